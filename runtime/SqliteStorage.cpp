#include "runtime/SqliteStorage.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "runtime/SqliteDatabase.h"
#include "runtime/SqliteOpen.h"

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

std::string place(const char* section, const char* key) {
    return std::string("'") + section + "', '" + key + "'";
}

}  // namespace

Result<std::unique_ptr<SqliteStorage>, StorageError> SqliteStorage::open(const std::string& path,
                                                                         int busyTimeoutMs) {
    auto database = openStorageDatabase(path, busyTimeoutMs);
    if (!database) return database.error();
    return std::unique_ptr<SqliteStorage>(new SqliteStorage(std::move(database).value(), path));
}

SqliteStorage::SqliteStorage(std::unique_ptr<SqliteDatabase> database, std::string path)
    : database_(std::move(database)), path_(std::move(path)) {}

SqliteStorage::~SqliteStorage() = default;

bool SqliteStorage::readOnly() const {
    const std::lock_guard guard(mutex_);
    return database_->readOnly();
}

/// Notes the first failure. REQUIRES: the mutex is held.
void SqliteStorage::fail(const std::string& what) {
    if (failure_.empty()) failure_ = path_ + ": " + what;
}

void SqliteStorage::failStep(const std::string& what) {
    fail(what + ": " + database_->message());
}

bool SqliteStorage::complete(const char* section, const char* key) {
    const bool given = section != nullptr && key != nullptr;
    if (!given) fail("null argument");
    return given;
}

void SqliteStorage::write(const char* section, const char* key, const StoredValue& value) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, key)) return;
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

void SqliteStorage::writeString(const char* section, const char* key, const char* value) {
    if (value == nullptr) {
        const std::lock_guard guard(mutex_);
        fail("null argument");
        return;
    }
    write(section, key, std::string(value));
}

void SqliteStorage::writeBool(const char* section, const char* key, bool value) {
    write(section, key, value);
}

void SqliteStorage::writeInt(const char* section, const char* key, int value) {
    write(section, key, value);
}

void SqliteStorage::removeKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, key)) return;
    const SqliteUse remove(database_->remove);
    remove->bind(1, section);
    remove->bind(2, key);
    if (remove->step() != SQLITE_DONE) failStep("removing " + place(section, key));
}

bool SqliteStorage::find(const char* section, const char* key, StoredValue& value) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, key)) return false;
    const SqliteUse take(database_->take);
    take->bind(1, section);
    take->bind(2, key);
    const int code = take->step();
    if (code == SQLITE_ROW) {
        value = valueIn(database_->take);
        return true;
    }
    if (code != SQLITE_DONE) failStep("reading " + place(section, key));
    return false;
}

bool SqliteStorage::findName(const char* section, int index, std::string& name) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, "") || index < 0) return false;
    const SqliteUse nameAt(database_->nameAt);
    nameAt->bind(1, section);
    nameAt->bind(2, index);
    const int code = nameAt->step();
    if (code == SQLITE_ROW) {
        name = nameAt->text(0);
        return true;
    }
    if (code != SQLITE_DONE) failStep("listing '" + std::string(section) + "'");
    return false;
}

const char* SqliteStorage::readString(const char* section, const char* key) {
    StoredValue value;
    return keptForThread(find(section, key, value) ? storedText(value) : std::string());
}

bool SqliteStorage::readBool(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) && storedBool(value);
}

int SqliteStorage::readInt(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) ? storedInt(value) : 0;
}

int SqliteStorage::hasKey(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) ? 1 : 0;
}

int SqliteStorage::keyCount(const char* section) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, "")) return 0;
    const SqliteUse count(database_->count);
    count->bind(1, section);
    if (count->step() == SQLITE_ROW) return static_cast<int>(count->number(0));
    failStep("counting '" + std::string(section) + "'");
    return 0;
}

const char* SqliteStorage::keyName(const char* section, int index) {
    std::string name;
    findName(section, index, name);
    return keptForThread(name);
}

int SqliteStorage::readStringInto(const char* section, const char* key, char* buffer, int size) {
    StoredValue value;
    return find(section, key, value) ? copyInto(storedText(value), buffer, size) : 0;
}

int SqliteStorage::keyNameInto(const char* section, int index, char* buffer, int size) {
    std::string name;
    return findName(section, index, name) ? copyInto(name, buffer, size) : 0;
}

bool SqliteStorage::failed() const {
    const std::lock_guard guard(mutex_);
    return !failure_.empty();
}

std::string SqliteStorage::lastError() const {
    const std::lock_guard guard(mutex_);
    return failure_;
}

void SqliteStorage::clearFailure() {
    const std::lock_guard guard(mutex_);
    failure_.clear();
}

std::vector<std::string> SqliteStorage::sections() {
    const std::lock_guard guard(mutex_);
    const SqliteUse all(database_->allSections);
    std::vector<std::string> names;
    int code = all->step();
    for (; code == SQLITE_ROW; code = all->step())
        names.push_back(all->text(0));
    if (code != SQLITE_DONE) failStep("listing the sections");
    return names;
}

std::vector<StoredEntry> SqliteStorage::entries(const std::string& section) {
    const std::lock_guard guard(mutex_);
    const SqliteUse all(database_->allEntries);
    all->bind(1, section);
    std::vector<StoredEntry> found;
    int code = all->step();
    for (; code == SQLITE_ROW; code = all->step()) {
        found.push_back({all->text(2), valueIn(database_->allEntries)});
    }
    if (code != SQLITE_DONE) failStep("listing '" + section + "'");
    return found;
}

void* SqliteStorage::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    if (CompareInterface(name, "IPermanentStorage2")) {
        return static_cast<IPermanentStorage2*>(this);
    }
    return nullptr;
}

}  // namespace runtime
