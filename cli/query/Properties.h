#pragma once

#include "model/Catalogue.h"

#include <functional>
#include <map>
#include <optional>
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
    /// Asks for the values of a property; nothing leaves it out.
    using Query = std::function<std::optional<std::vector<std::string>>(const std::string& key)>;

    /// The properties of a device and of its family.
    [[nodiscard]] Properties read(const std::string& device, const std::string& family, const Query& ask);

private:
    using Entries = std::map<std::string, catalogue::Entry>;

    const Entries& entriesOfFamily(const std::string& family);

    std::map<std::string, Entries> m_families;
};

/// The values of a device's property, in byte order.
/// @throw TarvikException if the manager raises
[[nodiscard]] std::vector<std::string> propertyValues(ConstraintsManager& manager, const std::string& device,
                                                      const std::string& key);

/// The properties of a device and of its family.
/// @throw TarvikException if the manager raises
[[nodiscard]] Properties deviceProperties(ConstraintsManager& manager, const std::string& device);

/// The class whose properties stand in for those that a flash lacks; of several that list it the last one. Empty if there
/// is none.
[[nodiscard]] std::string flashClass(const std::string& device);

/// The properties of an SPI flash and of its class that have a value.
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
