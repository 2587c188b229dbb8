#include <gtest/gtest.h>

#include "sim/Fault.h"

namespace sim {
namespace {

struct TextCase {
    const char* text;
    Fault fault;
};

TEST(FaultTextTest, ReadsEveryPart) {
    for (const TextCase& each : {
             TextCase{"silent", {.silent = true}},
             TextCase{"silent,times=3", {.times = 3, .silent = true}},
             TextCase{"exception=2", {.exception = 2}},
             TextCase{"node", {.wrongNode = true}},
             TextCase{"check", {.wrongCheck = true}},
             TextCase{"keep=0", {.keep = 0}},
             TextCase{"send=0103FF", {.replacement = wire::Bytes{0x01, 0x03, 0xFF}}},
             TextCase{"noise=00", {.noise = {0x00}}},
             TextCase{"delay=200", {.delayMs = 200}},
             TextCase{"drip=1/50", {.dripBytes = 1, .dripGapMs = 50}},
             TextCase{"hangup,keep=4", {.keep = 4, .hangUp = true}},
             TextCase{"for=247,check,delay=5", {.node = 247, .wrongCheck = true, .delayMs = 5}},
         }) {
        std::string error;
        const auto fault = parseFault(each.text, error);
        ASSERT_TRUE(fault) << each.text << ": " << error;
        EXPECT_EQ(each.fault, *fault) << each.text;
        EXPECT_EQ("", error) << each.text;
    }
}

TEST(FaultTextTest, RefusesWithThePartInTheMessage) {
    for (const auto& [text, part] : {
             std::pair{"", ""},
             std::pair{"silence", "silence"},
             std::pair{"silent=1", "silent=1"},
             std::pair{"silent,", ""},
             std::pair{"delay", "delay"},
             std::pair{"delay=", "delay="},
             std::pair{"check,delay=-1", "delay=-1"},
             std::pair{"delay=1x", "delay=1x"},
             std::pair{"delay=3600001", "delay=3600001"},
             std::pair{"exception=0", "exception=0"},
             std::pair{"exception=256", "exception=256"},
             std::pair{"times=0", "times=0"},
             std::pair{"for=0", "for=0"},
             std::pair{"drip=1", "drip=1"},
             std::pair{"drip=0/5", "drip=0/5"},
             std::pair{"drip=1/5/6", "drip=1/5/6"},
             std::pair{"noise=0", "noise=0"},
             std::pair{"noise=0G", "noise=0G"},
             std::pair{"send=ff", "send=ff"},
         }) {
        std::string error;
        EXPECT_FALSE(parseFault(text, error)) << text;
        EXPECT_EQ(std::string("not a fault: \"") + part +
                      "\"; the faults are silent, node, check, hangup, exception=, keep=, "
                      "send=, noise=, delay=, drip=, times=, for=",
                  error)
            << text;
    }
}

}  // namespace
}  // namespace sim
