#pragma once

#include "database/ParseError.h"

#include <list>
#include <string>
#include <string_view>

namespace acd {

/// How this layer names itself in messages and exceptions.
inline constexpr const char* PRODUCT = "Tarvik";
inline constexpr const char* SOURCE = "host/database";
inline constexpr const char* REVISION = "1.0";

/// Where a message or an exception of this layer comes from, unless it is a line of a database.
namespace location {

inline constexpr int BASE_MISSING = 101;
inline constexpr int FILE_UNREADABLE = 102;
inline constexpr int DIRECTORY_UNREADABLE = 103;
inline constexpr int SET_TOO_LATE = 104;

} // namespace location

/// What there is to say to the user. Gathered first and issued when the work is done, since whoever receives
/// a message may raise, or ask for the next database.
class DeferredMessages {
public:
    /// An error in a line of a file.
    void add(std::string_view path, const ParseError& error);

    /// A file or directory that can't be read.
    void add(std::string_view path, int location, const char* reason);

    /// There is no base database.
    void addMissingBase(const std::string& where);

    /// Databases can no longer come from somewhere else.
    /// @param what was set in vain
    void addTooLate(const char* what);

    /// Adds what the other has, which then has none.
    void add(DeferredMessages&& other) noexcept { m_messages.splice(m_messages.end(), other.m_messages); }

    /// Issues what was added, in order, each once.
    void issue();

private:
    struct Report {
        int line;
        std::string text;
    };

    std::list<Report> m_messages;
};

} // namespace acd
