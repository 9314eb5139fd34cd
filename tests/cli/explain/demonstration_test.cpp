// Every explanation about the demonstration database: its verdict against the manager's, and the place it names.
#include "WhyFixtures.h"

#include "model/Vocabulary.h"
#include "support/Sanitizers.h"

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

namespace {

using explanation::Conclusion;
using explanation::Question;
using Kind = Question::Kind;

/// The bytes of a file that start at a place.
std::string textAt(const catalogue::Origin& origin) {
    std::ifstream file(origin.file);
    std::string line;
    for (unsigned number = 0; number < origin.line; ++number) {
        std::getline(file, line);
    }
    return line.size() < origin.column ? "" : line.substr(origin.column - 1);
}

class WhyDemonstration : public testing::Test {
protected:
    void expectAgreement(const Question& question) {
        // Each explanation starts a manager. The stride has no common divisor with the sizes of the loops.
        constexpr int STRIDE = isSanitized() ? 13 : 1;
        if (m_asked++ % STRIDE != 0) {
            return;
        }
        const explanation::Explanation explanation = explanation::explain(question);
        ASSERT_EQ(explanation.verdict, explanation::ask(m_manager, question))
            << asPlainText({question, explanation.verdict, explanation});
    }

    template <typename Use>
    void forEachMode(Question& question, Use use) {
        for (std::size_t mode = 0; mode < vocabulary::modes().size(); ++mode) {
            question.mode = static_cast<TARVIKNS::MODE_TYPE>(mode);
            use();
        }
    }

    template <typename Use>
    void forEachOutput(Question& question, Use use) {
        for (std::size_t output = 0; output < vocabulary::outputs().size(); ++output) {
            question.output = static_cast<TARVIKNS::OUTPUT_TYPE>(output);
            use();
        }
    }

    template <typename Use>
    void forEachOperation(Question& question, Use use) {
        for (std::size_t operation = 0; operation < vocabulary::operations().size(); ++operation) {
            question.operation = static_cast<TARVIKNS::OP_TYPE>(operation);
            use();
        }
    }

    Databases m_databases{demonstration()};
    // One manager for all questions: in a sound database none changes the answer to another.
    ConstraintsManager& m_manager = Databases::freshManager();
    int m_asked = 0;

    /// One device of each kind: with and without tables and options of its own, with a package, a family, a flash, a
    /// name that nobody knows.
    const std::vector<std::string> m_devices{"KS50",    "ks100",    "HR4",     "HR4_TQ144", "HR8", "OS2000E",
                                             "DN1",     "DN1_SO20", "kestrel", "OVD16",     "spi", "base",
                                             "nothing", "ML5_CB48", "PV16",    "KS50_PQ208"};
};

TEST_F(WhyDemonstration, Modes) {
    Question question;
    for (const std::string& device : m_devices) {
        question.device = device;
        for (const auto& package : {std::optional<std::string>(), std::optional<std::string>("TQ144"),
                                    std::optional<std::string>("CB48")}) {
            question.package = package;
            forEachMode(question, [&] {
                question.kind = Kind::DEVICE;
                expectAgreement(question);
                question.kind = Kind::DEVICE_THROUGH;
                if (!package) {
                    forEachOutput(question, [&] { expectAgreement(question); });
                    return;
                }
                // A package is compared with lists of the mode alone: a few outputs show that.
                for (const int output : {0, 2, 9}) {
                    question.output = static_cast<TARVIKNS::OUTPUT_TYPE>(output);
                    expectAgreement(question);
                }
            });
        }
    }
    question.kind = Kind::OUTPUT;
    question.package.reset();
    forEachMode(question, [&] { forEachOutput(question, [&] { expectAgreement(question); }); });
    EXPECT_EQ(m_asked, 16 * 9 * (11 + 2 * 4) + 90);
}

TEST_F(WhyDemonstration, Operations) {
    Question question;
    question.kind = Kind::OPERATION;
    for (const char* const device : {"KS50", "HR4", "HR4_TQ144", "OVD16", "nothing"}) {
        question.device = device;
        forEachMode(question, [&] {
            for (const int output : {0, 2, 6}) {
                question.output = static_cast<TARVIKNS::OUTPUT_TYPE>(output);
                forEachOperation(question, [&] { expectAgreement(question); });
            }
        });
    }
}

TEST_F(WhyDemonstration, OperationsInModes) {
    Question question;
    question.kind = Kind::OPERATION_IN_MODE;
    for (const std::string& device : m_devices) {
        question.device = device;
        for (const int operation : {0, 1, 3, 4, 9}) {
            question.operation = static_cast<TARVIKNS::OP_TYPE>(operation);
            forEachMode(question, [&] { expectAgreement(question); });
        }
    }
}

TEST_F(WhyDemonstration, BoundaryScanOperations) {
    Question question;
    question.kind = Kind::BSDL;
    for (const std::string& device : m_devices) {
        question.device = device;
        for (const int output : {0, 4, 5}) {
            question.output = static_cast<TARVIKNS::OUTPUT_TYPE>(output);
            forEachOperation(question, [&] { expectAgreement(question); });
        }
    }
}

TEST_F(WhyDemonstration, Options) {
    Question question;
    question.kind = Kind::OPTION;
    for (const char* const device : {"KS50", "DN1", "HR4", "kestrel", "OVD16", "nothing"}) {
        question.device = device;
        for (const auto& package : {std::optional<std::string>(), std::optional<std::string>("PQ208"),
                                    std::optional<std::string>("SO20")}) {
            question.package = package;
            for (const int mode : {0, 2, 5, 7}) {
                question.mode = static_cast<TARVIKNS::MODE_TYPE>(mode);
                for (int option = 0; option < 24; ++option) {
                    question.option = static_cast<TARVIKNS::PROGRAM_OPTION>(option);
                    question.output = TARVIKNS::OUTPUT_TYPE::USB2;
                    expectAgreement(question);
                }
            }
        }
    }
}

TEST_F(WhyDemonstration, Properties) {
    Question question;
    question.kind = Kind::PROPERTY;
    for (const std::string& device : m_devices) {
        question.device = device;
        for (const char* const key :
             {"VENDOR", "PACKAGES", "IRLENGTH", "PROGRAM", "DENSITY", "PAGE", "NOTHING"}) {
            question.property = key;
            for (const auto& value : {std::optional<std::string>(), std::optional<std::string>("Korvel"),
                                      std::optional<std::string>("TQ144"), std::optional<std::string>("6")}) {
                question.value = value;
                expectAgreement(question);
            }
        }
    }
}

TEST_F(WhyDemonstration, EveryPlaceHoldsItsFragment) {
    Question question;
    int places = 0;
    for (const std::string& device : m_devices) {
        question.device = device;
        for (const Kind kind :
             {Kind::DEVICE, Kind::OPERATION, Kind::OPTION, Kind::BSDL, Kind::OPERATION_IN_MODE}) {
            question.kind = kind;
            for (const explanation::Step& step : explanation::explain(question).steps) {
                if (step.place) {
                    // A record may go on in the next line.
                    const std::string written = textAt(step.place->origin);
                    const std::string start = step.place->text.substr(0, step.place->text.find(','));
                    EXPECT_EQ(written.substr(0, start.size()), start) << step.text;
                    ++places;
                }
            }
        }
    }
    EXPECT_GT(places, 100);
}

TEST_F(WhyDemonstration, LinesAreAtMost80BytesButForPaths) {
    Question question;
    question.kind = Kind::OPERATION;
    question.device = "KS50";
    question.output = TARVIKNS::OUTPUT_TYPE::STAPL;
    explanation::Explanation explanation = explanation::explain(question);
    for (explanation::Step& step : explanation::alternatives(question)) {
        if (step.place) {
            step.place->origin.file = "kestrel.acd";
        }
        explanation.steps.push_back(step);
    }
    std::istringstream lines(asPlainText({question, Conclusion::NO, explanation}));
    for (std::string line; std::getline(lines, line);) {
        if (line.find("/database/") == std::string::npos) {
            EXPECT_LE(line.size(), 80U) << line;
        }
    }
}

} // namespace
