#include "platform/unicode.h"

#include <algorithm>
#include <cwchar>
#include <locale>

namespace tendril {
namespace {

using Codec = std::codecvt<char16_t, char8_t, std::mbstate_t>;

constexpr char16_t kByteMark = 0xDC00;  // what a stray byte is added to; such a byte is at least 0x80

bool StandsForByte(char16_t unit) { return unit >= kByteMark + 0x80 && unit <= kByteMark + 0xFF; }

// Where the next surrogate is written out as a character would be, which is no UTF-8. The codec passes it.
const char8_t* FindSurrogate(const char8_t* from, const char8_t* end) {
  return std::adjacent_find(from, end,
                            [](char8_t lead, char8_t next) { return lead == 0xED && next >= 0xA0; });
}

}  // namespace

std::u16string Utf16(std::string_view utf8) {
  const auto& codec = std::use_facet<Codec>(std::locale::classic());
  const std::u8string bytes(utf8.begin(), utf8.end());
  std::u16string text(bytes.size(), u'\0');  // no code point takes more units than bytes
  const char8_t* from = bytes.data();
  const char8_t* const end = from + bytes.size();
  char16_t* to = text.data();
  char16_t* const limit = to + text.size();
  const char8_t* surrogate = FindSurrogate(from, end);
  while (from != end) {
    if (from > surrogate) surrogate = FindSurrogate(from, end);
    std::mbstate_t state{};
    codec.in(state, from, surrogate, from, to, limit, to);
    if (from != end) *to++ = static_cast<char16_t>(kByteMark + *from++);
  }
  text.resize(static_cast<std::size_t>(to - text.data()));
  return text;
}

std::string Utf8(std::u16string_view text) {
  const auto& codec = std::use_facet<Codec>(std::locale::classic());
  constexpr std::size_t kMostBytesPerUnit = 3;
  std::u8string bytes(kMostBytesPerUnit * text.size(), u8'\0');
  const char16_t* from = text.data();
  const char16_t* const end = from + text.size();
  char8_t* to = bytes.data();
  char8_t* const limit = to + bytes.size();
  while (from != end) {
    std::mbstate_t state{};
    codec.out(state, from, end, from, to, limit, to);
    if (from == end) break;
    *to++ = StandsForByte(*from) ? static_cast<char8_t>(*from - kByteMark) : u8'?';
    ++from;
  }
  return {bytes.data(), to};
}

Bytes Utf16Bytes(std::u16string_view text) {
  Bytes bytes;
  bytes.reserve(2 * text.size());
  for (const char16_t unit : text) {
    bytes.push_back(static_cast<std::uint8_t>(unit & 0xFF));
    bytes.push_back(static_cast<std::uint8_t>(unit >> 8));
  }
  return bytes;
}

std::u16string Utf16Text(std::span<const std::uint8_t> bytes) {
  std::u16string text(bytes.size() / 2, u'\0');
  for (std::size_t i = 0; i < text.size(); ++i) {
    text[i] = static_cast<char16_t>(bytes[2 * i] | bytes[2 * i + 1] << 8);
  }
  return text;
}

}  // namespace tendril
