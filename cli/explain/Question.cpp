// The questions that can be explained: how the manager is asked them, and how they read.
#include "explain/Question.h"

#include "model/Catalogue.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace explanation {

namespace {

using Kind = Question::Kind;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

bool isInMask(int mask, int value) { return (static_cast<unsigned>(mask) >> value & 1U) != 0; }

/// A property's values are those that the manager gives as a set. It is asked for the single value first: for a flash
/// only that question finds a property, and for others it reports that there is none.
bool hasProperty(ConstraintsManager& manager, const Question& question) {
    const char* const device = question.device.c_str();
    const char* const key = question.property.c_str();
    const char* const value = manager.getDeviceStringProperty(device, key);
    if (manager.isSpiDevice(device)) {
        return *value != '\0' && (!question.value || *question.value == value);
    }
    const ConstraintsManager::TextSet& values = manager.getDeviceStringProperties(device, key);
    return question.value ? values.count(*question.value) != 0 : !values.empty();
}

bool hasOptions(ConstraintsManager& manager, const Question& question) {
    const ConstraintsManager::TextSet& options = manager.getDeviceOperationOptions(
        question.device.c_str(), vocabulary::key(question.operation).c_str(), question.mode);
    return question.value ? options.count(*question.value) != 0 : !options.empty();
}

/// Does the mode accept every device as long as no output is given?
bool acceptsAll(MODE_TYPE mode) { return mode == MODE_TYPE::PFF || mode == MODE_TYPE::SPI; }

bool isAllowedThroughSomeOutput(ConstraintsManager& manager, const Question& question) {
    const char* const package = question.package ? question.package->c_str() : nullptr;
    if (!acceptsAll(question.mode)) {
        return manager.checkConstraints(question.mode, question.device.c_str(), package);
    }
    for (int output = 0; output <= static_cast<int>(OUTPUT_TYPE::NONE); ++output) {
        if (manager.checkConstraints(question.mode, static_cast<OUTPUT_TYPE>(output), question.device.c_str(),
                                     package)) {
            return true;
        }
    }
    return false;
}

/// Asks about all parts, also after a no: each issues its own messages.
bool areAllAllowed(ConstraintsManager& manager, const Question& question) {
    bool isYes = true;
    for (const Question& part : partsOf(question)) {
        isYes = isAllowed(manager, part) && isYes;
    }
    return isYes;
}

} // namespace

bool isAllowed(ConstraintsManager& manager, const Question& question) {
    const char* const device = question.device.c_str();
    const char* const package = question.package ? question.package->c_str() : nullptr;
    switch (question.kind) {
    case Kind::OUTPUT:
        return manager.checkConstraints(question.mode, question.output);
    case Kind::DEVICE:
        return manager.checkConstraints(question.mode, device, package);
    case Kind::DEVICE_THROUGH:
        return manager.checkConstraints(question.mode, question.output, device, package);
    case Kind::OPERATION:
        return manager.checkConstraints(question.mode, question.output, device, question.operation, nullptr);
    case Kind::OPERATION_IN_MODE:
        return manager.checkConstraints(device, question.mode, question.operation, nullptr);
    case Kind::OPTION:
        return isInMask(manager.getProgramOptions(device, question.mode, question.output, package),
                        static_cast<int>(question.option));
    case Kind::BSDL:
        return isInMask(manager.getBsdlOperations(device, question.output),
                        static_cast<int>(question.operation));
    case Kind::PROPERTY:
        return hasProperty(manager, question);
    case Kind::OPERATION_OPTIONS:
        return hasOptions(manager, question);
    case Kind::MULTIBOOT:
        return manager.isMbBpiSpiSupport(device, question.multibootType.c_str(), question.width.c_str(),
                                         question.isLead);
    case Kind::DEVICE_IN_MODE:
        return isAllowedThroughSomeOutput(manager, question);
    case Kind::COMPLETE:
    case Kind::COMPLETE_IN_MODE:
        return areAllAllowed(manager, question);
    }
    return false;
}

namespace {

const std::string& optionKey(TARVIKNS::PROGRAM_OPTION option) {
    return vocabulary::options().at(static_cast<std::size_t>(option));
}

bool isOneOf(Kind kind, std::initializer_list<Kind> kinds) {
    return std::find(kinds.begin(), kinds.end(), kind) != kinds.end();
}

bool takesDevice(Kind kind) { return kind != Kind::OUTPUT; }
bool takesMode(Kind kind) { return !isOneOf(kind, {Kind::BSDL, Kind::PROPERTY, Kind::MULTIBOOT}); }
bool takesOutput(Kind kind) {
    return isOneOf(kind, {Kind::OUTPUT, Kind::DEVICE_THROUGH, Kind::OPERATION, Kind::OPTION, Kind::BSDL,
                          Kind::COMPLETE});
}
bool takesOperation(Kind kind) {
    return isOneOf(kind, {Kind::OPERATION, Kind::OPERATION_IN_MODE, Kind::COMPLETE, Kind::COMPLETE_IN_MODE});
}

/// The packages in which a mode excludes a device.
std::vector<std::string> excludedPackages(const Question& question) {
    const std::string prefix = vocabulary::key(question.mode) + '_' + question.device + '_';
    std::vector<std::string> packages;
    for (const std::string& part : catalogue::list(schema::BASE, schema::NOT_SUPPORTED_PART_IN_MODE)) {
        if (part.starts_with(prefix)) {
            packages.push_back(part.substr(prefix.size()));
        }
    }
    return packages;
}

const char* positionOf(const Question& question) { return question.isLead ? "lead" : "chain"; }

} // namespace

Conclusion ask(ConstraintsManager& manager, const Question& question) {
    try {
        return isAllowed(manager, question) ? Conclusion::YES : Conclusion::NO;
    } catch (const DataMismatchException&) {
        return Conclusion::FAULT;
    }
}

bool Question::takesPackage() const {
    return isOneOf(kind, {Kind::DEVICE, Kind::DEVICE_THROUGH, Kind::DEVICE_IN_MODE, Kind::OPTION}) ||
           takesOperation(kind);
}

std::vector<Question> partsOf(const Question& question) {
    std::vector<Kind> kinds;
    if (question.kind == Kind::COMPLETE) {
        kinds = {Kind::OUTPUT, Kind::DEVICE_IN_MODE, Kind::OPERATION};
    } else if (question.kind == Kind::COMPLETE_IN_MODE) {
        kinds = {Kind::DEVICE, Kind::OPERATION_IN_MODE};
    }
    std::vector<Question> parts;
    for (const Kind kind : kinds) {
        Question& part = parts.emplace_back(question);
        part.kind = kind;
        if (kind != Kind::DEVICE && kind != Kind::DEVICE_IN_MODE) {
            part.package.reset();
        }
    }
    return parts;
}

std::vector<std::string> skippedChecks(const Question& question) {
    const Kind kind = question.kind;
    const std::string& mode = vocabulary::key(question.mode);
    std::vector<std::string> skipped;
    if (takesMode(kind) && takesOutput(kind) && kind != Kind::OUTPUT && question.mode == MODE_TYPE::SPI) {
        skipped.emplace_back(questions::SPI_MODE_RULE);
    }
    if (isOneOf(kind, {Kind::OUTPUT, Kind::DEVICE_THROUGH, Kind::COMPLETE}) &&
        question.mode == MODE_TYPE::PFF) {
        skipped.emplace_back("PFF mode accepts every output");
    }
    if (isOneOf(kind, {Kind::DEVICE, Kind::COMPLETE_IN_MODE}) && acceptsAll(question.mode)) {
        skipped.push_back(fmt::format("without --output, {} mode accepts every device", mode));
    } else if (isOneOf(kind, {Kind::DEVICE, Kind::DEVICE_THROUGH}) && !question.package) {
        if (const std::vector<std::string> packages = excludedPackages(question); !packages.empty()) {
            skipped.push_back(
                fmt::format("without --package, it is not checked that {} mode excludes {} in {}", mode,
                            question.device, fmt::join(packages, ", ")));
        }
    } else if (kind == Kind::OPERATION) {
        skipped.push_back(fmt::format(
            "without --package, it is not checked whether {} mode accepts the device and the output", mode));
    }
    if (isOneOf(kind, {Kind::OPERATION_IN_MODE, Kind::COMPLETE_IN_MODE})) {
        skipped.push_back(fmt::format("without --output, only the property {} is checked, not the operations "
                                      "of the device",
                                      vocabulary::key(question.operation)));
    }
    return skipped;
}

std::string inWords(const Question& question) {
    const Kind kind = question.kind;
    std::string words;
    if (takesOperation(kind)) {
        words = vocabulary::key(question.operation) + " of ";
    } else if (kind == Kind::OPTION) {
        words = "option " + optionKey(question.option) + " of ";
    } else if (kind == Kind::BSDL) {
        words = "boundary-scan operation " + vocabulary::key(question.operation) + " of ";
    } else if (kind == Kind::PROPERTY) {
        words = "property " + question.property + (question.value ? " with value " + *question.value : "") +
                " of ";
    } else if (kind == Kind::OPERATION_OPTIONS) {
        words = (question.value ? "option " + *question.value : "options") + " for " +
                vocabulary::key(question.operation) + " of ";
    } else if (kind == Kind::MULTIBOOT) {
        return fmt::format("{} as {} device of {} {}", question.device, positionOf(question),
                           question.multibootType, question.width);
    }
    if (takesDevice(kind)) {
        words += question.device + (question.package ? " in package " + *question.package : "");
    }
    if (takesMode(kind)) {
        words += (words.empty() ? "mode " : " in mode ") + vocabulary::key(question.mode);
    }
    return takesOutput(kind) ? words + " through " + vocabulary::key(question.output) : words;
}

Json inJson(const Question& question) {
    const Kind kind = question.kind;
    Json asked;
    if (takesDevice(kind)) {
        asked["device"] = question.device;
    }
    if (takesMode(kind)) {
        asked["mode"] = vocabulary::key(question.mode);
    }
    if (takesOutput(kind)) {
        asked["output"] = vocabulary::key(question.output);
    }
    if (question.package) {
        asked["package"] = *question.package;
    }
    if (takesOperation(kind)) {
        asked["operation"] = vocabulary::key(question.operation);
    } else if (kind == Kind::BSDL) {
        asked["bsdl"] = vocabulary::key(question.operation);
    } else if (kind == Kind::OPTION) {
        asked["option"] = optionKey(question.option);
    } else if (kind == Kind::OPERATION_OPTIONS) {
        asked["operation-options"] = vocabulary::key(question.operation);
        if (question.value) {
            asked["value"] = *question.value;
        }
    } else if (kind == Kind::MULTIBOOT) {
        asked["type"] = question.multibootType;
        asked["width"] = question.width;
        asked["position"] = positionOf(question);
    } else if (kind == Kind::PROPERTY) {
        asked["property"] = question.property;
        if (question.value) {
            asked["value"] = *question.value;
        }
    }
    return asked;
}

} // namespace explanation
