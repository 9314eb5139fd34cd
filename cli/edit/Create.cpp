// Writes what a device, a family or a flash needs in all files, copied from a sibling where there is one.
#include "edit/Create.h"

#include "diff/NaturalLess.h"
#include "edit/Additions.h"
#include "edit/CreatedRecords.h"
#include "edit/Names.h"
#include "model/Catalogue.h"
#include "model/RecordSplitter.h"
#include "model/Records.h"
#include "text/Suggest.h"

#include <AcdStore.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace edit {

namespace {

using schema::NamePlaces;
using Kind = Creation::Kind;

constexpr const char* BASE_FAMILY = "base";

[[noreturn]] void refuse(const std::string& reason) { throw CommandError(ExitCode::FAULT, reason); }

class Creator {
public:
    Creator(Draft& draft, const Creation& creation)
        : m_draft(draft), m_creation(creation), m_model(draft.model()), m_index(m_model) {}

    [[nodiscard]] Intention run() {
        m_intention.added.insert(m_creation.name);
        if (!m_creation.like.empty()) {
            findSibling();
        }
        switch (m_creation.kind) {
        case Kind::DEVICE:
            addDevice();
            break;
        case Kind::FAMILY:
            addFamily();
            break;
        case Kind::FLASH:
            addFlash();
            break;
        }
        return std::move(m_intention);
    }

private:
    void findSibling() {
        const std::optional<KnownName> known = findName(m_model, m_creation.like);
        if (!known) {
            throw catalogue::unknownDevice(m_creation.like);
        }
        const bool isAlike = m_creation.kind == Kind::DEVICE   ? known->isDevice && !known->isFlash
                             : m_creation.kind == Kind::FAMILY ? known->isFamily
                                                               : known->isFlash;
        if (!isAlike) {
            refuse(fmt::format("--like needs a {}, which \"{}\" is not", kindName(), m_creation.like));
        }
        m_like = known->name;
    }

    [[nodiscard]] const char* kindName() const {
        return m_creation.kind == Kind::DEVICE   ? "device"
               : m_creation.kind == Kind::FAMILY ? "family"
                                                 : "flash";
    }

    void addDevice() {
        const std::string family = familyOfDevice();
        if (m_creation.idcode.empty()) {
            refuse("a new device needs --idcode");
        }
        addIdcode(family);
        copyPlaces();
        Draft::File& file = fileOf(family);
        std::string section = fmt::format("[{}]\n", m_creation.name);
        for (const char* const key : schema::FAMILY_KEYS) {
            catalogue::Records records =
                m_like.empty() ? catalogue::Records() : catalogue::readRecords(m_like, key);
            records = records.ofDevice ? records : catalogue::Records();
            const bool hasPackages = key == std::string_view(schema::PROPERTIES);
            const std::vector<std::string> texts = textsWith(
                records, schema::PACKAGES, hasPackages ? packagesRecord(m_creation) : std::string());
            if (!texts.empty()) {
                section += fmt::format("{} = {}\n", key, fmt::join(texts, ":"));
            }
        }
        std::vector<Neighbour> neighbours;
        const AcdLines lines(file.text);
        for (const AcdLines::Line& line : lines.lines()) {
            if (line.kind == AcdLines::Kind::HEADER) {
                neighbours.push_back({std::string(line.name), std::string(line.name)});
            }
        }
        addSection(file, section, before(neighbours));
    }

    [[nodiscard]] std::string familyOfDevice() const {
        if (m_like.empty() && m_creation.family.empty()) {
            refuse("a new device needs --family or --like");
        }
        const std::optional<KnownName> known = findName(m_model, m_creation.family);
        if (!m_creation.family.empty() && (!known || !known->isFamily)) {
            std::vector<std::string> families = catalogue::families();
            throw CommandError(ExitCode::NO,
                               fmt::format("the database has no family \"{}\"{}", m_creation.family,
                                           didYouMean(m_creation.family, families)));
        }
        if (m_like.empty()) {
            return known->name;
        }
        std::string family = m_model.device(m_like)->family->name;
        if (known && known->name != family) {
            refuse(fmt::format("\"{}\" is of family \"{}\", so it cannot be copied to \"{}\"", m_like, family,
                               known->name));
        }
        return family;
    }

    void addIdcode(const std::string& family) {
        std::vector<Neighbour> neighbours;
        for (const catalogue::Record& record : catalogue::readRecords(schema::BASE, schema::IDCODE).all) {
            const std::string& name = record.field(0)->text;
            const lint::Device* const device = m_model.device(name);
            if (device != nullptr && device->family->name == family) {
                neighbours.push_back({name, record.whole.text});
            }
        }
        const std::string after = before(neighbours);
        add(BASE_FAMILY, {schema::IDCODE, m_creation.name + splitter::FIELDS + m_creation.idcode, after},
            splitter::RECORDS);
    }

    /// Adds the name to the lists that have the sibling.
    void copyPlaces() {
        if (m_like.empty()) {
            return;
        }
        for (const char* const family : {BASE_FAMILY, schema::SPI_FAMILY.data()}) {
            for (const std::string& key : keysOf(family)) {
                copyPlaces(family, key);
            }
        }
    }

    /// The keys of a file that can contain names.
    [[nodiscard]] std::vector<std::string> keysOf(const std::string& family) const {
        std::vector<std::string> keys;
        const lint::FamilyData* const data = family == BASE_FAMILY ? m_model.base() : m_model.spi();
        if (data != nullptr) {
            for (const auto& [key, value] : data->own.values) {
                if (schema::namePlaces(schema::fileOf(family), key) != NamePlaces::NONE) {
                    keys.emplace_back(key);
                }
            }
        }
        return keys;
    }

    void copyPlaces(const std::string& family, const std::string& key) {
        const NamePlaces places = schema::namePlaces(schema::fileOf(family), key);
        if (places == NamePlaces::FIRST_FIELDS) {
            return; // each device has its own code
        }
        const std::optional<AcdStore::Value> value = AcdStore::value(family.c_str(), key.c_str());
        StatementReader reader;
        const AcdLines merged(key + " = " + (value ? std::string(value->text) : std::string()) + '\n', {},
                              family);
        for (const NamedStatement& statement : reader.read(merged)) {
            for (const NamedItem& item : statement.items) {
                const std::string_view name = m_index.nameOf(statement, item);
                if (!NameIndex::isSame(places, name, m_like)) {
                    continue;
                }
                const std::string former(statement.text(item));
                std::string copy = former;
                copy.replace(item.nameBegin - item.begin, name.size(), m_creation.name);
                if (hasPackage(former.substr(item.nameBegin - item.begin + name.size()))) {
                    add(family, {key, copy, placeInList(statement, item)}, splitter::FIELDS);
                }
            }
        }
    }

    /// After which item the copy of an item is to be. The lists of names with tables, and those of modes, are sorted as
    /// wholes; in the others the devices of a family follow each other.
    [[nodiscard]] std::string placeInList(const NamedStatement& statement, const NamedItem& item) const {
        if (statement.places != NamePlaces::PART_ITEMS && m_creation.kind != Kind::FLASH &&
            statement.places != NamePlaces::ITEMS_IN_ANY_CASE) {
            return {};
        }
        const std::string_view text = statement.text(item);
        const std::string_view start = text.substr(0, item.nameBegin - item.begin);
        const std::string_view end = text.substr(item.nameEnd - item.begin);
        std::vector<Neighbour> neighbours;
        for (const NamedItem& other : statement.items) {
            const std::string_view name = m_index.nameOf(statement, other);
            const std::string_view whole = statement.text(other);
            if (whole == std::string(start).append(name).append(end) && isSibling(std::string(name))) {
                neighbours.push_back({std::string(name), std::string(whole)});
            }
        }
        return before(neighbours);
    }

    /// Is it of the same family as the device that is copied?
    [[nodiscard]] bool isSibling(const std::string& name) const {
        const lint::Device* const like = m_model.device(m_like);
        const lint::Device* const other = m_model.device(name);
        return like == nullptr ? m_model.isFlashInAnyCase(name)
                               : other != nullptr && other->family == like->family;
    }

    /// A name of the same family, and the item or section that has it.
    struct Neighbour {
        std::string name;
        std::string whole;
    };

    /// The last of these that is before the new name, as people order names; otherwise the first one.
    [[nodiscard]] std::string before(const std::vector<Neighbour>& neighbours) const {
        const Neighbour* found = nullptr;
        for (const Neighbour& neighbour : neighbours) {
            if (found == nullptr || diff::NaturalLess()(neighbour.name, m_creation.name)) {
                found = &neighbour;
            }
        }
        return found == nullptr ? std::string() : found->whole;
    }

    /// Does the new device have the package at the end of an item? The item may have none.
    [[nodiscard]] bool hasPackage(std::string_view rest) const {
        rest = rest.substr(rest.starts_with('_') ? 1 : 0);
        return rest.empty() || m_creation.packages.empty() ||
               std::find(m_creation.packages.begin(), m_creation.packages.end(), rest) !=
                   m_creation.packages.end();
    }

    void addFamily() {
        Draft::File& file = fileOf(m_creation.name);
        if (!m_like.empty()) {
            for (const char* const key : schema::FAMILY_KEYS) {
                if (const std::optional<AcdStore::Value> value = AcdStore::value(m_like.c_str(), key)) {
                    addStatement(file, fmt::format("{} = {}", key, value->text));
                }
            }
            setText(file, std::move(file.text));
            copyPlaces();
            return;
        }
        if (m_creation.modes.empty() || m_creation.outputs.empty() || m_creation.operations.empty()) {
            refuse("a new family needs --like, or --mode, --output and --operation");
        }
        addStatement(file,
                     fmt::format("{} = {}", schema::OPERATION, fmt::join(operationRecords(m_creation), ":")));
        addStatement(file,
                     fmt::format("{} = {}", schema::PROPERTIES, fmt::join(modeRecords(m_creation), ":")));
        addToList(schema::DEVICE_SUPPORTED, m_creation.name);
        addToList(schema::PROGRAM_OPTION_PACKAGE, m_creation.name);
        for (const std::string& mode : m_creation.modes) {
            addToMode(mode);
        }
    }

    /// Adds a name to a list of base.acd unless it is there. A list from nothing has the base database, too.
    void addToList(const char* key, const std::string& name) {
        const std::vector<std::string> listed = catalogue::list(schema::BASE, key);
        if (listed.empty() && !m_started.contains(key)) {
            add(BASE_FAMILY, {key, BASE_FAMILY, {}}, splitter::FIELDS);
        }
        m_started.insert(key);
        if (std::find(listed.begin(), listed.end(), name) == listed.end()) {
            add(BASE_FAMILY, {key, name, {}}, splitter::FIELDS);
        }
    }

    void addToMode(const std::string& mode) {
        if (mode == schema::SPI_MODE) {
            refuse("in mode SPI every device is looked up as \"spi\": a family cannot be added to it");
        }
        const catalogue::Records records = catalogue::readRecords(schema::BASE, mode);
        if (!records.isSet) {
            addStatement(fileOf(BASE_FAMILY), fmt::format("{} = {},{}:{},{}", mode, schema::OUTPUTS_LABEL,
                                                          fmt::join(m_creation.outputs, ","),
                                                          schema::FAMILIES_LABEL, m_creation.name));
            m_intention.modes.insert(mode);
            return;
        }
        std::vector<std::string> known;
        for (const catalogue::SourceText& field : records.all.front().fields) {
            known.push_back(field.text);
        }
        for (const std::string& output : m_creation.outputs) {
            if (std::find(std::next(known.begin()), known.end(), output) == known.end()) {
                refuse(fmt::format("mode {} does not have the output {}: it would be new for all families; "
                                   "add it there first",
                                   mode, output));
            }
        }
        const bool hasFamilies = records.all.size() > 1;
        add(BASE_FAMILY,
            {mode,
             hasFamilies ? m_creation.name : fmt::format("{},{}", schema::FAMILIES_LABEL, m_creation.name),
             {}},
            hasFamilies ? splitter::FIELDS : splitter::RECORDS);
    }

    void addFlash() {
        const std::string family = familyOfFlash();
        const bool isFamily =
            std::any_of(m_model.flashFamilies().begin(), m_model.flashFamilies().end(),
                        [&family](const lint::FlashList& known) { return known.family.text == family; });
        const std::string spi(schema::SPI_FAMILY);
        if (!isFamily) {
            add(spi, {schema::DEVICE_FAMILY, family, {}}, splitter::FIELDS);
            m_intention.added.insert(family);
            addToList(schema::DEVICE_SUPPORTED, spi);
            addToList(schema::PROGRAM_OPTION_PACKAGE, spi);
        }
        if (m_like.empty()) {
            add(spi, {schema::devicesKey(family), m_creation.name, {}}, splitter::FIELDS);
        }
        copyPlaces();
        addFlashProperties();
    }

    [[nodiscard]] std::string familyOfFlash() const {
        if (m_like.empty()) {
            if (!isUsableName(m_creation.family)) {
                refuse("a new flash needs --family or --like");
            }
            return m_creation.family;
        }
        std::string family;
        for (const lint::FlashList& list : m_model.flashFamilies()) {
            const bool isIn = std::any_of(list.devices.begin(), list.devices.end(),
                                          [this](const lint::Token& flash) { return flash.text == m_like; });
            family = isIn ? list.family.text : std::string_view(family);
        }
        if (!m_creation.family.empty() && m_creation.family != family) {
            refuse(fmt::format("\"{}\" is of family \"{}\", so it cannot be copied to \"{}\"", m_like, family,
                               m_creation.family));
        }
        return family;
    }

    void addFlashProperties() {
        const catalogue::Records records =
            m_like.empty() ? catalogue::Records()
                           : catalogue::readRecords(schema::SPI, schema::propertyKey(m_like));
        const std::vector<std::string> texts = textsWith(
            records, schema::PACKAGE,
            m_creation.packages.empty() ? std::string()
                                        : fmt::format("{},{}", schema::PACKAGE, m_creation.packages.front()));
        if (!texts.empty()) {
            addStatement(fileOf(std::string(schema::SPI_FAMILY)),
                         fmt::format("{} = {}", schema::propertyKey(m_creation.name), fmt::join(texts, ":")));
        }
    }

    [[nodiscard]] Draft::File& fileOf(const std::string& family) {
        return m_draft.fileOf(family, m_creation.layer, m_creation.directory);
    }

    void add(const std::string& family, const Addition& addition, char separator) {
        const std::optional<AcdStore::Value> value =
            catalogue::hasFamilyFile(family) ? AcdStore::value(family.c_str(), addition.key.c_str())
                                             : std::nullopt;
        addItem(fileOf(family), addition, separator, value && !value->text.empty());
    }

    Draft& m_draft;
    const Creation& m_creation;
    const lint::Model m_model;
    const NameIndex m_index;
    std::string m_like;
    Intention m_intention;
    std::set<std::string> m_started; ///< the lists that are not empty any more
};

} // namespace

Intention create(Draft& draft, const Creation& creation) { return Creator(draft, creation).run(); }

} // namespace edit
