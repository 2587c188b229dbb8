#include "cli/override/OverrideStorage.h"

#include <gtest/gtest.h>

#include <sstream>

#include "runtime/Storage.h"

namespace {

using cli::overrideFault;
using runtime::StoredValue;

struct Row {
    const char* key;
    StoredValue value;
    const char* fault;
};

TEST(OverrideStorageTest, OutOfItsRangeIsRefused) {
    const Row rows[] = {
        {"tempNode5", std::string("0"), ""},
        {"tempNode5", std::string("255"), ""},
        {"tempNode5", std::string("256"), "'256' is no address from 0 to 255"},
        {"tempNode5", std::string("-1"), "'-1' is no address from 0 to 255"},
        {"tempNode5", std::string(""), "'' is no address from 0 to 255"},
        {"tempNode5", std::string("7x"), "'7x' is no address from 0 to 255"},
        {"tempNode5", std::string("99999999999999999999"),
         "'99999999999999999999' is no address from 0 to 255"},
        {"tempNode0x0A", std::string("017"), ""},
        {"tempNode19999", std::string("1"), ""},
        {"tempNode", std::string("1"), "'' is no node"},
        {"tempNode-1", std::string("1"), "'-1' is no node"},
        {"tempNode5a", std::string("1"), "'5a' is no node"},
        {"node5_ModiconMode", true, ""},
        {"node5_ModiconMode", 2, "'2' is neither 0 nor 1"},
        {"node5_ModiconMode", std::string("false"), ""},
        {"baud", 19200, ""},
        {"baud", 14400, "'14400' is no baud"},
        {"baud", 0, "'0' is no baud"},
        {"baud", std::string("fast"), "'fast' is no baud"},
        {"parity", 4, ""},
        {"parity", 5, "'5' is no parity"},
        {"stop", 2, ""},
        {"stop", 0, "'0' is no stop"},
        {"mode", 2, ""},
        {"mode", 3, "'3' is no mode"},
        {"mode", -1, "'-1' is no mode"},
        {"somethingElse", -1, ""},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(row.fault, overrideFault(row.key, row.value))
            << row.key << " = " << runtime::storedText(row.value);
    }
}

/// Keeps everything from its readers.
class DistrustedStorage final : public runtime::Storage {
  public:
    explicit DistrustedStorage(int count) : count_(count) {}
    std::vector<runtime::UnusedEntry> unused(const std::string& section) override {
        std::vector<runtime::UnusedEntry> all;
        for (int i = 0; i < count_; ++i)
            all.push_back({section + std::to_string(i), "why"});
        return all;
    }

    void writeString(const char*, const char*, const char*) override {}
    void writeBool(const char*, const char*, bool) override {}
    void writeInt(const char*, const char*, int) override {}
    const char* readString(const char*, const char*) override { return ""; }
    bool readBool(const char*, const char*) override { return false; }
    int readInt(const char*, const char*) override { return 0; }
    int hasKey(const char*, const char*) override { return 0; }
    void removeKey(const char*, const char*) override {}
    int keyCount(const char*) override { return 0; }
    const char* keyName(const char*, int) override { return ""; }
    int readStringInto(const char*, const char*, char*, int) override { return 0; }
    int keyNameInto(const char*, int, char*, int) override { return 0; }
    bool failed() const override { return false; }
    std::string lastError() const override { return {}; }
    void clearFailure() override {}
    std::vector<std::string> sections() override { return {}; }
    std::vector<runtime::StoredEntry> entries(const std::string&) override { return {}; }
    void* ConvertTo(const char*) override { return nullptr; }
    const char* GetImpName() const override { return "DistrustedStorage"; }
    int GetImpVersion() const override { return 100; }

  private:
    int count_;
};

std::string reportOn(int count) {
    std::ostringstream out;
    std::ostringstream err;
    cli::CommandContext context{
        .out = out, .err = err, .exitCode = cli::ExitCode::Done, .pluginOption = {}};
    DistrustedStorage storage(count);
    cli::reportUnused(context, storage, "key");
    return err.str();
}

TEST(OverrideStorageTest, ThatIsNotUsedIsReported) {
    EXPECT_EQ("", reportOn(0));
    EXPECT_EQ(
        "mrtu: stored override key0 is not used: why\n"
        "mrtu: 'mrtu override clear' takes out what is not used\n",
        reportOn(1));
    EXPECT_NE(std::string::npos, reportOn(12).find("key9 is not used: why\nmrtu: 2 more are not"));
}

}  // namespace
