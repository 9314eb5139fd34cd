#include "database/ReadLog.h"

#include "database/Database.h"
#include "database/FileNames.h"
#include "database/ParseError.h"

#include <PM_DEVKEY.h>

#include <memory>
#include <utility>

// What was read last, described for those who explain an answer or an exception.

namespace acd {

namespace {

using Observer = std::shared_ptr<const AcdStore::ReadObserver>;

/// The observer of the process. Never destroyed, since destructors of others may still read at exit; shared, so
/// that an observer that replaces itself lives until its own call ends.
Observer& currentObserver() {
    static auto& observer = *new Observer;
    return observer;
}

/// Where the byte at an offset of a value was written.
[[nodiscard]] AcdStore::SourceLocation locationIn(const Database& database, const Value& value,
                                                  std::size_t offset) {
    const LayerSpan span = database.locate(value, offset);
    const std::string_view path = database.path(span.layer);
    return {path, directoryOf(path), span.location.line, span.location.column};
}

} // namespace

const PM_DEVKEY* ReadLog::s_latest = nullptr;
bool ReadLog::s_isObserved = false;

AcdStore::ReadObserver ReadLog::setObserver(AcdStore::ReadObserver observer) {
    auto next = observer ? std::make_shared<const AcdStore::ReadObserver>(std::move(observer)) : nullptr;
    Observer& current = currentObserver();
    // A copy, as the former observer may be in the middle of a call; made first, so that failing changes nothing.
    AcdStore::ReadObserver former = current == nullptr ? AcdStore::ReadObserver() : *current;
    current = std::move(next);
    s_isObserved = current != nullptr;
    return former;
}

AcdStore::Read ReadLog::describe(const PM_DEVKEY& accessor) {
    const Database& database = accessor.m_database;
    const PM_DEVKEY::Request& request = accessor.m_request;
    AcdStore::Read read{};
    read.family = database.family();
    read.device = database.sectionName(accessor.m_section);
    read.key = accessor.m_key;
    read.separator = accessor.m_separator;
    read.item = request.index;
    read.subSeparator = request.hasSubSeparator ? accessor.m_subSeparator.c_str() : nullptr;
    read.field = request.subIndex;

    const Value* const value = database.find(accessor.m_section, accessor.m_key);
    if (value == nullptr) {
        return read;
    }
    read.value = value->text();
    read.fromSection = accessor.m_section != nullptr && database.holds(*accessor.m_section, *value);
    const AcdText::PartCursor& item = accessor.m_item;
    if (read.value.empty() || item.index() != static_cast<std::size_t>(request.index)) {
        return read;
    }
    read.itemText = item.part(read.value);
    read.itemLocation = locationIn(database, *value, item.offset());
    if (request.isFound) {
        const std::size_t offset = request.hasSubSeparator ? accessor.m_field.offset() : 0;
        read.text = accessor.m_result.c_str();
        read.location = locationIn(database, *value, item.offset() + offset);
    }
    return read;
}

std::string ReadLog::describeLatest() {
    if (s_latest == nullptr) {
        return {};
    }
    const AcdStore::Read read = describe(*s_latest);
    std::string text;
    if (read.itemLocation.file.empty()) {
        text = printable(read.family);
    } else {
        const AcdStore::SourceLocation& location = read.text == nullptr ? read.itemLocation : read.location;
        text = printable(location.file) + ':' + std::to_string(location.line) + ':' +
               std::to_string(location.column);
    }
    if (!read.device.empty()) {
        text += ": [" + printable(read.device) + ']';
    }
    text += ": " + excerpt(read.key) + ", item " + std::to_string(read.item);
    if (read.subSeparator != nullptr) {
        text += ", field " + std::to_string(read.field);
    }
    return text + ": " + (read.text == nullptr ? "missing" : '\'' + excerpt(read.text) + '\'');
}

void ReadLog::notify(const PM_DEVKEY& accessor) {
    const Observer observer = currentObserver();
    const struct Silence {
        Silence() noexcept { s_isObserved = false; }
        ~Silence() { s_isObserved = currentObserver() != nullptr; }
    } silence;
    (*observer)(describe(accessor));
}

} // namespace acd
