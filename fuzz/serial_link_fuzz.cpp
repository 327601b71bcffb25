// Input: what the program, the line and the port do, step by step (see Do()).
#include "fuzz/fuzz_input.h"
#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "serial/packets.h"
#include "support/memory_log.h"
#include "support/recording_device.h"
#include "support/simulated_time.h"
#include "trace/line_trace.h"
#include "trace/line_verdict.h"

namespace tendril::fuzz {
namespace {

// 238 bytes at 19200 baud, twice, and what slow kinds have besides.
constexpr std::uint32_t kMaxPollMs = 498;

class Run {
 public:
  Run() {
    link_.SetPollReplyHandler([this](bool success, std::uint8_t unit, std::uint8_t /*code*/, Bytes& data) {
      Check(std::exchange(reply_due_, false) && unit == unit_,
            "a poll has one reply, with the unit that was polled");
      Check(data.size() <= ReplyParser::kMaxData, "a reply has no more data than the limit");
      if (on_line_) CheckTrace(success);
      if (std::exchange(polls_again_, false)) Try([&] { Poll(unit, 'n'); });
    });
    link_.SetPortHandler([this](bool open) { on_line_ = on_line_ && open; });
    link_.SetLineObserver([this](const LineEvent& event) { trace_.Note(event, time_.NowMs()); });
    link_.SetCommPort(1);
    link_.SetBaudRate(19200);
  }

  void Step(Input& input) {
    Try([&] { Do(input); });
    CheckState();
  }
  // What is under way ends by itself.
  void End() {
    polls_again_ = false;
    time_.Advance(kMaxPollMs);
    CheckState();
    Check(!Outstanding(), "a poll ends in time");
  }

 private:
  template <typename Action>
  void Try(const Action& action) {
    try {
      action();
    } catch (const RuntimeError&) {
      Check(device_.open_failure || link_.CommPort() == 0, "only a port that cannot be opened is a failure");
    }
  }
  void Do(Input& input) {
    switch (input.Byte() % 16) {
      case 0:
        return Poll(input.Byte(), input.Byte());
      case 1:
        return Arrive(echo_);
      case 2:
        return Arrive(input.Take(input.Byte()));
      case 3:
        return Arrive(input.Take(input.Byte()), false);
      case 4:
        return Arrive(Bytes(std::size_t{50} * input.Byte(), input.Byte()));
      case 5:
        return time_.Advance(std::uint64_t{4} * input.Byte());
      case 6:
        return link_.cmdSetIntensity(static_cast<std::uint8_t>(input.Byte() | 1), input.Byte(), 50);
      case 7:
        if (device_.open) device_.Raise(SerialEvent::kReceiveOverflow);
        return;
      case 8:
        if (std::exchange(device_.open, false)) device_.Raise(SerialEvent::kDeviceLost);
        return;
      case 9:
        return link_.SetPortOpen(input.Flag());
      case 10:
        return link_.SetCommPort(static_cast<std::int16_t>(input.Byte() % 3));
      case 11:
        return link_.SetBaudRate(input.Flag() ? 115200 : 19200);
      case 12:
        return link_.SetPollPad(input.Byte());
      case 13:
        device_.open_failure.reset();
        if (input.Flag()) device_.open_failure = RuntimeError(kErrInvalidPort, "No such port");
        return;
      default:
        polls_again_ = true;
    }
  }
  void Poll(std::uint8_t unit, std::uint8_t kind) {
    const bool outstanding = Outstanding();
    const bool accepted = link_.cmdPollStation(unit, kind);
    Check(accepted == (unit != 0 && !outstanding),
          "a poll is refused for unit 0 and while one is outstanding");
    if (!accepted) return;
    echo_ = PollPacket(unit, kind, link_.PollPad());
    unit_ = unit;
    on_line_ = true;
    reply_due_ = kind != 202 && kind != 203;
  }
  void Arrive(const Bytes& bytes, bool report = true) {
    if (device_.open) device_.Receive(bytes, report);
  }
  void CheckTrace(bool success) const {
    Check(!trace_.Polls().empty() && trace_.Polls().back().unit == unit_, "the trace knows the poll");
    const PollSeen& poll = trace_.Polls().back();
    // Kind 100 takes some replies only.
    Check(poll.kind == 100 || poll.replied == success, "the trace and the link agree on replies");
  }
  // The only timer is that of a poll.
  bool Outstanding() const { return time_.RunningTimers() > 0; }
  void CheckState() const {
    const bool waits = Outstanding() && on_line_;
    Check(!reply_due_ || Outstanding(), "a poll has one reply");
    Check(link_.PortOpen() == device_.open, "the link knows whether its port is open");
    Check(!device_.open || waits || device_.rts, "RTS is asserted whenever no poll is out");
    Check(!device_.open || device_.receive_threshold == (waits ? 1 : 4000),
          "bytes are reported while a poll is out");
    Check(trace_.Entries().size() <= LineTrace::kMaxEntries && !JudgeLine(trace_).sentence.empty(),
          "the trace has its limits and a verdict");
  }

  test::SimulatedTime time_{0xFFFF'FE00};  // soon wraps
  test::RecordingDevice device_;
  test::MemoryLog log_;
  LineTrace trace_;
  HwSerial link_{device_, time_, time_, log_};
  Bytes echo_;  // of the last poll
  std::uint8_t unit_ = 0;
  bool on_line_ = false;  // the line of the last poll has not been closed since
  bool reply_due_ = false;
  bool polls_again_ = false;
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  return tendril::fuzz::RunSteps<tendril::fuzz::Run>({bytes, size});
}
