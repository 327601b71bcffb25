#include "app/control_panel_server.h"

#include <QHostAddress>
#include <QNetworkProxy>
#include <QTcpSocket>
#include <memory>
#include <span>
#include <stdexcept>
#include <utility>

namespace tendril {
namespace {

// Received bytes that wait at most. Beyond that, TCP holds the sender back.
constexpr qint64 kReadBufferBytes = qint64{64} * 1024;

}  // namespace

ControlPanelServer::ControlPanelServer(VirtualControlPanel& panel, std::uint16_t port,
                                       std::function<void(const std::string&)> note)
    : panel_(panel), note_(std::move(note)) {
  server_.setProxy(QNetworkProxy::NoProxy);
  QObject::connect(&server_, &QTcpServer::newConnection, &server_, [this] {
    while (QTcpSocket* const socket = server_.nextPendingConnection()) Accept(socket);
  });
  if (!server_.listen(QHostAddress::LocalHost, port)) {
    throw std::runtime_error("TCP port " + std::to_string(port) +
                             " is not available: " + server_.errorString().toStdString() + ".");
  }
}

// The session ends with its socket, which is in no call at that time.
void ControlPanelServer::Accept(QTcpSocket* socket) {
  socket->setReadBufferSize(kReadBufferBytes);
  socket->setSocketOption(QAbstractSocket::LowDelayOption, 1);
  const auto send = [socket](std::span<const std::uint8_t> bytes) {
    if (socket->state() != QAbstractSocket::ConnectedState) return;
    socket->write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
    socket->flush();
  };
  const auto hang_up = [this, socket] {
    note_("The Control Panel hangs up.");
    socket->disconnectFromHost();
  };
  const auto session =
      std::make_shared<PanelSession>(panel_, PanelConnection{.send = send, .hang_up = hang_up});
  QObject::connect(socket, &QTcpSocket::readyRead, socket, [socket, session] {
    const QByteArray bytes = socket->readAll();
    session->Receive({reinterpret_cast<const std::uint8_t*>(bytes.data()), std::size_t(bytes.size())});
  });
  QObject::connect(socket, &QTcpSocket::disconnected, &server_, [this, socket] {
    note_("The connection to the Control Panel has ended.");
    socket->deleteLater();
  });
  note_("A program has connected to the Control Panel.");
}

}  // namespace tendril
