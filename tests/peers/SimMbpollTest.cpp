// The command-line client mbpoll against the simulator.
#include <gtest/gtest.h>

#include <map>
#include <regex>

#include "RunProgram.h"
#include "sim/Simulator.h"

namespace {

using sim::Area;

constexpr std::uint8_t kNode = 3;

/// What mbpoll names the areas.
constexpr const char* kCoil = "0";
constexpr const char* kDiscreteInput = "1";
constexpr const char* kInputRegister = "3";
constexpr const char* kHoldingRegister = "4";

class SimMbpollTest : public testing::Test {
  protected:
    void SetUp() override {
        ASSERT_EQ(0, peers::runProgram({"mbpoll", "-V"}).exitCode)
            << "the program mbpoll is missing: apt-get install mbpoll";
        simulator.start();
    }

    /// One poll of one node, first address 0, time-out 10 s.
    peers::ProgramResult mbpoll(const char* area, const std::vector<std::string>& more,
                                const std::vector<std::string>& values = {}) {
        std::vector<std::string> words{"mbpoll", "-m", "rtu", "-P", "none", "-0", "-1",
                                       "-o",     "10", "-a",  "3",  "-t",   area};
        words.insert(words.end(), more.begin(), more.end());
        words.push_back(simulator.path());
        words.insert(words.end(), values.begin(), values.end());
        return peers::runProgram(words);
    }

    /// The values of lines such as "[5]:   1005", by address.
    static std::map<int, int> valuesIn(const std::string& output) {
        static const std::regex line(R"(\[(\d+)\]:\s+(\d+))");
        std::map<int, int> values;
        for (std::sregex_iterator found(output.begin(), output.end(), line), end; found != end;
             ++found) {
            values[std::stoi((*found)[1])] = std::stoi((*found)[2]);
        }
        return values;
    }

    int functionOfFirstRequest() const { return simulator.log().at(0).raw.at(1); }
    std::uint32_t item(Area area, std::uint32_t address) const {
        return simulator.slave().get(kNode, area, address);
    }

    sim::Simulator simulator{{.nodes = {{.address = kNode}}}};
};

TEST_F(SimMbpollTest, Function1ReadsCoils) {
    const auto result = mbpoll(kCoil, {"-r", "5", "-c", "4"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ((std::map<int, int>{{5, 0}, {6, 1}, {7, 0}, {8, 0}}), valuesIn(result.output))
        << result.output;
    EXPECT_EQ(1, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function2ReadsDiscreteInputs) {
    const auto result = mbpoll(kDiscreteInput, {"-r", "5", "-c", "4"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ((std::map<int, int>{{5, 0}, {6, 0}, {7, 1}, {8, 1}}), valuesIn(result.output))
        << result.output;
    EXPECT_EQ(2, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function3ReadsHoldingRegisters) {
    const auto result = mbpoll(kHoldingRegister, {"-r", "0", "-c", "125"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    const auto values = valuesIn(result.output);
    ASSERT_EQ(125U, values.size()) << result.output;
    for (const auto& [address, value] : values)
        EXPECT_EQ(3000 + address, value);
    EXPECT_EQ(3, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function4ReadsInputRegisters) {
    // Above 32767 mbpoll adds the signed value in brackets, behind the unsigned one.
    const auto result = mbpoll(kInputRegister, {"-r", "9998", "-c", "2"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ((std::map<int, int>{{9998, 42998}, {9999, 42999}}), valuesIn(result.output))
        << result.output;
    EXPECT_EQ(4, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function5WritesOneCoil) {
    const auto result = mbpoll(kCoil, {"-r", "5"}, {"1"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ(1U, item(Area::Coil, 5));
    EXPECT_EQ(5, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function6WritesOneRegister) {
    const auto result = mbpoll(kHoldingRegister, {"-r", "5"}, {"4711"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ(4711U, item(Area::HoldingRegister, 5));
    EXPECT_EQ(6, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function15WritesManyCoils) {
    const auto result = mbpoll(kCoil, {"-r", "8"}, {"1", "0", "0", "1", "1", "0", "1", "1", "1"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    const wire::Bytes written{1, 0, 0, 1, 1, 0, 1, 1, 1};
    for (std::uint32_t i = 0; i < written.size(); ++i) {
        EXPECT_EQ(written[i], item(Area::Coil, 8 + i)) << i;
    }
    EXPECT_EQ(15, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, Function16WritesManyRegisters) {
    const auto result = mbpoll(kHoldingRegister, {"-r", "5"}, {"1", "65535", "256"});
    EXPECT_EQ(0, result.exitCode) << result.output;
    EXPECT_EQ(1U, item(Area::HoldingRegister, 5));
    EXPECT_EQ(65535U, item(Area::HoldingRegister, 6));
    EXPECT_EQ(256U, item(Area::HoldingRegister, 7));
    EXPECT_EQ(16, functionOfFirstRequest());
}

TEST_F(SimMbpollTest, AnExceptionReachesThePerson) {
    const auto result = mbpoll(kHoldingRegister, {"-r", "9999", "-c", "2"});
    EXPECT_NE(result.exitCode, 0);
    EXPECT_NE(result.output.find("Illegal data address"), std::string::npos) << result.output;
}

}  // namespace
