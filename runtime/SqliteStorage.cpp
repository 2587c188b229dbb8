// What the storage writes into its file.
#include "runtime/SqliteStorage.h"

#include <utility>

#include "runtime/SqliteDatabase.h"
#include "runtime/SqliteFile.h"
#include "runtime/SqliteOpen.h"

namespace runtime {
namespace {

std::string place(const char* section, const char* key) {
    return std::string("'") + section + "', '" + key + "'";
}

}  // namespace

Result<std::unique_ptr<SqliteStorage>, StorageError> SqliteStorage::open(const std::string& path,
                                                                         int busyTimeoutMs,
                                                                         StorageJudge judge) {
    if (path.empty()) return StorageError{StorageFault::CannotOpen, "no storage file is named"};
    std::unique_ptr<SqliteStorage> storage(
        new SqliteStorage(path, busyTimeoutMs, std::move(judge)));
    if (isMissingOrEmpty(path)) return storage;
    if (auto fault = createMissing(path)) return *fault;  // Where it can't be, the reason is known.
    auto opened = openStorageDatabase(path, busyTimeoutMs);
    if (!opened) return opened.error();
    storage->database_ = std::move(opened.value().database);
    storage->whyReadOnly_ = opened.value().whyReadOnly;
    return storage;
}

SqliteStorage::SqliteStorage(std::string path, int busyTimeoutMs, StorageJudge judge)
    : path_(std::move(path)), busyTimeoutMs_(busyTimeoutMs), judge_(std::move(judge)) {}

SqliteStorage::~SqliteStorage() = default;

std::string SqliteStorage::whyReadOnly() const {
    const std::lock_guard guard(mutex_);
    return whyReadOnly_;
}

/// REQUIRES: the mutex is held; so for all below that does not take it.
bool SqliteStorage::openNow() {
    auto opened = openStorageDatabase(path_, busyTimeoutMs_);
    if (!opened) {
        noteFailure(opened.error().text);
        return false;
    }
    database_ = std::move(opened.value().database);
    whyReadOnly_ = opened.value().whyReadOnly;
    return true;
}

/// Another process may have made the file in the meantime.
bool SqliteStorage::isThere() {
    if (database_ != nullptr) return true;
    return !isMissingOrEmpty(path_) && openNow();
}

bool SqliteStorage::isWritable(const std::string& what) {
    if (database_ == nullptr) {
        if (const auto fault = createMissing(path_)) {
            noteFailure(fault->text);
            return false;
        }
        if (!openNow()) return false;
    }
    if (whyReadOnly_.empty()) return true;
    fail(what + ": attempt to write a readonly database (" + whyReadOnly_ + ")");
    return false;
}

std::string SqliteStorage::failureText(const std::string& what) const {
    return path_ + ": " + what;
}

void SqliteStorage::fail(const std::string& what) {
    noteFailure(failureText(what));
}

void SqliteStorage::failStep(const std::string& what) {
    fail(what + ": " + database_->message());
}

void SqliteStorage::write(const char* section, const char* key, const StoredValue& value) {
    if (!isWritable("writing " + place(section, key))) return;
    names_.clear();
    const SqliteUse put(database_->put);
    put->bind(1, section);
    put->bind(2, key);
    put->bind(3, storedTypeName(value));
    if (const auto* text = std::get_if<std::string>(&value)) {
        put->bind(4, *text);
    } else {
        put->bind(4, storedInt(value));
    }
    if (put->step() != SQLITE_DONE) failStep("writing " + place(section, key));
}

void SqliteStorage::removeKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, key) || !isThere()) return;
    if (!isWritable("removing " + place(section, key))) return;
    names_.clear();
    const SqliteUse remove(database_->remove);
    remove->bind(1, section);
    remove->bind(2, key);
    if (remove->step() != SQLITE_DONE) failStep("removing " + place(section, key));
}

}  // namespace runtime
