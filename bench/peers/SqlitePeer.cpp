#include "peers/SqlitePeer.h"

#include <filesystem>
#include <stdexcept>

namespace bench {

namespace {

void bindText(sqlite3_stmt& statement, int place, std::string_view text) {
    sqlite3_bind_text(&statement, place, text.data(), static_cast<int>(text.size()), SQLITE_STATIC);
}

void bindNumber(sqlite3_stmt& statement, int place, std::size_t number) {
    sqlite3_bind_int64(&statement, place, static_cast<sqlite3_int64>(number));
}

void insert(sqlite3_stmt& statement) {
    if (sqlite3_step(&statement) != SQLITE_DONE) {
        throw std::runtime_error("SQLite refuses a row");
    }
    sqlite3_reset(&statement);
}

} // namespace

SqlitePeer::SqlitePeer(const Facts& facts, const std::string& directory) {
    const std::string path = directory + "/facts.sqlite";
    std::filesystem::remove(path);
    sqlite3* connection = nullptr;
    if (sqlite3_open(path.c_str(), &connection) != SQLITE_OK) {
        throw std::runtime_error("SQLite can't open " + path);
    }
    m_connection.reset(connection);
    fill(facts);
    execute("PRAGMA mmap_size = 1073741824; PRAGMA locking_mode = EXCLUSIVE; BEGIN");
    m_operations = prepare("SELECT operations FROM device JOIN mask USING (family) "
                           "WHERE device.name = ?1 AND mode = ?2 AND output = ?3");
    m_options = prepare("SELECT options FROM device JOIN mask USING (family) "
                        "WHERE device.name = ?1 AND mode = ?2 AND output = ?3");
    m_property = prepare("SELECT value FROM property WHERE device = ?1 AND key = ?2");
}

void SqlitePeer::execute(const char* command) {
    if (sqlite3_exec(m_connection.get(), command, nullptr, nullptr, nullptr) != SQLITE_OK) {
        throw std::runtime_error(sqlite3_errmsg(m_connection.get()));
    }
}

SqlitePeer::Statement SqlitePeer::prepare(const char* command) {
    sqlite3_stmt* statement = nullptr;
    if (sqlite3_prepare_v3(m_connection.get(), command, -1, SQLITE_PREPARE_PERSISTENT, &statement, nullptr) !=
        SQLITE_OK) {
        throw std::runtime_error(sqlite3_errmsg(m_connection.get()));
    }
    return Statement(statement);
}

void SqlitePeer::fill(const Facts& facts) {
    execute(
        "PRAGMA journal_mode = OFF; PRAGMA synchronous = OFF;"
        "CREATE TABLE device (name TEXT PRIMARY KEY, family INTEGER) WITHOUT ROWID;"
        "CREATE TABLE mask (family INTEGER, mode INTEGER, output INTEGER, operations INTEGER, options "
        "INTEGER,"
        " PRIMARY KEY (family, mode, output)) WITHOUT ROWID;"
        "CREATE TABLE property (device TEXT, key TEXT, value TEXT, PRIMARY KEY (device, key)) WITHOUT ROWID;"
        "BEGIN");
    const Statement device = prepare("INSERT INTO device VALUES (?, ?)");
    const Statement mask = prepare("INSERT INTO mask VALUES (?, ?, ?, ?, ?)");
    const Statement property = prepare("INSERT INTO property VALUES (?, ?, ?)");
    std::size_t number = 0;
    for (const Family& family : facts.families) {
        for (std::size_t mode = 0; mode < MODES; ++mode) {
            for (std::size_t output = 0; output < OUTPUTS; ++output) {
                bindNumber(*mask, 1, number);
                bindNumber(*mask, 2, mode);
                bindNumber(*mask, 3, output);
                bindNumber(*mask, 4, family.operations[cellOf(mode, output)]);
                bindNumber(*mask, 5, family.options[cellOf(mode, output)]);
                insert(*mask);
            }
        }
        for (const Device& member : family.devices) {
            bindText(*device, 1, member.name);
            bindNumber(*device, 2, number);
            insert(*device);
            for (const Property& entry : member.properties) {
                bindText(*property, 1, member.name);
                bindText(*property, 2, entry.key);
                bindText(*property, 3, entry.value);
                insert(*property);
            }
        }
        ++number;
    }
    execute("COMMIT; ANALYZE");
}

std::uint32_t SqlitePeer::mask(sqlite3_stmt& statement, const Question& question) {
    bindText(statement, 1, question.device);
    bindNumber(statement, 2, question.mode);
    bindNumber(statement, 3, question.output);
    const bool found = sqlite3_step(&statement) == SQLITE_ROW;
    const auto mask = found ? static_cast<std::uint32_t>(sqlite3_column_int64(&statement, 0)) : 0;
    sqlite3_reset(&statement);
    return mask;
}

std::string_view SqlitePeer::property(const Question& question) {
    sqlite3_stmt& statement = *m_property;
    sqlite3_reset(&statement);
    bindText(statement, 1, question.device);
    bindText(statement, 2, question.key);
    if (sqlite3_step(&statement) != SQLITE_ROW) {
        return {};
    }
    const auto* const text = static_cast<const char*>(sqlite3_column_blob(&statement, 0));
    return {text, static_cast<std::size_t>(sqlite3_column_bytes(&statement, 0))};
}

} // namespace bench
