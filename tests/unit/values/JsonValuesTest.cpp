// Values in JSON.
#include "values/JsonValues.h"

#include <gtest/gtest.h>

#include "tests/unit/values/ValueSupport.h"
#include "values/Values.h"

namespace {

using values::Bytes;
using values::ValueShape;
using enum ICU_Type;

struct Row {
    ValueShape shape;
    std::string_view value;  ///< As a person writes it.
    std::string_view json;
};

const Row kRows[] = {
    {{boolean, 1}, "1", "true"},
    {{booleanArray, 2}, "1,0", "[true,false]"},
    {{byte, 1}, "-128", "-128"},
    {{short_, 2}, "-1", "-1"},
    {{int_, 4}, "-2147483648", "-2147483648"},
    {{int64, 8}, "-9223372036854775808", "-9223372036854775808"},
    {{uint64, 8}, "18446744073709551615", "18446744073709551615"},
    {{unsignedByteArray, 2}, "1,255", "[1,255]"},
    {{float_, 4}, "0.1", "0.1"},
    {{floatArray, 8}, "1.5,nan", "[1.5,\"nan\"]"},
    {{double_, 8}, "-inf", "\"-inf\""},
    {{string, 6}, "a\"b\\n", "\"a\\\"b\\n\""},
    {{string, 6}, "\\0a", "\"\\u0000a\""},
    {{string, 3}, "\\xfc", "[252]"},
    {{binary, 2}, "0x01ff", "\"0x01ff\""},
};

TEST(JsonValuesTest, HaveTheTagsType) {
    for (const Row& row : kRows) {
        const Bytes bytes = values::parseValue(row.shape, row.value);
        EXPECT_EQ(row.json, values::jsonValue(row.shape, bytes).dump()) << row.value;
    }
}

TEST(JsonValuesTest, TextInUtf8StaysText) {
    const auto json = values::jsonValue({string, 8}, values_test::bytesOf("K\xc3\xbch\0\0\0\0"));
    EXPECT_EQ("K\xc3\xbch", json.get<std::string>());
}

}  // namespace
