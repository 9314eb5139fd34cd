// The overview that the page opens with: what there is, at a glance.
#include "report/Overview.h"

#include "model/Vocabulary.h"
#include "report/HtmlEscape.h"

#include <tarvik/TARVIKNS.h>

#include <fmt/format.h>

#include <algorithm>
#include <bitset>
#include <iterator>

namespace report {

namespace {

constexpr unsigned SHADES = 5;

template <typename Pairs>
unsigned count(const Pairs& pairs) {
    std::size_t all = 0;
    for (const DeviceTable::Outputs outputs : pairs) {
        all += std::bitset<DeviceTable::OUTPUTS>(outputs).count();
    }
    return static_cast<unsigned>(all);
}

} // namespace

void Overview::add(const DeviceDetails& details) {
    const auto [known, isNew] = m_positions.try_emplace(details.family, m_families.size());
    if (isNew) {
        m_families.push_back({details.family, 0, {}});
    }
    Family& family = m_families[known->second];
    ++family.devices;
    for (const DeviceTable::Row& row : details.operations->rows) {
        Pairs& pairs = family.operations[row.key];
        for (std::size_t mode = 0; mode < pairs.size(); ++mode) {
            // What is allowed in SPI mode is the flashes' own, although every device is asked as one there.
            if (details.flash || mode != static_cast<std::size_t>(TARVIKNS::MODE_TYPE::SPI)) {
                pairs.at(mode) |= row.outputs.at(mode);
            }
        }
    }
}

std::vector<std::string> Overview::operations() const {
    std::vector<std::string> used;
    for (const std::string& key : vocabulary::operations()) {
        const bool isUsed = std::any_of(m_families.begin(), m_families.end(), [&](const Family& family) {
            const auto found = family.operations.find(key);
            return found != family.operations.end() && count(found->second) != 0;
        });
        if (isUsed) {
            used.push_back(key);
        }
    }
    return used;
}

unsigned Overview::most() const {
    unsigned most = 1;
    for (const Family& family : m_families) {
        for (const auto& [key, pairs] : family.operations) {
            most = std::max(most, count(pairs));
        }
    }
    return most;
}

std::string Overview::html() const {
    const std::vector<std::string> columns = operations();
    std::string html = "<table class=\"overview\">\n<caption class=\"unseen\">Families by operations: pairs "
                       "of mode and output "
                       "that allow the operation</caption>\n<thead><tr><th scope=\"col\">Family</th>"
                       "<th scope=\"col\" class=\"number\">Devices</th>";
    for (const std::string& key : columns) {
        html += fmt::format("<th scope=\"col\" class=\"slanted\"><span>{}</span></th>", key);
    }
    html += "</tr></thead>\n<tbody>\n";
    const unsigned scale = most();
    for (const Family& family : m_families) {
        html +=
            fmt::format("<tr><th scope=\"row\"><a href=\"#in-{}\">{}</a></th><td class=\"number\">{}</td>",
                        urlFragment(family.name), escaped(family.name), family.devices);
        for (const std::string& key : columns) {
            const auto found = family.operations.find(key);
            const unsigned pairs = found == family.operations.end() ? 0 : count(found->second);
            if (pairs == 0) {
                html += "<td></td>";
            } else {
                fmt::format_to(std::back_inserter(html), "<td class=\"shade-{}\">{}</td>",
                               (pairs * SHADES + scale - 1) / scale, pairs);
            }
        }
        html += "</tr>\n";
    }
    return html + "</tbody>\n</table>\n";
}

} // namespace report
