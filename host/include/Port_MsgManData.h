#pragma once

#include "TarvikAbi.h"

#include <tarvik/Attributes.h>

#include <functional>
#include <string_view>

// Applications define macros of these names (-DDEBUG), which must not replace the enumerators.
#pragma push_macro("INFO")
#pragma push_macro("STATUS")
#pragma push_macro("DEBUG")
#pragma push_macro("TRACE")
#undef INFO
#undef STATUS
#undef DEBUG
#undef TRACE

/// The message manager: everything that the libraries say goes through it, and out through one sink.
///
/// Each `issue...` method comes twice. The one without further arguments takes a finished text and is safe
/// for any content: `%%` gives `%`, any other `%` stays as it is. The other is printf-like; a null text
/// formats as `(null)`; it is a template only so that overload resolution prefers the other one where there
/// are no further arguments.
class TARVIK_HOST_API Port_MsgManData {
public:
    /// Whom a message is for.
    enum class Channel : int {
        INFO,          ///< notices to the user
        STATUS,        ///< status and dump lines
        DEBUG,         ///< trace output for developers
        TRACE = DEBUG, ///< the same, for applications that define a macro DEBUG
    };

    /// One message on its way to the sink. The texts are valid during the sink's call only.
    struct Message {
        Channel channel;           ///< whom it is for
        std::string_view product;  ///< that issues it; empty for debug messages, as source and revision are
        std::string_view source;   ///< of the issuing site
        int line;                  ///< the location of the issuing site; 0 for debug messages
        std::string_view revision; ///< of the source
        std::string_view text;     ///< finished, line end included where there is one
    };

    /// What takes the messages.
    using Sink = std::function<void(const Message&)>;

    /// Sends all messages to a sink from now on. A sink must not throw: what it throws passes through the library
    /// to whoever asked it, in the middle of its work. A sink of a plugin has to be removed before the plugin is
    /// unloaded.
    /// @param sink an empty one restores the default: info to standard error, status to standard output, debug
    ///        dropped unless the environment variable TARVIK_DEBUG is set (then to standard error)
    /// @return the former sink; empty when that was the default
    static Sink setSink(Sink sink);

    /// The message object of one issuing site. The texts must outlive it: pass constants.
    /// @param product that speaks
    /// @param source of the site
    /// @param line its location
    /// @param revision of the source
    /// @return the object
    [[nodiscard]] static Port_MsgManData createObject(const char* product, const char* source, int line,
                                                      const char* revision) noexcept;

    /// Issues a notice to the user.
    /// @param text finished
    void issueInfo(const char* text) const;

    /// Issues a notice to the user.
    /// @param format as of printf, as are the arguments after it
    template <typename Formatted = void>
    TARVIK_PRINTF(2, 3)
    void issueInfo(const char* format, ...) const;

    /// Issues a status or dump line, or a piece of one.
    /// @param text finished
    void issueStatus(const char* text) const;

    /// Issues a status or dump line, or a piece of one.
    /// @param format as of printf, as are the arguments after it
    template <typename Formatted = void>
    TARVIK_PRINTF(2, 3)
    void issueStatus(const char* format, ...) const;

    /// Issues trace output for developers.
    /// @param text finished
    static void debugStub(const char* text);

    /// Issues trace output for developers.
    /// @param format as of printf, as are the arguments after it
    template <typename Formatted = void>
    TARVIK_PRINTF(1, 2)
    static void debugStub(const char* format, ...);

private:
    Port_MsgManData(const char* product, const char* source, int line, const char* revision) noexcept;

    const char* m_product;
    const char* m_source;
    int m_line;
    const char* m_revision;
};

#pragma pop_macro("TRACE")
#pragma pop_macro("DEBUG")
#pragma pop_macro("STATUS")
#pragma pop_macro("INFO")
