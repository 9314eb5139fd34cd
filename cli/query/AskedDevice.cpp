// Finds the device that a text means, for all commands alike: the manager itself compares names by their case, takes
// every text for a device, and ignores the package in a name.
#include "query/AskedDevice.h"

#include "model/Catalogue.h"
#include "model/Schema.h"
#include "query/FreshManager.h"
#include "query/Properties.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <PicConfig.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

namespace {

using Names = std::vector<std::string>;

std::optional<std::string> findIn(const Names& names, const std::string& text) {
    const auto found =
        std::ranges::find_if(names, [&](const std::string& name) { return sameWithoutCase(name, text); });
    return found == names.end() ? std::nullopt : std::optional(*found);
}

/// Flashes, their families, and "spi", which stands for all of them.
Names flashNames() {
    Names names = catalogue::list(schema::SPI, schema::DEVICE_FAMILY);
    for (catalogue::Flash& flash : catalogue::flashes()) {
        names.push_back(std::move(flash.name));
    }
    names.emplace_back("spi");
    return names;
}

/// The device, flash or family of this name, as the database spells it.
std::optional<std::string> findDevice(const std::string& name) {
    if (std::optional<std::string> flash = findIn(flashNames(), name)) {
        return flash;
    }
    if (std::optional<std::string> family = findIn(catalogue::families(), name)) {
        // Opened, because a family that cannot be read has no answers.
        static_cast<void>(AcdStore::devices(*family));
        return family;
    }
    const PicConfig configuration(name.c_str(), 1, PM_PARTNAME_BINDING::BY_NAME);
    const char* const family = configuration.get_pm();
    return family == nullptr ? std::nullopt : findIn(AcdStore::devices(family), name);
}

/// A name may belong to a family that cannot be read.
/// @throw CommandError (FAULT) if there is such a family
void requireReadableFamilies(const std::string& device) {
    for (const std::string& family : AcdStore::families()) {
        try {
            static_cast<void>(AcdStore::devices(family));
        } catch (const DataNotFoundException&) {
            throw CommandError(
                ExitCode::FAULT,
                fmt::format("the family {} cannot be read, so it is unknown whether there is a "
                            "device \"{}\"",
                            family, device));
        }
    }
}

std::string readPackage(const std::string& device, const std::string& text) {
    const Names packages = packagesOf(device);
    const std::optional<std::string> package = findIn(packages, text);
    if (!package && !packages.empty()) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("{} has no package \"{}\"{}\npackages of {}, in any case:\n{}", device,
                                       text, didYouMean(text, packages), device, wrapped(packages, 2)));
    }
    return package.value_or(text);
}

std::string inPackage(const std::optional<std::string>& package) {
    return package ? " in package " + *package : "";
}

} // namespace

std::optional<std::string> deviceNamed(const std::string& text) {
    const std::optional<std::string> whole = findDevice(text);
    return whole ? whole : findDevice(text.substr(0, text.find('_')));
}

std::vector<std::string> packagesOf(const std::string& device) {
    // Opened first, so that what the host layer reports about the file is heard.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    const MutedMessages muted;
    try {
        const ManagerFactory::Manager manager = freshManager();
        if (!manager->isSpiDevice(device.c_str())) {
            return propertyValues(*manager, device, schema::PACKAGES);
        }
        const std::string package = manager->getSpiDeviceStringProperty(device.c_str(), schema::PACKAGE);
        return package.empty() ? Names() : Names{package};
    } catch (const TarvikException&) {
        // The question itself meets the same fault.
        return {};
    }
}

AskedDevice askedDevice(Tool& tool, const std::string& device, const std::optional<std::string>& package,
                        PackageUse use) {
    tool.openDatabase();
    AskedDevice asked{device, package, {}};
    if (tool.isLiteral()) {
        return asked;
    }
    std::optional<std::string> name = findDevice(device);
    const std::size_t separator = device.find('_');
    if (!name && separator != std::string::npos) {
        name = findDevice(device.substr(0, separator));
        asked.package = device.substr(separator + 1);
        if (name && package && !sameWithoutCase(*package, *asked.package)) {
            throw CommandError(ExitCode::FAULT,
                               fmt::format("\"{}\" names the package {}, and --package names {}", device,
                                           *asked.package, *package));
        }
    }
    if (!name) {
        requireReadableFamilies(device);
        throw catalogue::unknownDevice(device);
    }
    asked.name = *name;
    if (asked.package) {
        asked.package = readPackage(asked.name, *asked.package);
    }
    if (asked.name != device || asked.package != package) {
        const std::string typedPackage = package ? fmt::format(" in package \"{}\"", *package) : "";
        asked.reading = fmt::format("\"{}\"{} is device {}{}", device, typedPackage, asked.name,
                                    inPackage(asked.package));
        const char* const unused =
            asked.package && use == PackageUse::IGNORED ? ", and the package makes no difference here" : "";
        tool.note(asked.reading + unused + "; use --literal to ask about the name as typed", "asked",
                  {{"typed", device},
                   {"device", asked.name},
                   {"package", asked.package ? Json(*asked.package) : Json()}});
    }
    return asked;
}
