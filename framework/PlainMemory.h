// Memory for texts that are needed just when memory is short.
#pragma once

#include <cstddef>
#include <cstdlib>
#include <memory>

/// malloc(), since a refused operator new, even the one that returns null, throws inside the C++
/// run time, and a thread's first exception wants memory itself.
struct PlainMemoryDeleter {
    void operator()(void* memory) const noexcept { std::free(memory); }
};
using PlainMemory = std::unique_ptr<void, PlainMemoryDeleter>;

/// @return null when there is none.
inline PlainMemory takePlainMemory(std::size_t bytes) noexcept {
    return PlainMemory(std::malloc(bytes));
}
