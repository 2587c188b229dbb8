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

template <class Address>
void AddressReplacer<Address>::record(Address address, Address replacement) {
    const auto known = std::find_if(replacements_.begin(), replacements_.end(),
                                    [address](const Pair& pair) { return pair.first == address; });
    if (known != replacements_.end()) {
        known->second = replacement;
    } else {
        replacements_.emplace_back(address, replacement);
    }
}

template <class Address>
void AddressReplacer<Address>::setValue(Address address, Address replacement, const char* section) {
    record(address, replacement);
    IPermanentStorage* store = storage();
    if (section == nullptr || store == nullptr) return;

    const std::string key = getPrefix() + toString(address);
    if (replacement == address) {
        store->removeKey(section, key.c_str());
    } else {
        store->writeString(section, key.c_str(), toString(replacement).c_str());
    }
}

template <class Address>
void AddressReplacer<Address>::restore(const char* section) {
    IPermanentStorage* store = storage();
    if (section == nullptr || store == nullptr) return;

    const std::string prefix = getPrefix();
    const int count = store->keyCount(section);
    for (int index = 0; index < count; ++index) {
        // The extension is asked for anew with every key: the host may exchange it meanwhile.
        const StoredText stored(store, section);
        const std::string key = stored.key(index);
        if (!key.starts_with(prefix)) continue;
        record(fromString(key.substr(prefix.size())), fromString(stored.value(key)));
    }
}

template <class Address>
Address AddressReplacer<Address>::replacementOf(Address address) const {
    for (const Pair& pair : replacements_) {
        if (pair.first == address) return pair.second;
    }
    return address;
}

template class AddressReplacer<int>;

std::string AddressReplacerID::getPrefix() const {
    return "tempNode";
}

std::string AddressReplacerID::toString(int address) const {
    return std::to_string(address);
}

int AddressReplacerID::fromString(const std::string& text) const {
    return ProtUtilsN::ParseInteger(text.c_str());
}
