// libmodbus doing the same work.
//
//   peers_libmodbus PORT BAUD WORK COUNT at-once|silence
//
// "silence" keeps the silence that the standard demands in front of each request, in the same way
// as the plug-in's port; libmodbus itself keeps none.
#include <modbus.h>
#include <time.h>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "bench/peers/Work.h"
#include "wire/Times.h"

namespace {

using bench::Task;
using bench::Work;
using Values = std::vector<std::uint16_t>;

constexpr int kCharacterBits = 1 + 8 + 1;

class Transactions {
  public:
    explicit Transactions(const Task& task)
        : work_(task.work),
          line_(modbus_new_rtu(task.port.c_str(), task.baud, 'N', 8, 1), modbus_free),
          coils_(static_cast<std::size_t>(work_.count)) {
        modbus_set_slave(line_.get(), 1);
        modbus_set_response_timeout(line_.get(), 1, 0);
        if (modbus_connect(line_.get()) != 0) throw std::runtime_error(modbus_strerror(errno));
        if (task.waiting == "silence")
            silence_ = wire::silenceBetweenFrames({task.baud, kCharacterBits});
        for (int index = 0; index < work_.count; ++index)
            toWrite_.push_back(bench::valueToWrite(index));
    }
    ~Transactions() { modbus_close(line_.get()); }
    Transactions(const Transactions&) = delete;
    Transactions& operator=(const Transactions&) = delete;

    bool transact(Values& values) {
        keepSilence();
        const bool done = exchange(values);
        if (silence_.count() > 0) clock_gettime(CLOCK_MONOTONIC, &ended_);
        return done;
    }

    bool read(Values& values) {
        return modbus_read_registers(line_.get(), work_.address, work_.count, values.data()) ==
               work_.count;
    }

  private:
    bool exchange(Values& values) {
        if (work_.kind == Work::ReadRegisters) return read(values);
        if (work_.kind == Work::WriteRegisters)
            return modbus_write_registers(line_.get(), work_.address, work_.count,
                                          toWrite_.data()) == work_.count;
        if (modbus_read_bits(line_.get(), work_.address, work_.count, coils_.data()) != work_.count)
            return false;
        values.assign(coils_.begin(), coils_.end());
        return true;
    }

    void keepSilence() const {
        if (silence_.count() == 0) return;
        constexpr long kSecond = 1'000'000'000;
        timespec until = ended_;
        until.tv_nsec += silence_.count();
        until.tv_sec += until.tv_nsec / kSecond;
        until.tv_nsec %= kSecond;
        clock_nanosleep(CLOCK_MONOTONIC, TIMER_ABSTIME, &until, nullptr);
    }

    Work work_;
    std::unique_ptr<modbus_t, void (*)(modbus_t*)> line_;
    std::vector<std::uint8_t> coils_;
    Values toWrite_;
    std::chrono::nanoseconds silence_{0};
    timespec ended_{};
};

}  // namespace

int main(int count, char** arguments) {
    try {
        const Task task =
            bench::taskFrom(std::vector<std::string>(arguments + 1, arguments + count));
        Transactions transactions(task);
        return bench::measure(
            task, [&](Values& values) { return transactions.transact(values); },
            [&](Values& values) { return transactions.read(values); });
    } catch (const std::exception& error) {
        return std::fprintf(stderr, "peers_libmodbus: %s\n", error.what()), 2;
    }
}
