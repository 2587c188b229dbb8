// A copy of a file in memory, with a path of its own, whose bytes are changed and put back.
#pragma once

#include <sys/mman.h>
#include <unistd.h>

#include <cstdint>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

#include "posix/FileDescriptor.h"

namespace cli {

class MutableFile {
  public:
    explicit MutableFile(const std::string& original)
        : bytes_(contentsOf(original)), file_(::memfd_create("mutable", MFD_CLOEXEC)) {
        if (!file_) throw std::runtime_error("no memory file");
        write(0, bytes_.data(), bytes_.size());
    }

    std::string path() const { return "/proc/self/fd/" + std::to_string(file_.get()); }
    const std::vector<char>& original() const { return bytes_; }

    void put(std::size_t at, std::uint8_t byte) {
        changed_.push_back(at);
        const char value = static_cast<char>(byte);
        write(at, &value, 1);
    }
    template <class Value>
    void putValue(std::size_t at, Value value) {
        for (std::size_t i = 0; i < sizeof(Value); ++i)
            put(at + i, static_cast<std::uint8_t>(value >> (8 * i)));
    }
    /// Puts what was not there before; it stays.
    template <class Struct>
    void append(std::size_t at, const Struct& value) {
        write(at, reinterpret_cast<const char*>(&value), sizeof value);
    }
    void resizeTo(std::size_t length) {
        if (::ftruncate(file_.get(), static_cast<off_t>(length)) != 0) {
            throw std::runtime_error("not resized");
        }
    }
    /// Undoes put(), neither append() nor resizeTo().
    void restore() {
        for (const std::size_t at : changed_)
            write(at, bytes_.data() + at, 1);
        changed_.clear();
    }

  private:
    static std::vector<char> contentsOf(const std::string& path) {
        std::ifstream file(path, std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }
    void write(std::size_t at, const char* data, std::size_t size) {
        const auto offset = static_cast<off_t>(at);
        if (::pwrite(file_.get(), data, size, offset) != static_cast<ssize_t>(size)) {
            throw std::runtime_error("not written");
        }
    }

    std::vector<char> bytes_;
    std::vector<std::size_t> changed_;
    posix::FileDescriptor file_;
};

}  // namespace cli
