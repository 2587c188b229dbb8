#include "cli/inspect/ElfLibrary.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <gelf.h>
#include <libelf.h>

#include <cerrno>
#include <cstring>
#include <map>
#include <sstream>

#include "cli/ExitCode.h"
#include "runtime/FileDescriptor.h"

namespace cli {
namespace {

[[noreturn]] void refuse(const std::string& path, const std::string& why) {
    throw CommandError(ExitCode::Other, fmt::format("{}: {}", path, why));
}

/// The versions by the number that the symbols refer to them with.
struct Version {
    std::string name;
    std::string library;
};

class Reader {
  public:
    explicit Reader(const std::string& path);
    ~Reader() { elf_end(elf_); }
    Reader(const Reader&) = delete;
    Reader& operator=(const Reader&) = delete;

    ElfLibrary library();

  private:
    void readHeader(const std::string& path);
    void readSections();
    void readDynamic(Elf_Data* data, const GElf_Shdr& header);
    void readVersions(Elf_Data* data, const GElf_Shdr& header);
    void readSymbols();
    std::string text(std::size_t section, std::size_t offset) const;
    Version versionOf(int symbol) const;

    runtime::FileDescriptor file_;
    Elf* elf_ = nullptr;
    ElfLibrary found_;
    std::map<int, Version> versions_;
    Elf_Data* symbolVersions_ = nullptr;
    Elf_Data* symbols_ = nullptr;
    GElf_Shdr symbolHeader_{};
};

Reader::Reader(const std::string& path) : file_(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {
    if (!file_) refuse(path, std::strerror(errno));
    elf_version(EV_CURRENT);
    elf_ = elf_begin(file_.get(), ELF_C_READ, nullptr);
    try {
        readHeader(path);
    } catch (...) {
        elf_end(elf_);
        throw;
    }
}

void Reader::readHeader(const std::string& path) {
    GElf_Ehdr header{};
    if (elf_ == nullptr || elf_kind(elf_) != ELF_K_ELF || gelf_getehdr(elf_, &header) == nullptr) {
        refuse(path, "not an ELF file");
    }
    if (header.e_type != ET_DYN) refuse(path, "not a shared library");
    found_.architecture = {.machine = header.e_machine,
                           .bits = header.e_ident[EI_CLASS] == ELFCLASS64 ? 64 : 32,
                           .littleEndian = header.e_ident[EI_DATA] == ELFDATA2LSB,
                           .flags = header.e_flags};
}

ElfLibrary Reader::library() {
    readSections();
    if (symbols_ != nullptr) readSymbols();
    return std::move(found_);
}

void Reader::readSections() {
    for (Elf_Scn* section = nullptr; (section = elf_nextscn(elf_, section)) != nullptr;) {
        GElf_Shdr header{};
        if (gelf_getshdr(section, &header) == nullptr || header.sh_type == SHT_NOBITS) continue;
        Elf_Data* const data = elf_getdata(section, nullptr);
        if (data == nullptr) continue;
        if (header.sh_type == SHT_DYNAMIC) readDynamic(data, header);
        if (header.sh_type == SHT_GNU_verneed) readVersions(data, header);
        if (header.sh_type == SHT_GNU_versym) symbolVersions_ = data;
        if (header.sh_type == SHT_DYNSYM) {
            symbols_ = data;
            symbolHeader_ = header;
        }
    }
}

std::string Reader::text(std::size_t section, std::size_t offset) const {
    const char* const found = elf_strptr(elf_, section, offset);
    return found == nullptr ? "" : found;
}

void Reader::readDynamic(Elf_Data* data, const GElf_Shdr& header) {
    GElf_Dyn entry{};
    for (int i = 0; gelf_getdyn(data, i, &entry) != nullptr && entry.d_tag != DT_NULL; ++i) {
        if (entry.d_tag == DT_NEEDED) {
            found_.needed.push_back(text(header.sh_link, entry.d_un.d_val));
        }
        if (entry.d_tag != DT_RUNPATH && entry.d_tag != DT_RPATH) continue;
        std::istringstream folders(text(header.sh_link, entry.d_un.d_val));
        for (std::string folder; std::getline(folders, folder, ':');)
            found_.runPaths.push_back(folder);
    }
}

void Reader::readVersions(Elf_Data* data, const GElf_Shdr& header) {
    int offset = 0;
    GElf_Verneed need{};
    while (gelf_getverneed(data, offset, &need) != nullptr) {
        int auxOffset = offset + static_cast<int>(need.vn_aux);
        GElf_Vernaux aux{};
        for (int i = 0; i < need.vn_cnt && gelf_getvernaux(data, auxOffset, &aux) != nullptr; ++i) {
            const std::string name = text(header.sh_link, aux.vna_name);
            versions_[aux.vna_other] = {name, text(header.sh_link, need.vn_file)};
            found_.versions.push_back(name);
            auxOffset += static_cast<int>(aux.vna_next);
        }
        if (need.vn_next == 0) return;
        offset += static_cast<int>(need.vn_next);
    }
}

Version Reader::versionOf(int symbol) const {
    GElf_Versym number = 0;
    if (symbolVersions_ == nullptr || gelf_getversym(symbolVersions_, symbol, &number) == nullptr) {
        return {};
    }
    const auto found = versions_.find(number);
    return found == versions_.end() ? Version{} : found->second;
}

void Reader::readSymbols() {
    GElf_Sym symbol{};
    for (int i = 1; gelf_getsym(symbols_, i, &symbol) != nullptr; ++i) {
        const std::string name = text(symbolHeader_.sh_link, symbol.st_name);
        if (name.empty() || GELF_ST_BIND(symbol.st_info) == STB_LOCAL) continue;
        if (symbol.st_shndx != SHN_UNDEF) {
            found_.defined.insert(name);
        } else if (GELF_ST_BIND(symbol.st_info) != STB_WEAK) {
            const Version version = versionOf(i);
            found_.expected.push_back({name, version.name, version.library});
        }
    }
}

}  // namespace

ElfLibrary ElfLibrary::read(const std::string& path) {
    return Reader(path).library();
}

}  // namespace cli
