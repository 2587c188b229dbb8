// A permanent storage that lasts as long as its object, and that can refuse on demand.
#pragma once

#include <map>
#include <mutex>
#include <string>
#include <vector>

#include "runtime/Storage.h"

namespace runtime {

class MemoryStorage final : public Storage {
  public:
    /// From now on every write and removal fails with `reason` and changes nothing; an empty
    /// reason ends that.
    void refuseWrites(const std::string& reason);
    /// From now on every read fails with `reason` and finds nothing; an empty reason ends that.
    void refuseReads(const std::string& reason);

    /// Writes and removals that were carried out.
    int writes() const;

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
    int readStringInto(const char* section, const char* key, char* buffer, int size) override;
    int keyNameInto(const char* section, int index, char* buffer, int size) override;

    bool failed() const override;
    std::string lastError() const override;
    void clearFailure() override;
    std::vector<std::string> sections() override;
    std::vector<StoredEntry> entries(const std::string& section) override;

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "runtime::MemoryStorage"; }
    int GetImpVersion() const override { return 100; }

  private:
    using Section = std::map<std::string, StoredValue>;

    void write(const char* section, const char* key, StoredValue value);
    bool find(const char* section, const char* key, StoredValue& value);
    bool findName(const char* section, int index, std::string& name);
    bool refused(const std::string& reason, bool nullArgument);
    const Section* sectionOf(const char* section) const;

    mutable std::mutex mutex_;
    std::map<std::string, Section> sections_;
    std::string writeRefusal_;
    std::string readRefusal_;
    std::string failure_;
    int writes_ = 0;
};

}  // namespace runtime
