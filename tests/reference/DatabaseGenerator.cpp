// Makes up databases: all files, keys and forms of lines that there are, from few words.
#include "DatabaseGenerator.h"

#include "ReferenceReader.h"
#include "Words.h"

#include <functional>

namespace reference {

namespace {

/// Writes the values of keys, sound or damaged.
class ValueWriter {
public:
    ValueWriter(RandomSource& pick, Health health) : m_pick(pick), m_damaged(health == Health::DAMAGED) {}

    RandomSource& pick() { return m_pick; }
    [[nodiscard]] bool damaged() const { return m_damaged; }

    /// A word, or in a damaged database now and then something else.
    std::string word(const Words& words, const Words& unknown = words::NOISE) {
        return m_damaged && m_pick.chance(4) ? m_pick.from(unknown) : m_pick.from(words);
    }

    /// A name of any kind.
    std::string name() {
        switch (m_pick.below(8)) {
        case 0:
        case 1:
        case 2:
            return word(words::FAMILIES);
        case 3:
            return word(words::SPI_NAMES);
        case 4:
            return m_pick.from(Words{"spi", "base"});
        default:
            return word(words::DEVICES);
        }
    }

    std::string nameWithPackage() {
        const std::string name = word(m_pick.chance(75) ? words::DEVICES : words::FAMILIES);
        return name + m_pick.from(words::PACKAGES);
    }

    /// Up to `limit` pieces, joined; none makes an empty value, and in a damaged database pieces may be empty.
    std::string joined(char separator, int limit, const std::function<std::string()>& piece) {
        std::string value;
        const int count = m_damaged ? m_pick.below(limit + 1) : 1 + m_pick.below(limit);
        for (int number = 0; number < count; ++number) {
            value += (number == 0 ? "" : std::string(1, separator)) + piece();
        }
        return m_damaged && m_pick.chance(3) ? value + separator : value;
    }

    std::string outputs(int limit) {
        return joined(',', limit, [this] { return word(words::OUTPUT_NAMES, words::UNKNOWN_OUTPUT_NAMES); });
    }

    std::string operations() {
        return joined(':', 16, [this] { return fields({word(words::OPERATION_NAMES), mode(), outputs(6)}); });
    }

    std::string bsdlOperations() {
        return joined(':', 6, [this] { return fields({word(words::OPERATION_NAMES), outputs(4)}); });
    }

    std::string programOptions() {
        return joined(':', 16, [this] {
            return fields({word(words::OPTION_NAMES, words::UNKNOWN_OPTION_NAMES), mode(), outputs(6)});
        });
    }

    std::string singleProperties() {
        return joined(':', 8, [this] {
            const bool listsModes = m_pick.chance(40);
            return fields({property(listsModes), propertyValue(listsModes)});
        });
    }

    std::string multipleProperties() {
        return joined(':', 6, [this] {
            const bool listsModes = m_pick.chance(40);
            const int count = m_pick.below(5);
            std::string record = property(listsModes) + "," + counted(count);
            for (int number = 0; number < count; ++number) {
                record += "," + propertyValue(listsModes);
            }
            return record;
        });
    }

    std::string spiProperties() {
        return joined(':', 6, [this] {
            return fields({word(words::SPI_PROPERTIES), m_pick.from(words::SPI_VALUES)});
        });
    }

private:
    std::string mode() { return word(m_pick.chance(60) ? words::USUAL_MODE_NAMES : words::MODE_NAMES); }

    std::string property(bool listsModes) {
        return word(listsModes          ? words::OPERATION_PROPERTIES
                    : m_pick.chance(50) ? words::OPTION_PROPERTIES
                                        : words::PROPERTIES);
    }

    std::string propertyValue(bool listsModes) {
        return m_pick.from(!listsModes         ? words::VALUES
                           : m_pick.chance(60) ? words::USUAL_MODES
                                               : words::MODES);
    }

    /// A record; in a damaged database its end may be missing.
    std::string fields(const Words& all) {
        std::string record = all.front();
        for (std::size_t number = 1; number < all.size(); ++number) {
            if (m_damaged && m_pick.chance(5)) {
                break;
            }
            record += "," + all[number];
        }
        return record;
    }

    /// The number of values that follow; a damaged database miscounts.
    std::string counted(int count) {
        if (m_damaged && m_pick.chance(10)) {
            return m_pick.from(Words{"", "x", "-3", "0", "9", "2147483647", "40000"});
        }
        return std::to_string(count);
    }

    RandomSource& m_pick;
    bool m_damaged;
};

/// Writes one file, line by line, in all the ways that lines may be written.
class FileWriter {
public:
    explicit FileWriter(ValueWriter& value) : m_value(value), m_pick(value.pick()) {
        if (m_pick.chance(5)) {
            m_text = "\xEF\xBB\xBF";
        }
        m_lineEnd = m_pick.chance(10) ? "\r\n" : "\n";
    }

    void key(const std::string& key, const std::string& value) {
        decoration();
        switch (m_pick.below(12)) {
        case 0:
            line(key + "=" + value);
            break;
        case 1:
            line(" \t" + key + "  = " + value + " \t");
            break;
        case 2: {
            const std::size_t half = cut(value);
            line(key + " = " + value.substr(0, half));
            line(key + (m_pick.chance(50) ? " += " : "+=") + value.substr(half));
            break;
        }
        case 3: {
            const std::size_t half = cut(value);
            line(key + " = " + value.substr(0, half) + m_pick.from(Words{"\\", " \\"}));
            line("   " + value.substr(half));
            break;
        }
        case 4:
            line(key + " = overwritten");
            line(key + " = " + value);
            break;
        default:
            line(key + " = " + value);
        }
        damage(key);
    }

    /// A key that may be missing.
    void maybe(int percent, const std::string& name, const std::function<std::string()>& value) {
        if (m_pick.chance(percent)) {
            key(name, value());
        }
    }

    void section(const std::string& name) {
        decoration();
        line((m_pick.chance(10) ? " [" : "[") + name + (m_pick.chance(10) ? "]\t" : "]"));
    }

    [[nodiscard]] std::string finished() {
        if (m_value.damaged() && m_pick.chance(3)) {
            return m_text + "CUT = off\\";
        }
        const bool endsWithoutLineEnd = m_pick.chance(10) && m_text.ends_with(m_lineEnd);
        return endsWithoutLineEnd ? m_text.substr(0, m_text.size() - m_lineEnd.size()) : m_text;
    }

private:
    void line(const std::string& text) { m_text += text + m_lineEnd; }

    std::size_t cut(const std::string& value) {
        return static_cast<std::size_t>(m_pick.below(static_cast<int>(value.size()) + 1));
    }

    /// What has no meaning.
    void decoration() {
        if (m_pick.chance(5)) {
            line(m_pick.from(Words{"# OPERATION = PROGRAM,BS,USB2", "", "  ", " # x \\", "#[KS50]"}));
        }
    }

    /// What costs a line, or a section.
    void damage(const std::string& key) {
        using namespace std::string_literals;
        if (m_value.damaged() && m_pick.chance(4)) {
            line(m_pick.from(Words{"no assignment", "= no key", "two words = x", key + "\0 = x"s,
                                   key + " = x\0"s, "+= x", "[", "[]", "[KS50", "[KS50] x", "[MX2]]", "]",
                                   key + " x\\", key + "+ = x", "\\"}));
        }
    }

    ValueWriter& m_value;
    RandomSource& m_pick;
    std::string m_text;
    std::string m_lineEnd;
};

std::string baseFile(ValueWriter& value) {
    FileWriter file(value);
    RandomSource& pick = value.pick();
    const bool complete = pick.chance(60);
    const std::string all =
        "Mir,kes,pct%%%d,quillfamilyname16,spi,zor_x" + std::string(pick.chance(50) ? ",base" : "");
    file.maybe(97, "DEVICE_SUPPORTED", [&] {
        const std::string some = value.joined(',', 4, [&] { return value.name(); });
        return complete ? all + (pick.chance(30) ? "," + some : "") : some;
    });
    file.maybe(97, "PROGRAM_OPTION_PACKAGE", [&] {
        const std::string some =
            value.joined(',', 6, [&] { return pick.chance(50) ? value.nameWithPackage() : value.name(); });
        return complete ? some + "," + all : some;
    });
    for (const std::string& mode : words::MODES) {
        file.maybe(80, mode, [&] {
            const std::string outputs = "outs," + value.outputs(5);
            return value.damaged() && pick.chance(10)
                       ? outputs
                       : outputs + ":fams," + value.joined(',', 5, [&] { return value.name(); });
        });
    }
    file.maybe(70, "NOT_SUPPORTED_PART_IN_MODE", [&] {
        return value.joined(',', 30, [&] {
            return value.word(words::USUAL_MODES) + "_" + baseName(value.word(words::DEVICES)) + "_" +
                   pick.from(words::PACKAGES);
        });
    });
    file.maybe(80, "IDCODE", [&] {
        return value.joined(':', 5, [&] {
            return value.name() +
                   (value.damaged() && pick.chance(10) ? "" : ",0x" + std::to_string(pick.below(99)));
        });
    });
    file.maybe(20, "OPERATION", [&] { return value.operations(); });
    file.maybe(20, "PROPERTY", [&] { return value.singleProperties(); });
    file.maybe(10, "PROGRAM_OPTION", [&] { return value.programOptions(); });
    if (pick.chance(10)) {
        file.section(pick.from(words::DEVICES));
        file.key("PROPERTY", value.singleProperties());
    }
    return file.finished();
}

/// The keys that a family and each of its devices may have.
void familyKeys(FileWriter& file, ValueWriter& value, bool device) {
    file.maybe(device ? 15 : 85, "OPERATION", [&] { return value.operations(); });
    file.maybe(device ? 15 : 75, "BSDL_OPERATION", [&] { return value.bsdlOperations(); });
    file.maybe(device ? 40 : 80, "PROGRAM_OPTION", [&] { return value.programOptions(); });
    file.maybe(65, "PROPERTY", [&] { return value.singleProperties(); });
    file.maybe(50, "PROPERTIES", [&] { return value.multipleProperties(); });
}

std::string familyFile(ValueWriter& value) {
    FileWriter file(value);
    familyKeys(file, value, false);
    for (int count = 2 + value.pick().below(6); count > 0; --count) {
        file.section(value.pick().chance(85) ? value.pick().from(words::DEVICES)
                                             : value.pick().from(words::SPI_NAMES));
        familyKeys(file, value, true);
    }
    return file.finished();
}

std::string spiFile(ValueWriter& value) {
    FileWriter file(value);
    const auto names = [&] { return value.joined(',', 6, [&] { return value.word(words::SPI_NAMES); }); };
    file.maybe(92, "DEVICE_FAMILY", names);
    for (const std::string& name : words::SPI_NAMES) {
        file.maybe(40, name + "_DEVICES", names);
        file.maybe(50, upper(name) + "_PROPERTY", [&] { return value.spiProperties(); });
    }
    for (const std::string& name : words::CLASSES) {
        file.maybe(60, name + "_DEVICES", names);
    }
    for (const std::string& type : words::MULTIBOOT_TYPES) {
        file.maybe(60, type + "_LEAD", names);
        file.maybe(60, type + "_CHAIN", names);
    }
    familyKeys(file, value, false);
    return file.finished();
}

} // namespace

Files makeDatabases(RandomSource& pick, Health health) {
    ValueWriter value(pick, health);
    const bool damaged = health == Health::DAMAGED;
    Files files;
    if (!damaged || pick.chance(95)) {
        files["base.acd"] = baseFile(value);
    }
    if (!damaged || pick.chance(92)) {
        files["spi.acd"] = spiFile(value);
    }
    for (const std::string& family : words::FAMILIES) {
        if (pick.chance(70)) {
            files[family + ".acd"] = familyFile(value);
        }
    }
    if (pick.chance(10)) {
        files["KES.acd"] = familyFile(value);
    }
    return files;
}

} // namespace reference
