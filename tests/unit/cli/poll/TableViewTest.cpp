// What keys make of the part of a list that is seen.
#include "cli/poll/TableView.h"

#include <gtest/gtest.h>

namespace {

using cli::KeyKind;
using cli::TableView;

class TableViewTest : public testing::Test {
  protected:
    void SetUp() override {
        std::vector<std::string> texts;
        for (int i = 0; i < 100; ++i)
            texts.push_back("Tag" + std::to_string(i));
        view_.setRows(texts);
        view_.fit(10);
    }
    void type(const std::string& text) {
        for (const char letter : text)
            view_.press({KeyKind::Character, std::string(1, letter)});
    }
    void press(KeyKind kind) { view_.press({kind, {}}); }

    TableView view_;
};

TEST_F(TableViewTest, ScrollsWithinTheList) {
    press(KeyKind::Up);
    EXPECT_EQ(0U, view_.top());
    press(KeyKind::Down);
    EXPECT_EQ(1U, view_.top());
    press(KeyKind::PageDown);
    EXPECT_EQ(11U, view_.top());
    press(KeyKind::End);
    EXPECT_EQ(90U, view_.top());
    press(KeyKind::Down);
    EXPECT_EQ(90U, view_.top());
    press(KeyKind::PageUp);
    EXPECT_EQ(80U, view_.top());
    press(KeyKind::Home);
    EXPECT_EQ(0U, view_.top());
}

TEST_F(TableViewTest, StaysFullWhenTheScreenGrows) {
    press(KeyKind::End);
    view_.fit(40);
    EXPECT_EQ(60U, view_.top());
    view_.fit(1000);
    EXPECT_EQ(0U, view_.top());
}

TEST_F(TableViewTest, FiltersWhileTyping) {
    press(KeyKind::End);
    type("/tag9");
    EXPECT_TRUE(view_.typing());
    EXPECT_EQ(11U, view_.matching().size()) << "9 and 90 to 99, capitals or not";
    EXPECT_EQ(1U, view_.top());
    type("9");
    EXPECT_EQ((std::vector<std::size_t>{99}), view_.matching());
    press(KeyKind::Backspace);
    EXPECT_EQ(11U, view_.matching().size());
    press(KeyKind::Enter);
    EXPECT_FALSE(view_.typing());
    EXPECT_EQ("tag9", view_.filter());
    press(KeyKind::Escape);
    EXPECT_EQ(100U, view_.matching().size());
}

TEST_F(TableViewTest, TakesAQInAFilterAsALetter) {
    type("/q");
    EXPECT_FALSE(view_.ended());
    EXPECT_TRUE(view_.matching().empty());
    press(KeyKind::Down);
    EXPECT_EQ(0U, view_.top());
    press(KeyKind::Escape);
    type("q");
    EXPECT_TRUE(view_.ended());
}

TEST_F(TableViewTest, RemovesWholeCharacters) {
    type("/");
    view_.press({KeyKind::Character, "ä"});
    press(KeyKind::Backspace);
    EXPECT_EQ("", view_.filter());
    press(KeyKind::Backspace);
    EXPECT_EQ(100U, view_.matching().size());
}

TEST_F(TableViewTest, KeepsTheFilterForAnotherList) {
    type("/tag1");
    view_.setRows({"tag1", "pump", "tag12"});
    EXPECT_EQ((std::vector<std::size_t>{0, 2}), view_.matching());
    view_.setRows({});
    EXPECT_TRUE(view_.matching().empty());
}

}  // namespace
