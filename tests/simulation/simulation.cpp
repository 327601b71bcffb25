// The run and the rules; simulation_acts.cpp has what the user and the world do.
#include "simulation/simulation.h"

#include <QAbstractButton>
#include <QApplication>
#include <QLabel>
#include <algorithm>
#include <bit>
#include <cstdio>
#include <utility>
#include <variant>

#include "platform/runtime_error.h"

namespace tendril::test {
namespace {

constexpr std::uint8_t kSetOption = 0x0A;
constexpr std::uint8_t kSetAddress = 0x0F;
constexpr std::uint8_t kPoll = 0x88;
// Of a unit command: its longest pause and the longest time-out of a poll.
constexpr std::uint64_t kMaxSilenceMs = 300 + 200;
constexpr std::size_t kMaxReplyData = 4050;

std::vector<Bytes> SplitPackets(std::span<const std::uint8_t> bytes) {
  std::vector<Bytes> packets(1);
  for (const std::uint8_t byte : bytes) {
    if (byte != 0) {
      packets.back().push_back(byte);
    } else if (!packets.back().empty()) {
      packets.emplace_back();
    }
  }
  return packets;
}

}  // namespace

Simulation::Simulation(std::uint64_t seed, bool narrate)
    : random_(seed),
      narrate_(narrate),
      plain_(random_.Chance(40)),
      // Every third clock is near its wrap.
      world_(random_.Chance(33) ? 0u - static_cast<std::uint32_t>(random_.Between(0, 60'000)) : 1000) {
  SetUpWorld();
  device_.on_write = [this](std::span<const std::uint8_t> bytes) { OnWritten(bytes); };
  window_ = std::make_unique<frmNewServoConfig>(link_, world_.time, world_.boxes, panel_.control_panel,
                                                ProgramInfo{{1, 0, 0}, {}, {}});
  records_ = window_->WorkingConfiguration();
  auto program = link_.SetPollReplyHandler({});
  link_.SetPollReplyHandler(
      [this, program = std::move(program)](bool success, std::uint8_t unit, std::uint8_t kind, Bytes& data) {
        OnPollReply(success, data);
        if (program) program(success, unit, kind, data);
      });
  world_.boxes.while_open = [this] { WhileBoxOpen(); };
  world_.time.SetObserver([this] { Check(); });
}

Simulation::~Simulation() {
  world_.boxes.while_open = nullptr;
  world_.time.SetObserver(nullptr);
  window_.reset();
}

std::string Simulation::Run() {
  try {
    if (random_.OneIn(16)) {  // painting takes most of the time
      window_->show();
      QApplication::processEvents();
    }
    LetTimePass(random_.Below(200));
    if (random_.Chance(80)) ChoosePort(random_.Between(1, 6));
    const int acts = random_.Between(10, 60);
    for (int act = 0; act < acts && broken_.empty(); ++act) {
      if (random_.Chance(35)) ActAsWorld();
      ActAsUser();
      LetTimePass(AnyDuration());
    }
    if (broken_.empty() && random_.Chance(50)) CheckRecovery();
    if (broken_.empty()) Close();
  } catch (...) {
    Require(false, "every failure is handled: " + DescribeCurrentFault());
  }
  return broken_;
}

void Simulation::LetTimePass(std::uint64_t ms) {
  world_.time.Advance(ms);
  if (window_->isVisible()) QApplication::processEvents();
  Check();
}

void Simulation::Require(bool holds, std::string_view rule) {
  if (holds || !broken_.empty()) return;
  broken_ = rule;
  Note("BROKEN: " + broken_);
}

void Simulation::Note(const std::string& text) const {
  if (narrate_)
    std::printf("%10.3f s  %s\n", static_cast<double>(world_.time.ElapsedMs()) / 1000, text.c_str());
}

bool Simulation::CommandRuns() const {
  return !Find<QAbstractButton>("Command3_0").isEnabledTo(window_.get());
}

bool Simulation::SweepRuns() const {
  const auto buttons = window_->findChildren<QAbstractButton*>();
  return std::any_of(buttons.begin(), buttons.end(),
                     [](const auto* button) { return button->text() == QStringLiteral("Stop"); });
}

bool Simulation::SummaryShown() const { return !Find("fraChosenServo").isVisibleTo(window_.get()); }

bool Simulation::AllRecordsValid() const {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const auto encoded = EncodeOptions(window_->WorkingConfiguration().At(slot));
    if (!std::holds_alternative<OptionBytes>(encoded)) return false;
  }
  return true;
}

// --- What crosses the line ---

void Simulation::OnWritten(std::span<const std::uint8_t> bytes) {
  Require(!closed_, "a closed window sends nothing");
  Require(!undoing_, "undo, copy and paste send nothing");
  for (const Bytes& packet : SplitPackets(bytes)) OnPacket(packet);
}

void Simulation::OnPacket(const Bytes& packet) {
  if (packet.size() < 4) return;  // an unlock
  const std::uint8_t code = packet[1];
  operation_.last_activity_ms = world_.time.ElapsedMs();
  if (code != kPoll && code != kSetAddress && code != kSetOption) return;
  if (code == kSetOption && packet[3] == kLivePosition) return OnPositionSent(packet);
  const bool to_any = code == kSetAddress || (code == kPoll && packet[2] == '*');
  Require(operation_.what == "FIND" || packet[0] == (to_any ? 0xFF : operation_.unit),
          "a command addresses the unit that was chosen");
  Require(operation_.what != "FIND" || (code == kPoll && packet[2] == '*'),
          "a search only asks who is there");
  Require(operation_.what != "COMPARE" || (code == kPoll && packet[2] == 'n'), "a comparison only reads");
  if (code != kPoll) {
    operation_.polls_of_step = 0;
    if (code == kSetOption) OnOptionsSent(packet);
    return;
  }
  Require(!PollOutstanding(), "one poll is outstanding at most");
  ++polls_;
  ++operation_.polls_of_step;
  operation_.last_poll = packet[2];
}

void Simulation::OnOptionsSent(const Bytes& packet) {
  const std::size_t slot = operation_.ports++;
  Require(packet[3] == slot + 1 && slot < kPortCount, "ports are sent one after the other");
  if (!broken_.empty()) return;
  OptionBytes& options = operation_.options[slot];
  std::copy_n(packet.begin() + 4, options.size(), options.begin());
  const auto encoded = EncodeOptions(window_->WorkingConfiguration().At(slot));
  const auto* bytes = std::get_if<OptionBytes>(&encoded);
  Require(bytes != nullptr && *bytes == options, "a record is sent as it is encoded, and no invalid one");
}

void Simulation::OnPositionSent(const Bytes& packet) {
  const bool begun = operation_.ports > 0 || operation_.polls_of_step > 0;
  Require(!operation_.running || !begun, "nothing moves a servo while a command runs");
  // What a sweep and the test buttons send goes beyond the stops on purpose.
  if (SweepRuns() || using_test_button_ || operation_.swept) return;
  const auto channel = static_cast<std::size_t>(std::countr_zero(packet[4]));
  const Microseconds position = packet[5] * 10;
  const auto inside = [&](const ChannelTable& records) {
    const PulsePair& stops = records.At(channel).VirtualStops;
    return position >= stops[0] && position <= stops[1];
  };
  // The act that changes the record can send a position that waited.
  Require(inside(window_->WorkingConfiguration()) || inside(records_),
          "the slider's positions lie within the stops");
}

void Simulation::OnPollReply(bool success, const Bytes& data) {
  ++poll_replies_;
  operation_.last_activity_ms = world_.time.ElapsedMs();
  operation_.last_poll_answered = success;
  Require(poll_replies_ == polls_, "one poll, one PollReply");
  Require(data.size() <= kMaxReplyData, "a reply's data stay under their cap");
}

// --- Unit commands ---

void Simulation::Check() {
  if (plain_) {
    for (const std::int32_t port : kPorts) {
      Require(world_.bench.Line(port).counters().undriven_bytes == 0,
              "no byte leaves while the line is released");
    }
  }
  const QString port_sentence = Find<QLabel>("lblPort").text();
  const QString open = QString::fromStdString(CommName(OpenPort()));
  const bool said_open = port_sentence.section(u' ', 2, 2) == QStringLiteral("open:") ||
                         port_sentence.endsWith(QStringLiteral(" is still open"));
  Require(said_open == link_.PortOpen() && (!said_open || port_sentence.contains(open)),
          "the window says which port is open");
  if (boxes_open_ > 0) return;
  if (operation_.running) CheckCommand();
  if (SummaryShown()) records_ = window_->WorkingConfiguration();  // it changes records by showing them
  Require(window_->WorkingConfiguration() == records_,
          "only the user and a successful get change the records");
}

void Simulation::CheckCommand() {
  if (!CommandRuns()) return EndOperation();
  Require(world_.time.ElapsedMs() - operation_.last_activity_ms <= kMaxSilenceMs,
          "a command goes on, or ends");
  Require(operation_.polls_of_step <= operation_.max_polls, "a command polls no more often than it may");
}

void Simulation::EndOperation() {
  operation_.running = false;
  const std::string outcome = Find<QLabel>("lblProgress").text().toStdString();
  const bool success = outcome.starts_with("SUCCESS");
  Note(operation_.what + " ended: " + outcome);
  const std::size_t boxes = BoxesShown() - operation_.boxes_before;
  Require(boxes == (success ? 0 : 1) || (boxes == 0 && operation_.cancelled),
          "a failure shows one box, a success and a cancel none");
  if (!success) {
    Require(outcome == "COMMAND FAILED!" || !AllRecordsValid(), "a command ends with one of its outcomes");
    return;
  }
  if (operation_.what == "GET") records_ = window_->WorkingConfiguration();
  if (operation_.what == "FIND") return;
  if (operation_.what == "UPDATE") {
    Require(operation_.last_poll == '+' && operation_.last_poll_answered,
            "SUCCESS of a change of the ID: a unit has answered by the new one");
  } else if (plain_ && operation_.what != "COMPARE") {
    CheckData();
  }
}

// What a send or a get that succeeded has moved.
void Simulation::CheckData() {
  const auto place = std::find_if(units_.begin(), units_.end(),
                                  [this](const Place& each) { return each.port == operation_.comm_port; });
  const VirtualUnit& unit = place->unit->unit();
  for (int port = 1; port <= kUnitPorts; ++port) {
    const auto slot = static_cast<std::size_t>(port - 1);
    if (operation_.what == "SEND") {
      Require(unit.PortOptions(port) == operation_.options[slot],
              "SUCCESS of a send: the unit holds each port");
    } else if (!SummaryShown()) {
      ChannelTable held = records_;
      held.At(slot) = DecodeOptions(unit.PortOptions(port));
      held.At(slot).Received = records_.At(slot).Received;
      Require(held == records_, "SUCCESS of a get: each record is what the unit holds");
    }
  }
}

// Whatever has happened: when all is well again, all works again.
void Simulation::CheckRecovery() {
  calm_ = true;
  LetTimePass(60'000);
  Require(!CommandRuns(), "a command ends");
  CalmDown();
  LetTimePass(10'000);
  Require(panel_.panel.connections() == 1, "the client connects again");
  for (const std::uint8_t port : panel_ports_) {
    Require(!panel_behaved_ || panel_.panel.Holds(port) || panel_.control_panel.RequestedPort() == port,
            "a port that was taken from the Control Panel is given back");
  }
  ChoosePort(1);  // the Control Panel may have it and gives it up then
  LetTimePass(5000);
  ChoosePort(1);
  ChooseUnit(1);
  Require(OpenPort() == 1, "the port can be chosen again");
  if (!broken_.empty() || !AllRecordsValid()) return;
  for (const char* button : {"Command3_0", "Command3_1"}) {
    RunCommand(Find<QAbstractButton>(button));
    LetTimePass(15'000);
    Require(Find<QLabel>("lblProgress").text().startsWith(QStringLiteral("SUCCESS")),
            "a command succeeds when all is well");
  }
}

}  // namespace tendril::test
