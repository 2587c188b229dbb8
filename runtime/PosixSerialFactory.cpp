// Maps the names of ports to devices and opens them.
#include "runtime/PosixSerialFactory.h"

#include <algorithm>
#include <utility>

#include "runtime/PosixSerialPort.h"

namespace runtime {

void SerialErrors::set(const std::string& text) {
    const std::lock_guard guard(mutex_);
    text_ = text;
}

std::string SerialErrors::get() const {
    const std::lock_guard guard(mutex_);
    return text_;
}

bool isPortName(const std::string& name) {
    for (int number = 1; number <= PosixSerialFactory::kPorts; ++number) {
        if (name == "com" + std::to_string(number)) return true;
    }
    return false;
}

PosixSerialFactory::PosixSerialFactory() : errors_(std::make_shared<SerialErrors>()) {}

PosixSerialFactory::~PosixSerialFactory() = default;

bool PosixSerialFactory::mapPort(const std::string& name, const std::string& device) {
    if (!isPortName(name)) {
        errors_->set(name + ": not a port name (com1 .. com16)");
        return false;
    }
    const std::lock_guard guard(mutex_);
    if (device.empty()) {
        devices_.erase(name);
    } else {
        devices_[name] = device;
    }
    return true;
}

std::string PosixSerialFactory::deviceOf(const std::string& name) const {
    const std::lock_guard guard(mutex_);
    const auto row = devices_.find(name);
    return row != devices_.end() ? row->second : std::string();
}

void PosixSerialFactory::setGapFloor(int ms) {
    const std::lock_guard guard(mutex_);
    exchange_.gapFloor = Milliseconds{std::max(0, ms)};
}

void PosixSerialFactory::setFrameEnd(FrameEndBy frameEnd) {
    const std::lock_guard guard(mutex_);
    exchange_.frameEnd = frameEnd;
}

void PosixSerialFactory::setReplyRules(std::shared_ptr<const ReplyRules> rules) {
    const std::lock_guard guard(mutex_);
    exchange_.rules = std::move(rules);
}

void PosixSerialFactory::setReport(std::function<void(const std::string&)> report) {
    const std::lock_guard guard(mutex_);
    exchange_.report = std::move(report);
}

void PosixSerialFactory::setThrownAway(
    std::function<void(const std::string&, ByteView)> thrownAway) {
    const std::lock_guard guard(mutex_);
    thrownAway_ = std::move(thrownAway);
}

ExchangeOptions PosixSerialFactory::exchangeOf(const std::string& port) const {
    ExchangeOptions options = exchange_;
    options.port = port;
    options.longestWait = longestWait_;
    if (thrownAway_) {
        options.thrownAway = [port, show = thrownAway_](ByteView frame) { show(port, frame); };
    }
    return options;
}

ISerialPort* PosixSerialFactory::openPort(const char* name) {
    const std::lock_guard guard(mutex_);
    const std::string wanted = name != nullptr ? name : "";
    const auto row = devices_.find(wanted);
    if (row == devices_.end()) {
        errors_->set(wanted + (isPortName(wanted) ? ": no device is mapped to this port"
                                                  : ": not a port name (com1 .. com16)"));
        return nullptr;
    }
    auto opened = PosixSerialPort::open({row->second, exchangeOf(wanted)}, errors_);
    if (!opened) {
        errors_->set(opened.error());
        return nullptr;
    }
    errors_->forget();
    ISerialPort* port = opened.value().get();
    open_[port] = std::move(opened).value();
    return port;
}

void PosixSerialFactory::releasePort(ISerialPort* port) {
    const std::lock_guard guard(mutex_);
    open_.erase(port);
}

int PosixSerialFactory::openPorts() const {
    const std::lock_guard guard(mutex_);
    return static_cast<int>(open_.size());
}

std::string PosixSerialFactory::lastError() const {
    return errors_->get();
}

void* PosixSerialFactory::ConvertTo(const char* name) {
    return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this) : nullptr;
}

}  // namespace runtime
