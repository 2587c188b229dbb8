// The steps of opening a storage file, each of which may refuse it.
#include "runtime/SqliteOpen.h"

#include <chrono>
#include <optional>
#include <thread>
#include <utility>

#include "runtime/SqliteFile.h"
#include "runtime/SqliteLayout.h"

namespace runtime {
namespace {

using Fault = std::optional<StorageError>;

StorageError databaseFault(const std::string& path, const SqliteDatabase& database) {
    const int primary = database.code() & 0xFF;
    const bool damaged = primary == SQLITE_NOTADB || primary == SQLITE_CORRUPT;
    return {damaged ? StorageFault::Damaged : StorageFault::CannotOpen,
            path + ": " + database.message()};
}

/// A file that may only be read gets no locks and no side files, unless there are changes in its
/// log: then SQLite must see that log.
Fault connect(const std::string& path, const StandingFile& standing, int busyTimeoutMs,
              SqliteDatabase& database) {
    const bool immutable = !standing.writable && !standing.hasLog;
    const int flags = standing.writable ? SQLITE_OPEN_READWRITE : SQLITE_OPEN_READONLY;
    if (database.open(sqliteUri(path, immutable), flags, busyTimeoutMs) != SQLITE_OK) {
        return databaseFault(path, database);
    }
    // Until the file is known to be ours, closing it must not change it. Without a log nothing
    // would go into the file, and the side files that SQLite has made go away with the closing.
    database.checkpointOnClose(!standing.hasLog);
    database.execute("PRAGMA trusted_schema=OFF");
    return std::nullopt;
}

enum class Kind { Empty, WithSums, WithoutSums };

/// What the file is, told by questions alone.
Fault identify(const std::string& path, SqliteDatabase& database, Kind& kind) {
    const auto tables = database.answer("SELECT count(*) FROM sqlite_master");
    if (!tables) return databaseFault(path, database);
    const auto application = database.answer("PRAGMA application_id");
    const auto layout = database.answer("PRAGMA user_version");
    if (!application || !layout) return databaseFault(path, database);
    if (*tables == "0" && *application == "0" && *layout == "0") {
        kind = Kind::Empty;
        return std::nullopt;
    }
    if (*application != std::to_string(kStorageApplication)) {
        return StorageError{StorageFault::Foreign, path + ": a database of another program"};
    }
    const bool withSums = *layout == std::to_string(kStorageLayout);
    if (!withSums && *layout != "1") {
        return StorageError{StorageFault::Newer,
                            path + ": layout " + *layout + " is not known to this version"};
    }
    kind = withSums ? Kind::WithSums : Kind::WithoutSums;
    return std::nullopt;
}

Fault checkIntegrity(const std::string& path, SqliteDatabase& database) {
    const auto verdict = database.answer("PRAGMA integrity_check(1)");
    if (!verdict) return databaseFault(path, database);
    if (*verdict == "ok") return std::nullopt;
    return StorageError{StorageFault::Damaged, path + ": damaged: " + *verdict};
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

/// Makes or updates the table where that is due and the file may be written.
Fault furnish(const std::string& path, SqliteDatabase& database, Kind& kind) {
    if (kind == Kind::Empty && database.readOnly()) {
        return StorageError{StorageFault::CannotOpen, path + ": empty and write-protected"};
    }
    if (kind == Kind::WithSums || database.readOnly()) return std::nullopt;
    const bool done = kind == Kind::Empty ? makeTable(database) : updateTable(database);
    if (!done) return databaseFault(path, database);
    kind = Kind::WithSums;
    return std::nullopt;
}

Fault openStanding(const std::string& path, const StandingFile& standing, int busyTimeoutMs,
                   SqliteDatabase& database) {
    if (Fault fault = connect(path, standing, busyTimeoutMs, database)) return fault;
    Kind kind = Kind::Empty;
    if (Fault fault = identify(path, database, kind)) return fault;
    if (Fault fault = checkIntegrity(path, database)) return fault;
    if (Fault fault = furnish(path, database, kind)) return fault;
    if (!database.readOnly()) {
        if (Fault fault = useWriteAheadLog(path, database, busyTimeoutMs)) return fault;
    }
    if (prepareStatements(database, kind == Kind::WithSums) != SQLITE_OK) {
        return StorageError{StorageFault::Damaged, path + ": " + database.message()};
    }
    database.checkpointOnClose(true);
    return std::nullopt;
}

/// Writing needs room for side files; a full disk can still be read.
bool mayStillBeRead(const StorageError& fault, const StandingFile& standing,
                    const SqliteDatabase& database) {
    return fault.fault == StorageFault::CannotOpen && standing.writable &&
           (database.code() & 0xFF) != SQLITE_BUSY;
}

}  // namespace

Result<OpenedStorage, StorageError> openStorageDatabase(const std::string& path,
                                                        int busyTimeoutMs) {
    StandingFile standing;
    if (Fault fault = lookAtFile(path, standing)) return *fault;
    auto database = std::make_unique<SqliteDatabase>();
    const Fault fault = openStanding(path, standing, busyTimeoutMs, *database);
    if (!fault) {
        return OpenedStorage{std::move(database), standing.writable ? "" : "write-protected"};
    }
    if (!mayStillBeRead(*fault, standing, *database)) return *fault;
    standing.writable = false;
    auto readable = std::make_unique<SqliteDatabase>();
    if (openStanding(path, standing, busyTimeoutMs, *readable)) return *fault;
    return OpenedStorage{std::move(readable), fault->text.substr(path.size() + 2)};
}

}  // namespace runtime
