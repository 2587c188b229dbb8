// The command on the line of each slave that other people wrote.
#pragma once

#include <gtest/gtest.h>

#include <memory>

#include "OtherSlaves.h"
#include "RunProgram.h"

namespace peers {

inline constexpr int kNode = 3;

struct Peer {
    const char* name;
    const char* mode;
    std::unique_ptr<OtherSlave> (*make)();
};

inline void PrintTo(const Peer& peer, std::ostream* out) {
    *out << peer.name;
}

inline const Peer kPeers[] = {
    {"libmodbusRtu", "RTU",
     []() -> std::unique_ptr<OtherSlave> { return std::make_unique<LibmodbusSlave>(kNode); }},
    {"pymodbusRtu", "RTU",
     []() -> std::unique_ptr<OtherSlave> { return std::make_unique<PymodbusSlave>("rtu", kNode); }},
    {"pymodbusAscii", "ASCII",
     []() -> std::unique_ptr<OtherSlave> {
         return std::make_unique<PymodbusSlave>("ascii", kNode);
     }},
};

class OtherSlavesTest : public testing::TestWithParam<Peer> {
  protected:
    /// Runs `mrtu` on the slave's line; `more` begins with the sub-command.
    ProgramResult mrtu(const std::vector<std::string>& more) const {
        // Of an item that is set twice the first counts.
        std::vector<std::string> words{MRTU_COMMAND};
        words.insert(words.end(), more.begin(), more.end());
        for (const std::string& item : {std::string("timeout=10000"), std::string("bits=8"),
                                        std::string("txMode=") + GetParam().mode})
            words.insert(words.end(), {"--set", item});
        words.insert(words.end(), {"--port", slave_->port(), "--storage", "none"});
        return runProgram(words);
    }

    std::unique_ptr<OtherSlave> slave_ = GetParam().make();
};

inline std::string nameOf(const testing::TestParamInfo<Peer>& peer) {
    return peer.param.name;
}

}  // namespace peers
