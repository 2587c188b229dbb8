// Slaves that other people wrote, on the far end of a null modem, with known contents.
#pragma once

#include <sys/types.h>

#include <array>
#include <string>
#include <thread>
#include <vector>

#include "NullModem.h"

namespace peers {

/// What a slave's memory holds in the region that the tests write.
struct Written {
    std::vector<int> coils;      ///< Coils 100 to 119.
    std::vector<int> registers;  ///< Holding registers 100 to 119.
};

/// At first coil a is set when a mod 3 is 0, discrete input a when a mod 4 is 1; holding register a
/// holds 2000 + a and input register a 50000 + a; 300 of each.
class OtherSlave {
  public:
    virtual ~OtherSlave() = default;
    /// The device that a master opens.
    virtual const std::string& port() const = 0;
    /// Ends the slave. @return what its memory holds.
    virtual Written end() = 0;
};

/// libmodbus, RTU, on a thread of this program.
class LibmodbusSlave final : public OtherSlave {
  public:
    explicit LibmodbusSlave(int node);
    ~LibmodbusSlave() override;
    const std::string& port() const override { return line_.left(); }
    Written end() override;

  private:
    struct Memory;
    void serve() const;

    NullModem line_;
    Memory* memory_;
    std::array<int, 2> stop_{};
    std::thread thread_;
};

/// pymodbus, RTU or ASCII, in a process of its own.
class PymodbusSlave final : public OtherSlave {
  public:
    PymodbusSlave(const std::string& mode, int node);
    ~PymodbusSlave() override;
    const std::string& port() const override { return line_.left(); }
    Written end() override;

  private:
    std::string readLine() const;

    NullModem line_;
    pid_t process_ = -1;
    int input_ = -1;
    int output_ = -1;
};

}  // namespace peers
