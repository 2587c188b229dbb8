// Makes the storage's table and moves older files to it.
#include "runtime/SqliteLayout.h"

#include <zlib.h>

#include <array>
#include <cstdint>
#include <string>

namespace runtime {
namespace {

constexpr const char* kSchema =
    "CREATE TABLE IF NOT EXISTS settings("
    " section TEXT NOT NULL,"
    " key TEXT NOT NULL,"
    " type TEXT NOT NULL CHECK(type IN ('text','bool','int')),"
    " value NOT NULL CHECK(typeof(value) = CASE type WHEN 'text' THEN 'text' ELSE 'integer' END),"
    " sum INTEGER NOT NULL,"
    " PRIMARY KEY(section, key)) WITHOUT ROWID;"
    "PRAGMA application_id=1836217461;"
    "PRAGMA user_version=2;";

constexpr const char* kUpdate =
    "ALTER TABLE settings ADD COLUMN sum INTEGER NOT NULL DEFAULT 0;"
    "UPDATE settings SET sum=mrtu_sum(section,key,type,value);"
    "PRAGMA user_version=2;";

/// SQL function: the CRC-32 of its arguments, each as its length (32 bits, low byte first) and its
/// text. The lengths keep ("a","bc") apart from ("ab","c").
void sumOf(sqlite3_context* context, int count, sqlite3_value** values) {
    uLong sum = crc32(0, nullptr, 0);
    for (int i = 0; i < count; ++i) {
        const unsigned char* const text = sqlite3_value_text(values[i]);
        const auto length = static_cast<std::uint32_t>(sqlite3_value_bytes(values[i]));
        std::array<unsigned char, 4> prefix{};
        for (std::size_t byte = 0; byte < prefix.size(); ++byte)
            prefix[byte] = static_cast<unsigned char>(length >> (8 * byte) & 0xFFU);
        sum = crc32(sum, prefix.data(), prefix.size());
        if (text != nullptr) sum = crc32(sum, text, length);
    }
    sqlite3_result_int64(context, static_cast<sqlite3_int64>(sum));
}

int addSumFunction(SqliteDatabase& database) {
    constexpr int kArguments = 4;
    return sqlite3_create_function_v2(database.get(), "mrtu_sum", kArguments,
                                      SQLITE_UTF8 | SQLITE_DETERMINISTIC | SQLITE_DIRECTONLY,
                                      nullptr, sumOf, nullptr, nullptr, nullptr);
}

/// REQUIRES: a transaction is open.
bool commit(SqliteDatabase& database, bool done) {
    if (done && database.execute("COMMIT") == SQLITE_OK) return true;
    database.rollBack();
    return false;
}

struct StatementRow {
    SqliteStatement SqliteDatabase::*statement;
    std::string sql;
};

}  // namespace

/// Two processes may come here at once with the same empty file; the second finds it furnished.
bool makeTable(SqliteDatabase& database) {
    if (database.execute("BEGIN IMMEDIATE") != SQLITE_OK) return false;
    return commit(database, database.execute(kSchema) == SQLITE_OK);
}

/// Here too the second process finds the work done.
bool updateTable(SqliteDatabase& database) {
    if (addSumFunction(database) != SQLITE_OK) return false;
    if (database.execute("BEGIN IMMEDIATE") != SQLITE_OK) return false;
    const bool due = database.answer("PRAGMA user_version") == "1";
    return commit(database, !due || database.execute(kUpdate) == SQLITE_OK);
}

int prepareStatements(SqliteDatabase& database, bool withSums) {
    if (const int code = addSumFunction(database); code != SQLITE_OK) return code;
    const std::string row = std::string("SELECT type,value,key,") +
                            (withSums ? "sum=mrtu_sum(section,key,type,value)" : "1") +
                            " FROM settings";
    const std::array rows{
        StatementRow{&SqliteDatabase::put,
                     "INSERT INTO settings(section,key,type,value,sum)"
                     " VALUES(?1,?2,?3,?4,mrtu_sum(?1,?2,?3,?4))"
                     " ON CONFLICT(section,key) DO UPDATE"
                     " SET type=excluded.type,value=excluded.value,sum=excluded.sum"},
        StatementRow{&SqliteDatabase::take, row + " WHERE section=?1 AND key=?2"},
        StatementRow{&SqliteDatabase::remove, "DELETE FROM settings WHERE section=?1 AND key=?2"},
        StatementRow{&SqliteDatabase::allSections,
                     "SELECT DISTINCT section FROM settings ORDER BY section"},
        StatementRow{&SqliteDatabase::allEntries, row + " WHERE section=?1 ORDER BY key"},
        StatementRow{&SqliteDatabase::changes, "PRAGMA data_version"},
    };
    for (const auto& [statement, sql] : rows) {
        // A table without sums is read only: nothing is ever put.
        if (!withSums && statement == &SqliteDatabase::put) continue;
        const int code = (database.*statement).prepare(database.get(), sql.c_str());
        if (code != SQLITE_OK) return code;
    }
    return SQLITE_OK;
}

}  // namespace runtime
