// Texts that are no value, and what is said about them.
#include <gtest/gtest.h>

#include "tests/unit/values/ValueSupport.h"

namespace {

using values::ValueShape;
using values_test::refusal;
using enum ICU_Type;

struct Refused {
    ValueShape shape;
    std::string_view text;
    std::string_view complaint;
};

const Refused kRefused[] = {
    {{boolean, 1}, "2", "'2' is none of 0, 1, false and true (boolean)"},
    {{boolean, 1}, "", "'' is none of 0, 1, false and true (boolean)"},
    {{boolean, 1}, "TRUE", "'TRUE' is none of 0, 1, false and true (boolean)"},
    {{byte, 1}, "128", "'128' is out of range for byte (-128..127)"},
    {{byte, 1}, "-129", "'-129' is out of range for byte (-128..127)"},
    {{byte, 1}, "0xFF", "'0xFF' is out of range for byte (-128..127)"},
    {{short_, 2}, "32768", "'32768' is out of range for short (-32768..32767)"},
    {{short_, 2}, "0xFFFF", "'0xFFFF' is out of range for short (-32768..32767)"},
    {{int_, 4}, "2147483648", "'2147483648' is out of range for int (-2147483648..2147483647)"},
    {{int_, 4}, "-2147483649", "'-2147483649' is out of range for int (-2147483648..2147483647)"},
    {{unsignedByte, 1}, "256", "'256' is out of range for unsignedByte (0..255)"},
    {{unsignedByte, 1}, "-1", "'-1' is out of range for unsignedByte (0..255)"},
    {{unsignedShort, 2}, "65536", "'65536' is out of range for unsignedShort (0..65535)"},
    {{unsignedInt, 4},
     "4294967296",
     "'4294967296' is out of range for unsignedInt (0..4294967295)"},
    {{uint64, 8},
     "18446744073709551616",
     "'18446744073709551616' is out of range for uint64 (0..18446744073709551615)"},
    {{int64, 8},
     "9223372036854775808",
     "'9223372036854775808' is out of range for int64 (-9223372036854775808..9223372036854775807)"},
    {{int64, 8},
     "-99999999999999999999999",
     "'-99999999999999999999999' is out of range for int64 "
     "(-9223372036854775808..9223372036854775807)"},
    {{int_, 4}, "", "'' is no whole number (int)"},
    {{int_, 4}, "-", "'-' is no whole number (int)"},
    {{int_, 4}, "--1", "'--1' is no whole number (int)"},
    {{int_, 4}, "0x", "'0x' is no whole number (int)"},
    {{int_, 4}, "0x-1", "'0x-1' is no whole number (int)"},
    {{int_, 4}, "1.5", "'1.5' is no whole number (int)"},
    {{int_, 4}, "1 2", "'1 2' is no whole number (int)"},
    {{int_, 4}, "12a", "'12a' is no whole number (int)"},
    {{int_, 4}, "1,2", "'1,2' is no whole number (int)"},
    {{int_, 4}, "99999999999999999999x", "'99999999999999999999x' is no whole number (int)"},
    {{float_, 4}, "", "'' is no number for float"},
    {{float_, 4}, "abc", "'abc' is no number for float"},
    {{float_, 4}, "1.5x", "'1.5x' is no number for float"},
    {{float_, 4}, "--1", "'--1' is no number for float"},
    {{float_, 4}, "+-1", "'+-1' is no number for float"},
    {{float_, 4}, "0x", "'0x' is no number for float"},
    {{float_, 4}, "0x-1", "'0x-1' is no number for float"},
    {{float_, 4}, "0xinf", "'0xinf' is no number for float"},
    {{float_, 4}, "infinity", "'infinity' is no number for float"},
    {{float_, 4}, "nan()", "'nan()' is no number for float"},
    {{float_, 4}, "nan(0x3f800000)", "'nan(0x3f800000)' is no NaN pattern of float"},
    {{float_, 4}, "nan(0x1ffffffff)", "'nan(0x1ffffffff)' is no NaN pattern of float"},
    {{float_, 4}, "3.5e38", "'3.5e38' is out of range for float"},
    {{float_, 4}, "-3.5e38", "'-3.5e38' is out of range for float"},
    {{float_, 4}, "1e-50", "'1e-50' is out of range for float"},
    {{float_, 4}, "0x1p-200", "'0x1p-200' is out of range for float"},
    {{double_, 8}, "1e309", "'1e309' is out of range for double"},
    {{double_, 8}, "1e-400", "'1e-400' is out of range for double"},
    {{string, 4}, "abcde", "text of 5 bytes is too long for string-4"},
    {{string, 4}, "\"ab", "text '\"ab': the closing quote is missing"},
    {{string, 4}, "\"a\"b", "text '\"a\"b': something stands behind the closing quote"},
    {{string, 4}, "a\\q", "text 'a\\q': unknown escape \\q"},
    {{string, 4}, "a\\x4", "text 'a\\x4': \\x needs two hexadecimal digits"},
    {{string, 4}, "a\\x4g", "text 'a\\x4g': \\x needs two hexadecimal digits"},
    {{string, 4}, "a\\", "text 'a\\': a lone backslash at its end (write \\\\)"},
    {{binary, 2}, "0x01", "binary-2 needs 4 hexadecimal digits, not 2"},
    {{binary, 2}, "0x010203", "binary-2 needs 4 hexadecimal digits, not 6"},
    {{binary, 2}, "0x0g00", "'0g' is no hexadecimal byte (binary-2)"},
    {{binary, 2}, "+100", "'+1' is no hexadecimal byte (binary-2)"},
    {{shortArray, 4}, "1", "short-2 needs 2 items, not 1"},
    {{shortArray, 4}, "1,2,3", "short-2 needs 2 items, not 3"},
    {{shortArray, 4}, "", "short-2 needs 2 items, not 0"},
    {{shortArray, 4}, "1,", "'' is no whole number (short)"},
    {{shortArray, 4}, "1,70000", "'70000' is out of range for short (-32768..32767)"},
    {{booleanArray, 2}, "10", "boolean-2 needs 2 items, not 1"},
    {{booleanArray, 2}, "1,2", "'2' is none of 0, 1, false and true (boolean)"},
    {{intArray, 0}, "1", "int-0 needs 0 items, not 1"},
    {{time, 10}, "0", "values of type time can't be written as text"},
    {{timeArray, 10}, "0", "values of type time- can't be written as text"},
    {{object, 0}, "", "values of type object can't be written as text"},
};

TEST(RefusedValuesTest, AreNamedTogetherWithWhatWouldDo) {
    for (const Refused& row : kRefused) {
        EXPECT_EQ(row.complaint, refusal(row.shape, row.text))
            << values::typeName(row.shape) << ": " << row.text;
    }
}

TEST(RefusedValuesTest, OneTooManyIsRefusedForEveryWholeNumber) {
    for (const values::ValueType& row : values::kValueTypes) {
        const bool isSigned = row.kind == values::ValueKind::Signed;
        if (!isSigned && row.kind != values::ValueKind::Unsigned) continue;
        // 2^(bits - 1) or 2^bits, as hexadecimal text.
        const unsigned bits = 8U * row.bytes - (isSigned ? 1 : 0);
        const std::string limit =
            "0x" + std::string(1, "1248"[bits % 4]) + std::string(bits / 4, '0');
        const ValueShape shape{row.type, row.bytes};
        EXPECT_NE(refusal(shape, limit), "accepted") << row.name << ' ' << limit;
        EXPECT_EQ(isSigned, refusal(shape, "-" + limit) == "accepted") << row.name << " -" << limit;
    }
}

}  // namespace
