#include "bench/virtual_control_panel.h"

#include <gmock/gmock.h>

#include <string>
#include <string_view>
#include <utility>

#include "bench/virtual_tcp_socket.h"
#include "support/simulated_time.h"

namespace tendril {
namespace {

using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

Bytes Raw(std::string_view text) { return {text.begin(), text.end()}; }

std::string Text(std::span<const std::uint8_t> bytes) { return {bytes.begin(), bytes.end()}; }

constexpr std::string_view kPhysicalLightsOn = "P700001\1";

// A panel that holds Comm 3, and a program that is connected to it.
class VirtualControlPanelTest : public testing::Test {
 protected:
  VirtualControlPanelTest() {
    panel_.AddPort(3);
    panel_.SetPortHandler([this](std::uint8_t port, bool held) { port_changes_.emplace_back(port, held); });
    panel_.SetTap([this](PanelSide from, std::span<const std::uint8_t> bytes) {
      shown_ += (from == PanelSide::kProgram ? ">" : "<") + Text(bytes);
    });
  }

  PanelConnection Connection() {
    return {.send = [this](std::span<const std::uint8_t> bytes) { said_ += Text(bytes); },
            .hang_up = [this] { said_ += "<end>"; }};
  }

  // What the panel says to `text` at once.
  std::string Say(std::string_view text) {
    session_.Receive(Raw(text));
    return std::exchange(said_, {});
  }

  test::SimulatedTime time_;
  VirtualControlPanel panel_{time_};
  std::vector<std::pair<int, bool>> port_changes_;
  std::string said_;
  std::string shown_;
  PanelSession session_{panel_, Connection()};
};

TEST_F(VirtualControlPanelTest, Requests_AreDoneOrRefused) {
  const struct {
    std::string request;
    std::string reply;
  } cases[] = {
      {"I000015Tendril Utility", "1000000"},
      {"C100002\3\0"s, "1100000"},
      {"C200002\7\0"s, "1200000"},         // not one of its ports
      {"C300009C200002\7\1"s, "1300000"},  // a repeated request
      {"C400002\3\2", "0400000"},
      {"P700001\2", "0700000"},
      {"A800000", "1800000"},
      {"L200004\1\0\0\0"s, "1200000"},
      {"Z300002??", "0300000"},
      {"C400009D200002\3\0"s, "0400000"},  // another request inside is none
  };
  for (const auto& each : cases) EXPECT_EQ(Say(each.request), each.reply) << each.request;
  EXPECT_EQ(panel_.requests()[0],
            (PanelRequest{.identifier = 'I', .sequence = '0', .payload = Raw("Tendril Utility")}));
  EXPECT_TRUE(panel_.requests()[3].nested);
}

TEST_F(VirtualControlPanelTest, Requests_ComeInAnyPieces) {
  std::string replies;
  for (const char byte : "C100002\3\0A200000C300002\3\1"s) replies += Say({&byte, 1});
  EXPECT_EQ(replies, "110000012000001300000");
}

TEST_F(VirtualControlPanelTest, Garbage_EndsTheConnectionAtItsFirstByte) {
  for (const std::string begin : {"1", "[", "Cx", "C0-", "C0000x"}) {
    PanelSession session(panel_, Connection());
    shown_.clear();
    session.Receive(Raw("A100000" + begin));
    EXPECT_EQ(std::exchange(said_, {}), "1100000<end>");
    EXPECT_EQ(shown_, ">A100000<1100000>" + begin);
    session.Receive(Raw("A200000"));
    EXPECT_EQ(said_, "");
  }
}

TEST_F(VirtualControlPanelTest, Port_IsGivenUpAndTakenBackOnce) {
  EXPECT_TRUE(panel_.Holds(3));
  Say("C000002\3\1");  // held anyway
  Say("C100002\3\0"s);
  EXPECT_FALSE(panel_.Holds(3));
  Say("C200002\3\0"s);
  Say("C300009C100002\3\1");  // repeated inside another: to no effect
  Say("C400002\4\0"s);
  PanelSession(panel_, Connection()).Receive(Raw("C500002\3\1"));  // on any connection
  EXPECT_TRUE(panel_.Holds(3));
  EXPECT_FALSE(panel_.Holds(4));
  EXPECT_THAT(port_changes_, ElementsAre(Pair(3, false), Pair(3, true)));

  panel_.SetBehaviour(PanelBehaviour::kRefuse, 1);
  Say("C600002\3\0"s);
  EXPECT_TRUE(panel_.Holds(3));
  panel_.SetBehaviour(PanelBehaviour::kSilent, 1);
  Say("C700002\3\0"s);  // heard and done
  EXPECT_FALSE(panel_.Holds(3));
}

TEST_F(VirtualControlPanelTest, Behaviour_IsThatOfSoManyReplies) {
  panel_.SetBehaviour(FindPanelBehaviour("wrong-identifier")->behaviour, 1);
  EXPECT_EQ(Say("A900000"), "2900000");
  EXPECT_EQ(Say("A000000"), "1000000");
  panel_.SetBehaviour(FindPanelBehaviour("close-in-middle")->behaviour, 1);
  EXPECT_EQ(Say("A900000"), "190<end>");
}

class VirtualTcpSocketTest : public testing::Test {
 protected:
  static constexpr std::uint16_t kPort = 8837;

  VirtualTcpSocketTest() {
    socket_.SetEvents({.connected = [this] { events_.push_back("connected"); },
                       .data_arrived = [this] { events_.push_back("data " + Text(socket_.Receive(7))); },
                       .ended =
                           [this](std::int32_t number, const std::string& /*description*/) {
                             events_.push_back("ended " + std::to_string(number));
                           }});
  }

  std::vector<std::string> EventsOf(std::uint64_t ms) {
    time_.Advance(ms);
    return std::exchange(events_, {});
  }
  void ConnectAndWait() {
    socket_.Connect("127.0.0.1", kPort);
    ASSERT_THAT(EventsOf(5), ElementsAre("connected"));
  }

  test::SimulatedTime time_;
  VirtualControlPanel panel_{time_};
  VirtualTcpSocket socket_{panel_, kPort, time_};
  std::vector<std::string> events_;
};

TEST_F(VirtualTcpSocketTest, NoPanel_RefusesOrStaysSilent) {
  panel_.SetListener(PanelListener::kOff);
  socket_.Connect("127.0.0.1", kPort);
  EXPECT_THAT(EventsOf(60'000), ElementsAre("ended 10061"));
  EXPECT_EQ(socket_.State(), TcpState::kClosed);
  panel_.SetListener(PanelListener::kStuck);
  socket_.Connect("127.0.0.1", kPort);
  EXPECT_THAT(EventsOf(60'000), IsEmpty());
  EXPECT_EQ(socket_.State(), TcpState::kConnecting);
  EXPECT_EQ(time_.RunningTimers(), 0);
  panel_.SetListener(PanelListener::kOpen);
  ConnectAndWait();  // once more, from within an attempt
}

TEST_F(VirtualTcpSocketTest, PanelThatEnds_IsReportedAfterItsLastData) {
  socket_.SetLocalPort(4000);
  ConnectAndWait();
  EXPECT_EQ(socket_.LocalPort(), 4000);
  socket_.Send(Raw(kPhysicalLightsOn));
  panel_.SetListener(PanelListener::kOff);
  EXPECT_THAT(events_, IsEmpty()) << "no event comes from within a call";
  EXPECT_EQ(socket_.State(), TcpState::kConnected);
  EXPECT_THAT(EventsOf(5), ElementsAre("data 1700000", "ended 10054"));
  EXPECT_EQ(socket_.State(), TcpState::kClosed);
}

}  // namespace
}  // namespace tendril
