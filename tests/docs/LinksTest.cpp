// What the pages name is there.
#include <gtest/gtest.h>

#include <cctype>
#include <filesystem>
#include <regex>

#include "tests/docs/Page.h"

namespace docs_test {
namespace {

namespace fs = std::filesystem;

const fs::path kTop = SOURCE_FOLDER;

/// From the project's folder on.
std::vector<std::string> pages() {
    std::vector<std::string> names{"README.md", "CONTRIBUTING.md", "CHANGELOG.md"};
    for (const auto& entry : fs::directory_iterator(kTop / "docs"))
        names.push_back("docs/" + entry.path().filename().string());
    return names;
}

/// Whether the text is the name of a file or folder of the project, and no placeholder.
bool namesAFile(const std::string& text) {
    static const std::regex path("([a-z]+)/[A-Za-z0-9_./-]*");
    static const std::regex placeholder("(^|/)[A-Z]{2,}(/|$)|NAME|Name");
    std::smatch found;
    if (!std::regex_match(text, found, path) || found[1] == "build") return false;
    return fs::is_directory(kTop / found[1].str()) && !std::regex_search(text, placeholder);
}

/// "## A driver, or two" -> "a-driver-or-two"
std::string anchorOf(const std::string& heading) {
    std::string anchor;
    for (const char c : heading) {
        const auto letter = static_cast<unsigned char>(c);
        if (std::isalnum(letter) != 0 || c == '-') anchor += static_cast<char>(std::tolower(c));
        if (c == ' ') anchor += '-';
    }
    return anchor;
}

bool hasHeading(const Page& page, const std::string& anchor) {
    static const std::regex heading("(^|\n)#+ ([^\n]*)");
    const std::string& text = page.text();
    for (std::sregex_iterator each(text.begin(), text.end(), heading), end; each != end; ++each)
        if (anchorOf((*each)[2]) == anchor) return true;
    return false;
}

TEST(LinksTest, FilesInBackQuotesAreThere) {
    int files = 0;
    for (const std::string& name : pages()) {
        const Page page(name);
        for (const std::string& code : codeIn(page.text())) {
            if (!namesAFile(code)) continue;
            ++files;
            EXPECT_TRUE(fs::exists(kTop / code)) << code << " in " << name;
        }
    }
    EXPECT_LT(50, files);
}

TEST(LinksTest, LinksLeadToPagesAndTheirHeadings) {
    static const std::regex link("\\]\\(([^)#:]*)#?([^):]*)\\)");
    int links = 0;
    for (const std::string& name : pages()) {
        const std::string text = Page(name).text();
        const fs::path folder = fs::path(name).parent_path();
        for (std::sregex_iterator each(text.begin(), text.end(), link), end; each != end; ++each) {
            ++links;
            const std::string target = (*each)[1];
            const std::string file =
                target.empty() ? name : (folder / target).lexically_normal().string();
            ASSERT_TRUE(fs::exists(kTop / file)) << each->str() << " in " << name;
            const std::string anchor = (*each)[2];
            EXPECT_TRUE(anchor.empty() || hasHeading(Page(file), anchor))
                << each->str() << " in " << name;
        }
    }
    EXPECT_LT(50, links);
}

}  // namespace
}  // namespace docs_test
