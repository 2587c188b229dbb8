// Files that are meant to harm: an inspection ends with each of them, and says something.
#include <elf.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <random>

#include "cli/inspect/Inspection.h"
#include "cli/inspect/ReadableName.h"
#include "tests/unit/cli/InProcess.h"
#include "tests/unit/cli/inspect/MutableFile.h"
#include "tests/unit/cli/inspect/SampleFiles.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

template <class Struct>
Struct structAt(const std::vector<char>& bytes, std::size_t at) {
    Struct value{};
    if (at + sizeof value <= bytes.size()) std::memcpy(&value, bytes.data() + at, sizeof value);
    return value;
}

/// @return where the section headers of the type stand in the file.
std::vector<std::size_t> headersOf(const MutableFile& file, std::uint32_t type) {
    const auto elf = structAt<Elf64_Ehdr>(file.original(), 0);
    std::vector<std::size_t> found;
    for (std::size_t i = 0; i < elf.e_shnum; ++i) {
        const std::size_t at = elf.e_shoff + i * sizeof(Elf64_Shdr);
        if (structAt<Elf64_Shdr>(file.original(), at).sh_type == type) found.push_back(at);
    }
    return found;
}

Elf64_Shdr sectionOf(const MutableFile& file, std::uint32_t type) {
    const auto headers = headersOf(file, type);
    EXPECT_FALSE(headers.empty()) << type;
    return headers.empty() ? Elf64_Shdr{} : structAt<Elf64_Shdr>(file.original(), headers[0]);
}

/// @return "read", or why not. Whatever else happens ends the test program.
std::string outcomeOf(const std::string& path) {
    try {
        ElfLibrary::read(path);
    } catch (const CommandError& error) {
        return error.what();
    }
    return "read";
}

bool has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

TEST(HostileFileTest, VersionListThatLeadsBackEnds) {
    for (const std::uint32_t way : {0xFFFFFFF0U, 0x80000000U, 0xFFFFFFFFU, 1U, 4U}) {
        MutableFile file(PLUGIN);
        const Elf64_Shdr needs = sectionOf(file, SHT_GNU_verneed);
        const auto first = structAt<Elf64_Verneed>(file.original(), needs.sh_offset);
        const std::size_t second = needs.sh_offset + first.vn_next;
        file.putValue(second + offsetof(Elf64_Verneed, vn_next), way);
        EXPECT_EQ("read", outcomeOf(file.path())) << way;
    }
}

TEST(HostileFileTest, ListOfVersionsThatLeadsBackEnds) {
    for (const std::uint32_t way : {0xFFFFFFF0U, 0x80000000U, 1U}) {
        MutableFile file(PLUGIN);
        const Elf64_Shdr needs = sectionOf(file, SHT_GNU_verneed);
        const auto first = structAt<Elf64_Verneed>(file.original(), needs.sh_offset);
        file.putValue(needs.sh_offset + offsetof(Elf64_Verneed, vn_cnt), std::uint16_t{0xFFFF});
        file.putValue(needs.sh_offset + first.vn_aux + offsetof(Elf64_Vernaux, vna_next), way);
        EXPECT_EQ("read", outcomeOf(file.path())) << way;
    }
}

TEST(HostileFileTest, OneSectionGivenAThousandTimesIsNotReadAThousandTimes) {
    // Every section header of the file becomes a dynamic section over the whole file, and the
    // table is said to be as long as it can be.
    MutableFile file(PLUGIN);
    const auto elf = structAt<Elf64_Ehdr>(file.original(), 0);
    const std::uint64_t size = file.original().size();
    std::size_t end = size;
    for (int copy = 0; copy < 2000; ++copy, end += sizeof(Elf64_Shdr)) {
        file.append(end, Elf64_Shdr{.sh_name = 0,
                                    .sh_type = SHT_DYNSYM,
                                    .sh_flags = 0,
                                    .sh_addr = 0,
                                    .sh_offset = 0,
                                    .sh_size = size / 24 * 24,
                                    .sh_link = 1,
                                    .sh_info = 0,
                                    .sh_addralign = 8,
                                    .sh_entsize = 24});
    }
    ASSERT_NE(0, elf.e_shnum);
    file.putValue(offsetof(Elf64_Ehdr, e_shoff), size);
    file.putValue(offsetof(Elf64_Ehdr, e_shnum), std::uint16_t{2000});
    file.putValue(offsetof(Elf64_Ehdr, e_shstrndx), std::uint16_t{0});
    EXPECT_TRUE(has(outcomeOf(file.path()), "there is no end to what it holds"));
}

TEST(HostileFileTest, SectionsCountedElsewhereAreRefused) {
    MutableFile file(PLUGIN);
    file.putValue(offsetof(Elf64_Ehdr, e_shnum), std::uint16_t{0});
    EXPECT_TRUE(has(outcomeOf(file.path()), "more than 65000 sections"));
}

TEST(HostileFileTest, FileBeyondAllMeasureIsNotRead) {
    MutableFile file(OTHER_LIBRARY);
    file.resizeTo(kLargestLibrary + 1);
    EXPECT_TRUE(has(outcomeOf(file.path()), "larger than 128 MiB"));
}

TEST(HostileFileTest, NameWithoutEndIsNone) {
    MutableFile file(PLUGIN);
    const Elf64_Shdr strings = sectionOf(file, SHT_STRTAB);
    for (std::uint64_t i = 0; i < strings.sh_size; ++i)
        file.put(strings.sh_offset + i, 'x');
    EXPECT_EQ("read", outcomeOf(file.path()));
    EXPECT_TRUE(ElfLibrary::read(file.path()).defined.empty());
}

TEST(HostileFileTest, WhatIsNoFileIsNotOpened) {
    const SampleFiles files;
    const std::string pipe = files.path("pipe");
    ASSERT_EQ(0, mkfifo(pipe.c_str(), 0600));
    for (const std::string& path :
         {pipe, std::string("/dev/zero"), std::string("/dev/null"), std::string("/")}) {
        const Outcome outcome = runInProcess({"inspect", path});
        EXPECT_EQ(1, outcome.code) << path;
        EXPECT_EQ("mrtu: " + path + ": not a regular file\n", outcome.err);
    }
}

TEST(HostileFileTest, TextsReachNeitherTerminalNorJsonAsTheyAre) {
    MutableFile file(PLUGIN);
    const std::string marker = "<<ICOM_XML_START>>";
    const auto& bytes = file.original();
    const auto at = std::search(bytes.begin(), bytes.end(), marker.begin(), marker.end());
    ASSERT_NE(bytes.end(), at);
    std::size_t place = static_cast<std::size_t>(at - bytes.begin()) + marker.size();
    for (const char c : {'\x1b', '[', '2', 'J', '\xff', '\x7f', '\xc2', '\x9b'})
        file.put(place++, static_cast<std::uint8_t>(c));
    const Outcome text = runInProcess({"inspect", file.path()});
    EXPECT_TRUE(has(text.out, "header         \\x1b[2J\\xff\\x7f\\xc2\\x9b")) << text.out;

    const Outcome json = runInProcess({"inspect", "--json", file.path()});
    for (const char c : json.out)
        ASSERT_TRUE(c == '\n' || (c >= 0x20 && c < 0x7f)) << json.out;
    EXPECT_TRUE(Json::parse(json.out).at("header").get<std::string>().starts_with("\x1b[2J"));
}

TEST(HostileFileTest, NamesDoNotGrowBeyondReason) {
    EXPECT_EQ("ProtgenTag::PackedLen() const", readableName("_ZNK10ProtgenTag9PackedLenEv"));
    EXPECT_EQ("main", readableName("main"));
    EXPECT_EQ("i", readableName("i")) << "not the type int";
    // f(pair<a,a>, pair<pair,pair> ...): each argument is twice as long as the one before.
    std::string doubling = "_Z1fSt4pairI1aS0_E";
    const std::string digits = "123456789ABCDEFGHIJKLMNOPQRSTUVWXYZ";
    for (const char digit : digits)
        doubling += std::string("St4pairIS") + digit + "_S" + digit + "_E";
    EXPECT_EQ(doubling, readableName(doubling));
}

/// Bytes whose change matters most: the headers and the sections of the dynamic linker.
std::vector<std::pair<std::size_t, std::size_t>> sensitiveRanges(const MutableFile& file) {
    const auto elf = structAt<Elf64_Ehdr>(file.original(), 0);
    std::vector<std::pair<std::size_t, std::size_t>> ranges{
        {0, sizeof(Elf64_Ehdr)}, {elf.e_shoff, elf.e_shnum * sizeof(Elf64_Shdr)}};
    for (const std::uint32_t type :
         {SHT_DYNAMIC, SHT_GNU_verneed, SHT_GNU_versym, SHT_DYNSYM, SHT_STRTAB}) {
        for (const std::size_t header : headersOf(file, type)) {
            const auto section = structAt<Elf64_Shdr>(file.original(), header);
            ranges.emplace_back(header, sizeof section);
            ranges.emplace_back(section.sh_offset, section.sh_size);
        }
    }
    return ranges;
}

void mutate(MutableFile& file, std::mt19937& random,
            const std::vector<std::pair<std::size_t, std::size_t>>& ranges) {
    constexpr std::uint8_t kEdges[] = {0x00, 0x01, 0x7F, 0x80, 0xFE, 0xFF};
    const unsigned changes = 1 + random() % 8;
    for (unsigned i = 0; i < changes; ++i) {
        const auto& [begin, size] = ranges[random() % ranges.size()];
        if (size == 0) continue;
        const std::size_t at = begin + random() % size;
        if (at >= file.original().size()) continue;
        const bool edge = random() % 2 == 0;
        file.put(at,
                 edge ? kEdges[random() % std::size(kEdges)] : static_cast<std::uint8_t>(random()));
    }
}

void tryMutations(const std::string& original, unsigned seed, int rounds,
                  const std::function<void(const std::string& path)>& look) {
    MutableFile file(original);
    const auto ranges = sensitiveRanges(file);
    std::mt19937 random(seed);
    for (int round = 0; round < rounds; ++round) {
        SCOPED_TRACE(testing::Message() << original << ", seed " << seed << ", round " << round);
        mutate(file, random, ranges);
        look(file.path());
        file.restore();
    }
}

TEST(HostileFileTest, ThousandsOfMutationsAllEnd) {
    int refused = 0;
    const auto look = [&refused](const std::string& path) {
        if (outcomeOf(path) != "read") ++refused;
    };
    tryMutations(OTHER_LIBRARY, 1, 3000, look);
    tryMutations(ENGINE, 2, 300, look);
    tryMutations(PLUGIN, 3, 300, look);
    // Neither all nor none: the changes hit what is read.
    EXPECT_GT(refused, 100);
    EXPECT_LT(refused, 3000);
}

TEST(HostileFileTest, MutationsReachTheUserAsPlainText) {
    const auto look = [](const std::string& path) {
        const Outcome outcome = runInProcess({"inspect", path});
        EXPECT_TRUE(outcome.code == 0 || outcome.code == 1) << outcome.code;
        for (const char c : outcome.out + outcome.err)
            ASSERT_TRUE(c == '\n' || (c >= 0x20 && c != 0x7f) || c < 0) << int{c};
        const Outcome json = runInProcess({"inspect", "--json", path});
        EXPECT_TRUE(json.out.empty() || Json::accept(json.out));
    };
    tryMutations(OTHER_LIBRARY, 4, 200, look);
}

}  // namespace
}  // namespace cli
