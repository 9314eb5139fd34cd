// Reads records of the database, with the place of each field.
#include "model/Records.h"

#include "model/RecordSplitter.h"
#include "text/Suggest.h"

#include <algorithm>

namespace catalogue {

namespace {

SourceText sourceText(const AcdStore::Value& value, std::string_view text, std::size_t offset) {
    return {std::string(text), originOf(value.at(offset))};
}

void addRecords(const AcdStore::Value& value, std::vector<Record>& records) {
    splitter::forEachItem(value.text, splitter::RECORDS, [&](std::string_view text, std::size_t offset) {
        Record& record = records.emplace_back(Record{sourceText(value, text, offset), {}});
        splitter::forEachField(text, splitter::FIELDS, [&](std::string_view field, std::size_t within) {
            record.fields.push_back(sourceText(value, field, offset + within));
        });
    });
}

} // namespace

Records readRecords(const std::string& database, const std::string& key) {
    Records records;
    if (const std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str())) {
        records.isSet = true;
        records.ofDevice = value->fromSection;
        records.shadows = shadowsOf(*value);
        addRecords(*value, records.all);
        for (const AcdStore::Value& replaced : value->replaced) {
            addRecords(replaced, records.shadowed);
        }
    }
    return records;
}

std::vector<SourceText> readList(const std::string& database, const std::string& key) {
    std::vector<SourceText> items;
    if (const std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str())) {
        splitter::forEachItem(value->text, splitter::FIELDS, [&](std::string_view text, std::size_t offset) {
            items.push_back(sourceText(*value, text, offset));
        });
    }
    return items;
}

bool hasFamilyFile(const std::string& name) {
    const std::vector<std::string> families = AcdStore::families();
    return std::any_of(families.begin(), families.end(),
                       [&](const std::string& family) { return sameWithoutCase(family, name); });
}

} // namespace catalogue
