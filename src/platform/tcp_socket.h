// TcpSocket: a TCP client connection.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "platform/bytes.h"

namespace tendril {

// What the socket tells its owner, always from the event loop and never from inside a call.
struct TcpEvents {
  std::function<void()> connected;
  std::function<void()> data_arrived;
  // The attempt or the connection ended by itself: refused, closed by the peer, unreachable. The socket is
  // closed when this comes, comes once an attempt, and never after Close().
  std::function<void(std::int32_t number, const std::string& description)> ended;
};

// One connection at a time; Connect() may be called again after the connection has ended.
class TcpSocket {
 public:
  virtual ~TcpSocket() = default;

  virtual void SetEvents(TcpEvents events) = 0;
  // Starts connecting to the numeric address `host`; `connected` or `ended` follows. A connection that the
  // system made from the port to itself counts as refused.
  virtual void Connect(const std::string& host, std::uint16_t port) = 0;
  // Closes at once, without an event; what was sent before still goes out.
  virtual void Close() = 0;
  virtual bool IsConnected() const = 0;
  // Queues all of `bytes`. Ignored when not connected.
  virtual void Send(std::span<const std::uint8_t> bytes) = 0;
  // Takes at most `limit` bytes of what has arrived. What is not taken is held back at the sender once a
  // bounded buffer is full.
  virtual Bytes Receive(std::size_t limit) = 0;
};

}  // namespace tendril
