#include "platform/ansi_text.h"

#include <algorithm>
#include <array>
#include <cstdint>

#ifdef _WIN32
#include <windows.h>
#endif

namespace tendril {

#ifdef _WIN32

Bytes AnsiBytes(std::u16string_view text) {
  const auto* wide = reinterpret_cast<const wchar_t*>(text.data());
  const int length = static_cast<int>(text.size());
  const int size = WideCharToMultiByte(CP_ACP, 0, wide, length, nullptr, 0, nullptr, nullptr);
  Bytes bytes(static_cast<std::size_t>(size));
  WideCharToMultiByte(CP_ACP, 0, wide, length, reinterpret_cast<char*>(bytes.data()), size, nullptr, nullptr);
  return bytes;
}

std::u16string AnsiText(std::span<const std::uint8_t> bytes) {
  const auto* data = reinterpret_cast<const char*>(bytes.data());
  const int length = static_cast<int>(bytes.size());
  const int size = MultiByteToWideChar(CP_ACP, 0, data, length, nullptr, 0);
  std::u16string text(static_cast<std::size_t>(size), u'\0');
  MultiByteToWideChar(CP_ACP, 0, data, length, reinterpret_cast<wchar_t*>(text.data()), size);
  return text;
}

#else

namespace {

// Windows-1252 from 0x80 to 0x9F; the rest of it is Latin-1. The five bytes that it leaves free stand for the
// control characters of the same number.
constexpr std::array<char16_t, 32> kHighControls{
    0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0x008D, 0x017D, 0x008F, 0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

std::uint8_t AnsiByte(char16_t character) {
  if (character < 0x80 || (character >= 0xA0 && character <= 0xFF))
    return static_cast<std::uint8_t>(character);
  const auto* found = std::find(kHighControls.begin(), kHighControls.end(), character);
  if (found == kHighControls.end()) return '?';
  return static_cast<std::uint8_t>(0x80 + (found - kHighControls.begin()));
}

}  // namespace

Bytes AnsiBytes(std::u16string_view text) {
  Bytes bytes(text.size());
  std::transform(text.begin(), text.end(), bytes.begin(), AnsiByte);
  return bytes;
}

std::u16string AnsiText(std::span<const std::uint8_t> bytes) {
  std::u16string text(bytes.size(), u'\0');
  std::transform(bytes.begin(), bytes.end(), text.begin(), [](std::uint8_t byte) -> char16_t {
    return byte >= 0x80 && byte < 0xA0 ? kHighControls[byte - 0x80U] : byte;
  });
  return text;
}

#endif

}  // namespace tendril
