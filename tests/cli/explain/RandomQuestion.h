#pragma once

#include "explain/Question.h"
#include "model/Multiboot.h"

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
    constexpr int KINDS = static_cast<int>(Kind::COMPLETE_IN_MODE) + 1;
    question.kind = below<Kind>(pick, pick.chance(70) ? 8 : KINDS);
    question.device = randomName(pick);
    // What has a cell comes more often.
    question.mode = below<TARVIKNS::MODE_TYPE>(pick, pick.chance(70) ? 6 : 9);
    question.output = below<TARVIKNS::OUTPUT_TYPE>(pick, pick.chance(80) ? 5 : 10);
    question.operation = below<TARVIKNS::OP_TYPE>(pick, pick.chance(80) ? 5 : 32);
    question.option = below<TARVIKNS::PROGRAM_OPTION>(pick, 24);
    const bool isPlainOperation =
        question.kind == Kind::OPERATION || question.kind == Kind::OPERATION_IN_MODE;
    if (question.takesPackage() && !isPlainOperation && pick.chance(50)) {
        question.package = pick.from(words::PACKAGES);
    }
    question.property = pick.from(pick.chance(20)   ? words::OPERATION_PROPERTIES
                                  : pick.chance(40) ? words::SPI_PROPERTIES
                                                    : words::PROPERTIES);
    if (question.kind == Kind::PROPERTY && pick.chance(60)) {
        question.value = pick.from(pick.chance(70) ? words::VALUES : words::SPI_VALUES);
    }
    if (question.kind == Kind::OPERATION_OPTIONS && pick.chance(40)) {
        question.value = pick.from(words::VALUES);
    }
    question.multibootType = pick.from(multiboot::TYPES);
    question.width = pick.from(multiboot::WIDTHS);
    question.isLead = pick.chance(50);
    return question;
}

} // namespace reference
