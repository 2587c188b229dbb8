#include "sim/PtyLine.h"

#include <fcntl.h>
#include <stdlib.h>
#include <termios.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <system_error>
#include <utility>

namespace sim {
namespace {

using posix::FileDescriptor;

[[noreturn]] void fail(const std::string& what) {
    throw std::system_error(errno, std::generic_category(), what);
}

FileDescriptor openMaster() {
    FileDescriptor master(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC));
    if (!master) fail("no pseudo terminal");
    if (::grantpt(master.get()) != 0 || ::unlockpt(master.get()) != 0) fail("pseudo terminal");
    const int flags = ::fcntl(master.get(), F_GETFL);
    if (flags < 0 || ::fcntl(master.get(), F_SETFL, flags | O_NONBLOCK) != 0) {
        fail("pseudo terminal");
    }
    return master;
}

std::string deviceOf(const FileDescriptor& master) {
    std::array<char, 128> name{};
    const int error = ::ptsname_r(master.get(), name.data(), name.size());
    if (error != 0) throw std::system_error(error, std::generic_category(), "pseudo terminal");
    return name.data();
}

/// Every byte passes as it is: no echo, no line ends, no signals.
void makeRaw(const FileDescriptor& terminal, const std::string& device) {
    termios settings{};
    if (::tcgetattr(terminal.get(), &settings) != 0) fail(device);
    ::cfmakeraw(&settings);
    if (::tcsetattr(terminal.get(), TCSANOW, &settings) != 0) fail(device);
}

FileDescriptor openDevice(const std::string& device) {
    FileDescriptor terminal(::open(device.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC));
    if (!terminal) fail(device);
    makeRaw(terminal, device);
    return terminal;
}

bool pointsTo(const std::string& link, const std::string& target) {
    std::array<char, 128> found{};
    const ssize_t length = ::readlink(link.c_str(), found.data(), found.size());
    return length >= 0 && target == std::string(found.data(), static_cast<std::size_t>(length));
}

}  // namespace

PtyLine::PtyLine(std::string link)
    : master_(openMaster()), device_(deviceOf(master_)), link_(std::move(link)) {
    keeper_ = openDevice(device_);
    if (!link_.empty()) makeLink();
}

void PtyLine::makeLink() {
    // What is there is somebody's, also a link: a killed simulator's looks like any other.
    if (::symlink(device_.c_str(), link_.c_str()) != 0) fail(link_);
}

wire::Bytes PtyLine::read() {
    std::array<std::uint8_t, 4096> buffer{};
    const ssize_t count = ::read(master_.get(), buffer.data(), buffer.size());
    if (count > 0) return {buffer.begin(), buffer.begin() + count};
    const bool nothingYet = count < 0 && (errno == EAGAIN || errno == EINTR);
    if (!nothingYet) hangUp();
    return {};
}

void PtyLine::write(wire::ByteView bytes) {
    while (!bytes.empty()) {
        const ssize_t count = ::write(master_.get(), bytes.data(), bytes.size());
        if (count < 0 && errno == EINTR) continue;
        if (count <= 0) return;
        bytes = bytes.subspan(static_cast<std::size_t>(count));
    }
}

void PtyLine::hangUp() {
    if (!master_) return;
    // Another simulator may have taken the link over in the meantime.
    if (!link_.empty() && pointsTo(link_, device_)) ::unlink(link_.c_str());
    master_ = FileDescriptor();
    keeper_ = FileDescriptor();
}

}  // namespace sim
