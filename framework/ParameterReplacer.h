// Run-time overrides of configured parameters, kept in the host's permanent storage.
//
// Where the host gave no storage the overrides live in memory only. Threads: any operation of one
// replacer beside any other. The locks inside are leaf locks: the storage is never asked while one
// is held.
#pragma once

#include <initializer_list>
#include <map>
#include <mutex>
#include <string>
#include <string_view>

/// Named parameters, cached at the first look-up: the stored value wins over the default, and
/// neither is consulted again.
class ParameterReplacer {
  public:
    enum VariantType { Boolean = 0, Integer = 1, Text = 2 };

    struct Variant {
        int type = Boolean;
        bool boolValue = false;
        int intValue = 0;
        std::string stringValue;

        bool operator==(const Variant&) const = default;
    };
    using Values = std::map<std::string, Variant, std::less<>>;

    /// @return `name` for node -1, else "node" + node + "_" + name.
    static std::string makeFullName(std::string_view name, int node);

    /// Names the storage section. Cached values stay.
    void setSection(const char* section);
    std::string section() const;

    /// A section with its integers, fetched and not yet in force.
    struct Opened {
        std::string section;
        Values values;
    };
    struct Default {
        const char* name;
        int value;
    };
    /// Fetches those integers without a node that are not cached yet, in the order given; nothing
    /// is changed.
    Opened open(const char* section, std::initializer_list<Default> wanted) const;
    /// Puts them in force. Takes no memory. Values that were cached meanwhile stay.
    void adopt(Opened opened) noexcept;

    /// Stores the parameter's value in `out`. Allocates, and asks the storage, only at the first
    /// look-up of a key. A set() that comes while the storage is being asked wins.
    void get(std::string_view name, int node, int fallback, int& out);
    void get(std::string_view name, int node, bool fallback, bool& out);

    /// Inserts or overwrites the cached value under its full name; the storage is not touched.
    void set(const std::string& fullName, const Variant& value);

    /// Writes the value to the storage by its type: boolean, integer or text; other types and a
    /// missing storage are skipped.
    void persist(const std::string& fullName, const Variant& value) const;

    /// set() and persist() of all of them, all or, without memory, none. When several threads store
    /// the same parameter, the same one wins in memory and in the storage.
    void store(Values values);

  private:
    struct Number {
        bool boolValue;
        int intValue;
    };

    Number lookUp(std::string_view name, int node, const Variant& fallback);
    bool isCached(std::string_view fullName) const;
    void overwrite(Values values);
    bool settle(const std::string& fullName, Variant& value) const;

    mutable std::mutex mutex_;
    std::string section_;
    Values values_;
};

/// A staging area: parameters are written one by one and applied together later. Never persisted
/// itself, and never emptied.
class GroupParameterReplacer {
  public:
    struct Variant {
        int type = ParameterReplacer::Boolean;
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

    /// @return the entries that are staged at this moment, in key order.
    std::map<std::string, Variant> staged() const;

  private:
    mutable std::mutex mutex_;
    std::map<std::string, Variant> values_;
};
