// The table of replaced addresses and its way to and from the host's storage.
#include "framework/AddressReplacer.h"

#include <algorithm>
#include <string_view>

#include "framework/HostServicePointers.h"
#include "framework/TextUtils.h"
#include "platform/IPermanentStorage.h"

namespace {

/// Bytes of the buffers that the extended storage copies names and texts into.
constexpr int kStorageTextBytes = 256;

IPermanentStorage* storage() {
    return serviceAs<IPermanentStorage>(piPermanentStorage, "IPermanentStorage");
}

/// Runs a copying read of the extended storage. @return the text, empty when the read failed.
template <class CopyingRead>
std::string textOf(CopyingRead read) {
    char buffer[kStorageTextBytes] = {};
    if (read(buffer, kStorageTextBytes) == 0) return {};
    buffer[kStorageTextBytes - 1] = '\0';
    return buffer;
}

std::string orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

/// One key of a section with its value, read through the extension where the host has it.
class StoredText {
  public:
    StoredText(IPermanentStorage* plain, const char* section)
        : plain_(plain),
          copying_(static_cast<IPermanentStorage2*>(plain->ConvertTo("IPermanentStorage2"))),
          section_(section) {}

    std::string key(int index) const {
        if (copying_ == nullptr) return orEmpty(plain_->keyName(section_, index));
        return textOf([&](char* buffer, int size) {
            return copying_->keyNameInto(section_, index, buffer, size);
        });
    }

    std::string value(const std::string& key) const {
        if (copying_ == nullptr) return orEmpty(plain_->readString(section_, key.c_str()));
        return textOf([&](char* buffer, int size) {
            return copying_->readStringInto(section_, key.c_str(), buffer, size);
        });
    }

  private:
    IPermanentStorage* plain_;
    IPermanentStorage2* copying_;
    const char* section_;
};

}  // namespace

/// REQUIRES: the mutex is held.
template <class Address>
typename AddressReplacer<Address>::Entry& AddressReplacer<Address>::entryOf(Address address) {
    const auto known = std::find_if(entries_.begin(), entries_.end(),
                                    [address](const Entry& it) { return it.address == address; });
    if (known != entries_.end()) return *known;
    return entries_.emplace_back(Entry{address, address, 0});
}

/// @return the number of this write.
template <class Address>
std::uint64_t AddressReplacer<Address>::writeEntry(Address address, Address replacement) {
    const std::lock_guard lock(mutex_);
    Entry& entry = entryOf(address);
    entry.replacement = replacement;
    entry.write = ++writes_;
    return entry.write;
}

template <class Address>
std::uint64_t AddressReplacer<Address>::lastWrite() const {
    const std::lock_guard lock(mutex_);
    return writes_;
}

/// Compares what has just reached the storage with the memory. A restore may have put the old value
/// back into the memory; a later write may have reached the storage first.
/// @return true when both agree now; else the value that belongs into the storage, and its number.
template <class Address>
bool AddressReplacer<Address>::settle(Address address, Address& replacement, std::uint64_t& write) {
    const std::lock_guard lock(mutex_);
    Entry& entry = entryOf(address);
    const bool isLast = entry.write == write;
    if (isLast) entry.replacement = replacement;
    replacement = entry.replacement;
    write = entry.write;
    return isLast;
}

template <class Address>
void AddressReplacer<Address>::setValue(Address address, Address replacement, const char* section) {
    const std::string key = getPrefix() + toString(address);
    std::string text = toString(replacement);
    std::uint64_t write = writeEntry(address, replacement);
    IPermanentStorage* store = storage();
    if (section == nullptr || store == nullptr) return;

    for (;;) {
        if (replacement == address) {
            store->removeKey(section, key.c_str());
        } else {
            store->writeString(section, key.c_str(), text.c_str());
        }
        if (settle(address, replacement, write)) return;
        text = toString(replacement);
    }
}

template <class Address>
typename AddressReplacer<Address>::Stored AddressReplacer<Address>::stored(
    const char* section) const {
    Stored found;
    IPermanentStorage* store = storage();
    if (section == nullptr || store == nullptr) return found;

    found.lastWriteBefore = lastWrite();
    const std::string prefix = getPrefix();
    const int count = store->keyCount(section);
    for (int index = 0; index < count; ++index) {
        // The extension is asked for anew with every key: the host may exchange it meanwhile.
        const StoredText text(store, section);
        const std::string key = text.key(index);
        if (!key.starts_with(prefix)) continue;
        const Address address = fromString(key.substr(prefix.size()));
        found.pairs.emplace_back(address, fromString(text.value(key)));
    }
    return found;
}

template <class Address>
void AddressReplacer<Address>::adopt(const Stored& stored) {
    const std::lock_guard lock(mutex_);
    entries_.reserve(entries_.size() + stored.pairs.size());  // nothing below takes memory
    for (const Pair& pair : stored.pairs) {
        Entry& entry = entryOf(pair.first);
        // A value written since then is newer than what the storage held.
        if (entry.write <= stored.lastWriteBefore) entry.replacement = pair.second;
    }
}

template <class Address>
Address AddressReplacer<Address>::replacementOf(Address address) const {
    const std::lock_guard lock(mutex_);
    for (const Entry& entry : entries_) {
        if (entry.address == address) return entry.replacement;
    }
    return address;
}

template <class Address>
std::vector<typename AddressReplacer<Address>::Pair> AddressReplacer<Address>::replacements()
    const {
    const std::lock_guard lock(mutex_);
    std::vector<Pair> pairs;
    pairs.reserve(entries_.size());
    for (const Entry& entry : entries_)
        pairs.emplace_back(entry.address, entry.replacement);
    return pairs;
}

template class AddressReplacer<int>;

std::string AddressReplacerID::getPrefix() const {
    return "tempNode";
}

std::string AddressReplacerID::toString(int address) const {
    return std::to_string(address);
}

int AddressReplacerID::fromString(const std::string& text) const {
    return ProtUtilsN::parseInteger(text.c_str());
}
