// Each method of the manager, by the function of the C interface that stands for it.
#include "CManager.h"

#include "Boundary.h"
#include "reference/Invocation.h"
#include "support/TarvikTestPeer.h"

#include <new>
#include <stdexcept>

namespace reference {

namespace {

/// Throws what a status stands for.
void check(tarvik_status status) {
    if (status == TARVIK_OK) {
        return;
    }
    const tarvik_error& error = *tarvik_last_error();
    if (error.status != status) {
        throw std::logic_error("the last error is another one");
    }
    switch (status) {
    case TARVIK_DATA_MISMATCH:
    case TARVIK_OUT_OF_RANGE:
    case TARVIK_DATA_NOT_FOUND: {
        const char* const types[] = {"DataMismatchException", "OutOfRangeException", "DataNotFoundException"};
        std::string type = error.type;
        if (type != types[status - TARVIK_DATA_MISMATCH]) {
            type += " with status " + std::to_string(status);
        }
        if (std::string(error.product) != "Tarvik" ||
            std::string(error.source) != "../s/ConstraintsManager") {
            type += std::string(" from ") + error.product + " " + error.source;
        }
        throw Raised{type, error.line};
    }
    case TARVIK_NO_MEMORY:
        throw std::bad_alloc();
    case TARVIK_CALLBACK_FAILED: // our own callback had no memory to keep the message
        if (std::string(error.type) == "std::bad_alloc") {
            throw std::bad_alloc();
        }
        [[fallthrough]];
    default:
        throw std::logic_error(error.text);
    }
}

/// What a function writes to its last argument.
template <typename Result, typename Function, typename... Arguments>
Result answerOf(Function function, Arguments... arguments) {
    Result result{};
    check(function(arguments..., &result));
    return result;
}

template <typename... All>
bool flagOf(All... all) {
    const int flag = answerOf<int>(all...);
    if (flag != 0 && flag != 1) {
        throw std::logic_error("a flag is neither 0 nor 1");
    }
    return flag == 1;
}

template <typename... All>
int maskOf(All... all) {
    return static_cast<int>(answerOf<std::uint32_t>(all...));
}

std::vector<int> ordersOf(tarvik_status (*function)(int*, std::size_t, std::size_t*)) {
    std::size_t count = 0;
    check(function(nullptr, 0, &count));
    std::vector<int> values(count);
    check(function(values.data(), values.size(), &count));
    return values;
}

std::set<std::string> textsOf(const tarvik_text_set* set) {
    std::set<std::string> texts;
    tarvik_iterator at = {nullptr};
    while (const char* const text = tarvik_text_set_next(set, &at)) {
        texts.insert(texts.end(), text);
    }
    if (texts.size() != tarvik_text_set_size(set)) {
        throw std::logic_error("a set has not the size that it says");
    }
    return texts;
}

void dump(tarvik_status (*function)(const char**), std::string* recorder) {
    const char* table = nullptr;
    check(function(recorder == nullptr ? nullptr : &table));
    if (recorder != nullptr) {
        *recorder = table;
    }
}

int number(auto value) { return static_cast<int>(value); }

} // namespace

CManager::CManager(const std::map<std::string, std::string>& files) {
    TarvikTestPeer::reset();
    boundary::session = {};
    std::vector<tarvik_memory_file> memoryFiles;
    for (const auto& [name, text] : files) {
        memoryFiles.push_back({name.c_str(), text.data(), text.size()});
    }
    check(tarvik_set_memory_files(memoryFiles.data(), memoryFiles.size()));
    check(tarvik_set_message_callback(
        [](const tarvik_message* message, void* context) {
            static_cast<ManagerMessages*>(context)->add(
                {static_cast<Port_MsgManData::Channel>(message->channel), message->product, message->source,
                 message->line, message->revision, message->text});
        },
        &m_messages));
    obtain();
}

CManager::~CManager() {
    TarvikTestPeer::reset();
    boundary::session = {};
}

void CManager::obtain() const { check(tarvik_get_constraints_manager()); }

void CManager::setExceptions(bool exceptions) { check(tarvik_set_exceptions(exceptions ? 1 : 0)); }

std::vector<int> CManager::getOperationOrders() const { return ordersOf(tarvik_get_operation_orders); }

std::vector<int> CManager::getProgramOptionOrders() const {
    return ordersOf(tarvik_get_program_option_orders);
}

int CManager::modeString2Type(const char* text) { return answerOf<int>(tarvik_mode_string_to_type, text); }

std::string CManager::modeType2String(TARVIKNS::MODE_TYPE mode) {
    return answerOf<const char*>(tarvik_mode_type_to_string, number(mode));
}

int CManager::cableString2Type(const char* text) { return answerOf<int>(tarvik_cable_string_to_type, text); }

std::string CManager::cableType2String(TARVIKNS::OUTPUT_TYPE output) {
    return answerOf<const char*>(tarvik_cable_type_to_string, number(output));
}

int CManager::operationString2Type(const char* text) {
    return answerOf<int>(tarvik_operation_string_to_type, text);
}

int CManager::operationDisplayString2Type(const char* text) {
    return answerOf<int>(tarvik_operation_display_string_to_type, text);
}

std::string CManager::operationType2String(TARVIKNS::OP_TYPE operation) {
    return answerOf<const char*>(tarvik_operation_type_to_string, number(operation));
}

std::string CManager::operationType2DisplayString(TARVIKNS::OP_TYPE operation) {
    return answerOf<const char*>(tarvik_operation_type_to_display_string, number(operation));
}

int CManager::optionString2Type(const char* text) {
    return answerOf<int>(tarvik_option_string_to_type, text);
}

std::string CManager::optionType2String(TARVIKNS::PROGRAM_OPTION option) {
    return answerOf<const char*>(tarvik_option_type_to_string, number(option));
}

void CManager::removePackageName(std::string& device) {
    check(tarvik_remove_package_name(device.data()));
    device = device.c_str();
}

bool CManager::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output) {
    return flagOf(tarvik_check_output, number(mode), number(output));
}

bool CManager::checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package) {
    return flagOf(tarvik_check_device, number(mode), device, package);
}

bool CManager::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                                const char* package) {
    return flagOf(tarvik_check_output_and_device, number(mode), number(output), device, package);
}

bool CManager::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                                TARVIKNS::OP_TYPE operation, const char* family) {
    return flagOf(tarvik_check_operation, number(mode), number(output), device, number(operation), family);
}

bool CManager::checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OP_TYPE operation,
                                const char* family) {
    return flagOf(tarvik_check_operation_property, device, number(mode), number(operation), family);
}

int CManager::getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode,
                                  TARVIKNS::OUTPUT_TYPE output) {
    return maskOf(tarvik_get_device_operations, device, number(mode), number(output));
}

int CManager::getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                const char* package) {
    return maskOf(tarvik_get_program_options, device, number(mode), number(output), package);
}

int CManager::getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output) {
    return maskOf(tarvik_get_bsdl_operations, device, number(output));
}

std::set<std::string> CManager::getDeviceOperationOptions(const char* device, const char* operation,
                                                          TARVIKNS::MODE_TYPE mode) {
    return textsOf(answerOf<const tarvik_text_set*>(tarvik_get_device_operation_options, device, operation,
                                                    number(mode)));
}

std::set<std::string> CManager::getDeviceStringProperties(const char* device, const char* key) {
    return textsOf(answerOf<const tarvik_text_set*>(tarvik_get_device_string_properties, device, key));
}

std::optional<std::string> CManager::getDeviceStringProperty(const char* device, const char* key) {
    const char* const value = answerOf<const char*>(tarvik_get_device_string_property, device, key);
    return value == nullptr ? std::nullopt : std::optional<std::string>(value);
}

bool CManager::getDeviceBoolProperty(const char* device, const char* key) {
    return flagOf(tarvik_get_device_bool_property, device, key);
}

long CManager::getDeviceLongProperty(const char* device, const char* key) {
    return answerOf<std::int32_t>(tarvik_get_device_long_property, device, key);
}

std::string CManager::getPartFamily(const char* device) {
    return answerOf<const char*>(tarvik_get_part_family, device);
}

void CManager::addCachedDeviceFamily(const char* device, const char* family) {
    check(tarvik_add_cached_device_family(device, family));
}

bool CManager::isKorvelDevice(const char* device) { return flagOf(tarvik_is_korvel_device, device); }

std::map<std::string, std::string> CManager::getAllDeviceIdcodes() {
    const auto* const map = answerOf<const tarvik_text_map*>(tarvik_get_all_device_idcodes);
    std::map<std::string, std::string> idcodes;
    tarvik_iterator at = {nullptr};
    const char* value = nullptr;
    while (const char* const key = tarvik_text_map_next(map, &at, &value)) {
        idcodes.emplace_hint(idcodes.end(), key, value);
    }
    if (idcodes.size() != tarvik_text_map_size(map)) {
        throw std::logic_error("a map has not the size that it says");
    }
    return idcodes;
}

bool CManager::isSpiDevice(const std::string& device) { return flagOf(tarvik_is_spi_device, device.c_str()); }

std::string CManager::getSpiDeviceStringProperty(const char* device, const char* property) {
    return answerOf<const char*>(tarvik_get_spi_device_string_property, device, property);
}

bool CManager::getSpiDeviceBoolProperty(const char* device, const char* property) {
    return flagOf(tarvik_get_spi_device_bool_property, device, property);
}

long CManager::getSpiDeviceLongProperty(const char* device, const char* property) {
    return answerOf<std::int32_t>(tarvik_get_spi_device_long_property, device, property);
}

bool CManager::isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width, bool lead) {
    return flagOf(tarvik_is_mb_bpi_spi_support, device, typePrefix, width, lead ? 1 : 0);
}

void CManager::dumpOperationsTable(std::string* recorder) { dump(tarvik_dump_operations_table, recorder); }

void CManager::dumpBsdlOperationsTable(std::string* recorder) {
    dump(tarvik_dump_bsdl_operations_table, recorder);
}

void CManager::dumpProgramOptionsTable(std::string* recorder) {
    dump(tarvik_dump_program_options_table, recorder);
}

void CManager::dumpCachedDeviceFamilies(std::string* recorder) {
    dump(tarvik_dump_cached_device_families, recorder);
}

void CManager::dumpMbBpiSpi() { check(tarvik_dump_mb_bpi_spi()); }

template <>
struct Terms<CManager> {
    using Recorder = std::string;
    static std::string text(const std::string& text) { return text; }
    static std::string recorded(const std::string& recorder) { return show(recorder); }
    static bool isTheOne(const CManager& manager) {
        manager.obtain();
        return true;
    }
};

Outcome ask(CManager& manager, const Call& call) {
    Outcome outcome;
    try {
        outcome.result = invoke(manager, call);
    } catch (const Raised& raised) {
        outcome.result = showRaised(raised.type, raised.line);
    }
    outcome.messages = manager.takeMessages();
    return outcome;
}

} // namespace reference
