// Opening a storage file: touched only when it is sound and ours.
#pragma once

#include <memory>
#include <string>

#include "runtime/Result.h"
#include "runtime/SqliteDatabase.h"
#include "runtime/SqliteStorage.h"

namespace runtime {

struct OpenedStorage {
    std::unique_ptr<SqliteDatabase> database;  ///< With its statements prepared.
    std::string whyReadOnly;                   ///< Empty when it can be written.
};

/// Opens a file that is there; an empty one is furnished, one of an earlier layout brought up to
/// date. Otherwise as SqliteStorage::open().
Result<OpenedStorage, StorageError> openStorageDatabase(const std::string& path, int busyTimeoutMs);

}  // namespace runtime
