#pragma once

#include "database/Fault.h"

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

} // namespace location

/// What there is to say to the user. Gathered first and issued when the work is done, since whoever receives
/// a message may raise, or ask for the next database.
class Reports {
public:
    /// A fault in a line of a file.
    void add(std::string_view path, const Fault& fault);

    /// A file or directory that can't be read.
    void add(std::string_view path, int location, const char* reason);

    /// There is no base database.
    void addMissingBase(const std::string& where);

    /// Adds what the other has, which then has none.
    void add(Reports&& other) noexcept { m_reports.splice(m_reports.end(), other.m_reports); }

    /// Issues what was added, in order, each once.
    void issue();

private:
    struct Report {
        int line;
        std::string text;
    };

    std::list<Report> m_reports;
};

} // namespace acd
