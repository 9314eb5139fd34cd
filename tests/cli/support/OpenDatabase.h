#pragma once

#include "support/TarvikTestPeer.h"

#include <AcdStore.h>
#include <Port_MsgManData.h>

#include <map>
#include <string>
#include <utility>
#include <vector>

/// The database that managers of this process read, as long as this object lives. Messages are dropped.
class OpenDatabase {
public:
    explicit OpenDatabase(std::map<std::string, std::string> files) {
        reset();
        AcdStore::setMemoryFiles(std::move(files));
    }
    explicit OpenDatabase(std::vector<std::string> directories) {
        reset();
        AcdStore::setSearchPath(std::move(directories));
    }
    ~OpenDatabase() { TarvikTestPeer::reset(); }
    OpenDatabase(const OpenDatabase&) = delete;
    OpenDatabase& operator=(const OpenDatabase&) = delete;

private:
    static void reset() {
        TarvikTestPeer::reset();
        Port_MsgManData::setSink([](const Port_MsgManData::Message&) {});
    }
};
