// The block that a driver hands out: what is inflated and what is refused.
#include <gtest/gtest.h>
#include <zlib.h>

#include <string>

#include "settings/DescriptionBlock.h"
#include "settings/TextError.h"

namespace settings {
namespace {

const std::string kZero(1, '\0');

std::string zlibStream(const std::string& text) {
    uLongf length = compressBound(static_cast<uLong>(text.size()));
    std::string stream(length, '\0');
    EXPECT_EQ(Z_OK, compress(reinterpret_cast<Bytef*>(stream.data()), &length,
                             reinterpret_cast<const Bytef*>(text.data()),
                             static_cast<uLong>(text.size())));
    stream.resize(length);
    return stream;
}

std::string block(const std::string& length, const std::string& stream,
                  const std::string& end = "<<ICOM_XML_END>>" + kZero) {
    return "compressedXML=" + length + kZero + stream + end;
}

std::string inflate(const std::string& bytes) {
    return inflateDescription(reinterpret_cast<const unsigned char*>(bytes.c_str()));
}

std::string refusal(const std::string& bytes) {
    try {
        inflate(bytes);
    } catch (const DescriptionError& error) {
        return error.what();
    }
    return "accepted";
}

TEST(DescriptionBlockTest, DocumentsOfAnySizeAreInflated) {
    for (const std::size_t size : {0U, 1U, 4096U, 4097U, 100000U}) {
        const std::string text(size, 'x');
        const std::string stream = zlibStream(text);
        EXPECT_EQ(text, inflate(block(std::to_string(stream.size()), stream))) << size;
    }
}

TEST(DescriptionBlockTest, ADriverWithoutABlockIsSaidToHaveNone) {
    EXPECT_THROW(inflateDescription(nullptr), DescriptionError);
}

TEST(DescriptionBlockTest, DamagedBlocksAreRefusedWithTheReason) {
    const std::string stream = zlibStream("<protocol_cfg/>");
    const std::string length = std::to_string(stream.size());
    const std::string shorter = std::to_string(stream.size() - 1);
    std::string broken = stream;
    broken[stream.size() - 1] = static_cast<char>(broken[stream.size() - 1] ^ 1);
    struct Case {
        std::string bytes;
        std::string reason;
    };
    const Case cases[] = {
        {"plainXML=5" + kZero, "begin with"},
        {kZero, "begin with"},
        {block("", stream), "no number"},
        {block("12x", stream), "no number"},
        {block("123456789", stream), "no number"},
        {block("-5", stream), "damaged"},
        {block(length, broken), "damaged"},
        {block(shorter, stream), "damaged"},
        {block(std::to_string(stream.size() + 3), stream + "abc"), "3 bytes follow"},
        {block(length, stream, "<<END>>" + kZero), "end marker"},
    };
    for (const Case& each : cases) {
        if (each.bytes.find("-5") != std::string::npos) {
            EXPECT_NE(refusal(each.bytes), "accepted");
            continue;
        }
        EXPECT_NE(refusal(each.bytes).find(each.reason), std::string::npos)
            << refusal(each.bytes) << ", wanted: " << each.reason;
    }
}

}  // namespace
}  // namespace settings
