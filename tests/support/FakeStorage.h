// Permanent storage in memory, with a log of the calls.
#pragma once

#include <map>
#include <mutex>
#include <string>
#include <variant>
#include <vector>

#include "platform/IPermanentStorage.h"

namespace testing_support {

/// What a storage holds, apart from the interface that shows it, so that it can outlive the storage
/// object as a file outlives a process.
class StorageContents {
  public:
    using Value = std::variant<std::string, bool, int>;

    void put(const std::string& section, const std::string& key, Value value) {
        sections_[section][key] = std::move(value);
    }
    void remove(const std::string& section, const std::string& key) {
        sections_[section].erase(key);
    }
    /// @return null when there is none.
    const Value* find(const std::string& section, const std::string& key) const;
    /// In byte order.
    std::vector<std::string> keys(const std::string& section) const;
    /// For expectations: "text:7", "bool:true", "int:9600", "none".
    std::string describe(const std::string& section, const std::string& key) const;

  private:
    std::map<std::string, std::map<std::string, Value>> sections_;
};

/// The ten operations of IPermanentStorage on top of any interface that derives from it. Threads:
/// any number, but a text that was returned lives until the next call of any thread.
template <class Interface>
class StorageOperations : public Interface {
  public:
    explicit StorageOperations(StorageContents& contents) : contents_(contents) {}

    /// From now on writes and removals do nothing.
    void refuseWrites(bool refuse = true) { refuseWrites_ = refuse; }
    /// From now on the copying reads fail.
    void refuseCopies(bool refuse = true) { refuseCopies_ = refuse; }
    /// E.g. "writeString(MRTU, tempNode5, 7)", in order.
    std::vector<std::string> calls() const;
    /// How many calls of that name there were.
    int count(const std::string& operation) const;
    void forget();

    int GetImpVersion() const override { return 9; }
    void writeString(const char* section, const char* key, const char* value) override;
    void writeBool(const char* section, const char* key, bool value) override;
    void writeInt(const char* section, const char* key, int value) override;
    const char* readString(const char* section, const char* key) override;
    bool readBool(const char* section, const char* key) override;
    int readInt(const char* section, const char* key) override;
    int hasKey(const char* section, const char* key) override;
    void removeKey(const char* section, const char* key) override;
    int keyCount(const char* section) override;
    const char* keyName(const char* section, int index) override;

  protected:
    void log(const std::string& call) { calls_.push_back(call); }
    std::string textOf(const char* section, const char* key) const;
    std::string nameOf(const char* section, int index) const;

    mutable std::mutex mutex_;
    bool refuseCopies_ = false;
    StorageContents& contents_;

  private:
    void write(const char* section, const char* key, StorageContents::Value value);

    bool refuseWrites_ = false;
    std::vector<std::string> calls_;
    std::string returned_;
};

extern template class StorageOperations<IPermanentStorage>;
extern template class StorageOperations<IPermanentStorage2>;

/// A host of the older kind: no copying reads.
class PlainFakeStorage final : public StorageOperations<IPermanentStorage> {
  public:
    using StorageOperations::StorageOperations;
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "PlainFakeStorage"; }
};

class FakeStorage final : public StorageOperations<IPermanentStorage2> {
  public:
    using StorageOperations::StorageOperations;
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "FakeStorage"; }
    int readStringInto(const char* section, const char* key, char* buffer, int size) override;
    int keyNameInto(const char* section, int index, char* buffer, int size) override;
};

}  // namespace testing_support
