#pragma once

// The manager itself, which the exported class only forwards to. Applications never see this file, so everything in it
// is public.

#include "LatestFamily.h"
#include "LazyTexts.h"
#include "LookupCache.h"
#include "NameSequence.h"
#include "NameSet.h"
#include "PermissionTable.h"
#include "PropertyTable.h"

#include <tarvik/Attributes.h>
#include <tarvik/ConstraintsManager.h>

#include <array>
#include <cstddef>
#include <string_view>

class PM_DEVKEY;

/// The members of the manager and the operations on them. The exported operations are described in
/// `tarvik/ConstraintsManager.h`. Null texts arrive here as empty ones, except where the difference shows.
class TARVIK_HIDDEN ConstraintsManager::Implementation {
public:
    using MODE_TYPE = TARVIKNS::MODE_TYPE;
    using OUTPUT_TYPE = TARVIKNS::OUTPUT_TYPE;
    using OP_TYPE = TARVIKNS::OP_TYPE;

    /// Runs the start-up.
    Implementation();
    Implementation(const Implementation&) = delete;
    Implementation& operator=(const Implementation&) = delete;

    // Checks.
    bool checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output) const;
    bool checkConstraints(MODE_TYPE mode, std::string_view device, const char* package);
    bool checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, std::string_view device, const char* package);
    bool checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, std::string_view device, OP_TYPE operation);
    bool checkConstraints(std::string_view device, MODE_TYPE mode, OP_TYPE operation);

    // What a device offers.
    int getDeviceOperations(const char* deviceName, MODE_TYPE mode, OUTPUT_TYPE output);
    int getProgramOptions(const char* deviceName, MODE_TYPE mode, OUTPUT_TYPE output,
                          std::string_view package);
    int getBsdlOperations(const char* deviceName, OUTPUT_TYPE output);
    const TextSet& getDeviceOperationOptions(std::string_view device, std::string_view operation,
                                             MODE_TYPE mode);

    // Properties.
    const TextSet& getDeviceStringProperties(std::string_view device, std::string_view key);
    const char* getDeviceStringProperty(const char* device, const char* key);
    bool hasDevicePropertyValue(std::string_view device, std::string_view key, std::string_view value);

    // Families.
    StringBase getPartFamily(std::string_view device);
    void addCachedDeviceFamily(std::string_view device, const char* family);

    // SPI flash and multiboot.
    bool isSpiDevice(StringBase device) const;
    const char* getSpiDeviceStringProperty(const char* device, std::string_view property) const;
    bool isMbBpiSpiSupport(const char* device, std::string_view typePrefix, std::string_view width,
                           bool lead) const;

    // Dumps.
    void dumpOperationsTable(TarvikSmokeMgr* recorder) const;
    void dumpBsdlOperationsTable(TarvikSmokeMgr* recorder) const;
    void dumpProgramOptionsTable(TarvikSmokeMgr* recorder) const;
    void dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder) const;
    void dumpMbBpiSpi() const;
    StringBase supportedDeviceNameAt(int position) const;
    StringBase programOptionPackageNameAt(int position) const;

    // Start-up from the base database.
    void initialise();
    void loadSupportedLists();
    void loadModeOutputSets();
    void loadModeDeviceSets();
    void loadDeviceIdcodes();
    void loadNotSupportedParts();
    void allocateTables();

    // The SPI flash database.
    struct SpiClass;
    static const std::array<SpiClass, 6>& spiClasses();
    void loadSpiCatalogue();
    void readSpiNames(PM_DEVKEY* accessor);
    void readSpiProperties(PM_DEVKEY* accessor);
    void readMultibootDeviceLists(PM_DEVKEY* accessor);
    void readMultibootTypes(PM_DEVKEY* accessor);
    StringBase spiDeviceClass(const char* device) const;

    // The records that fill the permission tables.
    void parseOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family);
    void parseBsdlOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family);
    void parseProgramOptionEntries(PM_DEVKEY* accessor, const char* family);
    int programOptionTableIndex(std::string_view name);

    // Families, and loading on demand.
    unsigned familyIndex(std::string_view name);
    bool isFamilyName(const StringBase& name);
    StringBase resolveFamily(const StringBase& device, const StringBase& base) const;
    void loadDeviceData(std::string_view device, std::string_view package);
    StringBase loadDevice(const StringBase& device, std::string_view package);
    void loadFamily(const StringBase& family);
    void loadFamilyTables(PM_DEVKEY* accessor, const char* family);
    void loadProperties(PM_DEVKEY* accessor, const StringBase& owner);

    // What the checks are made of.
    struct ModeTable;
    static const ModeTable* modeTable(MODE_TYPE mode);
    const NameSet* modeDeviceSet(MODE_TYPE mode, int location) const;
    const NameSet* checkedModeDeviceSet(MODE_TYPE mode) const;
    const NameSet* dumpedModeDeviceSet(MODE_TYPE mode) const;
    bool modeAllowsOutput(MODE_TYPE mode, OUTPUT_TYPE output) const;
    bool familySupportsMode(MODE_TYPE mode, std::string_view device, const char* package);
    bool deviceSupportsMode(MODE_TYPE mode, std::string_view device, const char* package);
    bool isPartAllowedInMode(MODE_TYPE mode, std::string_view device, std::string_view package) const;

    // What the questions about a device are made of.
    const CachedLookup* findCachedLookup(const LookupCache& cache, std::string_view device);
    std::size_t cacheLimit() const noexcept;
    void cacheOperationLookup(const StringBase& device, const StringBase& owner, std::size_t block);
    void cacheOptionLookup(const StringBase& device, std::size_t block);
    StringBase operationOwner(const StringBase& device);
    bool isProgramOptionTableLoaded(std::string_view name) const;
    std::string_view loadedOptionOwner(StringBase& name, std::string_view package);
    const PropertyValues* findLoaded(std::string_view owner, std::string_view property) const;
    const PropertyValues* findProperty(std::string_view device, std::string_view key);

    bool m_exceptions = false;
    PM_DEVKEY* m_devKey = nullptr; ///< of the base database; lives as long as the process

    std::set<OUTPUT_TYPE> m_bsCables;
    std::set<OUTPUT_TYPE> m_ssCables;
    std::set<OUTPUT_TYPE> m_smCables;
    std::set<OUTPUT_TYPE> m_bsFileCables;
    std::set<OUTPUT_TYPE> m_dp770Cables;
    std::set<OUTPUT_TYPE> m_spiCables;
    std::set<OUTPUT_TYPE> m_kiteCfCables;
    std::set<OUTPUT_TYPE> m_kiteMpmCables;
    std::set<OUTPUT_TYPE> m_pffCables;

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
    LazyTexts m_deviceIdcodes;

    TextSet m_loadedFamilies;            ///< owners whose properties are loaded
    NameSequence m_operationsLoaded;     ///< families whose operations are loaded
    NameSequence m_programOptionsLoaded; ///< owners whose program options are loaded
    PropertyTable m_deviceProperties;
    Texts m_deviceFamilyCache; ///< lower-cased base name to family
    std::map<StringBase, int, ltptstr> m_programOptionPackageIndex;
    TextSet m_operationOptions; ///< stays empty: the result of a look-up that finds nothing
    LatestFamily m_partFamily;

    PermissionTable m_operationTable;
    PermissionTable m_programOptionTable;
    PermissionTable m_bsdlOperationTable;
    std::vector<OP_TYPE> m_operationOrders;
    std::vector<TARVIKNS::PROGRAM_OPTION> m_programOptionOrders;

    LazyTexts m_spiProperties; ///< name and property joined, to value
    NameSequence m_spiNames;
    std::vector<StringBase> m_spiFamilies; ///< no question reads it; it is part of what the manager holds
    std::vector<StringBase> m_at1Devices;
    std::vector<StringBase> m_st1Devices;
    std::vector<StringBase> m_st2Devices;
    std::vector<StringBase> m_bpi1Devices;
    std::vector<StringBase> m_bpi2Devices;
    std::vector<StringBase> m_bpi3Devices;
    std::map<StringBase, std::vector<StringBase>, ltptstr> m_multibootTypes;

    LookupCache m_operationLookups; ///< name as asked to its block of the two operation tables
    LookupCache m_optionLookups;    ///< name as asked to its block of the option table
};
