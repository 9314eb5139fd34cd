#pragma once

#include <tarvik/NameSequence.h>
#include <tarvik/NameSet.h>
#include <tarvik/TARVIKNS.h>
#include <tarvik/TextHash.h>
#include <tarvik/ltptstr.h>

#include <StringBase.h>

#include <array>
#include <cstddef>
#include <map>
#include <memory>
#include <memory_resource>
#include <set>
#include <string_view>
#include <unordered_map>
#include <vector>

class PermissionTable;
class PM_DEVKEY;
class PropertyTable;
class PropertyValues;
class TarvikSmokeMgr;

/// Tells a device-programming application what it may offer its user for a device.
///
/// One manager exists per process. It answers from the device database, which it reads as it goes: its
/// start-up reads the base database and the SPI flash database, the first question about a device loads that
/// device's records and its family's. It takes no lock: call it from one thread.
///
/// **Arguments.** A null text is the empty text, but a null package is no package. A device name may carry a
/// package behind its first "_"; the name before it is what families are found by. An enumeration may hold
/// any integer; each method says what one outside its list gives.
///
/// **Results.** Texts, sets and maps that are returned by pointer or reference belong to the manager and live
/// until it is removed; all others are the caller's. Bit i of a mask stands for the enumeration's value i.
///
/// **Errors.** A refusal is the answer no and a message, never an exception. While exceptions are on, as they
/// are after the start-up, faults of the database raise; while they are off the same faults give a neutral
/// value: false, 0, null or the empty set. A method that *loads* a device raises, the first time, for
/// - a malformed record, `DataMismatchException` with the location of the fault (1011 to 1760), after a debug
///   message. Cells that were filled before it stay filled, and the load is not tried again;
/// - an operation that nobody knows (1631, 1688), a family that is not supported (1999) or no option package
///   (2024), `OutOfRangeException`.
///
/// Two faults raise in either case: a record of an option that nobody knows, `DataMismatchException` (1500),
/// and a database file that is there but can't be read, `DataNotFoundException`.
class __attribute__((visibility("default"))) ConstraintsManager {
public:
    /// Texts by name, in byte order of the names.
    using Texts = std::map<StringBase, StringBase, ltptstr>;

    /// Texts, each once, in byte order.
    using TextSet = std::set<StringBase, ltptstr>;

    ConstraintsManager(const ConstraintsManager&) = delete;
    ConstraintsManager& operator=(const ConstraintsManager&) = delete;

    // ---- The manager itself -------------------------------------------------------------------------------

    /// The one manager of the process, made by the first call.
    ///
    /// A database fault ends the start-up early, reports itself by an info message and leaves a manager that
    /// answers from what it has.
    /// @return the manager; null when there is no memory for the object itself. What else may fail (memory
    ///         for the data) passes out, and the next call tries again.
    [[nodiscard]] static ConstraintsManager* getConstraintsManager();

    /// Destroys the manager, if there is one. Call it once, at shutdown, and nothing behind it: a manager
    /// can't be made twice in a process.
    static void RemoveConstraintsManager();

    /// Turns exceptions on (as they are after the start-up) or off, from the next call on.
    /// @param exceptions true: faults raise; false: they give a neutral value
    void setExceptions(bool exceptions) noexcept;

    /// The operations in the order in which they are presented.
    /// @return the values 0 to 31; empty when a fault ended the start-up before they were set
    [[nodiscard]] const std::vector<TARVIKNS::OP_TYPE>& getOperationOrders() const noexcept;

    /// The programming options in the order in which they are presented.
    /// @return the values 0 to 23; empty when a fault ended the start-up before they were set
    [[nodiscard]] const std::vector<TARVIKNS::PROGRAM_OPTION>& getProgramOptionOrders() const noexcept;

    // ---- The vocabulary: conversions that need no manager and raise whatever `setExceptions` says ---------

    /// The mode that a text names.
    /// @param text a key name, or a name that databases write, in any case
    /// @return the mode; `BS` for every text that names none
    [[nodiscard]] static TARVIKNS::MODE_TYPE modeString2Type(const char* text) noexcept;

    /// The key name of a mode.
    /// @param mode any value
    /// @return the name; "BS" for every value that is none
    [[nodiscard]] static StringBase modeType2String(TARVIKNS::MODE_TYPE mode);

    /// The output that a text names.
    /// @param text a key name, case included
    /// @return the output; `NONE` for every other text, "QSVF" and "NULLCABLE" too
    [[nodiscard]] static TARVIKNS::OUTPUT_TYPE cableString2Type(const char* text) noexcept;

    /// The key name of an output.
    /// @param output any value
    /// @return the name; empty for every value that is none
    [[nodiscard]] static StringBase cableType2String(TARVIKNS::OUTPUT_TYPE output);

    /// The operation that a key name stands for.
    /// @param text a key name in any case
    /// @return the operation; for every other text `NO_OPERATION`, after the info message
    ///         "Operation %s is not defined.\n"
    [[nodiscard]] static TARVIKNS::OP_TYPE operationString2Type(const char* text);

    /// The operation that a display name stands for.
    /// @param text a display name in any case
    /// @return as `operationString2Type`
    [[nodiscard]] static TARVIKNS::OP_TYPE operationDisplayString2Type(const char* text);

    /// The key name of an operation.
    /// @param operation any value
    /// @return the name; empty for every value that is none, after the info message
    ///         "Operation %d is not defined.\n"
    [[nodiscard]] static StringBase operationType2String(TARVIKNS::OP_TYPE operation);

    /// The name by which an operation is shown to users.
    /// @param operation any value
    /// @return as `operationType2String`
    [[nodiscard]] static StringBase operationType2DisplayString(TARVIKNS::OP_TYPE operation);

    /// The option that a text names.
    /// @param text a key name, case included, of an option up to `SECTOR_LOCKDOWN`
    /// @return the option
    /// @throw DataMismatchException (1500) for every other text
    [[nodiscard]] static TARVIKNS::PROGRAM_OPTION optionString2Type(const char* text);

    /// The key name of an option.
    /// @param option 0 to 23
    /// @return the name
    /// @throw DataMismatchException (1413) for every value that is none
    [[nodiscard]] static StringBase optionType2String(TARVIKNS::PROGRAM_OPTION option);

    /// Cuts a device name before its first "_"; a name without one stays as it is.
    /// @param device the name, changed in place
    static void removePackageName(StringBase& device);

    // ---- Checks -------------------------------------------------------------------------------------------

    /// May the mode use the output? Loads nothing.
    /// @param mode a value that is none may use nothing
    /// @param output any value; `PFF` may use each
    /// @return whether it may; a refusal issues the info message "%s is not supported in %s\n"
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output);

    /// May the device be configured in the mode? Loads nothing.
    /// @param mode `SPI` and `PFF` accept every device
    /// @param device the device, whose family the mode must list
    /// @param package in which the mode must not exclude the device; null asks for no package
    /// @return whether it may; a refusal issues the info message "%s is not supported in %s\n"
    /// @throw OutOfRangeException (644) while exceptions are on, for a value that is no mode
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package);

    /// May the mode use the output, and the device be configured in it? Loads nothing.
    /// @param mode unlike above, `SPI` and `PFF` do check the device
    /// @param output as above
    /// @param device as above
    /// @param package as above
    /// @return whether both may; a refusal issues the info message as above, which names the output when
    ///         both are refused
    /// @throw OutOfRangeException (644) while exceptions are on, for a value that is no mode
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, const char* package);

    /// May the operation run on the device, in the mode, through the output? Loads the device.
    /// @param mode in `SPI` the answer is that of "spi", whatever the device; else 0 to 8
    /// @param output 0 to 9
    /// @param device the device
    /// @param operation 0 to 31
    /// @param family is not read: the device's own family counts
    /// @return whether it may, without a message; for a value out of range false, after a debug message
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported,
    ///        and what loading raises
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, TARVIKNS::OP_TYPE operation, const char* family);

    /// Does the device's property that is named as the operation list the mode? Loads the device.
    /// @param device the device
    /// @param mode a value that is none counts as `BS`
    /// @param operation a value that is none gives false, after the info message
    ///        "Operation %d is not defined.\n"
    /// @param family is not read
    /// @return whether it does, without a message
    /// @throw LogicException as loading raises it
    [[nodiscard]] bool checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OP_TYPE operation, const char* family);

    // ---- What a device offers -----------------------------------------------------------------------------

    /// The operations that the device offers in the mode through the output. Loads the device.
    /// @param device the device
    /// @param mode in `SPI` the answer is that of "spi", whatever the device
    /// @param output any value; it, or a mode, out of range gives 0 without a message
    /// @return a mask of operations
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported,
    ///        and what loading raises
    [[nodiscard]] int getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode,
                                          TARVIKNS::OUTPUT_TYPE output);

    /// The programming options that the device has in the mode through the output. Loads the device.
    /// @param device the device; it has options of its own when a list holds it, else those of its family
    /// @param mode in `SPI` the answer is that of "spi", whatever the device; else 0 to 8
    /// @param output 0 to 9; it, or a mode, out of range gives 0, after a debug message
    /// @param package in which the device has options of its own when they are listed together; may be null
    /// @return a mask of options
    /// @throw OutOfRangeException (2024) while exceptions are on, for a name that is no option package, and
    ///        what loading raises
    [[nodiscard]] int getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OUTPUT_TYPE output, const char* package);

    /// The operations that the device offers by boundary scan alone. Loads the device.
    /// @param device the device
    /// @param output 0 to 9; more gives 0, after a debug message, and less gives 0 without one
    /// @return a mask of operations
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported,
    ///        and what loading raises
    [[nodiscard]] int getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output);

    /// The options that an operation of the device carries in the mode. Loads the device.
    /// @param device the device
    /// @param operation the key name, as properties spell it
    /// @param mode a value that is none counts as `BS`
    /// @return their names; empty when the device's property named as the operation does not list the mode
    /// @throw LogicException as loading raises it
    [[nodiscard]] const TextSet& getDeviceOperationOptions(const char* device, const char* operation,
                                                           TARVIKNS::MODE_TYPE mode);

    // ---- Properties of devices ----------------------------------------------------------------------------

    /// The values of a property. Loads the device.
    /// @param device the device, or else its family, has it
    /// @param key its name, case included
    /// @return the values; empty, without a message, when there is none
    /// @throw LogicException as loading raises it
    [[nodiscard]] const TextSet& getDeviceStringProperties(const char* device, const char* key);

    /// The value of a property, of several the smallest in byte order. Loads the device.
    /// @param device as above; an SPI flash answers as `getSpiDeviceStringProperty`
    /// @param key its name, case included
    /// @return the value; null when there is none, after the info message
    ///         "ACD entry  %s not found for device family %s.\n"
    /// @throw DataNotFoundException (437) in place of null while exceptions are on, and what loading raises
    [[nodiscard]] const char* getDeviceStringProperty(const char* device, const char* key);

    /// Is "TRUE" among the values of a property? Loads the device.
    /// @param device as above, but SPI flashes have a getter of their own
    /// @param key its name, case included
    /// @return whether it is; false, without a message, when there is no such property
    /// @throw LogicException as loading raises it
    [[nodiscard]] bool getDeviceBoolProperty(const char* device, const char* key);

    /// The value of `getDeviceStringProperty` as a decimal number.
    /// @param device as there
    /// @param key as there
    /// @return -2147483648 to 2147483647, 0 for a text that is no number; -1 in place of null
    /// @throw DataNotFoundException (437) as there
    [[nodiscard]] long getDeviceLongProperty(const char* device, const char* key);

    // ---- Families -----------------------------------------------------------------------------------------

    /// The family of a device. Loads nothing.
    /// @param device the device
    /// @return its name; "spi" for an SPI flash, "base" for a device that nobody knows
    [[nodiscard]] StringBase getPartFamily(const char* device);

    /// Tells the manager a device's family, unless the latest family that it resolved is itself cached as a
    /// device.
    /// @param device its name, kept in the case given; names are looked up in lower case
    /// @param family the family's name
    void addCachedDeviceFamily(const char* device, const char* family);

    /// Is the device known at all?
    /// @param device the device
    /// @return whether `getPartFamily` answers anything but "base"
    [[nodiscard]] bool isKorvelDevice(const char* device);

    /// The IDCODE of each device.
    /// @return IDCODEs by the names of the devices, both as the database writes them
    [[nodiscard]] const Texts& getAllDeviceIdcodes() const noexcept;

    // ---- SPI flash: known from the start-up on, so that nothing is loaded and nothing raised ---------------

    /// Is the name an SPI flash or an SPI flash family?
    /// @param device the whole name, in any case
    /// @return whether it is
    [[nodiscard]] bool isSpiDevice(StringBase device) const;

    /// A property of an SPI flash, or else of its class.
    /// @param device its name, in any case
    /// @param property the property's name, in any case
    /// @return the value; empty when there is none, and never null
    [[nodiscard]] const char* getSpiDeviceStringProperty(const char* device, const char* property) const;

    /// Is a property of an SPI flash "true"?
    /// @param device its name, in any case
    /// @param property the property's name, in any case
    /// @return whether it is, in any case; false when there is none
    [[nodiscard]] bool getSpiDeviceBoolProperty(const char* device, const char* property) const;

    /// A property of an SPI flash as a decimal number.
    /// @param device its name, in any case
    /// @param property the property's name, in any case
    /// @return -2147483648 to 2147483647; 0 when there is none
    [[nodiscard]] long getSpiDeviceLongProperty(const char* device, const char* property) const;

    // ---- Multiboot ----------------------------------------------------------------------------------------

    /// Does the device support a multiboot arrangement? No argument's case matters.
    /// @param device the device
    /// @param typePrefix "TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI" or "TYPE_MB_QPRM"
    /// @param width "SERIAL", "PARALLEL" or "NONE"
    /// @param lead true for the lead device of the chain, false for a device further down
    /// @return whether it does; false for texts that are none of these
    [[nodiscard]] bool isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width,
                                         bool lead) const;

    // ---- Dumps for smoke tests: what the tables hold by now, in fixed columns. Nothing is loaded -----------

    /// Writes the operations of all families.
    /// @param recorder what takes the text; null: the status channel, piece by piece
    void dumpOperationsTable(TarvikSmokeMgr* recorder);

    /// Writes the boundary-scan operations of all families.
    /// @param recorder as above
    void dumpBsdlOperationsTable(TarvikSmokeMgr* recorder);

    /// Writes the programming options of all option packages.
    /// @param recorder as above
    void dumpProgramOptionsTable(TarvikSmokeMgr* recorder);

    /// Writes the family of each device that was resolved or seeded.
    /// @param recorder as above
    void dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder);

    /// Writes the devices of each multiboot type to the status channel.
    void dumpMbBpiSpi() const;

private:
    friend class ManagerFactory;
    friend class TarvikTestPeer;

    ConstraintsManager();
    ~ConstraintsManager();
    void initialise();

    static ConstraintsManager* s_instance;

    // Start-up from the base database.
    struct ModeTable;
    static const ModeTable* modeTable(TARVIKNS::MODE_TYPE mode);
    void loadSupportedLists();
    void loadModeOutputSets();
    void loadModeDeviceSets();
    void loadDeviceIdcodes();
    void loadNotSupportedParts();
    void allocateTables();

    // The entries that fill the permission tables.
    void parseOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family);
    void parseBsdlOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family);
    void parseProgramOptionEntries(PM_DEVKEY* accessor, const char* family);
    int programOptionTableIndex(const char* name);

    // The SPI flash database.
    struct SpiClass;
    static const std::array<SpiClass, 6>& spiClasses();
    void loadSpiCatalogue();
    void readSpiNames(PM_DEVKEY* accessor);
    void readSpiProperties(PM_DEVKEY* accessor);
    void readMultibootDeviceLists(PM_DEVKEY* accessor);
    void readMultibootTypes(PM_DEVKEY* accessor);
    StringBase spiDeviceClass(const char* device) const;

    // Families, and loading on demand.
    unsigned familyIndex(const char* name);
    bool isFamilyName(const StringBase& name);
    StringBase resolveFamily(const StringBase& device, const StringBase& base) const;
    void loadDeviceData(const char* device, const char* package);
    StringBase loadDevice(const StringBase& device, const char* package);
    void loadFamily(const StringBase& family);
    void loadFamilyTables(PM_DEVKEY* accessor, const char* family);
    void loadProperties(PM_DEVKEY* accessor, const StringBase& owner);

    // Checks.
    const NameSet* modeDeviceSet(TARVIKNS::MODE_TYPE mode, int location) const;
    bool modeAllowsOutput(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output) const;
    bool familySupportsMode(TARVIKNS::MODE_TYPE mode, const StringBase& device, const char* package);
    bool deviceSupportsMode(TARVIKNS::MODE_TYPE mode, const StringBase& device, const char* package);
    bool isPartAllowedInMode(TARVIKNS::MODE_TYPE mode, const StringBase& device, const char* package) const;
    bool hasDevicePropertyValue(const char* device, const char* key, const char* value);

    // Queries.
    struct Shortcut {
        const StringBase*
            family; ///< what resolving leaves as the latest resolution; null when nothing is resolved
        std::size_t block;
    };
    using Shortcuts = std::pmr::unordered_map<StringBase, Shortcut, TextHash, TextEqual>;
    const Shortcut* recall(const Shortcuts& shortcuts, const char* device);
    void keepOperationShortcut(const StringBase& device, const StringBase& owner, std::size_t block);
    void keepOptionShortcut(const StringBase& device, std::size_t block);
    StringBase operationOwner(const StringBase& device);
    bool isProgramOptionTableLoaded(const char* name) const;
    StringBase loadedOptionOwner(const StringBase& device, const char* package);
    const PropertyValues* findLoaded(std::string_view owner, std::string_view property) const;
    const PropertyValues* findProperty(const char* device, const char* key);

    // Dumps.
    StringBase supportedDeviceNameAt(int position) const;
    StringBase programOptionPackageNameAt(int position) const;

    bool m_exceptions = false;
    PM_DEVKEY* m_devKey = nullptr; ///< of the base database; lives as long as the process

    std::set<TARVIKNS::OUTPUT_TYPE> m_bsCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_ssCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_smCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_bsFileCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_dp770Cables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_spiCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_kiteCfCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_kiteMpmCables;
    std::set<TARVIKNS::OUTPUT_TYPE> m_pffCables;

    NameSet m_supportedDevices;

    NameSet m_bsDevices;
    NameSet m_ssDevices;
    NameSet m_smDevices;
    NameSet m_bsFileDevices;
    NameSet m_dp770Devices;
    NameSet m_spiDevices;
    NameSet m_kiteCfDevices;
    NameSet m_kiteMpmDevices;
    NameSet m_pffDevices;

    NameSet m_programOptionPackages;
    NameSet m_notSupportedPartInMode;
    Texts m_deviceIdcodes;

    TextSet m_loadedFamilies;            ///< owners whose properties are loaded
    NameSequence m_operationsLoaded;     ///< families whose operations are loaded
    NameSequence m_programOptionsLoaded; ///< owners whose program options are loaded
    std::unique_ptr<PropertyTable> m_deviceProperties;
    Texts m_deviceFamilyCache; ///< lower-cased base name to family

    /// Apart from all else, so that the shortcuts stand close together however much is loaded between them.
    std::pmr::unsynchronized_pool_resource m_shortcutMemory;
    Shortcuts m_operationShortcuts{&m_shortcutMemory}; ///< name as asked to its block of the operation tables
    Shortcuts m_optionShortcuts{&m_shortcutMemory};    ///< name as asked to its block of the option table

    std::map<StringBase, int, ltptstr> m_programOptionPackageIndex;
    TextSet m_operationOptions; ///< stays empty: what a look-up returns that finds nothing
    StringBase m_partFamily;    ///< the family resolved latest

    std::unique_ptr<PermissionTable> m_operationTable;
    std::unique_ptr<PermissionTable> m_programOptionTable;
    std::unique_ptr<PermissionTable> m_bsdlOperationTable;
    std::vector<TARVIKNS::OP_TYPE> m_operationOrders;
    std::vector<TARVIKNS::PROGRAM_OPTION> m_programOptionOrders;

    Texts m_spiProperties; ///< name and property written together, to value
    NameSequence m_spiNames;
    std::vector<StringBase> m_spiFamilies;
    std::vector<StringBase> m_at1Devices;
    std::vector<StringBase> m_st1Devices;
    std::vector<StringBase> m_st2Devices;
    std::vector<StringBase> m_bpi1Devices;
    std::vector<StringBase> m_bpi2Devices;
    std::vector<StringBase> m_bpi3Devices;
    std::map<StringBase, std::vector<StringBase>, ltptstr> m_multibootTypes;
};
