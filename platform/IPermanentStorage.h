// The host's key/value storage, "IPermanentStorage", and its extension "IPermanentStorage2".
#pragma once

#include "platform/IInterface.h"

/// Values live under (section, key) and outlast the process. A key holds one value; writing
/// replaces it, whatever its type was. Sections and keys are compared exactly.
/// Threads: every operation may be called from any thread.
class IPermanentStorage : public IInterface {
  public:
    virtual void writeString(const char* section, const char* key, const char* value) = 0;
    virtual void writeBool(const char* section, const char* key, bool value) = 0;
    virtual void writeInt(const char* section, const char* key, int value) = 0;

    /// @return the text, empty when there is none; valid until the calling thread's next call.
    virtual const char* readString(const char* section, const char* key) = 0;
    /// @return the value, false when there is none.
    virtual bool readBool(const char* section, const char* key) = 0;
    /// @return the value, 0 when there is none.
    virtual int readInt(const char* section, const char* key) = 0;

    /// @return non-zero when the key exists.
    virtual int hasKey(const char* section, const char* key) = 0;
    /// Removes the key; nothing happens when it does not exist.
    virtual void removeKey(const char* section, const char* key) = 0;

    /// @return the number of keys in the section.
    virtual int keyCount(const char* section) = 0;
    /// @return the name of the key at `index`, 0..keyCount()-1, in an order that stays the same
    /// while the section does; empty when there is none. Valid until the thread's next call.
    virtual const char* keyName(const char* section, int index) = 0;
};

/// Reached with ConvertTo("IPermanentStorage2"). Its reads copy into the caller's buffer, so that
/// no text has to outlive the call.
class IPermanentStorage2 : public IPermanentStorage {
  public:
    /// @return non-zero when the key exists and its text with the terminating zero fits `size`
    /// bytes; otherwise `buffer` is untouched.
    virtual int readStringInto(const char* section, const char* key, char* buffer, int size) = 0;
    /// The same for the name of the key at `index`.
    virtual int keyNameInto(const char* section, int index, char* buffer, int size) = 0;
};
