#pragma once

#include "model/Schema.h"

#include <AcdLines.h>

#include <deque>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

namespace lint {

/// A location in a file of the database; line and column are counted from 1, the column in bytes.
struct SourceLocation {
    const AcdLines* file = nullptr;
    unsigned line = 1;
    unsigned column = 1;
};

/// A text of the database and its location.
struct Token {
    std::string_view text;
    SourceLocation location;
};

/// One item of a value between ":", with its fields between ",". A flat list is one item.
struct Item {
    Token whole;
    std::vector<Token> fields; ///< never empty
};

/// The value of one key of a section, all layers merged as the readers merge them.
///
/// Two mistakes are reported once, at the line that makes them, and otherwise read as they were meant: an appended
/// text that lacks its separator, and a layer that hides the names below by "=" in place of "+=".
class Value {
public:
    /// How long a value may grow by appending.
    static constexpr std::size_t MAX_LENGTH = std::size_t{1} << 30;

    /// Names of lower layers that "=" on top hides.
    struct Hiding {
        Token key;                ///< where the layer on top sets the key
        Token below;              ///< where the hidden value was set
        std::vector<Token> names; ///< that are hidden
    };

    Token key; ///< where it was set last
    schema::Shape shape = schema::Shape::NONE;
    std::vector<Item> items;
    std::vector<Token> oversizedAppends; ///< dropped, since the value would have grown too long
    std::vector<Token>
        truncatedItems; ///< of each list that is too long the first item, or field, that is not read
    std::vector<Token> joinedAppends; ///< without a separator before them
    std::vector<Hiding> hidings;
    bool isAssigned = false; ///< false: there are only appended texts
    bool isReplaced = false; ///< a layer on top has set it again

    /// The items of a flat list.
    [[nodiscard]] const std::vector<Token>& list() const;

    /// The whole text, as the readers give it.
    [[nodiscard]] const std::string& text() const noexcept { return m_source.text; }

    /// The whole values of lower layers that "=" on top replaces, each at its key; the upper ones first.
    [[nodiscard]] std::vector<Token> replaced() const;

    /// @param separator between what the value has and what is appended
    void assign(const AcdLines& file, const AcdLines::Line& line, char separator);
    void split(schema::File file, std::string_view name, schema::Shape wanted);

private:
    /// A text with the origin of each byte.
    struct SourceText {
        struct Span {
            std::size_t offset;
            SourceLocation location;
        };

        Token key;
        std::string text;
        std::vector<Span> spans;

        [[nodiscard]] Token token(std::string_view part, std::size_t offset) const;
    };

    [[nodiscard]] std::vector<Item> itemsOf(const SourceText& source, std::vector<Token>& truncated) const;
    void restoreHidden(schema::File file, std::string_view name);

    SourceText m_source;
    std::vector<SourceText> m_replaced; ///< by layers on top
};

/// The keys of one device, or those of the family itself.
struct Section {
    Token name; ///< where it opens first
    std::map<std::string_view, Value> values;

    /// The value of a key; null when the section does not set it.
    [[nodiscard]] const Value* find(std::string_view key) const;

    /// The items of a key; none when the section does not set it.
    [[nodiscard]] const std::vector<Item>& items(std::string_view key) const;

    /// The items of a key that is a flat list, likewise.
    [[nodiscard]] const std::vector<Token>& list(std::string_view key) const;
};

/// The files of one family, merged. Immutable.
struct FamilyData {
    std::vector<AcdLines> files; ///< the bottom layer first; one at least
    std::string name;
    schema::File kind;
    Section own;
    std::deque<Section> devices; ///< in the order in which they open first

    /// @param family its files, the bottom layer first; one at least
    explicit FamilyData(std::vector<AcdLines> family);
    FamilyData(const FamilyData&) = delete;
    FamilyData& operator=(const FamilyData&) = delete;

    /// Where to report something that the family's files lack.
    [[nodiscard]] Token start() const;

    /// Calls `use(section)` for the family's own keys and for each device.
    template <typename Use>
    void forEachSection(Use use) const {
        use(own);
        for (const Section& device : devices) {
            use(device);
        }
    }

private:
    void addFile(const AcdLines& file);
    void splitValues();
};

/// Families by the order of their files. Models share those that do not differ.
using Families = std::vector<std::shared_ptr<const FamilyData>>;

/// Groups the files of a database by family.
/// @param files those of a family follow each other, the bottom layer first
[[nodiscard]] Families familiesOf(std::vector<AcdLines> files);

/// The directories of files; those in memory have none.
[[nodiscard]] std::vector<std::string> layersOf(const std::vector<AcdLines>& files);

/// Those of the directories whose index does not match the files in it.
[[nodiscard]] std::vector<std::string> unusedIndexes(std::vector<std::string> directories);

/// Where to report something that no line of a file says.
[[nodiscard]] Token startOf(const AcdLines& file);

/// A device of a part family.
struct Device {
    const FamilyData* family;
    const Section* section;
};

/// The flashes of one SPI family or class.
struct FlashList {
    Token family;
    std::vector<Token> devices; ///< none when there is no list
};

/// The flashes of spi.acd: the families of `DEVICE_FAMILY`, each with its devices.
[[nodiscard]] std::vector<FlashList> flashLists(const Section& spiKeys);

/// Their names, those of the families among them.
[[nodiscard]] std::vector<std::string> namesOf(const std::vector<FlashList>& flashes);

/// A database as the rules see it. Immutable.
class Model {
public:
    /// @param unusedIndexes the directories whose index does not match their files
    explicit Model(Families families, std::vector<std::string> unusedIndexes = {});
    explicit Model(std::vector<AcdLines> files, std::vector<std::string> unusedIndexes = {})
        : Model(familiesOf(std::move(files)), std::move(unusedIndexes)) {}
    Model(const Model&) = delete;
    Model& operator=(const Model&) = delete;

    [[nodiscard]] const Families& families() const noexcept { return m_families; }

    /// The files of all families, in their order.
    [[nodiscard]] std::vector<const AcdLines*> files() const;

    /// The directories whose index does not match their files.
    [[nodiscard]] const std::vector<std::string>& unusedIndexes() const noexcept { return m_unusedIndexes; }

    /// Could all files be read?
    [[nodiscard]] bool isComplete() const;

    /// Null when the family has no file.
    [[nodiscard]] const FamilyData* base() const noexcept { return m_base; }
    [[nodiscard]] const FamilyData* spi() const noexcept { return m_spi; }

    /// The keys of base.acd and of spi.acd; an empty section when there is no such file.
    [[nodiscard]] const Section& baseKeys() const;
    [[nodiscard]] const Section& spiKeys() const;

    /// The devices of the part families in the order of the files; of several with one name the one that is found.
    [[nodiscard]] const std::vector<Device>& devices() const noexcept { return m_devices; }
    [[nodiscard]] const Device* device(std::string_view name) const;
    [[nodiscard]] bool isFamily(std::string_view name) const;

    /// Likewise, without regard to case.
    [[nodiscard]] const Device* deviceInAnyCase(const std::string& name) const;
    [[nodiscard]] bool isFamilyInAnyCase(const std::string& name) const;
    [[nodiscard]] bool isFlashInAnyCase(const std::string& name) const;

    /// The packages that a device's property PACKAGES lists, or else its family's.
    [[nodiscard]] std::vector<Token> packages(const Device& device) const;

    /// The names of `DEVICE_SUPPORTED` and of `PROGRAM_OPTION_PACKAGE`.
    [[nodiscard]] const std::set<std::string_view>& supported() const noexcept { return m_supported; }
    [[nodiscard]] const std::set<std::string_view>& optionPackages() const noexcept {
        return m_optionPackages;
    }

    /// The families of `DEVICE_FAMILY`, each with its devices.
    [[nodiscard]] const std::vector<FlashList>& flashFamilies() const noexcept { return m_flashFamilies; }

    // For suggestions.
    [[nodiscard]] const std::vector<std::string>& familyNames() const noexcept { return m_familyNames; }
    [[nodiscard]] const std::vector<std::string>& deviceNames() const noexcept { return m_deviceNames; }
    [[nodiscard]] const std::vector<std::string>& flashNames() const noexcept { return m_flashNames; }

private:
    void findDevices();

    Families m_families;
    std::vector<std::string> m_unusedIndexes;
    const FamilyData* m_base = nullptr;
    const FamilyData* m_spi = nullptr;
    std::vector<Device> m_devices;
    std::set<std::string_view> m_supported;
    std::set<std::string_view> m_optionPackages;
    std::vector<FlashList> m_flashFamilies;
    std::vector<std::string> m_familyNames;
    std::vector<std::string> m_deviceNames;
    std::vector<std::string> m_flashNames;
    std::set<std::string_view> m_sortedFamilyNames;
    std::unordered_set<std::string> m_lowerFamilies;
    std::unordered_map<std::string, const Device*> m_lowerDevices;
    std::unordered_set<std::string> m_lowerFlashes;
};

} // namespace lint
