// What every master of the comparison does, and what it tells of itself.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace bench {

/// One kind of transaction with node 1. Registers and coils count from 0.
struct Work {
    std::string_view name;
    enum Kind : std::uint8_t { ReadRegisters, ReadCoils, WriteRegisters } kind;
    int address;
    int count;
};

/// @return null when there is no such work.
const Work* findWork(std::string_view name);

/// What is written: register `index` gets this.
constexpr std::uint16_t valueToWrite(int index) {
    return static_cast<std::uint16_t>(40000 + 7 * index);
}

/// The command line of a master: PORT BAUD WORK COUNT WAITING [more].
struct Task {
    std::string port;
    int baud;
    Work work;
    long count;
    std::string waiting;  ///< The master's own word for what it waits for between two requests.
};

/// Errors: std::invalid_argument.
Task taskFrom(const std::vector<std::string>& arguments);

/// One transaction; the values read, one for each register or coil, replace `values`.
/// @return false when it failed.
using Transact = std::function<bool(std::vector<std::uint16_t>& values)>;

/// Does the work `count` times and prints one line: transactions, lost ones, wrong ones (whose
/// values are not those of the first), nanoseconds of CPU, of time, voluntary context switches, and
/// the values' check sum, the written ones as `readBack` finds them.
/// @return what main() returns.
int measure(const Task& task, const Transact& transact, const Transact& readBack);

}  // namespace bench
