// The protocol interface family, operation by operation through its one table.
#include <gtest/gtest.h>

#include "tests/unit/platform/ProtocolOperations.h"

namespace {

std::string called;

class RecordedProtocol final : public IProtocol7 {
  public:
    ~RecordedProtocol() override { called = "destructor"; }
    void* ConvertTo(const char*) override { return note<void*>("ConvertTo"); }
    const char* GetImpName() const override { return note<const char*>("GetImpName"); }
    int GetImpVersion() const override { return note<int>("GetImpVersion"); }
    int Config(const char*) override { return note<int>("Config"); }
    ITag* CreateTag(const char*) override { return note<ITag*>("CreateTag"); }
    void FreeTag(ITag*) override { called = "FreeTag"; }
    bool CanBeOptimized(const ITag*, const ITag*, bool) const override {
        return note<bool>("CanBeOptimized");
    }
    int Start() override { return note<int>("Start"); }
    int Stop() override { return note<int>("Stop"); }
    int Read(const ITag*, unsigned char*) override { return note<int>("Read"); }
    int Write(const ITag*, const unsigned char*) override { return note<int>("Write"); }
    int ReadBlock(const ITag*, unsigned char*, int) override { return note<int>("ReadBlock"); }
    int WriteBlock(const ITag*, const unsigned char*, int) override {
        return note<int>("WriteBlock");
    }
    int MaxDatagramItems(const ITag*) const override { return note<int>("MaxDatagramItems"); }
    int MaxDatagramLength(const ITag*) const override { return note<int>("MaxDatagramLength"); }
    bool CanCoexistInDatagram(const ITag*, const ITag*) const override {
        return note<bool>("CanCoexistInDatagram");
    }
    int ReadDatagram(const ITag* const*, int, unsigned char*) override {
        return note<int>("ReadDatagram");
    }
    const char* GetName() const override { return note<const char*>("GetName"); }
    const char* GetNextInstanceName() const override {
        return note<const char*>("GetNextInstanceName");
    }
    int GetLastError() const override { return note<int>("GetLastError"); }
    const char* GetLastErrorString() const override {
        return note<const char*>("GetLastErrorString");
    }
    int GetProtocolVersion() const override { return note<int>("GetProtocolVersion"); }
    int GetProtocolType() const override { return note<int>("GetProtocolType"); }
    const char* GetProtocolName() const override { return note<const char*>("GetProtocolName"); }
    int GetInfo(char*, int) const override { return note<int>("GetInfo"); }
    const unsigned char* GetXml() const override { return note<const unsigned char*>("GetXml"); }
    bool IsConverted() const override { return note<bool>("IsConverted"); }
    const char* GetIdent() const override { return note<const char*>("GetIdent"); }
    void SetIdent(const char*) override { called = "SetIdent"; }
    int DoCommand(const char*, char*, int) override { return note<int>("DoCommand"); }
    int Extend(int, void*) override { return note<int>("Extend"); }
    bool CanAddToDatagram(const ITag* const*, int, const ITag*) override {
        return note<bool>("CanAddToDatagram");
    }
    int ReadDatagramWithStatus(const ITag* const*, int, unsigned char*, idal_error_t*) override {
        return note<int>("ReadDatagramWithStatus");
    }
    bool MultipleReadSupported() const override { return note<bool>("MultipleReadSupported"); }
    int MultipleRead(IMultiRead*) override { return note<int>("MultipleRead"); }
    bool MultipleWriteSupported() const override { return note<bool>("MultipleWriteSupported"); }
    int MultipleWrite(IMultiWrite*) override { return note<int>("MultipleWrite"); }
    int GetNodeID(const ITag*) const override { return note<int>("GetNodeID"); }
    bool CanReadBitBlock(const ITag*) const override { return note<bool>("CanReadBitBlock"); }
    int ReadBitBlock(const ITag*, unsigned char*, int) override {
        return note<int>("ReadBitBlock");
    }
    void* GetInterface(const char*) override { return note<void*>("GetInterface"); }
    int MaxUnusedGap(const ITag*) const override { return note<int>("MaxUnusedGap"); }
    bool IsBefore(const ITag*, const ITag*) const override { return note<bool>("IsBefore"); }
    bool IsAdjacent(const ITag*, const ITag*) const override { return note<bool>("IsAdjacent"); }
    bool NeedsReadBeforeWrite(const ITag*) const override {
        return note<bool>("NeedsReadBeforeWrite");
    }
    bool CanWriteDatagrams(const ITag*) const override { return note<bool>("CanWriteDatagrams"); }
    bool CanAddToWriteDatagram(const ITag* const*, int, const ITag*) const override {
        return note<bool>("CanAddToWriteDatagram");
    }
    int WriteDatagramWithStatus(const ITag* const*, int, const unsigned char*,
                                idal_error_t*) override {
        return note<int>("WriteDatagramWithStatus");
    }
    bool CanWriteBitBlock(const ITag*) const override { return note<bool>("CanWriteBitBlock"); }
    int WriteBitBlock(const ITag*, const unsigned char*, int) override {
        return note<int>("WriteBitBlock");
    }
    int readObject(const ITag*, IObjectString*) override { return note<int>("readObject"); }
    int writeObject(const ITag*, const IObjectString*) override { return note<int>("writeObject"); }
    int vcsGetCapability() const override { return note<int>("vcsGetCapability"); }
    int vcsGetComParams(char*, int) const override { return note<int>("vcsGetComParams"); }
    int vcsActivateInterleaved(unsigned short) override {
        return note<int>("vcsActivateInterleaved");
    }
    IEventChannel* createEventChannel(int) override {
        return note<IEventChannel*>("createEventChannel(int)");
    }
    IEventChannel* createEventChannel(IEventProcessor*) override {
        return note<IEventChannel*>("createEventChannel(IEventProcessor*)");
    }
    void deleteEventChannel(IEventChannel*) override { called = "deleteEventChannel"; }
    int addEventSource(IEventChannel*, const char*) override { return note<int>("addEventSource"); }
    int addAlarmEvents(IEventChannel*, IAlarm*) override { return note<int>("addAlarmEvents"); }
    void* frontEvent(IEventChannel*) override { return note<void*>("frontEvent"); }
    void popEvent(IEventChannel*) override { called = "popEvent"; }
    IAlarm* createAlarm(const char*) override { return note<IAlarm*>("createAlarm"); }
    void deleteAlarm(IAlarm*) override { called = "deleteAlarm"; }
    int listAlarms(IAlarmProcessor*) override { return note<int>("listAlarms"); }
    int quitAlarm(IAlarm*) override { return note<int>("quitAlarm"); }
    ITrend* createTrend(const char*) override { return note<ITrend*>("createTrend"); }
    void deleteTrend(ITrend*) override { called = "deleteTrend"; }
    int readTrend(ITrend*, unsigned long long, unsigned long long, unsigned long long&,
                  unsigned int, bool, ITrendProcessor*) override {
        return note<int>("readTrend");
    }
    bool hasPlcTimestamp(const ITag*) override { return note<bool>("hasPlcTimestamp"); }
    int readWithTimestamp(const ITag*, unsigned char*, unsigned long long*) override {
        return note<int>("readWithTimestamp");
    }
    int readBlockWithTimestamp(const ITag*, unsigned char*, int, unsigned long long*) override {
        return note<int>("readBlockWithTimestamp");
    }
    int readDatagramWithTimestamp(const ITag* const*, int, unsigned char*, idal_error_t*,
                                  unsigned long long*) override {
        return note<int>("readDatagramWithTimestamp");
    }
    int getTagUriFieldCount() const override { return note<int>("getTagUriFieldCount"); }
    const char* getTagUriFieldName(int) const override {
        return note<const char*>("getTagUriFieldName");
    }
    int getTagUriFieldPosition(const char*) const override {
        return note<int>("getTagUriFieldPosition");
    }
    const char* getTagUriField(const ITag*, int, int*) const override {
        return note<const char*>("getTagUriField");
    }
    int readArrayItem(const ITag*, int, unsigned char*) override {
        return note<int>("readArrayItem");
    }
    int writeArrayItem(const ITag*, int, const unsigned char*) override {
        return note<int>("writeArrayItem");
    }
    int readBitBlockWithTimestamp(const ITag*, unsigned char*, int, unsigned long long*) override {
        return note<int>("readBitBlockWithTimestamp");
    }

  private:
    template <class Result>
    static Result note(const char* name) {
        called = name;
        return Result();
    }
};

TEST(SlotWalkProtocolTest, EveryOperationStandsAtItsEntry) {
    RecordedProtocol protocol;
    std::size_t slot = slots::kDestructors;
    for (const slots::Operation& operation : slots::protocolOperations()) {
        called.clear();
        operation.caller(static_cast<IProtocol*>(&protocol), slot);
        EXPECT_EQ(operation.name, called) << "entry " << slot;
        ++slot;
    }
}

TEST(SlotWalkProtocolTest, AllGenerationsAreOneObject) {
    RecordedProtocol protocol;
    IProtocol7* seventh = &protocol;
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol6*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol5*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol4*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol3*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol2*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IProtocol*>(seventh));
    EXPECT_EQ(static_cast<void*>(seventh), static_cast<IInterface*>(seventh));
}

TEST(SlotWalkProtocolTest, DestructorStandsInFront) {
    alignas(RecordedProtocol) unsigned char room[sizeof(RecordedProtocol)];
    auto* protocol = new (room) RecordedProtocol;
    called.clear();
    slots::call<void>(protocol, 0);
    EXPECT_EQ("destructor", called);
}

}  // namespace
