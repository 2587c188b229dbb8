// Files of every kind: reading ends, whatever a name stands for.
#include "settings/FileReader.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "posix/FileDescriptor.h"
#include "settings/TextError.h"

namespace settings {
namespace {

constexpr FileLimits kSmall{.bytes = 8, .silence = std::chrono::milliseconds(1)};
constexpr FileLimits kPatient{.bytes = 8, .silence = std::chrono::seconds(60)};

class FileReaderTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string name = testing::TempDir() + "file_reader_XXXXXX";
        ASSERT_NE(nullptr, mkdtemp(name.data()));
        folder_ = name;
    }
    void TearDown() override { std::filesystem::remove_all(folder_); }

    std::string store(const std::string& text) const {
        std::ofstream(folder_ / "file", std::ios::binary) << text;
        return (folder_ / "file").string();
    }
    std::string pipe() const {
        const std::string path = (folder_ / "pipe").string();
        EXPECT_EQ(0, mkfifo(path.c_str(), 0600));
        return path;
    }

  private:
    std::filesystem::path folder_;
};

std::string reasonOf(const std::string& path, const FileLimits& limits) {
    try {
        readFile(path, limits);
    } catch (const FileError& error) {
        return error.what();
    }
    return "read";
}

std::string refusalOf(const std::string& path, const FileLimits& limits) {
    try {
        readText("configuration", path, limits);
    } catch (const TextError& error) {
        return error.what();
    }
    return "read";
}

TEST_F(FileReaderTest, TakesEveryByteUpToTheLimit) {
    EXPECT_EQ("", readFile(store(""), kSmall));
    EXPECT_EQ("12345678", readFile(store("12345678"), kSmall));
    EXPECT_EQ(std::string("\0a", 2), readFile(store(std::string("\0a", 2)), kSmall));
    EXPECT_EQ("longer than 8 bytes", reasonOf(store("123456789"), kSmall));
}

TEST_F(FileReaderTest, EndlessDevicesAreCutOff) {
    EXPECT_EQ("longer than 1 MiB", reasonOf("/dev/zero", {.bytes = kConfigBytes}));
    EXPECT_EQ("longer than 8 bytes", reasonOf("/dev/urandom", kSmall));
    EXPECT_EQ("", readFile("/dev/null", kSmall));
}

TEST_F(FileReaderTest, WhatCannotBeReadSaysWhy) {
    EXPECT_EQ("No such file or directory", reasonOf("/nowhere/at/all", kSmall));
    EXPECT_EQ("Is a directory", reasonOf("/", kSmall));
    EXPECT_EQ("No such file or directory", reasonOf("", kSmall));
}

TEST_F(FileReaderTest, PipeWithoutWriterIsGivenUp) {
    EXPECT_EQ("nothing came for 0.001 s", reasonOf(pipe(), kSmall));
}

TEST_F(FileReaderTest, PipeThatIsNeverClosedIsGivenUp) {
    const std::string path = pipe();
    const posix::FileDescriptor both(open(path.c_str(), O_RDWR | O_CLOEXEC));
    ASSERT_EQ(3, write(both.get(), "abc", 3));
    EXPECT_EQ("nothing came for 0.001 s", reasonOf(path, kSmall));
}

TEST_F(FileReaderTest, PipeIsReadToItsEnd) {
    // As a shell's <(command) hands it over.
    int ends[2];
    ASSERT_EQ(0, ::pipe2(ends, O_CLOEXEC));
    const posix::FileDescriptor out(ends[0]);
    {
        const posix::FileDescriptor in(ends[1]);
        ASSERT_EQ(3, write(in.get(), "abc", 3));
    }
    EXPECT_EQ("abc", readFile("/dev/fd/" + std::to_string(out.get()), kPatient));
}

TEST_F(FileReaderTest, OnlyRegularFilesAreOpenedToLookInto) {
    EXPECT_TRUE(openRegularFile(store("a")));
    const auto reason = [](const std::string& path) -> std::string {
        try {
            openRegularFile(path);
        } catch (const FileError& error) {
            return error.what();
        }
        return "opened";
    };
    EXPECT_EQ("not a regular file", reason("/dev/zero"));
    EXPECT_EQ("not a regular file", reason("/"));
    EXPECT_EQ("not a regular file", reason(pipe()));
    EXPECT_EQ("No such file or directory", reason("/nowhere/at/all"));
}

TEST_F(FileReaderTest, TextForTheDriverHoldsNoZero) {
    const std::string path = store(std::string("a\0b", 3));
    EXPECT_EQ("configuration " + path + ": holds a zero byte", refusalOf(path, kSmall));
    EXPECT_EQ("configuration /: Is a directory", refusalOf("/", kSmall));
    EXPECT_EQ("ab", readText("configuration", store("ab"), kSmall));
}

}  // namespace
}  // namespace settings
