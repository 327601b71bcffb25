// Input: the polled unit, then what the line carries. A complete reply is followed by the next poll.
#include "serial/reply_parser.h"

#include "fuzz/fuzz_input.h"

namespace tendril::fuzz {
namespace {

using Verdict = ReplyParser::Verdict;

// Compares the parser with a slow reading of the line, a packet at a time.
class Run {
 public:
  void Step(Input& input) {
    if (!std::exchange(started_, true)) {
      unit_ = input.Byte();
      return Start();
    }
    const std::uint8_t byte = input.Byte();
    const Verdict verdict = parser_.Push(byte);
    Check(verdict == Read(byte), "parser and slow reading come to the same verdict");
    Check(parser_.pads() == pads_, "every zero byte that ends nothing is a pad");
    Check(parser_.data().size() <= ReplyParser::kMaxData, "no more data is kept than the limit");
    if (verdict != Verdict::kReplyComplete) return;
    Check(parser_.code() == (packet_.size() > 1 ? packet_[1] : 0), "the reply's code is its second byte");
    packet_.erase(packet_.begin(), packet_.begin() + std::min<std::ptrdiff_t>(2, std::ssize(packet_)));
    packet_.resize(std::min(packet_.size(), ReplyParser::kMaxData));
    Check(parser_.data() == packet_, "the reply's data follows the code");
    Start();
  }
  void End() {}

 private:
  void Start() {
    parser_.Start(unit_);
    coming_.clear();
    pads_ = 0;
    in_step_ = echo_seen_ = false;
  }
  Verdict Read(std::uint8_t byte) {
    if (byte != 0) {
      coming_.push_back(byte);
      return Verdict::kNeedMore;
    }
    packet_ = std::exchange(coming_, {});
    if (!std::exchange(in_step_, true)) packet_.clear();  // the rest of one that began earlier
    if (!packet_.empty() && packet_[0] == 0xFE) return Verdict::kReplyComplete;
    if (!echo_seen_ && packet_.size() > 1 && packet_[0] == unit_ && packet_[1] == 0x88) {
      echo_seen_ = true;
      pads_ = 0;
      return Verdict::kEchoSeen;
    }
    ++pads_;
    return Verdict::kNeedMore;
  }

  ReplyParser parser_;
  std::uint8_t unit_ = 0;
  Bytes coming_;
  Bytes packet_;  // the last one
  std::uint32_t pads_ = 0;
  bool started_ = false;
  bool in_step_ = false;
  bool echo_seen_ = false;
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  return tendril::fuzz::RunSteps<tendril::fuzz::Run>({bytes, size});
}
