// The caching of overridden parameters, and the staging area.
#include "framework/ParameterReplacer.h"

#include <charconv>
#include <cstring>

#include "framework/HostServicePointers.h"
#include "platform/IPermanentStorage.h"

namespace {

constexpr std::string_view kNodePrefix = "node";

/// Digits of a 32-bit number with its sign.
constexpr std::size_t kNumberRoom = 11;

IPermanentStorage* storage() {
    return serviceAs<IPermanentStorage>(piPermanentStorage, "IPermanentStorage");
}

/// A full parameter name. It lies on the stack unless it is unusually long, so that looking up a
/// cached value does not allocate.
class FullName {
  public:
    FullName(std::string_view name, int node) {
        if (node == -1) {
            view_ = name;
        } else if (kNodePrefix.size() + kNumberRoom + 1 + name.size() <= sizeof local_) {
            view_ = compose(name, node);
        } else {
            long_ = ParameterReplacer::makeFullName(name, node);
            view_ = long_;
        }
    }
    FullName(const FullName&) = delete;
    FullName& operator=(const FullName&) = delete;

    std::string_view view() const { return view_; }

  private:
    std::string_view compose(std::string_view name, int node) {
        char* at = local_ + kNodePrefix.copy(local_, kNodePrefix.size());
        at = std::to_chars(at, at + kNumberRoom, node).ptr;
        *at++ = '_';
        at += name.copy(at, name.size());
        return {local_, static_cast<std::size_t>(at - local_)};
    }

    char local_[128];
    std::string long_;
    std::string_view view_;
};

/// Replaces the value by the stored one, if there is one.
void takeStored(const std::string& section, const std::string& key,
                ParameterReplacer::Variant& value) {
    IPermanentStorage* store = storage();
    if (store == nullptr || store->hasKey(section.c_str(), key.c_str()) == 0) return;
    if (value.type == ParameterReplacer::integer) {
        value.intValue = store->readInt(section.c_str(), key.c_str());
    } else {
        value.boolValue = store->readBool(section.c_str(), key.c_str());
    }
}

std::string stagingKey(const std::string& name, int group) {
    return group == -1 ? name : name + std::to_string(group);
}

}  // namespace

std::string ParameterReplacer::makeFullName(std::string_view name, int node) {
    if (node == -1) return std::string(name);
    std::string full(kNodePrefix);
    full += std::to_string(node);
    full += '_';
    full += name;
    return full;
}

const ParameterReplacer::Variant& ParameterReplacer::lookUp(std::string_view name, int node,
                                                            const Variant& fallback) {
    const FullName full(name, node);
    const auto cached = values_.find(full.view());
    if (cached != values_.end()) return cached->second;

    const std::string key(full.view());
    Variant value = fallback;
    takeStored(section_, key, value);
    return values_.insert_or_assign(key, value).first->second;
}

void ParameterReplacer::get(std::string_view name, int node, int fallback, int& out) {
    Variant value;
    value.type = integer;
    value.intValue = fallback;
    out = lookUp(name, node, value).intValue;
}

void ParameterReplacer::get(std::string_view name, int node, bool fallback, bool& out) {
    Variant value;
    value.type = boolean;
    value.boolValue = fallback;
    out = lookUp(name, node, value).boolValue;
}

void ParameterReplacer::set(const std::string& fullName, const Variant& value) {
    values_.insert_or_assign(fullName, value);
}

void ParameterReplacer::persist(const std::string& fullName, const Variant& value) const {
    IPermanentStorage* store = storage();
    if (store == nullptr) return;
    const char* section = section_.c_str();
    const char* key = fullName.c_str();
    if (value.type == integer) store->writeInt(section, key, value.intValue);
    if (value.type == text) store->writeString(section, key, value.stringValue.c_str());
    if (value.type == boolean) store->writeBool(section, key, value.boolValue);
}

void GroupParameterReplacer::set(const std::string& name, int group, int value) {
    Variant staged;
    staged.type = ParameterReplacer::integer;
    staged.name = name;
    staged.intValue = value;
    staged.group = group;
    values_.insert_or_assign(stagingKey(name, group), staged);
}

bool GroupParameterReplacer::get(const std::string& name, int group, int& out) const {
    const auto staged = values_.find(stagingKey(name, group));
    if (staged == values_.end()) return false;
    out = staged->second.intValue;
    return true;
}
