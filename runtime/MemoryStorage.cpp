#include "runtime/MemoryStorage.h"

#include <iterator>
#include <utility>

namespace runtime {

void MemoryStorage::refuseWrites(const std::string& reason) {
    const std::lock_guard guard(mutex_);
    writeRefusal_ = reason;
}

void MemoryStorage::refuseReads(const std::string& reason) {
    const std::lock_guard guard(mutex_);
    readRefusal_ = reason;
}

int MemoryStorage::writes() const {
    const std::lock_guard guard(mutex_);
    return writes_;
}

/// Notes the first failure. REQUIRES: the mutex is held.
bool MemoryStorage::refused(const std::string& reason, bool nullArgument) {
    const std::string why = nullArgument ? "null argument" : reason;
    if (failure_.empty()) failure_ = why;
    return !why.empty();
}

void MemoryStorage::write(const char* section, const char* key, StoredValue value) {
    const std::lock_guard guard(mutex_);
    if (refused(writeRefusal_, section == nullptr || key == nullptr)) return;
    sections_[section].insert_or_assign(key, std::move(value));
    ++writes_;
}

void MemoryStorage::writeString(const char* section, const char* key, const char* value) {
    if (value == nullptr) {
        const std::lock_guard guard(mutex_);
        refused({}, true);
        return;
    }
    write(section, key, std::string(value));
}

void MemoryStorage::writeBool(const char* section, const char* key, bool value) {
    write(section, key, value);
}

void MemoryStorage::writeInt(const char* section, const char* key, int value) {
    write(section, key, value);
}

void MemoryStorage::removeKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    if (refused(writeRefusal_, section == nullptr || key == nullptr)) return;
    ++writes_;
    const auto held = sections_.find(section);
    if (held == sections_.end()) return;
    held->second.erase(key);
    if (held->second.empty()) sections_.erase(held);
}

/// REQUIRES: the mutex is held.
const MemoryStorage::Section* MemoryStorage::sectionOf(const char* section) const {
    const auto held = sections_.find(section);
    return held != sections_.end() ? &held->second : nullptr;
}

bool MemoryStorage::find(const char* section, const char* key, StoredValue& value) {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_, section == nullptr || key == nullptr)) return false;
    const Section* held = sectionOf(section);
    if (held == nullptr) return false;
    const auto row = held->find(key);
    if (row == held->end()) return false;
    value = row->second;
    return true;
}

bool MemoryStorage::findName(const char* section, int index, std::string& name) {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_, section == nullptr)) return false;
    const Section* held = sectionOf(section);
    if (held == nullptr || index < 0 || index >= static_cast<int>(held->size())) return false;
    name = std::next(held->begin(), index)->first;
    return true;
}

const char* MemoryStorage::readString(const char* section, const char* key) {
    StoredValue value;
    return keptForThread(find(section, key, value) ? storedText(value) : std::string());
}

bool MemoryStorage::readBool(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) && storedBool(value);
}

int MemoryStorage::readInt(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) ? storedInt(value) : 0;
}

int MemoryStorage::hasKey(const char* section, const char* key) {
    StoredValue value;
    return find(section, key, value) ? 1 : 0;
}

int MemoryStorage::keyCount(const char* section) {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_, section == nullptr)) return 0;
    const Section* held = sectionOf(section);
    return held != nullptr ? static_cast<int>(held->size()) : 0;
}

const char* MemoryStorage::keyName(const char* section, int index) {
    std::string name;
    findName(section, index, name);
    return keptForThread(name);
}

int MemoryStorage::readStringInto(const char* section, const char* key, char* buffer, int size) {
    StoredValue value;
    return find(section, key, value) ? copyInto(storedText(value), buffer, size) : 0;
}

int MemoryStorage::keyNameInto(const char* section, int index, char* buffer, int size) {
    std::string name;
    return findName(section, index, name) ? copyInto(name, buffer, size) : 0;
}

bool MemoryStorage::failed() const {
    const std::lock_guard guard(mutex_);
    return !failure_.empty();
}

std::string MemoryStorage::lastError() const {
    const std::lock_guard guard(mutex_);
    return failure_;
}

void MemoryStorage::clearFailure() {
    const std::lock_guard guard(mutex_);
    failure_.clear();
}

std::vector<std::string> MemoryStorage::sections() {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_, false)) return {};
    std::vector<std::string> names;
    for (const auto& [name, keys] : sections_)
        names.push_back(name);
    return names;
}

std::vector<StoredEntry> MemoryStorage::entries(const std::string& section) {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_, false)) return {};
    std::vector<StoredEntry> all;
    const Section* held = sectionOf(section.c_str());
    if (held == nullptr) return all;
    for (const auto& [key, value] : *held)
        all.push_back({key, value});
    return all;
}

void* MemoryStorage::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    if (CompareInterface(name, "IPermanentStorage2")) {
        return static_cast<IPermanentStorage2*>(this);
    }
    return nullptr;
}

}  // namespace runtime
