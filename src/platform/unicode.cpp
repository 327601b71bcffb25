#include "platform/unicode.h"

#include <cwchar>
#include <locale>

namespace tendril {
namespace {

using Codec = std::codecvt<char16_t, char8_t, std::mbstate_t>;

}  // namespace

std::u16string Utf16(std::string_view utf8) {
  const auto& codec = std::use_facet<Codec>(std::locale::classic());
  const std::u8string bytes(utf8.begin(), utf8.end());
  std::u16string text(bytes.size(), u'\0');  // no character takes more units than bytes
  const char8_t* from = bytes.data();
  const char8_t* const end = from + bytes.size();
  char16_t* to = text.data();
  while (from != end) {
    std::mbstate_t state{};
    codec.in(state, from, end, from, to, text.data() + text.size(), to);
    if (from == end) break;
    *to++ = u'\xFFFD';
    ++from;
  }
  text.resize(static_cast<std::size_t>(to - text.data()));
  return text;
}

std::string Utf8(std::u16string_view text) {
  constexpr std::size_t kMaxBytesPerUnit = 3;
  std::u8string bytes(kMaxBytesPerUnit * text.size(), u8'\0');
  std::mbstate_t state{};
  const char16_t* from = nullptr;
  char8_t* to = nullptr;
  std::use_facet<Codec>(std::locale::classic())
      .out(state, text.data(), text.data() + text.size(), from, bytes.data(), bytes.data() + bytes.size(),
           to);
  return {bytes.data(), to};
}

}  // namespace tendril
