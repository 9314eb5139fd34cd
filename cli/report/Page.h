#pragma once

#include "report/HtmlSections.h"
#include "report/Overview.h"
#include "report/PageData.h"

#include <string>

namespace report {

/// One self-contained HTML page about all devices.
///
/// For up to `STATIC_DEVICES` devices each one's part is written as HTML, which the page's script takes over. For
/// more, which no browser would open in time, the script makes the parts from the data as they are looked at; without
/// scripts such a page has the overview, the tables, and the names by family.
class Page {
public:
    static constexpr std::size_t STATIC_DEVICES = 400;

    void add(const DeviceDetails& details);

    [[nodiscard]] std::size_t devices() const { return m_count; }
    [[nodiscard]] std::size_t families() const { return m_overview.families(); }
    [[nodiscard]] std::size_t flashes() const { return m_flashes.size(); }

    [[nodiscard]] std::string html() const;

private:
    [[nodiscard]] bool isSmall() const { return m_count <= STATIC_DEVICES; }
    [[nodiscard]] std::string section(const std::string& name) const;

    std::size_t m_count = 0;
    std::string m_family; ///< of the latest device
    PageData m_data;
    Overview m_overview;
    FlashTable m_flashes;
    MultibootTable m_multiboot;
    std::string m_parts; ///< of a small page
    std::string m_names; ///< of a big page, without scripts
};

} // namespace report
