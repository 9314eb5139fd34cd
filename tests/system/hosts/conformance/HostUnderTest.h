#pragma once

#include <map>
#include <string>
#include <vector>

/// What the tests that run against every host ask of one behind its interfaces: databases to answer from, and
/// the messages that were issued. Each host brings its own implementation.
namespace host_under_test {

struct Database {
    std::string family;
    std::map<std::string, std::string> values; ///< all of them: a device's holds its family's, too
};

/// By the name of the family or device. "base" is the base database, "spi" that of the file "spi.acd".
using Databases = std::map<std::string, Database>;

/// Answers from these databases from now on, and drops the messages of before. Call it without a manager.
void install(const Databases& databases);

enum class Channel { INFO, STATUS, DEBUG };

struct Message {
    Channel channel;
    int line;
    std::string text;
};

/// The messages since the last call.
std::vector<Message> takeMessages();

} // namespace host_under_test
