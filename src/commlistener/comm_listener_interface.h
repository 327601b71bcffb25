// CommListenerInterface: the client of the Control Panel's comm listener.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <optional>
#include <span>
#include <string>

#include "commlistener/comm_frame.h"
#include "commlistener/lighting_queue.h"
#include "platform/bytes.h"
#include "platform/tcp_socket.h"
#include "platform/timer.h"

namespace tendril {

// What CLIError() can be.
enum CLIErrorCode : std::int32_t {
  kCLIConnectTimedOut = 1,
  kCLIRequestTimedOut = 2,
  kCLISocketError = 3,
  kCLIFault = 4,  // of the program itself: in an event, in a request, or in reading a reply
  kCLIBadReply = 5,
  kCLIRefused = 6,
  kCLIRequestTooLong = 7,  // in the error event only; nothing was sent
  kCLICannotConnect = 8
};

// What the client knows of a serial port that was requested.
enum class PortControl {
  kNone,        // not requested, or given back
  kAsked,       // requested; the listener has not answered yet
  kGranted,     // the listener has given it up
  kRefused,     // the listener has refused
  kUnanswered,  // the connection ended without an answer
};

// What the client reports to its owner. A handler must not be empty. It may call the client, except SetEvents().
// CommError and CommStateChanged must not raise: no further attempt to connect would follow.
struct CommListenerEvents {
  // A request was acknowledged. The status is always 0.
  std::function<void(const Bytes& payload, std::int32_t status)> CommReply = [](const Bytes&, std::int32_t) {
  };
  // A failure. The last two are the socket's; 0 and "" when the failure is not the socket's.
  std::function<void(std::int32_t code, const std::string& message, std::int32_t tcp_error,
                     const std::string& tcp_error_message)>
      CommError = [](std::int32_t, const std::string&, std::int32_t, const std::string&) {};
  std::function<void()> CommConnected = [] {};
  std::function<void()> CommClosed = [] {};
  // The client has connected, or its connection has ended.
  std::function<void()> CommStateChanged = [] {};
};

// Keeps a connection to the comm listener: after every failure it connects again. Requests are queued and sent one at
// a time, each when the one before was acknowledged.
//
//   Closed --Connect()--> Connecting --connected--> Connected
//   Connecting, Connected --any failure--> Closed, and Connecting again after CommReconnectTime
//
//   Idle --request sent--> Outstanding --acknowledged--> Idle
//   Outstanding --refused, bad reply, time-out, connection lost--> Idle, not connected
//
// A request that was sent and not acknowledged is repeated once, on the next connection, inside a new one: a frame
// with the same message identifier, whose payload is the whole old frame.
class CommListenerInterface {
 public:
  CommListenerInterface() = default;
  // Runs PrepareForShutdown(), without events.
  ~CommListenerInterface();
  CommListenerInterface(const CommListenerInterface&) = delete;
  CommListenerInterface& operator=(const CommListenerInterface&) = delete;

  void SetEvents(CommListenerEvents events) { events_ = std::move(events); }

  // Sets what the client works with. The owner keeps them until PrepareForShutdown(), and makes the timers tick into
  // On...Timer() below. The client sets the socket's events. Raises RuntimeError(kErrInternal) for one that is null.
  void InitializeControls(TcpSocket* socket, Timer* connect_timer, Timer* reconnect_timer,
                          Timer* request_timer);

  // Connects, and identifies the program as `client_identification` (UTF-8). send_all_off_on_disconnect asks the
  // listener to turn all off when the connection ends. send_physical_lights_control sends `physical_lights_control`,
  // which is only stored otherwise. Connecting while connected is a failure.
  void Connect(bool send_all_off_on_disconnect, const std::string& client_identification,
               bool send_physical_lights_control, bool physical_lights_control);
  // Closes an earlier connection first.
  void Reconnect(bool send_all_off_on_disconnect, const std::string& client_identification,
                 bool send_physical_lights_control, bool physical_lights_control);
  // Closes the connection. A time-out or a reconnect that is pending still happens, and connects again.
  void Disconnect();
  // Ends everything, and drops the socket and the timers.
  void PrepareForShutdown();

  // Requests. They are queued.
  //
  // Asks the listener to give up the serial port of this number, or gives it back.
  void RequestCommPortControl(std::uint8_t port);
  void RelinquishCommPortControl(std::uint8_t port);
  // What became of the last of these for this port.
  PortControl CommPortControl(std::uint8_t port) const;
  // Whether one of these waits to be sent, or for its acknowledgement.
  bool CommPortControlPending() const { return !port_control_queue_.empty() || port_control_outstanding_; }
  // Whether physical lights are controlled. Setting it notifies the listener.
  bool PhysicalLightsControl() const { return physical_lights_control_; }
  void SetPhysicalLightsControl(bool control);
  // These two are sent at once, and only when ReadyToTransmit().
  void SendClientIdentification();
  void SendAllOffOnDisconnect();
  // Lighting data. The numbers are passed through; the first `count` of `values` are sent.
  void SendAllOffCommand();
  void SendDMXEffectForAddressCommand(std::uint16_t a, std::uint16_t b, std::uint8_t c, std::uint8_t d,
                                      std::uint8_t e, std::int32_t f);
  void SendNyxEffectForCircuit(std::uint8_t a, std::uint8_t b, std::uint16_t c, std::uint8_t d,
                               std::uint8_t e, std::uint8_t f, std::int32_t g);
  void SendDMXIntensities(std::uint16_t a, std::uint16_t b, std::int16_t count,
                          std::span<const std::uint8_t> values);
  void SendNyxIntensities(std::uint8_t a, std::uint8_t b, std::uint16_t c, std::int16_t count,
                          std::span<const std::uint8_t> values);

  // The listener's host, a numeric address, and its TCP port, for the next connect. A port outside 1 to 65535 is a
  // failure of each attempt to connect.
  const std::string& RemoteAddress() const { return remote_address_; }
  void SetRemoteAddress(std::string address) { remote_address_ = std::move(address); }
  std::int32_t RemotePort() const { return remote_port_; }
  void SetRemotePort(std::int32_t port) { remote_port_ = port; }
  // Reads the socket's local port, and sets that of the next connect; 0 lets the system choose.
  std::int32_t LocalPort() const;
  void SetLocalPort(std::int32_t port) { local_port_ = port; }
  // Milliseconds, 0 or more: for a connect, between a failure and the next attempt, and for a reply. 0 disables the
  // time-out or the next attempt.
  std::int32_t ConnectTimeout() const { return connect_timeout_; }
  void SetConnectTimeout(std::int32_t ms) { connect_timeout_ = ms; }
  std::int32_t CommReconnectTime() const { return comm_reconnect_time_; }
  void SetCommReconnectTime(std::int32_t ms) { comm_reconnect_time_ = ms; }
  std::int32_t RequestTimeout() const { return request_timeout_; }
  void SetRequestTimeout(std::int32_t ms) { request_timeout_ = ms; }

  // From Connect() to Disconnect(), connected or not.
  bool Active() const { return active_; }
  bool IsConnected() const { return TCPState() == TcpState::kConnected; }
  bool Closed() const { return TCPState() == TcpState::kClosed; }
  // Closed while there is no socket.
  TcpState TCPState() const;
  // Connected, and no request is outstanding.
  bool ReadyToTransmit() const { return IsConnected() && !request_outstanding_; }

  // The last failure. A new attempt to connect clears the texts and the socket's number, and keeps the code.
  std::int32_t CLIError() const { return cli_error_; }
  const std::string& CLIErrorMessage() const { return cli_error_message_; }
  std::int32_t TCPError() const { return tcp_error_; }
  const std::string& TCPErrorMessage() const { return tcp_error_message_; }

  // Ticks of the owner's timers, which are used as one-shot timers.
  void OnConnectTimer();
  void OnReconnectTimer();
  void OnRequestTimer();

 private:
  void StopTimers();
  void StartConnecting();
  void OnSocketConnected();
  void OnDataArrived();
  void ProcessReply();
  void Fail(std::int32_t code, const std::string& message, std::int32_t tcp_error = 0,
            const std::string& tcp_error_message = {});
  void SetConnectedFlag(bool connected);
  void WorkOffPendingRequests();
  void SendMessage(std::uint8_t identifier, std::span<const std::uint8_t> payload);
  void SendMessageB(std::uint8_t identifier, std::span<const std::uint8_t> bytes, std::size_t count);
  void SendPhysicalLightsControl();
  void SendCommPortControl();
  void SendLightingData();
  template <typename Request>
  void Guarded(const char* failure, Request request);
  void QueueCommPortControl(std::int32_t entry);
  void EndCommPortControl(PortControl outcome);
  void QueueLighting(LightingRecordType type, std::span<const std::uint8_t> data);

  CommListenerEvents events_;

  // Null before InitializeControls() and after PrepareForShutdown().
  TcpSocket* TCPCommWinsock_ = nullptr;
  Timer* TCPConnectTimer_ = nullptr;
  Timer* TCPReconnectTimer_ = nullptr;
  Timer* TCPRequestTimer_ = nullptr;

  std::string remote_address_ = "127.0.0.1";
  std::int32_t remote_port_ = 3738;
  std::int32_t local_port_ = 0;
  std::int32_t connect_timeout_ = 5000;
  std::int32_t comm_reconnect_time_ = 100;
  std::int32_t request_timeout_ = 1000;

  bool active_ = false;
  bool connected_ = false;  // as last reported by CommStateChanged
  std::int32_t cli_error_ = 0;
  std::string cli_error_message_;
  std::int32_t tcp_error_ = 0;
  std::string tcp_error_message_;

  std::uint8_t next_sequence_ = '0';      // after "9" comes "0" again
  std::uint8_t expected_sequence_ = '0';  // of the request sent last
  bool request_outstanding_ = false;
  Bytes receive_buffer_;  // at most kMaxFrame
  // The frame sent last, until it is acknowledged or repeated. Its first byte is its message identifier.
  std::optional<Bytes> last_request_;

  // Pending requests.
  bool client_identification_pending_ = false;
  std::string client_identification_;
  bool all_off_on_disconnect_pending_ = false;
  bool physical_lights_pending_ = false;
  bool physical_lights_control_ = true;
  std::deque<std::int32_t> port_control_queue_;  // port number, plus kGiveBack
  std::optional<std::int32_t>
      port_control_outstanding_;                      // an entry of that queue, while it is not acknowledged
  std::map<std::uint8_t, PortControl> port_control_;  // of the ports that are requested
  LightingQueue lighting_;
};

}  // namespace tendril
