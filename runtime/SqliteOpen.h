// Opening a storage file: created when missing, and touched only when it is sound and ours.
#pragma once

#include <memory>
#include <string>

#include "runtime/Result.h"
#include "runtime/SqliteDatabase.h"
#include "runtime/SqliteStorage.h"

namespace runtime {

/// Does what SqliteStorage::open() promises.
/// @return the open database with its statements prepared.
Result<std::unique_ptr<SqliteDatabase>, StorageError> openStorageDatabase(const std::string& path,
                                                                          int busyTimeoutMs);

}  // namespace runtime
