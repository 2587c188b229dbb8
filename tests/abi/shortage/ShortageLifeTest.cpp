// The life of a protocol object from Init() to Close(), and the questions about it, with memory
// running short.
#include <gtest/gtest.h>

#include <cstring>

#include "tests/abi/shortage/Operations.h"

namespace shortage {
namespace {

using ShortageLifeTest = ShortageTest;

TEST_F(ShortageLifeTest, OfTheModule) {
    const auto initWithout = [](const char* service) {
        return Operation{std::string("Init without ") + service, Stage::loaded,
                         [](World& w) { return w.module.Init(&w.host); }, Refused::null,
                         [service](World& w) { w.host.withhold(service); }};
    };
    expectHarmless({
        atStage(Stage::loaded, "Init", [](World& w) { return w.module.Init(&w.host); }),
        atStage(Stage::initialised, "second Init",
                [](World& w) {
                    const int done = w.module.Init(&w.host);
                    w.module.Close();
                    return done;
                }),
        atStage(Stage::loaded, "Init without a factory",
                [](World& w) { return w.module.Init(nullptr); }),
        initWithout("IMultiTask2"),
        initWithout("ISerialFactory"),
        initWithout("ISocketFactory"),
        initWithout("ICDSBuffer"),
        initWithout("IFastTimer"),
    });
}

TEST_F(ShortageLifeTest, OfTheFactory) {
    EXPECT_LT(0, expectHarmless({
                     {"CreateProtocol", Stage::initialised,
                      [](World& w) {
                          IProtocol* const made = w.factory.CreateProtocol("MRTU");
                          w.factory.DeleteProtocol(made);
                          return made != nullptr ? 1 : 0;
                      },
                      Refused::null},
                     {"CreateProtocol of another", Stage::initialised,
                      [](World& w) {
                          return w.factory.CreateProtocol("a name that is long enough") != nullptr;
                      },
                      Refused::null},
                     {"ConvertTo", Stage::created,
                      [](World& w) { return w.protocol->ConvertTo("IProtocol7") != nullptr; }},
                 }));
}

TEST_F(ShortageLifeTest, OfTheConfiguration) {
    const auto config = [](Stage stage, const char* text) {
        return atStage(stage, std::string("Config ") + text,
                       [text](World& w) { return w.protocol->Config(text); });
    };
    EXPECT_LT(
        0, expectHarmless({
               config(Stage::created, World::kConfig),
               config(Stage::configured, World::kOtherConfig),
               config(Stage::configured, "no marker in a text that does not fit a short one"),
               config(Stage::configured, "CfgVer=1 defNodeId=1 uart=com1 baudrate=19200 bits=8 "),
               config(Stage::configured,
                      "CfgVer=1 defNodeId=1 uart=com2 baudrate=19200 bits=8 stopbits=1 mode=RS-232 "
                      "parity=a-parity-that-there-is-not"),
               config(Stage::configured,
                      "CfgVer=1 defNodeId=1 uart=com2 baudrate=19200 bits=8 stopbits=1 parity=odd "
                      "mode=a-mode-that-there-is-not"),
               config(Stage::configured, "CfgVer=1 defNodeId=1 maxOptLen=-1"),
               atStage(Stage::configured, "SetIdent",
                       [](World& w) {
                           w.protocol->SetIdent(kLongIdent);
                           return std::strcmp(w.protocol->GetIdent(), kLongIdent) == 0 ? 1 : 0;
                       }),
               atStage(Stage::configured, "vcsGetComParams",
                       [](World& w) { return w.protocol->vcsGetComParams(w.text(), 300); }),
           }));
}

void storeOverrides(World& world) {
    world.host.storage.writeString("MRTU", "tempNode1", "1");
    world.host.storage.writeString("MRTU", "tempNode123456789", "987654321");
    world.host.storage.writeString("MRTU", "tempNode9", "11");
    world.host.storage.writeInt("MRTU", "baud", 38400);
    world.host.storage.writeInt("MRTU", "stop", 2);
}

TEST_F(ShortageLifeTest, OfStartAndStop) {
    const auto start = [](World& w) { return w.protocol->Start(); };
    EXPECT_LT(
        0, expectHarmless({
               {"Start", Stage::configured, start},
               {"Start with overrides", Stage::configured, start, Refused::error, storeOverrides},
               {"Start with a long ident", Stage::configured, start, Refused::error,
                [](World& w) { w.protocol->SetIdent(kLongIdent); }},
               {"Start without a configuration", Stage::created, start},
               {"Start when started", Stage::started, start},
               {"Stop", Stage::started, [](World& w) { return w.protocol->Stop(); }},
               {"Stop and Start", Stage::started,
                [](World& w) { return w.protocol->Stop() != 0 ? w.protocol->Start() : 0; }},
           }));
}

TEST_F(ShortageLifeTest, OfQueries) {
    const std::string uri = "1?HREG?400010?unsignedShort";
    expectHarmless({
        onTag("GetInfo", uri, [](World& w) { return w.protocol->GetInfo(w.text(), 400); }),
        onTag("Extend", uri,
              [](World& w) {
                  ExtensionRecord record{};
                  record.queryCode = 3;
                  return w.protocol->Extend(0, &record);
              }),
        onTag("getTagUriField", uri,
              [](World& w) {
                  int length = 0;
                  return w.protocol->getTagUriField(w.target, 2, &length) != nullptr ? length : 0;
              }),
        onTag("getTagUriFieldPosition", uri,
              [](World& w) { return w.protocol->getTagUriFieldPosition("arrayindex.subindex"); }),
        onTag("questions about tags", uri,
              [](World& w) {
                  const ITag* tag = w.target;
                  IProtocol7& p = *w.protocol;
                  return 1 + p.CanBeOptimized(tag, tag, true) + p.IsBefore(tag, tag) +
                         p.IsAdjacent(tag, tag) + p.NeedsReadBeforeWrite(tag) +
                         p.CanReadBitBlock(tag) + p.CanWriteBitBlock(tag) +
                         p.MaxDatagramItems(tag) + p.MaxDatagramLength(tag) + p.GetNodeID(tag);
              }),
        onTag("readObject", uri,
              [](World& w) { return w.protocol->readObject(w.target, nullptr); }),
        onTag("writeObject", uri,
              [](World& w) { return w.protocol->writeObject(w.target, nullptr); }),
        onTag("createAlarm", uri,
              [](World& w) { return w.protocol->createAlarm("an alarm") != nullptr ? 1 : 0; }),
        onTag("createTrend", uri,
              [](World& w) { return w.protocol->createTrend("a trend") != nullptr ? 1 : 0; }),
        onTag("createEventChannel", uri,
              [](World& w) { return w.protocol->createEventChannel(1) != nullptr ? 1 : 0; }),
        onTag("addEventSource", uri,
              [](World& w) { return w.protocol->addEventSource(nullptr, "a source"); }),
        onTag("FreeTag", uri,
              [](World& w) {
                  w.protocol->FreeTag(w.target);
                  w.target = nullptr;
                  return 1;
              }),
    });
}

}  // namespace
}  // namespace shortage
