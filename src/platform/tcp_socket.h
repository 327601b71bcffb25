// TcpSocket: a TCP client connection.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "platform/bytes.h"

namespace tendril {

// What the socket reports to its owner, always from the event loop and never from inside a call. The handlers must not
// be empty.
struct TcpEvents {
  std::function<void()> connected = [] {};
  std::function<void()> data_arrived = [] {};
  // The attempt or the connection ended by itself: refused, closed by the peer, unreachable. The socket is closed
  // by then. At most once an attempt, and never after Close().
  std::function<void(std::int32_t number, const std::string& description)> ended = [](std::int32_t,
                                                                                      const std::string&) {};
};

// Reasons why a connection ended, with the numbers of the platform's published list.
inline constexpr std::int32_t kConnectionReset = 10054;
inline constexpr std::int32_t kConnectionRefused = 10061;

// The states of a socket that its owner distinguishes, with the numbers of that list.
enum class TcpState : std::int32_t { kClosed = 0, kConnecting = 6, kConnected = 7 };

// One connection at a time; Connect() may be called again after the connection has ended.
class TcpSocket {
 public:
  virtual ~TcpSocket() = default;

  virtual void SetEvents(TcpEvents events) = 0;
  // Starts connecting to the numeric address `host`; `connected` or `ended` follows. A connection of a port to itself
  // counts as refused.
  virtual void Connect(const std::string& host, std::uint16_t port) = 0;
  // Closes at once, without an event; what was sent before still goes out.
  virtual void Close() = 0;
  // As reported so far: it changes with Connect(), Close() and the events.
  virtual TcpState State() const = 0;
  // The local port that the next Connect() uses; 0, as in a fresh socket, lets the system choose.
  virtual void SetLocalPort(std::uint16_t port) = 0;
  // The local port of the connection; without one, what SetLocalPort() set.
  virtual std::uint16_t LocalPort() const = 0;
  // Queues all of `bytes`. Ignored when not connected.
  virtual void Send(std::span<const std::uint8_t> bytes) = 0;
  // Takes at most `limit` bytes of what has arrived; empty when there is nothing more. Once a bounded buffer is full,
  // the sender has to wait.
  virtual Bytes Receive(std::size_t limit) = 0;
};

}  // namespace tendril
