// What is read out of real files.
#include "cli/inspect/Inspection.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "cli/ExitCode.h"
#include "tests/unit/cli/inspect/SampleFiles.h"

namespace cli {
namespace {

std::string refusalOf(const std::string& file) {
    try {
        inspect(file);
    } catch (const CommandError& error) {
        return error.what();
    }
    return "accepted";
}

const NeededLibrary* needed(const Inspection& found, const std::string& name) {
    for (const NeededLibrary& library : found.needed)
        if (library.name == name) return &library;
    return nullptr;
}

TEST(InspectionTest, PluginBesideItsEngineIsComplete) {
    const Inspection found = inspect(PLUGIN);
    EXPECT_TRUE(found.runsHere);
    EXPECT_TRUE(found.hasEntry);
    EXPECT_TRUE(found.isComplete()) << ::testing::PrintToString(found.missing);
    EXPECT_TRUE(found.glibc.starts_with("2.")) << found.glibc;
    EXPECT_TRUE(found.descriptionHeader.starts_with("Name=MRTU?FullName=Modbus RTU?Version="))
        << found.descriptionHeader;
    ASSERT_NE(nullptr, needed(found, "libprotgen.so"));
    EXPECT_EQ(ENGINE, needed(found, "libprotgen.so")->file);
}

TEST(InspectionTest, PluginAloneMissesItsEngine) {
    const SampleFiles files;
    const Inspection found = inspect(files.copyOf(PLUGIN));
    EXPECT_TRUE(found.hasEntry);
    EXPECT_FALSE(found.isComplete());
    ASSERT_NE(nullptr, needed(found, "libprotgen.so"));
    EXPECT_EQ(std::nullopt, needed(found, "libprotgen.so")->file);
    EXPECT_EQ(1, std::count(found.missing.begin(), found.missing.end(),
                            "ProtgenProtocol::GetNodeID(ITag const*) const"));
    EXPECT_TRUE(std::all_of(
        found.missing.begin(), found.missing.end(),
        [](const std::string& name) { return name.find("Protgen") != std::string::npos; }))
        << ::testing::PrintToString(found.missing);
}

TEST(InspectionTest, EngineBesideIsFound) {
    const SampleFiles files;
    const std::string engine = files.copyOf(ENGINE);
    const Inspection found = inspect(files.copyOf(PLUGIN));
    EXPECT_TRUE(found.isComplete()) << ::testing::PrintToString(found.missing);
    EXPECT_EQ(engine, needed(found, "libprotgen.so")->file);
}

TEST(InspectionTest, EngineForAnotherArchitectureIsNotTheOne) {
    const SampleFiles files;
    files.foreignCopyOf(ENGINE);
    const Inspection found = inspect(files.copyOf(PLUGIN));
    EXPECT_EQ(std::nullopt, needed(found, "libprotgen.so")->file);
    EXPECT_FALSE(found.isComplete());
}

TEST(InspectionTest, AnotherLibraryHasNoEntry) {
    const Inspection found = inspect(OTHER_LIBRARY);
    EXPECT_FALSE(found.hasEntry);
    EXPECT_FALSE(found.isComplete());
    EXPECT_EQ("", found.descriptionHeader);
}

TEST(InspectionTest, ForeignFileIsReadAllTheSame) {
    const SampleFiles files;
    const Inspection found = inspect(files.foreignCopyOf(PLUGIN));
    EXPECT_FALSE(found.runsHere);
    EXPECT_EQ("64-bit ARM", architectureText(found.architecture));
    EXPECT_TRUE(found.hasEntry);
    EXPECT_TRUE(found.descriptionHeader.starts_with("Name=MRTU?")) << found.descriptionHeader;
}

TEST(InspectionTest, WhatIsNoLibraryIsRefused) {
    const SampleFiles files;
    EXPECT_EQ("/nonexistent.so: No such file or directory", refusalOf("/nonexistent.so"));
    EXPECT_EQ("/etc/passwd: not an ELF file", refusalOf("/etc/passwd"));
    EXPECT_EQ("/tmp: not a regular file", refusalOf("/tmp"));
    const std::string empty = files.beginningOf(ENGINE, 0);
    EXPECT_EQ(empty + ": not an ELF file", refusalOf(empty));
}

TEST(InspectionTest, TruncatedFilesNeitherCrashNorCount) {
    const auto whole = std::filesystem::file_size(PLUGIN);
    for (std::uintmax_t length = 1; length < whole; length = length * 3 / 2 + 1) {
        const SampleFiles files;
        const std::string part = files.beginningOf(PLUGIN, length);
        try {
            EXPECT_FALSE(inspect(part).isComplete()) << length;
        } catch (const CommandError&) {
            // A refusal is as good.
        }
    }
}

}  // namespace
}  // namespace cli
