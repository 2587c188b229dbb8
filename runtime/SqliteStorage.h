// The permanent storage: an SQLite database in one file.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "runtime/Result.h"
#include "runtime/StorageBase.h"
#include "runtime/StoragePath.h"

namespace runtime {

class SqliteDatabase;
class SqliteStatement;

/// Why a storage file could not be opened.
enum class StorageFault {
    NoDirectory,  ///< A directory on the way is missing and can't be made, or is none.
    CannotOpen,   ///< The file can't be created or opened.
    Damaged,      ///< The file is no database, a piece of one, or fails its integrity check.
    Foreign,      ///< A sound database, but not a storage of this run time.
    Newer,        ///< A storage with a layout that a later version wrote.
};

struct StorageError {
    StorageFault fault;
    std::string text;  ///< One line for a person; names the file.
};

/// A value whose write has returned without a failure survives the death of the process and of
/// the system. Several processes may use one file at a time. docs/storage.md shows the layout.
class SqliteStorage final : public StorageBase {
  public:
    /// Opens the file. One that is missing or empty holds nothing; the first write makes it (mode
    /// 0600), with the directories that are missing on the way (mode 0700). A file that is there
    /// and is not a sound storage is left as it is. One that may not be written is opened for
    /// reading, and writes fail. Values that were altered since they were written are kept from
    /// the readers; unused() tells of them.
    /// @param busyTimeoutMs  How long an operation waits for another process's write.
    /// @param judge  Refuses further values; empty to use all.
    static Result<std::unique_ptr<SqliteStorage>, StorageError> open(
        const std::string& path, int busyTimeoutMs = kBusyTimeoutMs, StorageJudge judge = {});

    ~SqliteStorage() override;
    SqliteStorage(const SqliteStorage&) = delete;
    SqliteStorage& operator=(const SqliteStorage&) = delete;

    bool readOnly() const { return !whyReadOnly().empty(); }
    /// @return why nothing can be written, e.g. "write-protected", "disk I/O error"; empty when it
    /// can, as far as is known.
    std::string whyReadOnly() const;
    const std::string& path() const { return path_; }

    void removeKey(const char* section, const char* key) override;
    int keyCount(const char* section) override;

    std::vector<std::string> sections() override;
    std::vector<StoredEntry> entries(const std::string& section) override;
    std::vector<UnusedEntry> unused(const std::string& section) override;

    const char* GetImpName() const override { return "runtime::SqliteStorage"; }
    int GetImpVersion() const override { return 100; }

    static constexpr int kBusyTimeoutMs = 5000;

  private:
    /// The names of a section's entries. Counting and asking for each name by its index would cost
    /// the square of their number otherwise.
    using Names = std::vector<std::string>;
    struct Row;

    SqliteStorage(std::string path, int busyTimeoutMs, StorageJudge judge);

    bool openNow();
    bool isThere();
    bool isWritable(const std::string& what);
    Row rowIn(const SqliteStatement& statement) const;
    std::vector<Row> rowsOf(const std::string& section);
    const Names& namesOf(const char* section);
    void write(const char* section, const char* key, const StoredValue& value) override;
    bool find(const char* section, const char* key, StoredValue& value) override;
    bool findName(const char* section, int index, std::string& name) override;
    std::string failureText(const std::string& what) const override;
    void fail(const std::string& what);
    void failStep(const std::string& what);

    std::string path_;
    int busyTimeoutMs_;
    StorageJudge judge_;
    std::unique_ptr<SqliteDatabase> database_;  ///< Null while the file is missing.
    std::string whyReadOnly_;
    std::map<std::string, Names> names_;  ///< By section, as of `namesVersion_`.
    std::int64_t namesVersion_ = 0;
};

}  // namespace runtime
