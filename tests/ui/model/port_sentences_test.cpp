#include "ui/model/port_sentences.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

struct Case {
  PortFacts facts;
  const char* sentence;
};

TEST(PortSentence, SaysWhetherThePortIsOpenAndWhyNot) {
  const Case cases[] = {
      {{.any_listed = false}, "No serial port found: plug in the adapter"},
      {{}, "No port chosen"},
      {{.open = 3}, "No port chosen; Comm 3 is still open"},
      {{.chosen = 3, .open = 3, .device = "FT232R USB UART (FTDI), /dev/ttyUSB0"},
       "Comm 3 open: FT232R USB UART (FTDI), /dev/ttyUSB0"},
      {{.chosen = 3}, "Comm 3 is not open"},
      {{.chosen = 3, .fault = PortFault::kInUse}, "Comm 3 is not open: another program has it"},
      {{.chosen = 3, .fault = PortFault::kInUse, .holder = {"picocom", 812}},
       "Comm 3 is not open: picocom (process 812) has it"},
      {{.chosen = 3, .fault = PortFault::kInUse, .holder = {"ModemManager", 0}},
       "Comm 3 is not open: perhaps ModemManager has it"},
      {{.chosen = 3, .fault = PortFault::kNotAllowed}, "Comm 3 is not open: you are not allowed to use it"},
      {{.chosen = 3, .fault = PortFault::kGone}, "Comm 3 is not open: it was unplugged"},
      {{.chosen = 3, .fault = PortFault::kGone, .back = true}, "Comm 3 is back: Enter opens it"},
      {{.chosen = 3, .fault = PortFault::kOther, .reason = "Bad file"}, "Comm 3 is not open: Bad file"},
      {{.chosen = 3,
        .fault = PortFault::kControlPanelHasIt,
        .requested = 4,
        .request = PortControl::kGranted},
       "Comm 3 is not open: the Control Panel has it"},
  };
  for (const Case& c : cases) EXPECT_EQ(PortSentence(c.facts), c.sentence);
}

TEST(PortSentence, FollowsWhatBecameOfTheRequest) {
  struct RequestCase {
    PortControl request;
    const char* port;
    const char* borrowed;
  };
  const RequestCase cases[] = {
      {PortControl::kNone, "the Control Panel has it", ""},
      {PortControl::kAsked, "the Control Panel is asked for it",
       "The Control Panel is asked for Comm 3 and has not answered yet."},
      {PortControl::kGranted, "given up, Enter opens it",
       "Comm 3 is taken from the Control Panel: shows cannot use it. It goes back when this window is closed "
       "or another "
       "port is asked for."},
      {PortControl::kRefused, "the Control Panel keeps it",
       "The Control Panel refuses to give up Comm 3: shows go on using it."},
      {PortControl::kUnanswered, "the Control Panel is silent",
       "The Control Panel was asked for Comm 3 and does not answer: perhaps shows cannot use it. Choose it "
       "again."},
  };
  for (const auto& [request, port, borrowed] : cases) {
    PortFacts facts{.chosen = 3, .fault = PortFault::kControlPanelHasIt, .requested = 3, .request = request};
    EXPECT_EQ(PortSentence(facts), std::string("Comm 3 is not open: ") + port);
    EXPECT_EQ(BorrowedPortSentence(facts), borrowed);
    facts.chosen = 1;
    EXPECT_EQ(BorrowedPortSentence(facts), request == PortControl::kRefused ? "" : borrowed);
  }
}

}  // namespace
}  // namespace tendril
