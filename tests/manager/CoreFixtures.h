#pragma once

// A manager over databases of the test's own, and its members in forms that compare and print.

#include "support/Fixtures.h"
#include "support/TarvikTestPeer.h"

#include "PermissionTable.h"
#include "PropertyTable.h"

#include <AcdReader.h>
#include <AcdStore.h>
#include <PM_DEVKEY.h>
#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <unistd.h>

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <map>
#include <ostream>
#include <set>
#include <string>
#include <string_view>
#include <typeinfo>
#include <utility>
#include <vector>

/// Databases held in memory: file name to text.
using Files = std::map<std::string, std::string>;

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

/// A manager that started on the given databases, with all that it said. Its end puts everything back.
struct ManagerSession {
    explicit ManagerSession(const Files& files)
        : manager((AcdStore::setMemoryFiles(files), start())), peer(manager) {}
    explicit ManagerSession(const DatabaseDirectory& directory)
        : manager((AcdStore::setSearchPath({directory.path()}), start())), peer(manager) {}
    ~ManagerSession() { TarvikTestPeer::reset(); }
    ManagerSession(const ManagerSession&) = delete;
    ManagerSession& operator=(const ManagerSession&) = delete;

    MessageRecorder messages;
    ConstraintsManager& manager;
    TarvikTestPeer peer;

private:
    static ConstraintsManager& start() { return *ConstraintsManager::getConstraintsManager(); }
};

/// A manager that has a base database alone.
struct BaseSession : ManagerSession {
    explicit BaseSession(const std::string& base) : ManagerSession(Files{{"base.acd", base}}) {}
};

/// The accessor that a reader opened by `name` hands out; it outlives the reader.
[[nodiscard]] inline PM_DEVKEY* accessorOf(const char* name) { return AcdReader(name).getDevkey(); }

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
        EXPECT_EQ(typeid(exception), typeid(Exception));
        EXPECT_STREQ(exception.product(), "Tarvik");
        EXPECT_STREQ(exception.source(), "../s/ConstraintsManager");
        return exception.line();
    }
    return -1;
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

[[nodiscard]] inline std::map<std::string, std::string> entries(const ConstraintsManager::Texts& map) {
    std::map<std::string, std::string> result;
    for (const auto& [key, value] : map) {
        result.emplace(text(key), text(value));
    }
    return result;
}

/// Property table or multiboot types: key to the names it holds.
template <typename Lists>
[[nodiscard]] std::map<std::string, std::vector<std::string>> lists(const Lists& map) {
    std::map<std::string, std::vector<std::string>> result;
    for (const auto& [key, names] : map) {
        result.emplace(text(key), texts(names));
    }
    return result;
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

/// One allowed cell of a permission table.
struct Cell {
    std::size_t block;
    int row;
    int mode;
    int output;

    friend bool operator==(const Cell&, const Cell&) = default;
    friend std::ostream& operator<<(std::ostream& out, const Cell& cell) {
        return out << "block " << cell.block << " row " << cell.row << " mode " << cell.mode << " output "
                   << cell.output;
    }
};

/// All allowed cells, by block, row, mode and output.
[[nodiscard]] inline std::vector<Cell> allowedCells(const PermissionTable& table, int rows, int modes,
                                                    int outputs) {
    std::vector<Cell> cells;
    for (std::size_t block = 0; block < table.blocks(); ++block) {
        for (int row = 0; row < rows; ++row) {
            for (int mode = 0; mode < modes; ++mode) {
                for (int output = 0; output < outputs; ++output) {
                    if (table.allows(block, row, mode, output)) {
                        cells.push_back({block, row, mode, output});
                    }
                }
            }
        }
    }
    return cells;
}
[[nodiscard]] inline std::vector<Cell> operationCells(TarvikTestPeer& peer) {
    return allowedCells(*peer.operationTable(), 32, 6, 5);
}
[[nodiscard]] inline std::vector<Cell> bsdlOperationCells(TarvikTestPeer& peer) {
    return allowedCells(*peer.bsdlOperationTable(), 32, 1, 5);
}
[[nodiscard]] inline std::vector<Cell> programOptionCells(TarvikTestPeer& peer) {
    return allowedCells(*peer.programOptionTable(), 24, 6, 5);
}

/// The nine output sets, or device sets, in mode order.
[[nodiscard]] inline std::vector<const std::set<TARVIKNS::OUTPUT_TYPE>*> modeOutputs(TarvikTestPeer& peer) {
    return {&peer.bsCables(),     &peer.ssCables(),      &peer.smCables(),
            &peer.bsFileCables(), &peer.dp770Cables(),   &peer.spiCables(),
            &peer.kiteCfCables(), &peer.kiteMpmCables(), &peer.pffCables()};
}
[[nodiscard]] inline std::vector<const NameSet*> modeDevices(TarvikTestPeer& peer) {
    return {&peer.bsDevices(),     &peer.ssDevices(),      &peer.smDevices(),
            &peer.bsFileDevices(), &peer.dp770Devices(),   &peer.spiDevices(),
            &peer.kiteCfDevices(), &peer.kiteMpmDevices(), &peer.pffDevices()};
}
inline constexpr const char* MODE_KEYS[] = {"BS",  "SS",     "SM",      "BSFILE", "DP770",
                                            "SPI", "KITECF", "KITEMPM", "PFF"};
