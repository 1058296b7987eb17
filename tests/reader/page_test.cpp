#include "reader/page.h"

#include <gtest/gtest.h>

#include <sstream>

#include "reader/html.h"
#include "reader/time_axis.h"
#include "reader/time_line.h"
#include "tests/support/file_text.h"

TEST(Page, ShowsMarkupAndHiddenCharactersAsText) {
  const std::pair<const char*, const char*> cases[] = {
      {"a&<>\"'b", "a&amp;&lt;&gt;&quot;&#39;b"},
      {"tab\tbell\x07", "tab[U+0009]bell[U+0007]"},
      {"\x7F\xC2\x9F\xC2\xA0", "[U+007F][U+009F]\xC2\xA0"},
      {"\xE2\x80\xAE"
       "exe\xE2\x81\xA6\xE2\x82\xAC",
       "[U+202E]exe[U+2066]\xE2\x82\xAC"},
      {"\xE2\x80\x8B\xE2\x80\x8F\xE2\x80\x90", "[U+200B][U+200F]\xE2\x80\x90"},
      {"\xF3\xA0\x80\x81\xF0\x9F\x98\x80", "[U+E0001]\xF0\x9F\x98\x80"},
  };
  for (const auto& [text, html] : cases) {
    EXPECT_EQ(EscapeHtml(text), html);
  }
}

TEST(Page, TicksAreRoundAndFew) {
  constexpr LocalTime begin = 1771000003;  // 2026-02-13 16:26:43
  const std::tuple<LocalTime, size_t, const char*, const char*> cases[] = {
      {0, 1, "02-13 16:26", "02-13 16:26"},
      {100, 2, "02-13 16:27", "02-13 16:28"},
      {3600, 4, "02-13 16:30", "02-13 17:15"},
      {86400, 8, "02-13 18:00", "02-14 15:00"},
      {40 * 86400, 5, "2026-02-19", "2026-03-19"},
      {400 * 86400, 7, "2026-03-01", "2027-03-01"},
      {2000 * 86400, 5, "2027-01-01", "2031-01-01"},
      {20LL * 366 * 86400, 4, "2030-01-01", "2045-01-01"},
  };
  for (const auto& [range, count, first, last] : cases) {
    const std::vector<TimeTick> ticks = TicksBetween(begin, begin + range);
    ASSERT_EQ(ticks.size(), count) << range;
    EXPECT_EQ(ticks.front().Label, first);
    EXPECT_EQ(ticks.back().Label, last);
  }
}

// Counted by a character that each occurrence gets.
static size_t Count(const std::string& text, const std::string& part) {
  return Replaced(text, part, part + '#').size() - text.size();
}

TEST(Page, BarsThatWouldOverlapShareALaneInRows) {
  const TimeLineBar bar = {"Prod", "1", "title", "#event-1", "ok", "x", 0, 10};
  TimeLineBar later = bar;
  later.Begin = later.End = 100000;
  TimeLineBar other = bar;
  other.Lane = "Test <2>";
  std::ostringstream drawn;
  DrawTimeLine({bar, bar, later, other}, drawn);
  const std::string svg = drawn.str();
  EXPECT_EQ(Count(svg, "class=\"lane\""), 2U);
  EXPECT_EQ(Count(svg, "class=\"bar ok\""), 4U);
  EXPECT_EQ(Count(svg, "y=\"32\" width=\"18\""), 2U) << svg;  // the first and the later one
  EXPECT_EQ(Count(svg, "y=\"54\" width=\"18\""), 1U) << svg;  // the second, below the first
  EXPECT_NE(svg.find("Test &lt;2&gt;"), svg.npos);
}

TEST(Page, KeepsEventsOfOneNameApartAndUnchangedFromNotKnown) {
  History history;
  history.Events.resize(2);
  for (Event& event : history.Events) {
    event.Identity = "<7>";
  }
  history.Events[0].Messages = std::string(5000, 'm') + '\n';
  history.Events[0].HasBefore = history.Events[0].HasAfter = true;
  history.Events[0].Differences.Compared.fill(true);
  // A change that a limit leaves out of the list.
  history.Events[0].Differences.Differs[static_cast<size_t>(Section::kUser)] = true;
  FindingList findings;
  findings.Add({FindingLevel::kNote, "damaged", "<7>", "cut"});
  std::ostringstream written;
  WritePage(history, findings, written);
  const std::string page = written.str();
  EXPECT_EQ(Count(page, "href=\"#event-2\""), 1U);
  EXPECT_EQ(Count(page, "Unchanged: groups"), 1U);
  EXPECT_EQ(Count(page, "Not known, as a snapshot is missing or not whole: user"), 1U);
  EXPECT_EQ(Count(page, "event <bdi>&lt;7&gt;</bdi>: <bdi>cut</bdi>"), 1U);
  EXPECT_EQ(page.find("<7>"), page.npos);
  EXPECT_EQ(Count(page, std::string(4000, 'm') + "\u2026"), 1U);
  EXPECT_EQ(Count(page, std::string(4001, 'm')), 0U);
}
