#include "tests/unit/cli/inspect/SampleFiles.h"

#include <elf.h>

#include <cstddef>

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace cli {

SampleFiles::SampleFiles() {
    std::string folder = std::filesystem::temp_directory_path() / "mrtu-inspect-XXXXXX";
    if (mkdtemp(folder.data()) == nullptr) throw std::runtime_error("no folder " + folder);
    folder_ = folder;
}

SampleFiles::~SampleFiles() {
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
}

std::string SampleFiles::path(const std::string& name) const {
    return (folder_ / name).string();
}

std::string SampleFiles::copyOf(const std::string& file) const {
    const auto copy = folder_ / std::filesystem::path(file).filename();
    std::filesystem::copy_file(file, copy);
    return copy.string();
}

std::string SampleFiles::foreignCopyOf(const std::string& file) const {
    std::string copy = copyOf(file);
    std::fstream bytes(copy, std::ios::in | std::ios::out | std::ios::binary);
    bytes.seekp(offsetof(Elf64_Ehdr, e_machine));
    bytes.put(static_cast<char>(EM_AARCH64));
    bytes.put('\0');
    return copy;
}

std::string SampleFiles::beginningOf(const std::string& file, std::uintmax_t bytes) const {
    std::string copy = copyOf(file);
    std::filesystem::resize_file(copy, bytes);
    return copy;
}

}  // namespace cli
