// A host that never runs short itself: its services work with Plenty.
#pragma once

#include <cstdint>
#include <map>
#include <string>

#include "platform/IInterfaceFactory.h"
#include "platform/IMultiTask2.h"
#include "platform/IPermanentStorage.h"
#include "platform/ISerialFactory.h"

namespace shortage {

/// Counts its locks; the process ends when one is taken twice or freed without being held.
class MultiTask final : public IMultiTask2 {
  public:
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "MultiTask"; }
    int GetImpVersion() const override { return 1; }
    ILock* createLock(int reserved) override;
    void deleteLock(ILock* lock) override;
    void sleep(int ms) override;

    int locksAlive() const { return alive_; }
    int locksHeld() const { return held_; }

  private:
    class Lock;

    int alive_ = 0;
    int held_ = 0;
};

/// A line with a slave for each node. Registers hold their own address, coils are on where the
/// address is odd; node 2 has 32-bit registers; writes are acknowledged and forgotten.
class Line final : public ISerialPort {
  public:
    virtual ~Line() = default;
    int configure(int baud, int parity, int dataBits, int stopBits, int mode) override;
    void purge() override {}
    int receiveByte(unsigned char* byte, int timeoutMs, int reserved) override;
    int send(const unsigned char* data, int length) override;
    int receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs, int* received,
                     int reserved) override;

    const std::string& settings() const { return settings_; }

  private:
    void put(unsigned byte);
    void putCheck();
    void answerRead(const unsigned char* request);

    std::string settings_;
    unsigned char reply_[260] = {};
    int length_ = 0;
    int next_ = 0;
};

class SerialFactory final : public ISerialFactory {
  public:
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "SerialFactory"; }
    int GetImpVersion() const override { return 1; }
    ISerialPort* openPort(const char* name) override;
    void releasePort(ISerialPort* port) override;

    int portsOpen() const { return open_; }
    const Line& line() const { return line_; }

  private:
    Line line_;
    int open_ = 0;
};

/// Every value as a text.
class Storage final : public IPermanentStorage2 {
  public:
    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "Storage"; }
    int GetImpVersion() const override { return 1; }
    void writeString(const char* section, const char* key, const char* value) override;
    void writeBool(const char* section, const char* key, bool value) override;
    void writeInt(const char* section, const char* key, int value) override;
    const char* readString(const char* section, const char* key) override;
    bool readBool(const char* section, const char* key) override;
    int readInt(const char* section, const char* key) override;
    int hasKey(const char* section, const char* key) override;
    void removeKey(const char* section, const char* key) override;
    int keyCount(const char* section) override;
    const char* keyName(const char* section, int index) override;
    int readStringInto(const char* section, const char* key, char* buffer, int size) override;
    int keyNameInto(const char* section, int index, char* buffer, int size) override;

    /// All that it holds, for comparing.
    std::string contents() const;

  private:
    std::map<std::string, std::map<std::string, std::string>> sections_;
};

/// A service that is only held.
class Held final : public IInterface {
  public:
    void* ConvertTo(const char*) override { return this; }
    const char* GetImpName() const override { return "Held"; }
    int GetImpVersion() const override { return 1; }
};

class Host final : public IInterfaceFactory {
  public:
    Host() = default;
    virtual ~Host() = default;
    Host(const Host&) = delete;
    Host& operator=(const Host&) = delete;

    MultiTask multiTask;
    SerialFactory serialFactory;
    Storage storage;

    /// From now on CreateInterface(name) gives null. `name` stays the caller's.
    void withhold(const char* name) { withheld_ = name; }

    IInterface* CreateInterface(const char* name) override;
    void ReleaseInterface(IInterface* service) override;
    int servicesHeld() const { return servicesHeld_; }

  private:
    Held held_;
    const char* withheld_ = nullptr;
    int servicesHeld_ = 0;
};

}  // namespace shortage
