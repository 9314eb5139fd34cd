#pragma once

#include <tarvik/Attributes.h>
#include <tarvik/TARVIKNS.h>
#include <tarvik/ltptstr.h>

#include <StringBase.h>

#include <map>
#include <set>
#include <vector>

class TarvikSmokeMgr;

/// Answers what a device-programming application may offer its user for a device.
///
/// A process has one manager. Its start-up reads the base database and the SPI flash database; the first question about a
/// device loads that device's records and those of its family. It takes no lock: call it from one thread.
///
/// **Arguments.** A null text is treated as the empty text, except that a null package means no package. A device name
/// may be followed by "_" and a package; families are found by the name before the first "_". An enumeration may hold
/// any integer; each method says what it does with a value that is not listed. A text that a method returned is a valid
/// argument of every method.
///
/// **Results.** Texts, sets and maps that are returned by pointer or reference belong to the manager. They stay valid
/// until it is removed; texts and sets of properties also stay unchanged. All other results belong to the caller. Bit i
/// of a mask stands for the enumeration's value i.
///
/// **Errors.** A refusal is the answer false and a message, never an exception. Exceptions are on after the start-up.
/// While they are on, faults of the database raise; while they are off, the same faults give a neutral value: false, 0,
/// null or the empty set. A method that *loads* a device raises, the first time,
/// - `DataMismatchException` for a malformed record (locations 1011 to 1760). What was read before the fault stays, and
///   the load is not repeated: the device then answers from what was read;
/// - `OutOfRangeException` for a record of an unknown operation (1631, 1688), for a family that is not supported (1999),
///   and for a family that is not an option package (2024).
///
/// Two faults raise even while exceptions are off: a record of an unknown option, `DataMismatchException` (1500), and a
/// database file that cannot be read, which every method that needs the file passes on as the host layer raises it.
/// `docs/embedding.md` lists all locations.
///
/// **Messages.** A message sink may call the manager. It must not throw: an exception from a sink ends the call as a
/// fault of the database does, and what was being loaded stays incomplete.
class TARVIK_MANAGER_API ConstraintsManager {
public:
    /// Texts by name, in byte order of the names.
    using Texts = std::map<StringBase, StringBase, ltptstr>;

    /// Texts without repetition, in byte order.
    using TextSet = std::set<StringBase, ltptstr>;

    ConstraintsManager(const ConstraintsManager&) = delete;
    ConstraintsManager& operator=(const ConstraintsManager&) = delete;

    // ---- The manager itself -------------------------------------------------------------------------------

    /// Returns the manager of the process. The first call makes it.
    ///
    /// A database fault ends the start-up early, reports itself by an info message, and leaves a manager that
    /// answers from what was read before.
    /// @return the manager; null when there is no memory for the object itself, and for a message sink that asks
    ///         while the start-up issues a message
    /// @throw std::bad_alloc when there is no memory for the data; the next call tries again
    [[nodiscard]] static ConstraintsManager* getConstraintsManager();

    /// Destroys the manager, if there is one. Call it once, at shutdown, and nothing after it: a process cannot make
    /// a second manager.
    static void RemoveConstraintsManager();

    /// Turns exceptions on (as they are after the start-up) or off, at once: a message sink that calls this while a
    /// device is loaded decides about the rest of that load.
    /// @param exceptions true: faults raise; false: they give a neutral value
    void setExceptions(bool exceptions) noexcept;

    /// The operations in the order in which they are presented.
    /// @return the values 0 to 31; empty when a fault ended the start-up before they were set
    [[nodiscard]] const std::vector<TARVIKNS::OP_TYPE>& getOperationOrders() const noexcept;

    /// The programming options in the order in which they are presented.
    /// @return the values 0 to 23; empty when a fault ended the start-up before they were set
    [[nodiscard]] const std::vector<TARVIKNS::PROGRAM_OPTION>& getProgramOptionOrders() const noexcept;

    // ---- The vocabulary: conversions that need no manager and do not depend on `setExceptions` -------------

    /// The mode that a text names.
    /// @param text a key name, or a name that databases use, in any case
    /// @return the mode; `BS` for every other text
    [[nodiscard]] static TARVIKNS::MODE_TYPE modeString2Type(const char* text) noexcept;

    /// The key name of a mode.
    /// @param mode any value
    /// @return the name; "BS" for a value that is not listed
    [[nodiscard]] static StringBase modeType2String(TARVIKNS::MODE_TYPE mode);

    /// The output that a text names.
    /// @param text a key name, in upper case as listed
    /// @return the output; `NONE` for every other text, including "QSVF" and "NULLCABLE"
    [[nodiscard]] static TARVIKNS::OUTPUT_TYPE cableString2Type(const char* text) noexcept;

    /// The key name of an output.
    /// @param output any value
    /// @return the name; empty for a value that is not listed
    [[nodiscard]] static StringBase cableType2String(TARVIKNS::OUTPUT_TYPE output);

    /// The operation with a key name.
    /// @param text a key name in any case
    /// @return the operation; for every other text `NO_OPERATION`, after the info message
    ///         "Operation %s is not defined.\n"
    [[nodiscard]] static TARVIKNS::OP_TYPE operationString2Type(const char* text);

    /// The operation with a display name.
    /// @param text a display name in any case
    /// @return as `operationString2Type`
    [[nodiscard]] static TARVIKNS::OP_TYPE operationDisplayString2Type(const char* text);

    /// The key name of an operation.
    /// @param operation any value
    /// @return the name; empty for a value that is not listed, after the info message
    ///         "Operation %d is not defined.\n"
    [[nodiscard]] static StringBase operationType2String(TARVIKNS::OP_TYPE operation);

    /// The name of an operation for users.
    /// @param operation any value
    /// @return as `operationType2String`
    [[nodiscard]] static StringBase operationType2DisplayString(TARVIKNS::OP_TYPE operation);

    /// The option that a text names.
    /// @param text the key name, in upper case as listed, of an option up to `SECTOR_LOCKDOWN`
    /// @return the option
    /// @throw DataMismatchException (1500) for every other text
    [[nodiscard]] static TARVIKNS::PROGRAM_OPTION optionString2Type(const char* text);

    /// The key name of an option.
    /// @param option 0 to 23
    /// @return the name
    /// @throw DataMismatchException (1413) for a value that is not listed
    [[nodiscard]] static StringBase optionType2String(TARVIKNS::PROGRAM_OPTION option);

    /// Cuts a device name before its first "_". A name without one does not change.
    /// @param device the name, changed in place
    static void removePackageName(StringBase& device);

    // ---- Checks -------------------------------------------------------------------------------------------

    /// May the mode use the output? Loads nothing.
    /// @param mode any value; one that is not listed may use nothing, `PFF` may use everything
    /// @param output any value. `NONE` also stands for all outputs in the database that have no name
    /// @return whether it may; a refusal issues the info message "%s is not supported in %s\n"
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output);

    /// May the device be configured in the mode? Loads nothing.
    /// @param mode `SPI` and `PFF` accept every device
    /// @param device the device; the mode must list its family
    /// @param package a package in which the mode must not exclude the device; null for no package
    /// @return whether it may; a refusal issues the info message "%s is not supported in %s\n"
    /// @throw OutOfRangeException (644) while exceptions are on, for a mode that is not listed, unless `BS` excludes
    ///        the device in the package
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package);

    /// May the mode use the output, and may the device be configured in it? Loads nothing.
    /// @param mode as above, but `PFF` checks the family of the device, and `SPI` that of the name "spi"
    /// @param output as above
    /// @param device as above
    /// @param package as above
    /// @return whether both are allowed; a refusal issues the info message "%s is not supported in %s\n", which names
    ///         the output if both are refused
    /// @throw OutOfRangeException (644) as above
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, const char* package);

    /// May the operation run on the device, in the mode, through the output? Loads the device, except in `SPI`.
    /// @param mode `BS` to `SPI` (0 to 5); in `SPI` the answer is that of "spi" for every device
    /// @param output `PARALLEL` to `STAPL` (0 to 4)
    /// @param device the device
    /// @param operation 0 to 31
    /// @param family not read: the device's own family is used
    /// @return whether it may, without a message; for a value outside its range false, after a debug message
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported, unless
    ///        a value is outside its range; and what loading raises
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, TARVIKNS::OP_TYPE operation, const char* family);

    /// Does the device's property with the operation's key name list the mode? Loads the device.
    /// @param device the device; a package is cut off
    /// @param mode a value that is not listed is treated as `BS`
    /// @param operation a value that is not listed issues the info message "Operation %d is not defined.\n" and has the
    ///        empty key name, which a database may give to a property, too
    /// @param family not read
    /// @return whether it does
    /// @throw LogicException what loading raises
    [[nodiscard]] bool checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OP_TYPE operation, const char* family);

    // ---- What a device offers -----------------------------------------------------------------------------

    /// The operations that the device offers in the mode through the output. Loads the device, except in `SPI`.
    /// @param device the device
    /// @param mode `BS` to `SPI` (0 to 5); in `SPI` the answer is that of "spi" for every device
    /// @param output `PARALLEL` to `STAPL` (0 to 4)
    /// @return a mask of operations; 0, without a message, for a value outside its range
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported, and what
    ///        loading raises
    [[nodiscard]] int getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode,
                                          TARVIKNS::OUTPUT_TYPE output);

    /// The programming options that the device has in the mode through the output. Loads the device, except in `SPI`.
    /// @param device the device; it has options of its own if it is listed as an option package, otherwise those of
    ///        its family
    /// @param mode `BS` to `SPI` (0 to 5); in `SPI` the answer is that of "spi" for every device
    /// @param output `PARALLEL` to `STAPL` (0 to 4)
    /// @param package if device and package, joined, are listed as an option package, they have options of their own;
    ///        may be null
    /// @return a mask of options; 0, after a debug message, for a value outside its range
    /// @throw OutOfRangeException (2024) while exceptions are on, if neither the device nor its family is listed as an
    ///        option package, unless a value is outside its range; and what loading raises
    [[nodiscard]] int getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OUTPUT_TYPE output, const char* package);

    /// The boundary-scan operations that the device offers through the output. Loads the device.
    /// @param device the device
    /// @param output `PARALLEL` to `STAPL` (0 to 4)
    /// @return a mask of operations; 0 for an output outside its range, after a debug message if it is above
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported, and what
    ///        loading raises
    [[nodiscard]] int getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output);

    /// The options of an operation of the device in the mode. Loads the device.
    /// @param device the device
    /// @param operation the key name, spelt as the property that lists the operation's modes
    /// @param mode a value that is not listed is treated as `BS`
    /// @return their names: the values of the property "OP_" + `operation`, or if there are none, of that with "_" and
    ///         the mode appended; empty if the property `operation` does not list the mode
    /// @throw LogicException what loading raises
    [[nodiscard]] const TextSet& getDeviceOperationOptions(const char* device, const char* operation,
                                                           TARVIKNS::MODE_TYPE mode);

    // ---- Properties of devices ----------------------------------------------------------------------------

    /// The values of a property. Loads the device.
    /// @param device the device; its family's property answers if it has none of its own
    /// @param key the property's name; case matters
    /// @return the values; empty, without a message, if there is no such property
    /// @throw LogicException what loading raises
    [[nodiscard]] const TextSet& getDeviceStringProperties(const char* device, const char* key);

    /// The value of a property; of several values, the first in byte order. Loads the device, except an SPI flash.
    /// @param device as above; for an SPI flash the result is that of `getSpiDeviceStringProperty`
    /// @param key the property's name; case matters
    /// @return the value; null if there is no value, after the info message
    ///         "ACD entry  %s not found for device family %s.\n"
    /// @throw DataNotFoundException (437), after that message, in place of null while exceptions are on; and what
    ///        loading raises
    [[nodiscard]] const char* getDeviceStringProperty(const char* device, const char* key);

    /// Is "TRUE" among the values of a property? Loads the device.
    /// @param device as for `getDeviceStringProperties`; SPI flashes have a getter of their own
    /// @param key the property's name; case matters
    /// @return whether it is, in upper case; false, without a message, if there is no such property
    /// @throw LogicException what loading raises
    [[nodiscard]] bool getDeviceBoolProperty(const char* device, const char* key);

    /// The value of `getDeviceStringProperty` as a decimal number.
    /// @param device as there
    /// @param key as there
    /// @return -2147483648 to 2147483647; 0 for a text that does not start with a number; -1 in place of null
    /// @throw DataNotFoundException (437) as there, and what loading raises
    [[nodiscard]] long getDeviceLongProperty(const char* device, const char* key);

    // ---- Families -----------------------------------------------------------------------------------------

    /// The family of a device. Loads nothing.
    /// @param device the device; a package is ignored unless an SPI flash is listed with it
    /// @return the family's name; "spi" for an SPI flash, "base" for an unknown device
    [[nodiscard]] StringBase getPartFamily(const char* device);

    /// Sets a device's family for all further questions, unless the family that the manager resolved last is itself
    /// cached as a device.
    /// @param device its name; a package is cut off. Only a name in lower case has an effect, as devices are looked up in
    ///        lower case
    /// @param family the family's name
    void addCachedDeviceFamily(const char* device, const char* family);

    /// Is the device known?
    /// @param device the device
    /// @return whether `getPartFamily` returns anything but "base"
    [[nodiscard]] bool isKorvelDevice(const char* device);

    /// The IDCODE of each device.
    /// @return IDCODEs by device name, both as the database spells them
    [[nodiscard]] const Texts& getAllDeviceIdcodes() const;

    // ---- SPI flash: read by the start-up, so nothing is loaded and nothing raised --------------------------

    /// Is the name an SPI flash or an SPI flash family?
    /// @param device the whole name, in any case; the database has to spell it in upper case
    /// @return whether it is
    [[nodiscard]] bool isSpiDevice(StringBase device) const;

    /// A property of an SPI flash, or if it has none, of its class.
    /// @param device its name, in any case
    /// @param property the property's name, in any case. The database has to spell both in upper case
    /// @return the value; empty if there is no such property, never null
    [[nodiscard]] const char* getSpiDeviceStringProperty(const char* device, const char* property) const;

    /// Is a property of an SPI flash "true"?
    /// @param device as above
    /// @param property as above
    /// @return whether it is, in any case; false if there is no such property
    [[nodiscard]] bool getSpiDeviceBoolProperty(const char* device, const char* property) const;

    /// A property of an SPI flash as a decimal number.
    /// @param device as above
    /// @param property as above
    /// @return -2147483648 to 2147483647; 0 if there is no such property
    [[nodiscard]] long getSpiDeviceLongProperty(const char* device, const char* property) const;

    // ---- Multiboot ----------------------------------------------------------------------------------------

    /// Does the device support a multiboot arrangement? All texts may be in any case.
    /// @param device the device
    /// @param typePrefix "TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI" or "TYPE_MB_QPRM"
    /// @param width "SERIAL" or "PARALLEL" for BPI, "NONE" for the other two
    /// @param lead true for the first device of the chain, false for any other
    /// @return whether it does; false for other texts
    [[nodiscard]] bool isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width,
                                         bool lead) const;

    // ---- Dumps for smoke tests: the current contents of the tables. Nothing is loaded ----------------------

    /// Writes the operations of all supported families, in fixed columns.
    /// @param recorder receives the text piece by piece; null for the status channel
    void dumpOperationsTable(TarvikSmokeMgr* recorder);

    /// Writes the boundary-scan operations of all supported families, in fixed columns.
    /// @param recorder as above
    void dumpBsdlOperationsTable(TarvikSmokeMgr* recorder);

    /// Writes the programming options of all option packages, in fixed columns.
    /// @param recorder as above
    void dumpProgramOptionsTable(TarvikSmokeMgr* recorder);

    /// Writes the family of each device that was resolved or set, a line each.
    /// @param recorder as above
    void dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder);

    /// Writes the devices of each multiboot type to the status channel, a line each.
    void dumpMbBpiSpi() const;

private:
    friend class ManagerFactory;
    friend class TarvikTestPeer;
    class Implementation;

    TARVIK_HIDDEN ConstraintsManager();
    TARVIK_HIDDEN ~ConstraintsManager();

    TARVIK_HIDDEN static ConstraintsManager* s_instance;

    Implementation* const m_implementation;
};
