#include "platform/qt/qt_tcp_socket.h"

#include <gmock/gmock.h>

#include <QTcpServer>

#include "platform/wait_for.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kHere[] = "127.0.0.1";

class QtTcpSocketTest : public testing::Test {
 protected:
  QtTcpSocketTest() {
    server_.listen(QHostAddress::LocalHost);
    socket_->SetEvents({[this] { Note("connected"); },
                        [this] {
                          Note("data");
                          if (taking_) Take();
                        },
                        [this](std::int32_t number, const std::string& description) {
                          EXPECT_FALSE(socket_->IsConnected());
                          EXPECT_FALSE(description.empty());
                          Note("ended " + std::to_string(number));
                        }});
  }

  void Note(const std::string& event) {
    EXPECT_FALSE(inside_call_) << event << " came from inside a call";
    // Data may come in any number of pieces.
    if (events_.empty() || events_.back() != "data" || event != "data") events_.push_back(event);
  }
  void Take() {
    const Bytes bytes = socket_->Receive(1000);
    received_.insert(received_.end(), bytes.begin(), bytes.end());
    if (!bytes.empty()) Take();
  }
  void Connect(std::uint16_t port) {
    inside_call_ = true;
    socket_->Connect(kHere, port);
    inside_call_ = false;
  }
  // Connects to the server; the far end of the connection.
  QTcpSocket* ConnectToServer() {
    Connect(server_.serverPort());
    EXPECT_TRUE(WaitFor([&] { return socket_->IsConnected() && server_.hasPendingConnections(); }));
    return server_.nextPendingConnection();
  }
  // A port of this machine that nobody listens on.
  static std::uint16_t ClosedPort() {
    QTcpServer server;
    server.listen(QHostAddress::LocalHost);
    return server.serverPort();
  }

  QTcpServer server_;
  std::vector<std::string> faults_;
  std::unique_ptr<QtTcpSocket> socket_ =
      std::make_unique<QtTcpSocket>([this](const std::string& fault) { faults_.push_back(fault); });
  std::vector<std::string> events_;
  Bytes received_;
  bool taking_ = true;
  bool inside_call_ = false;
};

TEST_F(QtTcpSocketTest, Bytes_PassBothWaysUntilThePeerCloses) {
  QTcpSocket* peer = ConnectToServer();
  socket_->Send(Bytes{0, 1, 255});
  EXPECT_TRUE(WaitFor([&] { return peer->bytesAvailable() == 3; }));
  EXPECT_EQ(peer->readAll().toHex(), "0001ff");

  peer->write(QByteArray(5000, '\0'));
  peer->disconnectFromHost();
  EXPECT_TRUE(WaitFor([&] { return events_.size() >= 3; }));
  RunFor(50);
  EXPECT_THAT(events_, ElementsAre("connected", "data", "ended 10054"));
  EXPECT_EQ(received_, Bytes(5000, 0));
}

TEST_F(QtTcpSocketTest, FailedAttempt_EndsOnce) {
  const std::uint16_t itself = ClosedPort();
  const struct {
    const char* what;
    std::function<void()> attempt;
    const char* end;
  } rows[] = {
      {"nobody listens", [&] { Connect(ClosedPort()); }, "ended 10061"},
      {"connected to itself",
       [&] {
         socket_->SetLocalPort(itself);
         Connect(itself);
         socket_->SetLocalPort(0);
       },
       "ended 10061"},
      {"a name", [&] { socket_->Connect("localhost", server_.serverPort()); }, "ended 11001"},
  };
  for (const auto& row : rows) {
    events_.clear();
    row.attempt();
    EXPECT_TRUE(WaitFor([&] { return !events_.empty(); })) << row.what;
    RunFor(50);
    EXPECT_THAT(events_, ElementsAre(row.end)) << row.what;
  }
}

TEST_F(QtTcpSocketTest, Close_SendsTheRestAndTellsNothing) {
  QTcpSocket* peer = ConnectToServer();
  peer->setReadBufferSize(100'000);  // it reads slowly
  events_.clear();
  const Bytes much(20'000'000, 0x55);
  socket_->Send(much);
  socket_->Close();
  EXPECT_FALSE(socket_->IsConnected());
  peer->write(QByteArray(500'000, 'x'));  // nobody wants it any more
  peer->flush();
  qint64 arrived = 0;
  EXPECT_TRUE(WaitFor([&] {
    arrived += peer->readAll().size();
    return peer->state() == QAbstractSocket::UnconnectedState;
  }));
  EXPECT_EQ(arrived, static_cast<qint64>(much.size()));
  EXPECT_THAT(events_, IsEmpty());
}

TEST_F(QtTcpSocketTest, UntakenData_HoldsThePeerBack) {
  taking_ = false;
  QTcpSocket* peer = ConnectToServer();
  constexpr qint64 kMuch = 50'000'000;
  peer->write(QByteArray(kMuch, 'x'));
  RunFor(200);
  EXPECT_GT(peer->bytesToWrite(), kMuch / 2);
  EXPECT_EQ(socket_->Receive(10).size(), 10u);
  taking_ = true;
  Take();
  EXPECT_TRUE(WaitFor([&] { return received_.size() + 10 == kMuch; }));
}

TEST_F(QtTcpSocketTest, EventHandler_MayFailOrEndTheSocket) {
  QTcpSocket* peer = ConnectToServer();
  socket_->SetEvents({{}, [] { throw std::runtime_error("reply broke"); }, {}});
  peer->write("x");
  EXPECT_TRUE(WaitFor([&] { return !faults_.empty(); }));
  EXPECT_THAT(faults_, ElementsAre("reply broke"));

  socket_->SetEvents({{}, [&] { socket_.reset(); }, {}});
  peer->write("y");
  EXPECT_TRUE(WaitFor([&] { return socket_ == nullptr; }));
}

}  // namespace
}  // namespace tendril::test
