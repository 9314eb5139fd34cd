#pragma once

// A manager over databases of the test's own. What a test does with the manager's members is in Members.h.

#include "support/Fixtures.h"
#include "support/TarvikTestPeer.h"

#include <AcdStore.h>
#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <string>
#include <string_view>
#include <typeinfo>
#include <utility>
#include <vector>

/// Databases held in memory: file name to text.
using Files = std::map<std::string, std::string>;

/// The text of a base database that is the only database.
struct Base {
    explicit Base(std::string base) : text(std::move(base)) {}
    std::string text;
};

/// A directory with databases.
struct SearchPath {
    explicit SearchPath(std::string path) : directory(std::move(path)) {}
    std::string directory;
};

/// A directory of the test's own, for what memory files can't show.
class DatabaseDirectory {
public:
    DatabaseDirectory() : m_path(testing::TempDir() + "tarvik_core_" + std::to_string(getpid())) {
        std::filesystem::create_directories(m_path);
    }
    ~DatabaseDirectory() { std::filesystem::remove_all(m_path); }
    DatabaseDirectory(const DatabaseDirectory&) = delete;
    DatabaseDirectory& operator=(const DatabaseDirectory&) = delete;

    void writeFile(const std::string& name, const std::string& text) const {
        std::ofstream(m_path / name, std::ios::binary) << text;
    }
    void makeDirectory(const std::string& name) const { std::filesystem::create_directory(m_path / name); }
    [[nodiscard]] std::string path() const { return m_path.string(); }

private:
    std::filesystem::path m_path;
};

/// The manager of the process over the given databases, with all its messages from the start-up on. Its end puts
/// everything back.
class ManagerFixture {
public:
    explicit ManagerFixture(Files files) {
        AcdStore::setMemoryFiles(std::move(files));
        start();
    }
    explicit ManagerFixture(Base base) : ManagerFixture(Files{{"base.acd", std::move(base.text)}}) {}
    explicit ManagerFixture(SearchPath path) {
        AcdStore::setSearchPath({std::move(path.directory)});
        start();
    }
    explicit ManagerFixture(const DatabaseDirectory& directory)
        : ManagerFixture(SearchPath(directory.path())) {}
    ~ManagerFixture() { TarvikTestPeer::reset(); }
    ManagerFixture(const ManagerFixture&) = delete;
    ManagerFixture& operator=(const ManagerFixture&) = delete;

    ConstraintsManager* operator->() const { return m_manager; }
    ConstraintsManager& operator*() const { return *m_manager; }
    [[nodiscard]] TarvikTestPeer::Members& members() const { return TarvikTestPeer::members(*m_manager); }

    /// What was issued since the last call.
    [[nodiscard]] std::vector<IssuedMessage> messages() { return m_messages.take(); }

private:
    void start() { m_manager = ConstraintsManager::getConstraintsManager(); }

    MessageRecorder m_messages;
    ConstraintsManager* m_manager = nullptr;
};

/// Messages whose location has no fixed number compare without it.
[[nodiscard]] inline std::vector<IssuedMessage> withoutLines(std::vector<IssuedMessage> messages) {
    for (IssuedMessage& message : messages) {
        message.line = 0;
    }
    return messages;
}
[[nodiscard]] inline IssuedMessage info(std::string text) { return info(0, std::move(text)); }
[[nodiscard]] inline IssuedMessage status(std::string text) { return status(0, std::move(text)); }

/// The location of the `Exception` that a call raises; -1 when it raises nothing. Anything else passes.
template <typename Exception, typename Call>
[[nodiscard]] int raisedLine(const Call& call) {
    try {
        call();
    } catch (const Exception& exception) {
        EXPECT_TRUE(typeid(exception) == typeid(Exception)) << exception.what();
        EXPECT_STREQ(exception.product(), "Tarvik");
        EXPECT_STREQ(exception.source(), "../s/ConstraintsManager");
        EXPECT_STREQ(exception.revision(), "1.0");
        return exception.line();
    }
    return -1;
}

/// Expects that `call` raises exactly an `Exception`, from the location `line`.
template <typename Exception, typename Call>
void expectRaises(int line, const Call& call) {
    EXPECT_EQ(raisedLine<Exception>(call), line);
}

[[nodiscard]] inline std::string text(std::string_view value) { return std::string(value); }

[[nodiscard]] inline std::string text(const StringBase& value) {
    return std::string(value.c_str(), value.GetLength());
}

/// The names of any container of texts, in its order.
template <typename Names>
[[nodiscard]] std::vector<std::string> texts(const Names& names) {
    std::vector<std::string> result;
    for (const StringBase& name : names) {
        result.push_back(text(name));
    }
    return result;
}

/// Does a container of texts hold a text?
template <typename Names>
[[nodiscard]] bool holds(const Names& names, const char* wanted) {
    for (const StringBase& name : names) {
        if (text(name) == wanted) {
            return true;
        }
    }
    return false;
}

[[nodiscard]] inline std::map<std::string, std::string> entries(const ConstraintsManager::Texts& map) {
    std::map<std::string, std::string> result;
    for (const auto& [key, value] : map) {
        result.emplace(text(key), text(value));
    }
    return result;
}

/// The values at and around every bound that a check or a query has.
inline constexpr int BOUNDARY_VALUES[] = {-2147483647 - 1, -1, 0, 4, 5, 6, 7, 8, 9, 10, 31, 32, 2147483647};

/// The mask in which exactly these bits are set.
template <typename... Bits>
[[nodiscard]] constexpr int maskOf(Bits... bits) {
    return static_cast<int>((0U | ... | (1U << static_cast<unsigned>(bits))));
}

/// A list of `count` items NAME0, NAME1, ...
[[nodiscard]] inline std::string numberedList(const std::string& name, int count,
                                              const char* separator = ",") {
    std::string list;
    for (int number = 0; number < count; ++number) {
        list += (number == 0 ? "" : separator) + name + std::to_string(number);
    }
    return list;
}

/// `count` times the same item.
[[nodiscard]] inline std::string repeatedItem(const std::string& item, int count) {
    std::string list;
    for (int number = 0; number < count; ++number) {
        list += (number == 0 ? "" : ":") + item;
    }
    return list;
}
