// The life of a protocol object: construction, configuration, start, stop, reports.
#include "mrtu/Protocol_MRTU.h"

#include <algorithm>
#include <memory>

#include "description/GetXml.h"
#include "framework/HostServicePointers.h"
#include "framework/TextUtils.h"
#include "mrtu/LineLock.h"
#include "mrtu/Tag_MRTU.h"

namespace {

constexpr _MRTU::Fault kParity{-1, "Parser: parameter 'parity' has invalid value"};
constexpr _MRTU::Fault kMode{-1, "Parser: parameter 'mode' has invalid value"};

/// Takes the settings over one by one, up to the first that is refused.
_MRTU::Fault takeOver(const _MRTU::CommonParams& common, _MRTU::LineSettings& line) {
    line.baud = common.baudrate;
    line.dataBits = common.isRtu() ? 8 : common.bits;
    line.stopBits = common.stopbits;

    const int parity = _MRTU::parityCode(common.parity);
    if (parity < 0) return kParity;
    line.parity = parity;

    const int mode = _MRTU::modeCode(common.mode);
    if (mode < 0) return kMode;
    line.mode = mode;

    line.gapMs = _MRTU::interCharacterGap(line.baud);
    return _MRTU::kNoFault;
}

constexpr const char* kUriNames[] = {"nodeid", "memorytype", "arrayindex.subindex", "datatype",
                                     nullptr};

constexpr int kExtensionQuery = 0;
constexpr int kKnownExtension = 3;

}  // namespace

IProtocol* CreateProtocol_MRTU() {
    return new Protocol_MRTU;
}

Protocol_MRTU::Protocol_MRTU()
    : serialFactory_(serviceAs<ISerialFactory>(piSerialFactory, "ISerialFactory")),
      multiTask_(serviceAs<IMultiTask2>(piMultiTask, "IMultiTask2")),
      lock_(multiTask_) {
    _MRTU::registerModels(memoryManager_);
}

Protocol_MRTU::~Protocol_MRTU() {
    lock_.reset();
    if (port_ != nullptr) releasePort();
}

void* Protocol_MRTU::ConvertTo(const char* name) {
    if (CompareInterface(name, "Protocol_MRTU")) return this;
    return ProtgenProtocol::ConvertTo(name);
}

int Protocol_MRTU::fail(const _MRTU::Fault& fault) {
    SetError(fault.code, fault.text);
    return 0;
}

int Protocol_MRTU::Config(const char* text) {
    return guardedBy(0, [&] {
        if (!params_.parse(text)) return fail({-1, params_.getLastError()});
        // What follows takes no memory, so that a shortage cannot leave it half done.
        configured_ = true;
        const std::lock_guard lock(lineMutex_);
        const _MRTU::Fault fault = takeOver(*params_.getCommonParams(), line_);
        return fault ? fail(fault) : 1;
    });
}

_MRTU::LineSettings Protocol_MRTU::lineSettings() const {
    const std::lock_guard lock(lineMutex_);
    return line_;
}

int Protocol_MRTU::lineSetting(int _MRTU::LineSettings::*setting) const {
    const std::lock_guard lock(lineMutex_);
    return line_.*setting;
}

int Protocol_MRTU::Start() {
    return guardedBy(0, [this] { return start(); });
}

int Protocol_MRTU::start() {
    if (started_) return 1;
    const std::lock_guard turn(portTurn_);
    if (started_) return 1;
    // Before a configuration there is no port, and the first look-up of an override would keep the
    // settings that are not there yet.
    if (!configured_) return fail(_MRTU::kCannotOpen);
    // What needs memory comes before the first change, so that a shortage changes nothing.
    const auto stored = nodeOverrides_.stored(GetIdent());
    const _MRTU::LineSettings line = lineSettings();
    auto opened = overrides_.open(GetIdent(), {{"baud", line.baud},
                                               {"parity", line.parity},
                                               {"stop", line.stopBits},
                                               {"mode", line.mode}});
    nodeOverrides_.adopt(stored);
    overrides_.adopt(std::move(opened));
    applySerialOverrides();
    if (!openPort()) return fail(_MRTU::kCannotOpen);
    started_ = true;
    return 1;
}

/// Every one of the parameters is cached by now, so that the host is not asked under the lock.
void Protocol_MRTU::applySerialOverrides() {
    constexpr int kNoNode = -1;
    const std::lock_guard lock(lineMutex_);
    overrides_.get("baud", kNoNode, line_.baud, line_.baud);
    overrides_.get("parity", kNoNode, line_.parity, line_.parity);
    overrides_.get("stop", kNoNode, line_.stopBits, line_.stopBits);
    overrides_.get("mode", kNoNode, line_.mode, line_.mode);
    line_.gapMs = _MRTU::interCharacterGap(line_.baud);
}

bool Protocol_MRTU::openPort() {
    // No line runs at 0 baud, and a host's port may divide by it.
    const int baud = lineSetting(&_MRTU::LineSettings::baud);
    if (baud == 0 || serialFactory_ == nullptr || !lock_) return false;
    port_ = serialFactory_->openPort(params_.getCommonParams()->uart.c_str());
    if (port_ == nullptr) return false;
    if (configure(*port_)) return true;
    releasePort();
    return false;
}

bool Protocol_MRTU::configure(ISerialPort& port) const {
    const _MRTU::LineSettings line = lineSettings();
    return port.configure(line.baud, line.parity, line.dataBits, line.stopBits, line.mode) != 0;
}

void Protocol_MRTU::releasePort() {
    serialFactory_->releasePort(port_);
    port_ = nullptr;
}

int Protocol_MRTU::Stop() {
    if (!started_) return 1;
    const LineLock lock(*this);
    const std::lock_guard turn(portTurn_);
    if (!started_) return 1;
    if (port_ != nullptr) releasePort();
    started_ = false;
    return 1;
}

int Protocol_MRTU::GetMaxTm(const ITag* tag) const {
    if (tag == nullptr) return params_.getMaxTm();
    return _MRTU::maxTransactionTime(*static_cast<const Tag_MRTU*>(tag)->nodeParams());
}

const unsigned char* Protocol_MRTU::GetXml() const {
    return GetXml_MRTU();
}

ITag* Protocol_MRTU::CreateTagBase(const char* uri) {
    return guardedBy(static_cast<ITag*>(nullptr), [&]() -> ITag* {
        auto tag = std::make_unique<Tag_MRTU>(uri != nullptr ? uri : "", tagUriNames());
        if (!tag->isComplete()) {
            outOfMemory();
            return nullptr;
        }
        if (tag->parseTagUrl(this)) return tag.release();
        SetTagError(tag.get());
        return nullptr;
    });
}

const char* const* Protocol_MRTU::tagUriNames() const {
    return kUriNames;
}

int Protocol_MRTU::vcsGetComParams(char* text, int size) const {
    const _MRTU::LineSettings line = lineSettings();
    ProtUtilsN::BoundedWriter report(text, size);
    report << params_.getCommonParams()->uart << "," << line.baud << ","
           << _MRTU::parityWord(line.parity) << "," << line.dataBits << "," << line.stopBits << ","
           << _MRTU::modeWord(line.mode);
    report.pad();
    return 1;
}

int Protocol_MRTU::Extend(int code, void* data) {
    if (data == nullptr) return 0;
    auto& record = *static_cast<ExtensionRecord*>(data);
    if (code == kExtensionQuery) {
        std::fill(std::begin(record.flags), std::end(record.flags), std::uint8_t{0});
        if (record.queryCode == kKnownExtension) record.flags[0] = 1;
        return 1;
    }
    return code == kKnownExtension ? record.value : 0;
}
