// QtTcpSocket: a TCP client connection on QTcpSocket.
#pragma once

#include <QTcpSocket>
#include <memory>
#include <string>

#include "platform/qt/mailbox.h"
#include "platform/tcp_socket.h"

namespace tendril {

// Failures carry the numbers of the platform's published list of socket errors (10061: connection refused).
// What the peer sent before it closed is reported, and can be received, before `ended`. The socket may be closed,
// connected again or destroyed inside any event.
class QtTcpSocket final : public TcpSocket {
 public:
  explicit QtTcpSocket(FaultHandler on_fault);
  ~QtTcpSocket() override;

  void SetEvents(TcpEvents events) override;
  // Closes an earlier connection or attempt first.
  void Connect(const std::string& host, std::uint16_t port) override;
  void Close() override;
  TcpState State() const override;
  void SetLocalPort(std::uint16_t port) override { local_port_ = port; }
  std::uint16_t LocalPort() const override;
  void Send(std::span<const std::uint8_t> bytes) override;
  Bytes Receive(std::size_t limit) override;

 private:
  void OnConnected();
  void OnError();
  void PostData();
  void PostEnd(std::int32_t number, const std::string& description);

  TcpEvents events_;
  std::uint16_t local_port_ = 0;

  std::unique_ptr<QTcpSocket> socket_;  // one per attempt; none while closed
  bool connected_ = false;              // `connected` was delivered

  // Posted and not delivered yet.
  bool data_posted_ = false;
  bool end_posted_ = false;
  Mailbox mailbox_;
};

}  // namespace tendril
