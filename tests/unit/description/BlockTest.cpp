// The framing of the block, byte for byte.
#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "description/GetXml.h"
#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

const char* characters(const unsigned char* bytes) {
    return reinterpret_cast<const char*>(bytes);
}

TEST(BlockTest, MarkerLineAndItsZeroStandInFrontOfThePointer) {
    const std::string marker =
        "<<ICOM_XML_START>>Name=MRTU?FullName=Modbus RTU?Version=126?Platform=KV58_LIN";
    const std::size_t size = marker.size() + 1;
    EXPECT_EQ(marker + '\0', std::string(characters(GetXml_MRTU()) - size, size));
}

TEST(BlockTest, PointerIsAtTheLengthLine) {
    const std::string line = "compressedXML=2224";
    EXPECT_EQ(line + '\0', std::string(characters(GetXml_MRTU()), line.size() + 1));
}

TEST(BlockTest, StreamBeginsBehindTheZeroOfTheLengthLine) {
    EXPECT_EQ(GetXml_MRTU() + sizeof "compressedXML=2224", stream());
    EXPECT_EQ(0x78, stream()[0]) << "deflate with a 32 KiB window";
    EXPECT_EQ(0, (stream()[0] * 256 + stream()[1]) % 31) << "check of the zlib header";
}

TEST(BlockTest, StreamInflatesWithNothingLeftOver) {
    const Inflated inflated = inflateDocument();
    EXPECT_EQ(1, inflated.result) << "Z_STREAM_END: complete and with the right Adler-32";
    EXPECT_EQ(0U, inflated.leftOver);
    EXPECT_EQ(15055U, inflated.text.size());
}

TEST(BlockTest, EndMarkerAndItsZeroFollowTheStreamAtOnce) {
    const std::string marker = "<<ICOM_XML_END>>";
    EXPECT_EQ(2224U, declaredStreamLength());
    EXPECT_EQ(marker + '\0', std::string(characters(stream()) + 2224, marker.size() + 1));
}

TEST(BlockTest, PointerIsAlwaysTheSame) {
    EXPECT_EQ(GetXml_MRTU(), GetXml_MRTU());
}

}  // namespace
}  // namespace description_test
