// Build step: turns the description document into the framed block that the library carries.
//
//   compress_description DOCUMENT OUTPUT
//
// OUTPUT receives the bytes of the block as the elements of a C++ array. Runs on the build machine,
// also when the library is built for another one.
#include <zlib.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>

namespace {

// The fields behind the marker, separated by "?": the protocol's short name, its display name, the
// version of the description and the platform.
const std::string kStartLine =
    "<<ICOM_XML_START>>Name=MRTU?FullName=Modbus RTU?Version=126?Platform=KV58_LIN";
const std::string kEndLine = "<<ICOM_XML_END>>";

[[noreturn]] void fail(const std::string& message) {
    std::fprintf(stderr, "compress_description: %s\n", message.c_str());
    std::exit(EXIT_FAILURE);
}

std::string readDocument(const char* path) {
    std::ifstream file(path, std::ios::binary);
    if (!file) fail(std::string("cannot read ") + path);
    std::string text{std::istreambuf_iterator<char>(file), {}};
    if (text.empty()) fail(std::string("the document is empty: ") + path);
    return text;
}

/// @return `document` as a zlib stream.
std::string compressed(const std::string& document) {
    const auto size = static_cast<uLong>(document.size());
    uLongf length = compressBound(size);
    std::string stream(length, '\0');
    const int result = compress(reinterpret_cast<Bytef*>(stream.data()), &length,
                                reinterpret_cast<const Bytef*>(document.data()), size);
    if (result != Z_OK) fail("zlib reports error " + std::to_string(result));
    stream.resize(length);
    return stream;
}

/// @return the block: every line, and the stream's length, ends in a zero byte; the stream does
/// not, since its length is known.
std::string framed(const std::string& stream) {
    const std::string zero(1, '\0');
    return kStartLine + zero + "compressedXML=" + std::to_string(stream.size()) + zero + stream +
           kEndLine + zero;
}

void writeArray(const char* path, const std::string& block) {
    constexpr std::size_t kBytesPerLine = 16;
    std::ofstream file(path);
    for (std::size_t i = 0; i < block.size(); ++i) {
        const unsigned value = static_cast<unsigned char>(block[i]);
        file << value << (i % kBytesPerLine == kBytesPerLine - 1 ? ",\n" : ",");
    }
    file << '\n';
    file.close();
    if (!file) fail(std::string("cannot write ") + path);
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 3) fail("usage: compress_description DOCUMENT OUTPUT");
    writeArray(argv[2], framed(compressed(readDocument(argv[1]))));
    return EXIT_SUCCESS;
}
