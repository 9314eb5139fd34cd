#pragma once

#include "model/Catalogue.h"

#include <map>
#include <string>
#include <vector>

class ConstraintsManager;
class Terminal;
class Tool;

/// One property: its values as the manager gives them, and where the database has them from.
struct Property {
    std::string key;
    std::vector<std::string> values; ///< in byte order
    std::string from;                ///< "device", "family", or the class of an SPI flash
    catalogue::Origin origin;
    catalogue::Shadows shadows;
};

using Properties = std::vector<Property>;

/// Reads the properties of devices; what devices of a family share is looked up once.
class PropertyReader {
public:
    /// The properties of a device and of its family.
    /// @param isOrderDependent asks for each property of a manager of its own
    [[nodiscard]] Properties read(ConstraintsManager& manager, const std::string& device,
                                  bool isOrderDependent = false);

private:
    using Entries = std::map<std::string, catalogue::Entry>;

    const Entries& entriesOfFamily(const std::string& family);

    std::map<std::string, Entries> m_families;
};

/// The properties of a device and of its family.
[[nodiscard]] inline Properties deviceProperties(ConstraintsManager& manager, const std::string& device) {
    return PropertyReader().read(manager, device);
}

/// The properties of an SPI flash and of its class.
[[nodiscard]] Properties flashProperties(const ConstraintsManager& manager, const std::string& device);

/// A table of properties, behind `indent` blanks.
[[nodiscard]] std::string asText(const Properties& properties, const Terminal& terminal, std::size_t indent);
[[nodiscard]] Json asJson(const Properties& properties);

/// What was found for one key.
struct PropertyAnswer {
    std::string device;
    std::string key;
    std::vector<std::string> values;
};

[[nodiscard]] std::string asText(const PropertyAnswer& answer, const Terminal& terminal);
[[nodiscard]] Json asJson(const PropertyAnswer& answer);

/// Shows the values one a line. No values: the answer is no, with a suggestion from the properties there are.
[[nodiscard]] ExitCode showProperty(Tool& tool, const PropertyAnswer& answer, const Properties& all);
