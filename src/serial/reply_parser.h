// ReplyParser: finds a unit's reply in what the line carries after a poll.
//
//   00 | unit | 88 | kind | pads | 00     the poll itself, as the adapter echoes it
//   00 ...                                pads, while the unit gets ready
//   FE | code | data ... | 00             the reply
#pragma once

#include <cstddef>
#include <cstdint>

#include "platform/bytes.h"

namespace tendril {

// Takes one byte at a time. It belongs to one poll after another: Start() begins each.
//
//   AwaitAddress --FE, or the polled unit until the echo is over--> AwaitCode --any--> InData
//   AwaitAddress --any other--> AwaitZero
//   AwaitCode, InData --00 once the reply is expected--> the reply is complete
//   any state --00 otherwise--> AwaitAddress (the end of the echo, a pad, or noise)
class ReplyParser {
 public:
  enum class Verdict { kNeedMore, kEchoSeen, kReplyComplete };

  // Data bytes of a reply that are kept: what the input buffer holds. Further ones are dropped.
  static constexpr std::size_t kMaxData = 4050;

  // Begins listening for the reply of `unit`.
  void Start(std::uint8_t unit);

  // kEchoSeen: the poll's own echo has ended, the line is to be released now. kReplyComplete: code() and
  // data() are the reply; feed no more bytes before the next Start().
  Verdict Push(std::uint8_t byte);

  // The reply's first byte, and what follows it; so far, until the reply is complete.
  std::uint8_t code() const { return code_; }
  const Bytes& data() const { return data_; }
  // Zero bytes since the echo ended, or since Start() while it has not.
  std::uint32_t pads() const { return pads_; }
  // Counts the pads from 0 again.
  void ResetPads() { pads_ = 0; }

 private:
  enum class State { kAwaitZero, kAwaitAddress, kAwaitCode, kInData };

  Verdict PushZero();

  State state_ = State::kAwaitZero;
  std::uint8_t polled_unit_ = 0;
  // The echo is over, or a reply has begun without one. From then on the unit's own ID is no address.
  bool reply_expected_ = false;
  std::uint8_t code_ = 0;
  Bytes data_;
  std::uint32_t pads_ = 0;
};

}  // namespace tendril
