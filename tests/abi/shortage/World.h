// A plug-in in the hands of a host, at a stage of its life, with all that an operation needs.
#pragma once

#include <array>
#include <string>

#include "tests/abi/LoadedPlugin.h"
#include "tests/abi/shortage/Host.h"

namespace shortage {

enum class Stage { loaded, initialised, created, configured, started };

class World {
  public:
    /// Throws std::runtime_error when the stage cannot be reached.
    World(const abi_test::Plugin& plugin, Stage stage);
    ~World();
    World(const World&) = delete;
    World& operator=(const World&) = delete;

    Host host;
    IProtModule& module;
    IProtocolFactory& factory;
    IProtocol7* protocol = nullptr;
    ITag* target = nullptr;  ///< What the operation works on; the protocol owns it.
    ITag* made = nullptr;    ///< What the operation made; deleted with the world unless null.

    static constexpr int kRoom = 8192;
    /// The caller's buffer, filled with kFill, with guard bytes on both sides.
    unsigned char* out() { return bytes_.data() + kGuard; }
    char* text() { return reinterpret_cast<char*>(out()); }
    void clearBuffer() { bytes_.fill(kFill); }
    bool bufferUntouched() const;
    bool guardsIntact() const;
    std::string buffer() const { return {bytes_.begin(), bytes_.end()}; }

    /// What can be seen of the state without changing it.
    std::string state();
    /// The same with the values of the driver's own areas.
    std::string wholeState();

    static constexpr const char* kConfig =
        "CfgVer=1 defNodeId=1 model=1 uart=/dev/a/port/with/a/long/name baudrate=19200 "
        "parity=even stopbits=1 mode=RS-485 txMode=RTU timeout=500 "
        "Node2::defNodeId=2 Node2::model=3 Node2::prefix=longer-than-a-short-text";
    static constexpr const char* kOtherConfig =
        "CfgVer=1 defNodeId=1 model=1 uart=/dev/another/port/with/a/long/name baudrate=9600 "
        "parity=none bits=7 stopbits=2 mode=RS-232 txMode=ASCII timeout=700 "
        "Node7::defNodeId=7 Node7::model=2 Node7::prefix=another-one-that-is-long";

  private:
    static constexpr int kGuard = 64;
    static constexpr unsigned char kFill = 0xA5;

    void reach(Stage stage);
    void close();
    std::string command(const char* line);

    std::array<unsigned char, kGuard + kRoom + kGuard> bytes_;
};

}  // namespace shortage
