#include "platform/unicode.h"

#include <gtest/gtest.h>

#include "platform/ansi_text.h"

namespace tendril::test {
namespace {

TEST(Unicode, Text_ComesBackWhateverItsBytesAre) {
  struct Case {
    std::string utf8;
    std::u16string utf16;
  };
  const Case cases[] = {
      {"", u""},
      {"a\xC3\xBC\xE2\x82\xAC", u"a\u00FC\u20AC"},
      {"\xF0\x9F\x92\xA1", u"\xD83D\xDCA1"},
      {"\xED\x95\x9C", u"\xD55C"},  // begins as a surrogate does
      {std::string("a\0b", 3), std::u16string(u"a\0b", 3)},
      // No UTF-8: a byte alone, a character cut off, a surrogate, too long a form, beyond the last character.
      {"\x80z", u"\xDC80z"},
      {"z\xE2\x82", u"z\xDCE2\xDC82"},
      {"\xED\xA0\x80", u"\xDCED\xDCA0\xDC80"},
      {"\xC0\xAF", u"\xDCC0\xDCAF"},
      {"\xF4\x90\x80\x80", u"\xDCF4\xDC90\xDC80\xDC80"},
  };
  for (const Case& text : cases) {
    EXPECT_EQ(Utf16(text.utf8), text.utf16) << text.utf8;
    EXPECT_EQ(Utf8(text.utf16), text.utf8) << text.utf8;
  }
  EXPECT_EQ(Utf8(u"a\xD83D\xDD00z"), "a\xF0\x9F\x94\x80z");
  EXPECT_EQ(Utf8(u"a\xD83D"), "a?");
  EXPECT_EQ(Utf8(u"\xDD00"), "?");  // stands for no byte
  EXPECT_EQ(Utf8(u"\xDCA1\xD83D\xD83D\xDCA1"), "\xA1?\xF0\x9F\x92\xA1");
}

TEST(AnsiText, EveryByte_ComesBack) {
  Bytes bytes;
  for (int byte = 0; byte < 256; ++byte) bytes.push_back(static_cast<std::uint8_t>(byte));
  EXPECT_EQ(AnsiBytes(AnsiText(bytes)), bytes);
  EXPECT_EQ(AnsiText(Bytes{'a', 0x80, 0xFC}), u"a\u20AC\u00FC");
  EXPECT_EQ(AnsiBytes(u"\u4E16"), Bytes{'?'});
}

}  // namespace
}  // namespace tendril::test
