#include "tests/abi/shortage/Operations.h"

#include <array>
#include <iostream>
#include <stdexcept>

namespace shortage {

const abi_test::Plugin& plugin() {
    static const abi_test::Plugin loaded(PLUGIN_PATH);
    return loaded;
}

void ShortageTest::TearDownTestSuite() {
    std::cout << "altogether " << describe(allTotals()) << std::endl;
}

int expectHarmless(const std::vector<Operation>& operations) {
    const Totals totals = refuseEach(plugin(), operations);
    std::cout << describe(totals) << std::endl;
    EXPECT_EQ(0, totals.ended);
    EXPECT_EQ(0, totals.failed);
    return totals.refusals;
}

Operation atStage(Stage stage, std::string name, std::function<int(World&)> call, Refused refused) {
    return {std::move(name), stage, std::move(call), refused};
}

void makeTarget(World& world, const std::string& uri) {
    world.target = world.protocol->CreateTag(uri.c_str());
    if (world.target == nullptr) throw std::runtime_error(world.protocol->GetLastErrorString());
}

Operation onTag(const std::string& name, const std::string& uri, std::function<int(World&)> call,
                Refused refused) {
    return {name + ' ' + uri, Stage::started, std::move(call), refused,
            [uri](World& world) { makeTarget(world, uri); }};
}

std::vector<Operation> onEveryTag(const std::string& name, int (*call)(World&), Refused refused) {
    std::vector<Operation> operations;
    for (const std::string& uri : uris())
        operations.push_back(onTag(name, uri, call, refused));
    return operations;
}

const std::vector<std::string>& uris() {
    static const std::vector<std::string> all = {
        "1?HREG?400010?unsignedShort",
        "1?HREG?400010?unsignedShort-300",
        "1?HREG?400010.3?boolean",
        "1?HREG?400010.3?boolean-40",
        "1?HREG?400010?string-63",
        "1?HREG?400010?float(swap2,swap4)",
        "1?HREG?400010?unsignedShort-200(swap4,swap2)",
        "1?HREG?400010?unsignedShort(bcd)",
        "1?HREG?400010?unsignedShort(swap4)",
        "1?HREG?400010?unsignedShort-300(swap8,bcd)",
        "1?IREG?300001?unsignedShort",
        "1?IREG?300001?double-8",
        "1?OUTP?1?boolean",
        "1?OUTP?1?boolean-4000",
        "1?INP?100003?boolean-19",
        "2?LONG?7?unsignedInt",
        "2?LONG?7?float-100",
        "7?HREG?400010?unsignedShort",
        "1?NO?0?unsignedByte",
        "1?NP_Mode?0?boolean",
        "1?SP_Baud?0?unsignedInt",
        "1?SP_Par?0?unsignedByte",
        "1?SP_Stop?0?unsignedByte",
        "1?SP_Mode?0?unsignedByte",
        "1?SP_Done?0?boolean",
        "0?HREG?400010?unsignedShort",
        "1?HREG?465536?string-4000",
        "1?HREG?400001.-13?boolean",
    };
    return all;
}

const unsigned char* value() {
    static constexpr std::array<unsigned char, World::kRoom> bytes{1};
    return bytes.data();
}

}  // namespace shortage
