// The one slave of the comparison, node 1 on a pseudo terminal.
//
//   peers_slave BAUD   prints the line's path and serves until its standard input ends
//
// With 0 baud nothing takes time: what is left is the masters' own work. Else characters leave at
// the line's speed, and the slave keeps 3.5 characters of silence before it replies.
#include <cstdio>
#include <cstdlib>
#include <exception>

#include "sim/Simulator.h"

int main(int count, char** arguments) {
    if (count != 2) return std::fputs("usage: peers_slave BAUD\n", stderr), 2;
    try {
        sim::SimulatorOptions options;
        options.nodes = {{.address = 1}};
        options.rate = {.baud = std::atoi(arguments[1]), .characterBits = 1 + 8 + 1};
        options.logLimit = 0;
        sim::Simulator simulator(options);
        for (std::uint32_t coil = 0; coil < 2000; ++coil)
            simulator.slave().set(1, sim::Area::Coil, coil, coil % 3 == 0 ? 1 : 0);
        simulator.start();
        std::printf("%s\n", simulator.path().c_str());
        std::fflush(stdout);
        while (std::getchar() != EOF) {
        }
        return 0;
    } catch (const std::exception& error) {
        return std::fprintf(stderr, "peers_slave: %s\n", error.what()), 2;
    }
}
