// Reports read back: whole, cut off, forged and doubled.

#include <gtest/gtest.h>

#include <algorithm>

#include "reader/report.h"
#include "tests/reader/history_text.h"

namespace {

// The golden report and its blocks, in their order.
const std::string report = GoldenReport();
const std::string boxLine(94, '*');
const std::string message = "Copying files\n";
const size_t box = report.find(boxLine);
const size_t afterBefore = report.find(message);
const std::string start = report.substr(0, box);
const std::string before = report.substr(box, afterBefore - box);
const std::string ending = report.substr(afterBefore + message.size());
const std::string changes = Golden("report_changes.txt");

ReportFacts Facts(const char* end = endTime) { return {"42", startTime, end}; }

std::string MessagesOf(const ReportRun& run) {
  std::string text;
  for (const std::string_view piece : run.Messages) {
    text += piece;
  }
  return text;
}

// A line for each; empty for a run that has not both snapshots.
std::string ChangesOf(const ReportRun& run) {
  return run.Before && run.After ? ChangeLines(CompareSnapshots(*run.Before, *run.After,
                                                                TextDecoder(), ChangeDetail::kList))
                                 : "";
}

// The start, the end, the snapshots or the number of changes, and the messages of each run.
std::string RunsText(const std::string& text, const ReportFacts& facts) {
  std::string lines;
  for (const ReportRun& run : ParseReport(text, facts)) {
    lines += run.IsWhole ? "whole" : "broken";
    lines.append(" from ").append(run.Start ? run.Start->Time : "-");
    lines.append(" to ").append(run.Result ? run.Result->EndTime : "-");
    lines += !run.Before ? ", no snapshot before\n"
             : !run.After
                 ? ", no snapshot after\n"
                 : ", " + std::to_string(SortedLines(ChangesOf(run)).size()) + " changes\n";
    lines += MessagesOf(run);
  }
  return lines;
}

const std::string whole =
    "whole from 20261114 22:00:03 to 20261114 22:41:55, 35 changes\nCopying files\n";

TEST(Report, IsReadBackWithTheLineEndsOfBothSystems) {
  for (std::string text : {report, Replaced(report, "\n", "\r\n")}) {
    UnifyLineEnds(text);
    EXPECT_EQ(RunsText(text, Facts()), whole);
    const ReportRun run = ParseReport(text, Facts()).front();
    EXPECT_EQ(run.Start->CommandLine, "setup.exe /gui");
    EXPECT_EQ(run.Computer, "ORXHOST");
    EXPECT_EQ(run.Result->Result, "Successful");
    EXPECT_EQ(ChangesOf(run), changes);
    const Changes counted =
        CompareSnapshots(*run.Before, *run.After, TextDecoder(), ChangeDetail::kCounts);
    EXPECT_TRUE(counted.List.empty() && counted.Differs[static_cast<size_t>(Section::kServices)]);
  }
}

// A report that was cut off anywhere shows changes that the whole one has, and of the messages no
// more than it has.
void ExpectPartOf(const std::string& cut, const ReportFacts& facts, const std::string& allChanges,
                  const std::string& messages) {
  const std::multiset<std::string> all = SortedLines(allChanges);
  for (const ReportRun& run : ParseReport(cut, facts)) {
    const std::multiset<std::string> found = SortedLines(ChangesOf(run));
    ASSERT_TRUE(std::includes(all.begin(), all.end(), found.begin(), found.end()))
        << cut.size() << testing::PrintToString(found);
    ASSERT_TRUE(messages.starts_with(MessagesOf(run))) << cut.size() << MessagesOf(run);
  }
}

TEST(Report, InventsNothingWhereItBreaksOff) {
  for (size_t size = 0; size < report.size(); ++size) {
    ExpectPartOf(report.substr(0, size), Facts(), changes, message);
  }
}

// Text instead of the message. Whatever it has, all of it is message, and the event is the same.
TEST(Report, TakesNoMessageForABlock) {
  ReportFacts open = Facts();
  open.EndTime.reset();
  open.MayHaveEnded = false;
  const std::string forgedEnd =
      Replaced(Replaced(ending, endTime, "20261114 22:30:00"), "Guests", "Forged");
  const std::string forgedReport = Replaced(start + before, "Administrators", "Forged") + forgedEnd;
  for (const std::string& forged :
       {start + before, forgedEnd, forgedReport, Replaced(report, "42", "43"),
        ending.substr(0, ending.size() / 2) + '\n', ending.substr(0, ending.find("Result of")),
        forgedEnd.substr(0, forgedEnd.find("ORX Products & Build Level   :")),
        std::string("---------- ORX Installation History Logger ( End ) ----------") + endTime +
            '\n',
        boxLine + '\n', std::string("\n2) Software Installed on the machine:\n")}) {
    const size_t forgedEndOffset = afterBefore + forged.size();
    const std::string rest = forged + ending;
    const std::string text = report.substr(0, afterBefore) + rest;
    EXPECT_EQ(RunsText(text, Facts()), Replaced(whole, message, forged));
    EXPECT_EQ(ChangesOf(ParseReport(text, Facts())[0]), changes) << forged;
    ExpectPartOf(text.substr(0, forgedEndOffset), Facts(), changes, forged);
    for (size_t size = afterBefore; size < text.size(); size += 7) {
      const std::string cut = text.substr(0, size);
      // A forged snapshot that the cut leaves without its times cannot be distinguished.
      if (size > forgedEndOffset) {
        ExpectPartOf(cut, Facts(), changes, rest);
      }
      ExpectPartOf(cut, open, "", rest);
    }
  }
}

// Rows, and no other line, can be missing from a part.
TEST(Report, IsNotReadWithoutALineOfATable) {
  const Snapshot snapshot = ParseReport(report, Facts()).front().Before.value();
  std::vector<size_t> rows;
  for (size_t part = 0; part < kSnapshotParts; ++part) {
    const std::string text(*snapshot.Parts[part]);
    rows.push_back(0);
    for (size_t begin = 0, end = 0; begin < text.size(); begin = end) {
      end = text.find('\n', begin) + 1;
      const std::string rest = text.substr(0, begin) + text.substr(end);
      rows.back() += ReadItems(rest, part, PaddingOfPart(snapshot, part)) ? 1 : 0;
    }
  }
  EXPECT_EQ(rows, (std::vector<size_t>{14, 4, 2, 11, 9, 0}));
}

// A second end that finds the report moved has changed the time in the history file alone.
TEST(Report, HasTheEndAndTheMessagesThatItsFactsAllow) {
  const std::string broken = "broken from 20261114 22:00:03 to ";
  const std::string withoutEnd = broken + "-, no snapshot after\n";
  const std::string secondEnd = Replaced(ending, endTime, "20261114 22:50:00");
  const std::string row = "4                  UNK_NAME\n";
  const std::string brokenSnapshot = before.substr(0, before.find(row) + row.size());
  ReportFacts later = Facts("20261114 23:00:00");
  ReportFacts placed = later;
  placed.IsPlaced = true;
  const std::tuple<const char*, std::string, ReportFacts, std::string> cases[] = {
      {"an end after the end", report + secondEnd, Facts(), whole + secondEnd},
      {"an end of another time", report, later, withoutEnd + message + ending},
      {"an earlier end", report, placed, whole},
      {"and a message", report + "late\n", placed, withoutEnd + message + ending + "late\n"},
      {"a message before the first snapshot", start + message + before + message + ending, Facts(),
       broken + endTime + ", no snapshot before\n" + message + before + message},
      {"an empty line there", start + "\n" + before + message + ending, Facts(),
       broken + endTime + ", no snapshot before\n\n" + before + message},
      // The changes are those of the users alone.
      {"a broken first snapshot", start + brokenSnapshot + message + ending, Facts(),
       broken + endTime + ", 4 changes\n" + message},
  };
  for (const auto& [what, text, facts, runs] : cases) {
    EXPECT_EQ(RunsText(text, facts), runs) << what;
  }
}

TEST(Report, SeparatesTheRunsOfARepeatedIdentity) {
  const std::string first = Replaced(report, "20261114", "20261101");
  const std::tuple<size_t, std::string> cases[] = {
      {first.size(), Replaced(whole, "20261114", "20261101")},
      {afterBefore + message.size(),
       "whole from 20261101 22:00:03 to -, no snapshot after\n" + message},
      {afterBefore, "whole from 20261101 22:00:03 to -, no snapshot after\n"},
      {3000, "broken from 20261101 22:00:03 to -, no snapshot after\n"},
      {1000, "broken from 20261101 22:00:03 to -, no snapshot after\n"},
      {200, "broken from 20261101 22:00:03 to -, no snapshot before\n"},
  };
  for (const auto& [size, run] : cases) {
    const std::string lines = first.substr(0, first.rfind('\n', size - 1) + 1);
    EXPECT_EQ(RunsText(lines + report, Facts()), run + whole) << size;
  }
}

}  // namespace
