// VirtualTcpSocket: a client connection to a VirtualControlPanel in the same program.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>

#include "bench/virtual_control_panel.h"
#include "platform/tcp_socket.h"
#include "platform/timer.h"

namespace tendril {

// What it sends reaches the panel at once; its events come one at a time, each a millisecond later. While an
// event is being handled no other comes, not even in an event loop of its own, and the socket must not be
// destroyed.
class VirtualTcpSocket final : public TcpSocket {
 public:
  // The panel listens on 127.0.0.1 at `panel_port`; every other place refuses connections. Panel and timers
  // must outlive the socket.
  VirtualTcpSocket(VirtualControlPanel& panel, std::uint16_t panel_port, TimerFactory& timers);
  ~VirtualTcpSocket() override;

  void SetEvents(TcpEvents events) override { events_ = std::move(events); }
  void Connect(const std::string& host, std::uint16_t port) override;
  void Close() override;
  TcpState State() const override { return state_; }
  void SetLocalPort(std::uint16_t port) override { local_port_ = port; }
  std::uint16_t LocalPort() const override;
  void Send(std::span<const std::uint8_t> bytes) override;
  Bytes Receive(std::size_t limit) override;

 private:
  struct End {
    std::int32_t number = 0;
    std::string description;
  };

  void OnTick();
  std::function<void()> Answer();
  void Post();

  VirtualControlPanel& panel_;
  const std::uint16_t panel_port_;
  TcpEvents events_;
  TcpState state_ = TcpState::kClosed;
  std::uint16_t local_port_ = 0;  // as set
  std::unique_ptr<PanelSession> session_;
  std::deque<std::uint8_t> input_;
  // Events that are due, in this order.
  bool answer_due_ = false;  // the connect is answered
  bool data_due_ = false;
  std::optional<End> end_due_;
  bool reachable_ = false;  // whether the panel is where the program connects to
  std::unique_ptr<Timer> timer_;
};

}  // namespace tendril
