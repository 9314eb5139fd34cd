// Every open, stat, read and listing goes wrong in turn, in every way in which it can, while a manager starts and
// is asked: the report names the file, and what stands in other files is answered as ever.
#include "SystemCalls.h"

#include "cli/support/DatabaseDirectory.h"
#include "support/Fixtures.h"
#include "support/TarvikTestPeer.h"

#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <new>
#include <set>

namespace {

using Kind = SystemCalls::Kind;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::Contains;
using testing::HasSubstr;
using testing::IsEmpty;

/// What came of one run.
struct Outcome {
    std::map<std::string, std::string> answers; ///< by the family that they are about
    std::vector<std::string> messages;          ///< of the database layer and of the start-up
    std::vector<SystemCalls::Call> calls;
};

/// Asks again where memory ran out, as an application may.
template <typename Question>
std::string answer(const Question& question) {
    for (;;) {
        try {
            return question();
        } catch (const TarvikException& raised) {
            return std::string("raised ") + raised.typeName();
        } catch (const std::bad_alloc&) {
            continue;
        }
    }
}

std::string ofDevice(ConstraintsManager& manager, const char* device) {
    const std::string mask = answer([&] {
        return std::to_string(manager.getDeviceOperations(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    });
    const std::string pins = answer([&] {
        const char* const text = manager.getDeviceStringProperty(device, "PINS");
        return std::string(text == nullptr ? "none" : text);
    });
    const std::string family = answer([&] { return std::string(manager.getPartFamily(device).c_str()); });
    return mask + ' ' + pins + ' ' + family;
}

class InputOutput : public testing::Test {
protected:
    ~InputOutput() override { TarvikTestPeer::reset(); }

    /// A manager that starts on the two directories, asked about all families.
    Outcome run(long number = 0, const SystemCalls::Trouble& trouble = {}) {
        TarvikTestPeer::reset();
        AcdStore::setSearchPath({m_top.path(), m_bottom.path()});
        MessageRecorder recorder;
        Outcome outcome;
        SystemCalls::watch(number, trouble);
        ConstraintsManager* manager = nullptr;
        const std::string start = answer([&] {
            manager = ConstraintsManager::getConstraintsManager();
            return "";
        });
        EXPECT_EQ(start, "");
        manager->setExceptions(false);
        outcome.answers["base"] = manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2) ? "yes" : "no";
        outcome.answers["finch"] = ofDevice(*manager, "FN10");
        outcome.answers["swift"] = ofDevice(*manager, "SW10");
        outcome.answers["spi"] = manager->getSpiDeviceStringProperty("FLA", "SIZE");
        outcome.calls = SystemCalls::stop();
        for (const IssuedMessage& message : recorder.take()) {
            outcome.messages.push_back(message.text);
        }
        return outcome;
    }

    /// The families whose answers depend on a file or directory.
    [[nodiscard]] std::set<std::string> lostWith(const std::string& path) const {
        for (const char* const family : {"finch", "swift", "spi"}) {
            if (path.ends_with(std::string("/") + family + ".acd")) {
                return {family};
            }
        }
        return path == m_top.path() ? std::set<std::string>{"finch"}
                                    : std::set<std::string>{"base", "finch", "swift", "spi"};
    }

    void expectNothingElseLost(const Outcome& disturbed, const std::string& path) const {
        const std::set<std::string> lost = lostWith(path);
        for (const auto& [family, answers] : m_undisturbed.answers) {
            if (!lost.contains(family)) {
                EXPECT_EQ(disturbed.answers.at(family), answers) << family;
            }
        }
    }

    /// Every call of these kinds fails in turn with an error that costs the file.
    void expectReported(int error, const std::set<Kind>& kinds) {
        int failed = 0;
        for (std::size_t number = 1; number <= m_undisturbed.calls.size(); ++number) {
            const SystemCalls::Call& call = m_undisturbed.calls[number - 1];
            if (!kinds.contains(call.kind)) {
                continue;
            }
            SCOPED_TRACE(call.path + ", call " + std::to_string(number));
            const Outcome disturbed =
                run(static_cast<long>(number), [error](const SystemCalls::Call&) { return error; });
            if (call.path.ends_with("/index.acx")) {
                // Without it the files are scanned; it can be made at any time.
                EXPECT_EQ(disturbed.answers, m_undisturbed.answers);
                EXPECT_EQ(disturbed.messages, m_undisturbed.messages);
            } else {
                EXPECT_THAT(disturbed.messages,
                            Contains(call.path + ": can't be read: " + std::strerror(error) + "\n").Times(1));
                expectNothingElseLost(disturbed, call.path);
            }
            ++failed;
        }
        EXPECT_GE(failed, 2);
    }

    /// Every call of these kinds is disturbed in turn in a way that must not show.
    void expectUnseen(const SystemCalls::Trouble& trouble, const std::set<Kind>& kinds) {
        for (std::size_t number = 1; number <= m_undisturbed.calls.size(); ++number) {
            if (kinds.contains(m_undisturbed.calls[number - 1].kind)) {
                SCOPED_TRACE(m_undisturbed.calls[number - 1].path + ", call " + std::to_string(number));
                const Outcome disturbed = run(static_cast<long>(number), trouble);
                EXPECT_EQ(disturbed.answers, m_undisturbed.answers);
                EXPECT_THAT(disturbed.messages, IsEmpty());
            }
        }
    }

    /// Every file changes in turn just before one of its reads.
    void expectOthersUnharmed(const SystemCalls::Trouble& change) {
        for (std::size_t number = 1; number <= m_undisturbed.calls.size(); ++number) {
            const SystemCalls::Call& call = m_undisturbed.calls[number - 1];
            if (call.kind == Kind::READ) {
                SCOPED_TRACE(call.path + ", call " + std::to_string(number));
                expectNothingElseLost(run(static_cast<long>(number), change), call.path);
                writeAll();
            }
        }
    }

    void writeAll() const {
        const auto write = [](const DatabaseDirectory& directory, const Files& files) {
            for (const auto& [name, text] : files) {
                std::ofstream(directory.path(name), std::ios::binary) << text;
            }
        };
        write(m_top, m_topFiles);
        write(m_bottom, m_bottomFiles);
    }

    using Files = DatabaseDirectory::Files;
    Files m_topFiles{{"finch.acd", "OPERATION = PROGRAM,Bscan,USB2\n[FN10]\nPROPERTY = PINS,44\n"}};
    Files m_bottomFiles{
        {"base.acd", "DEVICE_SUPPORTED = finch,swift,spi\nBS = outputs,USB2:families,finch,swift\n"},
        {"spi.acd", "DEVICE_FAMILY = NV\nNV_DEVICES = FLA\nFLA_PROPERTY = SIZE,16\n"},
        {"swift.acd", "OPERATION = VERIFY,Bscan,USB2\n[SW10]\nPROPERTY = PINS,100\n"}};
    DatabaseDirectory m_top{m_topFiles};
    DatabaseDirectory m_bottom{m_bottomFiles};
    Outcome m_undisturbed = run();
};

TEST_F(InputOutput, UndisturbedGivesAllAnswersAndMakesEachKindOfCall) {
    EXPECT_EQ(m_undisturbed.answers,
              (std::map<std::string, std::string>{
                  {"base", "yes"}, {"finch", "1 44 finch"}, {"spi", "16"}, {"swift", "8 100 swift"}}));
    EXPECT_THAT(m_undisturbed.messages, IsEmpty());
    std::set<Kind> kinds;
    for (const SystemCalls::Call& call : m_undisturbed.calls) {
        kinds.insert(call.kind);
    }
    EXPECT_EQ(kinds.size(), 5U);
}

TEST_F(InputOutput, AFaultOfTheDiskIsReported) {
    expectReported(EIO, {Kind::OPEN, Kind::STAT, Kind::READ, Kind::LIST, Kind::ENTRY});
}

TEST_F(InputOutput, AMissingPermissionIsReported) { expectReported(EACCES, {Kind::OPEN, Kind::LIST}); }

TEST_F(InputOutput, TooManyOpenFilesAreReported) { expectReported(EMFILE, {Kind::OPEN, Kind::LIST}); }

TEST_F(InputOutput, AFileOrDirectoryThatVanishedIsReported) {
    expectReported(ENOENT, {Kind::OPEN, Kind::LIST});
}

TEST_F(InputOutput, InterruptedReadsGoOn) {
    expectUnseen([](const SystemCalls::Call&) { return EINTR; }, {Kind::READ});
}

TEST_F(InputOutput, ShortReadsGoOn) {
    expectUnseen(
        [](const SystemCalls::Call&) {
            SystemCalls::limitRead(1);
            return 0;
        },
        {Kind::READ});
}

TEST_F(InputOutput, WantOfMemoryLeavesNothingUndone) {
    expectUnseen([](const SystemCalls::Call&) { return ENOMEM; },
                 {Kind::OPEN, Kind::STAT, Kind::READ, Kind::LIST, Kind::ENTRY});
}

TEST_F(InputOutput, AFileThatShrinksBetweenStatAndReadHarmsNoOther) {
    expectOthersUnharmed([](const SystemCalls::Call& call) {
        std::filesystem::resize_file(call.path, 5);
        return 0;
    });
}

TEST_F(InputOutput, AFileThatGrowsBetweenStatAndReadHarmsNoOther) {
    expectOthersUnharmed([](const SystemCalls::Call& call) {
        std::ofstream(call.path, std::ios::app) << std::string(10'000, '#') << "\nMORE = 1\n";
        return 0;
    });
}

TEST_F(InputOutput, ADirectoryThatVanishesIsReportedFileByFile) {
    const std::filesystem::path top = m_top.path();
    const std::filesystem::path elsewhere = m_top.path() + ".gone";
    for (std::size_t number = 1; number <= m_undisturbed.calls.size(); ++number) {
        SCOPED_TRACE(number);
        const Outcome disturbed = run(static_cast<long>(number), [&](const SystemCalls::Call&) {
            std::filesystem::rename(top, elsewhere);
            return 0;
        });
        std::filesystem::rename(elsewhere, top);
        expectNothingElseLost(disturbed, top.string());
        if (disturbed.answers.at("finch") != m_undisturbed.answers.at("finch")) {
            EXPECT_THAT(disturbed.messages, Contains(HasSubstr(top.string())).Times(1));
        }
    }
}

} // namespace
