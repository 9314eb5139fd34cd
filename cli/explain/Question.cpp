// The questions that can be explained: how the manager is asked them, and how they read.
#include "explain/Question.h"

#include "model/Vocabulary.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

namespace explanation {

namespace {

using Kind = Question::Kind;

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

bool answer(ConstraintsManager& manager, const Question& question) {
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
    }
    return false;
}

const std::string& optionKey(TARVIKNS::PROGRAM_OPTION option) {
    return vocabulary::options().at(static_cast<std::size_t>(option));
}

bool takesDevice(Kind kind) { return kind != Kind::OUTPUT; }
bool takesMode(Kind kind) { return kind != Kind::BSDL && kind != Kind::PROPERTY; }
bool takesOutput(Kind kind) {
    return kind != Kind::DEVICE && kind != Kind::OPERATION_IN_MODE && kind != Kind::PROPERTY;
}

} // namespace

Conclusion ask(ConstraintsManager& manager, const Question& question) {
    try {
        return answer(manager, question) ? Conclusion::YES : Conclusion::NO;
    } catch (const DataMismatchException&) {
        return Conclusion::FAULT;
    }
}

std::string inWords(const Question& question) {
    const Kind kind = question.kind;
    std::string words;
    if (kind == Kind::OPERATION || kind == Kind::OPERATION_IN_MODE) {
        words = vocabulary::key(question.operation) + " of ";
    } else if (kind == Kind::OPTION) {
        words = "option " + optionKey(question.option) + " of ";
    } else if (kind == Kind::BSDL) {
        words = "boundary-scan operation " + vocabulary::key(question.operation) + " of ";
    } else if (kind == Kind::PROPERTY) {
        words = "property " + question.property + (question.value ? " with value " + *question.value : "") +
                " of ";
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
    if (kind == Kind::OPERATION || kind == Kind::OPERATION_IN_MODE) {
        asked["operation"] = vocabulary::key(question.operation);
    } else if (kind == Kind::BSDL) {
        asked["bsdl"] = vocabulary::key(question.operation);
    } else if (kind == Kind::OPTION) {
        asked["option"] = optionKey(question.option);
    } else if (kind == Kind::PROPERTY) {
        asked["property"] = question.property;
        if (question.value) {
            asked["value"] = *question.value;
        }
    }
    return asked;
}

} // namespace explanation
