// The texts of records that are written for something new.
#include "edit/CreatedRecords.h"

#include "model/Schema.h"
#include "model/Vocabulary.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <iterator>
#include <utility>

namespace edit {

std::string packagesRecord(const Creation& creation) {
    return creation.packages.empty() ? std::string()
                                     : fmt::format("{},{},{}", schema::PACKAGES, creation.packages.size(),
                                                   fmt::join(creation.packages, ","));
}

std::vector<std::string> operationRecords(const Creation& creation) {
    // The tables have cells for some of the modes and outputs only.
    std::vector<std::string> outputs;
    const std::vector<std::string>& known = schema::tableOutputs();
    std::copy_if(creation.outputs.begin(), creation.outputs.end(), std::back_inserter(outputs),
                 [&known](const std::string& output) {
                     return std::find(known.begin(), known.end(), output) != known.end();
                 });
    std::vector<std::string> records;
    for (const std::string& operation : creation.operations) {
        for (const std::string& mode : creation.modes) {
            const auto position = static_cast<std::size_t>(vocabulary::readMode(mode));
            if (position < schema::tableModes().size() && !outputs.empty()) {
                records.push_back(fmt::format("{},{},{}", operation, schema::tableModes()[position],
                                              fmt::join(outputs, ",")));
            }
        }
    }
    return records;
}

std::vector<std::string> modeRecords(const Creation& creation) {
    std::vector<std::string> records;
    for (const std::string& operation : creation.operations) {
        records.push_back(
            fmt::format("{},{},{}", operation, creation.modes.size(), fmt::join(creation.modes, ",")));
    }
    return records;
}

std::vector<std::string> textsWith(const catalogue::Records& records, std::string_view name,
                                   std::string record) {
    std::vector<std::string> texts;
    for (const catalogue::Record& each : records.all) {
        const bool isReplaced = !record.empty() && each.field(0)->text == name;
        texts.push_back(isReplaced ? std::exchange(record, {}) : each.whole.text);
    }
    if (!record.empty()) {
        texts.push_back(std::move(record));
    }
    return texts;
}

} // namespace edit
