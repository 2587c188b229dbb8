// Transactions a second: the driver against the bare port calls that a transaction needs, and
// against libmodbus on the same simulated line.
//
// Read the ratios within one run; the absolute numbers belong to the machine.
#include <benchmark/benchmark.h>
#include <modbus.h>

#include <array>
#include <memory>

#include "bench/StartedDriver.h"
#include "mrtu/Tag_MRTU.h"
#include "runtime/PosixSerialFactory.h"
#include "sim/Simulator.h"
#include "tests/support/FixedReplyPort.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;
using testing_support::FixedReplyPort;

constexpr int kRegisters = 125;

/// Reads the registers without the engine above.
class Reader {
  public:
    Reader(ISerialFactory& serial, bool ascii)
        : driver_(serial, bench::configuration(ascii ? "ASCII" : "RTU")),
          tag_(driver_.tag("1?HREG?400001?unsignedShort-125")) {}

    bool read(unsigned char* data) {
        return driver_.protocol().doReadBlock(static_cast<const Tag_MRTU*>(tag_), 0, data,
                                              kRegisters);
    }

  private:
    bench::StartedDriver driver_;
    const ITag* tag_;
};

Bytes replyMessage() {
    Bytes message{1, 3, 2 * kRegisters};
    for (int index = 0; index < 2 * kRegisters; ++index)
        message.push_back(static_cast<unsigned char>(index));
    return message;
}

Bytes replyFrame(bool ascii) {
    return ascii ? testing_support::asciiFrame(replyMessage())
                 : testing_support::rtuFrame(replyMessage());
}

/// The driver on a port that answers at once: what is left is the driver's own work.
void driverOnScriptedPort(benchmark::State& state, bool ascii) {
    FixedReplyPort port(replyFrame(ascii));
    bench::OnePort factory(port);
    Reader driver(factory, ascii);
    std::array<unsigned char, 2 * kRegisters> data{};
    for (auto _ : state)
        if (!driver.read(data.data())) return state.SkipWithError("read failed");
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK_CAPTURE(driverOnScriptedPort, rtu, false);
BENCHMARK_CAPTURE(driverOnScriptedPort, ascii, true);

/// The port calls of one exchange and nothing else: the floor.
void portCallsAlone(benchmark::State& state) {
    FixedReplyPort port(replyFrame(false));
    const Bytes request = testing_support::rtuFrame({1, 3, 0, 0, 0, kRegisters});
    std::array<unsigned char, 513> raw{};
    for (auto _ : state) {
        int rest = 0;
        while (port.receiveByte(raw.data(), 0, 0) != 0) {
        }
        port.send(request.data(), static_cast<int>(request.size()));
        port.receiveByte(raw.data(), 2000, 0);
        port.receiveFrame(raw.data() + 1, 512, 2000, 2, &rest, 0);
        benchmark::DoNotOptimize(raw);
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(portCallsAlone);

sim::SimulatorOptions oneNode() {
    sim::SimulatorOptions options;
    options.nodes = {{.address = 1}};
    return options;
}

/// The driver on a pseudo terminal: each reply ends with the inter-character gap, which the driver
/// waits out and libmodbus does not.
void driverOnSimulatedLine(benchmark::State& state) {
    sim::Simulator simulator(oneNode());
    simulator.start();
    runtime::PosixSerialFactory serial;
    serial.mapPort("com1", simulator.path());
    Reader driver(serial, false);
    std::array<unsigned char, 2 * kRegisters> data{};
    for (auto _ : state)
        if (!driver.read(data.data())) return state.SkipWithError("read failed");
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(driverOnSimulatedLine)->UseRealTime();

void libmodbusOnSimulatedLine(benchmark::State& state) {
    sim::Simulator simulator(oneNode());
    simulator.start();
    const std::unique_ptr<modbus_t, void (*)(modbus_t*)> line(
        modbus_new_rtu(simulator.path().c_str(), 115200, 'N', 8, 1), modbus_free);
    modbus_set_slave(line.get(), 1);
    if (modbus_connect(line.get()) != 0) return state.SkipWithError("connect failed");
    std::array<std::uint16_t, kRegisters> data{};
    for (auto _ : state)
        if (modbus_read_registers(line.get(), 0, kRegisters, data.data()) != kRegisters)
            return state.SkipWithError("read failed");
    modbus_close(line.get());
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(libmodbusOnSimulatedLine)->UseRealTime();

}  // namespace

BENCHMARK_MAIN();
