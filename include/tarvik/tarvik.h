#pragma once

/**
 * @file
 * The constraints manager for C, and for every language that can call C.
 *
 * Each function stands for one method of the C++ class `ConstraintsManager` and gives the same results,
 * messages and failures; that class documents what a question means.
 *
 * **Manager.** A process has one manager and one device database, however many of its parts use this library or
 * the C++ one. Every function that needs the manager makes it if there is none yet, except after
 * `tarvik_remove_constraints_manager`. Set the search path or the memory files, and the message callback, before.
 *
 * **Arguments.** A null text is the empty text, but a null package is no package. Texts are bytes that end with
 * a NUL. An enumeration is passed as an `int` and may have any value.
 *
 * **Results** are written to the last arguments, and only if the function returns `TARVIK_OK` or
 * `TARVIK_CALLBACK_FAILED`. A result that is a boolean is 0 or 1. Bit i of a mask stands for value i of the
 * enumeration.
 *
 * **Lifetime.** Texts, sets and maps belong to the library. Names of enumeration values live until the library
 * is unloaded, all others until the manager is removed; where a function has a shorter lifetime, it says so.
 *
 * **Failures.** No function ends the process, throws, or lets an exception pass. While exceptions are on, as they
 * are at first, a fault of the database gives one of the statuses named after the exceptions of the C++ library;
 * while they are off, it gives a neutral value: 0, null or the empty set. A refusal is never a failure: it is the
 * answer 0 and a message.
 *
 * **Threads.** Call from one thread at a time. `tarvik_last_error` is kept for each thread.
 */

/* This is C. NOLINTBEGIN(modernize-deprecated-headers,modernize-use-using) */

#include <stddef.h>
#include <stdint.h>

#if defined(_WIN32) && defined(TARVIK_BUILDING_C_LIBRARY)
#define TARVIK_API __declspec(dllexport)
#elif defined(_WIN32)
#define TARVIK_API __declspec(dllimport)
#else
/** Marks what the library exports. */
#define TARVIK_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
extern "C" {
#endif

/** Configuration modes. */
typedef enum tarvik_mode {
    TARVIK_MODE_BS,      /**< boundary scan */
    TARVIK_MODE_SS,      /**< slave serial */
    TARVIK_MODE_SM,      /**< select map */
    TARVIK_MODE_BSFILE,  /**< boundary scan into a file */
    TARVIK_MODE_DP770,   /**< desktop programmer */
    TARVIK_MODE_SPI,     /**< SPI flash, directly */
    TARVIK_MODE_KITECF,  /**< Kite with a compact flash card */
    TARVIK_MODE_KITEMPM, /**< Kite with a memory of its own */
    TARVIK_MODE_PFF      /**< PROM file formatter */
} tarvik_mode;

/** Cables and output file types. */
typedef enum tarvik_output {
    TARVIK_OUTPUT_PARALLEL,
    TARVIK_OUTPUT_ZORVA,
    TARVIK_OUTPUT_USB2,
    TARVIK_OUTPUT_SVF,
    TARVIK_OUTPUT_STAPL,
    TARVIK_OUTPUT_QSVF,
    TARVIK_OUTPUT_EXPRESSSVF,
    TARVIK_OUTPUT_EXPRESSQSVF,
    TARVIK_OUTPUT_NULLCABLE,
    TARVIK_OUTPUT_NONE
} tarvik_output;

/** Device operations, in the order in which they are presented. */
typedef enum tarvik_operation {
    TARVIK_OPERATION_PROGRAM,
    TARVIK_OPERATION_PROGRAMFLASH,
    TARVIK_OPERATION_PROGRAMFPGAONLY,
    TARVIK_OPERATION_VERIFY,
    TARVIK_OPERATION_ERASE,
    TARVIK_OPERATION_FUNCTIONTEST,
    TARVIK_OPERATION_BLANKCHECK,
    TARVIK_OPERATION_READBACKTOFILE,
    TARVIK_OPERATION_PROGRAMUES,
    TARVIK_OPERATION_READIDCODE,
    TARVIK_OPERATION_CHECKSUM,
    TARVIK_OPERATION_READUSERCODE,
    TARVIK_OPERATION_READCUSTOMERCODE,
    TARVIK_OPERATION_READUES,
    TARVIK_OPERATION_ACTIVATEOTF,
    TARVIK_OPERATION_VALIDATEUSERCODE,
    TARVIK_OPERATION_CHECKIDCODE,
    TARVIK_OPERATION_READSTATUSREGISTER,
    TARVIK_OPERATION_LOADCONFIGURATIONREVISION,
    TARVIK_OPERATION_BYPASS,
    TARVIK_OPERATION_HIGHZ,
    TARVIK_OPERATION_CLAMP,
    TARVIK_OPERATION_DOPRELOAD,
    TARVIK_OPERATION_ISPENABLE,
    TARVIK_OPERATION_CONLD,
    TARVIK_OPERATION_PROGRAMKEY,
    TARVIK_OPERATION_SECUREMODE,
    TARVIK_OPERATION_READTEMP,
    TARVIK_OPERATION_PROGRAMUSERCODE,
    TARVIK_OPERATION_PROGRAMCUSTOMERCODE,
    TARVIK_OPERATION_EXPRESSSVF,
    TARVIK_OPERATION_EXPRESSQSVF,
    TARVIK_NO_OPERATION /**< what an unknown operation name converts to */
} tarvik_operation;

/** Programming options. */
typedef enum tarvik_option {
    TARVIK_OPTION_ERASE,
    TARVIK_OPTION_VERIFY,
    TARVIK_OPTION_READPROTECT,
    TARVIK_OPTION_WRITEPROTECT,
    TARVIK_OPTION_FUNCTIONTEST,
    TARVIK_OPTION_SKIPUSERARRAY,
    TARVIK_OPTION_LOADFPGA,
    TARVIK_OPTION_PARALLELMODE,
    TARVIK_OPTION_USED4, /**< a reserved slot */
    TARVIK_OPTION_USERCODE,
    TARVIK_OPTION_UES,
    TARVIK_OPTION_SECUREMODE,
    TARVIK_OPTION_PROGRAMKEY,
    TARVIK_OPTION_OTF,
    TARVIK_OPTION_PROG,
    TARVIK_OPTION_SECTOR_PROTECT,
    TARVIK_OPTION_SECTOR_LOCKDOWN,
    TARVIK_OPTION_PROGRAM_ONLYFPGA,
    TARVIK_OPTION_READ_PROTECT_NOBSCANTEST,
    TARVIK_OPTION_OTP,
    TARVIK_OPTION_ASSERT_INIT,
    TARVIK_OPTION_DATA_WIDTH,
    TARVIK_OPTION_RS_PIN1,
    TARVIK_OPTION_RS_PIN0
} tarvik_option;

/** What a function returns. */
typedef enum tarvik_status {
    TARVIK_OK,               /**< done; the results are written */
    TARVIK_DATA_MISMATCH,    /**< DataMismatchException: a record does not have the form it must have */
    TARVIK_OUT_OF_RANGE,     /**< OutOfRangeException: no list holds the name or value */
    TARVIK_DATA_NOT_FOUND,   /**< DataNotFoundException: data is missing, or a file cannot be read */
    TARVIK_OTHER_EXCEPTION,  /**< another exception of the C++ library */
    TARVIK_NO_MEMORY,        /**< memory ran out */
    TARVIK_INVALID_ARGUMENT, /**< a pointer for a result is null, or a count has no array */
    TARVIK_TOO_LATE,         /**< the search path or the memory files were set after the manager was made */
    TARVIK_REMOVED,          /**< the manager was removed before */
    TARVIK_BUSY,             /**< called from the message callback, in which the manager cannot be used */
    TARVIK_CALLBACK_FAILED   /**< done, and the results are written; but the message callback threw */
} tarvik_status;

/** Whom a message is for. */
typedef enum tarvik_channel {
    TARVIK_CHANNEL_INFO,   /**< notices to the user, such as the reason of a refusal */
    TARVIK_CHANNEL_STATUS, /**< status and dump lines */
    TARVIK_CHANNEL_DEBUG   /**< trace output for developers */
} tarvik_channel;

/** The enumerations of this header, for `tarvik_enumerator_name`. */
typedef enum tarvik_enumeration {
    TARVIK_ENUMERATION_MODE,
    TARVIK_ENUMERATION_OUTPUT,
    TARVIK_ENUMERATION_OPERATION,
    TARVIK_ENUMERATION_OPTION,
    TARVIK_ENUMERATION_STATUS,
    TARVIK_ENUMERATION_CHANNEL
} tarvik_enumeration;

/** Why a function failed. */
typedef struct tarvik_error {
    int status;           /**< a `tarvik_status`; `TARVIK_OK` if nothing has failed yet */
    int line;             /**< the location number of the exception; 0 if it has none */
    const char* type;     /**< of the exception, such as "DataMismatchException"; empty if there was none */
    const char* product;  /**< that failed; empty if unknown, as are source and revision */
    const char* source;   /**< of the location */
    const char* revision; /**< of the source */
    const char* text;     /**< what went wrong, for people; cut after 1023 bytes */
} tarvik_error;

/** One message. It and its texts are valid during the callback only. */
typedef struct tarvik_message {
    int channel;          /**< a `tarvik_channel` */
    int line;             /**< the location number of the issuing site; 0 for debug messages */
    const char* product;  /**< that issues it; empty for debug messages, as are source and revision */
    const char* source;   /**< of the issuing site */
    const char* revision; /**< of the source */
    const char* text;     /**< with its line end, if it has one */
} tarvik_message;

/**
 * Takes messages, in the middle of the call that issues them. It can use the conversions and the version, but
 * nothing that needs the manager: that returns `TARVIK_BUSY`. It must return: no `longjmp`, no end of the thread.
 * If it is written in C++ and throws, the call is completed all the same and returns `TARVIK_CALLBACK_FAILED`.
 */
typedef void (*tarvik_message_callback)(const tarvik_message* message, void* context);

/** A database file in memory. */
typedef struct tarvik_memory_file {
    const char* name; /**< such as "kestrel.acd" */
    const char* text; /**< its bytes; may be null if `length` is 0 */
    size_t length;    /**< how many */
} tarvik_memory_file;

/** Texts in byte order, each once. */
typedef struct tarvik_text_set tarvik_text_set;

/** Texts by key, in byte order of the keys. */
typedef struct tarvik_text_map tarvik_text_map;

/** A position in a set or map. Start with `tarvik_iterator at = {0};`, and copy it as you like. */
typedef struct tarvik_iterator {
    const void* position; /**< belongs to the library */
} tarvik_iterator;

/* ---- The library ---------------------------------------------------------------------------------------- */

/**
 * The version of the library.
 * @return such as "1.0.0"
 */
TARVIK_API const char* tarvik_version(void);

/**
 * Why the latest failed function of this thread failed. A function that succeeds does not change it.
 * @return the failure, never null; valid until the next failure in this thread
 */
TARVIK_API const tarvik_error* tarvik_last_error(void);

/**
 * The name of an enumeration value, as in this header without the prefix: "BS", "USB2", "DATA_MISMATCH". With it a
 * program in another language can build its own enumerations.
 * @param enumeration a `tarvik_enumeration`
 * @param value counted from 0
 * @return the name; null if the enumeration has no such value. `TARVIK_NO_OPERATION` has none
 */
TARVIK_API const char* tarvik_enumerator_name(int enumeration, int value);

/* ---- Before the manager is made ------------------------------------------------------------------------- */

/**
 * Sets the directories in which databases are looked for. If the C++ library has made the manager already, that has no
 * effect, and a message says so. The default is the environment variable
 * TARVIK_DATABASE, otherwise the installed share/tarvik/database.
 * @param directories the first one is on top: it can replace or extend what the others hold
 * @param count how many
 * @return `TARVIK_TOO_LATE` once the manager has been made
 */
TARVIK_API tarvik_status tarvik_set_search_path(const char* const* directories, size_t count);

/**
 * Uses these files as the database in place of any directory. They are copied.
 * @param files in any order
 * @param count how many
 * @return `TARVIK_TOO_LATE` once the manager has been made
 */
TARVIK_API tarvik_status tarvik_set_memory_files(const tarvik_memory_file* files, size_t count);

/**
 * Sends all messages to a callback from now on.
 * @param callback null restores the default: info to standard error, status to standard output, debug nowhere
 *        unless the environment variable TARVIK_DEBUG is set
 * @param context is passed to each call
 * @return `TARVIK_BUSY` in a callback
 */
TARVIK_API tarvik_status tarvik_set_message_callback(tarvik_message_callback callback, void* context);

/* ---- The manager itself --------------------------------------------------------------------------------- */

/**
 * Makes the manager, if there is none yet. A database that is missing or faulty is reported by a message and
 * leaves a manager that answers from what it has.
 * @return `TARVIK_NO_MEMORY` if there is no memory; the next call tries again
 */
TARVIK_API tarvik_status tarvik_get_constraints_manager(void);

/**
 * Destroys the manager. Texts, sets and maps that it returned become invalid. It cannot be made again: from now
 * on everything that needs it returns `TARVIK_REMOVED`. If the process uses the C++ library, too, remove the
 * manager through one of the two only.
 * @return a status
 */
TARVIK_API tarvik_status tarvik_remove_constraints_manager(void);

/**
 * Turns exceptions on or off, from the next call on.
 * @param exceptions not 0: faults of the database give a status; 0: they give a neutral value
 * @return a status
 */
TARVIK_API tarvik_status tarvik_set_exceptions(int exceptions);

/**
 * The operations in the order in which they are presented.
 * @param values receives the first `capacity` of them; may be null if `capacity` is 0
 * @param capacity the length of `values`; 32 suffices
 * @param count receives how many there are; 0 if a fault ended the start-up early
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_operation_orders(int* values, size_t capacity, size_t* count);

/**
 * The programming options in the order in which they are presented.
 * @param values as above
 * @param capacity as above; 24 suffices
 * @param count as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_program_option_orders(int* values, size_t capacity, size_t* count);

/* ---- The vocabulary: conversions that need no manager --------------------------------------------------- */

/**
 * The mode with a name.
 * @param text a key name, or a name that databases use, in any case
 * @param mode receives the mode; `TARVIK_MODE_BS` for every other text
 * @return a status
 */
TARVIK_API tarvik_status tarvik_mode_string_to_type(const char* text, int* mode);

/**
 * The key name of a mode.
 * @param mode any value
 * @param name receives the name; "BS" for an unknown value
 * @return a status
 */
TARVIK_API tarvik_status tarvik_mode_type_to_string(int mode, const char** name);

/**
 * The output with a name.
 * @param text a key name, case-sensitive
 * @param output receives the output; `TARVIK_OUTPUT_NONE` for every other text, also for "QSVF" and "NULLCABLE"
 * @return a status
 */
TARVIK_API tarvik_status tarvik_cable_string_to_type(const char* text, int* output);

/**
 * The key name of an output.
 * @param output any value
 * @param name receives the name; empty for an unknown value
 * @return a status
 */
TARVIK_API tarvik_status tarvik_cable_type_to_string(int output, const char** name);

/**
 * The operation with a key name.
 * @param text a key name in any case
 * @param operation receives the operation; `TARVIK_NO_OPERATION`, after a message, for every other text
 * @return a status
 */
TARVIK_API tarvik_status tarvik_operation_string_to_type(const char* text, int* operation);

/**
 * The operation with a display name.
 * @param text a display name in any case
 * @param operation as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_operation_display_string_to_type(const char* text, int* operation);

/**
 * The key name of an operation.
 * @param operation any value
 * @param name receives the name; empty, after a message, for an unknown value
 * @return a status
 */
TARVIK_API tarvik_status tarvik_operation_type_to_string(int operation, const char** name);

/**
 * The name by which an operation is shown to users.
 * @param operation any value
 * @param name as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_operation_type_to_display_string(int operation, const char** name);

/**
 * The programming option with a key name.
 * @param text the key name, case-sensitive, of an option up to `TARVIK_OPTION_SECTOR_LOCKDOWN`
 * @param option receives the option
 * @return `TARVIK_DATA_MISMATCH` for every other text, even while exceptions are off
 */
TARVIK_API tarvik_status tarvik_option_string_to_type(const char* text, int* option);

/**
 * The key name of a programming option.
 * @param option 0 to 23
 * @param name receives the name
 * @return `TARVIK_DATA_MISMATCH` for every other value, even while exceptions are off
 */
TARVIK_API tarvik_status tarvik_option_type_to_string(int option, const char** name);

/**
 * Cuts a device name before its first "_".
 * @param device the name, changed in place; null has no effect
 * @return a status
 */
TARVIK_API tarvik_status tarvik_remove_package_name(char* device);

/* ---- Checks: the overloads of checkConstraints ---------------------------------------------------------- */

/**
 * Can the mode use the output?
 * @param mode a value that is no mode can use nothing
 * @param output any value
 * @param allowed receives whether it can; a refusal issues an info message with the reason
 * @return a status
 */
TARVIK_API tarvik_status tarvik_check_output(int mode, int output, int* allowed);

/**
 * Can the device be configured in the mode?
 * @param mode `TARVIK_MODE_SPI` and `TARVIK_MODE_PFF` accept every device
 * @param device the device
 * @param package of the device; null asks for no package
 * @param allowed as above
 * @return `TARVIK_OUT_OF_RANGE` (644) while exceptions are on, for a value that is no mode
 */
TARVIK_API tarvik_status tarvik_check_device(int mode, const char* device, const char* package, int* allowed);

/**
 * Can the mode use the output, and the device be configured in it?
 * @param mode unlike above, `TARVIK_MODE_SPI` and `TARVIK_MODE_PFF` do check the device
 * @param output any value
 * @param device the device
 * @param package of the device; null asks for no package
 * @param allowed as above
 * @return as above
 */
TARVIK_API tarvik_status tarvik_check_output_and_device(int mode, int output, const char* device,
                                                        const char* package, int* allowed);

/**
 * Can the operation run on the device, in the mode, through the output? Loads the device.
 * @param mode in `TARVIK_MODE_SPI` the answer is that of "spi" for every device
 * @param output any value
 * @param device the device
 * @param operation any value
 * @param family is not read; the device's own family decides
 * @param allowed receives whether it can, without a message
 * @return `TARVIK_OUT_OF_RANGE` (1999) while exceptions are on, for a device whose family is not supported
 */
TARVIK_API tarvik_status tarvik_check_operation(int mode, int output, const char* device, int operation,
                                                const char* family, int* allowed);

/**
 * Does the device's property with the name of the operation list the mode? Loads the device.
 * @param device the device
 * @param mode a value that is no mode is treated as `TARVIK_MODE_BS`
 * @param operation any value
 * @param family is not read
 * @param allowed receives whether it does
 * @return a status
 */
TARVIK_API tarvik_status tarvik_check_operation_property(const char* device, int mode, int operation,
                                                         const char* family, int* allowed);

/* ---- What a device offers ------------------------------------------------------------------------------- */

/**
 * The operations that the device offers in the mode through the output. Loads the device.
 * @param device the device
 * @param mode in `TARVIK_MODE_SPI` the answer is that of "spi" for every device
 * @param output any value
 * @param operations receives a mask of operations
 * @return `TARVIK_OUT_OF_RANGE` (1999) while exceptions are on, for a device whose family is not supported
 */
TARVIK_API tarvik_status tarvik_get_device_operations(const char* device, int mode, int output,
                                                      uint32_t* operations);

/**
 * The programming options that the device has in the mode through the output. Loads the device.
 * @param device the device
 * @param mode as above
 * @param output any value
 * @param package for which a device can have options of its own; may be null
 * @param options receives a mask of programming options
 * @return `TARVIK_OUT_OF_RANGE` (2024) while exceptions are on, for a name that is no option package
 */
TARVIK_API tarvik_status tarvik_get_program_options(const char* device, int mode, int output,
                                                    const char* package, uint32_t* options);

/**
 * The operations that the device offers by boundary scan alone. Loads the device.
 * @param device the device
 * @param output any value
 * @param operations receives a mask of operations
 * @return `TARVIK_OUT_OF_RANGE` (1999) while exceptions are on, for a device whose family is not supported
 */
TARVIK_API tarvik_status tarvik_get_bsdl_operations(const char* device, int output, uint32_t* operations);

/**
 * The options that an operation of the device has in the mode. Loads the device.
 * @param device the device
 * @param operation the key name, as properties spell it
 * @param mode a value that is no mode is treated as `TARVIK_MODE_BS`
 * @param options receives their names; an empty set if the operation does not list the mode
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_device_operation_options(const char* device, const char* operation,
                                                             int mode, const tarvik_text_set** options);

/* ---- Properties of devices ------------------------------------------------------------------------------ */

/**
 * All values of a property. Loads the device.
 * @param device the device; a property it lacks is taken from its family
 * @param key case-sensitive
 * @param values receives them; an empty set if there is no such property
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_device_string_properties(const char* device, const char* key,
                                                             const tarvik_text_set** values);

/**
 * The value of a property; if there are several, the smallest in byte order. Loads the device.
 * @param device as above; for an SPI flash, as `tarvik_get_spi_device_string_property`
 * @param key case-sensitive
 * @param value receives the value; null, while exceptions are off, if there is none
 * @return `TARVIK_DATA_NOT_FOUND` (437) while exceptions are on, if there is none
 */
TARVIK_API tarvik_status tarvik_get_device_string_property(const char* device, const char* key,
                                                           const char** value);

/**
 * Is "TRUE" among the values of a property? Loads the device.
 * @param device as above, but SPI flashes have a function of their own
 * @param key case-sensitive
 * @param value receives whether it is; 0 if there is no such property
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_device_bool_property(const char* device, const char* key, int* value);

/**
 * The value of `tarvik_get_device_string_property` as a decimal number.
 * @param device as there
 * @param key as there
 * @param value receives the number, 0 for a text that is no number; -1, while exceptions are off, if there is none
 * @return as there
 */
TARVIK_API tarvik_status tarvik_get_device_long_property(const char* device, const char* key, int32_t* value);

/* ---- Families ------------------------------------------------------------------------------------------- */

/**
 * The family of a device.
 * @param device the device
 * @param family receives its name; "spi" for an SPI flash, "base" for an unknown device
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_part_family(const char* device, const char** family);

/**
 * Sets the family of a device, unless the family that was resolved last is itself cached as a device.
 * @param device its name
 * @param family the family's name
 * @return a status
 */
TARVIK_API tarvik_status tarvik_add_cached_device_family(const char* device, const char* family);

/**
 * Is the device known?
 * @param device the device
 * @param known receives whether its family is any other than "base"
 * @return a status
 */
TARVIK_API tarvik_status tarvik_is_korvel_device(const char* device, int* known);

/**
 * The IDCODE of each device.
 * @param idcodes receives IDCODEs by device, both as the database spells them
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_all_device_idcodes(const tarvik_text_map** idcodes);

/* ---- SPI flash ------------------------------------------------------------------------------------------ */

/**
 * Is the name an SPI flash or an SPI flash family?
 * @param device the whole name, in any case
 * @param is_spi receives whether it is
 * @return a status
 */
TARVIK_API tarvik_status tarvik_is_spi_device(const char* device, int* is_spi);

/**
 * A property of an SPI flash, or if it has none, of its class.
 * @param device its name, in any case
 * @param property the property's name, in any case
 * @param value receives the value; empty if there is none
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_spi_device_string_property(const char* device, const char* property,
                                                               const char** value);

/**
 * Is a property of an SPI flash "true", in any case?
 * @param device as above
 * @param property as above
 * @param value receives whether it is; 0 if there is none
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_spi_device_bool_property(const char* device, const char* property,
                                                             int* value);

/**
 * A property of an SPI flash as a decimal number.
 * @param device as above
 * @param property as above
 * @param value receives the number; 0 if there is none
 * @return a status
 */
TARVIK_API tarvik_status tarvik_get_spi_device_long_property(const char* device, const char* property,
                                                             int32_t* value);

/* ---- Multiboot ------------------------------------------------------------------------------------------ */

/**
 * Does the device support a multiboot arrangement? Case does not matter.
 * @param device the device
 * @param type_prefix "TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI" or "TYPE_MB_QPRM"
 * @param width "SERIAL", "PARALLEL" or "NONE"
 * @param lead not 0 for the lead device of the chain, 0 for a device further down
 * @param supported receives whether it does
 * @return a status
 */
TARVIK_API tarvik_status tarvik_is_mb_bpi_spi_support(const char* device, const char* type_prefix,
                                                      const char* width, int lead, int* supported);

/* ---- Dumps for smoke tests: what the tables hold by now ------------------------------------------------- */

/**
 * Writes the operations of all families.
 * @param table receives the text, valid until the next dump; null writes to the status channel instead
 * @return a status
 */
TARVIK_API tarvik_status tarvik_dump_operations_table(const char** table);

/**
 * Writes the boundary-scan operations of all families.
 * @param table as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_dump_bsdl_operations_table(const char** table);

/**
 * Writes the programming options of all option packages.
 * @param table as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_dump_program_options_table(const char** table);

/**
 * Writes the family of each device that was resolved or set.
 * @param table as above
 * @return a status
 */
TARVIK_API tarvik_status tarvik_dump_cached_device_families(const char** table);

/**
 * Writes the devices of each multiboot type to the status channel.
 * @return a status
 */
TARVIK_API tarvik_status tarvik_dump_mb_bpi_spi(void);

/* ---- Sets and maps -------------------------------------------------------------------------------------- */

/**
 * How many texts a set holds.
 * @param set null is an empty set
 * @return the number
 */
TARVIK_API size_t tarvik_text_set_size(const tarvik_text_set* set);

/**
 * Is a text in a set?
 * @param set null is an empty set
 * @param text the whole text, case-sensitive
 * @return 1 if it is, otherwise 0
 */
TARVIK_API int tarvik_text_set_contains(const tarvik_text_set* set, const char* text);

/**
 * The next text of a set.
 * @param set null is an empty set
 * @param at moves to that text
 * @return the text; null after the last one, or if `at` is null
 */
TARVIK_API const char* tarvik_text_set_next(const tarvik_text_set* set, tarvik_iterator* at);

/**
 * How many entries a map holds.
 * @param map null is an empty map
 * @return the number
 */
TARVIK_API size_t tarvik_text_map_size(const tarvik_text_map* map);

/**
 * The value of a key.
 * @param map null is an empty map
 * @param key the whole key, case-sensitive
 * @return the value; null if there is none
 */
TARVIK_API const char* tarvik_text_map_find(const tarvik_text_map* map, const char* key);

/**
 * The next entry of a map.
 * @param map null is an empty map
 * @param at moves to that entry
 * @param value receives its value; may be null
 * @return its key; null after the last one, or if `at` is null
 */
TARVIK_API const char* tarvik_text_map_next(const tarvik_text_map* map, tarvik_iterator* at,
                                            const char** value);

#ifdef __cplusplus
}
#endif

/* NOLINTEND(modernize-deprecated-headers,modernize-use-using) */
