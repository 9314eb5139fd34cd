#include "HostUnderTest.h"

#include <MemoryDatabases.h>

#include <utility>

// The in-memory host under test, and the failing one, which is the same until it is told to fail.

void host_under_test::install(const Databases& databases) {
    memory_host::Databases held;
    for (const auto& [name, database] : databases) {
        held[name] = {database.family, database.values};
    }
    if (held.count("spi") != 0) {
        held["spi.acd"] = held["spi"];
    }
    memory_host::setDatabases(std::move(held));
    static_cast<void>(memory_host::takeMessages());
}

std::vector<host_under_test::Message> host_under_test::takeMessages() {
    std::vector<Message> messages;
    for (const memory_host::Message& message : memory_host::takeMessages()) {
        messages.push_back({static_cast<Channel>(message.channel), message.line, message.text});
    }
    return messages;
}
