#pragma once

#include "explain/Explanation.h"
#include "support/Fixtures.h"
#include "support/TarvikTestPeer.h"

#include <AcdStore.h>
#include <tarvik/ConstraintsManager.h>

#include <cstdlib>
#include <map>
#include <string>
#include <vector>

/// Files by name.
using Files = std::map<std::string, std::string>;

/// Databases with a manager that was asked nothing before, as often as a test wants one.
class Databases {
public:
    explicit Databases(Files files) {
        TarvikTestPeer::reset();
        silence();
        AcdStore::setMemoryFiles(std::move(files));
    }
    explicit Databases(std::vector<std::string> directories) {
        TarvikTestPeer::reset();
        silence();
        AcdStore::setSearchPath(std::move(directories));
    }
    ~Databases() { TarvikTestPeer::reset(); }
    Databases(const Databases&) = delete;
    Databases& operator=(const Databases&) = delete;

    [[nodiscard]] static ConstraintsManager& freshManager() {
        TarvikTestPeer::removeManager();
        ConstraintsManager& manager = *ConstraintsManager::getConstraintsManager();
        manager.setExceptions(false);
        return manager;
    }

private:
    static void silence() {
        Port_MsgManData::setSink([](const Port_MsgManData::Message&) {});
    }
};

/// The demonstration database as it stands in the sources.
[[nodiscard]] inline std::vector<std::string> demonstration() {
    return {TARVIK_SOURCE_DIRECTORY "/database"};
}

/// The verdict that the records lead to, and the steps there.
[[nodiscard]] inline explanation::Explanation explained(const explanation::Question& question) {
    return explanation::explain(question);
}

/// The answer without colours, in 80 columns.
[[nodiscard]] inline std::string asPlainText(const explanation::Answer& answer) {
    ::setenv("COLUMNS", "80", 1);
    return explanation::asText(answer, Terminal(-1, Terminal::Colours::NEVER));
}

/// The first step about a topic; an empty one when there is none.
[[nodiscard]] inline explanation::Step stepAbout(const std::vector<explanation::Step>& steps,
                                                 const std::string& topic) {
    for (const explanation::Step& step : steps) {
        if (step.topic == topic) {
            return step;
        }
    }
    return {};
}
