// Whatever happens to a database and to its indexes, and in whichever order: with and without the indexes, every device
// is found in the same family, with the same messages.
#include "VirtualTime.h"

#include "cli/support/DatabaseDirectory.h"
#include "support/Fixtures.h"
#include "support/Setting.h"

#include "commands/IndexWriter.h"
#include "database/Catalogue.h"
#include "database/DirectoryIndex.h"
#include "database/IndexMaintenance.h"
#include "term/ExitCode.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>
#include <random>
#include <utility>

#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;
using Names = std::vector<std::string>;

const Names DEVICES{"D0", "D1", "D2", "d3", "D4", "ZZ"};
const Names FILES{"a.acd", "a.acd", "b.acd", "B.acd", "c.ACD", "d.txt"};
/// Few sizes, so that different texts often have the same.
const Names TEXTS{"[D0]\n[D1]\n",  "[D1]\n[D0]\n", "[D2]\n[D3]\n",   "[D4]\n#[D]\n",
                  "[D4\n[D1]\n\n", "K=a\\\n[D0]",  "[D\\\n2]\n[D0]", "",
                  "[D0]\n",        "[D1]\n",       "[D3]\n",         "[D2]\n[D2]\n[D4]\nK = v\n"};

/// Lets tests ask as a process that uses indexes, or as one that does not.
void useIndexes(bool areUsed) { areUsed ? ::unsetenv("TARVIK_INDEX") : ::setenv("TARVIK_INDEX", "off", 1); }

/// What a process has listed when it looked for databases first.
struct Listing {
    acd::DeferredMessages messages;
    acd::Catalogue catalogue;

    explicit Listing(const Names& directories) : catalogue(directories, messages) {}

    /// Everything that a process can find out about devices.
    [[nodiscard]] std::string answers(bool areIndexesUsed) {
        useIndexes(areIndexesUsed);
        MessageRecorder recorder;
        std::string text;
        for (const std::string& device : DEVICES) {
            const acd::Family* const family = catalogue.familyOfDevice(device, messages);
            text += device + ' ' + (family == nullptr ? "-" : family->fileName) + '\n';
        }
        messages.issue();
        for (const IssuedMessage& message : recorder.take()) {
            text += message.text;
        }
        return text;
    }
};

/// Two processes that start at the same time; one of them uses indexes.
struct Processes {
    explicit Processes(const Names& directories) : withIndexes(directories), without(directories) {}

    Listing withIndexes;
    Listing without;
};

class History {
public:
    History(const fs::path& root, std::uint64_t seed) : m_root(root), m_random(seed) {
        virtualTime::reset();
        for (const char* const name : {"top", "bottom", "other"}) {
            fs::create_directory(m_root / name);
        }
        for (int count = 2 + below(5); count != 0; --count) {
            edit();
        }
    }

    void run() {
        for (int count = 4 + below(12); count != 0; --count) {
            step();
            if (chance(40)) {
                compare();
            }
        }
        compare();
    }

    /// How often an index spared reading a file.
    [[nodiscard]] int indexedFiles() const noexcept { return m_indexedFiles; }
    [[nodiscard]] const std::string& difference() const noexcept { return m_difference; }

private:
    [[nodiscard]] int below(int count) { return static_cast<int>(m_random() % static_cast<unsigned>(count)); }
    [[nodiscard]] bool chance(int percent) { return below(100) < percent; }
    [[nodiscard]] const std::string& anyOf(const Names& names) {
        return names[static_cast<std::size_t>(below(static_cast<int>(names.size())))];
    }

    [[nodiscard]] std::string directory() { return (m_root / (chance(60) ? "bottom" : "top")).string(); }
    [[nodiscard]] std::string file() { return directory() + '/' + anyOf(FILES); }

    [[nodiscard]] Names layers() const {
        Names layers{(m_root / "top").string(), (m_root / "bottom").string()};
        if (m_isSwapped) {
            std::swap(layers[0], layers[1]);
        }
        return layers;
    }

    void step() {
        if (chance(50)) {
            // Mostly less than a tick, and now and then long enough for indexes to prove something.
            virtualTime::advance(chance(70) ? below(6'000'000) : 1'000'000'000);
        }
        log(std::to_string(m_step++) + ' ');
        switch (below(14)) {
        case 0:
        case 1:
        case 2:
        case 3:
            return writeIndexes();
        case 4:
        case 5:
        case 6:
            return edit();
        case 7:
            return replaceFile();
        case 8:
            return removeFile();
        case 9:
            return swapFiles();
        case 10:
            return linkFile();
        case 11:
            return moveDirectories();
        case 12:
            return copyIndex();
        default:
            if (chance(40)) {
                log("set the clock back\n");
                virtualTime::advance(-1 - below(2'000'000'000));
            } else if (chance(30)) {
                log("start processes\n");
                m_started.push_back(std::make_unique<Processes>(layers()));
            } else {
                log("swap the layers\n");
                m_isSwapped = !m_isSwapped;
            }
        }
    }

    /// Writes a file in place, with its former time or size.
    void edit() {
        const std::string path = file();
        if (fs::is_directory(path)) {
            return;
        }
        const std::int64_t modified = virtualTime::modified(path);
        const std::string& text = anyOf(TEXTS);
        log("edit " + path + ": " + text + "\n");
        virtualTime::write(path, text, fs::is_symlink(path));
        if (const int kind = below(3); kind != 0) {
            virtualTime::setModified(path, kind == 1 ? modified : 0);
        }
    }

    void replaceFile() {
        const std::string path = file();
        const std::string next = path + ".new";
        if (fs::is_directory(path)) {
            return;
        }
        log("replace " + path + "\n");
        const std::int64_t modified = virtualTime::modified(path);
        virtualTime::write(next, anyOf(TEXTS));
        virtualTime::setModified(next, modified);
        (void)::rename(next.c_str(), path.c_str());
    }

    void removeFile() {
        const std::string path = file();
        log("remove " + path + "\n");
        if (::rmdir(path.c_str()) != 0) {
            (void)::unlink(path.c_str());
        }
        if (chance(15)) {
            (void)::mkdir(path.c_str(), 0755); // a file that can't be read
        }
    }

    void swapFiles() {
        const std::string left = file();
        const std::string right = file();
        log("swap " + left + " " + right + "\n");
        const std::string aside = left + ".aside";
        if (left != right && ::rename(left.c_str(), aside.c_str()) == 0) {
            (void)::rename(right.c_str(), left.c_str());
            (void)::rename(aside.c_str(), right.c_str());
            (void)fs::remove_all(aside);
        }
    }

    /// Makes a second name of a file, or a link to a file on another device, or changes what the link leads to.
    void linkFile() {
        const std::string path = file();
        const std::string target = (m_root / "other" / anyOf(FILES)).string();
        if (chance(60)) {
            log("write " + target + "\n");
            virtualTime::write(target, anyOf(TEXTS), true);
        }
        if (fs::is_directory(path)) {
            return;
        }
        log("link " + path + "\n");
        const std::string from = file();
        std::error_code none;
        if (chance(50)) {
            (void)::unlink(path.c_str());
            fs::create_symlink(target, path, none);
        } else if (from != path && fs::is_regular_file(fs::symlink_status(from))) {
            (void)::unlink(path.c_str());
            fs::create_hard_link(from, path, none);
            virtualTime::touch(path);
        }
    }

    /// Puts another directory in a layer's place: the other layer, or a copy of it.
    void moveDirectories() {
        const fs::path top = m_root / "top";
        const fs::path bottom = m_root / "bottom";
        const fs::path aside = m_root / "aside";
        if (chance(50)) {
            log("swap directories\n");
            fs::rename(top, aside);
            fs::rename(bottom, top);
            fs::rename(aside, bottom);
            return;
        }
        log("copy a directory\n");
        fs::create_directory(aside);
        for (const auto& entry : fs::directory_iterator(top)) {
            if (entry.is_regular_file() && !entry.is_symlink()) {
                const std::string copy = aside / entry.path().filename();
                fs::copy_file(entry.path(), copy);
                virtualTime::touch(copy);
                virtualTime::setModified(copy, virtualTime::modified(entry.path()));
            }
        }
        fs::remove_all(bottom);
        fs::rename(aside, bottom);
    }

    void copyIndex() {
        log("copy an index\n");
        std::error_code none;
        const bool isDown = chance(50);
        fs::copy_file(m_root / (isDown ? "top" : "bottom") / "index.acx",
                      m_root / (isDown ? "bottom" : "top") / "index.acx",
                      fs::copy_options::overwrite_existing, none);
    }

    /// Writes an index: undisturbed, or while something else happens, or it fails, or the process is killed.
    void writeIndexes() {
        const std::string where = directory();
        const int call = 1 + below(24);
        const int kind = below(100);
        if (kind < 50) {
            log("index " + where + "\n");
            tryWriteIndex(where);
        } else if (kind < 80) {
            log("index " + where + ", at call " + std::to_string(call) + ": ");
            virtualTime::interrupt(call, [this] {
                chance(50) ? edit() : step();
                virtualTime::advance(chance(50) ? virtualTime::TICK : 0);
                return 0;
            });
            tryWriteIndex(where);
            virtualTime::stopInterrupting();
        } else if (kind < 99) {
            log("index " + where + ", failing at call " + std::to_string(call) + "\n");
            const int error = chance(50) ? ENOSPC : EACCES;
            virtualTime::interrupt(call, [error] { return error; });
            tryWriteIndex(where);
            virtualTime::stopInterrupting();
        } else {
            log("index " + where + ", killed at call " + std::to_string(call) + "\n");
            const pid_t process = ::fork();
            if (process == 0) {
                virtualTime::interrupt(call, [] { return ::raise(SIGKILL); });
                tryWriteIndex(where);
                ::_exit(0);
            }
            int status = 0;
            ::waitpid(process, &status, 0);
        }
    }

    static void tryWriteIndex(const std::string& directory) {
        try {
            (void)writeIndex(directory);
        } catch (const CommandError&) {
            return; // The former index, or none, is there.
        }
    }

    void compare() {
        m_started.push_back(std::make_unique<Processes>(layers()));
        for (const auto& processes : m_started) {
            const std::string expected = processes->without.answers(false);
            const std::string actual = processes->withIndexes.answers(true);
            if (actual != expected && m_difference.empty()) {
                m_difference = m_log + "without indexes:\n" + expected + "with them:\n" + actual;
            }
        }
        m_started.clear();
        for (const std::string& layer : layers()) {
            count(layer);
        }
    }

    void count(const std::string& directory) {
        const std::optional<acd::DirectoryIndex> index = acd::DirectoryIndex::read(directory);
        if (index && acd::checkIndex(directory).state == acd::IndexState::CURRENT) {
            for (const acd::IndexedFile& file : index->contents().files) {
                m_indexedFiles += index->contents().isSettled(file) ? 1 : 0;
            }
        }
    }

    void log(const std::string& text) { m_log += text; }

    fs::path m_root;
    std::mt19937_64 m_random;
    bool m_isSwapped = false;
    int m_step = 0;
    int m_indexedFiles = 0;
    std::string m_log;
    std::string m_difference;
    std::vector<std::unique_ptr<Processes>> m_started;
};

/// TARVIK_PROPERTY_CALLS is about the number of questions, as in other tests; a history asks some fifty.
TEST(IndexHistories, NeverChangeAnAnswer) {
    const std::uint64_t first = setting("TARVIK_PROPERTY_SEED", 16'000'000);
    const std::uint64_t count = setting("TARVIK_PROPERTY_CALLS", 100'000) / 50;
    std::uint64_t indexedFiles = 0;
    for (std::uint64_t seed = first; seed != first + count; ++seed) {
        const DatabaseDirectory directory;
        History history(directory.path(), seed);
        history.run();
        indexedFiles += static_cast<std::uint64_t>(history.indexedFiles());
        ASSERT_EQ(history.difference(), "") << "TARVIK_PROPERTY_SEED=" << seed;
    }
    useIndexes(true);
    RecordProperty("IndexedFiles", static_cast<int>(indexedFiles));
    // Otherwise the histories would prove nothing.
    EXPECT_GT(indexedFiles, count / 2);
}

} // namespace
