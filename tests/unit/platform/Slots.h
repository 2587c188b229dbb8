// Calls through a table of operations by index, the way a foreign compiler's code would.
//
// The layout is that of the Itanium C++ ABI, which 32-bit ARM shares: an object begins with the
// pointer to its table; a virtual destructor takes two entries.
#pragma once

#include <cstddef>
#include <functional>
#include <string>

namespace slots {

/// Calls entry `slot` of the object's table.
template <class Result, class... Arguments>
Result call(void* object, std::size_t slot, Arguments... arguments) {
    // The analyzer does not see that a constructor has set the pointer to the table.
    // NOLINTNEXTLINE(clang-analyzer-core.uninitialized.Assign)
    void** const operations = *static_cast<void***>(object);
    using Operation = Result (*)(void*, Arguments...);
    const auto operation = reinterpret_cast<Operation>(operations[slot]);
    return operation(object, arguments...);
}

using Caller = std::function<void(void* object, std::size_t slot)>;

/// A call with zeroes for arguments, its result thrown away.
template <class Result, class... Arguments>
Caller zeroes() {
    return [](void* object, std::size_t slot) {
        static_cast<void>(call<Result, Arguments...>(object, slot, Arguments{}...));
    };
}

/// One operation of an interface: its name and how to call it.
struct Operation {
    std::string name;
    Caller caller;
};

/// The entries that a virtual destructor takes.
inline constexpr std::size_t kDestructors = 2;

}  // namespace slots
