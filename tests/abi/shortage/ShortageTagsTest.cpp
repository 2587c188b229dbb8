// Tags, their values and their way over the line, with memory running short.
#include <gtest/gtest.h>

#include <array>
#include <cstring>

#include "tests/abi/shortage/Operations.h"

namespace shortage {
namespace {

using ShortageTagsTest = ShortageTest;

TEST_F(ShortageTagsTest, OfTags) {
    std::vector<Operation> operations;
    std::vector<std::string> texts = uris();
    for (const char* refused :
         {"", "1?HREG", "1?HREG?400010?a type that there is not", "1?HREG??unsignedShort",
          "1?an area that there is not?1?boolean", "1?HREG?999999?unsignedShort", "1?NO?0?boolean",
          "1?HREG?400010?unsignedShort(swap2", "1?OUTP?1?unsignedShort"})
        texts.emplace_back(refused);
    for (const std::string& uri : texts)
        operations.push_back(atStage(Stage::configured, "CreateTag " + uri, [uri](World& w) {
            return w.protocol->CreateTag(uri.c_str()) != nullptr ? 1 : 0;
        }));
    operations.push_back(atStage(Stage::configured, "CreateTag and FreeTag", [](World& w) {
        ITag* const tag = w.protocol->CreateTag("1?HREG?400010?float(swap2,swap4)");
        w.protocol->FreeTag(tag);
        return tag != nullptr ? 1 : 0;
    }));
    for (const std::string& uri : uris())
        operations.push_back(onTag(
            "Clone", uri,
            [](World& w) {
                ITag* const copy = w.target->Clone();
                const bool same =
                    copy != nullptr && std::strcmp(copy->GetVarName(), w.target->GetVarName()) == 0;
                delete copy;
                return same ? 1 : 0;
            },
            Refused::null));
    EXPECT_LT(0, expectHarmless(operations));
}

int convert(World& w, bool toDevice) {
    if (w.target->PackedLen() > World::kRoom || w.target->GetVarLength() > World::kRoom) return 1;
    return w.target->ConvertVariable(value(), w.out(), toDevice) ? 1 : 0;
}

TEST_F(ShortageTagsTest, OfConversions) {
    std::vector<Operation> operations;
    for (const std::string& uri : uris()) {
        operations.push_back(onTag(
            "ConvertVariable from", uri, [](World& w) { return convert(w, false); },
            Refused::null));
        operations.push_back(onTag(
            "ConvertVariable to", uri, [](World& w) { return convert(w, true); }, Refused::null));
    }
    EXPECT_LT(0, expectHarmless(operations));
}

TEST_F(ShortageTagsTest, OfReads) {
    for (const auto call : std::initializer_list<int (*)(World&)>{
             [](World& w) { return w.protocol->Read(w.target, w.out()); },
             [](World& w) {
                 unsigned long long stamp = 0;
                 return w.protocol->readWithTimestamp(w.target, w.out(), &stamp);
             },
             [](World& w) {
                 return w.protocol->ReadBlock(w.target, w.out(), w.target->PackedLen());
             },
             [](World& w) {
                 unsigned long long stamp = 0;
                 return w.protocol->readBlockWithTimestamp(w.target, w.out(), 401, &stamp);
             },
             [](World& w) {
                 return w.protocol->ReadBitBlock(w.target, w.out(), w.target->GetVarLength());
             },
             [](World& w) {
                 unsigned long long stamp = 0;
                 return w.protocol->readBitBlockWithTimestamp(w.target, w.out(), 3000, &stamp);
             },
             [](World& w) { return w.protocol->readArrayItem(w.target, 7, w.out()); },
         })
        EXPECT_LT(0, expectHarmless(onEveryTag("read", call)));
}

TEST_F(ShortageTagsTest, OfWrites) {
    for (const auto call : std::initializer_list<int (*)(World&)>{
             [](World& w) { return w.protocol->Write(w.target, value()); },
             [](World& w) { return w.protocol->WriteBlock(w.target, value(), 401); },
             [](World& w) {
                 return w.protocol->WriteBlock(w.target, value(), w.target->PackedLen());
             },
             [](World& w) { return w.protocol->WriteBitBlock(w.target, value(), 3000); },
             [](World& w) { return w.protocol->writeArrayItem(w.target, 7, value()); },
         })
        EXPECT_LT(0, expectHarmless(onEveryTag("write", call)));
}

TEST_F(ShortageTagsTest, OfDatagrams) {
    const std::string uri = "1?HREG?400010?unsignedShort";
    EXPECT_LT(0, expectHarmless({
                     onTag("ReadDatagram", uri,
                           [](World& w) {
                               const std::array<const ITag*, 3> tags{w.target, w.target, w.target};
                               return w.protocol->ReadDatagram(tags.data(), 3, w.out());
                           }),
                     onTag("ReadDatagramWithStatus", uri,
                           [](World& w) {
                               const std::array<const ITag*, 3> tags{w.target, w.target, w.target};
                               std::array<idal_error_t, 3> status{};
                               return w.protocol->ReadDatagramWithStatus(tags.data(), 3, w.out(),
                                                                         status.data());
                           }),
                     onTag("readDatagramWithTimestamp", uri,
                           [](World& w) {
                               const std::array<const ITag*, 3> tags{w.target, w.target, w.target};
                               std::array<idal_error_t, 3> status{};
                               std::array<unsigned long long, 3> stamps{};
                               return w.protocol->readDatagramWithTimestamp(
                                   tags.data(), 3, w.out(), status.data(), stamps.data());
                           }),
                     onTag("CanAddToDatagram", uri,
                           [](World& w) {
                               const std::array<const ITag*, 1> tags{w.target};
                               return w.protocol->CanAddToDatagram(tags.data(), 1, w.target) ? 2
                                                                                             : 1;
                           }),
                 }));
}

}  // namespace
}  // namespace shortage
