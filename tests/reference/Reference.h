#pragma once

#include "ReferenceReader.h"

#include <tarvik/TARVIKNS.h>

#include <array>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <vector>

namespace reference {

enum class Channel { INFO, STATUS, DEBUG };

/// The line of a message whose line nobody relies on.
inline constexpr int ANY_LINE = -1;

struct Message {
    Channel channel;
    int line;                        ///< 0 for debug messages
    std::optional<std::string> text; ///< nothing for the report of an exception: the host words it

    friend bool operator==(const Message&, const Message&) = default;
};

/// What the reference throws in place of the host's exceptions.
struct Raised {
    std::string type;
    int line;
};

using Texts = std::map<std::string, std::string>;
using TextSet = std::set<std::string>;

/// A second constraints manager, written to be obviously right rather than fast: its tables are sets of the facts
/// that hold. It has the exported interface of `ConstraintsManager` in terms of `std::string`, and shows its
/// members, which are named as there.
class Reference {
public:
    /// Runs the start-up over these files.
    explicit Reference(const std::map<std::string, std::string>& files);
    Reference(const Reference&) = delete;
    Reference& operator=(const Reference&) = delete;

    /// What was issued since the last call.
    [[nodiscard]] std::vector<Message> takeMessages();

    [[nodiscard]] const Databases& databases() const { return m_databases; }

    // The exported interface.
    void setExceptions(bool exceptions) { m_exceptions = exceptions; }
    const std::vector<int>& getOperationOrders() { return m_operationOrders; }
    const std::vector<int>& getProgramOptionOrders() { return m_programOptionOrders; }

    TARVIKNS::MODE_TYPE modeString2Type(const char* text);
    std::string modeType2String(TARVIKNS::MODE_TYPE mode);
    TARVIKNS::OUTPUT_TYPE cableString2Type(const char* text);
    std::string cableType2String(TARVIKNS::OUTPUT_TYPE output);
    TARVIKNS::OP_TYPE operationString2Type(const char* text);
    TARVIKNS::OP_TYPE operationDisplayString2Type(const char* text);
    std::string operationType2String(TARVIKNS::OP_TYPE operation);
    std::string operationType2DisplayString(TARVIKNS::OP_TYPE operation);
    TARVIKNS::PROGRAM_OPTION optionString2Type(const char* text);
    std::string optionType2String(TARVIKNS::PROGRAM_OPTION option);
    void removePackageName(std::string& device);

    bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output);
    bool checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package);
    bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                          const char* package);
    bool checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                          TARVIKNS::OP_TYPE operation, const char* family);
    bool checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OP_TYPE operation,
                          const char* family);

    int getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output);
    int getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                          const char* package);
    int getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output);
    TextSet getDeviceOperationOptions(const char* device, const char* operation, TARVIKNS::MODE_TYPE mode);

    TextSet getDeviceStringProperties(const char* device, const char* key);
    std::optional<std::string> getDeviceStringProperty(const char* device, const char* key);
    bool getDeviceBoolProperty(const char* device, const char* key);
    long getDeviceLongProperty(const char* device, const char* key);

    std::string getPartFamily(const char* device);
    void addCachedDeviceFamily(const char* device, const char* family);
    bool isKorvelDevice(const char* device);
    const Texts& getAllDeviceIdcodes() { return m_deviceIdcodes; }

    bool isSpiDevice(const std::string& device);
    std::string getSpiDeviceStringProperty(const char* device, const char* property);
    bool getSpiDeviceBoolProperty(const char* device, const char* property);
    long getSpiDeviceLongProperty(const char* device, const char* property);

    bool isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width, bool lead);

    void dumpOperationsTable(std::string* recorder);
    void dumpBsdlOperationsTable(std::string* recorder);
    void dumpProgramOptionsTable(std::string* recorder);
    void dumpCachedDeviceFamilies(std::string* recorder);
    void dumpMbBpiSpi();

    // The members that a comparison looks at.
    std::array<std::set<int>, 9> m_cables; ///< by mode
    TextSet m_supportedDevices;
    std::array<TextSet, 9> m_devices; ///< by mode
    TextSet m_programOptionPackages;
    TextSet m_notSupportedPartInMode;
    TextSet m_loadedFamilies;
    std::vector<std::string> m_operationsLoaded;
    std::vector<std::string> m_programOptionsLoaded;
    std::map<std::string, TextSet> m_deviceProperties;
    Texts m_deviceFamilyCache;
    std::string m_partFamily;
    Texts m_spiProperties;
    std::vector<std::string> m_spiNames;
    std::vector<std::string> m_spiFamilies;
    std::array<std::vector<std::string>, 6> m_classDevices; ///< AT1, ST1, ST2, BPI1, BPI2, BPI3
    std::map<std::string, std::vector<std::string>> m_multibootTypes;

private:
    // The start-up.
    void initialise();
    void loadSupportedLists();
    void loadModeSets();
    void loadDeviceIdcodes();
    void loadNotSupportedParts();
    void loadSpiCatalogue();
    void readSpiNames(const Accessor& accessor);
    void readSpiProperties(const Accessor& accessor);
    void readClassDevices(const Accessor& accessor);
    void readMultibootTypes(const Accessor& accessor);

    // The permission entries. A name that has no block in the tables is nothing.
    using Block = std::optional<std::string>;
    int readOperation(const std::string& key, const std::string& family, int location);
    int readMode(const Record& record, const std::string& family, int missing);
    int readOutput(const std::string& text, const std::string& family, int unknown);
    std::vector<std::string> outputTexts(const Record& record, std::size_t first, const std::string& family,
                                         int missing);
    void parseOperationEntries(const Accessor& accessor, const Block& block, const std::string& family);
    void parseBsdlOperationEntries(const Accessor& accessor, const Block& block, const std::string& family);
    void parseProgramOptionEntries(const Accessor& accessor, const std::string& family);
    Block programOptionBlock(const std::string& name);

    // Families, and loading on demand.
    Block operationBlock(const std::string& name);
    void loadDeviceData(const std::string& device, const char* package);
    void loadProperties(const Accessor& accessor, const std::string& owner);
    std::string spiDeviceClass(const std::string& device);

    // Checks and queries.
    bool isSupported(const std::string& device);
    bool isPartAllowedInMode(int mode, const std::string& device, const char* package);
    bool familySupportsMode(int mode, const std::string& device, const char* package);
    bool deviceSupportsMode(int mode, const std::string& device, const char* package);
    bool hasDevicePropertyValue(const std::string& device, const std::string& key, const std::string& value);

    // Messages and failures.
    void issueInfo(int line, const std::string& text);
    void issueDebug(const std::string& text);
    void emit(std::string* recorder, const std::string& piece);
    void raiseIfOn(const std::string& type, int line);

    Databases m_databases;
    std::vector<Message> m_messages;
    bool m_exceptions = false;
    Texts m_deviceIdcodes;
    std::vector<int> m_operationOrders;
    std::vector<int> m_programOptionOrders;

    std::set<std::tuple<std::string, int, int, int>> m_operations; ///< family, operation, mode, output
    std::set<std::tuple<std::string, int, int>> m_bsdlOperations;  ///< family, operation, output
    std::set<std::tuple<std::string, int, int, int>> m_options;    ///< package, option, mode, output
};

/// A null text is the empty text.
[[nodiscard]] std::string textOf(const char* text);

/// Leading blanks, a sign, digits; saturates at 32 bits.
[[nodiscard]] long decimal(const std::string& text);

/// Display names for messages.
[[nodiscard]] std::string modeDisplayName(int mode);
[[nodiscard]] std::string outputDisplayName(int output);

} // namespace reference
