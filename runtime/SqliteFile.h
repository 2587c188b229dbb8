// A storage's file before SQLite sees it. Looking at it changes nothing and leaves nothing behind.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>

#include "runtime/SqliteStorage.h"

namespace runtime {

/// "mrtu" as the database's application id. Tells our files from other programs' databases.
inline constexpr std::uint32_t kStorageApplication = 1836217461;
/// The layout's number; a change of the table makes it the next one. 1 had no check sums.
inline constexpr std::uint32_t kStorageLayout = 2;

/// A file as it stands.
struct StandingFile {
    bool writable = false;
    bool hasLog = false;  ///< A process that died, or is at work, has changes in a log beside it.
};

/// @return whether there is nothing at this path, or an empty file that nobody is at work on.
bool isMissingOrEmpty(const std::string& path);

/// Makes the directories that are missing (mode 0700) and an empty file (mode 0600) unless it is
/// there. SQLite, which would do it with a wider mode, gives its side files the file's mode.
std::optional<StorageError> createMissing(const std::string& path);

/// Refuses what can't be opened or read, and a file whose header or length tells that it is no
/// sound storage.
std::optional<StorageError> lookAtFile(const std::string& path, StandingFile& standing);

/// What is wrong with a file of `size` bytes that begins with `header`, as far as these tell:
/// no database, a piece of one, another program's, a later version's. Pure.
/// Source: SQLite, Database File Format, 1.3 "The Database Header".
/// @return the fault with a text that does not name the file.
std::optional<StorageError> headerFault(std::span<const std::uint8_t> header, std::uint64_t size);

}  // namespace runtime
