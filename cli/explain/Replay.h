#pragma once

#include "explain/StartUp.h"

#include <tarvik/TARVIKNS.h>

#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace why {

/// How a family was found.
struct Resolution {
    enum class By { FLASH, DATABASE, SPI_NAME, NOBODY };

    std::string family;
    By by;
    std::optional<Piece> listed; ///< where spi.acd lists a flash
};

/// The name of a table; nothing for a table that does not exist.
using TableName = std::optional<std::string>;

/// One record that allows something, in the words of the database and as the manager reads them.
struct Permission {
    Piece record;
    std::string owner;    ///< the name under which the record was read
    TableName table;      ///< that it goes to
    int row;              ///< the operation or option
    std::string modeWord; ///< none in records of boundary-scan operations
    TARVIKNS::MODE_TYPE mode;
    std::vector<Piece> outputWords;

    [[nodiscard]] bool names(TARVIKNS::OUTPUT_TYPE output) const;
};

/// The values of a property, and the record that gives them.
struct PropertyValues {
    std::set<std::string> values;
    Piece record;
    bool ofDevice; ///< the record stands in a device's section
};

/// A record that the manager can't go on behind.
struct UnknownOption {
    Piece word;
    std::string owner;
};

/// Reads on demand what a manager reads that was asked nothing before, in its order, keeping the place of
/// everything that counts. One replay stands for one manager; it has exceptions off.
class Replay {
public:
    using Permissions = std::vector<Permission>;

    explicit Replay(const StartUp& facts);

    /// The family of a device, as the first question that met its base name found it.
    const Resolution& resolve(const std::string& device);

    /// The operation table of a family or device.
    [[nodiscard]] TableName operationTable(const std::string& name);

    /// Reads a device's, and its family's, data.
    /// @throw UnknownOption where the manager raises
    void load(const std::string& device, const std::string& package);

    /// Reads it unless the part of it that a question asks for is there.
    void loadForProperties(const std::string& name);
    void loadForOperations(const std::string& name);
    void loadForOptions(const std::string& name, const std::string& device, const std::string& package);

    /// The values stored for an owner; null when there are none.
    [[nodiscard]] const PropertyValues* property(const std::string& owner, const std::string& key) const;

    [[nodiscard]] const Permissions& operations() const noexcept { return m_operations; }
    [[nodiscard]] const Permissions& bsdlOperations() const noexcept { return m_bsdlOperations; }
    [[nodiscard]] const Permissions& options() const noexcept { return m_options; }

private:
    [[nodiscard]] Resolution found(const std::string& device, const std::string& base) const;
    void start();
    [[nodiscard]] std::string loadDevice(const std::string& device, const std::string& package);
    void loadFamily(const std::string& family);
    void readProperties(const std::string& owner);
    void keep(const std::string& owner, const std::string& key, PropertyValues found);
    void readOperations(const std::string& owner, const std::string& database);
    void readBsdlOperations(const std::string& owner, const std::string& database);
    void readOptions(const std::string& owner, const std::string& database);

    const StartUp& m_facts;
    std::map<std::string, Resolution> m_families; ///< by base name in lower case
    std::set<std::string> m_propertiesLoaded;
    std::set<std::string> m_operationsLoaded;
    std::set<std::string> m_optionsLoaded;
    std::map<std::string, PropertyValues> m_properties; ///< by "owner_property"
    Permissions m_operations;
    Permissions m_bsdlOperations;
    Permissions m_options;
};

} // namespace why
