// Reports read back: whole, cut off, forged and doubled.

#include <gtest/gtest.h>

#include <set>

#include "reader/change.h"
#include "reader/report.h"
#include "tests/reader/change_text.h"
#include "tests/support/file_text.h"

namespace {

constexpr const char* start = "20261114 22:00:03";
constexpr const char* end = "20261114 22:41:55";

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

std::vector<std::string> ChangesOf(const ReportRun& run) {
  std::vector<std::string> texts;
  if (run.Before && run.After) {
    const TextDecoder decoder;
    for (const Change& change :
         CompareSnapshots(*run.Before, *run.After, decoder, ChangeDetail::kList).List) {
      texts.push_back(ChangeText(change));
    }
  }
  return texts;
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
  EXPECT_EQ(Join(run.Messages), "Copying files\n");
  const std::vector<std::string> changes = ChangesOf(run);
  const std::set<std::string> all(changes.begin(), changes.end());
  EXPECT_EQ(changes.size(), 35U) << ::testing::PrintToString(changes);
  for (const char* change :
       {"removed groups global/Domain Users", "removed members global/Domain Users/ana",
        "removed processes UNK_NAME|count 1 > -", "added copies C1",
        "removed services The ORX service|state Paused > -", "added profile C1/Limit|value - > -2",
        "added drivers ZEK ORX ODBC DRIVER",
        "added driver_parameters ZEK ORX ODBC DRIVER/UsageCount|value - > 2",
        "added instance_profile C1/ORX1/A_PARAMETER_NAME_OF_EXACTLY_36_BYTESrun in"}) {
    EXPECT_TRUE(all.contains(change)) << change << ::testing::PrintToString(changes);
  }
}

// A report that was cut off anywhere shows changes that the whole one has, and of the messages no
// more than it has.
void ExpectPartOf(const std::string& cut, const ReportFacts& facts,
                  const std::set<std::string>& changes, const std::string& messages) {
  for (const ReportRun& run : ParseReport(cut, facts)) {
    for (const std::string& change : ChangesOf(run)) {
      ASSERT_TRUE(changes.contains(change)) << cut.size() << ' ' << change;
    }
    ASSERT_TRUE(messages.starts_with(Join(run.Messages))) << cut.size() << Join(run.Messages);
  }
}

TEST(Report, InventsNothingWhereItBreaksOff) {
  const std::string text = Report();
  const std::vector<std::string> changes = ChangesOf(ParseReport(text, Facts())[0]);
  const std::set<std::string> all(changes.begin(), changes.end());
  for (size_t size = 0; size < text.size(); ++size) {
    ExpectPartOf(text.substr(0, size), Facts(), all, "Copying files\n");
  }
}

TEST(Report, ReadsTheLineEndsOfBothSystems) {
  std::string text = Replaced(Report(), "\n", "\r\n");
  UnifyLineEnds(text);
  EXPECT_EQ(text, Report());
}

// Text in place of the message. Whatever it holds, all of it is message, and the event is the same.
TEST(Report, TakesNoMessageForABlock) {
  const std::string text = Report();
  const std::string message = "Copying files\n";
  const size_t place = text.find(message);
  const size_t afterBox = place + message.size();
  const std::vector<std::string> changes = ChangesOf(ParseReport(text, Facts())[0]);
  const std::set<std::string> all(changes.begin(), changes.end());
  const std::string endOfReport = text.substr(afterBox);
  const std::string forgedEnd =
      Replaced(Replaced(endOfReport, end, "20261114 22:30:00"), "Guests", "Forged");
  const std::string withoutServices = Replaced(text.substr(0, place), "Administrators", "Forged");
  for (const std::string& forged :
       {text.substr(0, place), forgedEnd, withoutServices + forgedEnd, Replaced(text, "42", "43"),
        endOfReport.substr(0, endOfReport.size() / 2) + '\n',
        endOfReport.substr(0, endOfReport.find("Result of")),
        forgedEnd.substr(0, forgedEnd.find("ORX Products & Build Level   :")),
        std::string("---------- ORX Installation History Logger ( End ) ----------") + end + '\n',
        std::string(94, '*') + '\n', std::string("\n2) Software Installed on the machine:\n")}) {
    std::string whole = text;
    whole.replace(place, message.size(), forged);
    const std::vector<ReportRun> runs = ParseReport(whole, Facts());
    ASSERT_EQ(runs.size(), 1U) << forged;
    EXPECT_EQ(Join(runs[0].Messages), forged);
    EXPECT_EQ(ChangesOf(runs[0]), changes) << forged;
    EXPECT_EQ(runs[0].Result->Result, "Successful");
    const size_t forgedToo = place + forged.size();
    ExpectPartOf(whole.substr(0, forgedToo), Facts(), all, forged);
    for (size_t size = place; size < whole.size(); size += 7) {
      // A forged snapshot that the cut leaves without its times cannot be told apart.
      if (size > forgedToo) {
        ExpectPartOf(whole.substr(0, size), Facts(), all, forged + endOfReport);
      }
      ReportFacts open = Facts();
      open.EndTime.reset();
      open.MayHaveEnded = false;
      ExpectPartOf(whole.substr(0, size), open, {}, forged + endOfReport);
    }
  }
}

// The start broke off; what looks like its snapshot came later.
TEST(Report, TakesNoLaterBoxForTheFirstSnapshot) {
  const std::string text = Report();
  const size_t box = text.find(std::string(94, '*'));
  for (const std::string& message : {std::string("Copying files\n"), std::string("\n")}) {
    const std::string forged = Replaced(text, "Guests", "Forged").substr(box);
    const std::string whole = text.substr(0, box) + message + forged;
    const std::vector<ReportRun> runs = ParseReport(whole, Facts());
    EXPECT_FALSE(runs[0].Before);
    EXPECT_TRUE(runs[0].After);
    EXPECT_TRUE(Join(runs[0].Messages).starts_with(message + std::string(94, '*')));
  }
}

// A message to an event that has ended, which forges another end.
TEST(Report, KeepsTheEndOfTheHistoryFile) {
  const std::string text = Report();
  const std::string forged =
      Replaced(text.substr(text.find("Copying files\n") + 14), end, "20261114 22:50:00");
  const std::string whole = text + forged;
  const std::vector<ReportRun> runs = ParseReport(whole, Facts());
  EXPECT_EQ(runs[0].Result->EndTime, end);
  EXPECT_EQ(Join(runs[0].Messages), "Copying files\n" + forged);
  // A second end that finds the report moved has changed the time in the history file alone.
  ReportFacts facts = Facts();
  facts.EndTime = "20261114 23:00:00";
  EXPECT_FALSE(ParseReport(text, facts)[0].Result);
  facts.IsPlaced = true;
  EXPECT_EQ(ParseReport(text, facts)[0].Result->EndTime, end);
  EXPECT_FALSE(ParseReport(text + "late\n", facts)[0].Result);
}

TEST(Report, TellsTheRunsOfARepeatedIdentityApart) {
  const std::string first = Replaced(Report(), "20261114", "20261101");
  const size_t message = first.find("Copying files\n");
  for (const size_t size :
       {first.size(), message + 14, message, size_t{3000}, size_t{1000}, size_t{200}}) {
    std::string text = first.substr(0, size);
    text += text.ends_with('\n') ? "" : "\n";
    text += Report();
    const std::vector<ReportRun> runs = ParseReport(text, Facts());
    ASSERT_EQ(runs.size(), 2U) << size;
    EXPECT_EQ(runs[0].IsWhole, size >= message);
    EXPECT_EQ(runs[0].Start->Time, "20261101 22:00:03");
    EXPECT_TRUE(runs[1].IsWhole);
    EXPECT_EQ(ChangesOf(runs[1]).size(), 35U);
    EXPECT_EQ(ChangesOf(runs[0]).size(), size == first.size() ? 35U : 0U);
  }
}

// Messages go on after a start that broke off.
TEST(Report, FindsTheMessagesAfterABrokenSnapshot) {
  const std::string text = Report();
  const size_t place = text.find("Copying files\n");
  const std::string row = "4                  UNK_NAME\n";
  std::string cut = text;
  const size_t broken = cut.find(row) + row.size();
  cut.erase(broken, place - broken);
  const std::vector<ReportRun> runs = ParseReport(cut, Facts());
  EXPECT_FALSE(runs[0].IsWhole);
  EXPECT_EQ(Join(runs[0].Messages), "Copying files\n");
  EXPECT_EQ(runs[0].Result->Result, "Successful");
  const std::vector<std::string> changes = ChangesOf(runs[0]);
  EXPECT_EQ(changes.size(), 4U) << ::testing::PrintToString(changes);  // the users alone
}

}  // namespace
