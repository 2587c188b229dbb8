// The host's serial port service, "ISerialFactory", and the ports that it opens.
#pragma once

#include "platform/IInterface.h"

/// An open serial port.
/// Threads: purge(), receiveByte(), send() and receiveFrame() come one at a time; the driver's
/// transaction lock sees to that. configure() may come from another thread beside any one of them,
/// also between a request and its reply, but never beside another configure(). The release comes
/// when all of them have returned.
class ISerialPort {
  public:
    /// Applies the line settings to what is sent and received from now on. A frame that is being
    /// sent leaves whole, with the settings that it began with; what is being received may be lost.
    /// @param baud      Bits per second, e.g. 9600.
    /// @param parity    0 none, 1 even, 2 odd, 3 mark, 4 space.
    /// @param dataBits  7 or 8.
    /// @param stopBits  1 or 2.
    /// @param mode      0 RS-232, 1 RS-485, 2 RS-422, 3 RS-485P.
    /// @return non-zero on success; 0 when the port cannot work that way (its settings are then
    /// undefined and the port should be released).
    virtual int configure(int baud, int parity, int dataBits, int stopBits, int mode) = 0;

    /// Throws away what has been received and not yet read.
    virtual void purge() = 0;

    /// Waits for one byte.
    /// @param byte       Receives it; untouched when none came.
    /// @param timeoutMs  Milliseconds from the call; 0 only looks.
    /// @param reserved   0.
    /// @return non-zero when a byte arrived in time; 0 also, and at once, when the port is gone.
    virtual int receiveByte(unsigned char* byte, int timeoutMs, int reserved) = 0;

    /// Sends `length` bytes and returns when the port has taken them all.
    /// @return non-zero on success.
    virtual int send(const unsigned char* data, int length) = 0;

    /// Reads the rest of a frame. The frame ends when the line has been silent for `gapMs`, when
    /// `maxLength` bytes are there, or when `timeoutMs` have passed since the call, whichever is
    /// first.
    /// @param data       At least `maxLength` bytes.
    /// @param received   Receives the number of bytes stored, 0..maxLength, also on failure.
    /// @param reserved   0.
    /// @return non-zero when at least one byte was stored and the port still works.
    virtual int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                             int* received, int reserved) = 0;

  protected:
    ~ISerialPort() = default;
};

/// Threads: every operation may be called from any thread.
class ISerialFactory : public IInterface {
  public:
    /// @param name  "com1" .. "com16".
    /// @return the open port, to be handed back with releasePort(), or null when it can't be had.
    virtual ISerialPort* openPort(const char* name) = 0;
    /// Closes and frees a port that this factory opened.
    virtual void releasePort(ISerialPort* port) = 0;
};
