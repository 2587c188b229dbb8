// What the storage finds in its file, and what it keeps from its readers.
#include <algorithm>
#include <limits>
#include <utility>

#include "runtime/SqliteDatabase.h"
#include "runtime/SqliteStorage.h"

namespace runtime {
namespace {

/// The columns `type` and `value` of the present row, 0 and 1.
StoredValue valueIn(const SqliteStatement& row) {
    const std::string type = row.text(0);
    if (type == "text") return row.text(1);
    if (type == "bool") return row.number(1) != 0;
    constexpr sqlite3_int64 kLeast = std::numeric_limits<int>::min();
    constexpr sqlite3_int64 kMost = std::numeric_limits<int>::max();
    return static_cast<int>(std::clamp(row.number(1), kLeast, kMost));
}

}  // namespace

/// A row of the table.
struct SqliteStorage::Row {
    std::string key;
    StoredValue value;
    std::string whyNot;  ///< Why it is not used; empty when it is.
};

SqliteStorage::Row SqliteStorage::rowIn(const SqliteStatement& statement) const {
    constexpr int kKey = 2;
    constexpr int kSumIsRight = 3;
    Row row{statement.text(kKey), valueIn(statement), {}};
    if (statement.number(kSumIsRight) == 0) {
        row.whyNot = "altered since it was written";
    } else if (judge_) {
        row.whyNot = judge_(row.key, row.value);
    }
    return row;
}

std::vector<SqliteStorage::Row> SqliteStorage::rowsOf(const std::string& section) {
    std::vector<Row> rows;
    if (!isThere()) return rows;
    const SqliteUse all(database_->allEntries);
    all->bind(1, section);
    int code = all->step();
    for (; code == SQLITE_ROW; code = all->step())
        rows.push_back(rowIn(database_->allEntries));
    if (code != SQLITE_DONE) failStep("listing '" + section + "'");
    return rows;
}

/// The names are read anew when this or another process has written since.
const SqliteStorage::Names& SqliteStorage::namesOf(const char* section) {
    if (isThere()) {
        const SqliteUse changes(database_->changes);
        const std::int64_t version = changes->step() == SQLITE_ROW ? changes->number(0) : -1;
        if (version != namesVersion_) names_.clear();
        namesVersion_ = version;
    }
    const auto known = names_.find(section);
    if (known != names_.end()) return known->second;
    Names names;
    for (Row& row : rowsOf(section)) {
        if (row.whyNot.empty()) names.push_back(std::move(row.key));
    }
    return names_.insert_or_assign(section, std::move(names)).first->second;
}

bool SqliteStorage::find(const char* section, const char* key, StoredValue& value) {
    if (!isThere()) return false;
    const SqliteUse take(database_->take);
    take->bind(1, section);
    take->bind(2, key);
    const int code = take->step();
    if (code != SQLITE_ROW && code != SQLITE_DONE)
        failStep(std::string("reading '") + section + "', '" + key + "'");
    if (code != SQLITE_ROW) return false;
    Row row = rowIn(database_->take);
    if (!row.whyNot.empty()) return false;
    value = std::move(row.value);
    return true;
}

bool SqliteStorage::findName(const char* section, int index, std::string& name) {
    if (index < 0) return false;
    const Names& names = namesOf(section);
    if (static_cast<std::size_t>(index) >= names.size()) return false;
    name = names[static_cast<std::size_t>(index)];
    return true;
}

int SqliteStorage::keyCount(const char* section) {
    const std::lock_guard guard(mutex_);
    return complete(section, "") ? static_cast<int>(namesOf(section).size()) : 0;
}

std::vector<std::string> SqliteStorage::sections() {
    const std::lock_guard guard(mutex_);
    std::vector<std::string> names;
    if (!isThere()) return names;
    const SqliteUse all(database_->allSections);
    int code = all->step();
    for (; code == SQLITE_ROW; code = all->step())
        names.push_back(all->text(0));
    if (code != SQLITE_DONE) failStep("listing the sections");
    return names;
}

std::vector<StoredEntry> SqliteStorage::entries(const std::string& section) {
    const std::lock_guard guard(mutex_);
    std::vector<StoredEntry> found;
    for (Row& row : rowsOf(section)) {
        if (row.whyNot.empty()) found.push_back({std::move(row.key), std::move(row.value)});
    }
    return found;
}

std::vector<UnusedEntry> SqliteStorage::unused(const std::string& section) {
    const std::lock_guard guard(mutex_);
    std::vector<UnusedEntry> kept;
    for (Row& row : rowsOf(section)) {
        if (!row.whyNot.empty()) kept.push_back({std::move(row.key), std::move(row.whyNot)});
    }
    return kept;
}

}  // namespace runtime
