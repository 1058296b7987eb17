// The texts that the commands print.

#include "reader/views.h"

#include <gtest/gtest.h>

#include <tuple>

#include "reader/event_text.h"
#include "reader/text_encoding.h"

namespace {

TEST(Views, RoundDurations) {
  std::string texts;
  for (const LocalTime seconds :
       {0, 59, 60, 89, 90, 3569, 3570, 7500, 86369, 86370, 4 * 86400 - 1, -1}) {
    Event event;
    event.Started = 1'000'000;
    event.Ended = *event.Started + seconds;
    texts += DurationOf(event) + '|';
  }
  EXPECT_EQ(
      texts,
      "0 s|59 s|1 min|1 min|2 min|59 min|1 h 00 min|2 h 05 min|23 h 59 min|1 d 00 h|4 d 00 h||");
}

TEST(Views, CutTextToColumns) {
  const std::tuple<const char*, size_t, const char*> cases[] = {
      {"abcd", 4, "abcd"},    {"abcde", 4, "abc…"}, {"表示表", 6, "表示表"},
      {"表示表", 5, "表示…"}, {"表示表", 4, "表…"}, {"e\u0301e\u0301e", 2, "e\u0301…"},
      {"ab", 0, "…"},
  };
  for (const auto& [text, columns, cut] : cases) {
    EXPECT_EQ(CutTo(text, columns), cut) << text << columns;
  }
}

// The widest columns with free text are cut, but none to fewer than eight columns.
TEST(Views, FitAListIntoTheTerminal) {
  Event event;
  event.Identity = "1007 of the first machine";
  event.Action = "Upgrade";
  event.Product = "ORX Server Build 1960";
  event.Copy = "Production";
  const std::string begin = "\n-                  open   Upgrade  ";
  for (const auto& [width, rest] :
       {std::pair(80, "ORX Server…  Production  -        1007 of th…\n"),
        std::pair(20, "ORX Ser…  Product…  -        1007 of…\n")}) {
    const std::string text = ListText({&event}, {static_cast<size_t>(width)});
    EXPECT_NE(text.find(begin + rest), text.npos) << text;
  }
}

TEST(Views, KnowWellFormedUtf8) {
  for (const char* text : {"", "a\x7F", "\xC2\x80", "\xDF\xBF", "\xE0\xA0\x80", "\xED\x9F\xBF",
                           "\xEF\xBF\xBF", "\xF0\x90\x80\x80", "\xF4\x8F\xBF\xBF"}) {
    EXPECT_TRUE(IsUtf8(text)) << text;
  }
  for (const char* text :
       {"\x80", "\xC1\xBF", "\xC2", "\xC2z", "\xE0\x9F\xBF", "\xED\xA0\x80", "\xE2\x82",
        "\xE2\x82z", "\xF0\x8F\xBF\xBF", "\xF0\x90\x80", "\xF4\x90\x80\x80", "\xF5\x80\x80\x80"}) {
    EXPECT_FALSE(IsUtf8(text)) << text;
  }
}

}  // namespace
