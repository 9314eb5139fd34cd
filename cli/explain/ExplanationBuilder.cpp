// Starts and ends an explanation, and explains how names become families.
#include "explain/ExplanationBuilder.h"

#include "model/Schema.h"
#include "text/Suggest.h"

#include <PicConfig.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

namespace explanation {

namespace {

/// Explains each part of a question by itself.
Explanation explainParts(const std::vector<Question>& parts) {
    Explanation whole{Conclusion::YES, {}};
    for (const Question& part : parts) {
        Explanation one = explain(part);
        const char* const verdict = one.verdict == Conclusion::YES  ? "yes"
                                    : one.verdict == Conclusion::NO ? "no"
                                                                    : "no answer";
        whole.steps.push_back({"part", fmt::format("{}: {}", verdict, inWords(part))});
        std::move(one.steps.begin(), one.steps.end(), std::back_inserter(whole.steps));
        // YES, NO and FAULT, in this order: the worst one is that of the whole.
        whole.verdict = std::max(whole.verdict, one.verdict);
    }
    return whole;
}

} // namespace

Explanation explain(const Question& question) {
    const std::vector<Question> parts = partsOf(question);
    return parts.empty() ? ExplanationBuilder(question).build() : explainParts(parts);
}

const SourceText* Explanation::decidingRecord() const {
    const SourceText* found = nullptr;
    for (const Step& step : steps) {
        if (step.topic == "record" && step.place) {
            found = &*step.place;
        }
    }
    return found;
}

Explanation ExplanationBuilder::build() {
    if (m_asked.startUp.values().empty()) {
        add("fault", "there is no base database, so the manager knows nothing");
    }
    const Conclusion verdict = this->verdict();
    return {verdict, std::move(m_steps)};
}

Conclusion ExplanationBuilder::verdict() {
    if (m_asked.verdict != Conclusion::FAULT) {
        return isYes() ? Conclusion::YES : Conclusion::NO;
    }
    const Match culprit = m_asked.reads.last();
    if (!culprit) {
        return Conclusion::NO;
    }
    add("fault",
        fmt::format("no database can name an option \"{}\": the manager raises when it reads the options of "
                    "\"{}\"",
                    culprit.text->text,
                    culprit.value->fromSection ? culprit.value->device : culprit.value->family),
        culprit);
    return Conclusion::FAULT;
}

bool ExplanationBuilder::isYes() {
    switch (m_question.kind) {
    case Question::Kind::OUTPUT:
        return output();
    case Question::Kind::DEVICE:
        return device();
    case Question::Kind::DEVICE_THROUGH: {
        const bool isOutputAllowed = output();
        return modeAllowsDevice() && isOutputAllowed;
    }
    case Question::Kind::OPERATION:
    case Question::Kind::OPTION:
    case Question::Kind::BSDL:
        return permission();
    case Question::Kind::OPERATION_IN_MODE:
        return operationInMode();
    case Question::Kind::PROPERTY:
        return property();
    case Question::Kind::OPERATION_OPTIONS:
        return operationOptions();
    case Question::Kind::MULTIBOOT:
        return multiboot();
    case Question::Kind::DEVICE_IN_MODE:
        return modeAllowsDevice();
    case Question::Kind::COMPLETE:
    case Question::Kind::COMPLETE_IN_MODE:
        // These are explained part by part.
        break;
    }
    return false;
}

std::string withoutPackage(const std::string& device) {
    StringBase name(device.c_str());
    ConstraintsManager::removePackageName(name);
    return toStdString(name);
}

std::string ExplanationBuilder::addNameStep() {
    const std::string& device = m_question.device;
    std::string base = withoutPackage(device);
    if (base != device) {
        add("name", fmt::format("\"{}\" is asked for as \"{}\", without its package", device, base));
    }
    return base;
}

/// Where spi.acd lists a flash or a family of flashes.
ReadLog::Match ExplanationBuilder::flashListing(const std::string& name) const {
    const std::string upper = upperCase(name);
    Match found = m_asked.startUp.findItem(schema::DEVICE_FAMILY, upper);
    if (const ReadLog::Value* const families = m_asked.startUp.find(schema::DEVICE_FAMILY)) {
        for (auto family = families->items.begin(); !found && family != families->items.end(); ++family) {
            found = m_asked.startUp.findItem(schema::devicesKey(family->whole.text), upper);
        }
    }
    return found;
}

std::string ExplanationBuilder::addFamilyStep(const std::string& name) {
    std::string family = m_asked.familyOf(name);
    const std::string base = withoutPackage(name);
    const PicConfig configuration(base.c_str(), 1, PM_PARTNAME_BINDING::BY_NAME);
    const char* const module = configuration.get_pm();
    const Match listing = sameWithoutCase(family, "spi") ? flashListing(name) : Match();
    if (listing) {
        const bool hides = module != nullptr && family != module;
        add("family",
            fmt::format("\"{}\" is listed as a flash: family {}{}", name, family,
                        hides ? fmt::format(", before what {}.acd says", module) : ""),
            listing);
    } else if (module == nullptr && sameWithoutCase(name, "spi")) {
        add("family", fmt::format("\"{}\" means all flashes: family spi", name));
    } else if (module == nullptr) {
        add("family", fmt::format("no file, section or flash is called \"{}\": family base", base));
    } else if (sameWithoutCase(base, family) || sameWithoutCase(base, family + ".acd")) {
        add("family", fmt::format("{} is a family itself: the file {}.acd", family, family));
    } else {
        add("family", fmt::format("{}: section [{}] of {}.acd", family, base, family));
    }
    return family;
}

void ExplanationBuilder::add(const char* topic, std::string text) {
    m_steps.push_back({topic, std::move(text)});
}

void ExplanationBuilder::add(const char* topic, std::string text, const Match& place) {
    m_steps.push_back({topic, std::move(text), place.sourceText(), place.value->shadows()});
}

} // namespace explanation
