// Reports read back: whole, cut off, forged and doubled.

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "reader/change.h"
#include "reader/report.h"
#include "tests/reader/change_text.h"
#include "tests/support/file_text.h"

namespace {

constexpr const char* start = "20261114 22:00:03";
constexpr const char* end = "20261114 22:41:55";
const std::string message = "Copying files\n";
const std::string boxLine(94, '*');

// The golden report with times.
std::string Report() {
  std::string text = Golden("ORXInstallEvent.Log");
  text.replace(text.find("<time>"), 6, start);
  text.replace(text.find("<time>"), 6, start);
  return Replaced(text, "<time>", end);
}

ReportFacts Facts() {
  ReportFacts facts;
  facts.Identity = "42";
  facts.StartTime = start;
  facts.EndTime = end;
  return facts;
}

std::string Join(const std::vector<std::string_view>& pieces) {
  std::string text;
  for (const std::string_view piece : pieces) {
    text += piece;
  }
  return text;
}

using Set = std::multiset<std::string>;

// Nothing for a run that has not both snapshots.
Set ChangesOf(const ReportRun& run) {
  if (!run.Before || !run.After) {
    return {};
  }
  const auto texts =
      ChangeTexts(CompareSnapshots(*run.Before, *run.After, TextDecoder(), ChangeDetail::kList));
  return {texts.begin(), texts.end()};
}

TEST(Report, IsReadBack) {
  const std::string text = Report();
  const std::vector<ReportRun> runs = ParseReport(text, Facts());
  ASSERT_EQ(runs.size(), 1U);
  const ReportRun& run = runs[0];
  EXPECT_TRUE(run.IsWhole);
  ASSERT_TRUE(run.Start && run.Computer && run.Result);
  EXPECT_EQ(run.Start->CommandLine, "setup.exe /gui");
  EXPECT_EQ(*run.Computer, "ORXHOST");
  EXPECT_EQ(run.Result->EndTime, end);
  EXPECT_EQ(run.Result->Result, "Successful");
  EXPECT_EQ(Join(run.Messages), message);
  const Set changes = ChangesOf(run);
  EXPECT_EQ(changes.size(), 35U) << ::testing::PrintToString(changes);
  for (const char* change :
       {"removed groups global/Domain Users", "removed members global/Domain Users/ana",
        "removed processes UNK_NAME|count 1 > -", "added copies C1",
        "removed services The ORX service|state Paused > -", "added profile C1/Limit|value - > -2",
        "added drivers ZEK ORX ODBC DRIVER",
        "added driver_parameters ZEK ORX ODBC DRIVER/UsageCount|value - > 2",
        "added instance_profile C1/ORX1/A_PARAMETER_NAME_OF_EXACTLY_36_BYTESrun in"}) {
    EXPECT_TRUE(changes.contains(change)) << change << ::testing::PrintToString(changes);
  }
}

// A report that was cut off anywhere shows changes that the whole one has, and of the messages no
// more than it has.
void ExpectPartOf(const std::string& cut, const ReportFacts& facts, const Set& changes,
                  const std::string& messages) {
  for (const ReportRun& run : ParseReport(cut, facts)) {
    const Set found = ChangesOf(run);
    ASSERT_TRUE(std::includes(changes.begin(), changes.end(), found.begin(), found.end()))
        << cut.size() << testing::PrintToString(found);
    ASSERT_TRUE(messages.starts_with(Join(run.Messages))) << cut.size() << Join(run.Messages);
  }
}

TEST(Report, InventsNothingWhereItBreaksOff) {
  const std::string text = Report();
  const Set changes = ChangesOf(ParseReport(text, Facts())[0]);
  for (size_t size = 0; size < text.size(); ++size) {
    ExpectPartOf(text.substr(0, size), Facts(), changes, message);
  }
}

TEST(Report, ReadsTheLineEndsOfBothSystems) {
  std::string text = Replaced(Report(), "\n", "\r\n");
  UnifyLineEnds(text);
  EXPECT_EQ(text, Report());
}

// Text instead of the message. Whatever it holds, all of it is message, and the event is the same.
TEST(Report, TakesNoMessageForABlock) {
  const std::string text = Report();
  const size_t offset = text.find(message);
  const Set changes = ChangesOf(ParseReport(text, Facts())[0]);
  const std::string endOfReport = text.substr(offset + message.size());
  ReportFacts open = Facts();
  open.EndTime.reset();
  open.MayHaveEnded = false;
  const std::string forgedEnd =
      Replaced(Replaced(endOfReport, end, "20261114 22:30:00"), "Guests", "Forged");
  const std::string withoutServices = Replaced(text.substr(0, offset), "Administrators", "Forged");
  for (const std::string& forged :
       {text.substr(0, offset), forgedEnd, withoutServices + forgedEnd, Replaced(text, "42", "43"),
        endOfReport.substr(0, endOfReport.size() / 2) + '\n',
        endOfReport.substr(0, endOfReport.find("Result of")),
        forgedEnd.substr(0, forgedEnd.find("ORX Products & Build Level   :")),
        std::string("---------- ORX Installation History Logger ( End ) ----------") + end + '\n',
        boxLine + '\n', std::string("\n2) Software Installed on the machine:\n")}) {
    const std::string whole = text.substr(0, offset) + forged + endOfReport;
    const std::vector<ReportRun> runs = ParseReport(whole, Facts());
    ASSERT_EQ(runs.size(), 1U) << forged;
    EXPECT_EQ(Join(runs[0].Messages), forged);
    EXPECT_EQ(ChangesOf(runs[0]), changes) << forged;
    EXPECT_EQ(runs[0].Result->Result, "Successful");
    const size_t forgedEndOffset = offset + forged.size();
    ExpectPartOf(whole.substr(0, forgedEndOffset), Facts(), changes, forged);
    for (size_t size = offset; size < whole.size(); size += 7) {
      // A forged snapshot that the cut leaves without its times cannot be distinguished.
      if (size > forgedEndOffset) {
        ExpectPartOf(whole.substr(0, size), Facts(), changes, forged + endOfReport);
      }
      ExpectPartOf(whole.substr(0, size), open, {}, forged + endOfReport);
    }
  }
}

// The start broke off; what looks like its snapshot came later.
TEST(Report, TakesNoLaterBoxForTheFirstSnapshot) {
  const std::string text = Report();
  const size_t box = text.find(boxLine);
  for (const std::string& first : {message, std::string("\n")}) {
    const std::string forged = Replaced(text, "Guests", "Forged").substr(box);
    const std::string whole = text.substr(0, box) + first + forged;
    const std::vector<ReportRun> runs = ParseReport(whole, Facts());
    EXPECT_FALSE(runs[0].Before);
    EXPECT_TRUE(runs[0].After);
    EXPECT_TRUE(Join(runs[0].Messages).starts_with(first + boxLine));
  }
}

// A message to an event that has ended, which forges another end.
TEST(Report, KeepsTheEndOfTheHistoryFile) {
  const std::string text = Report();
  const std::string forged =
      Replaced(text.substr(text.find(message) + message.size()), end, "20261114 22:50:00");
  const std::string whole = text + forged;
  const std::vector<ReportRun> runs = ParseReport(whole, Facts());
  EXPECT_EQ(runs[0].Result->EndTime, end);
  EXPECT_EQ(Join(runs[0].Messages), message + forged);
  // A second end that finds the report moved has changed the time in the history file alone.
  ReportFacts facts = Facts();
  facts.EndTime = "20261114 23:00:00";
  EXPECT_FALSE(ParseReport(text, facts)[0].Result);
  facts.IsPlaced = true;
  EXPECT_EQ(ParseReport(text, facts)[0].Result->EndTime, end);
  EXPECT_FALSE(ParseReport(text + "late\n", facts)[0].Result);
}

TEST(Report, SeparatesTheRunsOfARepeatedIdentity) {
  const std::string first = Replaced(Report(), "20261114", "20261101");
  const size_t offset = first.find(message);
  for (const size_t size :
       {first.size(), offset + message.size(), offset, size_t{3000}, size_t{1000}, size_t{200}}) {
    std::string text = first.substr(0, size);
    text += (text.ends_with('\n') ? "" : "\n") + Report();
    const std::vector<ReportRun> runs = ParseReport(text, Facts());
    ASSERT_EQ(runs.size(), 2U) << size;
    EXPECT_EQ(runs[0].IsWhole, size >= offset);
    EXPECT_EQ(runs[0].Start->Time, "20261101 22:00:03");
    EXPECT_TRUE(runs[1].IsWhole);
    EXPECT_EQ(ChangesOf(runs[1]).size(), 35U);
    EXPECT_EQ(ChangesOf(runs[0]).size(), size == first.size() ? 35U : 0U);
  }
}

// Messages go on after a start that broke off.
TEST(Report, FindsTheMessagesAfterABrokenSnapshot) {
  const std::string row = "4                  UNK_NAME\n";
  std::string cut = Report();
  const size_t broken = cut.find(row) + row.size();
  cut.erase(broken, cut.find(message) - broken);
  const std::vector<ReportRun> runs = ParseReport(cut, Facts());
  EXPECT_FALSE(runs[0].IsWhole);
  EXPECT_EQ(Join(runs[0].Messages), message);
  EXPECT_EQ(runs[0].Result->Result, "Successful");
  EXPECT_EQ(ChangesOf(runs[0]).size(), 4U);  // the users alone
}

}  // namespace
