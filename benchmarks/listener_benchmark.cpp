// How many requests a second the comm listener client gets answered over the loopback interface, against a bare
// ping-pong of the same bytes with the toolkit's own socket.
#include <QCoreApplication>
#include <QEventLoop>
#include <QHostAddress>
#include <QTcpServer>
#include <QTcpSocket>
#include <QThread>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "commlistener/comm_listener_interface.h"
#include "measuring.h"
#include "platform/qt/qt_tcp_socket.h"
#include "platform/qt/qt_timer.h"

namespace tendril {
namespace {

constexpr int kRoundTrips = 5000;  // a run
constexpr int kRuns = 9;
constexpr int kRequestSize = 9;
constexpr int kReplySize = 7;

// Acknowledges every request of nine bytes, in a thread of its own.
class Listener {
 public:
  Listener() {
    thread_.start();
    server_.moveToThread(&thread_);
    QMetaObject::invokeMethod(
        &server_, [this] { Listen(); }, Qt::BlockingQueuedConnection);
  }
  ~Listener() {
    QMetaObject::invokeMethod(
        &server_, [this] { server_.close(); }, Qt::BlockingQueuedConnection);
    thread_.quit();
    thread_.wait();
  }
  std::uint16_t port() const { return port_; }

 private:
  void Listen() {
    QObject::connect(&server_, &QTcpServer::newConnection, &server_, [this] {
      QTcpSocket* const socket = server_.nextPendingConnection();
      QObject::connect(socket, &QTcpSocket::readyRead, socket, [socket] {
        // The identification has another length; it is acknowledged once, whole.
        const QByteArray request = socket->readAll();
        if (request.size() < kRequestSize) return;
        socket->write(QByteArray("1") + request.at(1) + "00000");
        socket->flush();
      });
      QObject::connect(socket, &QTcpSocket::disconnected, socket, &QObject::deleteLater);
    });
    if (!server_.listen(QHostAddress::LocalHost)) throw std::runtime_error("Cannot listen");
    port_ = server_.serverPort();
  }

  QThread thread_;
  QTcpServer server_;
  std::uint16_t port_ = 0;
};

// A client as the program has it.
struct Client {
  explicit Client(std::uint16_t port) {
    client.InitializeControls(&socket, connect_timer.get(), reconnect_timer.get(), request_timer.get());
    client.SetRemotePort(port);
  }

  FaultHandler on_fault = [](const std::string& fault) { std::printf("%s\n", fault.c_str()); };
  QtTimerFactory timers{on_fault};
  QtTcpSocket socket{on_fault};
  std::unique_ptr<Timer> connect_timer = timers.CreateTimer([this] { client.OnConnectTimer(); });
  std::unique_ptr<Timer> reconnect_timer = timers.CreateTimer([this] { client.OnReconnectTimer(); });
  std::unique_ptr<Timer> request_timer = timers.CreateTimer([this] { client.OnRequestTimer(); });
  CommListenerInterface client;
};

double RequestsPerSecond(std::uint16_t port) {
  Client program(port);
  QEventLoop loop;
  int replies = -1;  // the first one is that to the identification
  std::unique_ptr<Stopwatch> stopwatch;
  double taken_ms = 0;
  std::string failure;
  program.client.SetEvents(
      {.CommReply =
           [&](const Bytes&, std::int32_t) {
             if (++replies == 0) stopwatch = std::make_unique<Stopwatch>();
             if (replies == kRoundTrips) {
               taken_ms = stopwatch->Ms();
               return loop.quit();
             }
             program.client.RequestCommPortControl(3);
           },
       .CommError =
           [&](std::int32_t, const std::string& message, std::int32_t, const std::string&) {
             failure = message;
             loop.quit();
           }});
  program.client.Connect(false, "Tendril Utility", false, true);
  loop.exec();
  if (!failure.empty()) throw std::runtime_error(failure);
  return kRoundTrips * 1000 / taken_ms;
}

double PingPongsPerSecond(std::uint16_t port) {
  QTcpSocket socket;
  socket.connectToHost(QHostAddress::LocalHost, port);
  if (!socket.waitForConnected()) throw std::runtime_error("Cannot connect");
  QEventLoop loop;
  int replies = 0;
  const QByteArray request("C000002\3\0", kRequestSize);
  QObject::connect(&socket, &QTcpSocket::readyRead, &loop, [&] {
    if (socket.bytesAvailable() < kReplySize) return;
    socket.read(kReplySize);
    if (++replies == kRoundTrips) return loop.quit();
    socket.write(request);
    socket.flush();
  });
  const Stopwatch stopwatch;
  socket.write(request);
  socket.flush();
  loop.exec();
  return kRoundTrips * 1000 / stopwatch.Ms();
}

bool MeasureRoundTrips() {
  constexpr double kMinRatio = 0.5;
  const Listener listener;
  std::vector<double> requests, ping_pongs;
  for (int run = 0; run < kRuns; ++run) {
    ping_pongs.push_back(PingPongsPerSecond(listener.port()));
    requests.push_back(RequestsPerSecond(listener.port()));
  }
  const double ratio = Median(requests) / Median(ping_pongs);
  std::printf(
      "request and reply on loopback, median of %d runs of %d: %.0f a second, bare ping-pong %.0f, ratio "
      "%.2f "
      "(at least %.1f)\n",
      kRuns, kRoundTrips, Median(requests), Median(ping_pongs), ratio, kMinRatio);
  return ratio >= kMinRatio;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureRoundTrips); }
