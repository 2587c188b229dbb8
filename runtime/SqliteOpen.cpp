#include "runtime/SqliteOpen.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <optional>
#include <thread>
#include <utility>

#include "runtime/FileDescriptor.h"
#include "runtime/StoragePath.h"

namespace runtime {
namespace {

using Fault = std::optional<StorageError>;

/// "mrtu" as the database's application id. Tells our files from other programs' databases.
constexpr const char* kApplication = "1836217461";
/// The layout's number; a change of the table below makes it the next one.
constexpr const char* kLayout = "1";

constexpr const char* kSchema =
    "CREATE TABLE IF NOT EXISTS settings("
    " section TEXT NOT NULL,"
    " key TEXT NOT NULL,"
    " type TEXT NOT NULL CHECK(type IN ('text','bool','int')),"
    " value NOT NULL CHECK(typeof(value) = CASE type WHEN 'text' THEN 'text' ELSE 'integer' END),"
    " PRIMARY KEY(section, key)) WITHOUT ROWID;"
    "PRAGMA application_id=1836217461;"
    "PRAGMA user_version=1;";

/// A file as it stands before SQLite sees it.
struct Standing {
    bool writable = false;
    bool hasLog = false;  ///< A process that died has left changes in a log beside it.
};

bool allows(const std::string& path, int access) {
    return ::faccessat(AT_FDCWD, path.c_str(), access, AT_EACCESS) == 0;
}

/// Creates the file empty, before SQLite could do it with a wider mode. SQLite gives its side
/// files the mode of the database.
Fault createMissing(const std::string& path) {
    if (std::string fault = makeDirectoriesFor(path); !fault.empty()) {
        return StorageError{StorageFault::NoDirectory, path + ": cannot make " + fault};
    }
    const FileDescriptor made(::open(path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
    if (made || errno == EEXIST) return std::nullopt;
    return StorageError{StorageFault::CannotOpen, path + ": " + std::strerror(errno)};
}

bool hasContent(const std::string& path) {
    struct stat info {};
    return ::stat(path.c_str(), &info) == 0 && info.st_size > 0;
}

Fault look(const std::string& path, Standing& standing) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0) {
        return StorageError{StorageFault::CannotOpen, path + ": " + std::strerror(errno)};
    }
    if (!S_ISREG(info.st_mode)) {
        return StorageError{StorageFault::CannotOpen, path + ": not a regular file"};
    }
    if (!allows(path, R_OK)) {
        return StorageError{StorageFault::CannotOpen, path + ": " + std::strerror(errno)};
    }
    // Write protection is somebody's wish, so root, who could write all the same, follows it too.
    constexpr mode_t kAnyWrite = S_IWUSR | S_IWGRP | S_IWOTH;
    standing.writable =
        (info.st_mode & kAnyWrite) != 0 && allows(path, W_OK) && allows(directoryOf(path), W_OK);
    standing.hasLog = hasContent(path + "-wal") || hasContent(path + "-journal");
    return std::nullopt;
}

StorageError databaseFault(const std::string& path, const SqliteDatabase& database) {
    const int primary = database.code() & 0xFF;
    const bool damaged = primary == SQLITE_NOTADB || primary == SQLITE_CORRUPT;
    return {damaged ? StorageFault::Damaged : StorageFault::CannotOpen,
            path + ": " + database.message()};
}

/// A file that may only be read gets no locks and no side files, unless there are changes in its
/// log: then SQLite must see that log.
Fault connect(const std::string& path, const Standing& standing, int busyTimeoutMs,
              SqliteDatabase& database) {
    const bool immutable = !standing.writable && !standing.hasLog;
    const int flags = standing.writable ? SQLITE_OPEN_READWRITE : SQLITE_OPEN_READONLY;
    if (database.open(sqliteUri(path, immutable), flags, busyTimeoutMs) != SQLITE_OK) {
        return databaseFault(path, database);
    }
    // Until the file is known to be ours, closing it must not change it.
    database.checkpointOnClose(false);
    database.execute("PRAGMA trusted_schema=OFF");
    return std::nullopt;
}

/// What the file is, told by questions alone.
Fault identify(const std::string& path, SqliteDatabase& database, bool& empty) {
    const auto tables = database.answer("SELECT count(*) FROM sqlite_master");
    if (!tables) return databaseFault(path, database);
    const auto application = database.answer("PRAGMA application_id");
    const auto layout = database.answer("PRAGMA user_version");
    if (!application || !layout) return databaseFault(path, database);
    empty = *tables == "0" && *application == "0" && *layout == "0";
    if (empty) return std::nullopt;
    if (*application != kApplication) {
        return StorageError{StorageFault::Foreign, path + ": a database of another program"};
    }
    if (*layout != kLayout) {
        return StorageError{StorageFault::Newer,
                            path + ": layout " + *layout + " is not known to this version"};
    }
    return std::nullopt;
}

Fault checkIntegrity(const std::string& path, SqliteDatabase& database) {
    const auto verdict = database.answer("PRAGMA integrity_check(1)");
    if (!verdict) return databaseFault(path, database);
    if (*verdict == "ok") return std::nullopt;
    return StorageError{StorageFault::Damaged, path + ": damaged: " + *verdict};
}

/// Two processes may come here at once with the same empty file; the second finds it furnished.
Fault furnish(const std::string& path, SqliteDatabase& database) {
    if (database.readOnly()) {
        return StorageError{StorageFault::CannotOpen, path + ": empty and write-protected"};
    }
    if (database.execute("BEGIN IMMEDIATE") != SQLITE_OK ||
        database.execute(kSchema) != SQLITE_OK || database.execute("COMMIT") != SQLITE_OK) {
        StorageError fault = databaseFault(path, database);
        database.execute("ROLLBACK");
        return fault;
    }
    return std::nullopt;
}

/// Changing the journal's mode needs the file for itself for a moment, and SQLite does not wait
/// for that by itself.
Fault useWriteAheadLog(const std::string& path, SqliteDatabase& database, int busyTimeoutMs) {
    using Clock = std::chrono::steady_clock;
    constexpr std::chrono::milliseconds kPause{5};
    const auto deadline = Clock::now() + std::chrono::milliseconds(busyTimeoutMs);
    for (;;) {
        const auto mode = database.answer("PRAGMA journal_mode=WAL");
        // Some file systems can't share the log's index; their rollback journal is as safe.
        if (mode) break;
        const bool busy = (database.code() & 0xFF) == SQLITE_BUSY;
        if (!busy || Clock::now() >= deadline) return databaseFault(path, database);
        std::this_thread::sleep_for(kPause);
    }
    // Each commit reaches the disk before it is acknowledged.
    if (database.execute("PRAGMA synchronous=FULL") != SQLITE_OK) {
        return databaseFault(path, database);
    }
    return std::nullopt;
}

struct StatementRow {
    SqliteStatement SqliteDatabase::*statement;
    const char* sql;
};

constexpr std::array kStatements{
    StatementRow{&SqliteDatabase::put,
                 "INSERT INTO settings(section,key,type,value) VALUES(?1,?2,?3,?4)"
                 " ON CONFLICT(section,key) DO UPDATE SET type=excluded.type,value=excluded.value"},
    StatementRow{&SqliteDatabase::take,
                 "SELECT type,value FROM settings WHERE section=?1 AND key=?2"},
    StatementRow{&SqliteDatabase::remove, "DELETE FROM settings WHERE section=?1 AND key=?2"},
    StatementRow{&SqliteDatabase::count, "SELECT count(*) FROM settings WHERE section=?1"},
    StatementRow{&SqliteDatabase::nameAt,
                 "SELECT key FROM settings WHERE section=?1 ORDER BY key LIMIT 1 OFFSET ?2"},
    StatementRow{&SqliteDatabase::allSections,
                 "SELECT DISTINCT section FROM settings ORDER BY section"},
    StatementRow{&SqliteDatabase::allEntries,
                 "SELECT type,value,key FROM settings WHERE section=?1 ORDER BY key"},
};

Fault prepareAll(const std::string& path, SqliteDatabase& database) {
    for (const StatementRow& row : kStatements) {
        if ((database.*row.statement).prepare(database.get(), row.sql) == SQLITE_OK) continue;
        return StorageError{StorageFault::Damaged, path + ": " + database.message()};
    }
    return std::nullopt;
}

Fault openInto(const std::string& path, int busyTimeoutMs, SqliteDatabase& database) {
    if (path.empty()) return StorageError{StorageFault::CannotOpen, "no storage file is named"};
    if (Fault fault = createMissing(path)) return fault;
    Standing standing;
    if (Fault fault = look(path, standing)) return fault;
    if (Fault fault = connect(path, standing, busyTimeoutMs, database)) return fault;
    bool empty = false;
    if (Fault fault = identify(path, database, empty)) return fault;
    if (Fault fault = checkIntegrity(path, database)) return fault;
    if (empty) {
        if (Fault fault = furnish(path, database)) return fault;
    }
    if (!database.readOnly()) {
        if (Fault fault = useWriteAheadLog(path, database, busyTimeoutMs)) return fault;
    }
    if (Fault fault = prepareAll(path, database)) return fault;
    database.checkpointOnClose(true);
    return std::nullopt;
}

}  // namespace

Result<std::unique_ptr<SqliteDatabase>, StorageError> openStorageDatabase(const std::string& path,
                                                                          int busyTimeoutMs) {
    auto database = std::make_unique<SqliteDatabase>();
    if (Fault fault = openInto(path, busyTimeoutMs, *database)) return *fault;
    return database;
}

}  // namespace runtime
