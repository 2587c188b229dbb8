// The protocol interface family. Seven generations make one object with one table of operations:
// each generation adds its operations behind those of the one before. ConvertTo("IProtocol7") and
// so on down tells which generations an object supports; all of them are the same pointer.
#pragma once

#include <cstdint>

#include "platform/IInterface.h"
#include "platform/ITag.h"

class IAlarm;
class IAlarmProcessor;
class IEventChannel;
class IEventProcessor;
class IMultiRead;
class IMultiWrite;
class IObjectString;
class ITrend;
class ITrendProcessor;

/// Status of one item of a datagram: kItemDone marks an item that was transferred.
using idal_error_t = std::int32_t;
inline constexpr idal_error_t kItemDone = 1;

/// The record that IProtocol::Extend() takes. Only the first eight bytes and the one at offset 66
/// have a meaning here.
struct ExtensionRecord {
    std::int32_t queryCode;
    std::uint8_t flags[4];
    std::uint8_t unused[58];
    std::uint8_t value;
    std::uint8_t tail;
};
static_assert(sizeof(ExtensionRecord) == 4 + 4 + 58 + 1 + 1);

/// One protocol on one communication channel.
/// Results: where nothing else is said, an integer result is non-zero for success; after a failure
/// GetLastError() and GetLastErrorString() tell why. Both keep the last failure; a success does not
/// clear them.
/// Ownership: tags belong to the protocol until FreeTag() or its own destruction.
/// Threads: the host serialises Config(), CreateTag(), FreeTag(), the console's commands on tags
/// and the destruction with everything else on one object. Reads and writes of tags, the error
/// state, the ident, the reports, Start() and Stop() may run concurrently when the driver says that
/// it is re-entrant.
class IProtocol : public IInterface {
  public:
    /// Takes the configuration text (begins with "CfgVer=1"). REQUIRES: not started.
    virtual int Config(const char* text) = 0;
    /// @return a tag for the URI, or null after an error.
    virtual ITag* CreateTag(const char* uri) = 0;
    /// Destroys a tag of this protocol; null is ignored.
    virtual void FreeTag(ITag* tag) = 0;
    /// Tells whether one block read or write can serve both tags.
    virtual bool CanBeOptimized(const ITag* a, const ITag* b, bool write) const = 0;
    /// Opens the line. REQUIRES: Config() succeeded.
    virtual int Start() = 0;
    /// Closes the line, after the running transaction.
    virtual int Stop() = 0;
    /// Reads the tag into `value`, GetVarLength() bytes in run-time form.
    virtual int Read(const ITag* tag, unsigned char* value) = 0;
    /// Writes the tag from `value`, GetVarLength() bytes in run-time form.
    virtual int Write(const ITag* tag, const unsigned char* value) = 0;
    /// Reads `length` bytes in device form, beginning with the tag's first item.
    virtual int ReadBlock(const ITag* tag, unsigned char* data, int length) = 0;
    /// Writes `length` bytes in device form, beginning with the tag's first item.
    virtual int WriteBlock(const ITag* tag, const unsigned char* data, int length) = 0;
    /// @return the most tags that one datagram of the tag's memory can hold, 0 for no datagrams.
    virtual int MaxDatagramItems(const ITag* tag) const = 0;
    /// @return the most bytes of device form that one datagram can hold.
    virtual int MaxDatagramLength(const ITag* tag) const = 0;
    virtual bool CanCoexistInDatagram(const ITag* a, const ITag* b) const = 0;
    /// Reads `count` tags into `data`, their device forms one behind the other.
    virtual int ReadDatagram(const ITag* const* tags, int count, unsigned char* data) = 0;
    /// @return the protocol's short name, e.g. "MRTU".
    virtual const char* GetName() const = 0;
    virtual const char* GetNextInstanceName() const = 0;
    /// @return 1 before the first failure, then the code of the last one: -1 general, -3 not
    /// available or not started, -4 no response, -6 bad reply or exception, -9 conversion,
    /// -10 node disabled or broadcast read.
    virtual int GetLastError() const = 0;
    /// @return the text of the last failure, "" before the first one. It stays readable as long as
    /// the protocol lives. The usual texts never change; one that quotes what was asked for, such
    /// as a tag's URI, may be replaced after eight more different failures of that kind.
    virtual const char* GetLastErrorString() const = 0;
    virtual int GetProtocolVersion() const = 0;
    virtual int GetProtocolType() const = 0;
    /// @return the protocol's display name.
    virtual const char* GetProtocolName() const = 0;
    /// Writes a description of the object, at most `size` bytes and not terminated.
    /// @return the number of bytes written.
    virtual int GetInfo(char* buffer, int size) const = 0;
    /// @return the protocol description block: the text "compressedXML=" and a length, a zero
    /// byte, that many bytes of a zlib stream, "<<ICOM_XML_END>>" and a zero byte; null when there
    /// is none. Lives as long as the library.
    virtual const unsigned char* GetXml() const = 0;
    virtual bool IsConverted() const = 0;
    /// @return what SetIdent() set, else GetName(). It names the object's storage section.
    virtual const char* GetIdent() const = 0;
    virtual void SetIdent(const char* ident) = 0;
};

class IProtocol2 : public IProtocol {
  public:
    /// The text console: executes one command line and writes the answer, at most `size` bytes,
    /// padded with zeroes and unterminated when cut.
    /// @return 1 when the command was recognised, else 0 with `answer` untouched.
    virtual int DoCommand(const char* command, char* answer, int size) = 0;
    /// Optional extensions. Code 0 asks for support: `data` is an ExtensionRecord, whose queryCode
    /// is read and whose flags are set.
    virtual int Extend(int code, void* data) = 0;
};

class IProtocol3 : public IProtocol2 {
  public:
    /// Tells whether `candidate` can join a datagram that holds `count` tags already.
    virtual bool CanAddToDatagram(const ITag* const* tags, int count, const ITag* candidate) = 0;
    /// ReadDatagram() with one status an item.
    virtual int ReadDatagramWithStatus(const ITag* const* tags, int count, unsigned char* data,
                                       idal_error_t* status) = 0;
    virtual bool MultipleReadSupported() const = 0;
    virtual int MultipleRead(IMultiRead* request) = 0;
    virtual bool MultipleWriteSupported() const = 0;
    virtual int MultipleWrite(IMultiWrite* request) = 0;
};

class IProtocol4 : public IProtocol3 {
  public:
    /// @return the configuration node number of the tag.
    virtual int GetNodeID(const ITag* tag) const = 0;
    /// Tells whether the tag's memory is read bit by bit.
    virtual bool CanReadBitBlock(const ITag* tag) const = 0;
    /// Reads `bits` bits, beginning with the tag's first, into bit GetBitIndex() of `data` onward.
    virtual int ReadBitBlock(const ITag* tag, unsigned char* data, int bits) = 0;
    virtual void* GetInterface(const char* name) = 0;
    /// @return the most unused bytes between two tags that one block may span.
    virtual int MaxUnusedGap(const ITag* tag) const = 0;
    virtual bool IsBefore(const ITag* a, const ITag* b) const = 0;
    /// Tells whether `b` ends where `a` begins.
    virtual bool IsAdjacent(const ITag* a, const ITag* b) const = 0;
    /// Tells whether a write of the tag must first read what surrounds it.
    virtual bool NeedsReadBeforeWrite(const ITag* tag) const = 0;
};

class IProtocol5 : public IProtocol4 {
  public:
    virtual bool CanWriteDatagrams(const ITag* tag) const = 0;
    virtual bool CanAddToWriteDatagram(const ITag* const* tags, int count,
                                       const ITag* candidate) const = 0;
    virtual int WriteDatagramWithStatus(const ITag* const* tags, int count,
                                        const unsigned char* data, idal_error_t* status) = 0;
    virtual bool CanWriteBitBlock(const ITag* tag) const = 0;
    /// Writes `bits` bits, taken from bit GetBitIndex() of `data` onward.
    virtual int WriteBitBlock(const ITag* tag, const unsigned char* data, int bits) = 0;
    virtual int readObject(const ITag* tag, IObjectString* object) = 0;
    virtual int writeObject(const ITag* tag, const IObjectString* object) = 0;
};

class IProtocol6 : public IProtocol5 {
  public:
    virtual int vcsGetCapability() const = 0;
    /// Writes the line settings as text, at most `size` bytes, padded with zeroes and unterminated
    /// when cut. @return 1, or 0 when there is nothing to tell.
    virtual int vcsGetComParams(char* text, int size) const = 0;
    virtual int vcsActivateInterleaved(unsigned short onOff) = 0;

    virtual IEventChannel* createEventChannel(int kind) = 0;
    virtual IEventChannel* createEventChannel(IEventProcessor* processor) = 0;
    virtual void deleteEventChannel(IEventChannel* channel) = 0;
    virtual int addEventSource(IEventChannel* channel, const char* source) = 0;
    virtual int addAlarmEvents(IEventChannel* channel, IAlarm* alarm) = 0;
    virtual void* frontEvent(IEventChannel* channel) = 0;
    virtual void popEvent(IEventChannel* channel) = 0;

    virtual IAlarm* createAlarm(const char* source) = 0;
    virtual void deleteAlarm(IAlarm* alarm) = 0;
    virtual int listAlarms(IAlarmProcessor* processor) = 0;
    virtual int quitAlarm(IAlarm* alarm) = 0;

    virtual ITrend* createTrend(const char* source) = 0;
    virtual void deleteTrend(ITrend* trend) = 0;
    virtual int readTrend(ITrend* trend, unsigned long long from, unsigned long long to,
                          unsigned long long& next, unsigned int limit, bool option,
                          ITrendProcessor* processor) = 0;
};

class IProtocol7 : public IProtocol6 {
  public:
    /// Tells whether the device itself stamps the tag's values with a time.
    virtual bool hasPlcTimestamp(const ITag* tag) = 0;
    /// The reads again, each storing the time of the read in milliseconds since the Unix epoch;
    /// `stamp` is stored on success only (for a datagram: one for each item).
    virtual int readWithTimestamp(const ITag* tag, unsigned char* value,
                                  unsigned long long* stamp) = 0;
    virtual int readBlockWithTimestamp(const ITag* tag, unsigned char* data, int length,
                                       unsigned long long* stamp) = 0;
    virtual int readDatagramWithTimestamp(const ITag* const* tags, int count, unsigned char* data,
                                          idal_error_t* status, unsigned long long* stamps) = 0;

    /// The fields of a tag URI, which "?" separates.
    virtual int getTagUriFieldCount() const = 0;
    /// @return the name of field `index`, or null when there is none.
    virtual const char* getTagUriFieldName(int index) const = 0;
    /// @return the index of the field called `name`, or -1.
    virtual int getTagUriFieldPosition(const char* name) const = 0;
    /// @return the start of field `index` within the tag's URI, its length in `*length`; null and
    /// `*length` untouched when there is no such field.
    virtual const char* getTagUriField(const ITag* tag, int index, int* length) const = 0;

    /// Reads or writes item `index` of an array tag, in run-time form.
    virtual int readArrayItem(const ITag* tag, int index, unsigned char* value) = 0;
    virtual int writeArrayItem(const ITag* tag, int index, const unsigned char* value) = 0;
    virtual int readBitBlockWithTimestamp(const ITag* tag, unsigned char* data, int bits,
                                          unsigned long long* stamp) = 0;
};
