// What kind of machine a library is for. Pure.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace cli {

/// The numbers of an ELF header. Source: System V ABI, chapter 4, and ELF for the Arm Architecture.
struct Architecture {
    std::uint16_t machine = 0;  ///< e_machine, e.g. 40 for 32-bit ARM.
    int bits = 0;               ///< 32 or 64.
    bool littleEndian = true;
    std::uint32_t flags = 0;  ///< e_flags.
};

/// @return whether a library for `a` can live in one process with a library for `b`.
bool sameArchitecture(const Architecture& a, const Architecture& b);

/// The architecture of this program.
Architecture ownArchitecture();

/// @return e.g. "32-bit ARM", "x86-64", "machine 8, 32-bit, big-endian".
std::string architectureText(const Architecture& architecture);

/// @return "hard", "soft" or "unmarked" for 32-bit ARM, else empty.
std::string floatAbiText(const Architecture& architecture);

/// @return the name of Debian's folders for the architecture, e.g. "arm-linux-gnueabihf"; empty
/// when it has none that is known here.
std::string debianTriplet(const Architecture& architecture);

}  // namespace cli
