#pragma once

#include <Formatting.h>
#include <MemoryDatabases.h>

/// The message manager: keeps what is said until `memory_host::takeMessages`. Each operation takes a finished
/// text, or a printf format with its arguments.
class [[gnu::visibility("default")]] Port_MsgManData {
public:
    [[nodiscard]] static Port_MsgManData createObject(const char* product, const char* source, int line,
                                                      const char* revision);

    template <typename... Arguments>
    void issueInfo(const char* format, Arguments... arguments) const {
        issue({memory_host::Channel::INFO, m_line, memory_host::formatted(format, arguments...)});
    }

    template <typename... Arguments>
    void issueStatus(const char* format, Arguments... arguments) const {
        issue({memory_host::Channel::STATUS, m_line, memory_host::formatted(format, arguments...)});
    }

    template <typename... Arguments>
    static void debugStub(const char* format, Arguments... arguments) {
        issue({memory_host::Channel::DEBUG, 0, memory_host::formatted(format, arguments...)});
    }

private:
    explicit Port_MsgManData(int line) noexcept : m_line(line) {}

    static void issue(memory_host::Message message);

    int m_line;
};
