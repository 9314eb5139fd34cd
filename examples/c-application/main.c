/* An application in C: it offers its user a menu of what a device allows, keeps the library's messages in a log of its
 * own, and distinguishes a refused request from a faulty database.
 *
 *     c-application DATABASE DEVICE
 */

#include <tarvik/tarvik.h>

#include <stdint.h>
#include <stdio.h>
#include <string.h>

enum { MODE = TARVIK_MODE_BS, CABLE = TARVIK_OUTPUT_USB2 };

/** The application's log. Messages of the library go here, and not to the terminal. */
struct log {
    char text[1000];
};

static void keep(const tarvik_message* message, void* context) {
    struct log* log = context;
    if (message->channel != TARVIK_CHANNEL_DEBUG) {
        const size_t length = strlen(log->text);
        snprintf(log->text + length, sizeof log->text - length, "  %s", message->text);
    }
}

/** Prints why a call failed. Returns the exit status for that. */
static int fail(const char* what) {
    fprintf(stderr, "%s: %s\n", what, tarvik_last_error()->text);
    return 2;
}

/** Bit i of a mask stands for value i of the enumeration. */
static int holds(uint32_t mask, int value) { return (int)(mask >> value & 1U); }

static int print_menu(const char* device) {
    const char* family = NULL;
    uint32_t operations = 0;
    int order[32];
    size_t count = 0;
    if (tarvik_get_part_family(device, &family) != TARVIK_OK ||
        tarvik_get_device_operations(device, MODE, CABLE, &operations) != TARVIK_OK ||
        tarvik_get_operation_orders(order, 32, &count) != TARVIK_OK) {
        return fail(device);
    }
    printf("%s of family %s\nOperations:\n", device, family);
    for (size_t at = 0; at < count; ++at) {
        const char* name = NULL;
        if (holds(operations, order[at]) &&
            tarvik_operation_type_to_display_string(order[at], &name) == TARVIK_OK) {
            printf("  %s\n", name);
        }
    }
    return 0;
}

/** The values of a property; none if the device lacks it. */
static int print_vendors(const char* device) {
    const tarvik_text_set* vendors = NULL;
    if (tarvik_get_device_string_properties(device, "VENDOR", &vendors) != TARVIK_OK) {
        return fail(device);
    }
    tarvik_iterator at = {0};
    for (const char* vendor; (vendor = tarvik_text_set_next(vendors, &at)) != NULL;) {
        printf("Vendor: %s\n", vendor);
    }
    return 0;
}

int main(int argc, char** argv) {
    struct log log = {""};
    if (argc != 3) {
        fprintf(stderr, "usage: c-application DATABASE DEVICE\n");
        return 2;
    }
    const char* database = argv[1];
    const char* device = argv[2];
    if (tarvik_set_search_path(&database, 1) != TARVIK_OK ||
        tarvik_set_message_callback(keep, &log) != TARVIK_OK ||
        tarvik_get_constraints_manager() != TARVIK_OK) {
        return fail(database);
    }
    int status = print_menu(device);
    if (status == 0) {
        status = print_vendors(device);
    }
    int offered = 0;
    /* A refusal is an answer: the reason is in the log, in the user's words. */
    if (status == 0 &&
        tarvik_check_output_and_device(TARVIK_MODE_DP770, CABLE, device, NULL, &offered) != TARVIK_OK) {
        status = fail(device);
    }
    printf("In the desktop programmer: %s\nLog:\n%s", offered ? "yes" : "no", log.text);
    tarvik_remove_constraints_manager();
    return status;
}
