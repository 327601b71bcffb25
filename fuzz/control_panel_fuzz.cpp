// Input: how the panel behaves, then what a program sends it, in pieces with time between them.
#include <optional>
#include <string>

#include "bench/panel_printer.h"
#include "bench/virtual_control_panel.h"
#include "commlistener/comm_frame.h"
#include "fuzz/fuzz_input.h"
#include "support/simulated_time.h"

namespace tendril::fuzz {
namespace {

// Bytes that may be a frame or not.
void CheckBytes(PanelSide side, const Bytes& bytes) {
  const std::string line = PrintPanelBytes(1, side, bytes);
  Check(std::all_of(line.begin(), line.end(), [](char c) { return c >= ' ' && c < 0x7F; }), "a line is text");
  const std::optional<PanelRequest> frame = ParsePanelFrame(bytes);
  Check(!frame || BuildFrame(frame->identifier, frame->sequence, frame->payload) == bytes,
        "client and panel have the same frames");
}

class Run {
 public:
  explicit Run(Input& input) {
    panel_.AddPort(3);
    const std::size_t behaviour = input.Byte() % (PanelBehaviourKinds().size() + 1);
    proper_ = behaviour == PanelBehaviourKinds().size();
    if (!proper_) panel_.SetBehaviour(PanelBehaviourKinds()[behaviour].behaviour, input.Byte());
    panel_.SetTap([](PanelSide side, std::span<const std::uint8_t> bytes) {
      CheckBytes(side, {bytes.begin(), bytes.end()});
    });
  }
  void Step(Input& input) {
    const std::size_t step = input.Byte();
    if (step == 0) {
      panel_.SetListener(PanelListener::kOff);
      stays_open_ = false;
    } else if (step < 16) {
      time_.Advance(50 * step);
    } else {
      const Bytes piece = input.Take(step - 16);
      CheckBytes(PanelSide::kProgram, piece);
      CheckBytes(PanelSide::kPanel, piece);
      for (const std::uint8_t byte : piece) Expect(byte);
      session_.Receive(piece);
    }
  }
  void End() {
    time_.Advance(60'000);
    if (!proper_) return;
    Check(open_ == stays_open_, "the panel hangs up on who does not speak in frames");
    Check(panel_.requests() == requests_, "every frame is a request, and nothing else is");
    Check(sequences_.empty(), "every request has a reply");
  }

 private:
  void Expect(std::uint8_t byte) {
    if (!stays_open_) return;
    frame_.push_back(byte);
    const bool letter = (byte >= 'A' && byte <= 'Z') || (byte >= 'a' && byte <= 'z');
    const bool digit = byte >= '0' && byte <= '9';
    stays_open_ = frame_.size() > kFrameHeaderSize || (frame_.size() == 1 ? letter : digit);
    const std::optional<PanelRequest> request = ParsePanelFrame(frame_);
    if (!request) return;
    requests_.push_back(*request);
    if (requests_.size() > 1000) requests_.pop_front();
    sequences_.push_back(request->sequence);
    frame_.clear();
  }
  void TakeReply(std::span<const std::uint8_t> bytes) {
    Check(open_, "nothing is sent after the panel hung up");
    if (!proper_) return;
    const std::optional<PanelRequest> reply = ParsePanelFrame(bytes);
    Check(reply && reply->payload.empty() && (reply->identifier == '0' || reply->identifier == '1'),
          "a reply says done or refused");
    Check(!sequences_.empty() && reply->sequence == sequences_.front(), "requests are replied to in order");
    sequences_.pop_front();
  }

  test::SimulatedTime time_;
  VirtualControlPanel panel_{time_};
  bool proper_ = false;
  bool open_ = true;
  bool stays_open_ = true;              // by the protocol
  Bytes frame_;                         // so far
  std::deque<PanelRequest> requests_;   // whole ones, as many as the panel keeps
  std::deque<std::uint8_t> sequences_;  // of the requests without a reply
  PanelSession session_{
      panel_,
      {.send = [this](std::span<const std::uint8_t> bytes) { TakeReply(bytes); },
       .hang_up = [this] { Check(std::exchange(open_, false), "the panel hangs up once"); }}};
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  tendril::fuzz::Input input(bytes, size);
  tendril::fuzz::Run run(input);
  while (!input.empty()) run.Step(input);
  run.End();
  return 0;
}
