// Input: the polled unit, then what the line carries. A reply that is complete is followed by the next poll.
#include "serial/reply_parser.h"

#include "fuzz/fuzz_input.h"

namespace tendril::fuzz {
namespace {

using Verdict = ReplyParser::Verdict;

// Reads the line a packet at a time, each when its zero byte has come.
struct SlowReading {
  explicit SlowReading(std::uint8_t polled_unit) : unit(polled_unit) {}

  Verdict Push(std::uint8_t byte) {
    if (byte != 0) {
      coming.push_back(byte);
      return Verdict::kNeedMore;
    }
    packet = std::exchange(coming, {});
    if (!std::exchange(in_step, true)) packet.clear();  // the rest of one that began earlier
    if (!packet.empty() && packet[0] == 0xFE) return Verdict::kReplyComplete;
    if (!reply_expected && packet.size() > 1 && packet[0] == unit && packet[1] == 0x88) {
      reply_expected = true;
      pads = 0;
      return Verdict::kEchoSeen;
    }
    ++pads;
    return Verdict::kNeedMore;
  }

  std::uint8_t unit;
  Bytes coming;
  Bytes packet;  // the last one
  std::uint32_t pads = 0;
  bool in_step = false;
  bool reply_expected = false;
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  using namespace tendril;
  using namespace tendril::fuzz;
  Input input(bytes, size);
  const std::uint8_t unit = input.Byte();
  ReplyParser parser;
  parser.Start(unit);
  SlowReading reading(unit);
  for (const std::uint8_t byte : input.TakeAll()) {
    const Verdict verdict = parser.Push(byte);
    Check(verdict == reading.Push(byte), "parser and slow reading come to the same verdict");
    Check(parser.pads() == reading.pads, "every zero byte that ends nothing is a pad");
    Check(parser.data().size() <= ReplyParser::kMaxData, "no more data is kept than the limit says");
    if (verdict != Verdict::kReplyComplete) continue;

    Bytes& data = reading.packet;
    Check(parser.code() == (data.size() > 1 ? data[1] : 0), "the reply's code is its second byte");
    data.erase(data.begin(), data.begin() + std::min<std::ptrdiff_t>(2, std::ssize(data)));
    data.resize(std::min(data.size(), ReplyParser::kMaxData));
    Check(parser.data() == data, "the reply's data is what follows the code");
    parser.Start(unit);
    reading = SlowReading(unit);
  }
  return 0;
}
