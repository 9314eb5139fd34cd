// Turns the answers of a manager into a snapshot.
#include "diff/Snapshot.h"

#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/FreshManager.h"
#include "query/ManagerQueries.h"
#include "query/Properties.h"

#include <tarvik/ConstraintsManager.h>

#include <tuple>
#include <utility>

namespace diff {

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

constexpr const char* MODES = "modes";
constexpr const char* MODES_WITHOUT_OUTPUT = "modes (if no output is given)";
constexpr const char* OPERATIONS = "operations";
constexpr const char* OPTIONS = "options";
constexpr const char* SPI_MODE = "SPI";

Question value(std::string topic) { return {"", std::move(topic), Question::Kind::VALUE}; }
Question names(std::string topic) { return {"", std::move(topic)}; }

class SnapshotCollector {
public:
    [[nodiscard]] std::string collect(const ProgressCallback& progress) {
        DeviceSurvey survey(
            {.operations = true, .options = true, .packages = true, .facts = true, .families = true});
        std::string devices;
        survey.run([&](const DeviceDetails& details) { add(devices, details); }, progress);
        std::string text;
        putBlock(text, serialized(general(survey)));
        return text + devices;
    }

private:
    /// What devices have in common: their operations, their options, and their modes in two forms.
    using Common = std::tuple<SharedTable, SharedTable, std::vector<std::string>, std::vector<std::string>>;

    void add(std::string& text, const DeviceDetails& details) {
        const auto [first, isNew] = m_common.try_emplace(
            {details.operations, details.options, details.modes, details.modesWithoutOutput}, details.name);
        putBlock(text, details.name);
        putBlock(text, details.family);
        putBlock(text, details.isFamily ? "family" : "");
        putBlock(text, first->second);
        putBlock(text, isNew ? serialized(common(details)) : std::string());
        putBlock(text, serialized(own(details)));
    }

    [[nodiscard]] static Answers common(const DeviceDetails& details) {
        Answers answers;
        addTable(answers, "", OPERATIONS, *details.operations, false);
        addTable(answers, "", OPTIONS, *details.options, false);
        addModes(answers, "", details.modes, details.modesWithoutOutput);
        return answers;
    }

    [[nodiscard]] static Answers own(const DeviceDetails& details) {
        Answers answers;
        answers[value(FAMILY)] = {details.family};
        if (details.idcode) {
            answers[value("IDCODE")] = {details.idcode->value};
        }
        for (const DeviceDetails::Arrangement& one : details.multiboot) {
            answers[names("multiboot")].insert(one.type + '_' + one.width +
                                               (one.position == "lead" ? "_LEAD" : "_CHAIN"));
        }
        addProperties(answers, "property ", details.properties);
        addProperties(answers, "flash property ", details.flashProperties);
        for (const auto& [package, changes] : details.packages) {
            if (changes.options) {
                addTable(answers, package, OPTIONS, *changes.options, false);
            }
            addModes(answers, package, changes.modes, changes.modesWithoutOutput);
        }
        for (const std::string& fault : {details.operations->fault, details.options->fault, details.fault}) {
            if (!fault.empty()) {
                answers[value(FAULTS)].insert(withoutPlace(fault));
            }
        }
        return answers;
    }

    /// @param ofSpi whether to add the rows of SPI mode, which all devices have in common, or the others
    static void addTable(Answers& answers, const std::string& package, const char* topic,
                         const DeviceTable& table, bool ofSpi) {
        for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
            const auto through = static_cast<OUTPUT_TYPE>(output);
            for (std::size_t mode = 0; mode < DeviceTable::MODES; ++mode) {
                const auto in = static_cast<MODE_TYPE>(mode);
                if ((in == MODE_TYPE::SPI) != ofSpi) {
                    continue;
                }
                // Empty, too: what a package lacks may be there without it.
                StringSet& cell = answers[{package, topic, Question::Kind::NAMES, in, through}];
                for (const DeviceTable::Row& row : table.rows) {
                    if ((row.outputs.at(mode) >> output & 1U) != 0) {
                        cell.insert(row.key);
                    }
                }
            }
            for (const DeviceTable::Row& row : table.rows) {
                if (!ofSpi && (row.bsdl >> output & 1U) != 0) {
                    answers[{package, "boundary-scan operations", Question::Kind::NAMES, {}, through}].insert(
                        row.key);
                }
            }
        }
    }

    /// SPI mode, which is the same for all devices, is among the general answers.
    static void addModes(Answers& answers, const std::string& package, const std::vector<std::string>& modes,
                         const std::vector<std::string>& modesWithoutOutput) {
        StringSet& all = answers[{package, MODES}] = {modes.begin(), modes.end()};
        all.erase(SPI_MODE);
        answers[{package, MODES_WITHOUT_OUTPUT}] = {modesWithoutOutput.begin(), modesWithoutOutput.end()};
    }

    static void addProperties(Answers& answers, const std::string& topic, const Properties& properties) {
        for (const Property& property : properties) {
            answers[value(topic + property.key)] = {property.values.begin(), property.values.end()};
        }
    }

    [[nodiscard]] static Answers general(const DeviceSurvey& survey) {
        const MutedMessages muted;
        const ManagerFactory::Manager manager = freshManager();
        Answers answers;
        for (const std::string& mode : vocabulary::modes()) {
            StringSet& outputs = answers[names(OUTPUTS_OF_MODE + mode)];
            for (const std::string& output : vocabulary::outputs()) {
                if (manager->checkConstraints(vocabulary::readMode(mode), vocabulary::readOutput(output))) {
                    outputs.insert(output);
                }
            }
        }
        for (const std::string& package : spiPackages()) {
            StringSet& modes = answers[{package, "modes of every device"}];
            for (const std::string& mode :
                 questions::modes(*manager, "spi", package.empty() ? nullptr : package.c_str())) {
                if (mode == SPI_MODE) {
                    modes.insert(mode);
                }
            }
        }
        addTable(answers, "", OPERATIONS, survey.spiOperations(), true);
        addTable(answers, "", OPTIONS, survey.spiOptions(), true);
        const std::vector<std::string> families = catalogue::families();
        answers[names(FAMILIES)] = {families.begin(), families.end()};
        for (const std::string& family : catalogue::list("spi.acd", "DEVICE_FAMILY")) {
            answers[names(FLASH_FAMILIES)].insert(family);
        }
        return answers;
    }

    /// The packages in which SPI mode is refused, and none.
    [[nodiscard]] static StringSet spiPackages() {
        constexpr std::string_view PREFIX = "SPI_spi_";
        StringSet packages{""};
        for (const std::string& part : catalogue::list("base.acd", "NOT_SUPPORTED_PART_IN_MODE")) {
            if (part.starts_with(PREFIX)) {
                packages.insert(part.substr(PREFIX.size()));
            }
        }
        return packages;
    }

    std::map<Common, std::string> m_common; ///< with the first device that has it
};

} // namespace

std::string takeSnapshot(const ProgressCallback& progress) { return SnapshotCollector().collect(progress); }

} // namespace diff
