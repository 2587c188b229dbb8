// Refused requests. Source: the state diagrams of Modbus Application Protocol V1.1b3, 6.
#include <gtest/gtest.h>

#include <string>

#include "sim/Slave.h"

namespace sim {
namespace {

using wire::Bytes;

struct RefusedCase {
    const char* what;
    Bytes request;
    std::uint8_t code;
};

std::ostream& operator<<(std::ostream& out, const RefusedCase& each) {
    return out << each.what;
}

Bytes withData(Bytes request, std::size_t count) {
    request.resize(request.size() + count, 0x00);
    return request;
}

class ExceptionTest : public testing::TestWithParam<RefusedCase> {};

TEST_P(ExceptionTest, IsAnsweredWithItsCode) {
    Slave slave({NodeOptions{
        .address = 1,
        .sizes = {
            .coils = 100, .discreteInputs = 100, .holdingRegisters = 100, .inputRegisters = 100}}});
    const Bytes expected{1, static_cast<std::uint8_t>(GetParam().request[1] | 0x80U),
                         GetParam().code};
    EXPECT_EQ(expected, slave.answer(GetParam().request));
    for (std::uint32_t i = 0; i < 100; ++i) {
        const auto address = static_cast<std::uint16_t>(i);
        EXPECT_EQ(initialValue(Area::Coil, 1, address), slave.get(1, Area::Coil, i));
        EXPECT_EQ(initialValue(Area::HoldingRegister, 1, address),
                  slave.get(1, Area::HoldingRegister, i));
    }
}

INSTANTIATE_TEST_SUITE_P(
    Function, ExceptionTest,
    testing::Values(RefusedCase{"function 7", {1, 0x07}, 1},
                    RefusedCase{"function 0", {1, 0x00, 0, 0, 0, 1}, 1},
                    RefusedCase{"function 22", {1, 0x16, 0, 0, 0, 1, 0, 1}, 1},
                    RefusedCase{"function 23", {1, 0x17, 0, 0, 0, 1, 0, 0, 0, 1, 2, 0, 1}, 1}));

INSTANTIATE_TEST_SUITE_P(
    Address, ExceptionTest,
    testing::Values(RefusedCase{"coils beyond the end", {1, 0x01, 0, 99, 0, 2}, 2},
                    RefusedCase{"inputs beyond the end", {1, 0x02, 0, 100, 0, 1}, 2},
                    RefusedCase{"registers beyond the end", {1, 0x03, 0, 0, 0, 101}, 2},
                    RefusedCase{"highest address", {1, 0x03, 0xFF, 0xFF, 0, 2}, 2},
                    RefusedCase{"input registers beyond the end", {1, 0x04, 0xA1, 0, 0, 1}, 2},
                    RefusedCase{"one coil", {1, 0x05, 0, 100, 0xFF, 0}, 2},
                    RefusedCase{"one register", {1, 0x06, 0, 100, 0, 1}, 2},
                    RefusedCase{"many coils", {1, 0x0F, 0, 99, 0, 2, 1, 3}, 2},
                    RefusedCase{"many registers", {1, 0x10, 0, 99, 0, 2, 4, 9, 9, 9, 9}, 2}));

INSTANTIATE_TEST_SUITE_P(
    Value, ExceptionTest,
    testing::Values(RefusedCase{"0 coils", {1, 0x01, 0, 0, 0, 0}, 3},
                    RefusedCase{"2001 coils", {1, 0x01, 0, 0, 0x07, 0xD1}, 3},
                    RefusedCase{"2001 inputs", {1, 0x02, 0, 0, 0x07, 0xD1}, 3},
                    RefusedCase{"0 registers", {1, 0x03, 0, 0, 0, 0}, 3},
                    RefusedCase{"126 registers", {1, 0x03, 0, 0, 0, 126}, 3},
                    RefusedCase{"126 input registers", {1, 0x04, 0, 0, 0, 126}, 3},
                    RefusedCase{"coil value 1", {1, 0x05, 0, 0, 0, 1}, 3},
                    RefusedCase{"coil value FF01", {1, 0x05, 0, 0, 0xFF, 1}, 3},
                    RefusedCase{"0 coils written", {1, 0x0F, 0, 0, 0, 0, 0}, 3},
                    RefusedCase{"1969 coils", withData({1, 0x0F, 0, 0, 0x07, 0xB1, 247}, 247), 3},
                    RefusedCase{"0 registers written", {1, 0x10, 0, 0, 0, 0, 0}, 3},
                    RefusedCase{"124 registers", withData({1, 0x10, 0, 0, 0, 124, 248}, 248), 3}));

INSTANTIATE_TEST_SUITE_P(
    Length, ExceptionTest,
    testing::Values(RefusedCase{"read without count", {1, 0x03, 0, 0}, 3},
                    RefusedCase{"read of function alone", {1, 0x01}, 3},
                    RefusedCase{"read with a byte too many", {1, 0x03, 0, 0, 0, 1, 0}, 3},
                    RefusedCase{"write one, cut", {1, 0x06, 0, 0, 0}, 3},
                    RefusedCase{"write one, too long", {1, 0x06, 0, 0, 0, 0, 0, 1}, 3},
                    RefusedCase{"write many, cut", {1, 0x10, 0, 0, 0, 1}, 3},
                    RefusedCase{"byte count too small", {1, 0x10, 0, 0, 0, 2, 2, 9, 9}, 3},
                    RefusedCase{"byte count too great", {1, 0x0F, 0, 0, 0, 8, 2, 9, 9}, 3},
                    RefusedCase{"data missing", {1, 0x10, 0, 0, 0, 2, 4, 9, 9, 9}, 3},
                    RefusedCase{"data to spare", {1, 0x10, 0, 0, 0, 1, 2, 9, 9, 9}, 3}));

INSTANTIATE_TEST_SUITE_P(
    ValueBeforeAddress, ExceptionTest,
    testing::Values(RefusedCase{"126 registers far out", {1, 0x03, 0xF0, 0, 0, 126}, 3},
                    RefusedCase{"coil value far out", {1, 0x05, 0xF0, 0, 0, 1}, 3}));

}  // namespace
}  // namespace sim
