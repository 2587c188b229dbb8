// Run-time overrides of node addresses, one storage key for each changed node.
#pragma once

#include <cstdint>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

/// Pairs of a configured address and its replacement, at most one for each configured address, in
/// order of insertion.
/// Threads: as the other replacers. Of a setValue() and a restore() at the same time the former
/// wins; of two setValue() for one address the same one wins in memory and in the storage.
template <class Address>
class AddressReplacer {
  public:
    using Pair = std::pair<Address, Address>;

    AddressReplacer() = default;
    AddressReplacer(const AddressReplacer&) = delete;
    AddressReplacer& operator=(const AddressReplacer&) = delete;

    /// The prefix of the storage keys.
    virtual std::string getPrefix() const = 0;
    virtual std::string toString(Address address) const = 0;
    virtual Address fromString(const std::string& text) const = 0;

    /// Records an override and, unless `section` is null, persists it. Replacing an address by
    /// itself removes the storage key; the pair stays listed.
    void setValue(Address address, Address replacement, const char* section);

    /// What a storage section held, and when it was asked.
    struct Stored {
        std::vector<Pair> pairs;
        std::uint64_t lastWriteBefore = 0;
    };
    /// @return every override that the section holds; nothing is recorded yet.
    Stored stored(const char* section) const;
    /// Records them, all or, without memory, none; nothing is written back.
    void adopt(const Stored& stored);
    /// Both of it.
    void restore(const char* section) { adopt(stored(section)); }

    /// @return the replacement, or `address` itself when none is recorded.
    Address replacementOf(Address address) const;

    /// @return the pairs as they stand at this moment.
    std::vector<Pair> replacements() const;

  protected:
    // Not virtual: nobody deletes through this base, and the table begins with getPrefix().
    ~AddressReplacer() = default;

  private:
    struct Entry {
        Address address;
        Address replacement;
        std::uint64_t write;  ///< Number of the setValue() that it comes from; 0: restored.
    };

    Entry& entryOf(Address address);
    std::uint64_t writeEntry(Address address, Address replacement);
    std::uint64_t lastWrite() const;
    bool settle(Address address, Address& replacement, std::uint64_t& write);

    mutable std::mutex mutex_;
    std::vector<Entry> entries_;
    std::uint64_t writes_ = 0;
};

extern template class AddressReplacer<int>;

/// Node addresses: keys "tempNode" + address in decimal; stored texts are read with automatic base.
class AddressReplacerID final : public AddressReplacer<int> {
  public:
    std::string getPrefix() const override;
    std::string toString(int address) const override;
    int fromString(const std::string& text) const override;
};
