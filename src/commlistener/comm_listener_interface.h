// CommListenerInterface: the client of the Control Panel's comm listener.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
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
  kCLIFault = 4,  // of the program itself: in an event, a request, or a reply that cannot be read
  kCLIBadReply = 5,
  kCLIRefused = 6,
  kCLIRequestTooLong = 7,  // in the error event only; nothing was sent
  kCLICannotConnect = 8
};

// What the client tells its owner. Each may call the client again, but for SetEvents(). CommError and CommStateChanged
// must not raise: no further attempt to connect would follow.
struct CommListenerEvents {
  // A request was acknowledged. The status is always 0.
  std::function<void(const Bytes& payload, std::int32_t status)> CommReply = {};
  // A failure; the socket's number and description are 0 and "" when it is not the socket's.
  std::function<void(std::int32_t code, const std::string& message, std::int32_t tcp_error,
                     const std::string& tcp_error_message)>
      CommError = {};
  std::function<void()> CommConnected = {};
  std::function<void()> CommClosed = {};
  // The client has become connected, or is not any more.
  std::function<void()> CommStateChanged = {};
};

// Keeps a connection to the comm listener, by itself: after every failure it connects again. Requests are
// queued and sent one at a time, each when the one before was acknowledged.
//
//   Closed --Connect()--> Connecting --connected--> Connected
//   Connecting, Connected --any failure--> Closed, and Connecting again after CommReconnectTime
//
//   Idle --request sent--> Outstanding --acknowledged--> Idle
//   Outstanding --refused, bad reply, time-out, connection lost--> Idle, not connected
//
// A request that was sent and not acknowledged goes out again with the next connection, inside a new one: a
// frame with the same message identifier, whose payload is the whole old frame. That happens once.
class CommListenerInterface {
 public:
  CommListenerInterface() = default;
  // Runs PrepareForShutdown(), without events.
  ~CommListenerInterface();
  CommListenerInterface(const CommListenerInterface&) = delete;
  CommListenerInterface& operator=(const CommListenerInterface&) = delete;

  void SetEvents(CommListenerEvents events) { events_ = std::move(events); }

  // Takes what the client works with. They stay the owner's, who makes them tick into On...Timer() below and
  // keeps them until PrepareForShutdown(). Raises RuntimeError(kErrInternal) for one that is missing. Takes
  // over the socket's events.
  void InitializeControls(TcpSocket* socket, Timer* connect_timer, Timer* reconnect_timer,
                          Timer* request_timer);

  // Connects and goes on connecting, and identifies the program as `client_identification` (UTF-8). With
  // send_all_off_on_disconnect the listener is told to turn all off when the connection ends; with
  // send_physical_lights_control whether physical lights are controlled, physical_lights_control, which is
  // only kept otherwise. Connecting while connected is a failure.
  void Connect(bool send_all_off_on_disconnect, const std::string& client_identification,
               bool send_physical_lights_control, bool physical_lights_control);
  // The same, closing the connection first that there is.
  void Reconnect(bool send_all_off_on_disconnect, const std::string& client_identification,
                 bool send_physical_lights_control, bool physical_lights_control);
  // Closes the connection. A time-out or a reconnect that is on its way still comes, and connects again.
  void Disconnect();
  // Ends everything, and lets go of the socket and the timers.
  void PrepareForShutdown();

  // Requests. Each waits its turn.
  //
  // Asks the listener to give up a serial port, by its number, or gives it back.
  void RequestCommPortControl(std::uint8_t port);
  void RelinquishCommPortControl(std::uint8_t port);
  // Whether physical lights are controlled. Setting it tells the listener.
  bool PhysicalLightsControl() const { return physical_lights_control_; }
  void SetPhysicalLightsControl(bool control);
  // These two go out at once, and only when ReadyToTransmit().
  void SendClientIdentification();
  void SendAllOffOnDisconnect();
  // Lighting data. The numbers are passed through as they are; `count` values are taken from the start of
  // `values`.
  void SendAllOffCommand();
  void SendDMXEffectForAddressCommand(std::uint16_t a, std::uint16_t b, std::uint8_t c, std::uint8_t d,
                                      std::uint8_t e, std::int32_t f);
  void SendNyxEffectForCircuit(std::uint8_t a, std::uint8_t b, std::uint16_t c, std::uint8_t d,
                               std::uint8_t e, std::uint8_t f, std::int32_t g);
  void SendDMXIntensities(std::uint16_t a, std::uint16_t b, std::int16_t count,
                          std::span<const std::uint8_t> values);
  void SendNyxIntensities(std::uint8_t a, std::uint8_t b, std::uint16_t c, std::int16_t count,
                          std::span<const std::uint8_t> values);

  // The listener's host, a numeric address, and its TCP port. A port outside 1 to 65535 is a failure of each
  // attempt to connect. They take effect at the next connect, as the local port does.
  const std::string& RemoteAddress() const { return remote_address_; }
  void SetRemoteAddress(std::string address) { remote_address_ = std::move(address); }
  std::int32_t RemotePort() const { return remote_port_; }
  void SetRemotePort(std::int32_t port) { remote_port_ = port; }
  // The socket's local port. What is set is used at the next connect; 0 lets the system choose.
  std::int32_t LocalPort() const;
  void SetLocalPort(std::int32_t port) { local_port_ = port; }
  // Milliseconds, 0 or more: allowed for a connect, between a failure and the next attempt, and allowed for a reply. 0 is
  // never: no time-out, no next attempt.
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

  // The last failure. The code stays when a new attempt begins; the texts and the socket's number, 0 if it
  // was not the socket's, are cleared.
  std::int32_t CLIError() const { return cli_error_; }
  const std::string& CLIErrorMessage() const { return cli_error_message_; }
  std::int32_t TCPError() const { return tcp_error_; }
  const std::string& TCPErrorMessage() const { return tcp_error_message_; }

  // Ticks of the owner's timers. Each is used for one tick at a time.
  void OnConnectTimer();
  void OnReconnectTimer();
  void OnRequestTimer();

 private:
  void StopTimers();
  void StartConnecting();
  void OnSocketConnected();
  void OnDataArrived();
  void ProcessReply(std::span<const std::uint8_t> arrived);
  void TakeReply();
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
  bool connected_ = false;  // as last told by CommStateChanged
  std::int32_t cli_error_ = 0;
  std::string cli_error_message_;
  std::int32_t tcp_error_ = 0;
  std::string tcp_error_message_;

  SequenceCharacters sequence_;
  std::uint8_t expected_sequence_ = '0';
  bool request_outstanding_ = false;
  Bytes receive_buffer_;  // at most kLargestFrame
  // The frame sent last, until it is acknowledged or sent again. Its first byte is its message identifier.
  std::optional<Bytes> last_request_;

  // Pending requests.
  bool client_identification_pending_ = false;
  std::string client_identification_;
  bool all_off_on_disconnect_ = false;
  bool all_off_on_disconnect_pending_ = false;
  bool physical_lights_enabled_ = false;
  bool physical_lights_pending_ = false;
  bool physical_lights_control_ = true;
  std::deque<std::int32_t> port_control_queue_;  // port number, plus kGiveBack
  LightingQueue lighting_;
};

}  // namespace tendril
