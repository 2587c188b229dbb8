// The Modbus master for serial lines.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "engine/ProtgenProtocol.h"
#include "framework/AddressReplacer.h"
#include "framework/MemoryManager.h"
#include "framework/ParameterReplacer.h"
#include "mrtu/LineSettings.h"
#include "mrtu/OwnedLock.h"
#include "mrtu/Params.h"
#include "mrtu/Reply.h"
#include "platform/IMultiTask2.h"
#include "platform/ISerialFactory.h"

class Tag_MRTU;

/// One serial line with its slaves.
/// Threads: reads, writes, the driver's own areas, the console's "setid" and "getid", Start(),
/// Stop(), the reports and the error state may come at the same time. Configuration, the creation
/// and the freeing of tags rely on the host's ordering.
/// Locks, in the order in which they are taken:
/// 1. the transaction lock, the host's: every complete exchange on the line; Stop() takes it too;
/// 2. the port's turn: whoever opens, sets up or releases the port does so alone. No transaction
///    and none of the driver's areas but "SP_Done" waits for it;
/// 3. leaf locks around the line's settings, inside the replacers and the error state. They are
///    held for a few moves of memory, never over a call of the host's.
class Protocol_MRTU : public ProtgenProtocol {
  public:
    /// REQUIRES: the module object holds the host's services.
    Protocol_MRTU();
    ~Protocol_MRTU() override;

    void* ConvertTo(const char* name) override;
    const char* GetImpName() const override { return "Protocol_MRTU"; }
    int GetImpVersion() const override { return 100; }
    int Config(const char* text) override;
    int Start() override;
    int Stop() override;
    const char* GetName() const override { return "MRTU"; }
    int GetProtocolVersion() const override { return 126; }
    int GetProtocolType() const override { return 184; }
    const char* GetProtocolName() const override { return "Modbus RTU"; }
    const unsigned char* GetXml() const override;
    int DoCommand(const char* command, char* answer, int size) override;
    int Extend(int code, void* data) override;
    int vcsGetCapability() const override { return 2; }
    int vcsGetComParams(char* text, int size) const override;

    ITag* CreateTagBase(const char* uri) override;
    int GetMaxTm(const ITag* tag) const override;
    const char* const* tagUriNames() const override;

    int getMaxItemCount(const ProtgenTag* tag, bool write) const override;
    int arrayItemByTag() const override { return 1; }
    int doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) override;
    bool doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) override;
    int doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                    int count) override;
    bool doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) override;

    const _MRTU::ParamManager* getParamManager() const { return &params_; }
    const MemoryManager* getMemoryManager() const { return &memoryManager_; }

  private:
    class LineLock;

    int fail(const _MRTU::Fault& fault);

    // The line, held between Start() and Stop()
    int start();
    _MRTU::LineSettings lineSettings() const;
    int lineSetting(int _MRTU::LineSettings::*setting) const;
    void applySerialOverrides();
    // REQUIRE: the caller has the port's turn.
    bool openPort();
    void releasePort();
    bool configure(ISerialPort& port) const;

    // One exchange with a slave. REQUIRES: the line lock is held, except for pauseBefore().
    void pauseBefore(const Tag_MRTU& tag) const;
    bool modiconMode(const Tag_MRTU& tag);
    std::uint16_t lineAddress(const Tag_MRTU& tag, int index);
    std::uint8_t lineNode(const Tag_MRTU& tag) const;
    _MRTU::Fault beginRequest(const Tag_MRTU& tag, std::uint8_t function, int index,
                              _MRTU::Message& request);
    void exchange(const Tag_MRTU& tag, const _MRTU::Message& request, _MRTU::Reply& reply);
    void flushInput();
    void receiveReply(const _MRTU::NodeParams& node, bool ascii, _MRTU::Reply& reply);

    // Reads and writes of device areas
    _MRTU::Fault readItems(const Tag_MRTU& tag, int index, unsigned char* data, int count);
    int write(const Tag_MRTU& own, int index, const unsigned char* data, int count);
    int writeItems(const Tag_MRTU* tag, int index, const unsigned char* data, int count);
    _MRTU::Fault writeRequest(const Tag_MRTU& tag, int index, const unsigned char* data, int count);

    // The driver's own areas
    void readDriverArea(const Tag_MRTU& tag, unsigned char* data);
    bool writeDriverArea(const Tag_MRTU& tag, const unsigned char* data);
    void setModiconMode(int node, bool on);
    bool stage(const char* name, int value, bool allowed);
    void applyStaged();
    int serialValue(const char* name, int current);
    void takeStaged();

    // Console commands
    int commandHelp(const char* command, char* answer, int size);
    void commandSetId(const char* command, char* answer, int size);
    void commandGetId(char* answer, int size);
    void listIds(char* answer, int size) const;

    std::atomic<bool> started_ = false;
    _MRTU::ParamManager params_;
    bool configured_ = false;  ///< A text was accepted, if only up to its parity or mode.
    MemoryManager memoryManager_;
    mutable std::mutex lineMutex_;  // guards line_, a leaf but for the replacers' locks
    _MRTU::LineSettings line_;
    std::mutex portTurn_;
    // Changed by Start() while it is not started, and by Stop(), which holds the transaction lock.
    ISerialPort* port_ = nullptr;
    ISerialFactory* serialFactory_;
    AddressReplacerID nodeOverrides_;
    ParameterReplacer overrides_;
    GroupParameterReplacer stagedOverrides_;
    IMultiTask2* multiTask_;
    OwnedLock lock_;
};

/// @return a new protocol object, owned by the caller.
IProtocol* CreateProtocol_MRTU();
