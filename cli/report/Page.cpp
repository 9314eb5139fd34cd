// Puts the sections into the frame that page.html is.
#include "report/Page.h"

#include "model/Vocabulary.h"
#include "report/HtmlEscape.h"
#include "report/PageFiles.h"

#include <AcdStore.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace report {

namespace {

/// In the frame, "{{name}}" stands for a section.
constexpr std::string_view OPENING = "{{";
constexpr std::string_view CLOSING = "}}";

std::string source() {
    std::vector<std::string> path;
    for (const std::string& directory : AcdStore::searchPath()) {
        path.push_back(escaped(directory));
    }
    return path.empty() ? "the built-in demonstration" : fmt::format("{}", fmt::join(path, ", "));
}

std::string orNone(const std::string& html) { return html.empty() ? "<p>There are none.</p>\n" : html; }

} // namespace

void Page::add(const DeviceDetails& details) {
    ++m_count;
    m_data.add(details);
    m_overview.add(details);
    m_flashes.add(details);
    m_multiboot.add(details);
    const bool isNewFamily = m_count == 1 || m_family != details.family;
    m_family = details.family;
    if (isNewFamily) {
        m_names += (m_count == 1 ? "" : "</p>\n") + familyHeading(m_family) + "<p>";
    } else {
        m_names += ", ";
    }
    m_names += escaped(details.name);
    if (isSmall()) {
        m_parts += (isNewFamily ? familyHeading(m_family) : "") + deviceHtml(details);
    } else {
        m_parts.clear();
    }
}

std::string Page::section(const std::string& name) const {
    if (name == "source") {
        return source();
    }
    if (name == "version") {
        return TARVIK_VERSION;
    }
    if (name == "counts") {
        return fmt::format("<b>{}</b> devices in <b>{}</b> families, <b>{}</b> of them flashes", devices(),
                           families(), flashes());
    }
    if (name == "overview") {
        return m_overview.html();
    }
    if (name == "devices") {
        return isSmall() ? m_parts : "";
    }
    if (name == "names") {
        return isSmall() ? "" : "<noscript>" + m_names + "</p></noscript>";
    }
    if (name == "flashes") {
        return m_flashes.size() <= STATIC_DEVICES ? orNone(m_flashes.html())
                                                  : "<p>They stand among the devices.</p>\n";
    }
    if (name == "multiboot") {
        return orNone(m_multiboot.html(isSmall()));
    }
    if (name == "data") {
        std::string html;
        m_data.appendTo(html);
        return html;
    }
    return pageFiles().at(name);
}

std::string Page::html() const {
    const std::string frame = pageFiles().at("page.html");
    std::string html;
    std::string_view rest = frame;
    for (std::size_t open = rest.find(OPENING); open != rest.npos; open = rest.find(OPENING)) {
        html += rest.substr(0, open);
        rest.remove_prefix(open + OPENING.size());
        const std::size_t close = rest.find(CLOSING);
        html += section(std::string(rest.substr(0, close)));
        rest.remove_prefix(close + CLOSING.size());
    }
    return html += rest;
}

} // namespace report
