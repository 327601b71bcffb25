#include "ui/model/port_sentences.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

PortFacts NotOpen(PortFault fault, PortHolder holder = {}) {
  return {.chosen = 3, .fault = fault, .reason = "Bad file", .holder = std::move(holder)};
}
PortFacts Requested(PortControl request, std::int16_t port = 3) {
  return {.chosen = 3, .fault = PortFault::kControlPanelHasIt, .requested = port, .request = request};
}

TEST(PortSentences, SayWhetherThePortIsOpenAndWhyNot_AndWhatIsBorrowed) {
  struct {
    PortFacts facts;
    const char* port;
    const char* borrowed = "";
  } const cases[] = {
      {{.any_listed = false}, "No serial port found: plug in the adapter"},
      {{}, "No port chosen"},
      {{.open = 3}, "No port chosen; Comm 3 is still open"},
      {{.chosen = 3, .open = 3, .device = "X (Y), /dev/ttyUSB0"}, "Comm 3 open: X (Y), /dev/ttyUSB0"},
      {NotOpen(PortFault::kNone), "Comm 3 is not open"},
      {NotOpen(PortFault::kInUse), "Comm 3 is not open: another program has it"},
      {NotOpen(PortFault::kInUse, {"picocom", 812}), "Comm 3 is not open: picocom (process 812) has it"},
      {NotOpen(PortFault::kInUse, {"ModemManager"}), "Comm 3 is not open: perhaps ModemManager has it"},
      {NotOpen(PortFault::kNotAllowed), "Comm 3 is not open: you are not allowed to use it"},
      {NotOpen(PortFault::kGone), "Comm 3 is not open: it was unplugged"},
      {{.chosen = 3, .fault = PortFault::kGone, .back = true}, "Comm 3 is back: Enter opens it"},
      {NotOpen(PortFault::kOther), "Comm 3 is not open: Bad file"},
      {Requested(PortControl::kNone), "Comm 3 is not open: the Control Panel has it"},
      {Requested(PortControl::kAsked), "Comm 3 is not open: the Control Panel is asked for it",
       "The Control Panel is asked for Comm 3 and has not answered yet."},
      {Requested(PortControl::kGranted), "Comm 3 is not open: given up, Enter opens it",
       "Comm 3 is taken from the Control Panel: shows cannot use it. It goes back when this window is closed "
       "or another "
       "port is asked for."},
      {Requested(PortControl::kRefused), "Comm 3 is not open: the Control Panel keeps it",
       "The Control Panel refuses to give up Comm 3: shows go on using it."},
      {Requested(PortControl::kRefused, 4), "Comm 3 is not open: the Control Panel has it"},
      {Requested(PortControl::kUnanswered), "Comm 3 is not open: the Control Panel is silent",
       "The Control Panel was asked for Comm 3 and does not answer: perhaps shows cannot use it. Choose it "
       "again."},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(PortSentence(c.facts), c.port);
    EXPECT_EQ(BorrowedPortSentence(c.facts), c.borrowed);
  }
}

}  // namespace
}  // namespace tendril
