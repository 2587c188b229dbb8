// The client of pymodbus against the simulator, in both modes.
#include <gtest/gtest.h>

#include <string>

#include "RunProgram.h"
#include "sim/Simulator.h"

namespace {

using sim::Area;

// Debian's own interpreter: it is the one that sees Debian's python3-pymodbus.
constexpr const char* kPython = "/usr/bin/python3";

class SimPymodbusTest : public testing::TestWithParam<std::pair<wire::Mode, const char*>> {};

TEST_P(SimPymodbusTest, EveryFunctionCodeAgrees) {
    const auto installed = peers::runProgram({kPython, "-c", "import pymodbus.client"});
    ASSERT_EQ(0, installed.exitCode)
        << "pymodbus is missing: apt-get install python3-pymodbus python3-serial-asyncio\n"
        << installed.output;

    const auto [mode, name] = GetParam();
    sim::Simulator simulator({.mode = mode, .nodes = {{.address = 7}}});
    simulator.start();
    const std::string script = PEERS_DIRECTORY "/pymodbus_client.py";
    const auto result = peers::runProgram({kPython, script, name, simulator.path(), "7"});
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ(
        "coils 1 0 0 1 0 0 1 0 0\n"
        "inputs 0 0 0 1 1 0 0 0 1\n"
        "holding 7005 7006 7007\n"
        "input 37005 37006 37007\n"
        "coil written\n"
        "register written\n"
        "coils written\n"
        "registers written\n"
        "back 7200 1 65535 256 7204\n"
        "beyond 2\n",
        result.output);
    EXPECT_EQ(1U, simulator.slave().get(7, Area::Coil, 100));
    EXPECT_EQ(4711U, simulator.slave().get(7, Area::HoldingRegister, 100));
    EXPECT_EQ(1U, simulator.slave().get(7, Area::Coil, 201));
    EXPECT_EQ(0U, simulator.slave().get(7, Area::Coil, 202));
    EXPECT_EQ(1U, simulator.slave().get(7, Area::Coil, 203));
}

INSTANTIATE_TEST_SUITE_P(Modes, SimPymodbusTest,
                         testing::Values(std::pair{wire::Mode::Rtu, "rtu"},
                                         std::pair{wire::Mode::Ascii, "ascii"}),
                         [](const auto& each) { return std::string(each.param.second); });

}  // namespace
