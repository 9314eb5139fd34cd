#pragma once

#include <map>
#include <string>
#include <vector>

/// The databases of the in-memory host, and what was said through it.
namespace memory_host {

/// A database: the family that it belongs to, and its values by key.
struct Database {
    std::string family;
    std::map<std::string, std::string> values;
};

/// By the name of the device, family or file that is asked for. "base" is the base database.
using Databases = std::map<std::string, Database>;

/// Answers from these databases from now on.
[[gnu::visibility("default")]] void setDatabases(Databases databases);

enum class Channel { INFO, STATUS, DEBUG };

struct Message {
    Channel channel;
    int line; ///< 0 for debug messages
    std::string text;
};

/// The messages since the last call.
[[gnu::visibility("default")]] std::vector<Message> takeMessages();

} // namespace memory_host
