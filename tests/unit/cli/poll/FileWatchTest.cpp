// Files that change, vanish and come back.
#include "cli/poll/FileWatch.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace {

using cli::FileWatch;

class FileWatchTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = testing::TempDir() + "watchXXXXXX";
        folder_ = mkdtemp(pattern.data());
        path_ = folder_ + "/tags.csv";
        write(path_, "one");
    }
    void TearDown() override { std::filesystem::remove_all(folder_); }
    static void write(const std::string& path, const std::string& text) {
        std::ofstream(path) << text;
    }

    std::string folder_;
    std::string path_;
};

TEST_F(FileWatchTest, TellsAChangeOnce) {
    FileWatch watch({"", path_});
    EXPECT_FALSE(watch.changed());
    write(path_, "longer");
    EXPECT_EQ(path_, watch.changed());
    EXPECT_FALSE(watch.changed());
}

TEST_F(FileWatchTest, SeesAnotherFileOfTheSameSizeUnderTheName) {
    FileWatch watch({path_});
    write(folder_ + "/new", "two");
    std::filesystem::rename(folder_ + "/new", path_);
    EXPECT_EQ(path_, watch.changed());
}

TEST_F(FileWatchTest, SeesThatAFileVanishesAndComesBack) {
    FileWatch watch({path_});
    std::filesystem::remove(path_);
    EXPECT_EQ(path_, watch.changed());
    EXPECT_FALSE(watch.changed());
    write(path_, "one");
    EXPECT_EQ(path_, watch.changed());
}

TEST_F(FileWatchTest, TellsWhichFileChangedWhileItWasRead) {
    FileWatch watch({path_});
    watch.beginReading();
    EXPECT_FALSE(watch.tornFile());
    write(path_, "changed");
    EXPECT_EQ(path_, watch.tornFile());
    watch.beginReading();
    EXPECT_FALSE(watch.tornFile());
    std::filesystem::remove(path_);
    EXPECT_EQ(path_, watch.tornFile());
}

}  // namespace
