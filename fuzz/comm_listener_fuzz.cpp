// Input: what the program, the listener and the time do, step by step (see Do()).
#include <sanitizer/allocator_interface.h>

#include <memory>
#include <optional>

#include "commlistener/comm_listener_interface.h"
#include "fuzz/fuzz_input.h"
#include "support/scripted_socket.h"
#include "support/simulated_time.h"

namespace tendril::fuzz {
namespace {

std::size_t max_allocation = 0;  // since the last arrival

class Run {
 public:
  Run() {
    client_.SetEvents(
        {.CommReply = [this](const Bytes&, std::int32_t) { React(); },
         .CommError = [this](std::int32_t, const std::string&, std::int32_t, const std::string&) { React(); },
         .CommConnected = [this] { React(); },
         .CommClosed = [this] { React(); },
         .CommStateChanged = [this] { React(); }});
    client_.InitializeControls(&socket_, connect_timer_.get(), reconnect_timer_.get(), request_timer_.get());
    client_.Connect(false, "Tendril Utility", false, true);
  }

  void Step(Input& input) {
    Do(input);
    CheckState();
  }
  // Whatever came before, a proper listener gets all that was asked for.
  void End() {
    reaction_.reset();
    client_.Reconnect(false, "Tendril Utility", false, true);
    Accept();
    while (!client_.ReadyToTransmit()) {
      CheckState();
      Arrive(BuildFrame('1', sequence_, {}));
      Check(client_.IsConnected(), "a proper reply keeps the connection");
    }
    Check(time_.RunningTimers() == 0, "no timer runs while the client is idle");
  }

 private:
  void Do(Input& input) {
    switch (input.Byte() % 11) {
      case 0:
        return Accept();
      case 1:
        return Arrive(BuildFrame('1', sequence_, input.Take(input.Byte())));
      case 2:
        return Arrive(BuildFrame(input.Byte(), input.Flag() ? 'x' : sequence_, input.Take(input.Byte())));
      case 3:
        return Arrive(input.Take(input.Byte()));
      case 4:
        return Arrive(Bytes(std::size_t{1000} * input.Byte(), 'x'));
      case 5:
        return time_.Advance(std::uint64_t{25} * input.Byte());
      case 6:
        return client_.RelinquishCommPortControl(input.Byte());
      case 7:
        return client_.SendDMXIntensities(1, 2, static_cast<std::int16_t>(127 * input.Byte()), values_);
      case 8:
        return client_.Closed() ? void() : socket_.End(10054, "The connection was closed");
      case 9:
        return client_.Reconnect(input.Flag(), "Tendril Utility", input.Flag(), true);
      default:
        reaction_ = input.Byte();
    }
  }
  void Accept() {
    if (client_.TCPState() == TcpState::kConnecting) socket_.Accept();
  }
  void Arrive(const Bytes& bytes) {
    if (!client_.IsConnected()) return;
    max_allocation = 0;
    socket_.Deliver(bytes);
    Check(max_allocation <= 2 * std::max(kMaxFrame, bytes.size()), "the input buffer is limited");
  }
  // What the owner does in an event.
  void React() {
    const std::optional<int> reaction = std::exchange(reaction_, std::nullopt);
    if (!reaction) return;
    if (*reaction % 4 == 0) client_.RelinquishCommPortControl(3);
    if (*reaction % 4 == 1) client_.Disconnect();
    if (*reaction % 4 == 2) client_.Reconnect(true, "again", true, false);
    if (*reaction % 4 == 3) client_.Connect(false, "again", true, false);
  }
  void CheckState() {
    for (const Bytes& frame : socket_.Take()) {
      const std::optional<FrameHeader> header = ParseFrameHeader(frame);
      Check(header && frame.size() == kFrameHeaderSize + header->length, "a request is a whole frame");
      sequence_ = header->sequence;
    }
    const bool busy = client_.IsConnected() && !client_.ReadyToTransmit();
    Check(!client_.IsConnected() || request_timer_->Enabled() == busy, "a request has its time-out");
    Check(connect_timer_->Enabled() || client_.TCPState() != TcpState::kConnecting,
          "an attempt has its time-out");
  }

  test::SimulatedTime time_;
  test::ScriptedSocket socket_;
  std::unique_ptr<Timer> connect_timer_ = time_.CreateTimer([this] { client_.OnConnectTimer(); });
  std::unique_ptr<Timer> reconnect_timer_ = time_.CreateTimer([this] { client_.OnReconnectTimer(); });
  std::unique_ptr<Timer> request_timer_ = time_.CreateTimer([this] { client_.OnRequestTimer(); });
  CommListenerInterface client_;
  const Bytes values_ = Bytes(std::size_t{127} * 255, 7);
  std::uint8_t sequence_ = '0';  // of the last request
  std::optional<int> reaction_;
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerInitialize(int* /*argc*/, char*** /*argv*/) {
  __sanitizer_install_malloc_and_free_hooks(
      [](const volatile void* /*piece*/, std::size_t size) {
        tendril::fuzz::max_allocation = std::max(tendril::fuzz::max_allocation, size);
      },
      [](const volatile void* /*piece*/) {});
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  return tendril::fuzz::RunSteps<tendril::fuzz::Run>({bytes, size});
}
