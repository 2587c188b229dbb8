// Transactions a second: the driver against the bare port calls that a transaction needs, and
// against libmodbus on the same simulated line.
//
// Read the ratios within one run; the absolute numbers belong to the machine.
#include <benchmark/benchmark.h>
#include <modbus.h>

#include <array>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"
#include "plugin/ProtModule.h"
#include "runtime/PosixSerialFactory.h"
#include "sim/Simulator.h"
#include "tests/support/FakeHost.h"
#include "tests/support/FixedReplyPort.h"
#include "tests/support/Replies.h"

namespace {

using testing_support::Bytes;
using testing_support::FakeHost;
using testing_support::FixedReplyPort;

constexpr int kRegisters = 125;

/// Hands out one port for ever.
class OnePort final : public ISerialFactory {
  public:
    explicit OnePort(ISerialPort& port) : port_(port) {}
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this)
                                                        : nullptr;
    }
    const char* GetImpName() const override { return "OnePort"; }
    int GetImpVersion() const override { return 1; }
    ISerialPort* openPort(const char*) override { return &port_; }
    void releasePort(ISerialPort*) override {}

  private:
    ISerialPort& port_;
};

std::string configuration(bool ascii) {
    return std::string(
               "CfgVer=1 defNodeId=1 uart=com1 baudrate=115200 parity=none bits=8 "
               "stopbits=1 mode=RS-232 txMode=") +
           (ascii ? "ASCII" : "RTU");
}

/// The driver, started on the serial ports that `serial` offers.
class Driver {
  public:
    Driver(ISerialFactory& serial, bool ascii) {
        host_.offer("ISerialFactory", serial);
        if (module_.Init(&host_) == 0) throw std::runtime_error(module_.GetLastError());
        protocol_ = std::make_unique<Protocol_MRTU>();
        if (!protocol_->Config(configuration(ascii).c_str()) || !protocol_->Start())
            throw std::runtime_error(protocol_->GetLastErrorString());
        tag_ = protocol_->CreateTag("1?HREG?400001?unsignedShort-125");
    }
    ~Driver() {
        protocol_->Stop();
        protocol_.reset();
        module_.Close();
    }
    Driver(const Driver&) = delete;
    Driver& operator=(const Driver&) = delete;

    bool read(unsigned char* data) {
        return protocol_->doReadBlock(static_cast<const Tag_MRTU*>(tag_), 0, data, kRegisters);
    }

  private:
    FakeHost host_;
    ProtModule module_;
    std::unique_ptr<Protocol_MRTU> protocol_;
    ITag* tag_ = nullptr;
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
    OnePort factory(port);
    Driver driver(factory, ascii);
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
    Driver driver(serial, false);
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
