// The trace of the line and its verdicts, on the bench.
#include "trace/line_trace.h"

#include <gmock/gmock.h>

#include <memory>
#include <string>
#include <vector>

#include "bench/faulty_units.h"
#include "bench/virtual_ports.h"
#include "serial/hw_serial.h"
#include "serial/packets.h"
#include "support/memory_log.h"
#include "support/simulated_time.h"
#include "trace/line_verdict.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using Kind = LineVerdict::Kind;

// Comm 1 is chosen, with a line of these options. `unit`: the unit at 05 on it; empty for a well-behaved one, "none" for none.
struct TracedLine {
  explicit TracedLine(const std::string& unit = "", const VirtualLineOptions& options = {}) {
    bench.AddPort(1, options);
    if (unit.empty()) bench.Attach<VirtualUnit>(1, 0x05);
    if (!unit.empty() && unit != "none") bench.Attach(1, FindFaultKind(unit)->make(0x05));
    link.SetLineObserver([this](const LineEvent& event) { trace.Note(event, time.NowMs()); });
    link.SetBaudRate(19200);
    link.SetCommPort(1);
  }
  ~TracedLine() { link.SetLineObserver(nullptr); }

  void Poll(std::uint8_t kind, int times = 1) {
    for (int i = 0; i < times; ++i) {
      ASSERT_TRUE(link.cmdPollStation(0x05, kind));
      time.AdvanceUntil([this] { return !link.PollOutstanding(); }, 1000);
      time.Advance(250);
    }
  }
  Kind Verdict() const { return JudgeLine(trace).kind; }
  // "program: poll unit 05, kind '*'" for each entry since the last call.
  std::vector<std::string> Lines() {
    std::vector<std::string> lines;
    for (const TraceEntry& entry : trace.Entries())
      lines.push_back((entry.Direction().empty() ? "" : entry.Direction() + ": ") + entry.Meaning());
    trace.Clear();
    return lines;
  }

  SimulatedTime time;
  MemoryLog log;
  VirtualPorts bench{time, time};
  std::unique_ptr<SerialDevice> device = bench.CreateDevice();
  LineTrace trace;
  HwSerial link{*device, time, time, log};
};

TEST(LineTrace, Exchanges_AreShownPacketByPacket) {
  TracedLine line;
  line.link.SetPortOpen(true);
  EXPECT_THAT(line.Lines(), ElementsAre("Comm 1 at 19200 bit/s is open", "RTS on: the program has the line"));
  line.link.cmdSetoption(0x05, 0, 17, 3, 1, 60, 240);
  line.time.Advance(2);  // the unlock is not all echoed yet
  line.Poll('*');
  EXPECT_THAT(
      line.Lines(),
      ElementsAre("program: unlock unit 05", "program: set options of port 3 of unit 05",
                  "program: poll unit 05, kind '*'", "program: echo: unlock unit 05",
                  "program: echo: set options of port 3 of unit 05", "program: echo: poll unit 05, kind '*'",
                  "RTS off: the line is free for the reply", "unit: reply to '*': here is unit 05",
                  "RTS on: the program has the line", "program: 2 zero bytes"));
  // Held back during a poll, and sent in one piece.
  ASSERT_TRUE(line.link.cmdPollStation(0x06, 'n'));
  line.link.SendUnlockCmd(5);
  line.link.SendUnlockCmd(6);
  line.time.Advance(300);
  line.bench.Unplug(1);
  line.time.Advance(100);
  EXPECT_THAT(line.Lines(),
              ElementsAre("program: poll unit 06, kind 'n'", "program: echo: poll unit 06, kind 'n'",
                          "RTS off: the line is free for the reply", "no reply in time",
                          "RTS on: the program has the line", "program: unlock unit 05",
                          "program: unlock unit 06", "program: 1 zero byte", "program: 1 zero byte",
                          "the adapter was unplugged: the port is closed"));
  EXPECT_THROW(line.link.SetRTS(true), RuntimeError);
  EXPECT_THAT(line.Lines(), ElementsAre(testing::StartsWith("the port cannot be opened: ")));
}

TEST(LineTrace, LiveCommandsWithoutAPoll_AreEchoesWhenTheInputIsTaken) {
  TracedLine line;
  for (int i = 0; i < 300; ++i) {
    line.link.cmdSetoption(0x05, 0, 17, 137, 4, static_cast<std::uint8_t>(10 + i % 200), 255);
    line.time.Advance(20);
  }
  line.Poll('*');
  for (const TraceEntry& entry : line.trace.Entries())
    EXPECT_NE(entry.kind, TraceEntry::Kind::kNoise) << entry.Meaning();
}

TEST(LineVerdict, Verdict_IsThatOfTheLastPolls) {
  const VirtualLineOptions no_echo{.echo = false};
  const VirtualLineOptions half_echo{.echo_loses_every = 3};
  const struct {
    const char* unit;
    VirtualLineOptions options;
    Kind verdict;
  } cases[] = {{"", {}, Kind::kAnswers},
               {"", no_echo, Kind::kAnswers},
               {"none", {}, Kind::kEchoOnly},
               {"none", no_echo, Kind::kSilence},
               {"", half_echo, Kind::kEchoDamaged},
               {"none", half_echo, Kind::kEchoDamaged},
               {"mute", {}, Kind::kEchoOnly},
               {"deaf", {}, Kind::kAnswersSometimes},
               {"garbling", {}, Kind::kNoReply},
               {"rambling", {}, Kind::kAnswersInNoise},
               {"late", {}, Kind::kEchoOnly},
               {"late", no_echo, Kind::kTooLate},
               {"unfinished", {}, Kind::kNoReply},
               {"too-slow", no_echo, Kind::kTooLate},
               {"wrong-address", {}, Kind::kOtherAnswer}};
  for (const auto& each : cases) {
    TracedLine line(each.unit, each.options);
    SCOPED_TRACE(std::string(each.unit) + (each.options.echo ? "" : ", no echo"));
    line.Poll('*', 4);
    EXPECT_EQ(line.Verdict(), each.verdict) << JudgeLine(line.trace).sentence;
  }
}

TEST(LineVerdict, OddReplies_AreNoAnswers) {
  const Bytes kNoEcho{};
  const Bytes kEcho = PollPacket(0x05, '*', 45);
  const Bytes kEchoOfRead = PollPacket(0x05, 'n', 45);
  const struct {
    Bytes poll, before, after, dropped;
    Kind verdict;
  } cases[] = {{kEchoOfRead, kEchoOfRead, {0xFE, '0', 1, 10, 0}, {}, Kind::kOtherAnswer},
               {kEcho, kEcho, {0xFE, '*', 4, 0}, {}, Kind::kOtherUnit},
               {kEcho, kNoEcho, {0}, {}, Kind::kSilence},
               {kEcho, kEcho, {0, 0, 0}, {}, Kind::kEchoOnly},
               {kEcho, kEcho, {0, 5, '*', 5, 0, 7}, {}, Kind::kOtherAnswer},
               {kEcho, kEcho, {}, {0xFE, 7, 9, 0}, Kind::kEchoOnly},
               {kEcho, kEcho, {}, {0xFE, '*', 5, 0}, Kind::kTooLate}};
  for (const auto& each : cases) {
    LineTrace trace;
    const auto note = [&](LineEvent::Kind kind, const Bytes& bytes) {
      trace.Note({.kind = kind, .bytes = bytes}, 0);
    };
    note(LineEvent::Kind::kOpened, {});
    note(LineEvent::Kind::kPollSent, each.poll);
    note(LineEvent::Kind::kReceived, each.before);
    note(LineEvent::Kind::kReceived, each.after);
    note(LineEvent::Kind::kTimeOut, {});
    note(LineEvent::Kind::kDropped, each.dropped);
    const LineVerdict verdict = JudgeLine(trace);
    EXPECT_EQ(verdict.kind, each.verdict) << verdict.sentence;
  }
}

TEST(LineVerdict, UnitThatRefuses_IsNotCalledWell) {
  TracedLine line("locked");
  line.link.cmdSetoption(0x05, 0, 17, 3, 1, 60, 240);
  EXPECT_EQ(line.Verdict(), Kind::kNothingAsked);
  line.Poll('0');
  EXPECT_EQ(line.Verdict(), Kind::kNotAccepted);
}

TEST(LineVerdict, AdapterThatFailsInASearch_IsNoUnitThatAnswers) {
  TracedLine line;
  line.Poll('*');
  const Bytes next = PollPacket(0x06, '*', 45);
  for (const auto& [echo, verdict] : {std::pair(next, Kind::kAnswers), std::pair(Bytes{}, Kind::kSilence)}) {
    line.trace.Note({.kind = LineEvent::Kind::kPollSent, .bytes = next}, 0);
    line.trace.Note({.kind = LineEvent::Kind::kReceived, .bytes = echo}, 0);
    line.trace.Note({.kind = LineEvent::Kind::kTimeOut}, 0);
    EXPECT_EQ(line.Verdict(), verdict);
  }
}

TEST(LineVerdict, AdapterWithoutEcho_IsKnownByAReply) {
  TracedLine line("", {.echo = false});
  line.Poll('*');
  for (int poll = 0; poll < 3; ++poll) {
    ASSERT_TRUE(line.link.cmdPollStation(0x06, '*'));
    line.time.Advance(300);
  }
  EXPECT_EQ(line.Verdict(), Kind::kAnswers);  // a search has found a unit
  for (int poll = 0; poll < 3; ++poll) {
    ASSERT_TRUE(line.link.cmdPollStation(0x06, 'n'));
    line.time.Advance(300);
  }
  EXPECT_EQ(line.Verdict(), Kind::kNoAnswer);
}

TEST(LineVerdict, Changes_AreSeen) {
  TracedLine line;
  EXPECT_EQ(line.Verdict(), Kind::kNotOpened);
  line.link.SetPortOpen(true);
  EXPECT_EQ(line.Verdict(), Kind::kNothingAsked);
  line.Poll('*');
  VirtualUnit& other = line.bench.Attach<VirtualUnit>(1, 0x05, ReplyTiming{.turn_round_us = 2700});
  line.Poll('*');
  EXPECT_TRUE(PerhapsSeveralUnits(line.trace));
  EXPECT_EQ(line.Verdict(), Kind::kAnswersSometimes);
  line.Poll('*', 2);
  EXPECT_EQ(line.Verdict(), Kind::kNoReply);
  line.bench.Detach(1, other);
  line.Poll('*', 9);
  EXPECT_EQ(line.Verdict(), Kind::kAnswersSometimes);
  line.Poll('*');
  EXPECT_EQ(line.Verdict(), Kind::kAnswers);
  ASSERT_TRUE(line.link.cmdPollStation(0x05, '*'));
  line.bench.Unplug(1);
  line.time.Advance(300);
  EXPECT_EQ(line.Verdict(), Kind::kPortGone);
  EXPECT_THROW(line.link.SetRTS(true), RuntimeError);
  EXPECT_EQ(line.Verdict(), Kind::kCannotOpen);
  line.bench.Replug(1);
  line.link.SetPortOpen(true);
  line.link.SetPortOpen(false);
  EXPECT_EQ(line.Verdict(), Kind::kClosed);
}

TEST(LineTrace, Flood_KeepsTheNewestEntriesAndLittleOfEach) {
  LineTrace trace;
  const Bytes noise = [] {
    Bytes bytes(300, 7);
    bytes.back() = 0;
    return bytes;
  }();
  for (std::size_t i = 0; i < LineTrace::kMaxEntries; ++i)
    trace.Note({.kind = LineEvent::Kind::kReceived, .bytes = noise}, 0);
  ASSERT_EQ(trace.Entries().size(), LineTrace::kMaxEntries);
  for (const TraceEntry& entry : {trace.Entries().front(), trace.Entries().back()}) {
    EXPECT_EQ(entry.bytes.size(), TraceEntry::kMaxBytes);
    EXPECT_GT(entry.size, TraceEntry::kMaxBytes);
  }
  EXPECT_EQ(trace.Entries().back().number - trace.Entries().front().number, LineTrace::kMaxEntries - 1);
}

}  // namespace
}  // namespace tendril::test
