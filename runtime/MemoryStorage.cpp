// A storage in maps.
#include "runtime/MemoryStorage.h"

#include <iterator>

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

/// Notes the failure. REQUIRES: the mutex is held.
bool MemoryStorage::refused(const std::string& reason) {
    if (!reason.empty()) noteFailure(reason);
    return !reason.empty();
}

void MemoryStorage::write(const char* section, const char* key, const StoredValue& value) {
    if (refused(writeRefusal_)) return;
    sections_[section].insert_or_assign(key, value);
    ++writes_;
}

void MemoryStorage::removeKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, key) || refused(writeRefusal_)) return;
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
    if (refused(readRefusal_)) return false;
    const Section* held = sectionOf(section);
    if (held == nullptr) return false;
    const auto row = held->find(key);
    if (row == held->end()) return false;
    value = row->second;
    return true;
}

bool MemoryStorage::findName(const char* section, int index, std::string& name) {
    if (refused(readRefusal_)) return false;
    const Section* held = sectionOf(section);
    if (held == nullptr || index < 0 || index >= static_cast<int>(held->size())) return false;
    name = std::next(held->begin(), index)->first;
    return true;
}

int MemoryStorage::keyCount(const char* section) {
    const std::lock_guard guard(mutex_);
    if (!complete(section, "") || refused(readRefusal_)) return 0;
    const Section* held = sectionOf(section);
    return held != nullptr ? static_cast<int>(held->size()) : 0;
}

std::vector<std::string> MemoryStorage::sections() {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_)) return {};
    std::vector<std::string> names;
    for (const auto& [name, keys] : sections_)
        names.push_back(name);
    return names;
}

std::vector<StoredEntry> MemoryStorage::entries(const std::string& section) {
    const std::lock_guard guard(mutex_);
    if (refused(readRefusal_)) return {};
    std::vector<StoredEntry> all;
    const Section* held = sectionOf(section.c_str());
    if (held == nullptr) return all;
    for (const auto& [key, value] : *held)
        all.push_back({key, value});
    return all;
}

}  // namespace runtime
