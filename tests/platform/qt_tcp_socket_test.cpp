#include "platform/qt/qt_tcp_socket.h"

#include <gmock/gmock.h>

#include <QTcpServer>

#include "platform/wait_for.h"

namespace tendril::test {
namespace {

// A port of this machine without a listener.
std::uint16_t ClosedPort() {
  QTcpServer server;
  server.listen(QHostAddress::LocalHost);
  return server.serverPort();
}

TEST(QtTcpSocket, RefusedAttempt_EndsOnce) {
  for (const bool to_itself : {false, true}) {
    std::vector<std::string> events;
    QtTcpSocket socket([](const std::string& fault) { ADD_FAILURE() << fault; });
    socket.SetEvents({[&] { events.push_back("connected"); }, [&] { events.push_back("data"); },
                      [&](std::int32_t number, const std::string& description) {
                        EXPECT_EQ(socket.State(), TcpState::kClosed);
                        events.push_back(std::to_string(number) +
                                         (description.empty() ? " without a reason" : ""));
                      }});
    const std::uint16_t port = ClosedPort();
    socket.SetLocalPort(to_itself ? port : 0);
    socket.Connect("127.0.0.1", port);
    EXPECT_TRUE(events.empty()) << "reported from inside a call";
    EXPECT_TRUE(WaitFor([&] { return !events.empty(); })) << to_itself;
    RunFor(50);
    EXPECT_THAT(events, testing::ElementsAre("10061")) << to_itself;
  }
}

TEST(QtTcpSocket, Bytes_PassBothWaysUntilThePeerCloses) {
  QTcpServer server;
  server.listen(QHostAddress::LocalHost);
  Bytes received;
  std::int32_t end = 0;
  QtTcpSocket socket([](const std::string& fault) { ADD_FAILURE() << fault; });
  socket.SetEvents({.data_arrived = [&] { received = socket.Receive(100); },
                    .ended = [&](std::int32_t number, const auto&) { end = number; }});
  socket.Connect("127.0.0.1", server.serverPort());
  ASSERT_TRUE(
      WaitFor([&] { return socket.State() == TcpState::kConnected && server.hasPendingConnections(); }));
  QTcpSocket* peer = server.nextPendingConnection();
  socket.Send(Bytes{0, 1, 255});
  EXPECT_TRUE(WaitFor([&] { return peer->bytesAvailable() == 3; }));
  peer->write(peer->readAll());
  peer->disconnectFromHost();
  EXPECT_TRUE(WaitFor([&] { return end != 0; }));
  EXPECT_EQ(end, 10054);
  EXPECT_EQ(received, (Bytes{0, 1, 255}));
}

}  // namespace
}  // namespace tendril::test
