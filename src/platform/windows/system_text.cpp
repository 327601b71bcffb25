#include "platform/windows/system_text.h"

#include <windows.h>

#include <array>
#include <string_view>

#include "platform/windows/wide_text.h"

namespace tendril {

std::string SystemText(std::uint32_t error) {
  // The last: no line breaks but those that the text itself has.
  constexpr DWORD kHow =
      FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS | FORMAT_MESSAGE_MAX_WIDTH_MASK;
  std::array<wchar_t, 512> buffer;
  const DWORD size =
      FormatMessageW(kHow, nullptr, error, 0, buffer.data(), static_cast<DWORD>(buffer.size()), nullptr);
  std::wstring_view text(buffer.data(), size);
  constexpr std::wstring_view kEnd = L" .\r\n\u3002";  // the last is a Japanese or Chinese stop
  text = text.substr(0, text.find_last_not_of(kEnd) + 1);
  return text.empty() ? "error " + std::to_string(error) : NarrowText(text);
}

}  // namespace tendril
