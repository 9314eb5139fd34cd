// Logs the reads of accessors, grouped by value and item.
#include "query/ReadLog.h"

#include <algorithm>
#include <utility>

namespace {

/// The element of this number in a list by numbers, which is made if it is not there. Most reads are about the last one.
template <typename Element>
Element& findOrInsert(std::vector<Element>& list, int Element::*number, Element element) {
    auto place = std::find_if(list.rbegin(), list.rend(),
                              [&](const Element& known) { return known.*number <= element.*number; });
    if (place == list.rend() || (*place).*number != element.*number) {
        return *list.insert(place.base(), std::move(element));
    }
    return *place;
}

} // namespace

const ReadLog::Text* ReadLog::Item::field(int number) const {
    for (const Field& field : fields) {
        if (field.number == number) {
            return field.text ? &*field.text : nullptr;
        }
    }
    return nullptr;
}

catalogue::SourceText ReadLog::Match::sourceText() const {
    const AcdStore::SourceLocation& location = text->location;
    return {text->text,
            {std::string(location.file), location.line, location.column, std::string(location.layer)}};
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

ReadLog::Match ReadLog::last() const { return m_last == nullptr ? Match() : Match{&m_values.back(), m_last}; }

ReadLog::Match ReadLog::lastOrItsRecord() const {
    const Match found = last();
    return found || m_lastRecord == nullptr ? found : Match{&m_values.back(), m_lastRecord};
}

void ReadLog::add(const AcdStore::Read& read) {
    m_last = nullptr;
    m_lastRecord = nullptr;
    if (m_values.empty() || m_values.back().key != read.key || m_values.back().family != read.family ||
        m_values.back().device != read.device) {
        m_values.push_back(
            {std::string(read.family), std::string(read.device), std::string(read.key), read.fromSection});
    }
    std::vector<Item>& items = m_values.back().items;
    if (read.itemLocation.file.empty()) {
        return;
    }
    Item& item =
        findOrInsert(items, &Item::index, {read.item, {std::string(read.itemText), read.itemLocation}});
    m_last = &item.whole;
    m_lastRecord = m_last;
    if (read.subSeparator != nullptr) {
        Field& field = findOrInsert(item.fields, &Field::number, {read.field, std::nullopt});
        if (read.text != nullptr) {
            field.text = Text{read.text, read.location};
        }
        m_last = field.text ? &*field.text : nullptr;
    }
}
