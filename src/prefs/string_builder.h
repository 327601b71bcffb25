// StringBuilder: text that grows by appending, without copying the whole of it each time.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace tendril {

// Holds text as 16-bit code units, two bytes each, in memory order. Capacity and length count bytes.
class StringBuilder {
 public:
  // Appends `text`. Where the capacity does not suffice it becomes twice the new length. Raises
  // RuntimeError(kErrOverflow), with nothing appended, where that is beyond 32 bits.
  void Append(std::u16string_view text);

  bool IsEmpty() const { return length_ == 0; }
  // Frees the buffer: capacity and length are 0.
  void Reset();
  // The text so far. Shrinks the buffer to exactly its length as a side effect, unless it is empty.
  std::u16string ToString();

  std::int32_t capacity() const { return Bytes(buffer_.size()); }
  std::int32_t length() const { return Bytes(length_); }

 private:
  static std::int32_t Bytes(std::size_t units) { return static_cast<std::int32_t>(units * sizeof(char16_t)); }

  std::vector<char16_t> buffer_;  // its size is the capacity
  std::size_t length_ = 0;        // in code units, at most buffer_.size()
};

}  // namespace tendril
