#pragma once

#include "reference/Outcome.h"

#include <tarvik/tarvik.h>

#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace reference {

/// The manager as a C program sees it, with the methods of the C++ class: what a call of the reference can be put to.
/// A status that stands for an exception is thrown as `Raised`, lack of memory as std::bad_alloc.
class CManager {
public:
    /// Starts a manager over these files, and takes its messages.
    explicit CManager(const std::map<std::string, std::string>& files);
    ~CManager();
    CManager(const CManager&) = delete;
    CManager& operator=(const CManager&) = delete;

    /// What was issued since the last call.
    [[nodiscard]] std::vector<Message> takeMessages() { return m_messages.take(); }

    /// Asks for the manager again.
    void obtain() const;

    void setExceptions(bool exceptions);
    [[nodiscard]] std::vector<int> getOperationOrders() const;
    [[nodiscard]] std::vector<int> getProgramOptionOrders() const;

    int modeString2Type(const char* text);
    std::string modeType2String(TARVIKNS::MODE_TYPE mode);
    int cableString2Type(const char* text);
    std::string cableType2String(TARVIKNS::OUTPUT_TYPE output);
    int operationString2Type(const char* text);
    int operationDisplayString2Type(const char* text);
    std::string operationType2String(TARVIKNS::OP_TYPE operation);
    std::string operationType2DisplayString(TARVIKNS::OP_TYPE operation);
    int optionString2Type(const char* text);
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
    std::set<std::string> getDeviceOperationOptions(const char* device, const char* operation,
                                                    TARVIKNS::MODE_TYPE mode);

    std::set<std::string> getDeviceStringProperties(const char* device, const char* key);
    std::optional<std::string> getDeviceStringProperty(const char* device, const char* key);
    bool getDeviceBoolProperty(const char* device, const char* key);
    long getDeviceLongProperty(const char* device, const char* key);

    std::string getPartFamily(const char* device);
    void addCachedDeviceFamily(const char* device, const char* family);
    bool isKorvelDevice(const char* device);
    std::map<std::string, std::string> getAllDeviceIdcodes();

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

private:
    ManagerMessages m_messages;
};

struct Call;

/// Puts a call to the manager through C.
[[nodiscard]] Outcome ask(CManager& manager, const Call& call);

} // namespace reference
