// A serial line made of a pseudo terminal. Linux only.
#pragma once

#include <string>

#include "posix/FileDescriptor.h"
#include "wire/Bytes.h"

namespace sim {

/// The pair of ends: this side is the simulator's, the device is the masters'. The line holds the
/// device open itself, so that masters may come and go without ending it, and is raw, without echo.
/// Threads: one at a time.
class PtyLine {
  public:
    /// Opens the line.
    /// @param link  Path of a symbolic link to the device; whatever is there already, an old link
    ///              too, is refused and left alone. Empty: none.
    /// Errors: std::system_error; nothing stays behind.
    explicit PtyLine(std::string link = {});
    /// Hangs up.
    ~PtyLine() { hangUp(); }
    PtyLine(const PtyLine&) = delete;
    PtyLine& operator=(const PtyLine&) = delete;

    /// The path that a master opens: the link when there is one, else the device.
    const std::string& path() const { return link_.empty() ? device_ : link_; }
    /// The device itself, /dev/pts/N.
    const std::string& device() const { return device_; }
    /// For poll(): readable when a master has sent; -1 after hangUp().
    int descriptor() const { return master_.get(); }

    /// @return what has arrived; empty when nothing has. Never waits. A line that fails hangs up.
    wire::Bytes read();

    /// Sends. Never waits: bytes that nobody has room for are lost, as on a real line.
    void write(wire::ByteView bytes);

    /// Closes the line and removes the link: the device vanishes and a master that has it open
    /// sees the end of file or EIO. A second call does nothing.
    void hangUp();

  private:
    void makeLink();

    posix::FileDescriptor master_;
    posix::FileDescriptor keeper_;  // The device end that keeps the line alive between masters.
    std::string device_;
    std::string link_;
};

}  // namespace sim
