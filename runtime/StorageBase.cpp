// The driver's operations on a storage, made of finding and writing one value.
#include "runtime/StorageBase.h"

namespace runtime {

void StorageBase::noteFailure(const std::string& text) {
    if (failure_.empty()) failure_ = text;
}

bool StorageBase::complete(const char* section, const char* key) {
    const bool given = section != nullptr && key != nullptr;
    if (!given) noteFailure(failureText("null argument"));
    return given;
}

void StorageBase::writeGiven(const char* section, const char* key, const StoredValue& value) {
    const std::lock_guard guard(mutex_);
    if (complete(section, key)) write(section, key, value);
}

bool StorageBase::findGiven(const char* section, const char* key, StoredValue& value) {
    const std::lock_guard guard(mutex_);
    return complete(section, key) && find(section, key, value);
}

bool StorageBase::findNameGiven(const char* section, int index, std::string& name) {
    const std::lock_guard guard(mutex_);
    return complete(section, "") && findName(section, index, name);
}

void StorageBase::writeString(const char* section, const char* key, const char* value) {
    // A missing value is refused like a missing key.
    if (value == nullptr) return writeGiven(section, nullptr, 0);
    writeGiven(section, key, std::string(value));
}

void StorageBase::writeBool(const char* section, const char* key, bool value) {
    writeGiven(section, key, value);
}

void StorageBase::writeInt(const char* section, const char* key, int value) {
    writeGiven(section, key, value);
}

const char* StorageBase::readString(const char* section, const char* key) {
    StoredValue value;
    return keptForThread(findGiven(section, key, value) ? storedText(value) : std::string());
}

bool StorageBase::readBool(const char* section, const char* key) {
    StoredValue value;
    return findGiven(section, key, value) && storedBool(value);
}

int StorageBase::readInt(const char* section, const char* key) {
    StoredValue value;
    return findGiven(section, key, value) ? storedInt(value) : 0;
}

int StorageBase::hasKey(const char* section, const char* key) {
    StoredValue value;
    return findGiven(section, key, value) ? 1 : 0;
}

const char* StorageBase::keyName(const char* section, int index) {
    std::string name;
    findNameGiven(section, index, name);
    return keptForThread(name);
}

int StorageBase::readStringInto(const char* section, const char* key, char* buffer, int size) {
    StoredValue value;
    return findGiven(section, key, value) ? copyInto(storedText(value), buffer, size) : 0;
}

int StorageBase::keyNameInto(const char* section, int index, char* buffer, int size) {
    std::string name;
    return findNameGiven(section, index, name) ? copyInto(name, buffer, size) : 0;
}

bool StorageBase::failed() const {
    const std::lock_guard guard(mutex_);
    return !failure_.empty();
}

std::string StorageBase::lastError() const {
    const std::lock_guard guard(mutex_);
    return failure_;
}

void StorageBase::clearFailure() {
    const std::lock_guard guard(mutex_);
    failure_.clear();
}

void* StorageBase::ConvertTo(const char* name) {
    if (CompareInterface(name, "IPermanentStorage")) return static_cast<IPermanentStorage*>(this);
    if (CompareInterface(name, "IPermanentStorage2")) {
        return static_cast<IPermanentStorage2*>(this);
    }
    return nullptr;
}

}  // namespace runtime
