// The caching of overridden parameters, and the staging area.
#include "framework/ParameterReplacer.h"

#include <charconv>
#include <utility>

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
    if (value.type == ParameterReplacer::Integer) {
        value.intValue = store->readInt(section.c_str(), key.c_str());
    } else {
        value.boolValue = store->readBool(section.c_str(), key.c_str());
    }
}

/// Writes the value by its type; other types are skipped.
void putStored(const std::string& section, const std::string& key,
               const ParameterReplacer::Variant& value) {
    IPermanentStorage* store = storage();
    if (store == nullptr) return;
    const char* place = section.c_str();
    const char* name = key.c_str();
    if (value.type == ParameterReplacer::Integer) store->writeInt(place, name, value.intValue);
    if (value.type == ParameterReplacer::Boolean) store->writeBool(place, name, value.boolValue);
    if (value.type == ParameterReplacer::Text) {
        store->writeString(place, name, value.stringValue.c_str());
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

void ParameterReplacer::setSection(const char* section) {
    std::string named = section;
    const std::lock_guard lock(mutex_);
    section_ = std::move(named);
}

std::string ParameterReplacer::section() const {
    const std::lock_guard lock(mutex_);
    return section_;
}

bool ParameterReplacer::isCached(std::string_view fullName) const {
    const std::lock_guard lock(mutex_);
    return values_.contains(fullName);
}

ParameterReplacer::Opened ParameterReplacer::open(const char* section,
                                                  std::initializer_list<Default> wanted) const {
    Opened opened{section, {}};
    for (const Default& each : wanted) {
        if (isCached(each.name)) continue;
        const auto place = opened.values.try_emplace(each.name).first;
        place->second.type = Integer;
        place->second.intValue = each.value;
        takeStored(opened.section, place->first, place->second);
    }
    return opened;
}

void ParameterReplacer::adopt(Opened opened) noexcept {
    const std::lock_guard lock(mutex_);
    section_.swap(opened.section);
    values_.merge(opened.values);
}

ParameterReplacer::Number ParameterReplacer::lookUp(std::string_view name, int node,
                                                    const Variant& fallback) {
    const FullName full(name, node);
    {
        const std::lock_guard lock(mutex_);
        const auto cached = values_.find(full.view());
        if (cached != values_.end()) return {cached->second.boolValue, cached->second.intValue};
    }
    const std::string key(full.view());
    Variant value = fallback;
    takeStored(section(), key, value);

    const std::lock_guard lock(mutex_);
    const Variant& inForce = values_.try_emplace(key, value).first->second;
    return {inForce.boolValue, inForce.intValue};
}

void ParameterReplacer::get(std::string_view name, int node, int fallback, int& out) {
    Variant value;
    value.type = Integer;
    value.intValue = fallback;
    out = lookUp(name, node, value).intValue;
}

void ParameterReplacer::get(std::string_view name, int node, bool fallback, bool& out) {
    Variant value;
    value.type = Boolean;
    value.boolValue = fallback;
    out = lookUp(name, node, value).boolValue;
}

void ParameterReplacer::set(const std::string& fullName, const Variant& value) {
    overwrite({{fullName, value}});
}

/// Takes no memory, so that it never stops half way.
void ParameterReplacer::overwrite(Values values) {
    const std::lock_guard lock(mutex_);
    while (!values.empty()) {
        auto placed = values_.insert(values.extract(values.begin()));
        if (!placed.inserted) placed.position->second = std::move(placed.node.mapped());
    }
}

void ParameterReplacer::persist(const std::string& fullName, const Variant& value) const {
    putStored(section(), fullName, value);
}

/// Another thread's later value may have reached the storage first.
/// @return true when memory and storage agree; else `value` is the one that belongs into the
/// storage.
bool ParameterReplacer::settle(const std::string& fullName, Variant& value) const {
    const std::lock_guard lock(mutex_);
    const auto inForce = values_.find(fullName);
    if (inForce == values_.end() || inForce->second == value) return true;
    value = inForce->second;
    return false;
}

void ParameterReplacer::store(Values values) {
    const std::string named = section();
    overwrite(values);
    for (auto& [name, value] : values) {
        do {
            putStored(named, name, value);
        } while (!settle(name, value));
    }
}

void GroupParameterReplacer::set(const std::string& name, int group, int value) {
    Variant staged;
    staged.type = ParameterReplacer::Integer;
    staged.name = name;
    staged.intValue = value;
    staged.group = group;
    const std::string key = stagingKey(name, group);
    const std::lock_guard lock(mutex_);
    values_.insert_or_assign(key, staged);
}

bool GroupParameterReplacer::get(const std::string& name, int group, int& out) const {
    const std::string key = stagingKey(name, group);
    const std::lock_guard lock(mutex_);
    const auto staged = values_.find(key);
    if (staged == values_.end()) return false;
    out = staged->second.intValue;
    return true;
}

std::map<std::string, GroupParameterReplacer::Variant> GroupParameterReplacer::staged() const {
    const std::lock_guard lock(mutex_);
    return values_;
}
