// Logs the reads of accessors, grouped by value and item.
#include "query/ReadLog.h"

#include <algorithm>
#include <utility>

namespace {

catalogue::SourceText sourceText(std::string_view text, const AcdStore::SourceLocation& location) {
    return {std::string(text),
            {std::string(location.file), location.line, location.column, std::string(location.layer)}};
}

} // namespace

const ReadLog::SourceText* ReadLog::Item::field(int number) const {
    const auto found = fields.find(number);
    return found != fields.end() && found->second ? &*found->second : nullptr;
}

const ReadLog::Item* ReadLog::Value::item(int index) const {
    const auto found =
        std::find_if(items.begin(), items.end(), [&](const Item& item) { return item.index == index; });
    return found == items.end() ? nullptr : &*found;
}

std::string ReadLog::Value::accessorName() const { return device.empty() ? family + ".acd" : device; }

catalogue::Shadows ReadLog::Value::shadows() const {
    const std::optional<AcdStore::Value> value = AcdStore::value(accessorName().c_str(), key.c_str());
    return value ? catalogue::shadowsOf(*value) : catalogue::Shadows();
}

void ReadLog::record(const std::function<void()>& work) {
    const struct Restoration {
        AcdStore::ReadObserver former;
        ~Restoration() { AcdStore::setReadObserver(former); }
    } restoration{AcdStore::setReadObserver([this](const AcdStore::Read& read) { add(read); })};
    work();
}

const ReadLog::Value* ReadLog::find(const std::string& key) const {
    const auto found =
        std::find_if(m_values.begin(), m_values.end(), [&](const Value& value) { return value.key == key; });
    return found == m_values.end() ? nullptr : &*found;
}

ReadLog::Match ReadLog::findItem(const std::string& key, const std::string& text) const {
    if (const Value* const value = find(key)) {
        for (const Item& item : value->items) {
            if (item.whole.text == text) {
                return {value, &item.whole};
            }
        }
    }
    return {};
}

const ReadLog::Value* ReadLog::findWithItem(const std::string& key, int index) const {
    const auto found = std::find_if(m_values.begin(), m_values.end(), [&](const Value& value) {
        return value.key == key && value.item(index) != nullptr;
    });
    return found == m_values.end() ? nullptr : &*found;
}

ReadLog::Match ReadLog::last() const {
    return m_last == nullptr ? Match() : Match{&m_values.back(), m_last};
}

void ReadLog::add(const AcdStore::Read& read) {
    m_last = nullptr;
    if (m_values.empty() || m_values.back().key != read.key || m_values.back().family != read.family ||
        m_values.back().device != read.device) {
        m_values.push_back({std::string(read.family), std::string(read.device), std::string(read.key),
                            read.fromSection});
    }
    std::vector<Item>& items = m_values.back().items;
    if (read.itemLocation.file.empty()) {
        return;
    }
    auto item = std::find_if(items.rbegin(), items.rend(),
                             [&](const Item& known) { return known.index <= read.item; });
    if (item == items.rend() || item->index != read.item) {
        items.push_back({read.item, sourceText(read.itemText, read.itemLocation), {}});
        item = items.rbegin();
    }
    m_last = &item->whole;
    if (read.subSeparator != nullptr) {
        std::optional<SourceText>& field = item->fields[read.field];
        field = read.text == nullptr ? std::nullopt : std::optional(sourceText(read.text, read.location));
        m_last = field ? &*field : nullptr;
    }
}
