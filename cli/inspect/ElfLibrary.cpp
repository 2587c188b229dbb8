// Collects what a library defines, needs and asks for.
#include "cli/inspect/ElfLibrary.h"

#include <map>
#include <sstream>

#include "cli/inspect/ElfFile.h"

namespace cli {
namespace {

constexpr std::size_t kMostNeeded = 256;
constexpr std::size_t kMostRunPaths = 64;

/// The versions by the number that the symbols refer to them with.
struct Version {
    std::string name;
    std::string library;
};

class Reader {
  public:
    explicit Reader(ElfFile& file) : file_(file) { found_.architecture = file.architecture(); }

    ElfLibrary library();

  private:
    void readDynamic(const ElfSection& section);
    void readRunPaths(const std::string& list);
    void readVersions(const ElfSection& section);
    void readVersionsOf(const ElfSection& section, const GElf_Verneed& need, std::size_t offset);
    void readSymbols(const ElfSection& section);
    Version versionOf(int symbol) const;

    ElfFile& file_;
    ElfLibrary found_;
    std::map<int, Version> versions_;
    Elf_Data* symbolVersions_ = nullptr;
};

ElfLibrary Reader::library() {
    std::vector<ElfSection> symbols;
    for (const ElfSection& section :
         file_.sections({SHT_DYNAMIC, SHT_GNU_verneed, SHT_GNU_versym, SHT_DYNSYM})) {
        if (section.header.sh_type == SHT_DYNAMIC) readDynamic(section);
        if (section.header.sh_type == SHT_GNU_verneed) readVersions(section);
        if (section.header.sh_type == SHT_GNU_versym) symbolVersions_ = section.data;
        if (section.header.sh_type == SHT_DYNSYM) symbols.push_back(section);
    }
    // They refer to the versions, wherever those stand.
    for (const ElfSection& section : symbols)
        readSymbols(section);
    return std::move(found_);
}

void Reader::readDynamic(const ElfSection& section) {
    GElf_Dyn entry{};
    for (int i = 0; gelf_getdyn(section.data, i, &entry) != nullptr && entry.d_tag != DT_NULL;
         ++i) {
        file_.step();
        const std::size_t strings = section.header.sh_link;
        if (entry.d_tag == DT_NEEDED) {
            found_.needed.push_back(file_.text(strings, entry.d_un.d_val));
            if (found_.needed.size() > kMostNeeded) file_.refuse("needs more than 256 libraries");
        }
        if (entry.d_tag == DT_RUNPATH || entry.d_tag == DT_RPATH) {
            readRunPaths(file_.text(strings, entry.d_un.d_val));
        }
    }
}

void Reader::readRunPaths(const std::string& list) {
    std::istringstream folders(list);
    for (std::string folder; std::getline(folders, folder, ':');) {
        found_.runPaths.push_back(folder);
        if (found_.runPaths.size() > kMostRunPaths) file_.refuse("more than 64 run paths");
    }
}

/// Moves an offset by what the file says is the way to the next entry.
/// @return false at the end: without a next entry, and for one outside the section. An offset
/// never goes back, so no list is without end.
bool advance(std::size_t& offset, std::size_t way, std::size_t size) {
    if (way == 0 || way >= size - offset) return false;
    offset += way;
    return true;
}

void Reader::readVersions(const ElfSection& section) {
    std::size_t offset = 0;
    GElf_Verneed need{};
    while (gelf_getverneed(section.data, static_cast<int>(offset), &need) != nullptr) {
        file_.step();
        std::size_t first = offset;
        if (advance(first, need.vn_aux, section.data->d_size)) readVersionsOf(section, need, first);
        if (!advance(offset, need.vn_next, section.data->d_size)) return;
    }
}

void Reader::readVersionsOf(const ElfSection& section, const GElf_Verneed& need,
                            std::size_t offset) {
    const std::string library = file_.text(section.header.sh_link, need.vn_file);
    GElf_Vernaux entry{};
    for (int i = 0; i < need.vn_cnt; ++i) {
        if (gelf_getvernaux(section.data, static_cast<int>(offset), &entry) == nullptr) return;
        file_.step();
        const std::string name = file_.text(section.header.sh_link, entry.vna_name);
        file_.pay(library.size());
        versions_[entry.vna_other] = {name, library};
        found_.versions.push_back(name);
        if (!advance(offset, entry.vna_next, section.data->d_size)) return;
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

void Reader::readSymbols(const ElfSection& section) {
    GElf_Sym symbol{};
    for (int i = 1; gelf_getsym(section.data, i, &symbol) != nullptr; ++i) {
        const std::string name = file_.text(section.header.sh_link, symbol.st_name);
        if (name.empty() || GELF_ST_BIND(symbol.st_info) == STB_LOCAL) continue;
        if (symbol.st_shndx != SHN_UNDEF) {
            found_.defined.insert(name);
        } else if (GELF_ST_BIND(symbol.st_info) != STB_WEAK) {
            const Version version = versionOf(i);
            file_.pay(version.name.size() + version.library.size());
            found_.expected.push_back({name, version.name, version.library});
        }
    }
}

}  // namespace

ElfLibrary ElfLibrary::read(const std::string& path, ReadingBudget& budget) {
    ElfFile file(path, budget);
    return Reader(file).library();
}

ElfLibrary ElfLibrary::read(const std::string& path) {
    ReadingBudget budget;
    return read(path, budget);
}

Architecture ElfLibrary::architectureOf(const std::string& path) {
    ReadingBudget budget;
    return ElfFile(path, budget).architecture();
}

}  // namespace cli
