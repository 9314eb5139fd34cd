#include "HostUnderTest.h"

#include "database/Store.h"

#include <AcdStore.h>
#include <Port_MsgManData.h>

#include <utility>

// Our host under test: its databases are .acd files in memory.

namespace {

std::vector<host_under_test::Message>& messages() {
    static std::vector<host_under_test::Message> kept;
    return kept;
}

} // namespace

void host_under_test::install(const Databases& databases) {
    std::map<std::string, std::string> files;
    // A family's own keys stand before the first section, so families go first.
    for (const bool families : {true, false}) {
        for (const auto& [name, database] : databases) {
            if ((name == database.family) != families) {
                continue;
            }
            std::string& text = files[database.family + ".acd"];
            text += families ? "" : "[" + name + "]\n";
            for (const auto& [key, value] : database.values) {
                text += key + " = " + value + "\n";
            }
        }
    }
    // Databases are settled once they have been looked for.
    acd::Store::resetForTesting();
    AcdStore::setMemoryFiles(std::move(files));
    Port_MsgManData::setSink([](const Port_MsgManData::Message& message) {
        messages().push_back(
            {static_cast<Channel>(message.channel), message.line, std::string(message.text)});
    });
    messages().clear();
}

std::vector<host_under_test::Message> host_under_test::takeMessages() {
    return std::exchange(messages(), {});
}
