#pragma once

#include <Formatting.h>
#include <HostCall.h>

#include <string>

/// Records text for smoke tests.
class [[gnu::visibility("default")]] TarvikSmokeMgr {
public:
    /// Takes a finished text, or a printf format with its arguments.
    template <typename... Arguments>
    void smokeStatus(const char* format, Arguments... arguments) {
        hostCall("smokeStatus");
        m_text += memory_host::formatted(format, arguments...);
    }

    [[nodiscard]] const std::string& text() const noexcept { return m_text; }

private:
    std::string m_text;
};
