// Starts and ends the chain, and notes how names become families.
#include "explain/Chain.h"

#include "text/Suggest.h"

#include <PicConfig.h>

#include <fmt/format.h>

namespace why {

Explanation explain(const StartUp& facts, const Question& question) {
    return Chain(facts, question).follow();
}

const Piece* Explanation::decidingRecord() const {
    const Piece* found = nullptr;
    for (const Step& step : steps) {
        if (step.topic == "record" && step.place) {
            found = &*step.place;
        }
    }
    return found;
}

Explanation Chain::follow() {
    if (!m_facts.complete) {
        add("fault", "there is no base database, so the manager knows nothing");
    }
    Verdict verdict = Verdict::FAULT;
    try {
        verdict = isYes() ? Verdict::YES : Verdict::NO;
    } catch (const UnknownOption& unknown) {
        add("fault",
            fmt::format("no database can name an option \"{}\": the manager raises when it reads the options "
                        "of \"{}\"",
                        unknown.word.text, unknown.owner),
            unknown.word);
    }
    return {verdict, std::move(m_steps)};
}

bool Chain::isYes() {
    switch (m_question.kind) {
    case Question::Kind::OUTPUT:
        return output();
    case Question::Kind::DEVICE:
        return device();
    case Question::Kind::DEVICE_THROUGH:
        return deviceThrough();
    case Question::Kind::OPERATION:
        return operation();
    case Question::Kind::OPERATION_IN_MODE:
        return operationInMode();
    case Question::Kind::OPTION:
        return option();
    case Question::Kind::BSDL:
        return bsdl();
    case Question::Kind::PROPERTY:
        return property();
    }
    return false;
}

std::string Chain::withoutPackageNoted(const std::string& device) {
    std::string base = withoutPackage(device);
    if (base != device) {
        add("name", fmt::format("\"{}\" is asked for as \"{}\", without its package", device, base));
    }
    return base;
}

std::string Chain::familyNoted(const std::string& device) {
    const Resolution& found = m_replay.resolve(device);
    const std::string base = withoutPackage(device);
    switch (found.by) {
    case Resolution::By::FLASH: {
        const PicConfig configuration(base.c_str(), 1, PM_PARTNAME_BINDING::BY_NAME);
        const char* const module = configuration.get_pm();
        const bool hides = module != nullptr && found.family != module;
        add("family",
            fmt::format("\"{}\" is listed as a flash: family {}{}", device, found.family,
                        hides ? fmt::format(", before what {}.acd says", module) : ""),
            *found.listed);
        break;
    }
    case Resolution::By::DATABASE:
        if (sameWithoutCase(base, found.family) || sameWithoutCase(base, found.family + ".acd")) {
            add("family", fmt::format("{} is a family itself: the file {}.acd", found.family, found.family));
        } else {
            add("family", fmt::format("{}: section [{}] of {}.acd", found.family, base, found.family));
        }
        break;
    case Resolution::By::SPI_NAME:
        add("family", fmt::format("\"{}\" stands for all flashes: family spi", device));
        break;
    case Resolution::By::NOBODY:
        add("family", fmt::format("no file, section or flash is called \"{}\": family base", base));
        break;
    }
    return found.family;
}

void Chain::add(const char* topic, std::string text) {
    m_steps.push_back({topic, std::move(text), std::nullopt});
}

void Chain::add(const char* topic, std::string text, const Piece& place) {
    m_steps.push_back({topic, std::move(text), place});
}

} // namespace why
