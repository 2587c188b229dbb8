// Opens a connection and prepares its statements.
#include "runtime/SqliteDatabase.h"

#include <string_view>

namespace runtime {

int SqliteStatement::prepare(sqlite3* database, const char* sql) {
    sqlite3_stmt* made = nullptr;
    const int code =
        sqlite3_prepare_v3(database, sql, -1, SQLITE_PREPARE_PERSISTENT, &made, nullptr);
    statement_.reset(made);
    return code;
}

void SqliteStatement::bind(int parameter, const std::string& text) {
    sqlite3_bind_text64(statement_.get(), parameter, text.data(), text.size(), SQLITE_TRANSIENT,
                        SQLITE_UTF8);
}

void SqliteStatement::bind(int parameter, int number) {
    sqlite3_bind_int(statement_.get(), parameter, number);
}

void SqliteStatement::reset() {
    sqlite3_reset(statement_.get());
    sqlite3_clear_bindings(statement_.get());
}

std::string SqliteStatement::text(int column) const {
    const unsigned char* bytes = sqlite3_column_text(statement_.get(), column);
    if (bytes == nullptr) return {};
    const int length = sqlite3_column_bytes(statement_.get(), column);
    return {reinterpret_cast<const char*>(bytes), static_cast<std::size_t>(length)};
}

int SqliteDatabase::open(const std::string& uri, int flags, int busyTimeoutMs) {
    sqlite3* opened = nullptr;
    // Without its own mutex: the storage holds one around every use.
    const int code = sqlite3_open_v2(uri.c_str(), &opened,
                                     flags | SQLITE_OPEN_URI | SQLITE_OPEN_NOMUTEX, nullptr);
    database_.reset(opened);
    if (opened == nullptr) return SQLITE_NOMEM;
    sqlite3_extended_result_codes(opened, 1);
    sqlite3_busy_timeout(opened, busyTimeoutMs);
    return code;
}

int SqliteDatabase::execute(const char* sql) {
    return sqlite3_exec(database_.get(), sql, nullptr, nullptr, nullptr);
}

std::optional<std::string> SqliteDatabase::answer(const char* sql) {
    SqliteStatement question;
    if (question.prepare(database_.get(), sql) != SQLITE_OK) return std::nullopt;
    if (question.step() != SQLITE_ROW) return std::nullopt;
    return question.text(0);
}

void SqliteDatabase::rollBack() {
    failure_ = Failure{code(), message()};
    execute("ROLLBACK");
}

void SqliteDatabase::checkpointOnClose(bool on) {
    sqlite3_db_config(database_.get(), SQLITE_DBCONFIG_NO_CKPT_ON_CLOSE, on ? 0 : 1, nullptr);
}

std::string sqliteUri(const std::string& path, bool immutable) {
    constexpr std::string_view kMeaning = "%?#";
    constexpr std::string_view kDigits = "0123456789ABCDEF";
    // A bare name could be one of SQLite's own, such as ":memory:".
    std::string uri = path.starts_with('/') ? "file:" : "file:./";
    if (path.starts_with("//")) uri += "//";  // Else the first part would be taken for a host.
    for (const char c : path) {
        if (kMeaning.find(c) == std::string_view::npos) {
            uri += c;
            continue;
        }
        const auto code = static_cast<unsigned char>(c);
        uri += '%';
        uri += kDigits[code >> 4];
        uri += kDigits[code & 0x0F];
    }
    return immutable ? uri + "?immutable=1" : uri;
}

}  // namespace runtime
