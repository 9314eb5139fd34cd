#pragma once

#include "query/DeviceDetails.h"

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <tuple>
#include <unordered_map>
#include <vector>

namespace report {

/// What is the same for many devices, each once: a JSON list, and the positions of what stands in it.
class Dictionary {
public:
    /// The position of a text, which is added where it is new.
    [[nodiscard]] std::size_t ofText(std::string_view text);

    /// The position of what is JSON already, likewise.
    [[nodiscard]] std::size_t ofJson(std::string_view json);

    /// "[...]"
    [[nodiscard]] std::string list() const { return '[' + m_list + ']'; }

private:
    struct Hash {
        using is_transparent = void;
        std::size_t operator()(std::string_view text) const noexcept {
            return std::hash<std::string_view>()(text);
        }
    };

    [[nodiscard]] std::size_t add(std::string_view key, std::string_view json);

    std::unordered_map<std::string, std::size_t, Hash, std::equal_to<>> m_positions;
    std::string m_list;
};

/// The data that the page's script works with, in script elements that a browser does not run.
///
/// Element "index" is read when the page opens:
///
///     { "modes": [...], "outputs": [...], "letters": "PZUST", "families": [name, ...],
///       "tables": [{"modes": [...], "operations": [[key, OUTPUTS of each mode..., of BSDL], ...],
///                   "options": [[key, OUTPUTS of each mode...], ...]}, ...],
///       "names": [...], "family": [...], "table": [...], "idcode": [...],     by device
///       "faults": {"device": text}, "multiboot": [["type width position", [device, ...]], ...] }
///
/// OUTPUTS is a set: bit i stands for output i. Devices, families and tables are named by their positions.
///
/// Element "family-N" is read when a device of family N is looked at:
///
///     { "files": [...], "words": [...], "rows": [ROW, ...], "sets": [[row, ...], ...],
///       "devices": [[ORIGIN of the IDCODE or 0, PROPERTIES, PROPERTIES of the flash], ...] }
///
/// ORIGIN is three numbers: file, line, column. PROPERTIES is 0, or [ROWs of its own..., set]: the set names the
/// rows that it shares with others. ROW is [word of the key, word of where from, ORIGIN..., values...].
class PageData {
public:
    void add(const DeviceDetails& details);

    /// The script elements.
    void appendTo(std::string& html) const;

private:
    struct Chunk {
        Dictionary files;
        Dictionary words;
        Dictionary rows;
        Dictionary sets;
        std::string devices;
    };

    Chunk& chunk(const std::string& family);
    [[nodiscard]] std::string index() const;

    std::size_t m_count = 0;
    Dictionary m_tables;
    std::map<std::tuple<SharedTable, SharedTable, std::vector<std::string>>, std::size_t> m_tablePositions;
    std::string m_names;
    std::string m_families;
    std::string m_tableOf;
    std::string m_idcodes;
    std::string m_faults;
    std::map<std::string, std::string> m_multiboot; ///< arrangement to positions
    std::vector<Chunk> m_chunks;                    ///< by family
    std::vector<std::string> m_familyNames;
    std::unordered_map<std::string, std::size_t> m_familyPositions;
};

} // namespace report
