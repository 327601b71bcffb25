// What the client's requests carry, and in which order they go out.
#include "client_fixture.h"
#include "platform/runtime_error.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class RequestsTest : public ClientTest {
 protected:
  // Acknowledges request after request until no more is sent; returns what was sent.
  std::vector<Bytes> AcknowledgeAll() {
    std::vector<Bytes> all;
    for (;;) {
      const std::vector<Bytes> sent = socket.Take();
      if (sent.empty()) return all;
      EXPECT_EQ(sent.size(), 1u);  // at most one is outstanding
      all.push_back(sent.back());
      socket.Deliver(Bytes{'1', sent.back()[1], '0', '0', '0', '0', '0'});
    }
  }
};

TEST_F(RequestsTest, PendingRequests_GoOutInTheirOrder) {
  client.SendAllOffCommand();
  client.RequestCommPortControl(3);
  client.RelinquishCommPortControl(3);
  client.RequestCommPortControl(255);
  client.Connect(true, "Käte €", true, false);
  EXPECT_THAT(socket.Take(), IsEmpty());
  std::vector<std::size_t> sent_before_the_event;
  client.SetEvents({.CommReply = [&](const Bytes&, std::int32_t) {
    sent_before_the_event.push_back(socket.sent.size());
  }});
  socket.Accept();
  EXPECT_THAT(AcknowledgeAll(),
              ElementsAre(Frame("P000001", {0}), BytesOf("I100006K\xE4te \x80"), BytesOf("A200000"),
                          Frame("C300002", {3, 0}), Frame("C400002", {3, 1}), Frame("C500002", {255, 0}),
                          Frame("L600004", {1, 0, 0, 0})));
  EXPECT_THAT(sent_before_the_event, ElementsAre(1, 1, 1, 1, 1, 1, 0));
  EXPECT_FALSE(client.PhysicalLightsControl());
}

TEST_F(RequestsTest, PhysicalLights_AreSentWhenSetAndNotWhenOnlyStored) {
  ConnectIdle();
  client.SetPhysicalLightsControl(false);
  client.SetPhysicalLightsControl(true);  // waits, and is sent with the value of then
  EXPECT_THAT(AcknowledgeAll(), ElementsAre(Frame("P100001", {0}), Frame("P200001", {1})));
  client.Reconnect(false, "y", false, false);
  socket.Accept();
  EXPECT_THAT(AcknowledgeAll(), ElementsAre(BytesOf("I300001y")));
  EXPECT_FALSE(client.PhysicalLightsControl());
}

TEST_F(RequestsTest, LightingData_IsLaidOutByRecordType) {
  ConnectIdle();
  client.RequestCommPortControl(1);  // outstanding meanwhile, so that all of them share one message
  socket.Take();
  client.SendDMXEffectForAddressCommand(0x0102, 0x0304, 5, 6, 7, -2);
  client.SendNyxEffectForCircuit(1, 2, 0x0304, 5, 6, 7, 0x01020304);
  client.SendDMXIntensities(0x0102, 0x0304, 5, Bytes{1, 2, 3, 4, 5, 6});
  client.SendNyxIntensities(1, 2, 0x0304, 2, Bytes{9, 8});
  client.SendNyxIntensities(1, 2, 0x0304, 0, Bytes{});
  socket.Deliver("1100000");
  EXPECT_THAT(
      socket.Take(),
      ElementsAre(Frame("L200072", {0,  0, 12, 0, 2, 1, 4, 3, 5, 6, 7, 0, 0xFE, 0xFF, 0xFF, 0xFF, 2,  0,
                                    12, 0, 1,  2, 4, 3, 5, 6, 7, 0, 4, 3, 2,    1,    3,    0,    11, 0,
                                    2,  1, 4,  3, 5, 0, 1, 2, 3, 4, 5, 0, 4,    0,    8,    0,    1,  2,
                                    4,  3, 2,  0, 9, 8, 4, 0, 6, 0, 1, 2, 4,    3,    0,    0,    0,  0})));
}

TEST_F(RequestsTest, LightingData_GoesOutBatchByBatchWithoutTheOldest) {
  ConnectIdle();
  client.RequestCommPortControl(1);
  socket.Take();
  for (int batch = 0; batch <= 200; ++batch) {  // three records fit into a message, the fourth does not
    const Bytes values(32000, static_cast<std::uint8_t>(batch));
    for (int record = 0; record < 3; ++record) client.SendDMXIntensities(0, 0, 32000, values);
  }
  socket.Deliver("1100000");
  const auto sent = AcknowledgeAll();
  ASSERT_EQ(sent.size(), 200u);
  for (std::size_t i = 0; i < sent.size(); ++i) {
    ASSERT_EQ(std::string(sent[i].begin(), sent[i].begin() + 7),
              "L" + std::to_string((i + 2) % 10) + "96036");
    EXPECT_EQ(sent[i].size(), 7u + 96036u);
    EXPECT_EQ(sent[i].back(), 0) << "padding";
    EXPECT_EQ(sent[i][17], i + 1) << "the first value";
  }
}

TEST_F(RequestsTest, FaultyArguments_FailWithTheNameOfTheRequest) {
  // Negative, beyond the values, and beyond a record's length.
  for (const auto& [count, values] : {std::pair(std::int16_t{-1}, Bytes(9)),
                                      {std::int16_t{10}, Bytes(9)},
                                      {std::int16_t{32762}, Bytes(32762)}}) {
    for (const bool dmx : {true, false}) {
      client.Reconnect(false, "x", false, true);
      socket.Accept();
      AcknowledgeAll();
      Events();
      if (dmx) client.SendDMXIntensities(0, 0, count, values);
      if (!dmx) client.SendNyxIntensities(0, 0, 0, count, values);
      EXPECT_THAT(Events(), ElementsAre("error 4 Error in SendDMXIntensities|0|", "state"));
      EXPECT_THAT(socket.Take(), IsEmpty());
    }
  }
}

TEST(CommFrame, PayloadBeyondItsLengthField_IsRefused) {
  EXPECT_THAT([] { BuildFrame('L', '0', Bytes(100000)); },
              testing::ThrowsMessage<RuntimeError>("Invalid length for length field: 100000"));
}

}  // namespace
}  // namespace tendril::test
