// Run-time overrides of configured parameters, kept in the host's permanent storage.
//
// Where the host gave no storage the overrides live in memory only. Threads: no locks of their own;
// whoever changes an override sees to it that nobody looks it up at that moment.
#pragma once

#include <map>
#include <string>
#include <string_view>

/// Named parameters, cached at the first look-up: the stored value wins over the default, and
/// neither is consulted again.
class ParameterReplacer {
  public:
    enum VariantType { boolean = 0, integer = 1, text = 2 };

    struct Variant {
        int type = boolean;
        bool boolValue = false;
        int intValue = 0;
        std::string stringValue;
    };

    /// @return `name` for node -1, else "node" + node + "_" + name.
    static std::string makeFullName(std::string_view name, int node);

    /// Names the storage section. Cached values stay.
    void setSection(const char* section) { section_ = section; }
    const std::string& section() const { return section_; }

    /// Stores the parameter's value in `out`. Allocates only at the first look-up of a key.
    void get(std::string_view name, int node, int fallback, int& out);
    void get(std::string_view name, int node, bool fallback, bool& out);

    /// Inserts or overwrites the cached value under its full name; the storage is not touched.
    void set(const std::string& fullName, const Variant& value);

    /// Writes the value to the storage by its type: boolean, integer or text; other types and a
    /// missing storage are skipped.
    void persist(const std::string& fullName, const Variant& value) const;

  private:
    const Variant& lookUp(std::string_view name, int node, const Variant& fallback);

    std::string section_;
    std::map<std::string, Variant, std::less<>> values_;
};

/// A staging area: parameters are written one by one and applied together later. Never persisted
/// itself, and never emptied.
class GroupParameterReplacer {
  public:
    struct Variant {
        int type = ParameterReplacer::boolean;
        std::string name;  ///< The plain parameter name, the key under which it is committed.
        bool boolValue = false;
        int intValue = 0;
        std::string stringValue;
        int group = -1;  ///< -1: no group.
    };

    /// Stages an integer under `name`, followed by the group in decimal when it is not -1.
    void set(const std::string& name, int group, int value);

    /// @return false, with `out` untouched, when nothing is staged.
    bool get(const std::string& name, int group, int& out) const;

    /// The staged entries in key order.
    const std::map<std::string, Variant>& staged() const { return values_; }

  private:
    std::map<std::string, Variant> values_;
};
