// A permanent storage that lasts as long as its object, and that can refuse on demand.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "runtime/StorageBase.h"

namespace runtime {

class MemoryStorage final : public StorageBase {
  public:
    /// From now on every write and removal fails with `reason` and changes nothing; an empty
    /// reason ends that.
    void refuseWrites(const std::string& reason);
    /// From now on every read fails with `reason` and finds nothing; an empty reason ends that.
    void refuseReads(const std::string& reason);

    /// Writes and removals that were carried out.
    int writes() const;

    void removeKey(const char* section, const char* key) override;
    int keyCount(const char* section) override;

    std::vector<std::string> sections() override;
    std::vector<StoredEntry> entries(const std::string& section) override;

    const char* GetImpName() const override { return "runtime::MemoryStorage"; }
    int GetImpVersion() const override { return 100; }

  private:
    using Section = std::map<std::string, StoredValue>;

    void write(const char* section, const char* key, const StoredValue& value) override;
    bool find(const char* section, const char* key, StoredValue& value) override;
    bool findName(const char* section, int index, std::string& name) override;
    std::string failureText(const std::string& what) const override { return what; }
    bool refused(const std::string& reason);
    const Section* sectionOf(const char* section) const;

    std::map<std::string, Section> sections_;
    std::string writeRefusal_;
    std::string readRefusal_;
    int writes_ = 0;
};

}  // namespace runtime
