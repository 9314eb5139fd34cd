// Formatting random databases changes no answer. TARVIK_PROPERTY_DATABASES says how many, TARVIK_PROPERTY_SEED which. All
// must read alike, from which it follows; every one, or every TARVIK_PROPERTY_ANSWERS_EVERY-th, is asked everything as well.
#include "cli/diff/DatabaseRewriter.h"
#include "cli/support/Answers.h"
#include "reference/DatabaseGenerator.h"
#include "support/Setting.h"

#include "diff/Comparison.h"
#include "edit/Format.h"

#include <gtest/gtest.h>

#include <optional>

namespace {

using reference::Files;

std::string familyOf(const std::string& file) { return file.substr(0, file.rfind('.')); }

/// The files in their canonical form, each of which reads alike and is the form of itself.
Files formatted(const Files& files) {
    Files all;
    for (const auto& [name, text] : files) {
        const edit::SourceFile file(text, name, familyOf(name));
        const std::string& form = all[name] = edit::joined(edit::formatted(file));
        EXPECT_TRUE(edit::readsAlike(file.lines(), AcdLines(form))) << text << "\nbecomes\n" << form;
        EXPECT_EQ(edit::joined(edit::formatted(edit::SourceFile(form, name, familyOf(name)))), form) << text;
    }
    return all;
}

/// Do both databases answer everything alike?
bool answersAlike(const Files& files, const Files& others) {
    std::optional<std::string> before = answersOf(files);
    std::optional<std::string> after = answersOf(others);
    return before && after
               ? diff::compare(diff::Snapshot(*std::move(before)), diff::Snapshot(*std::move(after)))
                     .isEmpty()
               : !before && !after;
}

} // namespace

TEST(FormatOfRandomDatabases, ChangesNoAnswer) {
    const std::uint64_t seed = setting("TARVIK_PROPERTY_SEED", 1);
    const std::uint64_t count = setting("TARVIK_PROPERTY_DATABASES", 40);
    const std::uint64_t every = setting("TARVIK_PROPERTY_ANSWERS_EVERY", 1);
    reference::RandomSource pick{rc::Random(seed)};
    for (std::uint64_t i = 0; i < count && !testing::Test::HasFailure(); ++i) {
        const reference::Health health =
            pick.chance(30) ? reference::Health::DAMAGED : reference::Health::SOUND;
        const Files files = reference::makeDatabases(pick, health);
        const Files forms = formatted(files);
        if (i % every == 0) {
            EXPECT_TRUE(answersAlike(files, forms)) << "database " << i << " of seed " << seed;
        }
        if (health == reference::Health::SOUND) {
            // Written in another way: continuations, odd blanks and line ends, layers.
            for (const Files& layer : rewritten(pick, files)) {
                static_cast<void>(formatted(layer));
            }
        }
    }
}
