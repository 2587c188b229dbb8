// The parts of an ELF file, taken with care: every byte may be meant to harm.
#pragma once

#include <gelf.h>
#include <libelf.h>

#include <map>
#include <string>
#include <vector>

#include "cli/inspect/Architecture.h"
#include "cli/inspect/ReadingBudget.h"
#include "posix/FileDescriptor.h"

namespace cli {

struct ElfSection {
    GElf_Shdr header;
    Elf_Data* data;  ///< Lives as long as the file's object; never null.
};

/// Errors: CommandError (Other), also when the budget is exhausted.
class ElfFile {
  public:
    /// Opens the file and reads its header. The budget outlives the object.
    ElfFile(const std::string& path, ReadingBudget& budget);
    ~ElfFile();
    ElfFile(const ElfFile&) = delete;
    ElfFile& operator=(const ElfFile&) = delete;

    [[nodiscard]] const Architecture& architecture() const { return architecture_; }

    /// @return the sections of the dynamic linker: those whose type is among `types`.
    std::vector<ElfSection> sections(const std::vector<GElf_Word>& types);

    /// @return the text in a string section; empty for a section, offset or end that is not there.
    std::string text(std::size_t section, std::size_t offset);

    /// One step of a loop over the file's content.
    void step() { pay(16); }
    /// What is kept of it, in bytes.
    void pay(std::size_t bytes);

    [[noreturn]] void refuse(const std::string& why) const;

  private:
    void readHeader();
    Elf_Data* dataOf(Elf_Scn* section, const GElf_Shdr& header);
    const Elf_Data* strings(std::size_t section);

    std::string path_;
    ReadingBudget& budget_;
    posix::FileDescriptor file_;
    Elf* elf_ = nullptr;
    Architecture architecture_;
    std::map<std::size_t, const Elf_Data*> strings_;
};

}  // namespace cli
