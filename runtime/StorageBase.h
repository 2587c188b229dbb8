// What every storage of the run time does alike, whatever keeps its entries.
#pragma once

#include <mutex>
#include <string>

#include "runtime/Storage.h"

namespace runtime {

/// Turns the driver's operations into three of its own on values of any type, refuses null
/// arguments and keeps the first failure.
class StorageBase : public Storage {
  public:
    void writeString(const char* section, const char* key, const char* value) final;
    void writeBool(const char* section, const char* key, bool value) final;
    void writeInt(const char* section, const char* key, int value) final;
    const char* readString(const char* section, const char* key) final;
    bool readBool(const char* section, const char* key) final;
    int readInt(const char* section, const char* key) final;
    int hasKey(const char* section, const char* key) final;
    const char* keyName(const char* section, int index) final;
    int readStringInto(const char* section, const char* key, char* buffer, int size) final;
    int keyNameInto(const char* section, int index, char* buffer, int size) final;

    bool failed() const final;
    std::string lastError() const final;
    void clearFailure() final;

    void* ConvertTo(const char* name) final;

  protected:
    /// Held by every operation; those that are inherited hold it themselves.
    mutable std::mutex mutex_;

    /// Notes the failure unless there was one before. REQUIRES: the mutex is held.
    void noteFailure(const std::string& text);
    /// @return whether neither is null; notes the failure else. REQUIRES: the mutex is held.
    bool complete(const char* section, const char* key);

  private:
    // With neither text null and the mutex held:
    virtual void write(const char* section, const char* key, const StoredValue& value) = 0;
    /// @return whether there is such an entry, then with its value.
    virtual bool find(const char* section, const char* key, StoredValue& value) = 0;
    /// @return whether the section has that many keys, then with the name of one.
    virtual bool findName(const char* section, int index, std::string& name) = 0;
    /// @return the text of a failure, e.g. with the file's name in front.
    virtual std::string failureText(const std::string& what) const = 0;

    bool findGiven(const char* section, const char* key, StoredValue& value);
    bool findNameGiven(const char* section, int index, std::string& name);
    void writeGiven(const char* section, const char* key, const StoredValue& value);

    std::string failure_;
};

}  // namespace runtime
