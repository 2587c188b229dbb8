// The driver's own memory areas: overrides of node address, Modicon mode and line settings. They
// never reach the line and are served without the transaction lock.
#include <utility>

#include "framework/TextUtils.h"
#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"

using _MRTU::DriverArea;
using _MRTU::LineSettings;

namespace {

std::int32_t loadInt(const unsigned char* data) {
    std::uint32_t value = 0;
    for (unsigned byte = 0; byte < 4; ++byte)
        value |= static_cast<std::uint32_t>(data[byte]) << (8 * byte);
    return static_cast<std::int32_t>(value);
}

void storeInt(unsigned char* data, std::int32_t value) {
    for (unsigned byte = 0; byte < 4; ++byte)
        data[byte] =
            static_cast<unsigned char>((static_cast<std::uint32_t>(value) >> (8 * byte)) & 0xFFu);
}

unsigned char lowByte(int value) {
    return static_cast<unsigned char>(static_cast<unsigned>(value) & 0xFFu);
}

}  // namespace

void Protocol_MRTU::readDriverArea(const Tag_MRTU& tag, unsigned char* data) {
    switch (tag.driverArea()) {
        case DriverArea::NodeOverride:
            data[0] = lowByte(nodeOverrides_.replacementOf(tag.nodeId()));
            break;
        case DriverArea::ModiconMode:
            data[0] = modiconMode(tag) ? 1 : 0;
            break;
        case DriverArea::Baud:
            storeInt(data, serialValue("baud", lineSetting(&LineSettings::baud)));
            break;
        case DriverArea::Parity:
            data[0] = lowByte(serialValue("parity", lineSetting(&LineSettings::parity)));
            break;
        case DriverArea::StopBits:
            data[0] = lowByte(serialValue("stop", lineSetting(&LineSettings::stopBits)));
            break;
        case DriverArea::LineMode:
            data[0] = lowByte(serialValue("mode", lineSetting(&LineSettings::mode)));
            break;
        case DriverArea::Apply:
            data[0] = 0;
            break;
        case DriverArea::None:
            break;
    }
}

bool Protocol_MRTU::writeDriverArea(const Tag_MRTU& tag, const unsigned char* data) {
    switch (tag.driverArea()) {
        case DriverArea::NodeOverride:
            nodeOverrides_.setValue(tag.nodeId(), data[0], GetIdent());
            return true;
        case DriverArea::ModiconMode:
            setModiconMode(tag.nodeId(), data[0] != 0);
            return true;
        case DriverArea::Baud:
            return stage("baud", loadInt(data), _MRTU::isListedBaudRate(loadInt(data)));
        case DriverArea::Parity:
            return stage("parity", data[0], _MRTU::isListedParity(data[0]));
        case DriverArea::StopBits:
            return stage("stop", data[0], _MRTU::isListedStopBits(data[0]));
        case DriverArea::LineMode:
            return stage("mode", data[0], _MRTU::isListedMode(data[0]));
        case DriverArea::Apply:
            applyStaged();
            return true;
        case DriverArea::None:
            break;
    }
    return false;
}

void Protocol_MRTU::setModiconMode(int node, bool on) {
    ParameterReplacer::Variant value;
    value.type = ParameterReplacer::Boolean;
    value.boolValue = on;
    overrides_.store({{ParameterReplacer::makeFullName("ModiconMode", node), value}});
}

bool Protocol_MRTU::stage(const char* name, int value, bool allowed) {
    constexpr int kNoGroup = -1;
    if (allowed) stagedOverrides_.set(name, kNoGroup, value);
    return allowed;
}

/// Commits what is staged and sets the open port to the settings in force. The staged values stay
/// and keep shadowing the committed ones.
void Protocol_MRTU::applyStaged() {
    ParameterReplacer::Values committed;
    for (const auto& [key, staged] : stagedOverrides_.staged()) {
        if (staged.group != -1) continue;
        committed[staged.name] = {staged.type, staged.boolValue, staged.intValue,
                                  staged.stringValue};
    }
    overrides_.store(std::move(committed));
    takeStaged();

    const std::lock_guard turn(portTurn_);
    if (port_ != nullptr) configure(*port_);
}

/// Start() has looked every one of the parameters up, so the host is not asked under the lock.
void Protocol_MRTU::takeStaged() {
    const std::lock_guard lock(lineMutex_);
    line_.baud = serialValue("baud", line_.baud);
    line_.parity = serialValue("parity", line_.parity);
    line_.stopBits = serialValue("stop", line_.stopBits);
    line_.mode = serialValue("mode", line_.mode);
    line_.gapMs = _MRTU::interCharacterGap(line_.baud);
}

int Protocol_MRTU::serialValue(const char* name, int current) {
    constexpr int kNoNode = -1;
    constexpr int kNoGroup = -1;
    int value = current;
    if (!stagedOverrides_.get(name, kNoGroup, value)) overrides_.get(name, kNoNode, current, value);
    return value;
}
