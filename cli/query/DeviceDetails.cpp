// Gathers everything about one device.
#include "query/DeviceDetails.h"

#include "model/Multiboot.h"
#include "model/Records.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/AskedDevice.h"
#include "query/DeviceSurvey.h"
#include "text/Suggest.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <algorithm>

namespace {

std::string spelling(const std::string& device, const std::string& family) {
    for (const std::string& known : catalogue::families()) {
        if (known == family) {
            for (const std::string& name : AcdStore::devices(family)) {
                if (sameWithoutCase(name, device)) {
                    return name;
                }
            }
        }
    }
    return device;
}

/// All names that the lists of multiboot arrangements hold, in lower case.
std::unordered_set<std::string> multibootNames() {
    std::unordered_set<std::string> names;
    for (const std::string& key : multiboot::keys()) {
        for (const std::string& name : catalogue::list("spi.acd", key)) {
            names.insert(lowerCase(name));
        }
    }
    return names;
}

std::vector<DeviceDetails::Arrangement> arrangements(const ConstraintsManager& manager,
                                                     const std::string& device) {
    std::vector<DeviceDetails::Arrangement> found;
    multiboot::forEachArrangement([&](const std::string& type, const std::string& width, bool lead) {
        if (manager.isMbBpiSpiSupport(device.c_str(), type.c_str(), width.c_str(), lead)) {
            found.push_back({type, width, lead ? "lead" : "chain"});
        }
    });
    return found;
}

/// Adds the packages that change nothing, and where each package is excluded from a mode.
void completePackages(DeviceDetails& details) {
    for (const std::string& package : packagesOf(details.name)) {
        details.packages.try_emplace(package);
    }
    const std::vector<catalogue::SourceText> excluded =
        catalogue::readList(schema::BASE, schema::NOT_SUPPORTED_PART_IN_MODE);
    for (auto& [package, changes] : details.packages) {
        for (std::size_t mode = 0; mode < vocabulary::modes().size(); ++mode) {
            // In SPI mode the manager treats every device as "spi".
            const bool isSpi = mode == static_cast<std::size_t>(TARVIKNS::MODE_TYPE::SPI);
            const std::string part =
                vocabulary::modes()[mode] + '_' + (isSpi ? "spi" : details.name) + '_' + package;
            const auto found = std::ranges::find(excluded, part, &catalogue::SourceText::text);
            if (found != excluded.end()) {
                changes.exclusions.push_back({vocabulary::modes()[mode], found->origin});
            }
        }
    }
}

} // namespace

const Properties& DeviceDetails::shownProperties() const {
    static const Properties none;
    return flash ? none : properties;
}

std::string DeviceDetails::whyIncomplete() const {
    if (!isKnown()) {
        return catalogue::unknownDevice(name).what();
    }
    for (const SharedTable* const table : {&operations, &options}) {
        if (*table && !(*table)->fault.empty()) {
            return (*table)->fault;
        }
    }
    return fault;
}

DeviceFactsReader::DeviceFactsReader(const ConstraintsManager& manager)
    : m_idcodes(manager), m_idcodeEntries(catalogue::entries("base.acd", "IDCODE")),
      m_multiboot(multibootNames()) {}

void DeviceFactsReader::addFacts(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent) {
    const std::string& device = details.name;
    details.flash = manager.isSpiDevice(device.c_str());
    details.idcode = idcode(device);
    if (m_multiboot.count(lowerCase(device)) != 0) {
        details.multiboot = arrangements(manager, device);
    }
    if (details.flash) {
        details.flashClass = flashClass(device);
        details.flashProperties = flashProperties(manager, device);
    }
    if (!details.fault.empty()) {
        return;
    }
    const auto ask = [&](ConstraintsManager& asked,
                         const std::string& key) -> std::optional<std::vector<std::string>> {
        try {
            return propertyValues(asked, device, key);
        } catch (const TarvikException& fault) {
            details.fault = faultText(fault);
            return std::nullopt;
        }
    };
    // No record has this key, so the manager loads all there is, and the family of the name, too.
    const char* const missing = ":";
    const std::string family = toStdString(manager.getPartFamily(device.c_str()));
    if (isOrderDependent) {
        // One name may have properties of its own although its family's data raise.
        const MutedMessages muted;
        static_cast<void>(ask(*freshManager(), missing));
        details.properties = m_properties.read(
            device, family, [&](const std::string& key) { return ask(*freshManager(), key); });
    } else if (ask(manager, missing)) {
        details.properties =
            m_properties.read(device, family, [&](const std::string& key) { return ask(manager, key); });
    }
}

std::optional<DeviceDetails::Idcode> DeviceFactsReader::idcode(const std::string& device) const {
    std::optional<IdcodeFinder::Idcode> found = m_idcodes.find(device);
    if (!found) {
        // A package does not change the IDCODE.
        StringBase bare(device.c_str());
        ConstraintsManager::removePackageName(bare);
        found = m_idcodes.find(toStdString(bare));
    }
    if (!found) {
        return std::nullopt;
    }
    const catalogue::Entry& entry = m_idcodeEntries.at(found->name);
    return DeviceDetails::Idcode{found->value, entry.origin, entry.shadows};
}

DeviceDetails deviceDetails(const std::string& device) {
    // Read first, so that what the host layer reports about the files is heard.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    DeviceDetails details =
        DeviceSurvey({.operations = true, .options = true, .packages = true, .facts = true}).ask(device);
    if (const std::string reason = details.whyIncomplete(); !reason.empty()) {
        throw CommandError(details.isKnown() ? ExitCode::FAULT : ExitCode::NO, reason);
    }
    details.spelling = spelling(device, details.family);
    completePackages(details);
    return details;
}
