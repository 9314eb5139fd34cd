#pragma once

#include <AcdLines.h>

#include <deque>
#include <map>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

/// A place in a file of the database, counted from 1, the column in bytes.
struct Place {
    const AcdLines* file = nullptr;
    unsigned line = 1;
    unsigned column = 1;
};

/// A piece of the database's text that knows where it stands.
struct Token {
    std::string_view text;
    Place place;
};

/// One item of a value between ":", with its fields between ",". A flat list is one record.
struct Record {
    Token whole;
    std::vector<Token> fields;
};

/// What kind of value a key has.
enum class Shape {
    NONE,    ///< nobody reads it
    LIST,    ///< item,item,...
    RECORDS, ///< field,...:field,...
};

/// What one key of a section says, all layers merged as the readers merge them.
class Entry {
public:
    /// How many items, or fields of an item, are ever read.
    static constexpr std::size_t MOST = 32768;

    /// How long a value may grow by appending.
    static constexpr std::size_t LONGEST = std::size_t{1} << 30;

    Token key; ///< where it was set last
    Shape shape = Shape::NONE;
    std::vector<Record> records;
    std::vector<Token> tooLong; ///< what was appended in vain, since the value would grow too long
    std::vector<Token> unseen;  ///< the first item, or field, of each list that is too long

    /// The items of a flat list.
    [[nodiscard]] const std::vector<Token>& list() const;

    void assign(const AcdLines& file, const AcdLines::Line& line);
    void split(Shape wanted);

private:
    struct Fragment {
        std::size_t offset;
        Place place;
    };

    [[nodiscard]] Token token(std::size_t offset, std::size_t length) const;
    [[nodiscard]] std::vector<Token> pieces(std::size_t begin, std::size_t end, char separator);

    std::string m_text;
    std::vector<Fragment> m_fragments;
};

/// The keys of one device, or those of the family itself.
struct Section {
    Token name; ///< where it opens first
    std::map<std::string_view, Entry> entries;

    /// What a key says; null when it is not there.
    [[nodiscard]] const Entry* find(std::string_view key) const;
};

struct Family {
    enum class Kind { BASE, SPI, PARTS };

    std::string name;
    Kind kind = Kind::PARTS;
    std::vector<const AcdLines*> files; ///< the bottom layer first
    Section own;
    std::deque<Section> devices; ///< in the order in which they open first

    /// Where something is told that the family's files lack.
    [[nodiscard]] Token place() const;
};

/// Where something is told that no line of a file says.
[[nodiscard]] Token startOf(const AcdLines& file);

/// A device of a part family.
struct Device {
    const Family* family;
    const Section* section;
};

/// The flashes of one SPI family or class.
struct FlashList {
    Token family;
    const std::vector<Token>* devices; ///< null when there is no list
};

/// A database as the rules see it. Made once, and never changed.
class Model {
public:
    explicit Model(std::vector<AcdLines> files);
    Model(const Model&) = delete;
    Model& operator=(const Model&) = delete;

    [[nodiscard]] const std::vector<AcdLines>& files() const noexcept { return m_files; }
    [[nodiscard]] const std::deque<Family>& families() const noexcept { return m_families; }

    /// Null when the family has no file.
    [[nodiscard]] const Family* base() const noexcept { return m_base; }
    [[nodiscard]] const Family* spi() const noexcept { return m_spi; }

    /// What a key of the base, or the SPI, database says; null when it is not there.
    [[nodiscard]] const Entry* baseEntry(std::string_view key) const;
    [[nodiscard]] const Entry* spiEntry(std::string_view key) const;

    /// The devices of the part families by name; of several of one name the one that is found.
    [[nodiscard]] const std::map<std::string_view, Device>& devices() const noexcept { return m_devices; }
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
    void addFile(const AcdLines& file);
    void splitEntries();
    void findDevices();
    void findFlashes();

    std::vector<AcdLines> m_files;
    std::deque<Family> m_families;
    const Family* m_base = nullptr;
    const Family* m_spi = nullptr;
    std::map<std::string_view, Device> m_devices;
    std::set<std::string_view> m_supported;
    std::set<std::string_view> m_optionPackages;
    std::vector<FlashList> m_flashFamilies;
    std::vector<std::string> m_familyNames;
    std::vector<std::string> m_deviceNames;
    std::vector<std::string> m_flashNames;
    std::set<std::string> m_lowerFamilies;
    std::map<std::string, const Device*> m_lowerDevices;
    std::set<std::string> m_lowerFlashes;
};

} // namespace lint
