#pragma once

#include "query/DeviceDetails.h"

#include <map>
#include <string>
#include <vector>

namespace report {

/// The part of the page about one device, as page.js makes it from the data too: change both together.
[[nodiscard]] std::string deviceHtml(const DeviceDetails& details);

/// The heading above the devices of a family, likewise.
[[nodiscard]] std::string familyHeading(const std::string& family);

/// A link to a device's part.
[[nodiscard]] std::string linkTo(const std::string& device);

/// The table of SPI and BPI flashes: which there are, and what the database says about each.
class FlashTable {
public:
    FlashTable();

    void add(const DeviceDetails& details);
    [[nodiscard]] std::size_t size() const { return m_rows.size(); }

    /// The table element; empty without flashes.
    [[nodiscard]] std::string html() const;

private:
    struct Row {
        std::string name;
        std::map<std::string, std::string> values; ///< by property
    };

    std::map<std::string, std::string> m_families; ///< by flash
    std::vector<Row> m_rows;
};

/// The table of multiboot arrangements and of the devices that support them.
class MultibootTable {
public:
    void add(const DeviceDetails& details);

    /// The table element; empty when no device supports any.
    /// @param withLinks lists the devices; else the table says how many there are
    [[nodiscard]] std::string html(bool withLinks) const;

private:
    std::map<std::vector<std::string>, std::vector<std::string>> m_devices; ///< by type, width and position
};

} // namespace report
