// Every interface beside the protocol family, operation by operation through its table.
#include <gtest/gtest.h>

#include <vector>

#include "platform/HostServices.h"
#include "platform/IInterfaceFactory.h"
#include "platform/IMultiTask2.h"
#include "platform/IPermanentStorage.h"
#include "platform/IProtModule.h"
#include "platform/IProtocolFactory.h"
#include "platform/ISerialFactory.h"
#include "platform/ITag.h"
#include "tests/unit/platform/Slots.h"

class IProtocol;

namespace {

using slots::kDestructors;
using slots::Operation;
using slots::zeroes;

std::string called;

/// The operations that every service begins with.
template <class Interface>
class Recorded : public Interface {
  public:
    ~Recorded() override { called = "destructor"; }
    void* ConvertTo(const char*) override { return note<void*>("ConvertTo"); }
    const char* GetImpName() const override { return note<const char*>("GetImpName"); }
    int GetImpVersion() const override { return note<int>("GetImpVersion"); }

  protected:
    template <class Result>
    static Result note(const char* name) {
        called = name;
        return Result();
    }
};

void walk(void* object, std::size_t first, const std::vector<Operation>& operations) {
    for (std::size_t i = 0; i < operations.size(); ++i) {
        called.clear();
        operations[i].caller(object, first + i);
        EXPECT_EQ(operations[i].name, called) << "entry " << first + i;
    }
}

/// The interface's own operations stand behind those of IInterface.
void walkService(IInterface* object, std::vector<Operation> own) {
    std::vector<Operation> all{{"ConvertTo", zeroes<void*, const char*>()},
                               {"GetImpName", zeroes<const char*>()},
                               {"GetImpVersion", zeroes<int>()}};
    all.insert(all.end(), own.begin(), own.end());
    walk(object, kDestructors, all);
}

/// The first entry of a virtual destructor destroys without freeing.
template <class Object>
void expectDestructorInFront() {
    alignas(Object) unsigned char room[sizeof(Object)];
    auto* object = new (room) Object;
    called.clear();
    slots::call<void>(object, 0);
    EXPECT_EQ("destructor", called);
}

TEST(SlotWalkPlatformTest, HeldServicesHaveTheCommonOperationsOnly) {
    Recorded<IDiag> diag;
    Recorded<ISocketFactory> sockets;
    Recorded<ICDSBuffer> buffer;
    Recorded<IDriverInterface> driver;
    Recorded<ISmux> smux;
    Recorded<IFastTimer> timer;
    for (IInterface* service :
         std::initializer_list<IInterface*>{&diag, &sockets, &buffer, &driver, &smux, &timer})
        walkService(service, {});
    expectDestructorInFront<Recorded<IInterface>>();
}

class RecordedInterfaceFactory final : public IInterfaceFactory {
  public:
    IInterface* CreateInterface(const char*) override {
        called = "CreateInterface";
        return nullptr;
    }
    void ReleaseInterface(IInterface*) override { called = "ReleaseInterface"; }
};

TEST(SlotWalkPlatformTest, InterfaceFactoryHasTwoOperationsAndNothingInFront) {
    RecordedInterfaceFactory factory;
    walk(static_cast<IInterfaceFactory*>(&factory), 0,
         {{"CreateInterface", zeroes<IInterface*, const char*>()},
          {"ReleaseInterface", zeroes<void, IInterface*>()}});
}

class RecordedProtocolFactory final : public Recorded<IProtocolFactory> {
  public:
    IProtocol* CreateProtocol(const char*) override { return note<IProtocol*>("CreateProtocol"); }
    void DeleteProtocol(IProtocol*) override { called = "DeleteProtocol"; }
};

TEST(SlotWalkPlatformTest, ProtocolFactory) {
    RecordedProtocolFactory factory;
    walkService(&factory, {{"CreateProtocol", zeroes<IProtocol*, const char*>()},
                           {"DeleteProtocol", zeroes<void, IProtocol*>()}});
}

class RecordedModule final : public Recorded<IProtModule> {
  public:
    int Init(IInterfaceFactory*) override { return note<int>("Init"); }
    void Close() override { called = "Close"; }
    const char* GetLastError() const override { return note<const char*>("GetLastError"); }
};

TEST(SlotWalkPlatformTest, Module) {
    RecordedModule module;
    walkService(&module, {{"Init", zeroes<int, IInterfaceFactory*>()},
                          {"Close", zeroes<void>()},
                          {"GetLastError", zeroes<const char*>()}});
}

class RecordedMultiTask final : public Recorded<IMultiTask2> {
  public:
    ILock* createLock(int) override { return note<ILock*>("createLock"); }
    void deleteLock(ILock*) override { called = "deleteLock"; }
    void sleep(int) override { called = "sleep"; }
};

TEST(SlotWalkPlatformTest, MultiTask) {
    RecordedMultiTask tasks;
    walkService(&tasks, {{"createLock", zeroes<ILock*, int>()},
                         {"deleteLock", zeroes<void, ILock*>()},
                         {"sleep", zeroes<void, int>()}});
}

class RecordedLock final : public ILock {
  public:
    void lock() override { called = "lock"; }
    void unlock() override { called = "unlock"; }
};

TEST(SlotWalkPlatformTest, LockHasTwoOperationsAndNothingInFront) {
    RecordedLock lock;
    walk(static_cast<ILock*>(&lock), 0, {{"lock", zeroes<void>()}, {"unlock", zeroes<void>()}});
}

class RecordedSerialFactory final : public Recorded<ISerialFactory> {
  public:
    ISerialPort* openPort(const char*) override { return note<ISerialPort*>("openPort"); }
    void releasePort(ISerialPort*) override { called = "releasePort"; }
};

TEST(SlotWalkPlatformTest, SerialFactory) {
    RecordedSerialFactory factory;
    walkService(&factory, {{"openPort", zeroes<ISerialPort*, const char*>()},
                           {"releasePort", zeroes<void, ISerialPort*>()}});
}

class RecordedPort final : public ISerialPort {
  public:
    int configure(int, int, int, int, int) override { return note("configure"); }
    void purge() override { note("purge"); }
    int receiveByte(unsigned char*, int, int) override { return note("receiveByte"); }
    int send(const unsigned char*, int) override { return note("send"); }
    int receiveFrame(unsigned char*, int, int, int, int*, int) override {
        return note("receiveFrame");
    }

  private:
    static int note(const char* name) {
        called = name;
        return 0;
    }
};

TEST(SlotWalkPlatformTest, SerialPort) {
    RecordedPort port;
    walk(static_cast<ISerialPort*>(&port), 0,
         {{"configure", zeroes<int, int, int, int, int, int>()},
          {"purge", zeroes<void>()},
          {"receiveByte", zeroes<int, unsigned char*, int, int>()},
          {"send", zeroes<int, const unsigned char*, int>()},
          {"receiveFrame", zeroes<int, unsigned char*, int, int, int, int*, int>()}});
}

class RecordedStorage final : public Recorded<IPermanentStorage2> {
  public:
    using Text = const char*;
    void writeString(Text, Text, Text) override { called = "writeString"; }
    void writeBool(Text, Text, bool) override { called = "writeBool"; }
    void writeInt(Text, Text, int) override { called = "writeInt"; }
    Text readString(Text, Text) override { return note<Text>("readString"); }
    bool readBool(Text, Text) override { return note<bool>("readBool"); }
    int readInt(Text, Text) override { return note<int>("readInt"); }
    int hasKey(Text, Text) override { return note<int>("hasKey"); }
    void removeKey(Text, Text) override { called = "removeKey"; }
    int keyCount(Text) override { return note<int>("keyCount"); }
    Text keyName(Text, int) override { return note<Text>("keyName"); }
    int readStringInto(Text, Text, char*, int) override { return note<int>("readStringInto"); }
    int keyNameInto(Text, int, char*, int) override { return note<int>("keyNameInto"); }
};

TEST(SlotWalkPlatformTest, PermanentStorageWithItsExtensionBehind) {
    using Text = const char*;
    RecordedStorage storage;
    walkService(&storage, {{"writeString", zeroes<void, Text, Text, Text>()},
                           {"writeBool", zeroes<void, Text, Text, bool>()},
                           {"writeInt", zeroes<void, Text, Text, int>()},
                           {"readString", zeroes<Text, Text, Text>()},
                           {"readBool", zeroes<bool, Text, Text>()},
                           {"readInt", zeroes<int, Text, Text>()},
                           {"hasKey", zeroes<int, Text, Text>()},
                           {"removeKey", zeroes<void, Text, Text>()},
                           {"keyCount", zeroes<int, Text>()},
                           {"keyName", zeroes<Text, Text, int>()},
                           {"readStringInto", zeroes<int, Text, Text, char*, int>()},
                           {"keyNameInto", zeroes<int, Text, int, char*, int>()}});
}

class RecordedTag final : public ITag {
  public:
    using Data = unsigned char;
    ~RecordedTag() override { called = "destructor"; }
    ITag* Clone() const override { return note<ITag*>("Clone"); }
    unsigned int GetByteOffset() const override { return note<unsigned>("GetByteOffset"); }
    int GetBitIndex() const override { return note<int>("GetBitIndex"); }
    const char* GetVarName() const override { return note<const char*>("GetVarName"); }
    ICU_Type GetVarType() const override { return note<ICU_Type>("GetVarType"); }
    int GetVarLength() const override { return note<int>("GetVarLength"); }
    ICU_Type GetItemType() const override { return note<ICU_Type>("GetItemType"); }
    int PackedLen() const override { return note<int>("PackedLen"); }
    bool ConvertVariable(const Data*, Data*, bool) const override {
        return note<bool>("ConvertVariable");
    }
    bool IsReadOnly() const override { return note<bool>("IsReadOnly"); }
    bool IsWriteOnly() const override { return note<bool>("IsWriteOnly"); }
    bool Convert(const Data*, Data*, bool) const override { return note<bool>("Convert"); }
    bool DoConversion(Data*, const char*, bool) const override {
        return note<bool>("DoConversion");
    }

  private:
    template <class Result>
    static Result note(const char* name) {
        called = name;
        return Result();
    }
};

TEST(SlotWalkPlatformTest, Tag) {
    using Data = unsigned char;
    RecordedTag tag;
    walk(static_cast<ITag*>(&tag), kDestructors,
         {{"Clone", zeroes<ITag*>()},
          {"GetByteOffset", zeroes<unsigned>()},
          {"GetBitIndex", zeroes<int>()},
          {"GetVarName", zeroes<const char*>()},
          {"GetVarType", zeroes<ICU_Type>()},
          {"GetVarLength", zeroes<int>()},
          {"GetItemType", zeroes<ICU_Type>()},
          {"PackedLen", zeroes<int>()},
          {"ConvertVariable", zeroes<bool, const Data*, Data*, bool>()},
          {"IsReadOnly", zeroes<bool>()},
          {"IsWriteOnly", zeroes<bool>()},
          {"Convert", zeroes<bool, const Data*, Data*, bool>()},
          {"DoConversion", zeroes<bool, Data*, const char*, bool>()}});
    expectDestructorInFront<RecordedTag>();
}

}  // namespace
