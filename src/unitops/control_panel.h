// ControlPanel: what the program has to do with the show's Control Panel, which owns the serial ports while
// it runs.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <utility>

#include "commlistener/comm_listener_interface.h"
#include "platform/message_boxes.h"
#include "platform/process_list.h"
#include "platform/tcp_socket.h"
#include "platform/timer.h"
#include "prefs/network_preferences.h"
#include "prefs/registry.h"

namespace tendril {

// Keeps a connection to the Control Panel's comm listener, asks it for a port when the user wants that, and
// gives the port back.
class ControlPanel {
 public:
  // Everything handed in must outlive it. `wsCLI` is not to be used by anyone else.
  ControlPanel(TimerFactory& timers, MessageBoxes& boxes, TcpSocket& wsCLI, Registry& registry,
               const ProcessList& processes);
  ~ControlPanel();

  // Start-up: reads the show installation's network preferences.
  void ReadPreferences();
  // Start-up: prepares the comm listener client and connects it, for as long as the program runs. Shows a fault.
  void InitializeCommListenerInterface();

  // Whether the Control Panel runs on this computer and has a comm listener.
  bool ControlPanelRunning() const;
  // Asks the user whether the Control Panel is to give up port `port`, 1 to 255, and on Yes asks the Control
  // Panel, giving another port back first.
  void AskControlPanelForPort(std::uint8_t port);

  // The port whose control was asked of the Control Panel; nothing when none was.
  std::optional<std::uint8_t> RequestedPort() const { return requested_port_; }
  // What became of that request.
  PortControl RequestState() const;
  // `handler` is called when that has changed: at once for what the user does, and within a second of the answer.
  void SetChangedHandler(std::function<void()> handler) { changed_ = std::move(handler); }
  // Whether there is a connection to the comm listener. A request without an answer was sent only if there is one.
  bool Connected() const { return client_.IsConnected(); }
  // Whether a request for a port, or one that gives it back, is still to be sent or to be acknowledged.
  bool RequestPending() const { return client_.CommPortControlPending(); }
  // Gives that port back. It counts as requested no longer.
  void RelinquishPort();

 private:
  void OnAnswerTimer();

  MessageBoxes& boxes_;
  TcpSocket& wsCLI_;
  const ProcessList& processes_;
  NetworkPreferences preferences_;
  std::optional<std::uint8_t> requested_port_;
  std::function<void()> changed_;

  CommListenerInterface client_;
  std::unique_ptr<Timer> tmrCLIConnect_;
  std::unique_ptr<Timer> tmrCLIReconnect_;
  std::unique_ptr<Timer> tmrCLIRequest_;
  std::unique_ptr<Timer> answer_timer_;  // looks for the answer while a request has none
};

}  // namespace tendril
