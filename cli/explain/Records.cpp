// Reads the database as the manager does, keeping for every piece where it stands.
#include "explain/Records.h"

#include "text/Suggest.h"

#include <AcdStore.h>

#include <algorithm>
#include <iterator>
#include <string_view>

namespace why {

namespace {

/// Lists are read with 16-bit numbers: what stands behind the last of them is never seen.
constexpr std::size_t MOST_PIECES = 32768;

class Splitter {
public:
    explicit Splitter(const AcdStore::Value& value)
        : m_value(value), m_shadows(catalogue::shadowsOf(value)) {}

    /// The pieces of the text that starts at `offset`.
    [[nodiscard]] std::vector<Piece> pieces(std::string_view text, std::size_t offset, char separator) const {
        std::vector<Piece> found;
        for (std::size_t start = 0; start <= text.size() && found.size() < MOST_PIECES;) {
            const std::size_t end = std::min(text.find(separator, start), text.size());
            found.push_back(piece(text.substr(start, end - start), offset + start));
            start = end + 1;
        }
        return found;
    }

    [[nodiscard]] std::vector<Record> records() const {
        std::vector<Record> found;
        const std::string_view text = m_value.text;
        for (std::size_t start = 0; start <= text.size() && found.size() < MOST_PIECES;) {
            const std::size_t end = std::min(text.find(':', start), text.size());
            const std::string_view record = text.substr(start, end - start);
            found.push_back({piece(record, start), pieces(record, start, ',')});
            start = end + 1;
        }
        return found;
    }

private:
    [[nodiscard]] Piece piece(std::string_view text, std::size_t offset) const {
        return {std::string(text), catalogue::originOf(m_value.at(offset)), m_shadows};
    }

    const AcdStore::Value& m_value;
    catalogue::Shadows m_shadows;
};

/// A value that holds something: an empty one has no items at all.
std::optional<AcdStore::Value> valueWithItems(const std::string& database, const std::string& key) {
    std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str());
    return value && !value->text.empty() ? std::move(value) : std::nullopt;
}

} // namespace

Records readRecords(const std::string& database, const std::string& key) {
    const std::optional<AcdStore::Value> value = valueWithItems(database, key);
    return value ? Records{value->fromSection, Splitter(*value).records()} : Records{};
}

std::vector<Record> readShadowedRecords(const std::string& database, const std::string& key) {
    std::vector<Record> all;
    if (const std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str())) {
        for (const AcdStore::Value& replaced : value->replaced) {
            std::vector<Record> records = Splitter(replaced).records();
            std::move(records.begin(), records.end(), std::back_inserter(all));
        }
    }
    return all;
}

std::vector<Piece> readList(const std::string& database, const std::string& key) {
    const std::optional<AcdStore::Value> value = valueWithItems(database, key);
    return value ? Splitter(*value).pieces(value->text, 0, ',') : std::vector<Piece>{};
}

bool hasFamilyFile(const std::string& name) {
    const std::vector<std::string> families = AcdStore::families();
    return std::any_of(families.begin(), families.end(),
                       [&](const std::string& family) { return sameWithoutCase(family, name); });
}

} // namespace why
