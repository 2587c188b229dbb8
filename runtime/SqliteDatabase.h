// A connection to an SQLite database and its prepared statements, closed with their owners.
#pragma once

#include <sqlite3.h>

#include <memory>
#include <optional>
#include <string>

namespace runtime {

/// A statement that is prepared once and run many times. One thread at a time.
class SqliteStatement {
  public:
    SqliteStatement() = default;

    /// @return an SQLite result code.
    int prepare(sqlite3* database, const char* sql);

    /// Parameters count from 1; texts are copied.
    void bind(int parameter, const std::string& text);
    void bind(int parameter, int number);

    /// @return SQLITE_ROW, SQLITE_DONE or an error.
    int step() { return sqlite3_step(statement_.get()); }
    /// Makes the statement ready to be run again and gives up what it has locked.
    void reset();

    /// Columns of the present row count from 0.
    std::string text(int column) const;
    sqlite3_int64 number(int column) const {
        return sqlite3_column_int64(statement_.get(), column);
    }

  private:
    struct Finalizer {
        void operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }
    };
    std::unique_ptr<sqlite3_stmt, Finalizer> statement_;
};

/// One use of a statement: it is ready for the next one afterwards, whatever happened.
class SqliteUse {
  public:
    explicit SqliteUse(SqliteStatement& statement) : statement_(statement) {}
    ~SqliteUse() { statement_.reset(); }
    SqliteUse(const SqliteUse&) = delete;
    SqliteUse& operator=(const SqliteUse&) = delete;

    SqliteStatement* operator->() const { return &statement_; }

  private:
    SqliteStatement& statement_;
};

class SqliteDatabase {
    struct Closer {
        void operator()(sqlite3* database) const { sqlite3_close(database); }
    };
    // Before the statements, so that it is closed after them.
    std::unique_ptr<sqlite3, Closer> database_;
    struct Failure {
        int code;
        std::string text;
    };
    std::optional<Failure> failure_;  ///< Of a transaction that was rolled back.

  public:
    /// @param uri  A "file:" URI.
    /// @return an SQLite result code; message() tells more.
    int open(const std::string& uri, int flags, int busyTimeoutMs);

    /// Runs a text of statements without answers.
    int execute(const char* sql);
    /// @return the first column of the first row as text, nothing after a failure or without rows.
    std::optional<std::string> answer(const char* sql);

    sqlite3* get() const { return database_.get(); }
    int code() const { return failure_ ? failure_->code : sqlite3_extended_errcode(get()); }
    std::string message() const { return failure_ ? failure_->text : sqlite3_errmsg(get()); }
    bool readOnly() const { return sqlite3_db_readonly(database_.get(), "main") == 1; }

    /// Whether the last connection copies the write-ahead log into the database when it closes.
    void checkpointOnClose(bool on);

    /// Ends an open transaction without its changes. code() and message() stay what they were.
    void rollBack();

    SqliteStatement put, take, remove, allSections, allEntries;
    SqliteStatement changes;  ///< A number that other connections' commits change.
};

/// @return a "file:" URI of a path, with what has a meaning in URIs escaped.
/// @param immutable  The file can't change while it is open: no locks, no side files.
std::string sqliteUri(const std::string& path, bool immutable);

}  // namespace runtime
