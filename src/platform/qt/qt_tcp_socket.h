// QtTcpSocket: a TCP client connection on QTcpSocket.
#pragma once

#include <QObject>
#include <QTcpSocket>
#include <memory>
#include <optional>
#include <string>

#include "platform/qt/fault_handler.h"
#include "platform/tcp_socket.h"

namespace tendril {

// Failures carry the numbers of the platform's published list of socket errors (10061: connection refused).
// The events come in the order connected, data_arrived, ended; what the peer sent before it closed can be
// received until `ended` comes. The socket may be closed, connected again or destroyed inside any of them.
class QtTcpSocket final : public TcpSocket {
 public:
  explicit QtTcpSocket(FaultHandler on_fault);
  ~QtTcpSocket() override;

  void SetEvents(TcpEvents events) override;
  // Ends a connection or attempt that there still is, as Close() does.
  void Connect(const std::string& host, std::uint16_t port) override;
  void Close() override;
  TcpState State() const override;
  void SetLocalPort(std::uint16_t port) override { local_port_ = port; }
  std::uint16_t LocalPort() const override;
  void Send(std::span<const std::uint8_t> bytes) override;
  Bytes Receive(std::size_t limit) override;

 private:
  // Why an attempt or a connection ended.
  struct End {
    std::int32_t number;
    std::string description;
  };

  // Notes what the socket says, to be told from the event loop.
  void OnConnected();
  void NoteEnd(End end);
  void PostDelivery();
  // Tells the owner of one thing that was noted, the earliest in the order of events.
  void DeliverNext();

  TcpEvents events_;
  FaultHandler on_fault_;
  std::uint16_t local_port_ = 0;

  std::unique_ptr<QTcpSocket> socket_;  // one per attempt; none while closed
  bool connected_ = false;              // the owner knows of the connection

  // Noted and not told yet.
  bool connected_noted_ = false;
  bool data_noted_ = false;
  std::optional<End> end_noted_;
  bool delivery_posted_ = false;

  QObject context_;  // what is connected and posted ends with this object
};

}  // namespace tendril
