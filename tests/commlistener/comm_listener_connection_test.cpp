// How the client connects, fails, connects again and handles replies.
#include "client_fixture.h"
#include "platform/runtime_error.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::ThrowsMessage;

TEST_F(ClientTest, MissingControls_AreNamedInTheirOrder) {
  CommListenerInterface unusable;
  unusable.SendDMXIntensities(0, 0, -1, {});  // a failure with nothing to close
  EXPECT_EQ(unusable.CLIErrorMessage(), "Error in SendDMXIntensities");
  Timer* const timer = request_timer_.get();
  const auto given = [&](TcpSocket* its_socket, Timer* connect, Timer* reconnect, Timer* request) {
    return [&unusable, its_socket, connect, reconnect, request] {
      unusable.InitializeControls(its_socket, connect, reconnect, request);
    };
  };
  EXPECT_THAT(given(nullptr, nullptr, timer, timer), ThrowsMessage<RuntimeError>("Missing TCPCommWinsock"));
  EXPECT_THAT(given(&socket, nullptr, nullptr, timer),
              ThrowsMessage<RuntimeError>("Missing TCPConnectTimer"));
  EXPECT_THAT(given(&socket, timer, nullptr, nullptr),
              ThrowsMessage<RuntimeError>("Missing TCPReconnectTimer"));
  EXPECT_THAT(given(&socket, timer, timer, nullptr), ThrowsMessage<RuntimeError>("Missing TCPRequestTimer"));
  unusable.Reconnect(false, "x", false, true);
  EXPECT_EQ(unusable.CLIErrorMessage(), "Error connecting");
}

TEST_F(ClientTest, Connect_UsesTheAddressAndThePorts) {
  client.SetRemotePort(8837);
  client.SetLocalPort(1234);
  EXPECT_EQ(client.LocalPort(), 0) << "the socket's until it connects";
  Connect();
  Connect();  // connecting already
  EXPECT_TRUE(client.Active());
  EXPECT_THAT(socket.attempts, ElementsAre("127.0.0.1:8837"));
  EXPECT_EQ(socket.used_local_port, 1234);
  socket.Accept();
  EXPECT_THAT(Events(), ElementsAre("connected", "state"));
  EXPECT_EQ(client.LocalPort(), 40000);

  Connect();
  EXPECT_THAT(Events(), ElementsAre("error 4 Connect called while socket not closed|0|", "state"));
  Reconnected();
}

TEST_F(ClientTest, RefusedAttempt_IsRepeatedAfter100Ms) {
  Connect();
  socket.End(10061, "Connection refused");
  EXPECT_THAT(Events(), ElementsAre("error 3 Comm Winsock Error|10061|Connection refused"));
  time.Advance(99);
  EXPECT_EQ(socket.attempts.size(), 1u);
  EXPECT_EQ(client.TCPError(), 10061);
  time.Advance(1);
  EXPECT_EQ(socket.attempts.size(), 2u);
  EXPECT_EQ(client.CLIError(), 3) << "the code is kept";
  EXPECT_EQ(client.CLIErrorMessage(), "");
  EXPECT_EQ(client.TCPError(), 0);
}

TEST_F(ClientTest, PortsOutsideTheirRange_EndEachAttemptInCode8) {
  for (const auto& [remote, local] : {std::pair(0, 0), {65536, 0}, {8837, 65536}, {8837, -1}}) {
    client.SetRemotePort(remote);
    client.SetLocalPort(local);
    Connect();
    EXPECT_THAT(Events(), ElementsAre("error 8 Error 380: Invalid property value|0|"));
    time.Advance(100);
    EXPECT_EQ(Events().size(), 1u);
    EXPECT_THAT(socket.attempts, IsEmpty());
  }
}

TEST_F(ClientTest, TimeOuts_FailAndConnectAgain) {
  EXPECT_EQ(client.ConnectTimeout(), 5000);
  EXPECT_EQ(client.RequestTimeout(), 1000);
  client.SetRemoteAddress("10.0.0.1");
  client.SetConnectTimeout(40);
  client.SetCommReconnectTime(30);
  client.SetRequestTimeout(20);
  Connect();
  time.Advance(39);
  EXPECT_THAT(Events(), IsEmpty());
  time.Advance(1);
  EXPECT_THAT(Events(), ElementsAre("error 1 Connection timed out|0|"));
  Reconnected();
  EXPECT_THAT(socket.attempts, ElementsAre("10.0.0.1:3738", "10.0.0.1:3738"));
  Events();
  time.Advance(19);
  EXPECT_TRUE(client.IsConnected()) << "the connect timer still runs";
  time.Advance(1);
  EXPECT_THAT(Events(), ElementsAre("error 2 Request timed out|0|", "state"));
}

TEST_F(ClientTest, RequestsBeyondTheLargestPayload_AreDropped) {
  client.Connect(false, std::string(99999, 'n'), false, true);
  socket.Accept();
  EXPECT_EQ(socket.Take().at(0).size(), 100006u);
  time.Advance(1000);
  Events();
  Reconnected();  // the repetition would be longer
  EXPECT_THAT(Events(), ElementsAre("error 7 Request message too long|0|", "connected", "state"));
  EXPECT_EQ(client.CLIError(), 2);
  EXPECT_THAT(socket.Take(), IsEmpty());
  EXPECT_TRUE(client.ReadyToTransmit());
}

// Whole, and one byte at a time.
TEST(CommListenerReplies, BadReplies_EndInTheirCodeAndTheClientReconnects) {
  const std::pair<std::string, const char*> cases[] = {
      {"1900000", "error 5 Sequence char mismatch in comm reply|0|"},
      {"2100000", "error 5 Unexpected message identifier in comm reply|0|"},
      {"0100003abc", "error 6 NAKed comm request|0|"},
      {"11A000B", "error 4 Error on comm reply 37: Invalid digit byte: 66|0|"},
      {"11/0000", "error 4 Error on comm reply 37: Invalid digit byte: 47|0|"},
      {"11:0000", "error 4 Error on comm reply 37: Invalid digit byte: 58|0|"},
      {"1199999", "error 2 Request timed out|0|"},  // and never more
      {"11", "error 2 Request timed out|0|"},
  };
  for (const auto& [reply, error] : cases) {
    for (const std::size_t piece : {reply.size(), std::size_t{1}}) {
      SCOPED_TRACE(reply + " in pieces of " + std::to_string(piece));
      ClientWorld world;
      world.ConnectIdle();
      world.client.SendAllOffOnDisconnect();
      world.socket.Take();
      for (std::size_t at = 0; at < reply.size(); at += piece) {
        if (world.client.IsConnected()) world.socket.Deliver(reply.substr(at, piece));
      }
      world.time.Advance(world.client.IsConnected() ? 1000 : 0);
      EXPECT_THAT(world.Events(), ElementsAre(error, "state"));
      world.Reconnected();
      EXPECT_THAT(world.Events(), ElementsAre("connected", "state"));
      EXPECT_THAT(world.socket.Take(), ElementsAre(BytesOf("A200007A100000")));
    }
  }
}

TEST_F(ClientTest, Replies_AreAssembledAndWhatIsBeyondThemIsDropped) {
  ConnectIdle();
  client.SendAllOffOnDisconnect();
  for (const char byte : std::string("1100005hello")) socket.Deliver(std::string(1, byte));
  EXPECT_THAT(Events(), ElementsAre("reply 0 hello"));
  client.SendAllOffOnDisconnect();
  socket.Deliver("1200001a1200001b");
  EXPECT_THAT(Events(), ElementsAre("reply 0 a"));
  // With nothing outstanding, a reply is checked against the last request.
  socket.Deliver("1200002");
  socket.Deliver("xy");
  EXPECT_THAT(Events(), ElementsAre("reply 0 xy"));
  // Half a reply is dropped with its connection.
  socket.Deliver("120000");
  socket.End(10054, "closed");
  Reconnected();
  Events();
  socket.Deliver("1200000");
  EXPECT_THAT(Events(), ElementsAre("reply 0 "));
  socket.Deliver("1300000");
  EXPECT_THAT(Events(), ElementsAre("error 5 Sequence char mismatch in comm reply|0|", "state"));
}

TEST_F(ClientTest, LargestReply_IsTakenAndAFloodEndsWithIt) {
  ConnectIdle();
  client.SendAllOffOnDisconnect();
  socket.Deliver("1199999");
  socket.Deliver(Bytes(99998, 'f'));
  EXPECT_THAT(Events(), IsEmpty());
  socket.Deliver(Bytes(1'000'000, 'f'));
  EXPECT_THAT(Events(), ElementsAre("reply 0 " + std::string(99999, 'f')));
  EXPECT_THAT(socket.Receive(1), IsEmpty());
  EXPECT_TRUE(client.ReadyToTransmit());
}

TEST_F(ClientTest, FaultsOfTheSocket_AreReportedWithTheirPlace) {
  const RuntimeError fault(10040, "Too big");
  socket.fault = fault;
  Connect();
  EXPECT_THAT(Events(), ElementsAre("error 8 Error 10040: Too big|0|"));
  time.Advance(100);
  socket.fault = fault;  // of sending the identification
  socket.Accept();
  EXPECT_EQ(Events()[2], "error 4 Error in SendMessage 10040: Too big|0|");
  Reconnected();
  EXPECT_THAT(socket.Take(), IsEmpty()) << "what was not sent is not repeated";
  Events();
  socket.fault = fault;  // of receiving
  socket.Deliver("1");
  EXPECT_THAT(Events(),
              ElementsAre("error 4 Error in TCPCommWinsock_DataArrival 10040: Too big|0|", "state"));
  Reconnected();
}

TEST_F(ClientTest, HandlersThatFailOrDisconnect_LeaveTheClientUsable) {
  const auto raise = [] { throw RuntimeError(11, "Division by zero"); };
  const auto note = [this](std::int32_t, const std::string& message, std::int32_t, const std::string&) {
    Note(message);
  };
  client.SetEvents({.CommError = note, .CommConnected = raise});
  Connect();
  socket.Accept();
  EXPECT_THAT(Events(), ElementsAre("Error in TCPCommWinsock_Connect 11: Division by zero"));
  client.SetEvents({.CommReply = [&](const Bytes&, std::int32_t) { raise(); }, .CommError = note});
  Reconnected();
  socket.Deliver("1000000");
  EXPECT_THAT(Events(), ElementsAre("Error on comm reply 11: Division by zero"));
  client.SetEvents({.CommClosed = raise});
  Reconnected();
  client.Disconnect();
  EXPECT_EQ(client.CLIErrorMessage(), "Error disconnecting");
  EXPECT_TRUE(client.Closed());

  client.SetEvents(
      {.CommConnected = [this] { client.Disconnect(); }, .CommStateChanged = [this] { Note("state"); }});
  client.Reconnect(false, "x", false, true);
  socket.Take();
  socket.Accept();
  EXPECT_THAT(Events(), ElementsAre("state")) << "the end of the connection before";
  EXPECT_THAT(socket.Take(), IsEmpty());
}

TEST_F(ClientTest, Disconnect_ClosesAndAShutdownStopsEverything) {
  ConnectIdle();
  client.Disconnect();
  EXPECT_THAT(Events(), ElementsAre("closed", "state"));
  EXPECT_FALSE(client.Active());
  client.Disconnect();
  EXPECT_THAT(Events(), IsEmpty());

  client.Reconnect(false, "x", false, true);
  socket.End(10061, "refused");
  client.Disconnect();  // does not stop the next attempt
  time.Advance(100);
  EXPECT_EQ(client.TCPState(), TcpState::kConnecting);

  socket.Accept();
  client.SetEvents({.CommClosed = [this] { Connect(); }});
  client.PrepareForShutdown();
  EXPECT_EQ(time.RunningTimers(), 0);
  EXPECT_EQ(socket.State(), TcpState::kClosed);
  client.RequestCommPortControl(3);  // does nothing
}

TEST_F(ClientTest, Reconnect_StartsAfreshWhateverWasGoingOn) {
  ConnectIdle();
  client.RequestCommPortControl(3);
  client.Reconnect(true, "y", false, true);
  socket.Take();
  socket.Accept();
  EXPECT_THAT(socket.Take(), ElementsAre(Frame("C200009C100002", {3, 0})));
  socket.Deliver("10");  // cut off
  socket.End(10054, "closed");
  client.Reconnect(false, "z", false, true);
  socket.Accept();
  EXPECT_THAT(socket.Take(), ElementsAre(BytesOf("I300001z")));
  socket.Deliver("1300000");
  EXPECT_THAT(socket.Take(), IsEmpty());  // no longer with an "A"
  time.Advance(100);
  EXPECT_TRUE(client.ReadyToTransmit());  // the next attempt was cancelled
  socket.Deliver("1");                    // half a reply to no request
  client.RequestCommPortControl(4);
  socket.Deliver("1400000");
  EXPECT_TRUE(client.ReadyToTransmit());
}

TEST_F(ClientTest, Handlers_MayConnectAndShutDown) {
  const auto on_error = [this](auto action) {
    client.SetEvents({.CommError = [action](std::int32_t, const std::string&, std::int32_t,
                                            const std::string&) { action(); }});
  };
  ConnectIdle();
  on_error([this] { client.Connect(false, "y", false, true); });
  socket.End(10054, "closed");
  socket.Accept();
  time.Advance(200);
  EXPECT_TRUE(client.IsConnected());

  on_error([this] { client.PrepareForShutdown(); });
  socket.End(10054, "closed");
  EXPECT_EQ(time.RunningTimers(), 0);
  EXPECT_FALSE(client.Active());
}

}  // namespace
}  // namespace tendril::test
