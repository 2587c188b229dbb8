// The driver's and the engine's own work for one kind of request, for instruction counters.
//
//   driver_work KIND ROUNDS   the same request so often, on a port that answers at once
//
// What a round costs is the difference between two runs, divided by the difference of their rounds.
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string_view>
#include <vector>

#include "bench/StartedDriver.h"
#include "tests/support/FixedReplyPort.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;

struct Work {
    std::string_view kind;
    const char* tag;
    std::size_t valueBytes;
    bool write;
    Bytes reply;  // without its check
};

Bytes readReply(unsigned char function, std::size_t bytes) {
    Bytes reply{1, function, static_cast<unsigned char>(bytes)};
    for (std::size_t index = 0; index < bytes; ++index)
        reply.push_back(static_cast<unsigned char>(7 * index));
    return reply;
}

const std::vector<Work>& works() {
    static const std::vector<Work> rows{
        {"read-1-register", "1?HREG?400001?unsignedShort", 2, false, readReply(3, 2)},
        {"read-125-registers", "1?HREG?400001?unsignedShort-125", 250, false, readReply(3, 250)},
        {"read-2000-coils", "1?OUTP?1?boolean-2000", 2000, false, readReply(1, 250)},
        {"read-2000-coils-at-4", "1?OUTP?4?boolean-2000", 2000, false, readReply(1, 250)},
        {"write-123-registers",
         "1?HREG?400001?unsignedShort-123",
         246,
         true,
         {1, 16, 0, 0, 0, 123}},
        {"write-1968-coils", "1?OUTP?1?boolean-1968", 1968, true, {1, 15, 0, 0, 0x07, 0xB0}},
    };
    return rows;
}

void run(const Work& work, long rounds) {
    testing_support::FixedReplyPort port(testing_support::rtuFrame(work.reply));
    bench::OnePort serial(port);
    bench::StartedDriver driver(serial, bench::configuration());
    const ITag* tag = driver.tag(work.tag);
    std::vector<unsigned char> value(work.valueBytes);
    for (long round = 0; round < rounds; ++round) {
        const int done = work.write ? driver.protocol().Write(tag, value.data())
                                    : driver.protocol().Read(tag, value.data());
        if (done == 0) throw std::runtime_error(driver.protocol().GetLastErrorString());
    }
}

}  // namespace

int main(int argc, char** argv) {
    if (argc == 2 && std::string_view(argv[1]) == "--list") {
        for (const Work& work : works())
            std::printf("%s\n", work.kind.data());
        return 0;
    }
    if (argc == 3)
        for (const Work& work : works())
            if (work.kind == argv[1]) return run(work, std::atol(argv[2])), 0;
    std::fputs("usage: driver_work KIND ROUNDS | --list\n", stderr);
    return 2;
}
