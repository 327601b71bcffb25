#include "commlistener/comm_listener_interface.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

// "number: description" of the failure that is being handled.
std::string DescribeCurrentFailure() {
  const RuntimeError failure = CurrentFault();
  return std::to_string(failure.number()) + ": " + failure.description();
}

// A port number as the system takes it. 0 is no port.
std::uint16_t PortNumber(std::int32_t number, std::int32_t lowest) {
  if (number < lowest || number > std::numeric_limits<std::uint16_t>::max()) {
    throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
  }
  return static_cast<std::uint16_t>(number);
}

template <typename Control>
Control& Present(Control* control, const char* name) {
  if (control == nullptr) throw RuntimeError(kErrInternal, std::string("Missing ") + name);
  return *control;
}

}  // namespace

CommListenerInterface::~CommListenerInterface() {
  events_ = {};  // the owner may be half gone by now
  PrepareForShutdown();
}

void CommListenerInterface::InitializeControls(TcpSocket* socket, Timer* connect_timer,
                                               Timer* reconnect_timer, Timer* request_timer) {
  TCPCommWinsock_ = &Present(socket, "TCPCommWinsock");
  TCPCommWinsock_->SetLocalPort(0);
  TCPCommWinsock_->SetEvents({.connected = [this] { OnSocketConnected(); },
                              .data_arrived = [this] { OnDataArrived(); },
                              .ended =
                                  [this](std::int32_t number, const std::string& description) {
                                    Fail(kCLISocketError, "Comm Winsock Error", number, description);
                                  }});
  TCPConnectTimer_ = &Present(connect_timer, "TCPConnectTimer");
  TCPReconnectTimer_ = &Present(reconnect_timer, "TCPReconnectTimer");
  TCPRequestTimer_ = &Present(request_timer, "TCPRequestTimer");
}

void CommListenerInterface::Connect(bool send_all_off_on_disconnect, const std::string& client_identification,
                                    bool send_physical_lights_control, bool physical_lights_control) {
  all_off_on_disconnect_pending_ = send_all_off_on_disconnect;
  client_identification_ = client_identification;
  client_identification_pending_ = true;
  physical_lights_pending_ = send_physical_lights_control;
  physical_lights_control_ = physical_lights_control;
  active_ = true;
  try {
    StartConnecting();
  } catch (...) {
    cli_error_message_ = "Error connecting";
  }
}

void CommListenerInterface::Reconnect(bool send_all_off_on_disconnect,
                                      const std::string& client_identification,
                                      bool send_physical_lights_control, bool physical_lights_control) {
  if (TCPReconnectTimer_ != nullptr) TCPReconnectTimer_->SetEnabled(false);
  if (!Closed()) TCPCommWinsock_->Close();
  Connect(send_all_off_on_disconnect, client_identification, send_physical_lights_control,
          physical_lights_control);
}

void CommListenerInterface::Disconnect() {
  try {
    active_ = false;
    if (Closed()) return;
    TCPCommWinsock_->Close();
    events_.CommClosed();
    SetConnectedFlag(false);
  } catch (...) {
    cli_error_message_ = "Error disconnecting";
  }
}

void CommListenerInterface::PrepareForShutdown() {
  StopTimers();
  if (TCPCommWinsock_ != nullptr) {
    Disconnect();
    // The owner may have connected again in CommClosed.
    TCPCommWinsock_->SetEvents({});
    TCPCommWinsock_->Close();
    StopTimers();
  }
  TCPCommWinsock_ = nullptr;
  TCPConnectTimer_ = TCPReconnectTimer_ = TCPRequestTimer_ = nullptr;
}

void CommListenerInterface::StopTimers() {
  for (Timer* timer : {TCPConnectTimer_, TCPReconnectTimer_, TCPRequestTimer_}) {
    if (timer != nullptr) timer->SetEnabled(false);
  }
}

std::int32_t CommListenerInterface::LocalPort() const {
  return TCPCommWinsock_ != nullptr ? TCPCommWinsock_->LocalPort() : local_port_;
}

TcpState CommListenerInterface::TCPState() const {
  return TCPCommWinsock_ != nullptr ? TCPCommWinsock_->State() : TcpState::kClosed;
}

void CommListenerInterface::StartConnecting() {
  Present(TCPRequestTimer_, "TCPRequestTimer");  // the last that InitializeControls() stores
  if (TCPState() == TcpState::kConnecting) return;
  if (!Closed()) return Fail(kCLIFault, "Connect called while socket not closed");
  try {
    TCPCommWinsock_->SetLocalPort(PortNumber(local_port_, 0));
    const std::uint16_t remote_port = PortNumber(remote_port_, 1);
    TCPConnectTimer_->SetInterval(connect_timeout_);
    TCPConnectTimer_->SetEnabled(true);
    TCPCommWinsock_->Connect(remote_address_, remote_port);
    request_outstanding_ = false;
    EndCommPortControl(PortControl::kUnanswered);
    receive_buffer_.clear();  // may hold half a reply of the old connection
    cli_error_message_.clear();
    tcp_error_message_.clear();
    tcp_error_ = 0;
  } catch (...) {
    Fail(kCLICannotConnect, "Error " + DescribeCurrentFailure());
  }
}

void CommListenerInterface::OnSocketConnected() {
  try {
    TCPConnectTimer_->SetEnabled(false);
    if (last_request_) {
      const Bytes unacknowledged = *std::exchange(last_request_, std::nullopt);
      SendMessage(unacknowledged.front(), unacknowledged);
      last_request_.reset();
    }
    events_.CommConnected();
    if (!IsConnected()) return;  // the owner has disconnected
    SetConnectedFlag(true);
    WorkOffPendingRequests();
  } catch (...) {
    Fail(kCLIFault, "Error in TCPCommWinsock_Connect " + DescribeCurrentFailure());
  }
}

void CommListenerInterface::OnConnectTimer() {
  TCPConnectTimer_->SetEnabled(false);
  Fail(kCLIConnectTimedOut, "Connection timed out");
}

void CommListenerInterface::OnReconnectTimer() {
  TCPReconnectTimer_->SetEnabled(false);
  StartConnecting();
}

void CommListenerInterface::OnRequestTimer() {
  TCPRequestTimer_->SetEnabled(false);
  Fail(kCLIRequestTimedOut, "Request timed out");
}

// Every failure comes here, and from here the next attempt starts.
void CommListenerInterface::Fail(std::int32_t code, const std::string& message, std::int32_t tcp_error,
                                 const std::string& tcp_error_message) {
  cli_error_ = code;
  cli_error_message_ = message;
  tcp_error_ = tcp_error;
  tcp_error_message_ = tcp_error_message;
  if (TCPRequestTimer_ == nullptr) return;
  TCPCommWinsock_->Close();
  TCPConnectTimer_->SetEnabled(false);
  TCPRequestTimer_->SetEnabled(false);
  request_outstanding_ = false;
  EndCommPortControl(PortControl::kUnanswered);
  events_.CommError(code, message, tcp_error, tcp_error_message);
  SetConnectedFlag(false);
  if (TCPReconnectTimer_ == nullptr || !Closed())
    return;  // the owner has shut down, or connected, in an event
  TCPReconnectTimer_->SetInterval(comm_reconnect_time_);
  TCPReconnectTimer_->SetEnabled(true);
}

void CommListenerInterface::SetConnectedFlag(bool connected) {
  if (std::exchange(connected_, connected) != connected) events_.CommStateChanged();
}

// Never keeps more than the largest frame: what is beyond a frame is dropped with it anyway.
void CommListenerInterface::OnDataArrived() {
  try {
    for (;;) {
      const Bytes arrived = TCPCommWinsock_->Receive(kMaxFrame);
      if (arrived.empty()) break;
      const auto kept = std::min(arrived.size(), kMaxFrame - receive_buffer_.size());
      receive_buffer_.insert(receive_buffer_.end(), arrived.begin(),
                             arrived.begin() + static_cast<std::ptrdiff_t>(kept));
    }
  } catch (...) {
    return Fail(kCLIFault, "Error in TCPCommWinsock_DataArrival " + DescribeCurrentFailure());
  }
  try {
    ProcessReply();
  } catch (...) {
    Fail(kCLIFault, "Error on comm reply " + DescribeCurrentFailure());
  }
}

void CommListenerInterface::ProcessReply() {
  constexpr std::uint8_t kAcknowledged = '1';
  constexpr std::uint8_t kRefused = '0';
  if (receive_buffer_.size() < kFrameHeaderSize) return;
  const auto header = ParseFrameHeader(receive_buffer_);
  if (!header) return Fail(kCLIBadReply, "Unable to parse header in comm reply");
  if (header->sequence != expected_sequence_) {
    return Fail(kCLIBadReply, "Sequence char mismatch in comm reply");
  }
  if (header->identifier != kAcknowledged && header->identifier != kRefused) {
    return Fail(kCLIBadReply, "Unexpected message identifier in comm reply");
  }
  const std::size_t frame_size = kFrameHeaderSize + header->length;
  if (receive_buffer_.size() < frame_size) return;

  request_outstanding_ = false;
  EndCommPortControl(header->identifier == kRefused ? PortControl::kRefused : PortControl::kGranted);
  Bytes payload = std::exchange(receive_buffer_, {});
  payload.resize(frame_size);
  payload.erase(payload.begin(), payload.begin() + kFrameHeaderSize);
  if (header->identifier == kRefused) return Fail(kCLIRefused, "NAKed comm request");
  last_request_.reset();
  TCPRequestTimer_->SetEnabled(false);
  WorkOffPendingRequests();
  events_.CommReply(payload, 0);
}

void CommListenerInterface::SendMessage(std::uint8_t identifier, std::span<const std::uint8_t> payload) {
  if (!ReadyToTransmit()) return;
  try {
    if (next_sequence_ > '9') next_sequence_ = '0';
    const std::uint8_t sequence = next_sequence_++;
    if (payload.size() > kMaxPayload) {
      return events_.CommError(kCLIRequestTooLong, "Request message too long", 0, "");
    }
    Bytes frame = BuildFrame(identifier, sequence, payload);
    TCPCommWinsock_->Send(frame);
    expected_sequence_ = sequence;
    request_outstanding_ = true;
    receive_buffer_.clear();
    TCPRequestTimer_->SetEnabled(true);
    TCPRequestTimer_->SetInterval(request_timeout_);
    last_request_ = std::move(frame);
  } catch (...) {
    Fail(kCLIFault, "Error in SendMessage " + DescribeCurrentFailure());
  }
}

void CommListenerInterface::SendMessageB(std::uint8_t identifier, std::span<const std::uint8_t> bytes,
                                         std::size_t count) {
  try {
    if (count > bytes.size()) throw RuntimeError(kErrOutOfRange, "Subscript out of range");
    SendMessage(identifier, bytes.first(count));
  } catch (...) {
    Fail(kCLIFault, "Error in SendMessageB " + DescribeCurrentFailure());
  }
}

}  // namespace tendril
