// What an explanation names is what decides: without the record that it names the answer changes, and with what it says
// is missing the answer becomes yes.
#include "RandomQuestion.h"
#include "WhyFixtures.h"

#include "explain/ExplanationBuilder.h"
#include "model/Vocabulary.h"
#include "reference/DatabaseGenerator.h"
#include "reference/ReferenceReader.h"
#include "support/Sanitizers.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <regex>

namespace {

using namespace reference;
using explanation::Conclusion;
using explanation::Explanation;
using explanation::Question;
using Kind = Question::Kind;

/// Each question starts several managers, which takes long under the sanitizers.
constexpr int DATABASES = isSanitized() ? 30 : 150;

/// Where a text was removed.
struct Removal {
    std::string file;
    std::size_t offset;
    std::string text;
};

/// A database that can be edited: every key of its files is written in one line, so that a place is an offset.
class EditableDatabase {
public:
    explicit EditableDatabase(const Files& files) {
        for (const auto& [name, text] : files) {
            const ParsedFile parsed = parse(text);
            std::string& written = m_files[name];
            written = lines(parsed.own);
            for (const Section& section : parsed.sections) {
                written += '[' + section.name + "]\n" + lines(section.keys);
            }
        }
    }

    [[nodiscard]] Explanation explain(const Question& question) const {
        const ::Databases databases(m_files);
        return explanation::explain(question);
    }

    [[nodiscard]] Conclusion ask(const Question& question) const {
        const ::Databases databases(m_files);
        return explanation::ask(::Databases::freshManager(), question);
    }

    /// Removes a record, or a word of one, with the separator that belongs to it.
    Removal remove(const explanation::SourceText& place) {
        const std::string& file = m_files.at(place.origin.file);
        std::size_t start = offsetOf(place.origin);
        std::size_t end = start + place.text.size();
        if (file[start - 1] == ',' || file[start - 1] == ':') {
            --start;
        } else if (file[end] == ',' || file[end] == ':') {
            ++end;
        }
        Removal removal{place.origin.file, start, file.substr(start, end - start)};
        remove(removal);
        return removal;
    }

    void remove(const Removal& removal) {
        m_files.at(removal.file).erase(removal.offset, removal.text.size());
    }

    void insertAfter(const explanation::SourceText& place, const std::string& text) {
        m_files.at(place.origin.file).insert(offsetOf(place.origin) + place.text.size(), text);
    }

    /// Appends to a key among the family's own keys, which is made if it is not there.
    /// @param separator between what is there and the text
    void append(const std::string& name, const std::string& key, char separator, const std::string& text) {
        std::string& file = m_files[name];
        const std::string own = '\n' + file.substr(0, file.find("\n["));
        const std::size_t line = own.find('\n' + key + " = ");
        if (line == std::string::npos) {
            file.insert(0, key + " = " + text + '\n');
        } else {
            const std::size_t value = line + key.size() + 3;
            const std::size_t end = file.find('\n', value);
            file.insert(end, (end == value ? "" : std::string(1, separator)) + text);
        }
    }

    void replace(const explanation::SourceText& place, const std::string& text) {
        m_files.at(place.origin.file).replace(offsetOf(place.origin), place.text.size(), text);
    }

    void addSection(const std::string& file, const std::string& name, const std::string& line) {
        m_files[file] += '[' + name + "]\n" + line + '\n';
    }

    [[nodiscard]] std::string lineOf(const catalogue::Origin& origin) const {
        const std::string& file = m_files.at(origin.file);
        const std::size_t start = file.rfind('\n', offsetOf(origin) - 1) + 1;
        return file.substr(start, file.find('\n', start) - start);
    }

    [[nodiscard]] std::string familyOf(const std::string& name) const {
        const ::Databases databases(m_files);
        return toStdString(::Databases::freshManager().getPartFamily(name.c_str()));
    }

    [[nodiscard]] const Files& files() const { return m_files; }

private:
    static std::string lines(const Keys& keys) {
        std::string text;
        for (const auto& [key, value] : keys) {
            text += key + " = " + value + '\n';
        }
        return text;
    }

    [[nodiscard]] std::size_t offsetOf(const catalogue::Origin& origin) const {
        const std::string& file = m_files.at(origin.file);
        std::size_t offset = 0;
        for (unsigned line = 1; line < origin.line; ++line) {
            offset = file.find('\n', offset) + 1;
        }
        return offset + origin.column - 1;
    }

    Files m_files;
};

std::string described(const Question& question, const Explanation& explanation,
                      const EditableDatabase& database) {
    std::string text = asPlainText({question, explanation.verdict, explanation});
    for (const auto& [name, content] : database.files()) {
        text += "---- " + name + "\n" + content + "\n";
    }
    return text;
}

/// Removes the records that explanations name, one after the other, until the answer is no. Then each of them alone must
/// have been enough for the yes.
/// @return how many there were; none when no record decides
std::size_t removeUntilNo(const EditableDatabase& original, const Question& question) {
    EditableDatabase database = original;
    std::vector<Removal> removals;
    for (;;) {
        const Explanation explanation = database.explain(question);
        if (explanation.verdict != Conclusion::YES) {
            EXPECT_EQ(explanation.verdict, Conclusion::NO);
            break;
        }
        const explanation::SourceText* const record = explanation.decidingRecord();
        if (record == nullptr) {
            EXPECT_EQ(explanation.steps.back().topic, "rule");
            return 0;
        }
        Removal removal = database.remove(*record);
        // The place in the original file.
        for (auto former = removals.rbegin(); former != removals.rend(); ++former) {
            if (former->file == removal.file && former->offset <= removal.offset) {
                removal.offset += former->text.size();
            }
        }
        removals.push_back(std::move(removal));
        if (removals.size() > 20) {
            ADD_FAILURE() << described(question, explanation, original);
            return 0;
        }
    }
    // The empty record that a removal may leave is no option.
    for (std::size_t kept = 0; question.kind != Kind::OPTION && kept != removals.size(); ++kept) {
        std::vector<Removal> others = removals;
        others.erase(others.begin() + static_cast<std::ptrdiff_t>(kept));
        std::sort(others.begin(), others.end(),
                  [](const Removal& left, const Removal& right) { return left.offset > right.offset; });
        EditableDatabase one = original;
        for (const Removal& other : others) {
            one.remove(other);
        }
        EXPECT_EQ(one.ask(question), Conclusion::YES) << described(question, one.explain(question), one);
    }
    return removals.size();
}

TEST(WhyProof, WithoutTheNamedRecordTheAnswerChanges) {
    int proven = 0;
    int replaced = 0;
    for (int number = 0; number < DATABASES; ++number) {
        RandomSource pick(rc::Random(static_cast<std::uint64_t>(9000 + number)));
        const EditableDatabase original(makeDatabases(pick, Health::SOUND));
        for (int asked = 0; asked < 10; ++asked) {
            const Question question = randomQuestion(pick);
            const std::size_t records =
                original.ask(question) == Conclusion::YES ? removeUntilNo(original, question) : 0;
            proven += records > 0 ? 1 : 0;
            replaced += records > 1 ? 1 : 0;
            if (HasFailure()) {
                return;
            }
        }
    }
    EXPECT_GT(proven, DATABASES * 2 / 3);
    EXPECT_GT(replaced, DATABASES / 20);
}

/// Adds what an explanation says is missing, or removes what is in the way.
/// @return whether a database can give it at all
bool addWhatIsMissing(EditableDatabase& database, const Question& question, const Explanation& explanation) {
    const explanation::Step absent = stepAbout(explanation.steps, "absent");
    if (absent.text.empty()) {
        const explanation::Step& last = explanation.steps.back();
        const bool isExcluded = last.text.starts_with("NOT_SUPPORTED_PART_IN_MODE excludes");
        if (isExcluded) {
            database.remove(*last.place);
        }
        return isExcluded;
    }
    const std::string mode = vocabulary::key(question.mode);
    const std::string output = vocabulary::key(question.output);
    const std::string operation = vocabulary::key(question.operation);
    std::smatch match;
    const auto says = [&](const char* pattern) {
        return std::regex_match(absent.text, match, std::regex(pattern));
    };
    if (question.kind == Kind::MULTIBOOT) {
        if (absent.place) {
            database.insertAfter(*absent.place, "," + question.device);
        } else if (says("spi.acd has no list (.*)")) {
            database.append("spi.acd", match.str(1), ',', question.device);
        } else {
            return false;
        }
    } else if (says("mode .* can use .*")) {
        if (ConstraintsManager::cableString2Type(output.c_str()) != question.output) {
            return false;
        }
        if (absent.place) {
            database.insertAfter(*absent.place, "," + output);
        } else {
            database.append("base.acd", mode, ':', "outputs," + output);
        }
    } else if (says("mode .* takes the families .*, not (.*?)(: base.acd lists none under .*)?")) {
        if (absent.place) {
            database.insertAfter(*absent.place, "," + match.str(1));
        } else {
            database.append("base.acd", mode, ':', "families," + match.str(1));
        }
    } else if (says("(.*) lists .*the whole name \"(.*)\", which has no table")) {
        database.append("base.acd", match.str(1), ',', match.str(2));
    } else if (says("(.*) does not list \"(.*)\", so it has no table")) {
        database.append("base.acd", match.str(1), ',', match.str(2));
    } else if (says("(no record of (.*) names|the one record for|none of the) .*")) {
        const bool isOption = question.kind == Kind::OPTION;
        if (isOption && question.option > TARVIKNS::PROGRAM_OPTION::SECTOR_LOCKDOWN) {
            return false;
        }
        std::string record =
            isOption ? vocabulary::options().at(static_cast<std::size_t>(question.option)) : operation;
        record += question.kind == Kind::BSDL ? "," + output : "," + mode + "," + output;
        if (absent.place) {
            database.insertAfter(*absent.place, ":" + record);
        } else {
            const char* const key = isOption                      ? "PROGRAM_OPTION"
                                    : question.kind == Kind::BSDL ? "BSDL_OPERATION"
                                                                  : "OPERATION";
            if (says(".*: there is no section \\[(.*)\\]")) {
                database.addSection("Mir.acd", match.str(1), std::string(key) + " = " + record);
            } else if (says(".*: (.*\\.acd) has no (.*)")) {
                database.append(match.str(1), match.str(2), ':', record);
            }
        }
    } else if (question.kind == Kind::PROPERTY && question.value == "" &&
               says("(neither the flash|.* of the (flash|class .*) is) .*")) {
        // An empty property of a flash is none.
        return false;
    } else if (says("neither the flash nor its class has a property .*")) {
        database.append("spi.acd", upper(question.device) + "_PROPERTY", ':',
                        upper(question.property) + "," + question.value.value_or("x"));
    } else {
        // A property: the text that it lacks, as a record that comes after all others.
        std::string key = operation;
        std::string value = mode;
        if (question.kind == Kind::PROPERTY) {
            key = question.property;
            value = question.value.value_or("x");
        } else if (says("neither .* has a property (OP_\\w+) or .*") || says("(OP_\\w+) of the .*")) {
            key = match.str(1);
            value = question.value.value_or("x");
        }
        const bool isWhole = question.kind == Kind::PROPERTY || question.kind == Kind::OPERATION_OPTIONS;
        const std::string name = isWhole ? question.device : explanation::withoutPackage(question.device);
        if (absent.place) {
            const bool isSingle = !database.lineOf(absent.place->origin).starts_with("PROPERTIES ");
            database.insertAfter(*absent.place, ":" + key + (isSingle ? "," : ",1,") + value);
        } else {
            database.append(database.familyOf(name) + ".acd", "PROPERTY", ':', key + "," + value);
        }
    }
    return true;
}

TEST(WhyProof, WithWhatIsMissingTheAnswerIsYes) {
    int proven = 0;
    for (int number = 0; number < DATABASES; ++number) {
        RandomSource pick(rc::Random(static_cast<std::uint64_t>(12000 + number)));
        const EditableDatabase original(makeDatabases(pick, Health::SOUND));
        for (int asked = 0; asked < 10; ++asked) {
            const Question question = randomQuestion(pick);
            EditableDatabase database = original;
            Explanation explanation = database.explain(question);
            const bool wasNo = explanation.verdict == Conclusion::NO;
            int edits = 0;
            while (explanation.verdict == Conclusion::NO && edits < 8 &&
                   addWhatIsMissing(database, question, explanation)) {
                explanation = database.explain(question);
                ++edits;
            }
            ASSERT_LT(edits, 8) << described(question, explanation, database);
            proven += wasNo && explanation.verdict == Conclusion::YES ? 1 : 0;
        }
    }
    EXPECT_GT(proven, 2 * DATABASES);
}

/// The word that a fault names is its cause: with each such word mended there is an answer.
TEST(WhyProof, WithoutTheNamedWordThereIsNoFault) {
    int mended = 0;
    for (int number = 0; number < 2 * DATABASES; ++number) {
        RandomSource pick(rc::Random(static_cast<std::uint64_t>(15000 + number)));
        EditableDatabase database(makeDatabases(pick, Health::DAMAGED));
        Question question = randomQuestion(pick);
        question.kind = pick.chance(50) ? Kind::OPTION : Kind::OPERATION_IN_MODE;
        Explanation explanation = database.explain(question);
        const bool wasFault = explanation.verdict == Conclusion::FAULT;
        int edits = 0;
        for (; explanation.verdict == Conclusion::FAULT && edits < 50; ++edits) {
            const explanation::Step& fault = explanation.steps.back();
            ASSERT_EQ(fault.topic, "fault");
            ASSERT_TRUE(fault.place);
            database.replace(*fault.place, "VERIFY");
            explanation = database.explain(question);
        }
        ASSERT_LT(edits, 50) << described(question, explanation, database);
        mended += wasFault ? 1 : 0;
    }
    EXPECT_GT(mended, DATABASES / 10);
}

} // namespace
