#include "tests/support/FakeStorage.h"

#include <algorithm>
#include <cstring>

namespace testing_support {

namespace {

std::string join(const char* operation, const char* section, const std::string& rest) {
    return std::string(operation) + "(" + section + (rest.empty() ? "" : ", " + rest) + ")";
}

int copyOut(const std::string& text, char* buffer, int size) {
    if (static_cast<int>(text.size()) >= size) return 0;
    std::memcpy(buffer, text.c_str(), text.size() + 1);
    return 1;
}

}  // namespace

const StorageContents::Value* StorageContents::find(const std::string& section,
                                                    const std::string& key) const {
    const auto keys = sections_.find(section);
    if (keys == sections_.end()) return nullptr;
    const auto found = keys->second.find(key);
    return found == keys->second.end() ? nullptr : &found->second;
}

std::vector<std::string> StorageContents::keys(const std::string& section) const {
    std::vector<std::string> names;
    if (const auto found = sections_.find(section); found != sections_.end())
        for (const auto& [key, value] : found->second)
            names.push_back(key);
    return names;
}

std::string StorageContents::describe(const std::string& section, const std::string& key) const {
    const Value* value = find(section, key);
    if (value == nullptr) return "none";
    if (const auto* text = std::get_if<std::string>(value)) return "text:" + *text;
    if (const auto* flag = std::get_if<bool>(value)) return *flag ? "bool:true" : "bool:false";
    return "int:" + std::to_string(std::get<int>(*value));
}

template <class Interface>
std::vector<std::string> StorageOperations<Interface>::calls() const {
    const std::lock_guard guard(mutex_);
    return calls_;
}

template <class Interface>
int StorageOperations<Interface>::count(const std::string& operation) const {
    const std::lock_guard guard(mutex_);
    return static_cast<int>(std::count_if(
        calls_.begin(), calls_.end(),
        [&operation](const std::string& call) { return call.starts_with(operation + "("); }));
}

template <class Interface>
void StorageOperations<Interface>::forget() {
    const std::lock_guard guard(mutex_);
    calls_.clear();
}

template <class Interface>
void StorageOperations<Interface>::write(const char* section, const char* key,
                                         StorageContents::Value value) {
    if (!refuseWrites_) contents_.put(section, key, std::move(value));
}

template <class Interface>
void StorageOperations<Interface>::writeString(const char* section, const char* key,
                                               const char* value) {
    const std::lock_guard guard(mutex_);
    log(join("writeString", section, std::string(key) + ", " + value));
    write(section, key, std::string(value));
}

template <class Interface>
void StorageOperations<Interface>::writeBool(const char* section, const char* key, bool value) {
    const std::lock_guard guard(mutex_);
    log(join("writeBool", section, std::string(key) + ", " + (value ? "true" : "false")));
    write(section, key, value);
}

template <class Interface>
void StorageOperations<Interface>::writeInt(const char* section, const char* key, int value) {
    const std::lock_guard guard(mutex_);
    log(join("writeInt", section, std::string(key) + ", " + std::to_string(value)));
    write(section, key, value);
}

template <class Interface>
const char* StorageOperations<Interface>::readString(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    log(join("readString", section, key));
    returned_ = textOf(section, key);
    return returned_.c_str();
}

template <class Interface>
bool StorageOperations<Interface>::readBool(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    log(join("readBool", section, key));
    const auto* value = contents_.find(section, key);
    const bool* flag = value == nullptr ? nullptr : std::get_if<bool>(value);
    return flag != nullptr && *flag;
}

template <class Interface>
int StorageOperations<Interface>::readInt(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    log(join("readInt", section, key));
    const auto* value = contents_.find(section, key);
    const int* number = value == nullptr ? nullptr : std::get_if<int>(value);
    return number == nullptr ? 0 : *number;
}

template <class Interface>
int StorageOperations<Interface>::hasKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    log(join("hasKey", section, key));
    return contents_.find(section, key) == nullptr ? 0 : 1;
}

template <class Interface>
void StorageOperations<Interface>::removeKey(const char* section, const char* key) {
    const std::lock_guard guard(mutex_);
    log(join("removeKey", section, key));
    if (!refuseWrites_) contents_.remove(section, key);
}

template <class Interface>
int StorageOperations<Interface>::keyCount(const char* section) {
    const std::lock_guard guard(mutex_);
    log(join("keyCount", section, ""));
    return static_cast<int>(contents_.keys(section).size());
}

template <class Interface>
const char* StorageOperations<Interface>::keyName(const char* section, int index) {
    const std::lock_guard guard(mutex_);
    log(join("keyName", section, std::to_string(index)));
    returned_ = nameOf(section, index);
    return returned_.c_str();
}

template <class Interface>
std::string StorageOperations<Interface>::textOf(const char* section, const char* key) const {
    const auto* value = contents_.find(section, key);
    const auto* text = value == nullptr ? nullptr : std::get_if<std::string>(value);
    return text == nullptr ? std::string() : *text;
}

template <class Interface>
std::string StorageOperations<Interface>::nameOf(const char* section, int index) const {
    const auto keys = contents_.keys(section);
    const bool exists = index >= 0 && index < static_cast<int>(keys.size());
    return exists ? keys[static_cast<std::size_t>(index)] : std::string();
}

template class StorageOperations<IPermanentStorage>;
template class StorageOperations<IPermanentStorage2>;

void* PlainFakeStorage::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    return nullptr;
}

void* FakeStorage::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage2")) return static_cast<IPermanentStorage2*>(this);
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    return nullptr;
}

int FakeStorage::readStringInto(const char* section, const char* key, char* buffer, int size) {
    const std::lock_guard guard(mutex_);
    log(join("readStringInto", section, std::string(key) + ", " + std::to_string(size)));
    if (refuseCopies_ || contents_.find(section, key) == nullptr) return 0;
    return copyOut(textOf(section, key), buffer, size);
}

int FakeStorage::keyNameInto(const char* section, int index, char* buffer, int size) {
    const std::lock_guard guard(mutex_);
    log(join("keyNameInto", section, std::to_string(index) + ", " + std::to_string(size)));
    const std::string name = nameOf(section, index);
    if (refuseCopies_ || name.empty()) return 0;
    return copyOut(name, buffer, size);
}

}  // namespace testing_support
