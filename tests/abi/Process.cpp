#include "tests/abi/Process.h"

#include <malloc.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>

namespace abi_test {
namespace {

std::size_t entries(const char* folder) {
    const auto begin = std::filesystem::directory_iterator(folder);
    return static_cast<std::size_t>(std::distance(begin, std::filesystem::directory_iterator()));
}

}  // namespace

std::size_t residentKiB() {
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word;) {
        std::size_t kib = 0;
        if (word == "VmRSS:" && status >> kib) return kib;
    }
    throw std::runtime_error("no VmRSS in /proc/self/status");
}

std::size_t heapBytes() {
    const auto heap = mallinfo2();
    return heap.uordblks + heap.hblkhd;
}

std::size_t openFiles() {
    return entries("/proc/self/fd");
}

std::size_t threads() {
    return entries("/proc/self/task");
}

std::size_t mappedKiB() {
    std::ifstream maps("/proc/self/maps");
    std::uint64_t bytes = 0;
    for (std::string line; std::getline(maps, line);) {
        std::istringstream range(line);
        std::uint64_t begin = 0;
        std::uint64_t end = 0;
        char dash = 0;
        if (range >> std::hex >> begin >> dash >> end) bytes += end - begin;
    }
    if (bytes == 0) throw std::runtime_error("/proc/self/maps is empty");
    return static_cast<std::size_t>(bytes / 1024);
}

std::size_t mappings(const std::string& part) {
    std::ifstream maps("/proc/self/maps");
    std::size_t count = 0;
    for (std::string line; std::getline(maps, line);)
        if (line.find(part) != std::string::npos) ++count;
    if (part.empty() && count == 0) throw std::runtime_error("/proc/self/maps is empty");
    return count;
}

}  // namespace abi_test
