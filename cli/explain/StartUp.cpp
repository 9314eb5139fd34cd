// Reads what the manager reads when it starts: the base database and the catalogue of SPI flashes.
#include "explain/StartUp.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <UT_STR.h>
#include <tarvik/ConstraintsManager.h>

namespace why {

namespace {

constexpr const char* BASE = "base.acd";
constexpr const char* FLASHES = "spi.acd";

Names names(std::vector<Piece>&& pieces) {
    Names found;
    for (Piece& piece : pieces) {
        std::string name = piece.text;
        found.try_emplace(std::move(name), std::move(piece));
    }
    return found;
}

StartUp::Mode readMode(const std::string& key) {
    StartUp::Mode mode;
    const Records records = readRecords(BASE, key);
    if (!records.all.empty()) {
        const Record& outputs = records.all[0];
        mode.outputRecord = outputs.whole;
        for (std::size_t field = 1; field < outputs.fields.size(); ++field) {
            const Piece& word = outputs.fields[field];
            mode.outputs.try_emplace(ConstraintsManager::cableString2Type(word.text.c_str()), word);
        }
    }
    if (records.all.size() > 1) {
        const Record& families = records.all[1];
        mode.familyRecord = families.whole;
        mode.families = names({families.fields.begin() + 1, families.fields.end()});
    }
    return mode;
}

void readFlashProperties(StartUp& facts, const std::string& name) {
    for (const Record& record : readRecords(FLASHES, upperCase(name) + "_PROPERTY").all) {
        const Piece* const value = record.field(1);
        facts.flashProperties.insert_or_assign(
            name + record.fields.front().text,
            StartUp::FlashProperty{value == nullptr ? "" : value->text, record.whole});
    }
}

void readFlashes(StartUp& facts) {
    std::vector<Piece> all;
    for (const Piece& family : readList(FLASHES, "DEVICE_FAMILY")) {
        all.push_back(family);
        for (Piece& device : readList(FLASHES, family.text + "_DEVICES")) {
            all.push_back(std::move(device));
        }
    }
    // In the order of the list: two names that run together with their properties replace each other.
    for (const Piece& name : all) {
        readFlashProperties(facts, name.text);
    }
    facts.flashes = names(std::move(all));
    for (const char* const flashClass : {"AT1", "ST1", "ST2", "BPI1", "BPI2", "BPI3"}) {
        Names members;
        for (Piece& member : readList(FLASHES, std::string(flashClass) + "_DEVICES")) {
            std::string name = lowerCase(member.text);
            members.try_emplace(std::move(name), std::move(member));
        }
        facts.flashClasses.emplace_back(flashClass, std::move(members));
    }
}

} // namespace

bool StartUp::isFlash(const std::string& name) const { return flashes.count(upperCase(name)) != 0; }

StartUp readStartUp() {
    StartUp facts;
    if (!hasFamilyFile("base")) {
        return facts;
    }
    facts.complete = true;
    facts.supported = names(readList(BASE, "DEVICE_SUPPORTED"));
    facts.packages = names(readList(BASE, "PROGRAM_OPTION_PACKAGE"));
    for (std::size_t mode = 0; mode < StartUp::MODES; ++mode) {
        facts.modes.at(mode) = readMode(vocabulary::modes().at(mode));
    }
    facts.excludedParts = names(readList(BASE, "NOT_SUPPORTED_PART_IN_MODE"));
    if (hasFamilyFile("spi")) {
        readFlashes(facts);
    }
    return facts;
}

std::string withoutPackage(const std::string& device) { return device.substr(0, device.find('_')); }

std::string upperCase(const std::string& text) { return plain(UT_STR::Upper(text.c_str())); }

} // namespace why
