// The build step: it computes the length for whatever document it is given, and says what is wrong.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <zlib.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

namespace {

namespace fs = std::filesystem;

class CompressDescriptionTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string name = (fs::temp_directory_path() / "mrtu_compress_XXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        directory_ = name;
    }
    void TearDown() override { fs::remove_all(directory_); }

    fs::path document() const { return directory_ / "document.xml"; }
    fs::path output() const { return directory_ / "block.inc"; }

    void store(const std::string& text) const {
        std::ofstream(document(), std::ios::binary) << text;
    }

    /// @return the exit code.
    int run(const fs::path& to) const {
        const std::string command = std::string(COMPRESS_DESCRIPTION) + " '" + document().string() +
                                    "' '" + to.string() + "' 2>/dev/null";
        const int status = std::system(command.c_str());
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    std::string block() const {
        std::ifstream file(output());
        std::string bytes;
        for (std::string number; std::getline(file, number, ',');) {
            if (number.find_first_of("0123456789") == std::string::npos) continue;
            bytes += static_cast<char>(std::stoi(number));
        }
        return bytes;
    }

  private:
    fs::path directory_;
};

std::string zlibStream(const std::string& text) {
    uLongf length = compressBound(static_cast<uLong>(text.size()));
    std::string stream(length, '\0');
    EXPECT_EQ(Z_OK, compress(reinterpret_cast<Bytef*>(stream.data()), &length,
                             reinterpret_cast<const Bytef*>(text.data()),
                             static_cast<uLong>(text.size())));
    stream.resize(length);
    return stream;
}

TEST_F(CompressDescriptionTest, FramesAnyDocumentWithItsOwnLength) {
    for (const std::string& text : {std::string("<a/>"), std::string(40000, 'x')}) {
        store(text);
        ASSERT_EQ(0, run(output()));
        const std::string stream = zlibStream(text);
        std::string expected =
            "<<ICOM_XML_START>>Name=MRTU?FullName=Modbus RTU?Version=126?Platform=KV58_LIN";
        expected.append(1, '\0');
        expected.append("compressedXML=").append(std::to_string(stream.size())).append(1, '\0');
        expected.append(stream).append("<<ICOM_XML_END>>").append(1, '\0');
        EXPECT_EQ(expected, block());
    }
}

TEST_F(CompressDescriptionTest, RefusesAMissingDocument) {
    EXPECT_EQ(1, run(output()));
    EXPECT_FALSE(fs::exists(output()));
}

TEST_F(CompressDescriptionTest, RefusesAnEmptyDocument) {
    store("");
    EXPECT_EQ(1, run(output()));
    EXPECT_FALSE(fs::exists(output()));
}

TEST_F(CompressDescriptionTest, ReportsAnOutputThatCannotBeWritten) {
    store("<a/>");
    EXPECT_EQ(1, run("/dev/full"));
}

}  // namespace
