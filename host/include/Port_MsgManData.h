#pragma once

#include <functional>
#include <string_view>

/// The message manager: everything that the libraries say goes through it, and out through one sink.
///
/// Each `issue...` method comes twice. The one without further arguments takes a finished text and is safe
/// whatever it holds: `%%` gives `%`, any other `%` stands as it is. The other is printf-like; a null text
/// formats as `(null)`; it is a template only so that overload resolution prefers the other one where there
/// are no further arguments.
class __attribute__((visibility("default"))) Port_MsgManData {
public:
    enum class Channel : int {
        INFO,   ///< notices to the user
        STATUS, ///< status and dump lines
        DEBUG,  ///< trace output for developers
    };

    /// One message on its way to the sink. The texts are valid during the sink's call only.
    struct Message {
        Channel channel;
        std::string_view product; ///< empty for debug messages, as source and revision are
        std::string_view source;
        int line; ///< the issuing site; 0 for debug messages
        std::string_view revision;
        std::string_view text; ///< finished, line end included where there is one
    };

    using Sink = std::function<void(const Message&)>;

    /// Sends all messages to `sink` from now on. An empty sink restores the default: info to standard error,
    /// status to standard output, debug dropped unless the environment variable TARVIK_DEBUG is set (then to
    /// standard error). What a sink throws passes through to the caller that issued the message.
    /// @return the former sink; empty when that was the default.
    static Sink setSink(Sink sink);

    /// The message object of one issuing site. The texts must outlive it: pass constants.
    [[nodiscard]] static Port_MsgManData createObject(const char* product, const char* source, int line,
                                                      const char* revision) noexcept;

    void issueInfo(const char* text) const;
    template <typename Formatted = void>
    [[gnu::format(printf, 2, 3)]] void issueInfo(const char* format, ...) const;

    void issueStatus(const char* text) const;
    template <typename Formatted = void>
    [[gnu::format(printf, 2, 3)]] void issueStatus(const char* format, ...) const;

    static void debugStub(const char* text);
    template <typename Formatted = void>
    [[gnu::format(printf, 1, 2)]] static void debugStub(const char* format, ...);

private:
    Port_MsgManData(const char* product, const char* source, int line, const char* revision) noexcept;

    const char* m_product;
    const char* m_source;
    int m_line;
    const char* m_revision;
};
