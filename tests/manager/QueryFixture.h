#pragma once

#include <support/Fixtures.h>
#include <support/TarvikTestPeer.h>

#include <PropertyTable.h>

#include <TarvikException.h>

#include <gtest/gtest.h>

#include <map>
#include <string>
#include <typeinfo>
#include <utility>
#include <vector>

/// Databases: file name to text.
using Files = std::map<std::string, std::string>;

/// The process's manager over these databases, its messages taken. What was issued
/// during the start-up is dropped.
class ManagerOver {
public:
    explicit ManagerOver(Files files) {
        AcdStore::setMemoryFiles(std::move(files));
        start();
    }
    explicit ManagerOver(std::vector<std::string> searchPath) {
        AcdStore::setSearchPath(std::move(searchPath));
        start();
    }
    ~ManagerOver() { TarvikTestPeer::reset(); }
    ManagerOver(const ManagerOver&) = delete;
    ManagerOver& operator=(const ManagerOver&) = delete;

    ConstraintsManager* operator->() const { return m_manager; }
    ConstraintsManager& operator*() const { return *m_manager; }
    [[nodiscard]] TarvikTestPeer peer() const { return TarvikTestPeer(*m_manager); }

    /// What was issued since the last call.
    [[nodiscard]] std::vector<IssuedMessage> messages() { return m_messages.take(); }

private:
    void start() {
        m_manager = ConstraintsManager::getConstraintsManager();
        static_cast<void>(m_messages.take());
    }

    MessageRecorder m_messages;
    ConstraintsManager* m_manager = nullptr;
};

/// Expects that `call` raises exactly a `Raised`, from the site `line`.
template <typename Raised, typename Call>
void expectRaises(int line, Call call) {
    try {
        static_cast<void>(call());
        ADD_FAILURE() << "nothing was raised";
    } catch (const TarvikException& raised) {
        EXPECT_TRUE(typeid(raised) == typeid(Raised)) << raised.what();
        EXPECT_EQ(raised.line(), line);
        EXPECT_STREQ(raised.product(), "Tarvik");
        EXPECT_STREQ(raised.source(), "../s/ConstraintsManager");
        EXPECT_STREQ(raised.revision(), "1.0");
    }
}

/// The values at and around every bound that a check or a query has.
inline constexpr int BOUNDARY_VALUES[] = {-2147483647 - 1, -1, 0, 4, 5, 6, 7, 8, 9, 10, 31, 32, 2147483647};

/// The mask in which exactly these bits are set.
template <typename... Bits>
[[nodiscard]] constexpr int maskOf(Bits... bits) {
    return static_cast<int>((0U | ... | (1U << static_cast<unsigned>(bits))));
}

/// Does a container of texts hold a text?
template <typename Container>
[[nodiscard]] bool holds(const Container& container, const char* text) {
    for (const auto& held : container) {
        if (held == StringBase(text)) {
            return true;
        }
    }
    return false;
}

/// The texts of a set or a list, in its order.
template <typename Container>
[[nodiscard]] std::vector<std::string> textsOf(const Container& container) {
    std::vector<std::string> texts;
    for (const StringBase& text : container) {
        texts.emplace_back(text.c_str(), text.GetLength());
    }
    return texts;
}
