// Machine, word length, byte order and float convention by name.
#include "cli/inspect/Architecture.h"

#include <elf.h>
#include <fmt/format.h>

#include <array>
#include <bit>

namespace cli {
namespace {

struct MachineRow {
    std::uint16_t machine;
    int bits;
    const char* text;
    const char* triplet;
};

constexpr std::array kMachines{
    MachineRow{EM_X86_64, 64, "x86-64", "x86_64-linux-gnu"},
    MachineRow{EM_386, 32, "32-bit x86", "i386-linux-gnu"},
    MachineRow{EM_AARCH64, 64, "64-bit ARM", "aarch64-linux-gnu"},
    MachineRow{EM_ARM, 32, "32-bit ARM", "arm-linux-gnueabi"},
};

const MachineRow* rowOf(const Architecture& architecture) {
    for (const MachineRow& row : kMachines) {
        if (row.machine == architecture.machine && row.bits == architecture.bits) return &row;
    }
    return nullptr;
}

constexpr std::uint16_t ownMachine() {
#if defined(__x86_64__)
    return EM_X86_64;
#elif defined(__i386__)
    return EM_386;
#elif defined(__aarch64__)
    return EM_AARCH64;
#elif defined(__arm__)
    return EM_ARM;
#else
    return EM_NONE;
#endif
}

constexpr std::uint32_t ownFlags() {
#if defined(__ARM_PCS_VFP)
    return EF_ARM_ABI_FLOAT_HARD;
#elif defined(__arm__)
    return EF_ARM_ABI_FLOAT_SOFT;
#else
    return 0;
#endif
}

bool isHardFloat(const Architecture& architecture) {
    return architecture.machine == EM_ARM && (architecture.flags & EF_ARM_ABI_FLOAT_HARD) != 0;
}

}  // namespace

bool sameArchitecture(const Architecture& a, const Architecture& b) {
    return a.machine == b.machine && a.bits == b.bits && a.littleEndian == b.littleEndian &&
           isHardFloat(a) == isHardFloat(b);
}

Architecture ownArchitecture() {
    return {.machine = ownMachine(),
            .bits = static_cast<int>(8 * sizeof(void*)),
            .littleEndian = std::endian::native == std::endian::little,
            .flags = ownFlags()};
}

std::string architectureText(const Architecture& architecture) {
    const MachineRow* const row = rowOf(architecture);
    std::string text =
        row != nullptr ? row->text
                       : fmt::format("machine {}, {}-bit", architecture.machine, architecture.bits);
    if (!architecture.littleEndian) text += ", big-endian";
    return text;
}

std::string floatAbiText(const Architecture& architecture) {
    if (architecture.machine != EM_ARM) return {};
    if (isHardFloat(architecture)) return "hard";
    return (architecture.flags & EF_ARM_ABI_FLOAT_SOFT) != 0 ? "soft" : "unmarked";
}

std::string debianTriplet(const Architecture& architecture) {
    const MachineRow* const row = rowOf(architecture);
    if (row == nullptr || !architecture.littleEndian) return {};
    return isHardFloat(architecture) ? fmt::format("{}hf", row->triplet) : row->triplet;
}

}  // namespace cli
