#include <PM_DEVKEY.h>

#include "database/Database.h"
#include "database/ReadLog.h"
#include "database/Store.h"
#include "text/NullToEmpty.h"

// Keyed reading with two levels of splitting. Lists are read item by item, so the accessor keeps its place:
// the value of the latest key, the latest item and the latest field in it.

namespace {

/// Whether a text that was kept is the one given, null being the empty one. Those are a few bytes: a call into the
/// C library would cost more than the comparison.
[[nodiscard]] bool isSame(const std::string& kept, const char* text) noexcept {
    const char* expected = kept.c_str();
    for (text = nullToEmpty(text); *text == *expected; ++text, ++expected) {
        if (*text == '\0') {
            return true; // nothing that was kept holds a NUL
        }
    }
    return false;
}

} // namespace

PM_DEVKEY::PM_DEVKEY(const char* file, const PM_PIC&, unsigned char, unsigned char, unsigned char)
    : PM_DEVKEY(acd::Store::instance().databaseOfFile(nullToEmpty(file)), nullptr) {}

PM_DEVKEY::PM_DEVKEY(const acd::Database& database, const acd::Section* section) noexcept
    : m_database(database), m_section(section) {}

PM_DEVKEY::~PM_DEVKEY() { acd::ReadLog::forget(*this); }

const char* PM_DEVKEY::getstringbykey(const char* key, const char* separator, short index,
                                      const char* subSeparator, short subIndex) {
    m_request = {index, subIndex, subSeparator != nullptr, false};
    m_request.isFound = find(nullToEmpty(key), separator, subSeparator);
    acd::ReadLog::add(*this);
    return m_request.isFound ? m_result.c_str() : nullptr;
}

/// Looks for what `m_request` asks for, and makes it the result.
/// @return whether it exists
bool PM_DEVKEY::find(const char* key, const char* separator, const char* subSeparator) {
    if (!isSame(m_key, key) || !isSame(m_separator, separator)) {
        select(key, nullToEmpty(separator));
    }
    // A negative index becomes one that is larger than any list.
    // Lists are read field by field, so the current item is asked for most.
    const auto index = static_cast<std::size_t>(m_request.index);
    if (m_value.empty() || (index != m_item.index() && !moveToItem(index))) {
        return false;
    }
    std::string_view part = m_item.part(m_value);
    if (subSeparator != nullptr) {
        if (!isSame(m_subSeparator, subSeparator)) {
            m_subSeparator = subSeparator;
            m_field.start(part, m_subSeparator);
        }
        const auto subIndex = static_cast<std::size_t>(m_request.subIndex);
        if (subIndex != m_field.index() && !m_field.moveTo(subIndex, part, m_subSeparator)) {
            return false;
        }
        part = m_field.part(part);
    }
    // Half as much work as an assignment, which allows for a text that overlaps.
    if (part.size() >= m_result.size()) {
        m_result.resize(part.size() + 1);
    }
    part.copy(m_result.data(), part.size());
    m_result[part.size()] = '\0';
    return true;
}

/// Makes the value of `key` the current one, split at `separator`.
void PM_DEVKEY::select(std::string_view key, std::string_view separator) {
    // Nothing is current while memory may run out: no key is empty.
    m_key.clear();
    m_value = {};
    m_separator = separator;
    m_key = key;
    if (const acd::Value* const value = m_database.find(m_section, key)) {
        m_value = value->text();
        m_item.start(m_value, m_separator);
        m_field.start(m_item.part(m_value), m_subSeparator);
    }
}

bool PM_DEVKEY::moveToItem(std::size_t index) noexcept {
    const std::size_t former = m_item.index();
    const bool found = m_item.moveTo(index, m_value, m_separator);
    if (m_item.index() != former) {
        m_field.start(m_item.part(m_value), m_subSeparator);
    }
    return found;
}
