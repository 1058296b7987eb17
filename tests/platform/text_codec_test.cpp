#include "platform/text_codec.h"

#include <gtest/gtest.h>

namespace {

TEST(TextCodec, ReadsTheSameEncodingsOnBothSystems) {
  const char* cases[][3] = {
      {"CP1252", "\x80 \xFC", "\u20AC \u00FC"},
      {"cp932", "\x95\x5C\\a", "\u8868\\a"},
      {"windows-1250", "\xB9\xB9", "\u0105\u0105"},
      {"ISO-8859-1", "\xFC", "\u00FC"},
      {"iso-8859-15", "\xA4", "\u20AC"},
      {"CP850", "\x81", "\u00FC"},
      {"CP1252", "", ""},
  };
  for (const auto& [encoding, raw, text] : cases) {
    const std::optional<TextCodec> codec = TextCodec::Open(encoding);
    ASSERT_TRUE(codec) << encoding;
    EXPECT_EQ(codec->ToUtf8(raw), text) << encoding;
  }
  for (const char* name : {"", "none", "CP", "CP1252x", "CP99999", "windows-", "-1252"}) {
    EXPECT_FALSE(TextCodec::Open(name)) << name;
  }
}

TEST(TextCodec, ContinuesAfterInvalidBytes) {
  // Half a character at the end, and before a blank.
  const std::optional<TextCodec> codec = TextCodec::Open("CP932");
  ASSERT_TRUE(codec);
  const std::string text = codec->ToUtf8("a\x95");
  EXPECT_TRUE(text.starts_with("a") && text.size() > 1) << text;
  EXPECT_NE(codec->ToUtf8("\xFD z").find(" z"), std::string::npos);
  EXPECT_EQ(codec->ToUtf8("b"), "b");
}

}  // namespace
