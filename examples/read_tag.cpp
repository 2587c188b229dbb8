// The whole way of a tag, from the plug-in file to its value, in one page.
//
//     read_tag ./libmrtu.so
//
// The line is a simulated one; on a real one map "com1" to its device and leave the simulator out.
#include <cstdio>

#include "runtime/Channel.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"
#include "sim/Simulator.h"

namespace {

constexpr char kConfiguration[] =
    "CfgVer=1 defNodeId=1 uart=com1 baudrate=19200 parity=none stopbits=1 mode=RS-232 txMode=RTU";

int complain(const std::string& text) {
    std::fprintf(stderr, "%s\n", text.c_str());
    return 1;
}

}  // namespace

int main(int count, char** arguments) {
    if (count != 2) return complain("usage: read_tag PLUGIN");

    // The line: one node whose holding register a holds 1000 + a.
    sim::Simulator simulator({.nodes = {{.address = 1}}});
    simulator.start();

    // The host: what the driver gets from the panel otherwise.
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    serial.mapPort("com1", simulator.path());
    runtime::ServiceFactory services(multiTask, serial);

    // The driver: load, bind, create, configure, start.
    auto library = runtime::PluginLibrary::load(arguments[1]);
    if (!library) return complain(library.error().text);
    auto module = runtime::Module::bind(library.value(), services);
    if (!module) return complain(module.error().text);
    auto protocol = module.value().createProtocol("MRTU");
    if (!protocol) return complain(protocol.error().text);
    runtime::Channel channel(std::move(protocol).value());
    if (auto done = channel.configure(kConfiguration); !done) return complain(done.error().text);
    if (auto done = channel.start(); !done) return complain(done.error().text);

    // The tag: holding register 400010 is address 9 on the line.
    auto tag = channel.createTag("1?HREG?400010?unsignedShort");
    if (!tag) return complain(tag.error().text);
    auto value = channel.read(*tag.value());
    if (!value) return complain(value.error().text);
    std::printf("1?HREG?400010?unsignedShort = %d\n", value.value()[0] | value.value()[1] << 8);
}
