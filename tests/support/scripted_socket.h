// ScriptedSocket: a TCP socket whose other end is the test.
#pragma once

#include <algorithm>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/bytes.h"
#include "platform/runtime_error.h"
#include "platform/tcp_socket.h"

namespace tendril::test {

// The text's characters as bytes; zero bytes within a literal count.
inline Bytes BytesOf(std::string_view text) { return {text.begin(), text.end()}; }

class ScriptedSocket : public TcpSocket {
 public:
  void SetEvents(TcpEvents events) override { events_ = std::move(events); }
  void Connect(const std::string& host, std::uint16_t port) override {
    ThrowFault();
    attempts.push_back(host + ":" + std::to_string(port));
    used_local_port = local_port_;
    state_ = TcpState::kConnecting;
  }
  void Close() override {
    state_ = TcpState::kClosed;
    waiting_.clear();
  }
  TcpState State() const override { return state_; }
  void SetLocalPort(std::uint16_t port) override { local_port_ = port; }
  std::uint16_t LocalPort() const override { return state_ == TcpState::kConnected ? 40000 : local_port_; }
  void Send(std::span<const std::uint8_t> bytes) override {
    ThrowFault();
    sent.emplace_back(bytes.begin(), bytes.end());
  }
  Bytes Receive(std::size_t limit) override {
    ThrowFault();
    const auto end = waiting_.begin() + static_cast<std::ptrdiff_t>(std::min(limit, waiting_.size()));
    Bytes taken(waiting_.begin(), end);
    waiting_.erase(waiting_.begin(), end);
    return taken;
  }

  // What the other end does.
  void Accept() {
    state_ = TcpState::kConnected;
    events_.connected();
  }
  void Deliver(const Bytes& bytes) {
    waiting_.insert(waiting_.end(), bytes.begin(), bytes.end());
    events_.data_arrived();
  }
  void Deliver(std::string_view text) { Deliver(BytesOf(text)); }
  void End(std::int32_t number, const std::string& description) {
    Close();
    events_.ended(number, description);
  }
  // Takes what was sent since the last call.
  std::vector<Bytes> Take() { return std::exchange(sent, {}); }

  std::vector<std::string> attempts;  // "host:port" of each Connect()
  std::uint16_t used_local_port = 1;  // by the last of them
  std::vector<Bytes> sent;
  std::optional<RuntimeError> fault;  // what the next call to the network raises

 private:
  void ThrowFault() {
    if (fault) throw *std::exchange(fault, std::nullopt);
  }

  TcpEvents events_;
  TcpState state_ = TcpState::kClosed;
  std::uint16_t local_port_ = 0;
  Bytes waiting_;
};

}  // namespace tendril::test
