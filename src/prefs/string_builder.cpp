#include "prefs/string_builder.h"

#include <algorithm>
#include <limits>

#include "platform/runtime_error.h"

namespace tendril {

void StringBuilder::Append(std::u16string_view text) {
  if (text.empty()) return;
  constexpr std::size_t kMostUnits = std::numeric_limits<std::int32_t>::max() / sizeof(char16_t);
  if (buffer_.size() - length_ < text.size()) {
    if (text.size() > kMostUnits / 2 - std::min(length_, kMostUnits / 2)) {
      throw RuntimeError(kErrOverflow, "Overflow");
    }
    buffer_.resize(2 * (length_ + text.size()));
  }
  std::copy(text.begin(), text.end(), buffer_.begin() + static_cast<std::ptrdiff_t>(length_));
  length_ += text.size();
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
