// Overridden parameters and their cache.
#include <limits>
#include <string>

#include "framework/ParameterReplacer.h"
#include "tests/unit/framework/ReplacerFixture.h"

namespace {

class ReplacerParameterTest : public ReplacerTest {
  protected:
    ReplacerParameterTest() { replacer_.setSection("MRTU"); }

    int number(const std::string& name, int fallback, int node = -1) {
        int value = -12345;
        replacer_.get(name, node, fallback, value);
        return value;
    }
    bool flag(const std::string& name, int node, bool fallback) {
        bool value = !fallback;
        replacer_.get(name, node, fallback, value);
        return value;
    }

    static ParameterReplacer::Variant ofType(int type) {
        ParameterReplacer::Variant value;
        value.type = type;
        value.boolValue = true;
        value.intValue = 42;
        value.stringValue = "text";
        return value;
    }

    ParameterReplacer replacer_;
};

TEST_F(ReplacerParameterTest, FullNameCarriesTheNodeUnlessItIsMinusOne) {
    struct Row {
        const char* name;
        int node;
        const char* full;
    };
    const Row rows[] = {
        {"ModiconMode", -1, "ModiconMode"},
        {"ModiconMode", 0, "node0_ModiconMode"},
        {"ModiconMode", 5, "node5_ModiconMode"},
        {"ModiconMode", 247, "node247_ModiconMode"},
        {"ModiconMode", -2, "node-2_ModiconMode"},
        {"x", std::numeric_limits<int>::max(), "node2147483647_x"},
        {"x", std::numeric_limits<int>::min(), "node-2147483648_x"},
        {"", 3, "node3_"},
        {"", -1, ""},
    };
    for (const Row& row : rows)
        EXPECT_EQ(row.full, ParameterReplacer::makeFullName(row.name, row.node));
}

TEST_F(ReplacerParameterTest, NewVariantIsAFalseBoolean) {
    const ParameterReplacer::Variant value;
    EXPECT_EQ(0, value.type);
    EXPECT_FALSE(value.boolValue);
    EXPECT_EQ(0, value.intValue);
    EXPECT_EQ("", value.stringValue);
}

TEST_F(ReplacerParameterTest, SectionIsKept) {
    EXPECT_EQ("MRTU", replacer_.section());
}

TEST_F(ReplacerParameterTest, FirstDefaultDecidesWhereNothingIsStored) {
    EXPECT_EQ(9600, number("baud", 9600));
    EXPECT_EQ(9600, number("baud", 19200));
    EXPECT_TRUE(flag("ModiconMode", 3, true));
    EXPECT_TRUE(flag("ModiconMode", 3, false));
}

TEST_F(ReplacerParameterTest, StoredValueWinsOverTheDefault) {
    contents_.put("MRTU", "baud", 38400);
    contents_.put("MRTU", "node3_ModiconMode", false);
    EXPECT_EQ(38400, number("baud", 9600));
    EXPECT_FALSE(flag("ModiconMode", 3, true));
}

TEST_F(ReplacerParameterTest, StorageIsConsultedOnce) {
    contents_.put("MRTU", "baud", 38400);
    EXPECT_EQ(38400, number("baud", 9600));
    contents_.put("MRTU", "baud", 1200);
    storage_.forget();
    EXPECT_EQ(38400, number("baud", 9600));
    EXPECT_TRUE(storage_.calls().empty());
}

TEST_F(ReplacerParameterTest, MissingKeyIsAskedForOnceAndNotRead) {
    EXPECT_EQ(2, number("stop", 2));
    const std::vector<std::string> calls{"hasKey(MRTU, stop)"};
    EXPECT_EQ(calls, storage_.calls());
    contents_.put("MRTU", "stop", 1);
    EXPECT_EQ(2, number("stop", 2));
    EXPECT_EQ(calls, storage_.calls());
}

TEST_F(ReplacerParameterTest, EachFormReadsItsOwnType) {
    contents_.put("MRTU", "baud", 38400);
    contents_.put("MRTU", "node5_ModiconMode", true);
    number("baud", 9600);
    flag("ModiconMode", 5, false);
    EXPECT_EQ((std::vector<std::string>{"hasKey(MRTU, baud)", "readInt(MRTU, baud)",
                                        "hasKey(MRTU, node5_ModiconMode)",
                                        "readBool(MRTU, node5_ModiconMode)"}),
              storage_.calls());
}

TEST_F(ReplacerParameterTest, NodesHaveValuesOfTheirOwn) {
    EXPECT_TRUE(flag("ModiconMode", 1, true));
    EXPECT_FALSE(flag("ModiconMode", 2, false));
    EXPECT_FALSE(flag("ModiconMode", -1, false));
    EXPECT_TRUE(flag("ModiconMode", 1, false));
}

TEST_F(ReplacerParameterTest, SectionsAreTakenFromTheReplacer) {
    contents_.put("other", "baud", 1200);
    EXPECT_EQ(9600, number("baud", 9600));
    ParameterReplacer other;
    other.setSection("other");
    int value = 0;
    other.get("baud", -1, 9600, value);
    EXPECT_EQ(1200, value);
}

TEST_F(ReplacerParameterTest, NewSectionKeepsCachedValues) {
    EXPECT_EQ(9600, number("baud", 9600));
    contents_.put("other", "baud", 1200);
    replacer_.setSection("other");
    EXPECT_EQ(9600, number("baud", 300));
}

TEST_F(ReplacerParameterTest, WithoutStorageDefaultsAreCached) {
    useNoStorage();
    EXPECT_EQ(9600, number("baud", 9600));
    piPermanentStorage = &storage_;
    contents_.put("MRTU", "baud", 1200);
    EXPECT_EQ(9600, number("baud", 300));
}

TEST_F(ReplacerParameterTest, ExplicitValueReplacesTheCachedOneInMemoryOnly) {
    EXPECT_EQ(9600, number("baud", 9600));
    storage_.forget();
    replacer_.set("baud", ofType(ParameterReplacer::Integer));
    EXPECT_EQ(42, number("baud", 9600));
    EXPECT_TRUE(storage_.calls().empty());
}

TEST_F(ReplacerParameterTest, ExplicitValueComesBeforeTheFirstLookUp) {
    contents_.put("MRTU", "node3_ModiconMode", false);
    replacer_.set("node3_ModiconMode", ofType(ParameterReplacer::Boolean));
    EXPECT_TRUE(flag("ModiconMode", 3, false));
}

TEST_F(ReplacerParameterTest, EachFormTakesItsOwnFieldOfAnEntry) {
    ParameterReplacer::Variant value;
    value.type = ParameterReplacer::Boolean;
    value.boolValue = true;
    replacer_.set("mixed", value);
    EXPECT_EQ(0, number("mixed", 9600));
    EXPECT_TRUE(flag("mixed", -1, false));
}

TEST_F(ReplacerParameterTest, ValuesArePersistedByType) {
    replacer_.persist("flag", ofType(ParameterReplacer::Boolean));
    replacer_.persist("number", ofType(ParameterReplacer::Integer));
    replacer_.persist("name", ofType(ParameterReplacer::Text));
    EXPECT_EQ("bool:true", stored("flag"));
    EXPECT_EQ("int:42", stored("number"));
    EXPECT_EQ("text:text", stored("name"));
    EXPECT_EQ(3u, storage_.calls().size());
}

TEST_F(ReplacerParameterTest, OtherTypesAreNotPersisted) {
    for (int type : {-1, 3, 99})
        replacer_.persist("odd", ofType(type));
    EXPECT_TRUE(storage_.calls().empty());
}

TEST_F(ReplacerParameterTest, PersistedValueIsNotCached) {
    replacer_.persist("baud", ofType(ParameterReplacer::Integer));
    EXPECT_EQ(42, number("baud", 9600));  // found in the storage at the first look-up
    replacer_.persist("baud", ofType(ParameterReplacer::Text));
    EXPECT_EQ(42, number("baud", 9600));
}

TEST_F(ReplacerParameterTest, PersistingWithoutStorageIsHarmless) {
    useNoStorage();
    replacer_.persist("baud", ofType(ParameterReplacer::Integer));
    EXPECT_EQ("none", stored("baud"));
}

TEST_F(ReplacerParameterTest, NamesOfAnyLengthAreKeptApart) {
    for (std::size_t length : {1u, 111u, 112u, 113u, 128u, 500u}) {
        const std::string name(length, 'n');
        contents_.put("MRTU", "node-2147483648_" + name, static_cast<int>(length));
        EXPECT_EQ(static_cast<int>(length), number(name, -1, std::numeric_limits<int>::min()));
        EXPECT_EQ(-7, number(name, -7)) << length;
        EXPECT_EQ(static_cast<int>(length), number(name, -8, std::numeric_limits<int>::min()));
    }
}

TEST_F(ReplacerParameterTest, PlainStorageServesAsWell) {
    usePlainStorage();
    contents_.put("MRTU", "baud", 38400);
    EXPECT_EQ(38400, number("baud", 9600));
}

}  // namespace
