// The parts of the page that are written as HTML, for browsers without scripts and for small databases.
#include "report/HtmlSections.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "report/HtmlEscape.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <iterator>
#include <set>

namespace report {

namespace {

std::string place(const catalogue::Origin& origin) { return escaped(catalogue::asText(origin)); }

/// The outputs as letters, each in its place.
std::string cell(DeviceTable::Outputs outputs) {
    if (outputs == 0) {
        return "<td class=\"none\">–</td>";
    }
    const std::string letters = outputLetters();
    std::vector<std::string> keys;
    std::string marks;
    for (std::size_t output = 0; output < letters.size(); ++output) {
        if ((outputs >> output & 1U) != 0) {
            keys.push_back(vocabulary::outputs().at(output));
            marks += fmt::format("<b>{}</b>", letters[output]);
        } else {
            marks += "<i>·</i>";
        }
    }
    const std::string words = fmt::format("{}", fmt::join(keys, ", "));
    return fmt::format("<td aria-label=\"{0}\" title=\"{0}\">{1}</td>", words, marks);
}

/// A table that scrolls by itself where it is too wide.
std::string scrolling(const std::string& label, const std::string& device, const std::string& table) {
    return fmt::format(
        "<div class=\"scroll\" tabindex=\"0\" role=\"region\" aria-label=\"{} of {}\">{}</div>", label,
        escaped(device), table);
}

std::string headings(const std::vector<std::string>& texts) {
    std::string html = "<thead><tr>";
    for (const std::string& text : texts) {
        html += fmt::format("<th scope=\"col\">{}</th>", escaped(text));
    }
    return html + "</tr></thead>";
}

/// The meaning of the letters in a matrix: "P PARALLEL, Z ZORVA".
std::string legend() {
    const std::string letters = outputLetters();
    std::vector<std::string> words;
    for (std::size_t output = 0; output < letters.size(); ++output) {
        words.push_back(fmt::format("<b>{}</b> {}", letters[output], vocabulary::outputs().at(output)));
    }
    return fmt::format("<span class=\"legend\">{}</span>", fmt::join(words, ", "));
}

/// Marks a row that other devices than flashes have in SPI mode only.
std::string mark() { return fmt::format(" <i title=\"{}\">(spi)</i>", escaped(questions::SPI_MODE_RULE)); }

std::string matrix(const std::string& title, const std::vector<DeviceTable::Row>& rows, bool withBsdl,
                   const DeviceDetails& details) {
    if (rows.empty()) {
        return {};
    }
    std::vector<std::string> columns{""};
    columns.insert(columns.end(), vocabulary::modes().begin(),
                   vocabulary::modes().begin() + DeviceTable::MODES);
    if (withBsdl) {
        columns.emplace_back("BSDL");
    }
    std::string html = fmt::format("<table class=\"matrix\"><caption>{} {}</caption>{}<tbody>", title,
                                   legend(), headings(columns));
    for (const DeviceTable::Row& row : rows) {
        html += fmt::format("<tr><th scope=\"row\">{}{}</th>", escaped(row.key),
                            !details.flash && row.isOfSpiModeOnly() ? mark() : "");
        for (const DeviceTable::Outputs outputs : row.outputs) {
            html += cell(outputs);
        }
        html += (withBsdl ? cell(row.bsdl) : "") + "</tr>";
    }
    return scrolling(title, details.name, html + "</tbody></table>");
}

std::string values(const Property& property) {
    std::vector<std::string> texts;
    for (const std::string& value : property.values) {
        texts.push_back(escaped(value));
    }
    return texts.empty() ? "(none)" : fmt::format("{}", fmt::join(texts, ", "));
}

std::string propertyRows(const Properties& properties, bool own) {
    std::string html;
    for (const Property& property : properties) {
        if ((property.from == "device") == own) {
            fmt::format_to(
                std::back_inserter(html),
                "<tr><th scope=\"row\">{}</th><td>{}</td><td>{}</td><td class=\"origin\">{}</td></tr>",
                escaped(property.key), values(property), escaped(property.from), place(property.origin));
        }
    }
    return html;
}

/// A device's own properties stand before those that it has from elsewhere.
std::string propertyTable(const std::string& title, const Properties& properties, const std::string& device) {
    if (properties.empty()) {
        return {};
    }
    return scrolling(
        title, device,
        fmt::format("<table class=\"properties\"><caption>{}</caption>{}<tbody>{}{}</tbody></table>", title,
                    headings({"Property", "Value", "From", "Where"}), propertyRows(properties, true),
                    propertyRows(properties, false)));
}

std::string fact(const std::string& term, const std::string& html) {
    return fmt::format("<div><dt>{}</dt><dd>{}</dd></div>", term, html);
}

std::string facts(const DeviceDetails& details) {
    std::string html = fact("Family", escaped(details.family));
    if (details.idcode) {
        html += fact("IDCODE", fmt::format("<code>{}</code> <span class=\"origin\">{}</span>",
                                           escaped(details.idcode->value), place(details.idcode->origin)));
    }
    html += fact("Modes", fmt::format("{}", fmt::join(details.modes, " ")));
    if (!details.multiboot.empty()) {
        std::vector<std::string> arrangements;
        for (const DeviceDetails::Arrangement& one : details.multiboot) {
            arrangements.push_back(fmt::format("{} {} {}", one.type, one.width, one.position));
        }
        html += fact("Multiboot", fmt::format("{}", fmt::join(arrangements, ", ")));
    }
    return "<dl class=\"facts\">" + html + "</dl>";
}

std::string bodyOf(const DeviceDetails& details) {
    if (const std::string reason = details.whyIncomplete(); !reason.empty()) {
        return fmt::format("<p class=\"fault\">No answer: {}</p>", escaped(reason));
    }
    return facts(details) + matrix("Operations", details.operations->rows, true, details) +
           matrix("Programming options", details.options->rows, false, details) +
           propertyTable("Properties", details.shownProperties(), details.name) +
           propertyTable("Properties of the flash", details.flashProperties, details.name);
}

} // namespace

std::string deviceHtml(const DeviceDetails& details) {
    return fmt::format("<details class=\"device\"><summary><h4>{0}</h4> <span class=\"idcode\">{1}</span> "
                       "<span class=\"modes\">{2}</span></summary><div class=\"sheet\" "
                       "id=\"device-{0}\">{3}</div></details>\n",
                       escaped(details.name), escaped(details.idcode ? details.idcode->value : ""),
                       fmt::join(details.modes, " "), bodyOf(details));
}

std::string familyHeading(const std::string& family) {
    return fmt::format("<h3 id=\"in-{0}\">{0}</h3>\n", escaped(family));
}

std::string linkTo(const std::string& device) {
    return fmt::format("<a href=\"#device-{}\">{}</a>", urlFragment(device), escaped(device));
}

FlashTable::FlashTable() {
    for (catalogue::Flash& flash : catalogue::flashes()) {
        m_families.try_emplace(std::move(flash.name), std::move(flash.family));
    }
}

void FlashTable::add(const DeviceDetails& details) {
    if (details.flash) {
        Row row{details.name, {}};
        for (const Property& property : details.flashProperties) {
            row.values[property.key] = values(property);
        }
        m_rows.push_back(std::move(row));
    }
}

std::string FlashTable::html() const {
    if (m_rows.empty()) {
        return {};
    }
    std::set<std::string> keys;
    for (const Row& row : m_rows) {
        for (const auto& [key, value] : row.values) {
            keys.insert(key);
        }
    }
    std::vector<std::string> columns{"Flash", "Family"};
    columns.insert(columns.end(), keys.begin(), keys.end());
    std::string html = "<table class=\"list\"><caption class=\"unseen\">SPI and BPI flashes</caption>" +
                       headings(columns) + "<tbody>\n";
    for (const Row& row : m_rows) {
        const auto family = m_families.find(row.name);
        html += fmt::format("<tr><th scope=\"row\">{}</th><td>{}</td>", linkTo(row.name),
                            family == m_families.end() ? "" : escaped(family->second));
        for (const std::string& key : keys) {
            const auto value = row.values.find(key);
            html += "<td>" + (value == row.values.end() ? "" : value->second) + "</td>";
        }
        html += "</tr>\n";
    }
    return html + "</tbody></table>\n";
}

void MultibootTable::add(const DeviceDetails& details) {
    for (const DeviceDetails::Arrangement& one : details.multiboot) {
        m_devices[{one.type, one.width, one.position}].push_back(details.name);
    }
}

std::string MultibootTable::html(bool withLinks) const {
    if (m_devices.empty()) {
        return {};
    }
    std::string html =
        "<table class=\"list multiboot\"><caption class=\"unseen\">Multiboot arrangements and the "
        "devices that support them</caption>" +
        headings({"Type", "Width", "Position", "Devices"}) + "<tbody>\n";
    multiboot::forEachArrangement([&](const std::string& type, const std::string& width, bool lead) {
        const std::string position = lead ? "lead" : "chain";
        const auto found = m_devices.find({type, width, position});
        if (found == m_devices.end()) {
            return;
        }
        html += fmt::format("<tr><th scope=\"row\">{}</th><td>{}</td><td>{}</td>"
                            "<td><details><summary>{} devices</summary>",
                            type, width, position, found->second.size());
        if (withLinks) {
            for (const std::string& device : found->second) {
                html += ' ' + linkTo(device);
            }
        }
        html += "</details></td></tr>\n";
    });
    return html + "</tbody></table>\n";
}

} // namespace report
