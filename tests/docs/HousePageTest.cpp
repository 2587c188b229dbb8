// The house of docs/architecture.md against the includes of the source files.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <sstream>

#include "tests/docs/Page.h"

namespace docs_test {
namespace {

namespace fs = std::filesystem;

struct Room {
    int layer;
    bool aboveTheLine;  ///< Whether a driver is loaded there and not linked.
};

using House = std::map<std::string, Room>;

House houseOfThePage() {
    const std::string text = Page("docs/architecture.md").text();
    const std::regex room("^ (\\d| )   ([a-z]+)/ ");
    std::istringstream lines(text.substr(text.find("```")));
    House house;
    int layer = 0;
    bool above = true;
    std::string line;
    std::getline(lines, line);
    while (std::getline(lines, line) && !line.starts_with("```")) {
        if (line.find("====") != std::string::npos) above = false;
        std::smatch found;
        if (!std::regex_search(line, found, room)) continue;
        if (found[1] != " ") layer = std::stoi(found[1]);
        house[found[2]] = {layer, above};
    }
    return house;
}

bool isSource(const fs::path& file) {
    const std::string extension = file.extension();
    return extension == ".h" || extension == ".cpp" || extension == ".c";
}

std::vector<fs::path> sourcesOf(const std::string& room) {
    std::vector<fs::path> files;
    for (const auto& entry : fs::recursive_directory_iterator(SOURCE_FOLDER "/" + room))
        if (entry.is_regular_file() && isSource(entry.path())) files.push_back(entry.path());
    return files;
}

/// The rooms of the house that a file includes something of.
std::vector<std::string> roomsIncludedBy(const fs::path& file, const House& house) {
    static const std::regex include("^#include \"([a-z]+)/");
    std::vector<std::string> rooms;
    std::ifstream lines(file);
    std::smatch found;
    for (std::string line; std::getline(lines, line);)
        if (std::regex_search(line, found, include) && house.contains(found[1]))
            rooms.push_back(found[1]);
    return rooms;
}

bool mayInclude(const std::string& from, const std::string& what, const House& house) {
    if (from == what) return true;
    const Room& upper = house.at(from);
    const Room& lower = house.at(what);
    if (upper.aboveTheLine && !lower.aboveTheLine) return what == "platform";
    return lower.layer < upper.layer;
}

TEST(HousePageTest, EveryRoomStandsThereAndHasSources) {
    const House house = houseOfThePage();
    EXPECT_LT(10U, house.size());
    for (const auto& [name, room] : house)
        EXPECT_FALSE(sourcesOf(name).empty()) << name;
}

TEST(HousePageTest, EveryFolderWithSourcesIsNamed) {
    const House house = houseOfThePage();
    const std::string text = Page("docs/architecture.md").text();
    for (const auto& entry : fs::directory_iterator(SOURCE_FOLDER)) {
        const std::string name = entry.path().filename();
        if (!entry.is_directory() || name == "build" || name.starts_with('.')) continue;
        if (sourcesOf(name).empty()) continue;
        const bool named =
            house.contains(name) || text.find('`' + name + "/`") != std::string::npos;
        EXPECT_TRUE(named) << name;
    }
}

TEST(HousePageTest, IncludesPointDownwardsOnly) {
    const House house = houseOfThePage();
    for (const auto& [name, room] : house)
        for (const fs::path& file : sourcesOf(name))
            for (const std::string& other : roomsIncludedBy(file, house))
                EXPECT_TRUE(mayInclude(name, other, house)) << file << " includes " << other;
}

}  // namespace
}  // namespace docs_test
