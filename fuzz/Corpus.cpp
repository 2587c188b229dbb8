// Feeds a fuzz target with a fixed sequence of pseudo random inputs and mutated seeds.
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

const std::vector<std::string> seeds{
    "1?HREG?400010.3?unsignedShort-4(swap2,bcd)",
    "CfgVer=1 defNodeId=1 uart=com1 baudrate=9600 parity=even bits=8 stopbits=1 mode=RS-485 "
    "Node3::timeout=500 Node3::model=3",
    std::string("\x01\x03\x02\x03\xF1\x79\x30", 7),
    ":010302002AD0\r\n",
    "name,uri,period,scale,decimals,low\r\na,\"1?A?2?float(swap2,swap4)\",2s,0.1,1,-5\n# "
    "b\nc,d,,,,\n",
};

constexpr int kRounds = 20000;

}  // namespace

int main() {
    std::minstd_rand random(1);
    for (int round = 0; round < kRounds; ++round) {
        std::string input = seeds[random() % seeds.size()];
        for (auto changes = random() % 8; changes > 0 && !input.empty(); --changes)
            input[random() % input.size()] = static_cast<char>(random() & 0xFF);
        if (random() % 4 == 0) input.resize(random() % 600, static_cast<char>(random() & 0xFF));
        LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(input.data()), input.size());
    }
    std::printf("%d inputs\n", kRounds);
}
