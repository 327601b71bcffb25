#include "serial/reply_parser.h"

#include "serial/packets.h"

namespace tendril {

void ReplyParser::Start(std::uint8_t unit) {
  *this = ReplyParser();
  polled_unit_ = unit;
}

ReplyParser::Verdict ReplyParser::Push(std::uint8_t byte) {
  if (byte == kFrameByte) return PushZero();
  switch (state_) {
    case State::kAwaitZero:
      break;
    case State::kAwaitAddress:
      if (byte == kProgramAddress) {
        reply_expected_ = true;
        state_ = State::kAwaitCode;
      } else if (!reply_expected_ && byte == polled_unit_) {
        state_ = State::kAwaitCode;
      } else {
        state_ = State::kAwaitZero;
      }
      break;
    case State::kAwaitCode:
      code_ = byte;
      data_.clear();
      state_ = State::kInData;
      break;
    case State::kInData:
      if (data_.size() < kMaxData) data_.push_back(byte);
      break;
  }
  return Verdict::kNeedMore;
}

ReplyParser::Verdict ReplyParser::PushZero() {
  const bool in_packet = state_ == State::kAwaitCode || state_ == State::kInData;
  if (in_packet && reply_expected_) {
    state_ = State::kAwaitZero;
    return Verdict::kReplyComplete;
  }
  const bool echo = code_ == kCodePoll;
  if (echo) {
    reply_expected_ = true;
    pads_ = 0;
  } else {
    ++pads_;
  }
  code_ = 0;
  data_.clear();  // of the echo, or of noise: no part of a reply
  state_ = State::kAwaitAddress;
  return echo ? Verdict::kEchoSeen : Verdict::kNeedMore;
}

}  // namespace tendril
