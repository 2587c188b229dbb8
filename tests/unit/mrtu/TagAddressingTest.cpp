// Tag URIs: fields, checks in order, types and function codes.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;

class TagAddressingTest : public DriverTest {};

TEST_F(TagAddressingTest, HoldingRegisterOfModelOne) {
    configure();
    const Tag_MRTU* word = tag("1?HREG?400001?unsignedShort");
    EXPECT_EQ(0, word->offset());
    EXPECT_EQ(0U, word->GetByteOffset());
    EXPECT_EQ(3, word->readFunction());
    EXPECT_EQ(16, word->writeFunction());
    EXPECT_EQ(1, word->nodeId());
    EXPECT_EQ(1, driver->GetNodeID(word));
    EXPECT_EQ("1", word->model()->getName());
    EXPECT_EQ("HREG", word->memoryType()->getName());
    EXPECT_EQ(driver->getMemoryManager()->getMemoryType("1", "HREG"), word->memoryType());
    EXPECT_EQ(driver->getParamManager()->getNodeParams(1), word->nodeParams());
    EXPECT_EQ(driver->getParamManager()->getCommonParams(), word->commonParams());
    EXPECT_EQ(_MRTU::DriverArea::None, word->driverArea());
    EXPECT_STREQ("1?HREG?400001?unsignedShort", word->GetVarName());
}

TEST_F(TagAddressingTest, SameUriOfModelTwo) {
    configure("model=2");
    EXPECT_EQ(1, tag("1?HREG?400001?unsignedShort")->offset());
}

TEST_F(TagAddressingTest, FieldNames) {
    EXPECT_EQ(4, driver->getTagUriFieldCount());
    EXPECT_STREQ("nodeid", driver->getTagUriFieldName(0));
    EXPECT_STREQ("memorytype", driver->getTagUriFieldName(1));
    EXPECT_STREQ("arrayindex.subindex", driver->getTagUriFieldName(2));
    EXPECT_STREQ("datatype", driver->getTagUriFieldName(3));
    EXPECT_EQ(nullptr, driver->getTagUriFieldName(4));
    EXPECT_EQ(nullptr, driver->getTagUriFieldName(-1));
}

TEST_F(TagAddressingTest, FieldsAreTrimmed) {
    configure();
    const Tag_MRTU* word = tag(" 1 ?\tHREG ? 400010 ? int ( swap2 ) ");
    EXPECT_EQ(9, word->offset());
    EXPECT_EQ(ICU_Type::int_, word->GetVarType());
    EXPECT_EQ(std::vector<std::string>{"swap2"}, word->conversions());
}

TEST_F(TagAddressingTest, FieldCount) {
    configure();
    for (const char* uri : {"", "1", "1?HREG", "1?HREG?400001", "1?HREG?400001?int?x", "????"})
        expectRefused(uri, "there must be 4 tag specification fields");
}

TEST_F(TagAddressingTest, EmptyFieldsAreReportedFromTheFirstOn) {
    configure();
    expectRefused("?HREG?400001?int", "nodeID field missing");
    expectRefused("1??400001?int", "memorytype field missing");
    expectRefused("1?HREG??int", "subIndex field missing");
    expectRefused("1?HREG?400001?", "icomType field missing");
    expectRefused("???", "nodeID field missing");
    expectRefused("1???", "memorytype field missing");
    expectRefused("1?HREG??", "subIndex field missing");
    expectRefused(" \t?HREG?400001?int", "nodeID field missing");
}

TEST_F(TagAddressingTest, UnknownMemoryTypes) {
    configure();
    for (const char* area : {"hreg", "HREG2", "LONG", "X"})
        expectRefused("1?" + std::string(area) + "?400001?int", "Can't access memory type");
}

TEST_F(TagAddressingTest, UnknownDataTypes) {
    configure();
    expectRefused("1?HREG?400001?word", "word: data type unknown");
    expectRefused("1?HREG?400001? Int ", "Int: data type unknown");
    expectRefused("1?HREG?400001?int(swap2", "int(swap2: data type unknown");
    expectRefused("1?HREG?400001?int5", "int5: data type unknown");
}

TEST_F(TagAddressingTest, DataTypesThatTheAreaDoesNotTake) {
    configure("model=3");
    expectRefused("1?INP?100001?unsignedShort", "not allowed icom type");
    expectRefused("1?OUTP?1?byte", "not allowed icom type");
    expectRefused("1?HREG?400001?time", "not allowed icom type");
    expectRefused("1?HREG?400001?time-2", "not allowed icom type");
    expectRefused("1?HREG?400001?object", "not allowed icom type");
    expectRefused("1?LONG?5?short", "not allowed icom type");
    expectRefused("1?LONG?5?double", "not allowed icom type");
    expectRefused("1?NP_Mode?0?unsignedByte", "not allowed icom type");
    expectRefused("1?SP_Baud?0?int", "not allowed icom type");
    expectRefused("1?SP_Mode?0?boolean", "not allowed icom type");
    expectRefused("1?SP_Done?0?unsignedByte", "not allowed icom type");
}

TEST_F(TagAddressingTest, EveryTypeOfARegisterArea) {
    configure();
    for (const char* type : {"boolean",         "byte",          "short",       "int",
                             "unsignedByte",    "unsignedShort", "unsignedInt", "float",
                             "double",          "string-20",     "binary-7",    "boolean-5",
                             "byte-3",          "short-4",       "int-5",       "unsignedByte-6",
                             "unsignedShort-7", "unsignedInt-8", "float-9",     "double-10",
                             "uint64",          "int64",         "uint64-2",    "int64-3"})
        tag("1?HREG?400001?" + std::string(type));
}

TEST_F(TagAddressingTest, EveryTypeOfALongArea) {
    configure("model=3");
    for (const char* type : {"int", "unsignedInt", "float", "int-3", "unsignedInt-3", "float-3"})
        EXPECT_EQ(5, tag("1?LONG?5?" + std::string(type))->offset()) << type;
}

TEST_F(TagAddressingTest, LongRegistersBelongToTheEnronModels) {
    configure("Node1::model=3 Node2::model=1 Node4::model=4");
    const Tag_MRTU* number = tag("1?LONG?5?float");
    EXPECT_EQ(5, number->offset());
    EXPECT_EQ(5, tag("4?LONG?5?float")->offset());
    expectRefused("2?LONG?5?float", "Can't access memory type");
}

TEST_F(TagAddressingTest, ChecksRunInOrder) {
    configure();
    expectRefused("1?XREG?0?word", "Can't access memory type");
    expectRefused("1?HREG?0?word", "word: data type unknown");
    expectRefused("1?HREG?0?time", "invalid offset for this memory type");
    expectRefused("1?NO?5?word", "word: data type unknown");
    expectRefused("1?NO?5?int", "invalid access to node override");
    expectRefused("1?NO?5?unsignedByte", "invalid offset for this memory type");
}

TEST_F(TagAddressingTest, NodeOverrideTakesOneUnsignedByteAtIndexZero) {
    configure();
    EXPECT_EQ(_MRTU::DriverArea::NodeOverride, tag("1?NO?0?unsignedByte")->driverArea());
    for (const char* type : {"byte", "boolean", "int", "unsignedByte-2"})
        expectRefused("1?NO?0?" + std::string(type), "invalid access to node override");
    expectRefused("1?NO?1?unsignedByte", "invalid offset for this memory type");
    expectRefused("1?NO?-1?unsignedByte", "invalid offset for this memory type");
}

TEST_F(TagAddressingTest, DriverAreasExistInEveryModelAtIndexZeroOnly) {
    const std::pair<const char*, const char*> areas[] = {
        {"NO", "unsignedByte"},     {"NP_Mode", "boolean"},      {"SP_Baud", "unsignedInt"},
        {"SP_Par", "unsignedByte"}, {"SP_Stop", "unsignedByte"}, {"SP_Mode", "unsignedByte"},
        {"SP_Done", "boolean"},
    };
    for (const char* model : {"model=1", "model=2", "model=3", "model=4"}) {
        configure(model);
        for (const auto& [name, type] : areas) {
            const std::string area = std::string("1?") + name;
            const Tag_MRTU* made = tag(area + "?0?" + type);
            EXPECT_NE(_MRTU::DriverArea::None, made->driverArea()) << area;
            EXPECT_EQ(0, made->offset()) << area << ' ' << model;
            expectRefused(area + "?1?" + type, "invalid offset for this memory type");
        }
    }
}

struct CodeCase {
    const char* items;
    const char* uri;
    int readFunction;
    int writeFunction;
};

TEST_F(TagAddressingTest, FunctionCodes) {
    const CodeCase cases[] = {
        {"", "1?OUTP?1?boolean", 1, 15},
        {"forceFunction=15", "1?OUTP?1?boolean", 1, 15},
        {"forceFunction=05", "1?OUTP?1?boolean", 1, 5},
        {"forceFunction=5", "1?OUTP?1?boolean", 1, 5},
        {"forceFunction=0x0F", "1?OUTP?1?boolean", 1, 5},
        {"forceFunction=16", "1?OUTP?1?boolean", 1, 5},
        {"", "1?INP?100001?boolean", 2, 0},
        {"", "1?HREG?400001?short", 3, 16},
        {"presetFunction=16", "1?HREG?400001?short", 3, 16},
        {"presetFunction=06", "1?HREG?400001?short", 3, 6},
        {"presetFunction=6", "1?HREG?400001?short", 3, 6},
        {"presetFunction=15", "1?HREG?400001?short", 3, 6},
        {"", "1?IREG?300001?short", 4, 0},
        {"model=3", "1?LONG?1?int", 3, 6},
        {"model=3 presetFunction=16", "1?LONG?1?int", 3, 6},
        {"presetFunction=06 Node2::presetFunction=16", "1?HREG?400001?short", 3, 6},
        {"presetFunction=06 Node2::presetFunction=16", "2?HREG?400001?short", 3, 16},
        {"forceFunction=05", "1?HREG?400001?short", 3, 16},
        {"presetFunction=06", "1?OUTP?1?boolean", 1, 15},
        {"", "1?NO?0?unsignedByte", 0, 0},
        {"", "1?SP_Baud?0?unsignedInt", 0, 0},
    };
    for (const CodeCase& code : cases) {
        SCOPED_TRACE(std::string(code.items) + " " + code.uri);
        configure(code.items);
        EXPECT_EQ(code.readFunction, tag(code.uri)->readFunction());
        EXPECT_EQ(code.writeFunction, tag(code.uri)->writeFunction());
    }
}

TEST_F(TagAddressingTest, NodeNumberHasAutomaticBase) {
    configure();
    EXPECT_EQ(16, tag("0x10?HREG?400001?short")->nodeId());
    EXPECT_EQ(8, tag("010?HREG?400001?short")->nodeId());
    EXPECT_EQ(0, tag("abc?HREG?400001?short")->nodeId());
    EXPECT_EQ(300, tag("300?HREG?400001?short")->nodeId());
}

TEST_F(TagAddressingTest, UnknownNodeGetsTheWideParameters) {
    configure("timeout=700 Node2::timeout=90");
    EXPECT_EQ(700, tag("9?HREG?400001?short")->nodeParams()->timeout);
    EXPECT_EQ(90, tag("2?HREG?400001?short")->nodeParams()->timeout);
}

TEST_F(TagAddressingTest, UnknownModelIsTheFirstOne) {
    configure("model=17");
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    EXPECT_EQ("1", word->model()->getName());
    EXPECT_EQ(0, word->offset());
    expectRefused("1?LONG?5?int", "Can't access memory type");
}

TEST_F(TagAddressingTest, LengthsAndConversions) {
    configure();
    const Tag_MRTU* words = tag("1?HREG?400001?short-10(bcd, swap2)");
    EXPECT_EQ(ICU_Type::shortArray, words->GetVarType());
    EXPECT_EQ(ICU_Type::short_, words->GetItemType());
    EXPECT_EQ(20, words->GetVarLength());
    EXPECT_EQ((std::vector<std::string>{"bcd", "swap2"}), words->conversions());
}

TEST_F(TagAddressingTest, SubIndexIsTheBitWithinTheItem) {
    configure();
    const Tag_MRTU* bit = tag("1?HREG?400010.3?boolean");
    EXPECT_EQ(9, bit->offset());
    EXPECT_EQ(3, bit->subIndex());
    EXPECT_EQ(3, bit->GetBitIndex());
    EXPECT_EQ(0, tag("1?HREG?400010?boolean")->GetBitIndex());
}

TEST_F(TagAddressingTest, CloneCopiesEveryField) {
    configure("presetFunction=06");
    const Tag_MRTU* word = tag("1?HREG?400010.2?boolean(inv)");
    const std::unique_ptr<ITag> copy(word->Clone());
    const auto* clone = dynamic_cast<Tag_MRTU*>(copy.get());
    ASSERT_NE(nullptr, clone);
    EXPECT_STREQ(word->GetVarName(), clone->GetVarName());
    EXPECT_EQ(word->offset(), clone->offset());
    EXPECT_EQ(word->GetBitIndex(), clone->GetBitIndex());
    EXPECT_EQ(word->nodeId(), clone->nodeId());
    EXPECT_EQ(word->GetVarType(), clone->GetVarType());
    EXPECT_EQ(word->GetVarLength(), clone->GetVarLength());
    EXPECT_EQ(word->conversions(), clone->conversions());
    EXPECT_EQ(word->memoryType(), clone->memoryType());
    EXPECT_EQ(word->model(), clone->model());
    EXPECT_EQ(word->nodeParams(), clone->nodeParams());
    EXPECT_EQ(word->commonParams(), clone->commonParams());
    EXPECT_EQ(3, clone->readFunction());
    EXPECT_EQ(6, clone->writeFunction());
    EXPECT_EQ(word->driverArea(), clone->driverArea());
    const std::unique_ptr<ITag> area(tag("1?NO?0?unsignedByte")->Clone());
    EXPECT_EQ(_MRTU::DriverArea::NodeOverride, static_cast<Tag_MRTU*>(area.get())->driverArea());
}

/// A later configuration once freed the records that tags pointed to.
TEST_F(TagAddressingTest, TagKeepsItsNodesParametersThroughALaterConfiguration) {
    configure("timeout=70 Node2::timeout=90 Node2::presetFunction=06");
    const Tag_MRTU* named = tag("2?HREG?400001?short");
    const Tag_MRTU* unnamed = tag("9?HREG?400001?short");
    const std::unique_ptr<ITag> copy(named->Clone());
    const auto* clone = static_cast<const Tag_MRTU*>(copy.get());

    for (const char* items : {"timeout=5", "timeout=6 Node2::timeout=7", "timeout=8 parity=bad"}) {
        driver->Config(driver_test::configText(items).c_str());
        EXPECT_EQ(90, named->nodeParams()->timeout) << items;
        EXPECT_EQ("06", named->nodeParams()->presetFunction) << items;
        EXPECT_EQ(90, clone->nodeParams()->timeout) << items;
        EXPECT_EQ(70, unnamed->nodeParams()->timeout) << items;
    }
    EXPECT_EQ(8, tag("2?HREG?400001?short")->nodeParams()->timeout);
    EXPECT_EQ(6, named->writeFunction());
    EXPECT_EQ(16, tag("2?HREG?400001?short")->writeFunction());
}

TEST_F(TagAddressingTest, TagIsFramedAsTheLineIsNow) {
    configure("txMode=RTU");
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    configure("txMode=ASCII");
    EXPECT_TRUE(word->commonParams()->isAscii());
}

TEST_F(TagAddressingTest, ReadOnlyAreasGiveReadOnlyTags) {
    configure();
    EXPECT_TRUE(tag("1?IREG?300001?short")->IsReadOnly());
    EXPECT_TRUE(tag("1?INP?100001?boolean")->IsReadOnly());
    EXPECT_FALSE(tag("1?HREG?400001?short")->IsReadOnly());
    EXPECT_FALSE(tag("1?OUTP?1?boolean")->IsReadOnly());
}

}  // namespace
