#include "settings/DescriptionBlock.h"

#include <fmt/format.h>
#include <zlib.h>

#include <charconv>
#include <cstring>
#include <string_view>

#include "settings/TextError.h"

namespace settings {
namespace {

constexpr std::string_view kLengthKey = "compressedXML=";
constexpr std::string_view kEndMarker = "<<ICOM_XML_END>>";
constexpr std::size_t kMaxDigits = 8;
constexpr std::size_t kMaxDocument = std::size_t{16} << 20;

[[noreturn]] void refuse(const std::string& why) {
    throw DescriptionError("the driver's description can't be read: " + why);
}

struct Stream {
    const unsigned char* data;
    std::size_t length;
};

/// The line is compared character by character, so that nothing behind a foreign block is read.
Stream streamOf(const unsigned char* block) {
    const char* line = reinterpret_cast<const char*>(block);
    if (std::strncmp(line, kLengthKey.data(), kLengthKey.size()) != 0) {
        refuse("it does not begin with 'compressedXML='");
    }
    const char* digits = line + kLengthKey.size();
    const char* end = digits + strnlen(digits, kMaxDigits + 1);
    std::size_t length = 0;
    const auto [stop, error] = std::from_chars(digits, end, length);
    if (error != std::errc{} || stop != end || end - digits > static_cast<long>(kMaxDigits)) {
        refuse("its length is no number");
    }
    return {block + (end - line) + 1, length};
}

/// The piece-wise loop lets the document be of any size without asking for its greatest first.
std::string inflated(const Stream& stream) {
    z_stream state{};
    state.next_in = const_cast<Bytef*>(stream.data);
    state.avail_in = static_cast<uInt>(stream.length);
    if (inflateInit(&state) != Z_OK) refuse("zlib has no memory");

    std::string document;
    int result = Z_OK;
    while (result == Z_OK && document.size() < kMaxDocument) {
        char piece[4096];
        state.next_out = reinterpret_cast<Bytef*>(piece);
        state.avail_out = sizeof piece;
        result = inflate(&state, Z_NO_FLUSH);
        document.append(piece, sizeof piece - state.avail_out);
    }
    const std::size_t leftOver = state.avail_in;
    inflateEnd(&state);
    if (result != Z_STREAM_END) refuse(fmt::format("its stream is damaged (zlib: {})", result));
    if (leftOver != 0) refuse(fmt::format("{} bytes follow its stream", leftOver));
    return document;
}

}  // namespace

std::string inflateDescription(const unsigned char* block) {
    if (block == nullptr) refuse("the driver has none");
    const Stream stream = streamOf(block);
    std::string document = inflated(stream);
    const char* marker = reinterpret_cast<const char*>(stream.data + stream.length);
    if (std::strncmp(marker, kEndMarker.data(), kEndMarker.size() + 1) != 0) {
        refuse("the end marker is missing");
    }
    return document;
}

}  // namespace settings
