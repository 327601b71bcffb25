#include "platform/qt/qt_tcp_socket.h"

#include <QCoreApplication>
#include <QHostAddress>
#include <QNetworkProxy>
#include <QTimer>
#include <algorithm>
#include <utility>

namespace tendril {
namespace {

// Size of the receive buffer. While it is full, the peer has to wait.
constexpr qint64 kReadBufferBytes = qint64{64} * 1024;

// How long a closed connection may go on sending.
constexpr int kLingerMs = 5000;

// Further reasons why a connection ends, as in tcp_socket.h.
constexpr std::int32_t kOperationFailed = 10000;
constexpr std::int32_t kNetworkUnreachable = 10051;
constexpr std::int32_t kTimedOut = 10060;
constexpr std::int32_t kHostNotFound = 11001;

std::int32_t ErrorNumber(QAbstractSocket::SocketError error) {
  if (error == QAbstractSocket::ConnectionRefusedError) return kConnectionRefused;
  if (error == QAbstractSocket::RemoteHostClosedError) return kConnectionReset;
  if (error == QAbstractSocket::HostNotFoundError) return kHostNotFound;
  if (error == QAbstractSocket::SocketTimeoutError) return kTimedOut;
  if (error == QAbstractSocket::NetworkError) return kNetworkUnreachable;
  return kOperationFailed;
}

// A socket that connects to a closed port of its own machine may get that port as its own, and is then connected to
// itself.
bool IsConnectedToItself(const QTcpSocket& socket) {
  return socket.localPort() == socket.peerPort() && socket.localAddress() == socket.peerAddress();
}

// Closes the connection after its output, if need be after this call. Until then, what the peer sends is read and
// dropped: a connection that is closed with unread input is reset, and the peer loses what it has not read yet. (Qt's own
// closing stops reading first.)
void Retire(std::unique_ptr<QTcpSocket> socket) {
  if (!socket || socket->state() != QAbstractSocket::ConnectedState) return;
  socket->readAll();
  if (socket->waitForReadyRead(0)) socket->readAll();
  socket->flush();
  if (socket->bytesToWrite() == 0 || socket->state() != QAbstractSocket::ConnectedState) return;

  QTcpSocket* const lingering = socket.release();
  lingering->setParent(QCoreApplication::instance());
  QObject::connect(lingering, &QTcpSocket::readyRead, lingering, &QTcpSocket::readAll);
  QObject::connect(lingering, &QTcpSocket::bytesWritten, lingering, [lingering] {
    if (lingering->bytesToWrite() == 0) lingering->disconnectFromHost();
  });
  QObject::connect(lingering, &QTcpSocket::disconnected, lingering, &QObject::deleteLater);
  QTimer::singleShot(kLingerMs, lingering, &QTcpSocket::abort);
}

}  // namespace

QtTcpSocket::QtTcpSocket(FaultHandler on_fault) : mailbox_(std::move(on_fault)) {}

QtTcpSocket::~QtTcpSocket() { Close(); }

void QtTcpSocket::SetEvents(TcpEvents events) { events_ = std::move(events); }

void QtTcpSocket::Connect(const std::string& host, std::uint16_t port) {
  Close();
  socket_ = std::make_unique<QTcpSocket>();
  QTcpSocket* const socket = socket_.get();
  socket->setProxy(QNetworkProxy::NoProxy);  // the listener is on this computer
  socket->setReadBufferSize(kReadBufferBytes);
  QObject::connect(socket, &QTcpSocket::connected, socket, [this] { OnConnected(); });
  QObject::connect(socket, &QTcpSocket::readyRead, socket, [this] { PostData(); });
  // A refusal comes with an error and nothing else, a peer's close with an error while still connected and a
  // `disconnected` afterwards: the first of them ends the attempt.
  QObject::connect(socket, &QTcpSocket::errorOccurred, socket, [this] { OnError(); });
  QObject::connect(socket, &QTcpSocket::disconnected, socket,
                   [this] { PostEnd(kConnectionReset, "The connection was closed"); });

  const QHostAddress address(QString::fromStdString(host));
  if (address.isNull()) return PostEnd(kHostNotFound, "\"" + host + "\" is no numeric address");
  const bool ipv6 = address.protocol() == QAbstractSocket::IPv6Protocol;
  const QHostAddress any(ipv6 ? QHostAddress::AnyIPv6 : QHostAddress::AnyIPv4);
  if (local_port_ != 0 && !socket->bind(any, local_port_)) return OnError();
  socket->connectToHost(address, port);
}

void QtTcpSocket::Close() {
  if (socket_) socket_->disconnect();
  Retire(std::move(socket_));
  connected_ = data_posted_ = end_posted_ = false;
  mailbox_.Clear();
}

TcpState QtTcpSocket::State() const {
  if (connected_) return TcpState::kConnected;
  return socket_ ? TcpState::kConnecting : TcpState::kClosed;
}

void QtTcpSocket::Send(std::span<const std::uint8_t> bytes) {
  if (!connected_ || socket_->state() != QAbstractSocket::ConnectedState) return;
  socket_->write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
  socket_->flush();
}

Bytes QtTcpSocket::Receive(std::size_t limit) {
  if (!connected_) return {};
  const auto most = static_cast<qint64>(std::min(limit, static_cast<std::size_t>(kReadBufferBytes)));
  const QByteArray bytes = socket_->read(most);
  return {bytes.begin(), bytes.end()};
}

std::uint16_t QtTcpSocket::LocalPort() const { return connected_ ? socket_->localPort() : local_port_; }

void QtTcpSocket::OnConnected() {
  if (IsConnectedToItself(*socket_)) {
    PostEnd(kConnectionRefused, "Connection refused");
    return socket_->abort();
  }
  mailbox_.Post([this] {
    connected_ = true;
    const auto connected = events_.connected;  // which may destroy this object
    connected();
  });
}

void QtTcpSocket::OnError() { PostEnd(ErrorNumber(socket_->error()), socket_->errorString().toStdString()); }

void QtTcpSocket::PostData() {
  if (std::exchange(data_posted_, true)) return;
  mailbox_.Post([this] {
    data_posted_ = false;
    const auto data_arrived = events_.data_arrived;
    data_arrived();
  });
}

void QtTcpSocket::PostEnd(std::int32_t number, const std::string& description) {
  if (std::exchange(end_posted_, true)) return;
  if (socket_->bytesAvailable() > 0) PostData();
  mailbox_.Post([this, number, description] {
    const auto ended = events_.ended;
    Close();
    ended(number, description);
  });
}

}  // namespace tendril
