// The questions that a manager is asked: whole topics at a time.
#include "diff/SnapshotCollector.h"

#include "model/Catalogue.h"
#include "model/Multiboot.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/Properties.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <algorithm>

namespace diff {

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// The tables have rows for the modes up to SPI, and cells for the outputs up to STAPL.
constexpr int TABLE_MODES = static_cast<int>(MODE_TYPE::SPI) + 1;
constexpr int TABLE_OUTPUTS = static_cast<int>(OUTPUT_TYPE::STAPL) + 1;

Question value(std::string topic) { return {std::move(topic), Question::Kind::VALUE}; }

Texts members(int mask, const std::vector<std::string>& names) {
    Texts found;
    for (std::size_t i = 0; i < names.size(); ++i) {
        if ((static_cast<unsigned>(mask) >> i & 1U) != 0) {
            found.insert(names[i]);
        }
    }
    return found;
}

template <typename Ask>
void forEachCell(Ask ask) {
    for (int mode = 0; mode < TABLE_MODES; ++mode) {
        for (int output = 0; output < TABLE_OUTPUTS; ++output) {
            ask(static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output));
        }
    }
}

/// The names of the properties that a database has, or that a device's own section has.
std::set<std::string> propertyNames(const std::string& database, bool sectionOnly) {
    std::set<std::string> names;
    for (const char* const key : {"PROPERTY", "PROPERTIES"}) {
        for (const auto& [name, entry] : catalogue::entries(database, key)) {
            if (!sectionOnly || entry.ofDevice) {
                names.insert(name);
            }
        }
    }
    return names;
}

} // namespace

Answers Interview::general() {
    Answers answers;
    for (const std::string& mode : vocabulary::modes()) {
        Texts& outputs = answers[{"outputs of mode " + mode}];
        for (const std::string& output : vocabulary::outputs()) {
            if (m_manager.checkConstraints(vocabulary::readMode(mode), vocabulary::readOutput(output))) {
                outputs.insert(output);
            }
        }
    }
    const std::vector<std::string> families = catalogue::families();
    answers[{"families"}] = {families.begin(), families.end()};
    Texts& flashFamilies = answers[{"families of flashes"}];
    for (const std::string& family : catalogue::list("spi.acd", "DEVICE_FAMILY")) {
        flashFamilies.insert(family);
        // The properties of classes are answers of their flashes; those of others speak for the name alone.
        if (!schema::isFlashClass(family)) {
            addFlashProperties(answers, family, "flash family " + family + ": property ");
        }
    }
    return answers;
}

Answers Interview::whatItIs(const Member& member) {
    const std::string& name = member.name;
    Answers answers;
    answers[value(FAMILY)] = {plain(m_manager.getPartFamily(name.c_str()))};
    if (const std::optional<IdcodeFinder::Idcode> idcode = m_idcodes.find(name)) {
        answers[value("IDCODE")] = {idcode->value};
    }
    if (m_inMultiboot.count(lowerCase(name)) == 0) {
        return answers;
    }
    Texts& arrangements = answers[{"multiboot"}];
    for (const std::string& type : multiboot::TYPES) {
        for (const std::string& width : multiboot::WIDTHS) {
            for (const bool lead : {true, false}) {
                if (m_manager.isMbBpiSpiSupport(name.c_str(), type.c_str(), width.c_str(), lead)) {
                    arrangements.insert(type + '_' + width + (lead ? "_LEAD" : "_CHAIN"));
                }
            }
        }
    }
    return answers;
}

Texts Interview::modes(const std::string& device, const char* package) {
    Texts allowed;
    for (const std::string& key : vocabulary::modes()) {
        if (m_manager.checkConstraints(vocabulary::readMode(key), device.c_str(), package)) {
            allowed.insert(key);
        }
    }
    return allowed;
}

Answers Interview::modes(const std::string& device) { return {{{MODES}, modes(device, nullptr)}}; }

Answers Interview::operations(const std::string& device) {
    Answers answers;
    forEachCell([&](MODE_TYPE mode, OUTPUT_TYPE output) {
        answers[{"operations", Question::Kind::NAMES, mode, output}] =
            members(m_manager.getDeviceOperations(device.c_str(), mode, output), vocabulary::operations());
    });
    for (int output = 0; output < TABLE_OUTPUTS; ++output) {
        const auto through = static_cast<OUTPUT_TYPE>(output);
        answers[{"boundary-scan operations", Question::Kind::NAMES, {}, through}] =
            members(m_manager.getBsdlOperations(device.c_str(), through), vocabulary::operations());
    }
    return answers;
}

Answers Interview::options(const std::string& device, const char* package) {
    Answers answers;
    forEachCell([&](MODE_TYPE mode, OUTPUT_TYPE output) {
        answers[{OPTIONS, Question::Kind::NAMES, mode, output}] = members(
            m_manager.getProgramOptions(device.c_str(), mode, output, package), vocabulary::options());
    });
    return answers;
}

Answers Interview::allProperties(const Member& member) {
    Answers answers;
    for (const Property& property : deviceProperties(m_manager, member.name)) {
        answers[value("property " + property.key)] = {property.values.begin(), property.values.end()};
    }
    if (member.isFlash) {
        addFlashProperties(answers, member.name, "flash property ");
    }
    return answers;
}

/// Those of the device's own section; one without values hides that of the family.
Answers Interview::sectionProperties(const std::string& device) {
    Answers answers;
    for (const std::string& name : propertyNames(device, true)) {
        Texts& values = answers[value("property " + name)];
        for (const StringBase& text : m_manager.getDeviceStringProperties(device.c_str(), name.c_str())) {
            values.insert(plain(text));
        }
    }
    return answers;
}

Answers Interview::familyProperties(const std::string& family) {
    Answers answers;
    for (const std::string& name : propertyNames(family, false)) {
        Texts& values = answers[value("property " + name)];
        for (const StringBase& text : m_manager.getDeviceStringProperties(family.c_str(), name.c_str())) {
            values.insert(plain(text));
        }
    }
    return answers;
}

void Interview::addFlashProperties(Answers& answers, const std::string& name, const std::string& topic) {
    for (const Property& property : flashProperties(m_manager, name)) {
        answers[value(topic + property.key)] = {property.values.begin(), property.values.end()};
    }
}

} // namespace diff
