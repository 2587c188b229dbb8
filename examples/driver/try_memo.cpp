// A host for the driver beside it: loads it, writes tags and reads them back.
//
//     try_memo ./libmemo.so
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "runtime/Channel.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"

namespace {

int complain(const std::string& text) {
    std::fprintf(stderr, "%s\n", text.c_str());
    return 1;
}

bool write(runtime::Channel& channel, const char* uri, const std::vector<std::uint8_t>& value) {
    const auto tag = channel.createTag(uri);
    return tag && channel.write(*tag.value(), value);
}

void show(runtime::Channel& channel, const char* uri) {
    std::printf("%s =", uri);
    const auto tag = channel.createTag(uri);
    if (!tag) return void(std::printf(" refused: %s\n", tag.error().text.c_str()));
    const auto value = channel.read(*tag.value());
    if (!value) return void(std::printf(" failed: %s\n", value.error().text.c_str()));
    for (const std::uint8_t byte : value.value())
        std::printf(" %02x", byte);
    std::printf("\n");
}

}  // namespace

int main(int count, char** arguments) {
    if (count != 2) return complain("usage: try_memo PLUGIN");

    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    runtime::ServiceFactory services(multiTask, serial);
    auto library = runtime::PluginLibrary::load(arguments[1]);
    if (!library) return complain(library.error().text);
    auto module = runtime::Module::bind(library.value(), services);
    if (!module) return complain(module.error().text);
    auto protocol = module.value().createProtocol("MEMO");
    if (!protocol) return complain(protocol.error().text);
    runtime::Channel channel(std::move(protocol).value());
    if (auto done = channel.configure("CfgVer=1"); !done) return complain(done.error().text);
    if (auto done = channel.start(); !done) return complain(done.error().text);

    // A cell, one of its bits through the engine's read-modify-write, and an array that takes more
    // than one request.
    const std::vector<std::uint8_t> pattern(2 * 250, 0x5a);
    const bool written = write(channel, "CELL?10?unsignedShort", {0x34, 0x12}) &&
                         write(channel, "CELL?10.15?boolean", {1}) &&
                         write(channel, "CELL?500?unsignedShort-250", pattern);
    if (!written) return complain(channel.lastError().text);
    show(channel, "CELL?10?unsignedShort");
    show(channel, "CELL?10.15?boolean");
    show(channel, "CELL?748?unsignedShort-3");
    show(channel, "CELL?999?unsignedInt");
    show(channel, "ROOM?1?unsignedShort");
}
