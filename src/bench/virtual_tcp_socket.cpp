#include "bench/virtual_tcp_socket.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace tendril {
namespace {

constexpr char kPanelHost[] = "127.0.0.1";
constexpr std::uint16_t kChosenPort = 49152;  // what a system chooses
constexpr std::int32_t kEventDelayMs = 1;     // the least that a timer can wait

}  // namespace

VirtualTcpSocket::VirtualTcpSocket(VirtualControlPanel& panel, std::uint16_t panel_port, TimerFactory& timers)
    : panel_(panel), panel_port_(panel_port), timer_(timers.CreateTimer([this] { OnTick(); })) {
  timer_->SetInterval(kEventDelayMs);
}

VirtualTcpSocket::~VirtualTcpSocket() = default;

void VirtualTcpSocket::Connect(const std::string& host, std::uint16_t port) {
  Close();
  state_ = TcpState::kConnecting;
  reachable_ = host == kPanelHost && port == panel_port_;
  answer_due_ = true;
  Post();
}

void VirtualTcpSocket::Close() {
  state_ = TcpState::kClosed;
  session_.reset();
  input_.clear();
  answer_due_ = data_due_ = false;
  end_due_.reset();
  timer_->SetEnabled(false);
}

std::uint16_t VirtualTcpSocket::LocalPort() const {
  return state_ == TcpState::kConnected && local_port_ == 0 ? kChosenPort : local_port_;
}

void VirtualTcpSocket::Send(std::span<const std::uint8_t> bytes) {
  if (state_ == TcpState::kConnected) session_->Receive(bytes);
}

Bytes VirtualTcpSocket::Receive(std::size_t limit) {
  const auto taken = static_cast<std::ptrdiff_t>(std::min(limit, input_.size()));
  Bytes bytes(input_.begin(), input_.begin() + taken);
  input_.erase(input_.begin(), input_.begin() + taken);
  return bytes;
}

void VirtualTcpSocket::OnTick() {
  timer_->SetEnabled(false);
  std::function<void()> event;
  if (std::exchange(answer_due_, false)) {
    event = Answer();
  } else if (std::exchange(data_due_, false)) {
    event = events_.data_arrived;
  } else if (end_due_) {
    event = [ended = events_.ended, end = *end_due_] {
      if (ended) ended(end.number, end.description);
    };
    Close();
  }
  if (data_due_ || end_due_) Post();
  if (event) event();
}

// What the panel makes of the attempt to connect.
std::function<void()> VirtualTcpSocket::Answer() {
  const PanelListener listener = reachable_ ? panel_.listener() : PanelListener::kOff;
  if (listener == PanelListener::kStuck) return {};
  if (listener == PanelListener::kOff) {
    end_due_ = {kConnectionRefused, "Connection refused"};
    return {};
  }
  session_ = std::make_unique<PanelSession>(
      panel_, PanelConnection{.send =
                                  [this](std::span<const std::uint8_t> bytes) {
                                    input_.insert(input_.end(), bytes.begin(), bytes.end());
                                    data_due_ = true;
                                    Post();
                                  },
                              .hang_up =
                                  [this] {
                                    end_due_ = {kConnectionReset, "The connection was closed"};
                                    Post();
                                  }});
  state_ = TcpState::kConnected;
  return events_.connected;
}

void VirtualTcpSocket::Post() {
  if (!timer_->Enabled()) timer_->SetEnabled(true);
}

}  // namespace tendril
