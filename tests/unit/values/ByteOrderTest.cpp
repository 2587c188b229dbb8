#include "values/ByteOrder.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "values/ValueError.h"

namespace {

using values::withoutByteOrder;

TEST(ByteOrderTest, ANameBecomesConversions) {
    const struct {
        const char* named;
        const char* plain;
    } rows[] = {
        {"1?HREG?400010?float@ABCD", "1?HREG?400010?float(swap2,swap4)"},
        {"1?HREG?400010?float@CDAB", "1?HREG?400010?float"},
        {"1?HREG?400010?int@DCBA", "1?HREG?400010?int(swap2)"},
        {"1?IREG?300010?unsignedInt@BADC", "1?IREG?300010?unsignedInt(swap4)"},
        {"1?HREG?400010?double@ABCDEFGH", "1?HREG?400010?double(swap2,swap8)"},
        {"1?HREG?400010?int64@GHEFCDAB", "1?HREG?400010?int64"},
        {"1?HREG?400010?uint64@HGFEDCBA", "1?HREG?400010?uint64(swap2)"},
        {"1?HREG?400010?double@BADCFEHG", "1?HREG?400010?double(swap8)"},
        {"1?HREG?400010?double-3@EFGHABCD", "1?HREG?400010?double-3(swap2,swap4)"},
        {"1?HREG?400010?short@AB", "1?HREG?400010?short"},
        {"1?HREG?400010?unsignedShort-9@BA", "1?HREG?400010?unsignedShort-9(swap2)"},
        {"1?HREG?400010?string-8@AB", "1?HREG?400010?string-8(swap2)"},
        {"1?HREG?400010?string-8@BA", "1?HREG?400010?string-8"},
        {"1?HREG?400010?binary-4@AB", "1?HREG?400010?binary-4(swap2)"},
        {"1?HREG?400010?float-4@abcd", "1?HREG?400010?float-4(swap2,swap4)"},
        {" 1 ? HREG ?400010? float @ ABCD ", " 1 ? HREG ?400010?float(swap2,swap4)"},
        {"1?HREG?400010?int(neg)@ABCD", "1?HREG?400010?int(neg,swap2,swap4)"},
        {"1?HREG?400010?int@ABCD(neg)", "1?HREG?400010?int(neg,swap2,swap4)"},
        {"1?HREG?400010?int(neg)@CDAB", "1?HREG?400010?int(neg)"},
        {"1?HREG?400010?int(swapnibble)@DCBA", "1?HREG?400010?int(swapnibble,swap2)"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(row.plain, withoutByteOrder(row.named)) << row.named;
}

TEST(ByteOrderTest, A32BitRegisterTravelsHighByteFirst) {
    EXPECT_EQ("1?LONG?5000?float", withoutByteOrder("1?LONG?5000?float@ABCD"));
    EXPECT_EQ("1?LONG?5000?int(swap2,swap4)", withoutByteOrder("1?LONG?5000?int@CDAB"));
    EXPECT_EQ("1?LONG?5000?int(swap4)", withoutByteOrder("1?LONG?5000?int@DCBA"));
    EXPECT_EQ("1?LONG?5000?int(swap2)", withoutByteOrder("1?LONG?5000?int@BADC"));
}

TEST(ByteOrderTest, WhatHasNoneStaysAsItIs) {
    for (const char* const uri :
         {"1?HREG?400010?float", "1?HREG?400010?float(swap2)", "1?OUTP?1?boolean-8", "", "@",
          "1?HREG?400010@ABCD", "1?HREG@ABCD?400010?float", " 1?HREG ?400010? float( swap2 ) "})
        EXPECT_EQ(uri, withoutByteOrder(uri));
}

// The driver's own complaint about the type says more than one about the order.
TEST(ByteOrderTest, AnUnknownTypeIsLeftToTheDriver) {
    EXPECT_EQ("1?HREG?400010?word", withoutByteOrder("1?HREG?400010?word@ABCD"));
}

std::string refusalOf(const std::string& uri) {
    try {
        return "accepted: " + withoutByteOrder(uri);
    } catch (const values::ValueError& error) {
        return error.what();
    }
}

TEST(ByteOrderTest, OneThatDoesNotFitIsRefusedWithTheChoices) {
    const struct {
        const char* uri;
        const char* refusal;
    } rows[] = {
        {"1?HREG?400010?float@ABDC", "'ABDC' is no byte order of float: ABCD, CDAB, DCBA, BADC"},
        {"1?HREG?400010?float@", "'' is no byte order of float: ABCD, CDAB, DCBA, BADC"},
        {"1?HREG?400010?double-2@ABCD",
         "'ABCD' is no byte order of double-2: ABCDEFGH, GHEFCDAB, HGFEDCBA, BADCFEHG, EFGHABCD, "
         "CDABGHEF, DCBAHGFE, FEHGBADC"},
        {"1?HREG?400010?short@ABCD", "'ABCD' is no byte order of short: AB, BA"},
        {"1?HREG?400010?string-8@ABCD", "'ABCD' is no byte order of string-8: AB, BA"},
        {"1?HREG?400010?string-7@AB", "string-7 has no byte order: an odd length"},
        {"1?HREG?400010.3?boolean@AB", "boolean has no byte order here"},
        {"1?OUTP?1?boolean-8@AB", "boolean-8 has no byte order here"},
        {"1?HREG?400010?unsignedByte@AB", "unsignedByte has no byte order here"},
        {"1?SP_Baud?0?unsignedInt@ABCD", "unsignedInt has no byte order here"},
        {"1?HREG?400010?float(swap2)@ABCD", "a byte order by name takes the place of swap2"},
        {"1?HREG?400010?float(neg, swap4)@ABCD", "a byte order by name takes the place of swap4"},
        {"1?HREG?400010?float(neg@ABCD", "a conversion list ends in ')'"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(row.refusal, refusalOf(row.uri)) << row.uri;
}

TEST(ByteOrderTest, EachNameOfTheTableIsAPermutationAndStandsOnce) {
    const auto orders = values::byteOrders();
    EXPECT_EQ(14U, orders.size());
    for (const values::ByteOrder& order : orders) {
        std::string letters(order.name);
        std::sort(letters.begin(), letters.end());
        EXPECT_EQ(std::string("ABCDEFGH").substr(0, order.name.size()), letters);
        EXPECT_EQ(1,
                  std::count_if(orders.begin(), orders.end(), [&](const values::ByteOrder& each) {
                      return each.name == order.name;
                  }));
    }
}

}  // namespace
