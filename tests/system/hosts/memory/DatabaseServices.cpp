#include <AcdReader.h>
#include <HostCall.h>
#include <MemoryDatabases.h>
#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <TarvikException.h>

#include <optional>
#include <string_view>
#include <utility>

// The databases of the in-memory host. What it hands out lives no longer than it must, so that a manager that
// holds on to a text or an accessor too long is found out.

namespace {

memory_host::Databases& databases() {
    static memory_host::Databases held;
    return held;
}

/// The database of a name, or of what stands before its first "_"; null when there is neither.
const memory_host::Database* find(const char* name) {
    const std::string whole(name);
    for (const std::string& sought : {whole, whole.substr(0, whole.find('_'))}) {
        const auto found = databases().find(sought);
        if (found != databases().end()) {
            return &found->second;
        }
    }
    return nullptr;
}

/// A piece of a text that is split at a separator.
std::optional<std::string_view> piece(std::string_view text, std::string_view separator, short index) {
    if (index < 0) {
        return std::nullopt;
    }
    for (; index > 0; --index) {
        const std::size_t end = text.find(separator);
        if (end == std::string_view::npos) {
            return std::nullopt;
        }
        text.remove_prefix(end + separator.size());
    }
    return text.substr(0, text.find(separator));
}

} // namespace

void memory_host::setDatabases(Databases replacement) { databases() = std::move(replacement); }

PM_DEVKEY::PM_DEVKEY(const char* name) : m_name(name) {
    if (const memory_host::Database* const database = find(name)) {
        m_values = database->values;
    }
}

PM_DEVKEY::PM_DEVKEY(const char* file, const PM_PIC& /*configuration*/, unsigned char /*flag1*/,
                     unsigned char /*flag2*/, unsigned char /*flag3*/)
    : PM_DEVKEY(file) {
    hostCall("PM_DEVKEY", file);
}

const char* PM_DEVKEY::getstringbykey(const char* key, const char* separator, short index,
                                      const char* subSeparator, short subIndex) {
    m_result.reset();
    hostCall("getstringbykey", m_name.c_str(), key);
    const auto value = m_values.find(key);
    if (value == m_values.end() || value->second.empty()) {
        return nullptr;
    }
    auto result = piece(value->second, separator, index);
    if (result && subSeparator != nullptr) {
        result = piece(*result, subSeparator, subIndex);
    }
    if (!result) {
        return nullptr;
    }
    m_result = std::make_unique<std::string>(*result);
    return m_result->c_str();
}

AcdReader::AcdReader() : m_module("base") {
    hostCall("AcdReader", "base");
    if (find("base") == nullptr) {
        throw DataNotFoundException("", "", "", 0);
    }
    // The manager keeps this accessor for good.
    static std::shared_ptr<PM_DEVKEY> kept;
    kept = m_accessor = std::make_shared<PM_DEVKEY>("base");
}

AcdReader::AcdReader(const char* name) : m_accessor(std::make_shared<PM_DEVKEY>(name)) {
    hostCall("AcdReader", name);
    const memory_host::Database* const database = find(name);
    m_module = database == nullptr ? "base" : database->family;
}

AcdReader::~AcdReader() { hostClosed(m_module.c_str()); }

PM_DEVKEY* AcdReader::getDevkey() const {
    hostCall("getDevkey");
    return m_accessor.get();
}

const char* AcdReader::getPM() const {
    hostCall("getPM");
    return m_module.c_str();
}

PicConfig::PicConfig(const char* name, int /*flag*/, PM_PARTNAME_BINDING /*binding*/) {
    hostCall("PicConfig", name);
    if (const memory_host::Database* const database = find(name)) {
        m_module = database->family;
    }
}

const char* PM_SPEC::get_pm() const {
    hostCall("get_pm");
    return m_module ? m_module->c_str() : nullptr;
}
