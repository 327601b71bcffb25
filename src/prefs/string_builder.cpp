#include "prefs/string_builder.h"

#include <algorithm>
#include <limits>

#include "platform/runtime_error.h"

namespace tendril {

void StringBuilder::Append(std::u16string_view text) {
  if (text.empty()) return;
  const std::size_t needed = length_ + text.size();
  if (buffer_.size() < needed) {
    constexpr std::size_t kMaxUnits = std::numeric_limits<std::int32_t>::max() / sizeof(char16_t);
    if (needed > kMaxUnits / 2) throw RuntimeError(kErrOverflow, "Overflow");
    buffer_.resize(2 * needed);
  }
  std::copy(text.begin(), text.end(), buffer_.begin() + static_cast<std::ptrdiff_t>(length_));
  length_ = needed;
}

void StringBuilder::Reset() {
  buffer_ = {};
  length_ = 0;
}

std::u16string StringBuilder::ToString() {
  if (IsEmpty()) return {};
  buffer_.resize(length_);
  buffer_.shrink_to_fit();
  return {buffer_.begin(), buffer_.end()};
}

}  // namespace tendril
