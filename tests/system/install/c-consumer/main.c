/* Asks the installed C interface of what can go wrong in an installation: the database beside it, its messages, and a
 * failure that crosses its boundary. Prints what the C++ consumer prints. */

#include <tarvik/tarvik.h>

#include <stdio.h>

static void ignore(const tarvik_message* message, void* context) {
    (void)message;
    (void)context;
}

int main(void) {
    static const int OPERATIONS[] = {TARVIK_OPERATION_PROGRAM, TARVIK_OPERATION_VERIFY,
                                     TARVIK_OPERATION_ERASE};
    const char* text = NULL;
    tarvik_set_message_callback(ignore, NULL);
    if (tarvik_get_part_family("KS50", &text) != TARVIK_OK) {
        return 1;
    }
    printf("KS50 is of family %s\n", text);
    for (size_t at = 0; at < sizeof OPERATIONS / sizeof *OPERATIONS; ++at) {
        int allowed = 0;
        if (tarvik_check_operation(TARVIK_MODE_BS, TARVIK_OUTPUT_USB2, "KS50", OPERATIONS[at], NULL,
                                   &allowed) == TARVIK_OK &&
            allowed && tarvik_operation_type_to_display_string(OPERATIONS[at], &text) == TARVIK_OK) {
            puts(text);
        }
    }
    if (tarvik_get_device_string_property("KS50", "VENDOR", &text) == TARVIK_OK) {
        printf("Vendor %s\n", text);
    }
    if (tarvik_get_device_string_property("KS50", "NO_SUCH_PROPERTY", &text) == TARVIK_DATA_NOT_FOUND) {
        const tarvik_error* error = tarvik_last_error();
        printf("No such property: %s at %s, line %d\n", error->type, error->source, error->line);
    }
    return tarvik_remove_constraints_manager() == TARVIK_OK ? 0 : 1;
}
