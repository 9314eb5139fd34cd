#pragma once

#include "WhyFixtures.h"

#include <string>

// Questions about small databases, and where their steps lead.

[[nodiscard]] inline explanation::Question about(explanation::Question::Kind kind,
                                                 const std::string& device) {
    explanation::Question question;
    question.kind = kind;
    question.device = device;
    return question;
}

[[nodiscard]] inline explanation::Question programming(const std::string& device, TARVIKNS::MODE_TYPE mode,
                                                       TARVIKNS::OUTPUT_TYPE output) {
    explanation::Question question = about(explanation::Question::Kind::OPERATION, device);
    question.mode = mode;
    question.output = output;
    return question;
}

[[nodiscard]] inline Files family(const std::string& keys, const std::string& base = "") {
    return {{"base.acd", "DEVICE_SUPPORTED = fam\nPROGRAM_OPTION_PACKAGE = fam\n" + base},
            {"fam.acd", keys + "\n[D1]\n"}};
}

[[nodiscard]] inline std::string place(const explanation::Step& step) {
    return step.place ? catalogue::asText(step.place->origin) + ": " + step.place->text : "nowhere";
}
