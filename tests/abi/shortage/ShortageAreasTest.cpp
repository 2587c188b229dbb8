// The driver's own areas with memory running short.
#include <gtest/gtest.h>

#include <array>
#include <cstring>

#include "tests/abi/shortage/Operations.h"

namespace shortage {
namespace {

void renameAndStart(World& world) {
    world.protocol->SetIdent(kLongIdent);
    world.protocol->Start();
}

using ShortageAreasTest = ShortageTest;

TEST_F(ShortageAreasTest, OfTheDriversAreasWithALongIdent) {
    std::vector<Operation> operations;
    for (const char* uri : {"1?NO?0?unsignedByte", "1?NP_Mode?0?boolean", "2?NP_Mode?0?boolean"}) {
        const auto prepare = [uri](World& w) {
            renameAndStart(w);
            makeTarget(w, uri);
        };
        // 0 is not what the areas hold.
        operations.push_back({std::string("write ") + uri, Stage::configured,
                              [](World& w) { return w.protocol->Write(w.target, value() + 1); },
                              Refused::error, prepare});
        operations.push_back({std::string("read ") + uri, Stage::configured,
                              [](World& w) { return w.protocol->Read(w.target, w.out()); },
                              Refused::error, prepare});
    }
    operations.push_back({"setid", Stage::configured,
                          [](World& w) { return w.protocol->DoCommand("setid 5 7", w.text(), 99); },
                          Refused::answer, renameAndStart});
    EXPECT_LT(0, expectHarmless(operations));
}

TEST_F(ShortageAreasTest, OfStagedSettings) {
    const auto stage = [](World& w) {
        for (const char* uri : {"1?SP_Baud?0?unsignedInt", "1?SP_Par?0?unsignedByte",
                                "1?SP_Stop?0?unsignedByte", "1?SP_Mode?0?unsignedByte"}) {
            std::array<unsigned char, 4> bytes{1, 0, 0, 0};
            if (std::strstr(uri, "Baud") != nullptr) bytes = {0x80, 0x25, 0, 0};  // 9600
            makeTarget(w, uri);
            w.protocol->Write(w.target, bytes.data());
        }
        makeTarget(w, "1?SP_Done?0?boolean");
    };
    const auto write = [](World& w) { return w.protocol->Write(w.target, value()); };
    const auto stageWithLongIdent = [stage](World& w) {
        renameAndStart(w);
        stage(w);
    };
    EXPECT_LT(0, expectHarmless({
                     {"SP_Done after all settings", Stage::started, write, Refused::error, stage},
                     {"SP_Done with a long ident", Stage::configured, write, Refused::error,
                      stageWithLongIdent},
                 }));
}

}  // namespace
}  // namespace shortage
