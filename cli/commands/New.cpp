// `new`: adds a device, a family or a flash to a database.
#include "commands/Commands.h"
#include "commands/CommonArguments.h"
#include "commands/EditedFiles.h"

#include "edit/Create.h"
#include "edit/Names.h"
#include "model/IdcodePattern.h"
#include "model/Vocabulary.h"
#include "query/Tool.h"
#include "text/Suggest.h"

#include <AcdStore.h>

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <memory>

namespace {

using edit::Creation;

struct Arguments {
    std::string kind;
    edit::Creation creation;
    std::string layer;
    bool dryRun = false;
};

bool isSameDirectory(const std::string& left, const std::string& right) {
    std::error_code ignored;
    return std::filesystem::equivalent(left, right, ignored);
}

/// The family whose file says which layer is written to.
std::string homeFamily(const lint::Model& model, const Creation& creation) {
    if (creation.kind != Creation::Kind::DEVICE) {
        return creation.kind == Creation::Kind::FLASH ? std::string(schema::SPI_FAMILY) : "base";
    }
    const lint::Device* const device = model.deviceInAnyCase(creation.like);
    return device == nullptr ? creation.family : device->family->name;
}

/// The layer that has the lowest file of a family, otherwise the lowest layer.
std::size_t layerOf(const edit::Draft& draft, const std::string& family, std::size_t lowest) {
    const auto file =
        std::find_if(draft.files().begin(), draft.files().end(), [&family](const edit::Draft::File& each) {
            return sameWithoutCase(each.family, family);
        });
    return file == draft.files().end() ? lowest : file->layer;
}

/// Puts the directory that is to be written to among the layers, on top unless it is there.
void addLayer(std::vector<std::string>& layers, const std::string& directory) {
    if (!std::filesystem::is_directory(directory)) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("there is no directory \"{}\"", printable(directory)));
    }
    const auto isIt = [&directory](const std::string& layer) { return isSameDirectory(layer, directory); };
    if (std::none_of(layers.begin(), layers.end(), isIt)) {
        layers.insert(layers.begin(), directory);
        AcdStore::setSearchPath(layers);
    }
}

void checkWords(Creation& creation) {
    for (std::string& mode : creation.modes) {
        mode = vocabulary::key(vocabulary::readMode(mode));
    }
    for (std::string& output : creation.outputs) {
        output = vocabulary::key(vocabulary::readOutput(output));
    }
    for (std::string& operation : creation.operations) {
        operation = vocabulary::key(vocabulary::readOperation(operation));
    }
    for (const std::string& package : creation.packages) {
        if (!edit::isUsableName(package)) {
            throw CommandError(ExitCode::FAULT,
                               fmt::format("\"{}\" cannot be a package", printable(package)));
        }
    }
    if (!creation.idcode.empty() && !readIdcode(creation.idcode)) {
        throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" is not an IDCODE: 0x and eight hexadecimal "
                                                        "digits, X for one that can have any value",
                                                        printable(creation.idcode)));
    }
}

/// Refuses options that say nothing about what is added.
void checkKind(const std::string& kind, const Creation& creation) {
    const auto refuseIf = [&kind](bool isGiven, const char* what) {
        if (isGiven) {
            throw CommandError(ExitCode::FAULT, fmt::format("a {} has no {}", kind, what));
        }
    };
    const bool isFamily = creation.kind == Creation::Kind::FAMILY;
    refuseIf(creation.kind != Creation::Kind::DEVICE && !creation.idcode.empty(), "IDCODE");
    refuseIf(creation.kind == Creation::Kind::FLASH && creation.packages.size() > 1, "second package");
    refuseIf(isFamily && !creation.packages.empty(), "packages");
    refuseIf(isFamily && !creation.family.empty(), "family");
    const bool hasTables =
        !creation.modes.empty() || !creation.outputs.empty() || !creation.operations.empty();
    if (hasTables && (!isFamily || !creation.like.empty())) {
        throw CommandError(ExitCode::FAULT,
                           "--mode, --output and --operation are those of a new family without --like");
    }
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    std::vector<std::string> layers = tool.openDirectories();
    if (!arguments.layer.empty()) {
        addLayer(layers, arguments.layer);
    }
    Creation creation = arguments.creation;
    creation.kind = arguments.kind == "device"   ? Creation::Kind::DEVICE
                    : arguments.kind == "family" ? Creation::Kind::FAMILY
                                                 : Creation::Kind::FLASH;
    checkKind(arguments.kind, creation);
    checkWords(creation);
    edit::Draft draft = edit::Draft::ofDatabase();
    const lint::Model before = draft.model();
    edit::requireNewName(before, creation.name, creation.kind == Creation::Kind::FAMILY, {});
    if (arguments.layer.empty()) {
        creation.layer = layerOf(draft, homeFamily(before, creation), layers.size() - 1);
    } else {
        creation.layer = static_cast<std::size_t>(
            std::find_if(layers.begin(), layers.end(),
                         [&](const std::string& layer) { return isSameDirectory(layer, arguments.layer); }) -
            layers.begin());
    }
    creation.directory = layers[creation.layer];
    const edit::Intention intention = edit::create(draft, creation);
    return finishEdit(tool, before, draft, layers, intention, arguments.dryRun);
}

Argument severalOf(Argument argument) {
    argument.isCommaSeparated = true;
    return argument;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    Creation& creation = arguments->creation;
    list = {
        {.name = "KIND",
         .description = "What is added",
         .kind = ValueKind::CHOICE,
         .choices = {"device", "family", "flash"},
         .required = true,
         .target = &arguments->kind},
        {.name = "NAME", .description = "Its name", .required = true, .target = &creation.name},
        {.name = "--family",
         .value = "FAMILY",
         .description = "The family of a device, or of a flash",
         .kind = ValueKind::FAMILY,
         .target = &creation.family},
        {.name = "--like",
         .value = "NAME",
         .description = "Copy the records of this device, family or flash",
         .kind = ValueKind::DEVICE,
         .target = &creation.like},
        {.name = "--idcode",
         .value = "CODE",
         .description = "The IDCODE of a device: 0x and eight hexadecimal digits, X for any",
         .target = &creation.idcode},
        {.name = "--packages",
         .value = "PACKAGE",
         .description = "The packages of a device, or the package of a flash (comma-separated)",
         .isCommaSeparated = true,
         .target = &creation.packages},
        severalOf(argument::mode(&creation.modes, false)),
        severalOf(argument::output(&creation.outputs, false)),
        severalOf(argument::operation(&creation.operations, "The operations of a family in all these modes")),
        {.name = "--layer",
         .value = "DIR",
         .description = "Write to this layer only, which appends to the values of the layers below",
         .kind = ValueKind::PATH,
         .target = &arguments->layer},
        argument::dryRun(&arguments->dryRun),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::NEW{
    "new",
    "Add a device, a family or a flash",
    "Writes the section or the file, the IDCODE and all list entries. Before anything is written it is "
    "proven "
    "that no other answer changes, and that lint has no new finding.",
    "tarvik new family falcon --like kestrel --database database\n"
    "tarvik --database database new family swift -m BS -o USB2 --operation PROGRAM\n"
    "tarvik --database database new device FK5 --family falcon --idcode 0xX5105FB7\n"
    "tarvik --database database new flash OVD128 --like OVD64 --dry-run",
    declare,
};
