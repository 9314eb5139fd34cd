#pragma once

#include "query/DeviceDetails.h"

#include <array>
#include <map>
#include <string>
#include <vector>

namespace report {

/// The table of families by operations: through how many pairs of mode and output some device allows it.
class Overview {
public:
    void add(const DeviceDetails& details);

    [[nodiscard]] std::size_t families() const { return m_families.size(); }

    /// The table element.
    [[nodiscard]] std::string html() const;

private:
    using Pairs = std::array<DeviceTable::Outputs, DeviceTable::MODES>;

    struct Family {
        std::string name;
        std::size_t devices = 0;
        std::map<std::string, Pairs> operations;
    };

    /// The operations that some device allows in some mode, in the order in which they are presented.
    [[nodiscard]] std::vector<std::string> operations() const;
    [[nodiscard]] unsigned most() const;

    std::vector<Family> m_families;
    std::map<std::string, std::size_t> m_positions;
};

} // namespace report
