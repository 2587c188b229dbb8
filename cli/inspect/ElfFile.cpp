// Takes sections and strings from an ELF file, every length checked.
#include "cli/inspect/ElfFile.h"

#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstring>

#include "cli/ExitCode.h"
#include "cli/inspect/ElfLibrary.h"
#include "settings/FileReader.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

/// Compilers cut names off long before.
constexpr std::size_t kLongestText = 65536;

posix::FileDescriptor opened(const std::string& path) {
    try {
        return settings::openRegularFile(path);
    } catch (const settings::FileError& error) {
        throw CommandError(ExitCode::Other,
                           fmt::format("{}: {}", values::printableText(path), error.what()));
    }
}

bool isTooLarge(int fd) {
    struct stat status {};
    return ::fstat(fd, &status) == 0 &&
           static_cast<std::uint64_t>(status.st_size) > static_cast<std::uint64_t>(kLargestLibrary);
}

/// More than 65,000 sections are counted in the first one instead of the header. No library has as
/// many, and memory would be set aside for all of them before a single one is looked at.
bool countsSectionsElsewhere(int fd) {
    std::array<char, sizeof(Elf64_Ehdr)> bytes{};
    if (::pread(fd, bytes.data(), bytes.size(), 0) < EI_NIDENT) return false;
    const bool wide = bytes[EI_CLASS] == ELFCLASS64;
    const auto isZero = [&bytes](std::size_t begin, std::size_t size) {
        return std::all_of(bytes.begin() + static_cast<std::ptrdiff_t>(begin),
                           bytes.begin() + static_cast<std::ptrdiff_t>(begin + size),
                           [](char c) { return c == 0; });
    };
    if (wide)
        return isZero(offsetof(Elf64_Ehdr, e_shnum), 2) &&
               !isZero(offsetof(Elf64_Ehdr, e_shoff), 8);
    return isZero(offsetof(Elf32_Ehdr, e_shnum), 2) && !isZero(offsetof(Elf32_Ehdr, e_shoff), 4);
}

}  // namespace

ElfFile::ElfFile(const std::string& path, ReadingBudget& budget)
    : path_(path), budget_(budget), file_(opened(path)) {
    if (isTooLarge(file_.get())) refuse("larger than 128 MiB");
    if (countsSectionsElsewhere(file_.get())) refuse("more than 65000 sections");
    elf_version(EV_CURRENT);
    elf_ = elf_begin(file_.get(), ELF_C_READ, nullptr);
    try {
        readHeader();
    } catch (...) {
        elf_end(elf_);
        throw;
    }
}

ElfFile::~ElfFile() {
    elf_end(elf_);
}

void ElfFile::refuse(const std::string& why) const {
    throw CommandError(ExitCode::Other, fmt::format("{}: {}", values::printableText(path_), why));
}

void ElfFile::pay(std::size_t bytes) {
    if (!budget_.spend(bytes)) refuse("there is no end to what it holds");
}

void ElfFile::readHeader() {
    GElf_Ehdr header{};
    if (elf_ == nullptr || elf_kind(elf_) != ELF_K_ELF || gelf_getehdr(elf_, &header) == nullptr) {
        refuse("not an ELF file");
    }
    if (header.e_type != ET_DYN) refuse("not a shared library");
    architecture_ = {.machine = header.e_machine,
                     .bits = header.e_ident[EI_CLASS] == ELFCLASS64 ? 64 : 32,
                     .littleEndian = header.e_ident[EI_DATA] == ELFDATA2LSB,
                     .flags = header.e_flags};
}

Elf_Data* ElfFile::dataOf(Elf_Scn* section, const GElf_Shdr& header) {
    // What lies outside the file is not read, and costs nothing.
    if (header.sh_type == SHT_NOBITS || header.sh_size > kLargestLibrary) return nullptr;
    pay(header.sh_size);
    return elf_getdata(section, nullptr);
}

std::vector<ElfSection> ElfFile::sections(const std::vector<GElf_Word>& types) {
    std::vector<ElfSection> found;
    for (Elf_Scn* section = nullptr; (section = elf_nextscn(elf_, section)) != nullptr;) {
        step();
        GElf_Shdr header{};
        if (gelf_getshdr(section, &header) == nullptr) continue;
        if (std::find(types.begin(), types.end(), header.sh_type) == types.end()) continue;
        Elf_Data* const data = dataOf(section, header);
        if (data != nullptr && data->d_buf != nullptr) found.push_back({header, data});
    }
    return found;
}

const Elf_Data* ElfFile::strings(std::size_t section) {
    const auto known = strings_.find(section);
    if (known != strings_.end()) return known->second;
    Elf_Scn* const found = elf_getscn(elf_, section);
    GElf_Shdr header{};
    const bool usable =
        found != nullptr && gelf_getshdr(found, &header) != nullptr && header.sh_type == SHT_STRTAB;
    const Elf_Data* const data = usable ? dataOf(found, header) : nullptr;
    return strings_[section] = data;
}

std::string ElfFile::text(std::size_t section, std::size_t offset) {
    step();
    const Elf_Data* const data = strings(section);
    if (data == nullptr || data->d_buf == nullptr || offset >= data->d_size) return {};
    const char* const begin = static_cast<const char*>(data->d_buf) + offset;
    const std::size_t most = std::min(data->d_size - offset, kLongestText);
    const auto* const end = static_cast<const char*>(std::memchr(begin, 0, most));
    pay(end != nullptr ? static_cast<std::size_t>(end - begin) : most);
    return end != nullptr ? std::string(begin, end) : std::string();
}

}  // namespace cli
