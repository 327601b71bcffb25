// VirtualControlPanel: the comm listener of a show-control Control Panel, without a socket.
//
// Requests and replies are frames: an identifier, a sequence digit, five digits with the length of what
// follows, and that many bytes (at most 99999).
//
//   I  text                     here is a program
//   C  port, 0 or 1             give the port up, or take it back
//   P  0 or 1                   control of the physical lights
//   A  -                        all lights off when the connection ends
//   L  lighting records         what the lights are to do
//   1  -                        reply: done
//   0  -                        reply: refused
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <span>
#include <string_view>
#include <vector>

#include "platform/bytes.h"
#include "platform/timer.h"

namespace tendril {

// How the panel replies. It does what it is asked all the same, unless it refuses.
enum class PanelBehaviour {
  kProper,
  kRefuse,
  kSilent,
  kSlow,
  kTooSlow,
  kByteByByte,
  kWrongSequence,
  kWrongIdentifier,
  kLetterInLength,
  kFlood,
  kCloseInMiddle,
};

// The ways to misbehave by name, as a user asks for them.
struct PanelBehaviourKind {
  std::string_view name;
  std::string_view description;  // half a sentence: "never answers"
  PanelBehaviour behaviour;
};

std::span<const PanelBehaviourKind> PanelBehaviourKinds();
// The kind called `name`, or null.
const PanelBehaviourKind* FindPanelBehaviour(std::string_view name);

// What happens to an attempt to connect to the panel.
enum class PanelListener {
  kOpen,
  kOff,    // the panel does not run: refused
  kStuck,  // neither made nor refused
};

// A request as it came in, whole.
struct PanelRequest {
  std::uint8_t identifier = 0;
  std::uint8_t sequence = 0;
  Bytes payload = {};
  // The payload is itself a frame of this identifier: a program repeats so what was not answered before its
  // connection ended.
  bool nested = false;

  bool operator==(const PanelRequest&) const = default;
};

// The request or the reply that `frame` is, if it is exactly one.
std::optional<PanelRequest> ParsePanelFrame(std::span<const std::uint8_t> frame);

enum class PanelSide { kProgram, kPanel };

class PanelSession;

// The panel, for all its connections. It must outlive its sessions. A panel takes a port back only on request, not
// when a connection ends.
class VirtualControlPanel {
 public:
  // `timers` let the pieces of a reply come over time; they must outlive the panel.
  explicit VirtualControlPanel(TimerFactory& timers) : timers_(timers) {}
  VirtualControlPanel(const VirtualControlPanel&) = delete;
  VirtualControlPanel& operator=(const VirtualControlPanel&) = delete;

  // The next `replies` replies (all, if not given) misbehave; those after them are proper again.
  void SetBehaviour(PanelBehaviour behaviour, std::optional<std::size_t> replies = std::nullopt);

  // kOff also ends the connections that there are.
  void SetListener(PanelListener listener);
  PanelListener listener() const { return listener_; }

  // Makes `port` one of the panel's own, and held. Any other port that it is asked for leaves it as it is.
  void AddPort(std::uint8_t port);
  bool Holds(std::uint8_t port) const { return held_.contains(port); }
  // Called when the panel gives up or takes back one of its ports. It must not close a connection.
  void SetPortHandler(std::function<void(std::uint8_t port, bool held)> handler);

  // Gets what crosses a connection: each whole request, each piece of a reply, and the bytes that made the panel
  // hang up.
  void SetTap(std::function<void(PanelSide from, std::span<const std::uint8_t> bytes)> tap);

  // The requests since the panel was made, those that were refused too; the last thousand of them.
  const std::deque<PanelRequest>& requests() const { return requests_; }
  // Connections that there are now.
  std::size_t connections() const { return sessions_.size(); }

 private:
  friend class PanelSession;

  // Does what is asked; false if it is refused.
  bool Obey(const PanelRequest& request);
  void ControlPort(std::uint8_t port, bool held);
  void Show(PanelSide from, std::span<const std::uint8_t> bytes) const;
  PanelBehaviour NextBehaviour();

  TimerFactory& timers_;
  PanelListener listener_ = PanelListener::kOpen;
  PanelBehaviour behaviour_ = PanelBehaviour::kProper;
  std::optional<std::size_t> replies_left_;  // that misbehave; without a value all do
  std::set<std::uint8_t> ports_;
  std::set<std::uint8_t> held_;  // of ports_
  std::function<void(std::uint8_t, bool)> port_handler_;
  std::function<void(PanelSide, std::span<const std::uint8_t>)> tap_;
  std::deque<PanelRequest> requests_;
  std::vector<PanelSession*> sessions_;
};

// What carries a session. Both are called from within Receive() and SetListener(), and from timers, and must
// not destroy the session.
struct PanelConnection {
  std::function<void(std::span<const std::uint8_t> bytes)> send;
  std::function<void()> hang_up;  // once, and the last call
};

// One program's connection to the panel, for as long as the object lives.
class PanelSession {
 public:
  PanelSession(VirtualControlPanel& panel, PanelConnection connection);
  ~PanelSession();
  PanelSession(const PanelSession&) = delete;
  PanelSession& operator=(const PanelSession&) = delete;

  // Takes bytes from the program, in whatever pieces they come. After the panel has hung up they are ignored.
  void Receive(std::span<const std::uint8_t> bytes);

 private:
  friend class VirtualControlPanel;

  struct Piece {
    std::int32_t delay_ms = 0;  // since the piece before it
    Bytes bytes = {};
    bool hang_up = false;  // after the bytes
  };

  void Take(std::uint8_t byte);
  void HandleRequest();
  void QueueReply(PanelBehaviour behaviour, const Bytes& reply);
  void SendDuePieces();
  void HangUp();

  VirtualControlPanel& panel_;
  PanelConnection connection_;
  bool open_ = true;
  Bytes frame_;                   // the request that is coming in
  std::deque<Piece> pieces_;      // of replies, yet to be sent
  std::unique_ptr<Timer> timer_;  // runs while the first of pieces_ waits
};

}  // namespace tendril
