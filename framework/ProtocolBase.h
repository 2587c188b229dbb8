// The framework's base of every protocol.
#pragma once

#include <string>
#include <vector>

#include "framework/ErrorState.h"
#include "framework/Guarded.h"
#include "framework/KeptText.h"
#include "framework/TagList.h"
#include "platform/IProtocol.h"

class TagBase;

/// Supplies the error state, the identity, the ownership of tags, the generic reads, the queries
/// of tag URI fields, the console and a refusing default for every optional capability.
/// Pure operations are left to the engine and to the driver.
/// Nothing is thrown, neither by the constructor nor by any operation: short memory is a failure
/// with -1 "Out of memory", and all is as before the call. Threads: no locking here; see IProtocol.
class ProtocolBase : public IProtocol7 {
  public:
    ProtocolBase();
    ~ProtocolBase() override;
    ProtocolBase(const ProtocolBase&) = delete;
    ProtocolBase& operator=(const ProtocolBase&) = delete;

    // IProtocol
    void* ConvertTo(const char* name) override;
    ITag* CreateTag(const char* uri) override;
    void FreeTag(ITag* tag) override;
    int Start() override;
    int Stop() override;
    int Read(const ITag* tag, unsigned char* value) override;
    int WriteBlock(const ITag* tag, const unsigned char* data, int length) override;
    int MaxDatagramItems(const ITag* tag) const override;
    int MaxDatagramLength(const ITag* tag) const override;
    bool CanCoexistInDatagram(const ITag* a, const ITag* b) const override;
    int ReadDatagram(const ITag* const* tags, int count, unsigned char* data) override;
    const char* GetNextInstanceName() const override;
    int GetLastError() const override;
    const char* GetLastErrorString() const override;
    int GetInfo(char* buffer, int size) const override;
    const unsigned char* GetXml() const override;
    bool IsConverted() const override;
    const char* GetIdent() const override;
    void SetIdent(const char* ident) override;

    // IProtocol2
    int DoCommand(const char* command, char* answer, int size) override;
    int Extend(int code, void* data) override;

    // IProtocol3
    bool CanAddToDatagram(const ITag* const* tags, int count, const ITag* candidate) override;
    int ReadDatagramWithStatus(const ITag* const* tags, int count, unsigned char* data,
                               idal_error_t* status) override;
    bool MultipleReadSupported() const override;
    int MultipleRead(IMultiRead* request) override;
    bool MultipleWriteSupported() const override;
    int MultipleWrite(IMultiWrite* request) override;

    // IProtocol4
    bool CanReadBitBlock(const ITag* tag) const override;
    int ReadBitBlock(const ITag* tag, unsigned char* data, int bits) override;
    void* GetInterface(const char* name) override;
    int MaxUnusedGap(const ITag* tag) const override;
    bool IsBefore(const ITag* a, const ITag* b) const override;
    bool IsAdjacent(const ITag* a, const ITag* b) const override;
    bool NeedsReadBeforeWrite(const ITag* tag) const override;

    // IProtocol5
    bool CanWriteDatagrams(const ITag* tag) const override;
    bool CanAddToWriteDatagram(const ITag* const* tags, int count,
                               const ITag* candidate) const override;
    int WriteDatagramWithStatus(const ITag* const* tags, int count, const unsigned char* data,
                                idal_error_t* status) override;
    bool CanWriteBitBlock(const ITag* tag) const override;
    int WriteBitBlock(const ITag* tag, const unsigned char* data, int bits) override;
    int readObject(const ITag* tag, IObjectString* object) override;
    int writeObject(const ITag* tag, const IObjectString* object) override;

    // IProtocol6
    int vcsGetCapability() const override;
    int vcsGetComParams(char* text, int size) const override;
    int vcsActivateInterleaved(unsigned short onOff) override;
    IEventChannel* createEventChannel(int kind) override;
    IEventChannel* createEventChannel(IEventProcessor* processor) override;
    void deleteEventChannel(IEventChannel* channel) override;
    int addEventSource(IEventChannel* channel, const char* source) override;
    int addAlarmEvents(IEventChannel* channel, IAlarm* alarm) override;
    void* frontEvent(IEventChannel* channel) override;
    void popEvent(IEventChannel* channel) override;
    IAlarm* createAlarm(const char* source) override;
    void deleteAlarm(IAlarm* alarm) override;
    int listAlarms(IAlarmProcessor* processor) override;
    int quitAlarm(IAlarm* alarm) override;
    ITrend* createTrend(const char* source) override;
    void deleteTrend(ITrend* trend) override;
    int readTrend(ITrend* trend, unsigned long long from, unsigned long long to,
                  unsigned long long& next, unsigned int limit, bool option,
                  ITrendProcessor* processor) override;

    // IProtocol7
    bool hasPlcTimestamp(const ITag* tag) override;
    int readWithTimestamp(const ITag* tag, unsigned char* value,
                          unsigned long long* stamp) override;
    int readBlockWithTimestamp(const ITag* tag, unsigned char* data, int length,
                               unsigned long long* stamp) override;
    int readDatagramWithTimestamp(const ITag* const* tags, int count, unsigned char* data,
                                  idal_error_t* status, unsigned long long* stamps) override;
    int getTagUriFieldCount() const override;
    const char* getTagUriFieldName(int index) const override;
    int getTagUriFieldPosition(const char* name) const override;
    const char* getTagUriField(const ITag* tag, int index, int* length) const override;
    int readArrayItem(const ITag* tag, int index, unsigned char* value) override;
    int writeArrayItem(const ITag* tag, int index, const unsigned char* value) override;
    int readBitBlockWithTimestamp(const ITag* tag, unsigned char* data, int bits,
                                  unsigned long long* stamp) override;

    // What a driver supplies, in table order behind the interface family.

    /// @return a new tag for the URI, or null after setting the error.
    virtual ITag* CreateTagBase(const char* uri) = 0;
    /// @return the worst-case time of one transaction in milliseconds; `tag` may be null.
    virtual int GetMaxTm(const ITag* tag) const = 0;
    /// @return the names of the tag URI's fields, ended by a null pointer.
    virtual const char* const* tagUriNames() const;

  protected:
    /// Stores the error that GetLastError() and GetLastErrorString() report, code and text
    /// together; see ErrorState. Null is an empty text. Needs no memory for texts of up to 256
    /// characters; longer ones are cut when there is none. Never throws. Threads: any.
    void SetError(int code, const char* text) noexcept;
    /// Reports -1 "Out of memory", without needing any. @return 0
    int outOfMemory() noexcept;
    /// Reports why ConvertVariable() failed: -9 `text`, or that there was no memory for it.
    /// REQUIRES: the tag is a TagBase, as every tag that CreateTagBase() makes. @return 0
    int conversionFailed(const ITag* tag, const char* text) noexcept;
    /// Runs a step of an entry; when it throws, reports the shortage and returns `refused`.
    template <class Result, class Step>
    Result guardedBy(Result refused, Step&& step) noexcept {
        return guarded(
            refused, [this] { outOfMemory(); }, std::forward<Step>(step));
    }
    /// Reports the tag's own error text together with its URI, or "Out of memory". Never throws.
    void SetTagError(const TagBase* tag) noexcept;
    /// Destroys every tag that this object owns.
    void DeleteTags();
    /// @return whether the tag is an array that has item `index`; sets the error when not.
    bool arrayItemInRange(const ITag* tag, int index);

    /// Tells why the tag cannot be read as a whole, null when it can. The engine sets it in its
    /// constructor, so that a tag of any length is refused before memory is taken for its value;
    /// null: every tag is tried.
    using ReadCheck = const char* (*)(const ITag* tag);
    ReadCheck readCheck_ = nullptr;
    /// Tells whether `b` ends where `a` begins. The engine, which knows how many bits an item has,
    /// sets it in its constructor, so that IsAdjacent() need not be its own: every run time's
    /// engine leaves that slot to the framework. Null: an item is a byte.
    using Adjacency = bool (*)(const ITag* a, const ITag* b);
    Adjacency adjacency_ = nullptr;

  private:
    class ConsoleTag;

    int refuseEvents();
    bool refuseRead(const ITag* tag);
    int commandInfo(char* answer, int size) const;
    int commandMaxTm(char* answer, int size) const;
    int commandRead(const std::vector<std::string>& words, char* answer, int size);
    int commandWrite(const std::vector<std::string>& words, char* answer, int size);
    bool showValue(const ITag* tag, char* answer, int size);
    const char* writeHex(const ITag* tag, const std::string& hex);

    TagList tags_;
    ErrorState error_;
    KeptText ident_;
};

/// @return milliseconds since the Unix epoch.
unsigned long long currentTimeStamp();
