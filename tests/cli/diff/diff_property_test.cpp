// What is written in another way is no difference; one real change is the only one.
#include "DatabaseRewriter.h"
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"
#include "reference/DatabaseGenerator.h"
#include "reference/ReferenceReader.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <cstdint>
#include <cstdlib>
#include <deque>
#include <string>
#include <vector>

namespace {

using reference::Files;
using reference::RandomSource;

/// The layers of a database in directories.
class Layers {
public:
    explicit Layers(const std::vector<Files>& layers) {
        for (const Files& files : layers) {
            const DatabaseDirectory& directory = m_directories.emplace_back(files);
            m_path += (m_path.empty() ? "" : ":") + directory.path();
        }
    }

    /// As the tool takes them.
    [[nodiscard]] const std::string& path() const { return m_path; }

private:
    std::deque<DatabaseDirectory> m_directories;
    std::string m_path;
};

/// The same databases each time, unless RC_PARAMS asks for others.
void configure() {
    const char* const wanted = std::getenv("RC_PARAMS");
    const std::string parameters = "seed=50 max_success=15 " + std::string(wanted == nullptr ? "" : wanted);
    setenv("RC_PARAMS", parameters.c_str(), 1);
}

RandomSource anyRandomSource() {
    return RandomSource(rc::Random(*rc::gen::noShrink(rc::gen::arbitrary<std::uint64_t>())));
}

ProcessResult diff(const Layers& before, const Layers& after) {
    return runTool(std::vector<std::string>{"diff", before.path(), after.path()});
}

std::string shown(const std::vector<Files>& layers) {
    std::string text;
    for (const Files& files : layers) {
        for (const auto& [name, content] : files) {
            text += "--- " + name + '\n' + content;
        }
        text += "=== below\n";
    }
    return text;
}

/// A change of the family "probe", and what is told of it.
struct Edit {
    const char* file;
    const char* from; ///< appended when this is empty
    const char* to;
    const char* told;
};

const std::vector<Edit>& edits() {
    static const std::vector<Edit> all{
        {"probe.acd", "", "[PROBE9]\n", "only in the new database\n  probe\n    PROBE9\n"},
        {"probe.acd", "[PROBE2]\n", "", "only in the old database\n  probe\n    PROBE2\n"},
        {"probe.acd", ",Bscan,USB2,SVF", ",Bscan,USB2",
         "probe (all 2 devices)\n  operations in BS through SVF: -CHECKSUM\n"},
        {"probe.acd", "CHECKSUM,", "BLANKCHECK,",
         "probe (all 2 devices)\n  operations in BS through USB2, SVF: -CHECKSUM +BLANKCHECK\n"},
        {"probe.acd", "CLAMP,", "HIGHZ,",
         "probe (all 2 devices)\n  boundary-scan operations through ZORVA: -CLAMP +HIGHZ\n"},
        {"probe.acd", "UES,", "OTF,", "probe (all 2 devices)\n  options in SM through STAPL: -UES +OTF\n"},
        {"probe.acd", "COLOUR,1,RED", "COLOUR,1,BLUE", "PROBE1 (probe)\n  property COLOUR: -RED +BLUE\n"},
        {"probe.acd", "SHAPE,ROUND", "SHAPE,SQUARE",
         "probe (all 2 devices)\n  property SHAPE: -ROUND +SQUARE\n"},
        {"base.acd", "PROBE1,0x00000001", "PROBE1,0x00000003",
         "PROBE1 (probe)\n  IDCODE: -0x00000001 +0x00000003\n"},
        {"base.acd", "BS_PROBE1_BOX", "BS_PROBE1_TUB",
         "PROBE1 (probe)\n  package BOX: modes: +BS\n  package TUB: modes: -BS\n"},
        {"spi.acd", "PROBE1", "PROBE0", "PROBE1 (probe)\n  multiboot: -TYPE_MB_QPRM_NONE_LEAD\n"},
        {"spi.acd", "PROBEFLASH,PROBEMORE", "PROBEFLASH",
         "only in the old database\n  spi (flashes)\n    PROBEMORE\n"},
    };
    return all;
}

/// The text of a file with these items added to the lists of its own keys.
std::string withItems(const std::string& text, const reference::Keys& items, char separator) {
    reference::ParsedFile file = reference::parse(text);
    file.own["BS"] = "outputs,USB2:families,probe";
    for (const auto& [key, item] : items) {
        std::string& value = file.own[key];
        value += (value.empty() ? "" : std::string(1, separator)) + item;
    }
    std::string result;
    const auto write = [&result](const reference::Keys& keys) {
        for (const auto& [key, value] : keys) {
            result += key + " = " + value + '\n';
        }
    };
    write(file.own);
    for (const reference::Section& section : file.sections) {
        result += '[' + section.name + "]\n";
        write(section.keys);
    }
    return result;
}

/// Adds a family of its own that no word of the generator meets.
void addProbe(Files& files) {
    std::string& base = files["base.acd"];
    base = withItems(base,
                     {{"DEVICE_SUPPORTED", "probe"},
                      {"PROGRAM_OPTION_PACKAGE", "probe"},
                      {"NOT_SUPPORTED_PART_IN_MODE", "BS_PROBE1_BOX"}},
                     ',');
    base = withItems(base, {{"IDCODE", "PROBE1,0x00000001"}}, ':');
    std::string& flashes = files["spi.acd"];
    flashes = withItems(flashes,
                        {{"DEVICE_FAMILY", "PROBES"},
                         {"PROBES_DEVICES", "PROBEFLASH,PROBEMORE"},
                         {"TYPE_MB_QPRM_NONE_LEAD", "PROBE1"}},
                        ',');
    files["probe.acd"] = "OPERATION = CHECKSUM,Bscan,USB2,SVF\nBSDL_OPERATION = CLAMP,ZORVA\n"
                         "PROGRAM_OPTION = UES,Smap,STAPL\nPROPERTY = SHAPE,ROUND\n"
                         "[PROBE2]\n[PROBE1]\nPROPERTIES = COLOUR,1,RED\n";
}

void apply(const Edit& edit, Files& files) {
    std::string& text = files.at(edit.file);
    const std::string from = edit.from;
    if (from.empty()) {
        text += edit.to;
        return;
    }
    const std::size_t at = text.find(from);
    ASSERT_NE(at, text.npos) << from;
    text.replace(at, from.size(), edit.to);
}

TEST(DiffProperty, TellsNothingOfWhatIsWrittenInAnotherWay) {
    configure();
    EXPECT_TRUE(rc::check([] {
        RandomSource pick = anyRandomSource();
        const Files files = makeDatabases(pick, reference::Health::SOUND);
        const std::vector<Files> layers = rewritten(pick, files);
        const ProcessResult outcome = diff(Layers({files}), Layers(layers));
        if (outcome.status != 0) {
            RC_FAIL(outcome.output + outcome.error + shown({files}) + shown(layers));
        }
    }));
}

TEST(DiffProperty, TellsOneChangeAndNothingElse) {
    configure();
    EXPECT_TRUE(rc::check([] {
        RandomSource pick = anyRandomSource();
        Files before = makeDatabases(pick, reference::Health::SOUND);
        addProbe(before);
        const Edit& edit = pick.from(edits());
        Files after = before;
        apply(edit, after);
        const std::vector<Files> layers = rewritten(pick, after);
        const ProcessResult outcome = diff(Layers({before}), Layers(layers));
        if (outcome.output != edit.told) {
            RC_FAIL(outcome.output + outcome.error + shown({before}) + shown(layers));
        }
    }));
}

} // namespace
