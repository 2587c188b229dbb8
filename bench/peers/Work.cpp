#include "bench/peers/Work.h"

#include <sys/resource.h>

#include <array>
#include <chrono>
#include <cstdio>
#include <stdexcept>

namespace bench {

namespace {

// What is written must not change what is read.
constexpr int kWrittenAt = 2000;

constexpr std::array kWorks{
    Work{"read-1-register", Work::ReadRegisters, 0, 1},
    Work{"read-125-registers", Work::ReadRegisters, 0, 125},
    Work{"read-2000-coils", Work::ReadCoils, 0, 2000},
    Work{"write-123-registers", Work::WriteRegisters, kWrittenAt, 123},
};

struct Used {
    long long cpuNs;
    long voluntary;
    std::chrono::steady_clock::time_point at;
};

long long nanoseconds(const timeval& time) {
    return (time.tv_sec * 1'000'000LL + time.tv_usec) * 1000;
}

Used used() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return {nanoseconds(usage.ru_utime) + nanoseconds(usage.ru_stime), usage.ru_nvcsw,
            std::chrono::steady_clock::now()};
}

// FNV-1a, so that a script can compute it as well.
std::uint32_t checkSum(const std::vector<std::uint16_t>& values) {
    std::uint32_t sum = 2166136261U;
    for (const std::uint16_t value : values)
        sum = (sum ^ value) * 16777619U;
    return sum;
}

}  // namespace

const Work* findWork(std::string_view name) {
    for (const Work& work : kWorks)
        if (work.name == name) return &work;
    return nullptr;
}

Task taskFrom(const std::vector<std::string>& arguments) {
    if (arguments.size() < 5) throw std::invalid_argument("PORT BAUD WORK COUNT WAITING");
    const Work* work = findWork(arguments[2]);
    if (work == nullptr) throw std::invalid_argument("unknown work: " + arguments[2]);
    return {arguments[0], std::stoi(arguments[1]), *work, std::stol(arguments[3]), arguments[4]};
}

int measure(const Task& task, const Transact& transact, const Transact& readBack) {
    std::vector<std::uint16_t> first(static_cast<std::size_t>(task.work.count));
    // The first one finds out what later ones know, and says what is right.
    if (!transact(first)) return std::fputs("the first transaction failed\n", stderr), 1;
    std::vector<std::uint16_t> values = first;

    long lost = 0;
    long wrong = 0;
    const Used before = used();
    for (long number = 0; number < task.count; ++number) {
        if (!transact(values))
            ++lost;
        else if (values != first)
            ++wrong;
    }
    const Used after = used();

    if (task.work.kind == Work::WriteRegisters && !readBack(first))
        return std::fputs("reading back failed\n", stderr), 1;
    const std::chrono::nanoseconds time = after.at - before.at;
    std::printf("%ld %ld %ld %lld %lld %ld %u\n", task.count, lost, wrong,
                after.cpuNs - before.cpuNs, static_cast<long long>(time.count()),
                after.voluntary - before.voluntary, checkSum(first));
    return 0;
}

}  // namespace bench
