#include "tests/abi/shortage/World.h"

#include <algorithm>
#include <stdexcept>

namespace shortage {

namespace {

void require(bool done, const char* what) {
    if (!done) throw std::runtime_error(what);
}

}  // namespace

World::World(const abi_test::Plugin& plugin, Stage stage)
    : module(plugin.module()), factory(plugin.protocols()) {
    clearBuffer();
    try {
        reach(stage);
    } catch (...) {
        close();
        throw;
    }
}

void World::reach(Stage stage) {
    if (stage == Stage::loaded) return;
    require(module.Init(&host) != 0, "Init");
    if (stage == Stage::initialised) return;
    IProtocol* const plain = factory.CreateProtocol("MRTU");
    require(plain != nullptr, "CreateProtocol");
    protocol = static_cast<IProtocol7*>(plain->ConvertTo("IProtocol7"));
    if (stage == Stage::created) return;
    require(protocol->Config(kConfig) != 0, "Config");
    if (stage == Stage::configured) return;
    require(protocol->Start() != 0, "Start");
}

World::~World() {
    close();
}

void World::close() {
    if (made != nullptr) delete made;
    if (protocol != nullptr) factory.DeleteProtocol(protocol);
    while (host.servicesHeld() > 0)
        module.Close();
}

bool World::bufferUntouched() const {
    return std::all_of(bytes_.begin(), bytes_.end(), [](unsigned char b) { return b == kFill; });
}

bool World::guardsIntact() const {
    const auto intact = [](unsigned char byte) { return byte == kFill; };
    return std::all_of(bytes_.begin(), bytes_.begin() + kGuard, intact) &&
           std::all_of(bytes_.end() - kGuard, bytes_.end(), intact);
}

std::string World::command(const char* line) {
    char answer[256] = {};
    protocol->DoCommand(line, answer, sizeof answer - 1);
    return std::string(line) + ": " + answer + '\n';
}

std::string World::state() {
    std::string text = "services " + std::to_string(host.servicesHeld()) + ", locks " +
                       std::to_string(host.multiTask.locksAlive()) + ", taken " +
                       std::to_string(host.multiTask.locksHeld()) + ", ports " +
                       std::to_string(host.serialFactory.portsOpen()) + ", line " +
                       host.serialFactory.line().settings() + '\n' + host.storage.contents();
    if (protocol == nullptr) return text;
    char report[256] = {};
    protocol->vcsGetComParams(report, sizeof report - 1);
    text += protocol->GetIdent() + std::string(", ") + report + '\n';
    return text + command("getid") + command("getmaxtm");
}

std::string World::wholeState() {
    std::string text = state();
    if (protocol == nullptr) return text;
    for (const char* line : {"read 1?NO?0?unsignedByte", "read 2?NO?0?unsignedByte",
                             "read 1?NP_Mode?0?boolean", "read 2?NP_Mode?0?boolean",
                             "read 1?SP_Baud?0?unsignedInt", "read 1?SP_Par?0?unsignedByte",
                             "read 1?SP_Stop?0?unsignedByte", "read 1?SP_Mode?0?unsignedByte"})
        text += command(line);
    return text;
}

}  // namespace shortage
