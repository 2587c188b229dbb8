// Replacers that several threads use, and a storage that comes back to the replacer it is asked by.
#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "framework/AddressReplacer.h"
#include "framework/HostServicePointers.h"
#include "framework/ParameterReplacer.h"
#include "tests/support/FakeStorage.h"

namespace {

using testing_support::StorageContents;
using Pairs = std::vector<std::pair<int, int>>;

/// Does something once, in the middle of its next call: what another thread could do there. A
/// replacer that held a lock meanwhile would never come back.
class IntrudingStorage final : public testing_support::StorageOperations<IPermanentStorage> {
  public:
    using StorageOperations::StorageOperations;
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "IPermanentStorage") ? this : nullptr;
    }
    const char* GetImpName() const override { return "IntrudingStorage"; }

    void beforeNextWrite(std::function<void()> action) { beforeWrite_ = std::move(action); }
    void afterNextRead(std::function<void()> action) { afterRead_ = std::move(action); }

    void writeString(const char* section, const char* key, const char* value) override {
        run(beforeWrite_);
        StorageOperations::writeString(section, key, value);
    }
    void writeInt(const char* section, const char* key, int value) override {
        run(beforeWrite_);
        StorageOperations::writeInt(section, key, value);
    }
    const char* readString(const char* section, const char* key) override {
        const char* value = StorageOperations::readString(section, key);
        kept_ = value;
        run(afterRead_);
        return kept_.c_str();
    }
    int readInt(const char* section, const char* key) override {
        const int value = StorageOperations::readInt(section, key);
        run(afterRead_);
        return value;
    }

  private:
    static void run(std::function<void()>& action) {
        if (action) std::exchange(action, nullptr)();
    }

    std::function<void()> beforeWrite_;
    std::function<void()> afterRead_;
    std::string kept_;
};

class ReplacerThreadsTest : public testing::Test {
  protected:
    ReplacerThreadsTest() {
        piPermanentStorage = &storage_;
        parameters_.setSection("MRTU");
    }
    ~ReplacerThreadsTest() override { piPermanentStorage = nullptr; }

    static ParameterReplacer::Variant number(int value) {
        ParameterReplacer::Variant variant;
        variant.type = ParameterReplacer::Integer;
        variant.intValue = value;
        return variant;
    }
    int baud() {
        int value = 0;
        parameters_.get("baud", -1, 1200, value);
        return value;
    }
    std::string stored(const std::string& key) const { return contents_.describe("MRTU", key); }

    /// Runs the work in `count` threads at once, each told its number, on a storage for threads.
    void inThreads(int count, const std::function<void(int)>& work) {
        piPermanentStorage = &threadedStorage_;
        std::vector<std::thread> threads;
        for (int number = 0; number < count; ++number)
            threads.emplace_back(work, number);
        for (std::thread& thread : threads)
            thread.join();
    }

    StorageContents contents_;
    IntrudingStorage storage_{contents_};
    testing_support::FakeStorage threadedStorage_{contents_};
    ParameterReplacer parameters_;
    AddressReplacerID addresses_;
};

TEST_F(ReplacerThreadsTest, ValueSetWhileTheStorageIsAskedWins) {
    contents_.put("MRTU", "baud", 9600);
    storage_.afterNextRead([this] { parameters_.set("baud", number(38400)); });
    EXPECT_EQ(38400, baud());
    EXPECT_EQ(38400, baud());
}

TEST_F(ReplacerThreadsTest, LaterParameterWinsInMemoryAndInTheStorage) {
    storage_.beforeNextWrite([this] { parameters_.store({{"baud", number(38400)}}); });
    parameters_.store({{"baud", number(9600)}});
    EXPECT_EQ(38400, baud());
    EXPECT_EQ("int:38400", stored("baud"));
}

TEST_F(ReplacerThreadsTest, LaterAddressWinsInMemoryAndInTheStorage) {
    storage_.beforeNextWrite([this] { addresses_.setValue(5, 9, "MRTU"); });
    addresses_.setValue(5, 7, "MRTU");
    EXPECT_EQ(9, addresses_.replacementOf(5));
    EXPECT_EQ("text:9", stored("tempNode5"));
}

TEST_F(ReplacerThreadsTest, AddressSetWhileTheStoredOnesAreRestoredWins) {
    contents_.put("MRTU", "tempNode5", std::string("7"));
    storage_.afterNextRead([this] { addresses_.setValue(5, 9, "MRTU"); });
    addresses_.restore("MRTU");
    EXPECT_EQ(9, addresses_.replacementOf(5));
    EXPECT_EQ("text:9", stored("tempNode5"));
}

TEST_F(ReplacerThreadsTest, AddressOnItsWayToTheStorageSurvivesARestore) {
    contents_.put("MRTU", "tempNode5", std::string("7"));
    storage_.beforeNextWrite([this] { addresses_.restore("MRTU"); });
    addresses_.setValue(5, 9, "MRTU");
    EXPECT_EQ(9, addresses_.replacementOf(5));
    EXPECT_EQ("text:9", stored("tempNode5"));
}

TEST_F(ReplacerThreadsTest, FirstLookUpsOfManyNodesAgree) {
    contents_.put("MRTU", "node7_ModiconMode", true);
    std::atomic<int> wrong = 0;
    inThreads(8, [this, &wrong](int thread) {
        for (int node = 1; node <= 247; ++node) {
            bool first = false;
            bool again = false;
            parameters_.get("ModiconMode", node, thread % 2 == 0, first);
            parameters_.get("ModiconMode", node, thread % 2 != 0, again);
            if (first != again || (node == 7 && !first)) ++wrong;
        }
    });
    EXPECT_EQ(0, wrong);
}

TEST_F(ReplacerThreadsTest, AddressesAreSetListedAndLookedUpAtOnce) {
    std::atomic<int> wrong = 0;
    inThreads(8, [this, &wrong](int thread) {
        for (int round = 0; round < 100; ++round) {
            const int node = thread * 100 + round;
            addresses_.setValue(node, node + 1, "MRTU");
            if (addresses_.replacementOf(node) != node + 1) ++wrong;
            if (round % 20 == 0) addresses_.restore("MRTU");
            for (const auto& [listed, replacement] : addresses_.replacements())
                if (replacement != listed + 1) ++wrong;
        }
    });
    EXPECT_EQ(0, wrong);
    EXPECT_EQ(800U, addresses_.replacements().size());
}

TEST_F(ReplacerThreadsTest, ParametersAreStagedAndTakenOverAtOnce) {
    GroupParameterReplacer staging;
    std::atomic<int> wrong = 0;
    inThreads(4, [&](int thread) {
        for (int round = 0; round < 200; ++round) {
            staging.set("baud", -1, thread * 1000 + round);
            int found = -1;
            if (!staging.get("baud", -1, found) || found < 0) ++wrong;
            for (const auto& [key, staged] : staging.staged())
                parameters_.store({{staged.name, number(staged.intValue)}});
        }
    });
    EXPECT_EQ(0, wrong);
    EXPECT_EQ("int:" + std::to_string(baud()), stored("baud"));
}

}  // namespace
