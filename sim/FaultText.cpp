// The form in which people write faults.
#include <algorithm>
#include <array>
#include <limits>

#include "sim/Fault.h"
#include "sim/TextNumbers.h"
#include "wire/Hex.h"

namespace sim {
namespace {

using wire::Bytes;

/// Reads the value of a part into the fault. @return whether it could.
using Setter = bool (*)(std::string_view value, Fault& fault);

bool readHex(std::string_view text, Bytes& out) {
    const auto bytes = wire::fromHex(Bytes(text.begin(), text.end()));
    if (!bytes) return false;
    out = *bytes;
    return true;
}

bool setFlag(std::string_view value, bool& flag) {
    flag = true;
    return value.empty();
}

bool setKeep(std::string_view value, Fault& fault) {
    return readNumber<std::size_t>(value, 0, 1000000, fault.keep.emplace());
}

bool setDrip(std::string_view value, Fault& fault) {
    const std::size_t slash = value.find('/');
    if (slash == std::string_view::npos) return false;
    return readNumber<std::size_t>(value.substr(0, slash), 1, 1000, fault.dripBytes) &&
           readNumber<std::uint32_t>(value.substr(slash + 1), 0, 3600000, fault.dripGapMs);
}

struct PartRow {
    std::string_view name;
    bool hasValue;
    Setter set;
};

constexpr std::array kParts{
    PartRow{"silent", false, [](std::string_view v, Fault& f) { return setFlag(v, f.silent); }},
    PartRow{"node", false, [](std::string_view v, Fault& f) { return setFlag(v, f.wrongNode); }},
    PartRow{"check", false, [](std::string_view v, Fault& f) { return setFlag(v, f.wrongCheck); }},
    PartRow{"hangup", false, [](std::string_view v, Fault& f) { return setFlag(v, f.hangUp); }},
    PartRow{"exception", true,
            [](std::string_view v, Fault& f) {
                return readNumber<std::uint8_t>(v, 1, 255, f.exception);
            }},
    PartRow{"keep", true, setKeep},
    PartRow{"send", true,
            [](std::string_view v, Fault& f) { return readHex(v, f.replacement.emplace()); }},
    PartRow{"noise", true, [](std::string_view v, Fault& f) { return readHex(v, f.noise); }},
    PartRow{"delay", true,
            [](std::string_view v, Fault& f) {
                return readNumber<std::uint32_t>(v, 0, 3600000, f.delayMs);
            }},
    PartRow{"drip", true, setDrip},
    PartRow{"times", true,
            [](std::string_view v, Fault& f) {
                return readNumber<int>(v, 1, std::numeric_limits<int>::max(), f.times);
            }},
    PartRow{
        "for", true,
        [](std::string_view v, Fault& f) { return readNumber<std::uint8_t>(v, 1, 255, f.node); }},
};

bool readPart(std::string_view part, Fault& fault) {
    const std::size_t equals = part.find('=');
    const bool hasValue = equals != std::string_view::npos;
    const auto* row = std::find_if(kParts.begin(), kParts.end(), [&](const PartRow& each) {
        return each.name == part.substr(0, equals);
    });
    if (row == kParts.end() || row->hasValue != hasValue) return false;
    return row->set(hasValue ? part.substr(equals + 1) : std::string_view{}, fault);
}

/// @return "silent, node, ..., exception=, ...".
std::string knownParts() {
    std::string names;
    for (const PartRow& row : kParts) {
        if (!names.empty()) names += ", ";
        names.append(row.name).append(row.hasValue ? "=" : "");
    }
    return names;
}

}  // namespace

std::optional<Fault> parseFault(std::string_view text, std::string& error) {
    Fault fault;
    while (true) {
        const std::size_t comma = text.find(',');
        const std::string_view part = text.substr(0, comma);
        if (!readPart(part, fault)) {
            error = "not a fault: \"" + std::string(part) + "\"; the faults are " + knownParts();
            return std::nullopt;
        }
        if (comma == std::string_view::npos) return fault;
        text.remove_prefix(comma + 1);
    }
}

}  // namespace sim
