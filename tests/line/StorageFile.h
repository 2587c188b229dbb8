// A storage file in a directory of its own, looked at with SQLite itself.
#pragma once

#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <string>

#include "runtime/SqliteStorage.h"

struct StorageFileTest : ::testing::Test {
    StorageFileTest() {
        std::string pattern = ::testing::TempDir() + "storage-XXXXXX";
        folder = ::mkdtemp(pattern.data());
        path = folder + "/overrides.db";
    }
    ~StorageFileTest() override {
        std::error_code ignored;
        std::filesystem::remove_all(folder, ignored);
    }

    /// Opens a storage that must open.
    std::unique_ptr<runtime::SqliteStorage> open() const {
        auto opened = runtime::SqliteStorage::open(path);
        if (!opened) {
            ADD_FAILURE() << opened.error().text;
            return nullptr;
        }
        return std::move(opened).value();
    }

    /// The first column of every row, one line each; the error's text after a failure.
    std::string ask(const std::string& sql) const {
        sqlite3* database = nullptr;
        std::string answer;
        const auto addRow = [](void* text, int, char** columns, char**) {
            *static_cast<std::string*>(text) += std::string(columns[0] ? columns[0] : "") + "\n";
            return 0;
        };
        sqlite3_open(path.c_str(), &database);
        if (sqlite3_exec(database, sql.c_str(), addRow, &answer, nullptr) != SQLITE_OK) {
            answer = sqlite3_errmsg(database);
        }
        sqlite3_close(database);
        return answer;
    }

    static std::string contentOf(const std::string& file) {
        std::ifstream in(file, std::ios::binary);
        return {std::istreambuf_iterator<char>(in), {}};
    }
    /// Key and reason of what is not used, one line each.
    static std::string unusedIn(runtime::SqliteStorage& storage,
                                const std::string& section = "MRTU") {
        std::string text;
        for (const runtime::UnusedEntry& entry : storage.unused(section))
            text += entry.key + ": " + entry.why + '\n';
        return text;
    }
    static unsigned modeOf(const std::string& file) {
        struct stat info {};
        EXPECT_EQ(0, ::stat(file.c_str(), &info)) << file;
        return info.st_mode & 07777u;
    }

    std::string folder;
    std::string path;
};

/// Waits for a child. @return its exit status, or minus the signal that ended it.
inline int endOf(pid_t child) {
    int status = 0;
    EXPECT_EQ(child, ::waitpid(child, &status, 0));
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}
