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

#include "runtime/LineTransfer.h"

namespace runtime {
namespace {

constexpr const char* kInUse = "in use";

FileDescriptor openTerminal(const std::string& device) {
    int fd = -1;
    do {
        fd = ::open(device.c_str(), O_RDWR | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
    } while (fd < 0 && errno == EINTR);
    return FileDescriptor(fd);
}

/// The terminal's own exclusiveness does not hold root back; the file lock does. The lock comes
/// first, so that a loser leaves the winner's terminal untouched.
bool takeForOurselves(int fd) {
    if (::flock(fd, LOCK_EX | LOCK_NB) != 0) return false;
    return ::ioctl(fd, TIOCEXCL) == 0;
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

}  // namespace

Result<std::unique_ptr<PosixSerialPort>, std::string> PosixSerialPort::open(
    const PortRequest& request, std::shared_ptr<SerialErrors> errors) {
    const auto refusal = [&request](const char* why) {
        return request.name + ": " + request.device + ": " + why;
    };
    FileDescriptor fd = openTerminal(request.device);
    if (!fd) return refusal(errno == EBUSY ? kInUse : std::strerror(errno));
    if (::isatty(fd.get()) == 0) return refusal("not a terminal");
    if (!takeForOurselves(fd.get())) {
        return refusal(errno == EWOULDBLOCK ? kInUse : std::strerror(errno));
    }
    termios found{};
    if (::tcgetattr(fd.get(), &found) != 0) return refusal(std::strerror(errno));
    return std::unique_ptr<PosixSerialPort>(
        new PosixSerialPort(request, std::move(errors), std::move(fd), found));
}

PosixSerialPort::PosixSerialPort(const PortRequest& request, std::shared_ptr<SerialErrors> errors,
                                 FileDescriptor fd, const termios& found)
    : label_(request.name + ": " + request.device + ": "),
      gapFloorMs_(request.gapFloorMs),
      errors_(std::move(errors)),
      fd_(std::move(fd)),
      line_(fd_.get()),
      found_(found),
      foundDirection_(directionOf(fd_.get())),
      direction_(foundDirection_),
      pseudo_(isPseudoTerminal(fd_.get())) {}

PosixSerialPort::~PosixSerialPort() {
    restore();
}

/// Nothing here can be reported to anybody, and a port that is gone has nothing to restore.
void PosixSerialPort::restore() {
    line_.discardOutput();
    if (foundDirection_) changeDirection(*foundDirection_);
    setTermios(fd_.get(), found_);
    ::ioctl(fd_.get(), TIOCNXCL);
    ::flock(fd_.get(), LOCK_UN);
}

int PosixSerialPort::configure(int baud, int parity, int dataBits, int stopBits, int mode) {
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
    errors_->set({});
    return 1;
}

std::string PosixSerialPort::applyFormat() {
    const termios wanted = rawTermios(found_, settings_);
    if (setTermios(fd_.get(), wanted) != 0) return std::strerror(errno);
    termios taken{};
    if (::tcgetattr(fd_.get(), &taken) != 0) return std::strerror(errno);
    return differenceIn(wanted, taken, pseudo_);
}

std::string PosixSerialPort::applyDirection() {
    if (!foundDirection_) return {};
    if (changeDirection(rs485For(*foundDirection_, settings_.mode))) return {};
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

void PosixSerialPort::purge() {
    line_.discardInput();
}

int PosixSerialPort::receiveByte(unsigned char* byte, int timeoutMs, int /*reserved*/) {
    return receiveOne(line_, *byte, Milliseconds{timeoutMs}) == Transfer::Complete ? 1 : 0;
}

int PosixSerialPort::send(const unsigned char* data, int length) {
    // Without a rate there is no time that sending may take.
    if (length < 0 || !speedOf(settings_.baud)) return 0;
    const auto count = static_cast<std::size_t>(length);
    const auto character = characterTime(settings_.baud, characterBits(settings_));
    const Transfer end = sendAll(line_, {data, count}, sendingTime(count, character), character);
    return end == Transfer::Complete ? 1 : 0;
}

int PosixSerialPort::receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                                  int* received, int /*reserved*/) {
    const auto room = static_cast<std::size_t>(std::max(0, maxLength));
    const FrameEnd end = receiveRest(line_, {data, room}, Milliseconds{timeoutMs},
                                     Milliseconds{std::max(gapMs, gapFloorMs_)});
    *received = static_cast<int>(end.count);
    return end.count > 0 && end.how != Transfer::Gone ? 1 : 0;
}

}  // namespace runtime
