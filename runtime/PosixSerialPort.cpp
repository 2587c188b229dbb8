// The operations of an open serial port.
#include "runtime/PosixSerialPort.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace runtime {
namespace {

using posix::FileDescriptor;

constexpr const char* kInUse = "in use";

FileDescriptor openTerminal(const std::string& device) {
    int fd = -1;
    do {
        fd = ::open(device.c_str(), O_RDWR | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
    } while (fd < 0 && errno == EINTR);
    return FileDescriptor(fd);
}

/// Pseudo terminals' own ends have the majors 136 to 143 (Linux, devices.txt).
bool isPseudoTerminal(int fd) {
    struct stat info {};
    if (::fstat(fd, &info) != 0) return false;
    const unsigned number = major(info.st_rdev);
    return number >= 136 && number <= 143;
}

std::optional<serial_rs485> directionOf(int fd) {
    serial_rs485 direction{};
    if (::ioctl(fd, TIOCGRS485, &direction) != 0) return std::nullopt;
    return direction;
}

int setTermios(int fd, const termios& wanted) {
    int result = 0;
    do {
        result = ::tcsetattr(fd, TCSANOW, &wanted);
    } while (result != 0 && errno == EINTR);
    return result;
}

void putBackFound(const void* what) noexcept {
    static_cast<const FoundTerminal*>(what)->putBack();
}

}  // namespace

void FoundTerminal::putBack() const noexcept {
    ::tcflush(fd, TCOFLUSH);
    serial_rs485 now{};
    // Some drivers move RTS whenever they are told, also when nothing would change.
    const bool changed =
        direction && ::ioctl(fd, TIOCGRS485, &now) == 0 && now.flags != direction->flags;
    if (changed) {
        serial_rs485 before = *direction;
        ::ioctl(fd, TIOCSRS485, &before);
    }
    setTermios(fd, settings);
    ::ioctl(fd, TIOCNXCL);
    ::flock(fd, LOCK_UN);
}

Result<std::unique_ptr<PosixSerialPort>, std::string> PosixSerialPort::open(
    const PortRequest& request, std::shared_ptr<SerialErrors> errors) {
    const auto refusal = [&request](const char* why) {
        return request.exchange.port + ": " + request.device + ": " + why;
    };
    FileDescriptor fd = openTerminal(request.device);
    if (!fd) return refusal(errno == EBUSY ? kInUse : std::strerror(errno));
    if (::isatty(fd.get()) == 0) return refusal("not a terminal");
    // The terminal's own exclusiveness does not hold root back; the file lock does. The lock comes
    // first, so that a loser leaves the winner's terminal untouched.
    if (::flock(fd.get(), LOCK_EX | LOCK_NB) != 0) {
        return refusal(errno == EWOULDBLOCK ? kInUse : std::strerror(errno));
    }
    termios found{};
    if (::tcgetattr(fd.get(), &found) != 0) return refusal(std::strerror(errno));
    std::unique_ptr<PosixSerialPort> port(
        new PosixSerialPort(request, std::move(errors), std::move(fd), found));
    // Last: from here on a signal that ends the process finds the port announced, and the terminal
    // does not stay closed to everybody.
    if (::ioctl(port->descriptor(), TIOCEXCL) != 0) return refusal(std::strerror(errno));
    return port;
}

PosixSerialPort::PosixSerialPort(PortRequest request, std::shared_ptr<SerialErrors> errors,
                                 FileDescriptor fd, const termios& found)
    : label_(request.exchange.port + ": " + request.device + ": "),
      errors_(std::move(errors)),
      fd_(std::move(fd)),
      line_(fd_.get()),
      exchange_(line_, std::move(request.exchange)),
      found_{fd_.get(), found, directionOf(fd_.get())},
      putBackAtTheEnd_(putBackFound, &found_),
      direction_(found_.direction),
      pseudo_(isPseudoTerminal(fd_.get())) {}

PosixSerialPort::~PosixSerialPort() {
    awaitSent();
    found_.putBack();
}

/// What was sent leaves whole before its settings go.
void PosixSerialPort::awaitSent() {
    if (!speedOf(settings_.baud)) return;
    const auto character = characterTime(settings_.baud, characterBits(settings_));
    drain(line_, line_.now() + sendingTime(line_.unsent(), character), character);
}

int PosixSerialPort::configure(int baud, int parity, int dataBits, int stopBits, int mode) {
    const std::lock_guard guard(sendMutex_);
    awaitSent();
    settings_ = {baud, parity, dataBits, stopBits, mode};
    std::string fault = settingsFault(settings_);
    if (fault.empty()) fault = applyFormat();
    if (fault.empty()) fault = applyDirection();
    if (!fault.empty()) {
        errors_->set(label_ + fault);
        return 0;
    }
    line_.discardInput();
    line_.discardOutput();
    exchange_.forgetInput();
    exchange_.setFormat(settings_.baud, characterBits(settings_));
    errors_->set({});
    return 1;
}

std::string PosixSerialPort::applyFormat() {
    const termios wanted = rawTermios(found_.settings, settings_);
    if (setTermios(fd_.get(), wanted) != 0) return std::strerror(errno);
    termios taken{};
    if (::tcgetattr(fd_.get(), &taken) != 0) return std::strerror(errno);
    return differenceIn(wanted, taken, pseudo_);
}

std::string PosixSerialPort::applyDirection() {
    if (!found_.direction) return {};
    if (changeDirection(rs485For(*found_.direction, settings_.mode))) return {};
    // A port may answer the question for its direction control and yet have none.
    if (errno == ENOTTY || errno == EOPNOTSUPP || !isHalfDuplex(settings_.mode)) return {};
    return std::string("RS-485 direction control: ") + std::strerror(errno);
}

/// Leaves the port alone when nothing would change: some drivers move RTS whenever they are told.
bool PosixSerialPort::changeDirection(serial_rs485 wanted) {
    if (wanted.flags == direction_->flags) return true;
    if (::ioctl(fd_.get(), TIOCSRS485, &wanted) != 0) return false;
    direction_ = wanted;
    return true;
}

/// Tells the factory of a port that has gone. @return whether all was done.
bool PosixSerialPort::noted(Transfer end) {
    if (end == Transfer::Gone) errors_->notePortGone();
    return end == Transfer::Complete;
}

void PosixSerialPort::purge() {
    exchange_.purge();
}

int PosixSerialPort::receiveByte(unsigned char* byte, int timeoutMs, int /*reserved*/) {
    return noted(exchange_.receiveByte(*byte, Milliseconds{timeoutMs})) ? 1 : 0;
}

int PosixSerialPort::send(const unsigned char* data, int length) {
    if (length < 0) return 0;
    const ByteView request(data, static_cast<std::size_t>(length));
    if (!exchange_.clearToSend(request)) return 0;
    const std::lock_guard guard(sendMutex_);
    // Without a rate there is no time that sending may take.
    if (!speedOf(settings_.baud)) return 0;
    return noted(exchange_.transmit(request, isHalfDuplex(settings_.mode))) ? 1 : 0;
}

int PosixSerialPort::receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                                  int* received, int /*reserved*/) {
    const auto room = static_cast<std::size_t>(std::max(0, maxLength));
    const FrameEnd end =
        exchange_.receiveFrame({data, room}, Milliseconds{timeoutMs}, Milliseconds{gapMs});
    *received = static_cast<int>(end.count);
    noted(end.how);
    return end.count > 0 && end.how != Transfer::Gone ? 1 : 0;
}

}  // namespace runtime
