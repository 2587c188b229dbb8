// The fields of a tag URI.
#include <gtest/gtest.h>

#include <string>

#include "tests/unit/framework/TestProtocol.h"

namespace {

class NamedFields : public TestProtocol {
  public:
    const char* const* tagUriNames() const override {
        static constexpr const char* kNames[] = {"nodeid", "area", "offset", nullptr};
        return kNames;
    }
};

TEST(ProtocolBaseUriTest, ProtocolWithoutNamesHasNoFields) {
    const TestProtocol protocol;
    ASSERT_NE(protocol.tagUriNames(), nullptr);
    EXPECT_EQ(nullptr, protocol.tagUriNames()[0]);
    EXPECT_EQ(0, protocol.getTagUriFieldCount());
    EXPECT_EQ(nullptr, protocol.getTagUriFieldName(0));
    EXPECT_EQ(-1, protocol.getTagUriFieldPosition("nodeid"));
}

TEST(ProtocolBaseUriTest, FieldNamesEndAtTheirCount) {
    const NamedFields protocol;
    EXPECT_EQ(3, protocol.getTagUriFieldCount());
    EXPECT_STREQ("nodeid", protocol.getTagUriFieldName(0));
    EXPECT_STREQ("area", protocol.getTagUriFieldName(1));
    EXPECT_STREQ("offset", protocol.getTagUriFieldName(2));
    for (int index : {-1, 3, 4, 1000, -2147483647 - 1, 2147483647})
        EXPECT_EQ(nullptr, protocol.getTagUriFieldName(index)) << index;
}

TEST(ProtocolBaseUriTest, FieldPositionsComeFromExactNames) {
    const NamedFields protocol;
    const std::pair<const char*, int> rows[] = {
        {"nodeid", 0}, {"area", 1},     {"offset", 2}, {"Area", -1},  {"area ", -1},
        {"node", -1},  {"nodeid2", -1}, {"", -1},      {nullptr, -1},
    };
    for (const auto& [name, position] : rows)
        EXPECT_EQ(position, protocol.getTagUriFieldPosition(name)) << (name ? name : "null");
}

struct UriRow {
    const char* uri;
    int index;
    const char* field;  ///< Null: there is none.
};

TEST(ProtocolBaseUriTest, FieldsAreCutAtEveryQuestionMark) {
    const UriRow rows[] = {
        {"1?HREG?400001", 0, "1"},
        {"1?HREG?400001", 1, "HREG"},
        {"1?HREG?400001", 2, "400001"},
        {"1?HREG?400001", 3, nullptr},
        {"1?HREG?400001", -1, nullptr},
        {"1?HREG?400001", 99, nullptr},
        {"", 0, ""},
        {"", 1, nullptr},
        {"?", 0, ""},
        {"?", 1, ""},
        {"?", 2, nullptr},
        {"a??b", 1, ""},
        {"a??b", 2, "b"},
        {"a?b?", 2, ""},
        {" a ? b ", 1, " b "},
        {"plain", 0, "plain"},
    };
    const NamedFields protocol;
    for (const UriRow& row : rows) {
        const TestTag tag(row.uri, bytesShape(1));
        int length = -77;
        const char* field = protocol.getTagUriField(&tag, row.index, &length);
        SCOPED_TRACE(std::string(row.uri) + " field " + std::to_string(row.index));
        if (row.field == nullptr) {
            EXPECT_EQ(nullptr, field);
            EXPECT_EQ(-77, length);
            continue;
        }
        ASSERT_NE(field, nullptr);
        EXPECT_EQ(row.field, std::string(field, static_cast<std::size_t>(length)));
    }
}

TEST(ProtocolBaseUriTest, FieldPointsIntoTheTagsOwnText) {
    const NamedFields protocol;
    const TestTag tag("1?HREG?400001", bytesShape(1));
    int length = 0;
    EXPECT_EQ(tag.GetVarName() + 2, protocol.getTagUriField(&tag, 1, &length));
    EXPECT_EQ(4, length);
}

TEST(ProtocolBaseUriTest, TagWithoutUriHasNoFields) {
    const NamedFields protocol;
    TestTag tag("1?HREG", bytesShape(1));
    tag.forgetUri();
    int length = -77;
    EXPECT_EQ(nullptr, protocol.getTagUriField(&tag, 0, &length));
    EXPECT_EQ(-77, length);
}

}  // namespace
