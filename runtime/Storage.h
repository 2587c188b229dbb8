// What the run time's permanent storages offer beyond the driver's interface.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "platform/IPermanentStorage.h"
#include "runtime/StoredValue.h"

namespace runtime {

struct StoredEntry {
    std::string key;
    StoredValue value;
};

/// An entry that is there and must not be used: its readers find nothing.
struct UnusedEntry {
    std::string key;
    std::string why;  ///< One line for a person.
};

/// Looks at a stored value before it is used.
/// @return why it must not be; empty when it may.
using StorageJudge = std::function<std::string(const std::string& key, const StoredValue& value)>;

/// The writes of IPermanentStorage return nothing, so that a refusal has to be asked for here.
/// Values may be read as another type than they were written; runtime/StoredValue.h tells how.
/// Null sections, keys and values are refused. Keys are ordered byte by byte.
/// Threads: any. Texts returned by readString() and keyName() live until the calling thread's next
/// call of any storage.
class Storage : public IPermanentStorage2 {
  public:
    /// Tells whether an operation has failed since the opening or the last clearFailure().
    virtual bool failed() const = 0;
    /// @return the text of the first such failure; empty when there is none.
    virtual std::string lastError() const = 0;
    virtual void clearFailure() = 0;

    /// @return every section that has a key, ordered byte by byte.
    virtual std::vector<std::string> sections() = 0;
    /// @return every key of a section with its value, ordered byte by byte.
    virtual std::vector<StoredEntry> entries(const std::string& section) = 0;
    /// @return what is kept from the readers of a section, ordered byte by byte. removeKey() takes
    /// such entries away, too, and a write replaces them.
    virtual std::vector<UnusedEntry> unused(const std::string& /*section*/) { return {}; }

  protected:
    /// Keeps a text until the calling thread's next call of this.
    static const char* keptForThread(const std::string& text);
    /// Copies a text with its terminating zero. @return 1, or 0 with `buffer` untouched when it
    /// does not fit.
    static int copyInto(const std::string& text, char* buffer, int size);
};

}  // namespace runtime
