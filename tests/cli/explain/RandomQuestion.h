#pragma once

#include "explain/Question.h"

#include "reference/RandomSource.h"
#include "reference/Words.h"

#include <string>

namespace reference {

[[nodiscard]] inline std::string randomName(RandomSource& pick) {
    switch (pick.below(10)) {
    case 0:
        return pick.from(words::FAMILIES);
    case 1:
    case 2:
        return pick.from(words::SPI_NAMES);
    case 3:
        return pick.from(words::NOISE);
    case 4:
        return pick.from(words::DEVICES) + "_" + pick.from(words::PACKAGES);
    default:
        return pick.from(words::DEVICES);
    }
}

template <typename Type>
[[nodiscard]] Type below(RandomSource& pick, int count) {
    return static_cast<Type>(pick.below(count));
}

/// A question in words that random databases are made of.
[[nodiscard]] inline explanation::Question randomQuestion(RandomSource& pick) {
    using Kind = explanation::Question::Kind;
    explanation::Question question;
    question.kind = below<Kind>(pick, 8);
    question.device = randomName(pick);
    // What has a cell comes more often.
    question.mode = below<TARVIKNS::MODE_TYPE>(pick, pick.chance(70) ? 6 : 9);
    question.output = below<TARVIKNS::OUTPUT_TYPE>(pick, pick.chance(80) ? 5 : 10);
    question.operation = below<TARVIKNS::OP_TYPE>(pick, pick.chance(80) ? 5 : 32);
    question.option = below<TARVIKNS::PROGRAM_OPTION>(pick, 24);
    const bool takesPackage = question.kind == Kind::DEVICE || question.kind == Kind::DEVICE_THROUGH ||
                              question.kind == Kind::OPTION;
    if (takesPackage && pick.chance(50)) {
        question.package = pick.from(words::PACKAGES);
    }
    question.property = pick.from(pick.chance(20)   ? words::OPERATION_PROPERTIES
                                  : pick.chance(40) ? words::SPI_PROPERTIES
                                                    : words::PROPERTIES);
    if (question.kind == Kind::PROPERTY && pick.chance(60)) {
        question.value = pick.from(pick.chance(70) ? words::VALUES : words::SPI_VALUES);
    }
    return question;
}

} // namespace reference
