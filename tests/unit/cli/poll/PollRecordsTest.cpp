// Lines for programs: whole, and only what is new.
#include "cli/poll/PollRecords.h"

#include <gtest/gtest.h>

#include <sstream>

#include "tests/unit/cli/poll/PollSamples.h"
#include "values/JsonValues.h"

namespace {

using cli::PollRecords;
using cli::RecordForm;
using cli::RecordWhen;
using cli_test::noon;
using values::Json;

class PollRecordsTest : public testing::Test {
  protected:
    std::string news(PollRecords& records) { return records.news(tags_, snapshot_, noon()); }

    cli::ShownTags tags_ = cli_test::sampleTags();
    poll::Snapshot snapshot_ = cli_test::sampleSnapshot();
};

TEST_F(PollRecordsTest, WritesCsvWithQuotesWhereTheyAreNeeded) {
    PollRecords records(RecordForm::Csv, RecordWhen::Change);
    EXPECT_EQ("time,name,value,unit,quality,code,error\n", records.header());
    EXPECT_EQ(
        "2026-03-01T11:59:58.250Z,Level,133.7,\"m, \"\"NN\"\"\",good,,\n"
        "2026-03-01T11:59:58.250Z,Pump,1,,good,,\n"
        "2026-03-01T12:00:00.000Z,Text,,,bad,-6,\"exception 2, \"\"illegal\"\"\"\n",
        news(records));
}

TEST_F(PollRecordsTest, WritesOneJsonDocumentALine) {
    PollRecords records(RecordForm::Json, RecordWhen::Change);
    EXPECT_EQ("", records.header());
    std::istringstream lines(news(records));
    std::vector<Json> documents;
    for (std::string line; std::getline(lines, line);)
        documents.push_back(Json::parse(line));
    ASSERT_EQ(3U, documents.size());
    EXPECT_EQ(Json(133.7), documents[0]["value"]);
    EXPECT_EQ(Json(1337), documents[0]["raw"]);
    EXPECT_EQ("m, \"NN\"", documents[0]["unit"]);
    EXPECT_EQ(Json(true), documents[1]["value"]);
    EXPECT_FALSE(documents[2].contains("value"));
    EXPECT_EQ("bad", documents[2]["quality"]);
    EXPECT_EQ(Json(-6), documents[2]["error"]["code"]);
}

TEST_F(PollRecordsTest, TellsChangesOnly) {
    PollRecords records(RecordForm::Csv, RecordWhen::Change);
    news(records);
    EXPECT_EQ("", news(records));
    snapshot_.tags[0].count = 2;
    EXPECT_EQ("", news(records)) << "read again, and the same";
    snapshot_.tags[0].count = 3;
    snapshot_.tags[0].value = {0x3A, 0x05};
    EXPECT_EQ("2026-03-01T11:59:58.250Z,Level,133.8,\"m, \"\"NN\"\"\",good,,\n", news(records));
    snapshot_.tags[1].quality = poll::Quality::Stale;
    snapshot_.tags[1].staleSince = noon() - std::chrono::seconds(1);
    EXPECT_EQ("2026-03-01T11:59:59.000Z,Pump,1,,stale,,\n", news(records));
}

TEST_F(PollRecordsTest, TellsEveryReadWhereItIsAsked) {
    PollRecords records(RecordForm::Csv, RecordWhen::Read);
    news(records);
    EXPECT_EQ("", news(records));
    snapshot_.tags[1].count = 2;
    EXPECT_EQ("2026-03-01T11:59:58.250Z,Pump,1,,good,,\n", news(records));
}

TEST_F(PollRecordsTest, SaysNothingOfTagsThatWereNotTriedYet) {
    snapshot_.tags = {{}, {}, {}};
    PollRecords records(RecordForm::Json, RecordWhen::Read);
    EXPECT_EQ("", news(records));
}

TEST_F(PollRecordsTest, TellsAllTagsAnewAfterAnotherList) {
    PollRecords records(RecordForm::Csv, RecordWhen::Change);
    const std::string first = news(records);
    records.forget();
    EXPECT_EQ(first, news(records));
}

TEST_F(PollRecordsTest, StaysOneLineWhateverAnErrorSays) {
    snapshot_.tags[0].error = {-1, "two\nlines \xFF"};
    PollRecords records(RecordForm::Json, RecordWhen::Change);
    const std::string lines = news(records);
    EXPECT_EQ(3, std::count(lines.begin(), lines.end(), '\n'));
}

}  // namespace
