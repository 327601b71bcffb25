// The run and the rules; simulation_acts.cpp has what the person and the world do.
#include "simulation/simulation.h"

#include <malloc.h>

#include <QAbstractButton>
#include <QApplication>
#include <QLabel>
#include <QPushButton>
#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdio>
#include <utility>
#include <variant>

#include "platform/runtime_error.h"
#include "ui/model/summary_editor.h"

namespace tendril::test {
namespace {

// As the protocol and the operations have them.
constexpr std::uint8_t kSetOption = 0x0A;
constexpr std::uint8_t kSetAddress = 0x0F;
constexpr std::uint8_t kPoll = 0x88;
constexpr std::uint8_t kAccepted = 10;
constexpr std::uint64_t kLongestPauseMs = 300;  // of a unit command, between a reply and its next packet
constexpr int kMostPollsOfPort = 3;
constexpr int kMostPollsOfGet = 33;
constexpr int kMostPollsOfStage = 15;
constexpr std::size_t kMostReplyData = 4050;
constexpr std::size_t kMostWaitingBytes = 48;  // three live commands with their unlocks
// Above what the program holds at the start. Seen are 4.0 MB at the most: the parts of the window that are made later, and
// a flood of a megabyte on its way.
constexpr std::size_t kMostHeapGrowth = 4'718'592;

std::vector<Bytes> SplitPackets(std::span<const std::uint8_t> bytes) {
  std::vector<Bytes> packets(1);
  for (const std::uint8_t byte : bytes) {
    if (byte != 0) {
      packets.back().push_back(byte);
    } else if (!packets.back().empty()) {
      packets.emplace_back();
    }
  }
  if (packets.back().empty()) packets.pop_back();
  return packets;
}

// What the summary makes of records that it shows.
ChannelTable Normalised(ChannelTable records) {
  SummaryEditor editor(records);
  for (std::size_t slot = 0; slot < kPortCount; ++slot) editor.Normalise(slot);
  return records;
}

}  // namespace

std::size_t HeapInUse() { return mallinfo2().uordblks; }

Simulation::Simulation(std::uint64_t seed, Tally& tally, bool narrate)
    : random_(seed),
      tally_(tally),
      narrate_(narrate),
      // Every third clock is near its wrap.
      world_(random_.Chance(33) ? 0u - static_cast<std::uint32_t>(random_.Between(0, 60'000)) : 1000),
      device_(world_.bench.CreateDevice(), world_.time, disturbance_,
              [this](std::span<const std::uint8_t> bytes) { OnWritten(bytes); }),
      link_(device_, world_.time, world_.time, world_.log) {
  if (world_.time.NowMs() > 0x8000'0000) ++tally_.faults["clocks near their wrap"];
  SetUpWorld();
  window_ = std::make_unique<frmNewServoConfig>(link_, world_.time, world_.boxes, panel_.control_panel,
                                                Version{1, 0, 0});
  heap_at_start_ = HeapInUse();
  records_ = window_->WorkingConfiguration();
  auto program = link_.SetPollReplyHandler({});
  link_.SetPollReplyHandler(
      [this, program = std::move(program)](bool success, std::uint8_t unit, std::uint8_t kind, Bytes& data) {
        OnPollReply(success, kind, data);
        if (program) program(success, unit, kind, data);
      });
  panel_.panel.SetPortHandler([this](std::uint8_t port, bool held) {
    Require(!held || !closing_ || !device_.IsOpen() || device_.number() != port,
            "a port is closed before it is given back");
    world_.bench.SetHeldByAnother(port, held);
  });
  world_.boxes.while_open = [this] { WhileBoxOpen(); };
  world_.time.SetObserver([this] {
    CheckTheLine();
    if (boxes_open_ == 0) CheckOperation();
  });
}

Simulation::~Simulation() {
  world_.boxes.while_open = nullptr;
  world_.time.SetObserver(nullptr);
  window_.reset();
}

std::string Simulation::Run() {
  try {
    if (random_.OneIn(16)) {  // where it is seen it is painted, which takes most of the time
      window_->show();
      QApplication::processEvents();
    }
    LetTimePass(random_.Below(200));
    if (random_.Chance(80)) ChoosePort("Comm " + std::to_string(random_.Between(1, 6)));
    const int acts = random_.Between(10, 60);
    for (int act = 0; act < acts && broken_.empty(); ++act) {
      if (random_.Chance(35)) ActAsWorld();
      ActAsPerson();
      LetTimePass(AnyDuration());
    }
    if (broken_.empty() && random_.Chance(50)) CheckRecovery();
    if (broken_.empty()) Close();
  } catch (...) {
    Require(false, ("nothing fails unseen: " + DescribeCurrentFault()).c_str());
  }
  tally_.virtual_ms += world_.time.ElapsedMs();
  return broken_;
}

void Simulation::LetTimePass(std::uint64_t ms) {
  world_.time.Advance(ms);
  if (window_->isVisible()) QApplication::processEvents();
  CheckTheLine();
  if (boxes_open_ == 0) CheckOperation();
  Require(HeapInUse() <= heap_at_start_ + kMostHeapGrowth, "no buffer grows beyond its cap");
}

void Simulation::Require(bool holds, const char* rule) {
  if (holds || !broken_.empty()) return;
  broken_ = rule;
  Note("BROKEN: " + broken_);
}

void Simulation::Note(const std::string& text) {
  Mix({reinterpret_cast<const std::uint8_t*>(text.data()), text.size()});
  if (narrate_)
    std::printf("%10.3f s  %s\n", static_cast<double>(world_.time.ElapsedMs()) / 1000, text.c_str());
}

void Simulation::Mix(std::span<const std::uint8_t> bytes) {
  const auto add = [this](std::uint64_t value) { digest_ = (digest_ ^ value) * 0x100000001b3; };
  add(world_.time.ElapsedMs());
  for (const std::uint8_t byte : bytes) add(byte);
}

bool Simulation::CommandRuns() const {
  return !Find<QAbstractButton>("Command3_0").isEnabledTo(window_.get());
}

bool Simulation::SweepRuns() const {
  for (const char* name : {"cmdTest_0", "cmdTest_1", "cmdTest_3"}) {
    if (Find<QAbstractButton>(name).text() == QStringLiteral("Stop")) return true;
  }
  return false;
}

std::string Simulation::Outcome() const { return Find<QLabel>("lblProgress").text().toStdString(); }

bool Simulation::SummaryShown() const {
  const auto* back = window_->findChild<QAbstractButton*>(QStringLiteral("cmdShowConfig"));
  return back != nullptr && back->isVisibleTo(window_.get());
}

// The summary changes records by showing them.
void Simulation::TakeOverNormalised() {
  if (SummaryShown() && window_->WorkingConfiguration() == Normalised(records_))
    records_ = Normalised(records_);
}

bool Simulation::AllRecordsValid() const {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    if (!std::holds_alternative<OptionBytes>(EncodeOptions(window_->WorkingConfiguration().At(slot))))
      return false;
  }
  return true;
}

// --- What crosses the line ---

void Simulation::OnWritten(std::span<const std::uint8_t> bytes) {
  Require(device_.rts(), "the program transmits only while RTS is asserted");
  Require(!closed_, "a closed window sends nothing");
  Mix(bytes);
  for (const Bytes& packet : SplitPackets(bytes)) OnPacket(packet);
}

void Simulation::OnPacket(const Bytes& packet) {
  if (packet.size() < 4) return;  // an unlock
  const std::uint8_t code = packet[1];
  operation_.last_activity_ms = world_.time.ElapsedMs();
  const bool to_any = code == kSetAddress || (code == kPoll && packet[2] == '*');
  if (code == kPoll || code == kSetAddress || (code == kSetOption && packet[3] != kLivePosition))
    Require(packet[0] == (to_any ? 0xFF : operation_.unit), "a command speaks to the unit that was chosen");
  if (code == kPoll) {
    operation_.last_poll = packet[2];
    Require(polls_ == poll_replies_, "one poll is outstanding at most");
    ++polls_;
    ++operation_.polls;
    ++operation_.polls_of_step;
    poll_ms_ = world_.time.ElapsedMs();
    const double bytes = static_cast<double>(device_.PendingOutput()) + 38 + link_.PollPad();
    poll_time_out_ms_ = static_cast<std::uint64_t>(std::nearbyint(bytes * 10 * 1000 / 19200 * 2));
    device_.ForgetDamage();
    Note(std::string("poll '") + static_cast<char>(packet[2]) + "' of unit " + std::to_string(packet[0]));
  } else if (code == kSetAddress) {
    operation_.polls_of_step = 0;
  } else if (code == kSetOption && packet[2] == kOptionServoPort && packet[3] == kLivePosition) {
    OnPositionSent(packet);
  } else if (code == kSetOption && packet[2] == kOptionServoPort) {
    OnOptionsSent(packet);
  }
}

void Simulation::OnOptionsSent(const Bytes& packet) {
  const int slot = packet[3] - 1;
  Require(slot == operation_.port + 1, "ports are sent one after the other");
  if (!broken_.empty()) return;
  operation_.port = slot;
  operation_.polls_of_step = 0;
  SentPort& port = operation_.ports[static_cast<std::size_t>(slot)];
  const auto encoded = EncodeOptions(window_->WorkingConfiguration().At(static_cast<std::size_t>(slot)));
  Require(std::holds_alternative<OptionBytes>(encoded), "no invalid record is sent");
  if (!broken_.empty()) return;
  port = {.options = std::get<OptionBytes>(encoded)};
  for (const Place& place : units_) {
    const bool hears =
        place.port == device_.number() && (place.unit->unit().id() == packet[0] || packet[0] == 0xFF);
    if (hears && place.unit->AcknowledgementDue()) port.excused = true;
  }
}

void Simulation::OnPositionSent(const Bytes& packet) {
  Require(!operation_.running || operation_.polls == 0, "nothing moves a servo while a command runs");
  // What a sweep and the test buttons send goes beyond the stops on purpose.
  if (SweepRuns() || using_test_button_ || operation_.swept) return;
  ++tally_.seen["slider positions sent"];
  Require(device_.PendingOutput() <= kMostWaitingBytes, "the slider sends no faster than the line");
  const auto channel = static_cast<std::size_t>(std::countr_zero(packet[4]));
  const Microseconds position = packet[5] * 10;
  const auto inside = [&](const ChannelTable& records) {
    const PulsePair& stops = records.At(channel).VirtualStops;
    return position >= stops[0] && position <= stops[1];
  };
  // One that waited its turn can be let go by the act that changes the record.
  Require(inside(window_->WorkingConfiguration()) || inside(records_),
          "the slider's positions lie within the stops");
}

void Simulation::OnAccepted(const DisturbedUnit& unit, const Bytes& packet, bool damaged) {
  if (!operation_.running || operation_.port < 0 || packet.size() < 4) return;
  const auto slot = static_cast<std::size_t>(operation_.port);
  SentPort& port = operation_.ports[slot];
  if (unit.unit().PortOptions(operation_.port + 1) == port.options && packet[3] == operation_.port + 1) {
    port.accepted = true;
  } else if (damaged) {
    port.damage_passed = true;
  } else if (packet[3] == kLivePosition) {
    port.excused = true;  // sent before the command, and heard in it
  }
}

void Simulation::OnPollReply(bool success, std::uint8_t kind, const Bytes& data) {
  ++poll_replies_;
  operation_.last_activity_ms = world_.time.ElapsedMs();
  operation_.last_poll_answered = success;
  operation_.replies_damaged = operation_.replies_damaged || device_.damaged();
  answered_too_early_ = success && device_.pending_when_taken_back() > 0;
  const std::uint64_t took_ms = world_.time.ElapsedMs() - poll_ms_;
  Require(poll_replies_ == polls_, "one poll, one PollReply");
  Require(!link_.PollOutstanding(), "the host may poll again in PollReply");
  Require(success ? took_ms <= poll_time_out_ms_ : took_ms == poll_time_out_ms_,
          "a poll ends with its time-out");
  Require(data.size() <= kMostReplyData, "a reply's data stay under their cap");
  Note(success ? "replied, " + std::to_string(data.size()) + " bytes" : "not replied");
  if (success && kind == 'n' && data.size() >= 10 && (data[0] < 1 || data[0] > 8))
    operation_.no_such_port = true;
  if (success && kind == '0' && data.size() >= 2 && data[1] == kAccepted && operation_.port >= 0 &&
      device_.damaged())
    operation_.ports[static_cast<std::size_t>(operation_.port)].excused = true;
}

void Simulation::CheckTheLine() {
  if (!link_.PollOutstanding()) {
    Require(polls_ == poll_replies_, "a poll that ends raises its PollReply");
    Require(!link_.PortOpen() || device_.rts(), "RTS is asserted while no poll is outstanding");
  }
  // Damaged input can look like the echo of a poll that is still on its way out. And when a late unit's words were
  // taken for the answer to such a poll, its echo is taken for that of the next one.
  const std::size_t undriven_bytes = CountOnLines(&LineCounters::undriven_bytes);
  if (undriven_bytes == undriven_bytes_) return;
  Require(device_.damaged() || answered_too_early_, "no byte leaves while the line is released");
  tally_.seen["bytes into a released line, after a false echo"] += undriven_bytes - undriven_bytes_;
  undriven_bytes_ = undriven_bytes;
}

std::size_t Simulation::CountOnLines(std::size_t LineCounters::*counter) {
  std::size_t sum = 0;
  for (const std::int32_t port : kPorts) sum += world_.bench.Line(port).counters().*counter;
  return sum;
}

// --- Unit commands ---

void Simulation::CheckOperation() {
  if (operation_.running) {
    if (!CommandRuns()) return EndOperation();
    const std::uint64_t silent_ms = world_.time.ElapsedMs() - operation_.last_activity_ms;
    Require(silent_ms <= kLongestPauseMs + (link_.PollOutstanding() ? poll_time_out_ms_ : 0),
            "a command goes on, or ends");
    const bool send = operation_.port >= 0;
    Require(operation_.polls_of_step <= (send                       ? kMostPollsOfPort
                                         : operation_.what == "GET" ? kMostPollsOfGet
                                                                    : kMostPollsOfStage),
            "a command does not poll more often than it may");
  }
  if (!(window_->WorkingConfiguration() == records_)) TakeOverNormalised();
  Require(window_->WorkingConfiguration() == records_,
          "only the person and a get that succeeds change the records");
  CheckPanel();
}

void Simulation::EndOperation() {
  operation_.running = false;
  const std::string outcome = Outcome();
  const std::size_t boxes = BoxesShown() - operation_.boxes_before;
  const std::string title = boxes == 0 ? std::string() : operation_.first_box;
  Note(operation_.what + " ended: " + outcome);
  if (outcome.starts_with("SUCCESS")) {
    Require(boxes == 0, "a success shows no box");
    Require(!operation_.no_such_port, "a port that no unit has ends a get");
    if (operation_.what == "UPDATE") {
      Require(operation_.last_poll == '+' && operation_.last_poll_answered,
              "SUCCESS of a change of the ID: a unit has answered by the new one");
    }
    if (operation_.what == "SEND") CheckSend();
    if (operation_.what == "GET") CheckGet();
  } else if (title == "Internal Error") {
    Require(operation_.what == "SEND" && boxes == 1, "an invalid record ends a send with one box");
    Require(!AllRecordsValid(), "only an invalid record is called so");
  } else {
    Require(outcome == "COMMAND FAILED!", "a command ends with one of its outcomes");
    Require(boxes == 1, "a failure shows one box");
    if (title == "No Repsonse" && !operation_.last_poll_answered)
      Require(operation_.polls_of_step == kMostPollsOfPort, "a send asks three times before it gives up");
    if (title == "Send Error" && operation_.what == "GET")
      Require(operation_.polls == kMostPollsOfGet, "a get asks 33 times before it gives up");
    if (title == "Cannot Find Unit" || title == "Cannot Change Unit ID")
      Require(operation_.polls_of_step == kMostPollsOfStage, "a change of the ID asks fifteen times");
  }
  TakeOverNormalised();
  Require(outcome.starts_with("SUCCESS: Upload") || window_->WorkingConfiguration() == records_,
          "a get that fails leaves the records as they were");
  records_ = window_->WorkingConfiguration();
  ++tally_.seen[operation_.what + ": " +
                (title.empty() ? outcome.substr(0, outcome.find('\'')) : title.substr(0, title.find('(')))];
}

// Who says SUCCESS says that a unit took each port as it was encoded.
void Simulation::CheckSend() {
  Require(operation_.port + 1 == static_cast<int>(kPortCount), "a success has sent all ports");
  for (const SentPort& port : operation_.ports) {
    if (port.accepted) continue;
    Require(port.damage_passed || port.excused,
            "SUCCESS of a send: the unit accepted each port as it was encoded");
    ++tally_.seen[port.damage_passed ? "sends whose damage kept a checksum valid"
                                     : "sends with a damaged or stale acknowledgement"];
  }
}

// Replies have no checksum: damaged ones, and those of units that talked at once, can be read as another configuration.
void Simulation::CheckGet() {
  const bool collided = CountOnLines(&LineCounters::garbled_bytes) != operation_.garbled_before;
  if (operation_.replies_damaged || collided) {
    ++tally_.seen[collided ? "gets with colliding replies" : "gets with a damaged reply"];
    return;
  }
  const ChannelTable& records = window_->WorkingConfiguration();
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const bool as_held = std::any_of(units_.begin(), units_.end(), [&](const Place& place) {
      ChannelTable held = records;
      held.At(slot) = DecodeOptions(place.unit->unit().PortOptions(static_cast<int>(slot) + 1));
      held.At(slot).Received = records.At(slot).Received;
      return place.port == device_.number() && records == (SummaryShown() ? Normalised(held) : held);
    });
    Require(as_held, "SUCCESS of a get: each record is what a unit holds");
  }
}

// A panel that has behaved all the time has every port but the one that the program has asked for last.
void Simulation::CheckPanel() {
  const bool connected = panel_.control_panel.Client().IsConnected();
  if (panel_always_there_) Require(connected || !was_connected_, "a connection that nothing disturbs stays");
  was_connected_ = connected;
  if (!panel_behaved_ || !panel_.control_panel.Client().ReadyToTransmit()) return;
  for (const std::uint8_t port : panel_ports_) {
    Require(panel_.panel.Holds(port) || panel_.control_panel.RequestedPort() == port,
            "a port that was taken from the Control Panel is given back");
  }
}

// Whatever has happened: when all is well again, all works again.
void Simulation::CheckRecovery() {
  calm_ = true;
  LetTimePass(60'000);
  Require(!CommandRuns(), "a command ends");
  CalmDown();
  LetTimePass(10'000);
  Require(panel_.control_panel.Client().IsConnected(), "the client connects again");
  Require(panel_.control_panel.Client().ReadyToTransmit(), "a request that nobody answers is given up");
  ChoosePort("Comm 1");
  if (!link_.PortOpen()) {  // it was given back to the panel only now
    LetTimePass(5000);
    ChoosePort("Comm 1");
  }
  ChooseUnit(1);
  Require(link_.PortOpen() && link_.CommPort() == 1, "the port can be chosen again");
  if (!broken_.empty() || !AllRecordsValid()) return;
  for (const char* button : {"Command3_0", "Command3_1"}) {
    RunCommand(Find<QAbstractButton>(button));
    LetTimePass(15'000);
    Require(Outcome().starts_with("SUCCESS"), "a command succeeds when all is well");
  }
}

}  // namespace tendril::test
