// How the client connects, fails and connects again, and what it makes of replies.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "client_fixture.h"
#include "platform/runtime_error.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(CommListenerControls, MissingOnes_AreNamedInTheirOrder) {
  SimulatedTime time;
  ScriptedSocket socket;
  const std::unique_ptr<Timer> timer = time.CreateTimer([] {});
  Timer* const good = timer.get();
  const struct {
    TcpSocket* socket;
    Timer* connect;
    Timer* reconnect;
    Timer* request;
    const char* description;
  } cases[] = {{nullptr, nullptr, good, good, "Missing TCPCommWinsock"},
               {&socket, nullptr, nullptr, good, "Missing TCPConnectTimer"},
               {&socket, good, nullptr, nullptr, "Missing TCPReconnectTimer"},
               {&socket, good, good, nullptr, "Missing TCPRequestTimer"}};
  for (const auto& each : cases) {
    CommListenerInterface client;
    client.SetLocalPort(7);
    EXPECT_EQ(client.LocalPort(), 7);
    client.SendDMXIntensities(0, 0, -1, {});  // a failure before there is anything to close
    EXPECT_EQ(client.CLIErrorMessage(), "Error in SendDMXIntensities");
    try {
      client.InitializeControls(each.socket, each.connect, each.reconnect, each.request);
      ADD_FAILURE() << each.description;
    } catch (const RuntimeError& error) {
      EXPECT_EQ(error.number(), 37);
      EXPECT_EQ(error.description(), each.description);
    }
    client.Connect(false, "x", false, true);  // cannot, and says so
    EXPECT_EQ(client.CLIErrorMessage(), "Error connecting");
    client.Disconnect();
    client.Reconnect(false, "x", false, true);
    EXPECT_TRUE(client.Closed());
  }
}

TEST_F(ClientTest, Connect_GoesWhereItWasTold) {
  client.SetRemotePort(8837);
  client.SetLocalPort(1234);
  EXPECT_EQ(client.LocalPort(), 0);  // it is the socket's until then
  client.Connect(false, "Tendril Utility", false, true);
  EXPECT_TRUE(client.Active());
  EXPECT_THAT(socket.attempts, ElementsAre("127.0.0.1:8837"));
  EXPECT_EQ(socket.used_local_port, 1234);
  client.Connect(false, "Tendril Utility", false, true);  // already on its way
  EXPECT_EQ(socket.attempts.size(), 1u);
  socket.Accept();
  EXPECT_THAT(Events(), ElementsAre("connected", "state"));
  EXPECT_THAT(socket.Take(), ElementsAre(BytesOf("I000015Tendril Utility")));
  EXPECT_EQ(client.LocalPort(), 40000);

  client.Connect(false, "Tendril Utility", false, true);
  EXPECT_THAT(Events(), ElementsAre("error 4 Connect called while socket not closed|0|", "state"));
  Reconnected();
}

TEST_F(ClientTest, NoListener_IsTriedAgainEvery100MsForAnHourWithoutGrowth) {
  client.Connect(false, "x", false, true);
  for (int attempt = 1; attempt <= 36'000; ++attempt) {
    ASSERT_EQ(socket.attempts.size(), 1u);
    socket.attempts.clear();
    socket.End(10061, "Connection refused");
    ASSERT_THAT(Events(), ElementsAre("error 3 Comm Winsock Error|10061|Connection refused"));
    ASSERT_EQ(time.RunningTimers(), 1);
    time.Advance(99);
    ASSERT_THAT(socket.attempts, IsEmpty());
    EXPECT_EQ(client.TCPError(), 10061);
    time.Advance(1);
  }
  EXPECT_EQ(time.ElapsedMs(), 3'600'000u);
  EXPECT_EQ(client.CLIError(), 3);  // kept; the rest is of the new attempt
  EXPECT_EQ(client.CLIErrorMessage(), "");
  EXPECT_EQ(client.TCPError(), 0);
  socket.Accept();
  EXPECT_THAT(socket.Take(), ElementsAre(BytesOf("I000001x")));
}

TEST_F(ClientTest, PortsOutsideTheirRange_EndEachAttemptInCode8) {
  for (const auto& [remote, local] : {std::pair(0, 0), {65536, 0}, {-1, 0}, {8837, 65536}, {8837, -1}}) {
    client.SetRemotePort(remote);
    client.SetLocalPort(local);
    client.Connect(false, "x", false, true);
    EXPECT_THAT(Events(), ElementsAre("error 8 Error 380: Invalid property value|0|"));
    time.Advance(100);
    EXPECT_EQ(Events().size(), 1u);
    EXPECT_THAT(socket.attempts, IsEmpty());
  }
  client.SetRemotePort(65535);
  client.SetLocalPort(0);
  time.Advance(100);
  EXPECT_THAT(socket.attempts, ElementsAre("127.0.0.1:65535"));
}

TEST_F(ClientTest, ConnectTimeout_FailsAndTriesAgain) {
  client.Connect(false, "x", false, true);
  time.Advance(4999);
  EXPECT_THAT(Events(), IsEmpty());
  time.Advance(1);
  EXPECT_THAT(Events(), ElementsAre("error 1 Connection timed out|0|"));
  Reconnected();
  time.Advance(900);  // the timer of the first attempt is not running any more
  EXPECT_TRUE(client.IsConnected());
}

TEST_F(ClientTest, RequestThatIsTooLongToRepeat_IsDropped) {
  ConnectIdle();
  const std::string longest(99999, 'n');
  client.Reconnect(false, longest, false, true);
  socket.Accept();
  ASSERT_EQ(socket.sent.size(), 1u);
  EXPECT_EQ(socket.sent[0].size(), 100006u);
  EXPECT_EQ(socket.Take()[0][6], '9');
  time.Advance(1000);
  Events();
  Reconnected();
  EXPECT_THAT(Events(), ElementsAre("error 7 Request message too long|0|", "connected", "state"));
  EXPECT_EQ(client.CLIError(), 2);
  EXPECT_THAT(socket.Take(), IsEmpty());
  EXPECT_TRUE(client.ReadyToTransmit());

  client.Reconnect(false, longest + "n", false, true);
  socket.Accept();
  EXPECT_THAT(Events(), ElementsAre("connected", "error 7 Request message too long|0|"));
  EXPECT_TRUE(client.ReadyToTransmit());
}

// A reply, what it ends in, whole and one byte at a time, and that the client recovers.
TEST(CommListenerReplies, BadReplies_EndInTheirCodeAndTheClientReconnects) {
  const struct {
    std::string reply;
    const char* error;
  } cases[] = {
      {"1900000", "error 5 Sequence char mismatch in comm reply|0|"},
      {"0900000", "error 5 Sequence char mismatch in comm reply|0|"},
      {"2100000", "error 5 Unexpected message identifier in comm reply|0|"},
      {"0100000", "error 6 NAKed comm request|0|"},
      {"0100003abc", "error 6 NAKed comm request|0|"},
      {"11A0000", "error 4 Error on comm reply 37: Invalid digit byte: 65|0|"},
      {"11-0001", "error 4 Error on comm reply 37: Invalid digit byte: 45|0|"},
      {"1199999", "error 2 Request timed out|0|"},  // and never more
      {"11", "error 2 Request timed out|0|"},
  };
  for (const auto& each : cases) {
    for (const std::size_t piece : {each.reply.size(), std::size_t{1}}) {
      SCOPED_TRACE(each.reply + " in pieces of " + std::to_string(piece));
      ClientWorld world;
      world.ConnectIdle();
      world.client.SendAllOffOnDisconnect();
      EXPECT_THAT(world.socket.Take(), ElementsAre(BytesOf("A100000")));
      for (std::size_t at = 0; at < each.reply.size(); at += piece) {
        if (world.client.IsConnected()) world.socket.Deliver(each.reply.substr(at, piece));
      }
      world.time.Advance(world.client.IsConnected() ? 1000 : 0);
      EXPECT_THAT(world.Events(), ElementsAre(each.error, "state"));
      EXPECT_EQ(std::string("error ") + std::to_string(world.client.CLIError()) + " " +
                    world.client.CLIErrorMessage() + "|0|",
                each.error);
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
  // With nothing outstanding it is measured against the last request.
  socket.Deliver("1200002");
  socket.Deliver("xy");
  EXPECT_THAT(Events(), ElementsAre("reply 0 xy"));
  // Half a reply is forgotten with its connection.
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

TEST_F(ClientTest, Faults_AreReportedWithWhereTheyHappened) {
  const RuntimeError fault(10040, "Too big");
  socket.fault = fault;
  client.Connect(false, "x", false, true);
  EXPECT_THAT(Events(), ElementsAre("error 8 Error 10040: Too big|0|"));
  EXPECT_EQ(time.RunningTimers(), 1);
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

TEST_F(ClientTest, FaultsOfTheOwner_DoNotKeepTheClientFromReconnecting) {
  std::vector<std::string> errors;
  const auto raise = [] { throw RuntimeError(11, "Division by zero"); };
  client.SetEvents({.CommReply = [&](const Bytes&, std::int32_t) { raise(); },
                    .CommError = [&](std::int32_t, const std::string& message, std::int32_t,
                                     const std::string&) { errors.push_back(message); },
                    .CommConnected = raise});
  client.Connect(false, "x", false, true);
  socket.Accept();
  EXPECT_THAT(errors, ElementsAre("Error in TCPCommWinsock_Connect 11: Division by zero"));
  client.SetEvents({.CommReply = [&](const Bytes&, std::int32_t) { raise(); },
                    .CommError = [&](std::int32_t, const std::string& message, std::int32_t,
                                     const std::string&) { errors.push_back(message); }});
  Reconnected();
  socket.Deliver("1000000");
  EXPECT_EQ(errors.back(), "Error on comm reply 11: Division by zero");
  Reconnected();
}

TEST_F(ClientTest, OwnerThatDisconnectsOrFailsInsideAnEvent_IsObeyed) {
  client.SetEvents(
      {.CommConnected = [this] { client.Disconnect(); }, .CommStateChanged = [this] { Note("state"); }});
  client.Connect(false, "x", false, true);
  socket.Accept();
  EXPECT_THAT(Events(), IsEmpty()) << "it never counted as connected";
  EXPECT_THAT(socket.Take(), IsEmpty());

  client.SetEvents({.CommClosed = [] { throw RuntimeError(11, "Division by zero"); }});
  client.Reconnect(false, "x", false, true);
  socket.Accept();
  client.Disconnect();
  EXPECT_EQ(client.CLIErrorMessage(), "Error disconnecting");
  EXPECT_TRUE(client.Closed());
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
  client.Disconnect();  // the attempt that is on its way still comes
  time.Advance(100);
  EXPECT_EQ(client.TCPState(), TcpState::kConnecting);

  socket.End(10061, "refused");
  client.PrepareForShutdown();
  EXPECT_EQ(time.RunningTimers(), 0);
  client.RequestCommPortControl(3);  // nobody is there any more
  client.Connect(false, "x", false, true);
  EXPECT_EQ(client.CLIErrorMessage(), "Error connecting");
  client.PrepareForShutdown();
}

TEST_F(ClientTest, Settings_CountFromTheNextConnect) {
  client.SetRemoteAddress("10.0.0.1");
  client.SetConnectTimeout(40);
  client.SetCommReconnectTime(30);
  client.SetRequestTimeout(20);
  client.Connect(false, "x", false, true);
  time.Advance(40);
  EXPECT_EQ(client.CLIError(), kCLIConnectTimedOut);
  time.Advance(30);
  EXPECT_THAT(socket.attempts, ElementsAre("10.0.0.1:3738", "10.0.0.1:3738"));
  socket.Accept();
  time.Advance(20);
  EXPECT_EQ(client.CLIError(), kCLIRequestTimedOut);
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
  EXPECT_THAT(socket.Take(), IsEmpty());  // no "A" any more
  time.Advance(100);
  EXPECT_TRUE(client.ReadyToTransmit());  // the retry was called off
  socket.Deliver("1");                    // half of something that nobody asked for
  client.RequestCommPortControl(4);
  socket.Deliver("1400000");
  EXPECT_TRUE(client.ReadyToTransmit());
}

TEST_F(ClientTest, OwnerThatConnectsInsideAnEvent_GetsWhatItAskedFor) {
  ConnectIdle();
  client.SetEvents({.CommError = [this](std::int32_t, const std::string&, std::int32_t, const std::string&) {
    client.Connect(false, "y", false, true);
  }});
  socket.End(10054, "closed");
  socket.Accept();
  time.Advance(200);
  EXPECT_TRUE(client.IsConnected());

  client.SetEvents({.CommClosed = [this] { client.Connect(false, "z", false, true); }});
  client.PrepareForShutdown();
  EXPECT_EQ(time.RunningTimers(), 0);
  EXPECT_EQ(socket.State(), TcpState::kClosed);
}

TEST_F(ClientTest, ShutdownInsideAnEvent_EndsTheFailureThere) {
  ConnectIdle();
  client.SetEvents({.CommError = [this](std::int32_t, const std::string&, std::int32_t, const std::string&) {
    client.PrepareForShutdown();
  }});
  socket.End(10054, "closed");
  EXPECT_EQ(time.RunningTimers(), 0);
  EXPECT_FALSE(client.Active());
}

}  // namespace
}  // namespace tendril::test
