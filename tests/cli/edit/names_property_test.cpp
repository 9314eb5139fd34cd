// Renames and removes the names of the demonstration and of random databases. TARVIK_PROPERTY_DATABASES says how many,
// TARVIK_PROPERTY_SEED which. Of the demonstration every TARVIK_PROPERTY_NAMES_EVERY-th name is taken.
#include "cli/support/Answers.h"
#include "reference/DatabaseGenerator.h"
#include "support/Setting.h"

#include "diff/Comparison.h"
#include "diff/Presentation.h"
#include "edit/Format.h"
#include "edit/Guard.h"
#include "edit/Names.h"
#include "edit/Remove.h"
#include "edit/Rename.h"
#include "edit/Sort.h"
#include "query/Demonstration.h"

#include <gtest/gtest.h>

#include <optional>

namespace {

using reference::Files;

std::string familyOf(const std::string& file) { return file.substr(0, file.rfind('.')); }

edit::Draft draftOf(const Files& files) {
    std::vector<edit::Draft::File> all;
    for (const auto& [name, text] : files) {
        all.push_back({name, familyOf(name), 0, text, name, text});
    }
    return edit::Draft(std::move(all));
}

Files filesOf(const edit::Draft& draft) {
    Files files;
    for (const edit::Draft::File& file : draft.files()) {
        if (!file.isRemoved) {
            files[file.path] = file.text;
        }
    }
    return files;
}

/// The answers that an edit changes without meaning to, in words.
std::string answersUnmeantBy(const std::string& answers, const edit::Draft& draft,
                             const edit::Intention& intention) {
    std::optional<std::string> after = answersOf(filesOf(draft));
    if (!after) {
        return "there are no answers";
    }
    diff::Snapshot before(answers);
    before.rename(intention.renamed);
    const diff::Comparison rest =
        edit::unmeant(diff::compare(before, diff::Snapshot(*std::move(after))), intention);
    return rest.isEmpty() ? std::string() : diff::asMarkdown(rest);
}

/// The same, and the new findings.
std::string unmeantBy(const Files& files, const std::string& answers, const edit::Draft& draft,
                      const edit::Intention& intention) {
    return newFindings(draftOf(files).model(), draft, intention) +
           answersUnmeantBy(answers, draft, intention);
}

/// The names that can be renamed and removed.
std::vector<edit::KnownName> namesOf(const Files& files) {
    const edit::Draft draft = draftOf(files);
    const lint::Model model = draft.model();
    std::set<std::string> spellings;
    for (const auto* const names : {&model.familyNames(), &model.deviceNames(), &model.flashNames()}) {
        spellings.insert(names->begin(), names->end());
    }
    std::vector<edit::KnownName> all;
    for (const std::string& name : spellings) {
        const std::optional<edit::KnownName> known = edit::findName(model, name);
        if (known && schema::fileOf(name) == schema::File::FAMILY && !schema::isFlashClass(name)) {
            all.push_back(*known);
        }
    }
    return all;
}

std::string newNameFor(const edit::KnownName& known) { return known.isFamily ? "zzz9" : "ZZZ9"; }

/// Renames a name.
/// @return what changes without being meant; otherwise the name is gone, and the other one has all that it was
std::string renameName(const Files& files, const std::string& answers, const edit::KnownName& known,
                       edit::Draft& draft) {
    const std::string to = newNameFor(known);
    renameIn(draft, known.name, to);
    std::string rest = unmeantBy(files, answers, draft, {.renamed = {{known.name, to}}});
    if (rest.empty()) {
        const lint::Model model = draft.model();
        const std::optional<edit::KnownName> renamed = edit::findName(model, to);
        EXPECT_TRUE(renamed && renamed->isDevice == known.isDevice && renamed->isFamily == known.isFamily &&
                    renamed->isFlash == known.isFlash && renamed->isFlashFamily == known.isFlashFamily)
            << known.name;
    }
    return rest;
}

/// Removes a name, likewise.
std::string removeName(const Files& files, const std::string& answers, const edit::KnownName& known,
                       edit::Draft& draft) {
    const std::set<std::string> names = namesRemovedWith(draft.model(), known);
    removeFrom(draft, names);
    std::string rest = unmeantBy(files, answers, draft, {.removed = names});
    if (rest.empty()) {
        const lint::Model model = draft.model();
        for (const std::string& name : names) {
            EXPECT_FALSE(edit::findName(model, name)) << name;
        }
    }
    return rest;
}

} // namespace

class NamesOfTheDemonstration : public testing::Test {
protected:
    /// Calls `use(files, answers, name)` with each name.
    template <typename Use>
    void forEachName(Use use) {
        const Files files = demonstrationFiles();
        const std::string answers = answersOf(files).value();
        const std::uint64_t every = setting("TARVIK_PROPERTY_NAMES_EVERY", 13);
        const std::vector<edit::KnownName> names = namesOf(files);
        EXPECT_GT(names.size(), 150U);
        for (std::size_t i = 0; i < names.size(); i += every) {
            use(files, answers, names[i]);
        }
    }
};

TEST_F(NamesOfTheDemonstration, AreRenamed) {
    forEachName([](const Files& files, const std::string& answers, const edit::KnownName& known) {
        edit::Draft draft = draftOf(files);
        EXPECT_EQ(renameName(files, answers, known, draft), "") << known.name;
        EXPECT_EQ(edit::placeOf(draft.model(), known.name), "") << known.name;
        renameIn(draft, newNameFor(known), known.name);
        EXPECT_EQ(filesOf(draft), files) << known.name;
    });
}

TEST_F(NamesOfTheDemonstration, AreRemoved) {
    forEachName([](const Files& files, const std::string& answers, const edit::KnownName& known) {
        edit::Draft draft = draftOf(files);
        EXPECT_EQ(removeName(files, answers, known, draft), "") << known.name;
        EXPECT_EQ(edit::placeOf(draft.model(), known.name), "") << known.name;
    });
}

/// Names of random databases, which are hostile: the same name in several cases, for several things, or within others. An
/// edit that cannot be proven there is refused; many can.
class NamesOfRandomDatabases : public testing::Test {
protected:
    /// Edits a name of each database by `edit(files, answers, name, draft)`.
    template <typename Edit>
    void forEachName(Edit edit) {
        const std::uint64_t seed = setting("TARVIK_PROPERTY_SEED", 1);
        reference::RandomSource pick{rc::Random(seed)};
        std::size_t proven = 0;
        std::size_t all = 0;
        for (std::uint64_t i = 0; i < setting("TARVIK_PROPERTY_DATABASES", 20) && !HasFailure(); ++i) {
            const Files files = reference::makeDatabases(pick, reference::Health::SOUND);
            const std::vector<edit::KnownName> names = namesOf(files);
            const std::optional<std::string> answers = answersOf(files);
            if (!names.empty() && answers) {
                SCOPED_TRACE("database " + std::to_string(i) + " of seed " + std::to_string(seed));
                edit::Draft draft = draftOf(files);
                proven += edit(files, *answers, pick.from(names), draft).empty() ? 1U : 0U;
                ++all;
            }
        }
        RecordProperty("proven", std::to_string(proven) + " of " + std::to_string(all));
        EXPECT_GE(proven * 4, all);
    }
};

TEST_F(NamesOfRandomDatabases, AreRenamed) { forEachName(renameName); }

TEST_F(NamesOfRandomDatabases, AreRemoved) { forEachName(removeName); }

TEST(SortingOfRandomDatabases, ChangesNoAnswer) {
    const std::uint64_t seed = setting("TARVIK_PROPERTY_SEED", 1);
    reference::RandomSource pick{rc::Random(seed)};
    for (std::uint64_t i = 0; i < setting("TARVIK_PROPERTY_DATABASES", 20) && !HasFailure(); ++i) {
        const Files files = reference::makeDatabases(pick, pick.chance(30) ? reference::Health::DAMAGED
                                                                           : reference::Health::SOUND);
        edit::Draft draft = draftOf(files);
        edit::KeysOfFamilies skipped = edit::keysWithFindings(draft.model());
        for (edit::Draft::File& file : draft.files()) {
            const edit::SourceFile source(file.text, file.path, file.family);
            file.text = joined(
                formatted(edit::SourceFile(sorted(source, skipped[file.family]), file.path, file.family)));
            const edit::SourceFile again(file.text, file.path, file.family);
            EXPECT_EQ(joined(formatted(
                          edit::SourceFile(sorted(again, skipped[file.family]), file.path, file.family))),
                      file.text);
        }
        const std::optional<std::string> answers = answersOf(files);
        if (answers) {
            EXPECT_EQ(answersUnmeantBy(*answers, draft, {}), "") << "database " << i << " of seed " << seed;
        } else {
            EXPECT_EQ(answersOf(filesOf(draft)), std::nullopt) << "database " << i << " of seed " << seed;
        }
    }
}
