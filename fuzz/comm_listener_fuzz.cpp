// Input: what the program, the listener and the time do, step by step (see Do()).
#include <sanitizer/allocator_interface.h>

#include <deque>
#include <memory>
#include <optional>
#include <string>

#include "commlistener/comm_listener_interface.h"
#include "fuzz/fuzz_input.h"
#include "support/simulated_time.h"

namespace tendril::fuzz {
namespace {

std::size_t largest_piece = 0;  // of memory that anybody has asked for

struct FuzzedSocket final : TcpSocket {
  void SetEvents(TcpEvents owner) override { events = std::move(owner); }
  void Connect(const std::string& /*host*/, std::uint16_t /*port*/) override {
    state = TcpState::kConnecting;
  }
  void Close() override { state = TcpState::kClosed; }
  TcpState State() const override { return state; }
  void SetLocalPort(std::uint16_t /*port*/) override {}
  std::uint16_t LocalPort() const override { return 0; }
  void Send(std::span<const std::uint8_t> bytes) override { on_send({bytes.begin(), bytes.end()}); }
  Bytes Receive(std::size_t limit) override {
    if (!waiting.empty()) return std::exchange(waiting, {});  // it never is more than anybody's limit
    const std::size_t taken = std::min(limit, flood);
    flood -= taken;
    return Bytes(taken, 'x');
  }

  TcpEvents events;
  std::function<void(Bytes)> on_send;
  TcpState state = TcpState::kClosed;
  Bytes waiting;
  std::size_t flood = 0;  // bytes that come behind those
};

class Run {
 public:
  Run() {
    socket_.on_send = [this](const Bytes& frame) { TakeRequest(frame); };
    client_.SetEvents(
        {.CommReply =
             [this](const Bytes& payload, std::int32_t /*status*/) {
               Check(payload == payload_, "a reply's payload is told as it came");
               Tell(kAcknowledged);
             },
         .CommError = [this](std::int32_t code, const std::string& /*message*/, std::int32_t /*number*/,
                             const std::string& /*description*/) { Tell(code); },
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
      Arrive(BuildFrame('1', sequence_, {}));
      Check(client_.IsConnected(), "a proper reply keeps the connection");
    }
    CheckState();
    Check(time_.RunningTimers() == 0, "nothing runs while the client is idle");
  }

 private:
  static constexpr std::int32_t kAcknowledged = -1;
  static constexpr std::int32_t kNothing = 0;

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
        return Arrive(input.Take(input.Byte()), std::size_t{1000} * input.Byte());
      case 5:
        return time_.Advance(std::uint64_t{25} * input.Byte());
      case 6:
        return AskForPort(input.Byte(), input.Flag());
      case 7:
        return client_.SendDMXIntensities(1, 2, static_cast<std::int16_t>(127 * input.Byte()), values_);
      case 8:
        if (client_.Closed()) return;
        socket_.Close();
        return socket_.events.ended(10054, "The connection was closed");
      case 9:
        return client_.Reconnect(input.Flag(), "Tendril Utility", input.Flag(), true);
      default:
        reaction_ = input.Byte();
    }
  }
  void Accept() {
    if (client_.TCPState() != TcpState::kConnecting) return;
    socket_.state = TcpState::kConnected;
    arrived_.clear();
    outstanding_ = false;
    socket_.events.connected();
  }
  void Arrive(const Bytes& bytes, std::size_t flood = 0) {
    if (!client_.IsConnected()) return;
    Append(arrived_, bytes);
    arrived_.resize(std::min(arrived_.size() + flood, kMaxFrame), 'x');
    const std::int32_t outcome = Outcome();
    if (outcome != kNothing) {
      arrived_.clear();
      outstanding_ = false;
    }
    told_.clear();
    socket_.waiting = bytes;
    socket_.flood = flood;
    largest_piece = 0;
    socket_.events.data_arrived();
    Check(largest_piece <= 2 * kMaxFrame, "no more is kept of a reply than the largest has");
    Check(told_ == (outcome == kNothing ? std::vector<std::int32_t>() : std::vector{outcome}),
          "what arrives has the outcome that it should have, once");
  }
  // What the bytes that have arrived since the last request come to.
  std::int32_t Outcome() {
    if (arrived_.size() < kFrameHeaderSize) return kNothing;
    std::size_t size = kFrameHeaderSize;
    for (std::size_t i = 2, weight = 10'000; i < kFrameHeaderSize; ++i, weight /= 10) {
      if (arrived_[i] < '0' || arrived_[i] > '9') return kCLIFault;
      size += weight * (arrived_[i] - std::size_t{'0'});
    }
    if (arrived_[1] != sequence_ || (arrived_[0] != '0' && arrived_[0] != '1')) return kCLIBadReply;
    if (arrived_.size() < size) return kNothing;
    payload_ = Input(arrived_.data(), size).TakeAll();
    payload_.erase(payload_.begin(), payload_.begin() + kFrameHeaderSize);
    return arrived_[0] == '1' ? kAcknowledged : kCLIRefused;
  }
  void TakeRequest(const Bytes& frame) {
    Check(client_.IsConnected() && !outstanding_, "one request at a time is outstanding");
    const std::optional<FrameHeader> header = ParseFrameHeader(frame);
    Check(header && frame.size() == kFrameHeaderSize + header->length, "a request is a whole frame");
    if (header->identifier == 'C' && header->length == 2) {
      Check(!ports_.empty() && ports_.front() == Bytes(frame.end() - 2, frame.end()),
            "requests for ports go out in order, each once");
      ports_.pop_front();
    }
    sequence_ = header->sequence;
    outstanding_ = true;
    arrived_.clear();
  }
  void AskForPort(std::uint8_t port, bool give_back) {
    ports_.push_back({port, static_cast<std::uint8_t>(give_back ? 1 : 0)});
    give_back ? client_.RelinquishCommPortControl(port) : client_.RequestCommPortControl(port);
  }
  void Tell(std::int32_t outcome) {
    if (!reacting_) told_.push_back(outcome);
    React();
  }
  // What the owner does when it is told of something.
  void React() {
    const std::optional<int> reaction = std::exchange(reaction_, std::nullopt);
    if (!reaction) return;
    reacting_ = true;
    if (*reaction % 4 == 0) AskForPort(3, true);
    if (*reaction % 4 == 1) client_.Disconnect();
    if (*reaction % 4 == 2) client_.Reconnect(true, "again", true, false);
    if (*reaction % 4 == 3) client_.Connect(false, "again", true, false);
    reacting_ = false;
  }
  void CheckState() {
    const bool idle = client_.IsConnected() && !outstanding_;
    Check(client_.ReadyToTransmit() == idle, "the client is ready unless a request is outstanding");
    Check(!client_.IsConnected() || request_timer_->Enabled() != idle, "a request has its time");
    Check(connect_timer_->Enabled() || client_.TCPState() != TcpState::kConnecting,
          "an attempt has its time");
    Check(!idle || ports_.empty(), "no request waits while the client is idle");
  }

  test::SimulatedTime time_;
  FuzzedSocket socket_;
  std::unique_ptr<Timer> connect_timer_ = time_.CreateTimer([this] { client_.OnConnectTimer(); });
  std::unique_ptr<Timer> reconnect_timer_ = time_.CreateTimer([this] { client_.OnReconnectTimer(); });
  std::unique_ptr<Timer> request_timer_ = time_.CreateTimer([this] { client_.OnRequestTimer(); });
  CommListenerInterface client_;

  const Bytes values_ = Bytes(std::size_t{127} * 255, 7);
  std::deque<Bytes> ports_;      // payloads of requests that have not gone out yet
  std::uint8_t sequence_ = '0';  // of the last request
  bool outstanding_ = false;     // on this connection
  Bytes arrived_;                // since the last request, no more than the largest frame
  Bytes payload_;                // of the reply in there, when it is whole
  std::vector<std::int32_t> told_;
  std::optional<int> reaction_;
  bool reacting_ = false;
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerInitialize(int* /*argc*/, char*** /*argv*/) {
  __sanitizer_install_malloc_and_free_hooks(
      [](const volatile void* /*piece*/, std::size_t size) {
        tendril::fuzz::largest_piece = std::max(tendril::fuzz::largest_piece, size);
      },
      [](const volatile void* /*piece*/) {});
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  tendril::fuzz::Input input(bytes, size);
  tendril::fuzz::Run run;
  while (!input.empty()) run.Step(input);
  run.End();
  return 0;
}
