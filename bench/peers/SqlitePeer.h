#pragma once

#include "peers/Question.h"

#include <memory>
#include <string_view>

#include <sqlite3.h>

namespace bench {

/// SQLite: a file mapped into memory, statements prepared once, one read transaction for all questions.
class SqlitePeer {
public:
    static constexpr const char* NAME = "SQLite";

    SqlitePeer(const Facts& facts, const std::string& directory);

    [[nodiscard]] std::uint32_t operations(const Question& question) { return mask(*m_operations, question); }
    [[nodiscard]] std::uint32_t options(const Question& question) { return mask(*m_options, question); }
    [[nodiscard]] bool allows(const Question& question) {
        return (operations(question) >> question.operation & 1U) != 0;
    }

    /// Valid until the next question.
    [[nodiscard]] std::string_view property(const Question& question);

private:
    struct Closer {
        void operator()(sqlite3* connection) const noexcept { sqlite3_close_v2(connection); }
        void operator()(sqlite3_stmt* statement) const noexcept { sqlite3_finalize(statement); }
    };
    using Connection = std::unique_ptr<sqlite3, Closer>;
    using Statement = std::unique_ptr<sqlite3_stmt, Closer>;

    void execute(const char* command);
    [[nodiscard]] Statement prepare(const char* command);
    void fill(const Facts& facts);
    [[nodiscard]] std::uint32_t mask(sqlite3_stmt& statement, const Question& question);

    Connection m_connection;
    Statement m_operations;
    Statement m_options;
    Statement m_property;
};

} // namespace bench
