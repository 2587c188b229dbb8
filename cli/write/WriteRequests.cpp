// Whether a write goes out as one request.
#include "cli/write/WriteRequests.h"

#include <algorithm>

#include "settings/ConfigText.h"
#include "settings/NumberText.h"
#include "values/ValueTypes.h"

namespace cli {
namespace {

/// Items per write request. Source: Modbus Application Protocol V1.1b3, 6.11 and 6.12.
constexpr long kMostCoils = 1968;
constexpr long kMostRegisters = 123;
constexpr long kRegisterBytes = 2;
constexpr std::size_t kLongRegisterBytes = 4;

std::string itemFor(const Session& session, const ITag& tag, const char* key, const char* preset) {
    return settings::nodeItemOf(session.configText(), session.nodeOf(tag), key).value_or(preset);
}

long lengthFor(const Session& session, const ITag& tag, const char* key, const char* preset) {
    return settings::readNumber(itemFor(session, tag, key, preset)).value;
}

// The driver takes anything but "15" for 5, and anything but "16" for 6.
bool writesSingleCoils(const Session& session, const ITag& tag) {
    return itemFor(session, tag, "forceFunction", "15") != "15";
}
bool writesSingleRegisters(const Session& session, const ITag& tag) {
    return itemFor(session, tag, "presetFunction", "16") != "16";
}

bool coilsFit(const Session& session, const ITag& tag) {
    if (writesSingleCoils(session, tag)) return tag.GetVarLength() == 1;
    return tag.GetVarLength() <=
           std::min(kMostCoils, lengthFor(session, tag, "maxBitOptLen", "2000"));
}

bool registersFit(const Session& session, const ITag& tag) {
    const long registers = (tag.PackedLen() + kRegisterBytes - 1) / kRegisterBytes;
    if (writesSingleRegisters(session, tag)) return registers == 1;
    const long most = lengthFor(session, tag, "maxOptLen", "250") / kRegisterBytes;
    return registers <= std::min(kMostRegisters, most);
}

}  // namespace

bool isArrayOfSingleCoils(const Session& session, const ITag& tag) {
    return tag.GetVarType() == ICU_Type::booleanArray && session.areaOf(tag) == "OUTP" &&
           writesSingleCoils(session, tag);
}

bool goesInOneRequest(const Session& session, const ITag& tag) {
    const std::string area = session.areaOf(tag);
    if (area == "OUTP") return coilsFit(session, tag);
    if (area == "HREG") return registersFit(session, tag);
    // A 32-bit register goes alone, whatever the configuration says.
    return values::shapeOf(tag).bytes <= kLongRegisterBytes;
}

}  // namespace cli
