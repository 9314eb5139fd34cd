#pragma once

#include <nlohmann/json.hpp>

#include <algorithm>
#include <cstddef>
#include <stdexcept>
#include <string>

/// Reads the data of a page back into what `show --json` says about each device.
class PageData {
public:
    using Json = nlohmann::json;

    explicit PageData(const std::string& page) : m_page(page), m_index(element("index")) {}

    [[nodiscard]] std::size_t size() const { return m_index.at("names").size(); }
    [[nodiscard]] std::string name(std::size_t device) const { return m_index.at("names").at(device); }

    /// Null when there is none.
    [[nodiscard]] Json fault(std::size_t device) const {
        return m_index.at("faults").value(std::to_string(device), Json());
    }

    /// "device", "family", "idcode", "modes", "properties", "flashProperties", "multiboot", "operations", "bsdl" and
    /// "options".
    [[nodiscard]] Json sheet(std::size_t device) const {
        const std::size_t family = m_index.at("family").at(device);
        const Json chunk = element("family-" + std::to_string(family));
        const Json coded = chunk.at("devices").at(ordinal(device));
        const Json table = m_index.at("tables").at(m_index.at("table").at(device).get<std::size_t>());
        Json idcode;
        if (coded.at(0).is_array()) {
            idcode = origin(chunk, coded.at(0), 0);
            idcode["value"] = m_index.at("idcode").at(device);
        }
        return {{"device", name(device)},
                {"family", m_index.at("families").at(family)},
                {"idcode", idcode},
                {"modes", table.at("modes")},
                {"properties", properties(chunk, coded.at(1))},
                {"flashProperties", properties(chunk, coded.at(2))},
                {"multiboot", multiboot(device)},
                {"operations", matrix(table.at("operations"), modes())},
                {"bsdl", bsdl(table.at("operations"))},
                {"options", matrix(table.at("options"), modes())}};
    }

private:
    [[nodiscard]] Json element(const std::string& id) const {
        const std::string opening = R"(<script type="application/json" id=")" + id + "\">";
        const std::size_t begin = m_page.find(opening);
        if (begin == std::string::npos) {
            throw std::runtime_error("the page has no data " + id);
        }
        const std::size_t text = begin + opening.size();
        return Json::parse(m_page.substr(text, m_page.find("</script>", text) - text));
    }

    [[nodiscard]] std::size_t modes() const { return m_index.at("modes").size(); }

    [[nodiscard]] std::size_t ordinal(std::size_t device) const {
        const auto begin = m_index.at("family").begin();
        return static_cast<std::size_t>(
            std::count(begin, begin + static_cast<std::ptrdiff_t>(device), m_index.at("family").at(device)));
    }

    static Json origin(const Json& chunk, const Json& from, std::size_t first) {
        return {{"file", chunk.at("files").at(from.at(first).get<std::size_t>())},
                {"line", from.at(first + 1)},
                {"column", from.at(first + 2)}};
    }

    static Json property(const Json& chunk, const Json& row) {
        Json one = origin(chunk, row, 2);
        one["key"] = chunk.at("words").at(row.at(0).get<std::size_t>());
        one["from"] = chunk.at("words").at(row.at(1).get<std::size_t>());
        one["values"] = Json::array();
        for (std::size_t value = 5; value < row.size(); ++value) {
            one["values"].push_back(row.at(value));
        }
        return one;
    }

    static Json properties(const Json& chunk, const Json& coded) {
        Json list = Json::array();
        if (coded.is_array()) {
            for (std::size_t i = 0; i + 1 < coded.size(); ++i) {
                list.push_back(property(chunk, coded.at(i)));
            }
            for (const std::size_t row : chunk.at("sets").at(coded.back().get<std::size_t>())) {
                list.push_back(property(chunk, chunk.at("rows").at(row)));
            }
        }
        return list;
    }

    [[nodiscard]] Json multiboot(std::size_t device) const {
        Json list = Json::array();
        for (const Json& arrangement : m_index.at("multiboot")) {
            const Json& members = arrangement.at(1);
            if (std::find(members.begin(), members.end(), device) != members.end()) {
                list.push_back(arrangement.at(0));
            }
        }
        return list;
    }

    [[nodiscard]] Json outputKeys(unsigned outputs) const {
        Json keys = Json::array();
        for (std::size_t output = 0; output < m_index.at("outputs").size(); ++output) {
            if ((outputs >> output & 1U) != 0) {
                keys.push_back(m_index.at("outputs").at(output));
            }
        }
        return keys;
    }

    [[nodiscard]] Json matrix(const Json& rows, std::size_t columns) const {
        Json object = Json::object();
        for (const Json& row : rows) {
            for (std::size_t mode = 0; mode < columns; ++mode) {
                if (row.at(mode + 1) != 0U) {
                    object[row.at(0).get<std::string>()][m_index.at("modes").at(mode).get<std::string>()] =
                        outputKeys(row.at(mode + 1));
                }
            }
        }
        return object;
    }

    [[nodiscard]] Json bsdl(const Json& rows) const {
        Json object = Json::object();
        for (const Json& row : rows) {
            if (row.at(modes() + 1) != 0U) {
                object[row.at(0).get<std::string>()] = outputKeys(row.at(modes() + 1));
            }
        }
        return object;
    }

    std::string m_page;
    Json m_index;
};
