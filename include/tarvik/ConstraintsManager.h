#pragma once

#include <tarvik/NameSequence.h>
#include <tarvik/NameSet.h>
#include <tarvik/PropertyValues.h>
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
class TarvikSmokeMgr;

/// Tells a device-programming application what it may offer its user for a device.
///
/// One manager exists per process. It answers from the device database, which it reads as it goes: its
/// start-up reads the base database and the SPI flash database, the first question about a device reads that
/// device's family. It takes no lock: call it from one thread.
///
/// For all methods: a null text is the empty text, but a null package is no package. A device name may carry
/// a package behind its first "_". Texts and sets that are returned by pointer or reference belong to the
/// manager and live until it is removed. While exceptions are on, bad records of the database raise
/// `DataMismatchException` and names that no list holds raise `OutOfRangeException`, as each method says;
/// while they are off the same faults give a neutral value. Failures to read a database file raise
/// `DataNotFoundException` in either case.
class __attribute__((visibility("default"))) ConstraintsManager {
public:
    /// Texts by name, and sets of texts, in byte order.
    using Texts = std::map<StringBase, StringBase, ltptstr>;
    using TextSet = PropertyValues::TextSet;

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

    /// Turns exceptions on (as they are after the start-up) or off.
    void setExceptions(bool exceptions) noexcept;

    /// The operations, or options, in the order in which they are presented: 0 to 31, and 0 to 23. Empty when
    /// a fault ended the start-up before they were set.
    [[nodiscard]] const std::vector<TARVIKNS::OP_TYPE>& getOperationOrders() const noexcept;
    [[nodiscard]] const std::vector<TARVIKNS::PROGRAM_OPTION>& getProgramOptionOrders() const noexcept;

    // ---- The vocabulary: conversions that need no manager and raise whatever `setExceptions` says ---------

    /// The mode that a text names, without regard to case; `BS` for every text that names none.
    [[nodiscard]] static TARVIKNS::MODE_TYPE modeString2Type(const char* text) noexcept;

    /// The key name of a mode; "BS" for every value that is none.
    [[nodiscard]] static StringBase modeType2String(TARVIKNS::MODE_TYPE mode);

    /// The output that a text names, case included; `NONE` for every other text, "QSVF" and "NULLCABLE" too.
    [[nodiscard]] static TARVIKNS::OUTPUT_TYPE cableString2Type(const char* text) noexcept;

    /// The key name of an output; empty for every value that is none.
    [[nodiscard]] static StringBase cableType2String(TARVIKNS::OUTPUT_TYPE output);

    /// The operation that a key name, or a display name, stands for, without regard to case; for every other
    /// text `NO_OPERATION`, and the info message "Operation %s is not defined.\n".
    [[nodiscard]] static TARVIKNS::OP_TYPE operationString2Type(const char* text);
    [[nodiscard]] static TARVIKNS::OP_TYPE operationDisplayString2Type(const char* text);

    /// The key name, or display name, of an operation; empty for every value that is none, and the info
    /// message "Operation %d is not defined.\n".
    [[nodiscard]] static StringBase operationType2String(TARVIKNS::OP_TYPE operation);
    [[nodiscard]] static StringBase operationType2DisplayString(TARVIKNS::OP_TYPE operation);

    /// The option that a text names, case included. Only the options up to `SECTOR_LOCKDOWN` can be read.
    /// @throw DataMismatchException (1500) for every other text
    [[nodiscard]] static TARVIKNS::PROGRAM_OPTION optionString2Type(const char* text);

    /// The key name of an option.
    /// @throw DataMismatchException (1413) for every value that is none
    [[nodiscard]] static StringBase optionType2String(TARVIKNS::PROGRAM_OPTION option);

    /// Cuts a device name before its first "_"; a name without one stays as it is.
    static void removePackageName(StringBase& device);

    // ---- Checks -------------------------------------------------------------------------------------------

    /// May the mode use the output? A refusal issues the info message "%s is not supported in %s\n".
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output);

    /// May the device, in a package or (null) in any, be configured in the mode? Refusals as above. `SPI` and
    /// `PFF` accept every device.
    /// @throw OutOfRangeException (644) while exceptions are on, for a value that is no mode
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package);

    /// Both at once; here `SPI` and `PFF` do check the device. When both refuse, the message names the
    /// output.
    /// @throw OutOfRangeException (644) while exceptions are on, for a value that is no mode
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, const char* package);

    /// May the operation run on the device, in the mode, through the output? A value that is out of the
    /// table's range gives a debug message and false. `family` is not read: the device's own family counts.
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported
    [[nodiscard]] bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                        const char* device, TARVIKNS::OP_TYPE operation, const char* family);

    /// Does the device's property named as the operation list the mode? `family` is not read.
    [[nodiscard]] bool checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OP_TYPE operation, const char* family);

    // ---- What a device offers -----------------------------------------------------------------------------

    /// The operations that the device offers in the mode through the output: bit i stands for operation i. In
    /// `SPI` mode it answers for "spi". Values out of the table's range give 0, silently.
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported
    [[nodiscard]] int getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode,
                                          TARVIKNS::OUTPUT_TYPE output);

    /// The programming options: bit i stands for option i. A device and package that are listed together have
    /// options of their own, others have their family's. Values out of range give 0 and a debug message.
    /// @throw OutOfRangeException (2024) while exceptions are on, for a name that is no option package
    [[nodiscard]] int getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode,
                                        TARVIKNS::OUTPUT_TYPE output, const char* package);

    /// The boundary-scan operations: bit i stands for operation i. An output out of range gives 0 and a debug
    /// message.
    /// @throw OutOfRangeException (1999) while exceptions are on, for a device whose family is not supported
    [[nodiscard]] int getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output);

    /// The options that an operation of the device carries in the mode; empty when the device's property
    /// named as the operation does not list the mode.
    [[nodiscard]] const TextSet& getDeviceOperationOptions(const char* device, const char* operation,
                                                           TARVIKNS::MODE_TYPE mode);

    // ---- Properties of devices ----------------------------------------------------------------------------

    /// The values of a property, of the device itself or else of its family; empty when there is none.
    [[nodiscard]] const TextSet& getDeviceStringProperties(const char* device, const char* key);

    /// The value of a property, of several the smallest in byte order. An SPI flash answers as
    /// `getSpiDeviceStringProperty`.
    /// @return null when there is none, after the info message
    ///         "ACD entry  %s not found for device family %s.\n"
    /// @throw DataNotFoundException (437) in place of null while exceptions are on
    [[nodiscard]] const char* getDeviceStringProperty(const char* device, const char* key);

    /// Is "TRUE" among the values? No message and no exception; SPI flashes have a getter of their own.
    [[nodiscard]] bool getDeviceBoolProperty(const char* device, const char* key);

    /// The value of `getDeviceStringProperty` as a decimal number of 32 bits; -1 in place of null.
    /// @throw DataNotFoundException (437) as there
    [[nodiscard]] long getDeviceLongProperty(const char* device, const char* key);

    // ---- Families -----------------------------------------------------------------------------------------

    /// The family of a device: "spi" for an SPI flash, "base" for a device that nobody knows.
    [[nodiscard]] StringBase getPartFamily(const char* device);

    /// Tells the manager a device's family, unless the latest family that it resolved is itself cached as a
    /// device. The name is kept in the case given, and is looked up in lower case.
    void addCachedDeviceFamily(const char* device, const char* family);

    /// Is the device known at all? (Is its family anything but "base"?)
    [[nodiscard]] bool isKorvelDevice(const char* device);

    /// The IDCODE of each device, by the name as the database writes it.
    [[nodiscard]] const Texts& getAllDeviceIdcodes() const noexcept;

    // ---- SPI flash ----------------------------------------------------------------------------------------

    /// Is the name, in any case, an SPI flash or an SPI flash family?
    [[nodiscard]] bool isSpiDevice(StringBase device) const;

    /// A property of an SPI flash, or else of its class.
    /// @return never null: empty when there is none
    [[nodiscard]] const char* getSpiDeviceStringProperty(const char* device, const char* property) const;

    /// Is the property "true", in any case?
    [[nodiscard]] bool getSpiDeviceBoolProperty(const char* device, const char* property) const;

    /// The property as a decimal number of 32 bits; 0 when there is none.
    [[nodiscard]] long getSpiDeviceLongProperty(const char* device, const char* property) const;

    // ---- Multiboot ----------------------------------------------------------------------------------------

    /// Does the device support a multiboot arrangement? No argument's case matters.
    /// @param typePrefix "TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI" or "TYPE_MB_QPRM"
    /// @param width "SERIAL", "PARALLEL" or "NONE"
    /// @param lead true for the lead device of the chain, false for a device further down
    [[nodiscard]] bool isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width,
                                         bool lead) const;

    // ---- Dumps for smoke tests ----------------------------------------------------------------------------

    /// Write a table, as it stands, to the recorder, or (null) piece by piece to the status channel. Nothing
    /// is loaded.
    void dumpOperationsTable(TarvikSmokeMgr* recorder);
    void dumpBsdlOperationsTable(TarvikSmokeMgr* recorder);
    void dumpProgramOptionsTable(TarvikSmokeMgr* recorder);
    void dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder);

    /// Writes the devices of each multiboot type to the status channel.
    void dumpMbBpiSpi() const;

private:
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
    void growProperties();
    void loadProperties(PM_DEVKEY* accessor, const StringBase& owner);
    PropertyValues::Owner propertyOwner(const StringBase& name) const;
    void loadSingleProperties(PM_DEVKEY* accessor, const StringBase& owner);
    void loadMultipleProperties(PM_DEVKEY* accessor, const StringBase& owner);

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
    void keepOptionShortcut(const StringBase& device, const StringBase& owner, std::size_t block);
    StringBase operationOwner(const StringBase& device);
    StringBase loadedOptionOwner(const StringBase& device, const char* package);
    const PropertyValues* findStored(std::string_view owner, std::string_view property) const;
    const PropertyValues* findLoaded(std::string_view owner, std::string_view property) const;
    const PropertyValues* findProperty(const char* device, const char* key);

    // Dumps.
    StringBase supportedDeviceNameAt(int position) const;
    StringBase programOptionPackageNameAt(int position) const;

    /// An owner and a property, looked up as the text "owner_property" without joining them.
    struct PropertyKey {
        std::string_view owner;
        std::string_view property;
    };

    /// Hashes the keys of properties by their CRC-32. Not `noexcept`, for the reason of `TextHash`.
    struct PropertyKeyHash {
        using is_transparent = void;
        std::size_t operator()(const StringBase& key) const { return key.CRC32(); }
        std::size_t operator()(const PropertyKey& key) const;
    };
    struct PropertyKeyEqual {
        using is_transparent = void;
        bool operator()(const StringBase& left, const StringBase& right) const noexcept {
            return left == right;
        }
        bool operator()(const PropertyKey& left, const StringBase& right) const noexcept;
    };
    using Properties = std::unordered_map<StringBase, PropertyValues, PropertyKeyHash, PropertyKeyEqual>;

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
    Properties m_deviceProperties;       ///< "owner_property" to values
    Texts m_deviceFamilyCache;           ///< lower-cased base name to family

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
