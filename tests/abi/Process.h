// What this process holds, as the kernel counts it.
#pragma once

#include <cstddef>
#include <string>

namespace abi_test {

/// Kibibytes in memory now. Source: VmRSS in /proc/self/status, proc(5).
std::size_t residentKiB();
/// Bytes of the heap that somebody holds. Source: mallinfo(3). Means nothing under a sanitizer,
/// which has a heap of its own.
std::size_t heapBytes();
std::size_t openFiles();
std::size_t threads();
/// The sum of all ranges in /proc/self/maps, in KiB. Source: proc(5).
std::size_t mappedKiB();
/// Ranges in /proc/self/maps that belong to a file whose name contains `part`; all of them when it
/// is empty.
std::size_t mappings(const std::string& part = "");

}  // namespace abi_test
