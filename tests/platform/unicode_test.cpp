#include "platform/unicode.h"

#include <gtest/gtest.h>

#include "platform/ansi_text.h"

namespace tendril::test {
namespace {

TEST(Unicode, Text_ComesBackAndWhatIsNoTextIsReplaced) {
  for (const auto& [utf8, utf16] : {std::pair<std::string, std::u16string>("", u""),
                                    {"a\xC3\xBC\xE2\x82\xACz", u"a\u00FC\u20ACz"},
                                    {"\xF0\x9F\x92\xA1", u"\xD83D\xDCA1"},
                                    {std::string("a\0b", 3), std::u16string(u"a\0b", 3)}}) {
    EXPECT_EQ(Utf16(utf8), utf16) << utf8;
    EXPECT_EQ(Utf8(utf16), utf8) << utf8;
  }
  EXPECT_EQ(Utf16("\x80z\xE2\x82"), u"\xFFFDz\xFFFD\xFFFD");
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
