#include "ctl/unit_session.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "ctl/bounded_wait.h"
#include "platform/hex_text.h"
#include "trace/line_verdict.h"
#include "trace/trace_text.h"

namespace tendril::ctl {
namespace {

// A reply that comes later than its poll waits must not be taken for one of the next unit.
constexpr std::int32_t kLateReplyMs = 500;
// A unit that floods the line does so for seconds.
constexpr int kMaxWaits = 10;
// No window is painted first.
constexpr std::int32_t kAtOnceMs = 1;
constexpr int kMaxLooks = 3;
constexpr char kPortGone[] = "The port went away: plug the adapter in again.";
constexpr char kNotStarted[] = "Nothing was sent.";

// What boxes say of a unit that answers each poll, by how they begin, in words that need no window.
struct BoxWords {
  std::string_view box;
  const char* words;  // after the unit
};
constexpr BoxWords kBoxWords[] = {
    {"Error:1 ",
     " answers, but does not report all of its eight ports. Read it again; if that fails, too, it is "
     "faulty."},
    {"Upload error:", " reports a port that does not exist: check that it is a Tendril unit."},
    {"Unit did not respond",
     " answers, but does not acknowledge what was sent. Send again; if that fails, too, it is faulty."}};

// The text of a box as one line, without the trace of the failure.
std::string InOneLine(std::string_view text) {
  std::string line;
  while (!text.empty()) {
    const std::size_t end = text.find("\r\n");
    const std::string_view part = text.substr(0, end);
    text = end == text.npos ? std::string_view() : text.substr(end + 2);
    if (part.empty() || part.starts_with("Trace:")) continue;
    if (!line.empty()) line += line.ends_with('.') || line.ends_with(':') ? " " : ": ";
    line += part;
  }
  return line;
}

}  // namespace

UnitSession::UnitSession(Environment& environment)
    : environment_(environment),
      link_(environment.device, environment.timers, environment.clock, environment.log),
      commands_(link_, trace_, environment.timers, *this, *this, *this, records_,
                {.polled =
                     [this](std::uint8_t /*unit*/, bool replied) {
                       replies_ += replied ? 1 : 0;
                       misses_ += replied ? 0 : 1;
                       unanswered_ = unanswered_ || !replied;
                       ReportStep();
                     },
                 .compared = [this](std::uint8_t /*unit*/, const OptionTable& held) { held_ = held; }}) {
  link_.SetLineObserver([this](const LineEvent& event) { trace_.Note(event, environment_.now_ms()); });
  // A command that runs would open the port again, and another adapter may stand behind it then.
  link_.SetPortHandler([this](bool open) {
    if (!open) link_.SetCommPort(0);
  });
  commands_.running.SetReporter([this](const CommandReport& report) { report_ = report; });
  environment_.stop.SetHandler([this] { OnStop(); });
}

UnitSession::~UnitSession() {
  environment_.stop.SetHandler(nullptr);
  commands_.Stop();
}

CommandResult UnitSession::Send(std::uint8_t unit, const ChannelTable& records) {
  records_ = records;
  CommandResult result = Run(unit, commands_.send);
  const bool begun = !report_.what.empty();
  if (begun) result.written = commands_.send.WhatIsWritten();
  return result;
}

CommandResult UnitSession::LookFor(std::uint8_t unit) {
  const StepHandler on_step = std::exchange(on_step_, nullptr);  // its steps are those of a search
  CommandResult result;
  for (int looks = 0; looks < kMaxLooks; ++looks) {
    result = Find(unit, unit, kAtOnceMs);
    const auto& found = Search().found;
    if (!result.Done() || !found.empty()) break;
  }
  on_step_ = on_step;
  if (!result.Done()) return result;
  const auto& found = Search().found;
  const bool clean =
      found.size() == 1 && found.front().id == unit && found.front().what == FoundUnit::What::kAnswers;
  return clean ? result : CommandResult{CommandResult::Kind::kFailed, Reason(), {}};
}

CommandResult UnitSession::Read(std::uint8_t unit, OptionTable& held) {
  OptionTable read{};
  CommandResult result = ReadOnce(unit, read);
  if (result.Done() && InDoubt()) {
    const OptionTable first = read;
    result = ReadOnce(unit, read);
    if (result.Done() && read != first) {
      return {CommandResult::Kind::kFailed,
              "Two readings of unit " + HexByte(unit) + " differ: check the wiring and the adapter."};
    }
  }
  if (result.Done()) held = read;
  return result;
}

// A port that is opened may bring stray bytes before the first echo.
bool UnitSession::InDoubt() const {
  bool exchanging = false;
  bool noise = false;
  for (const TraceEntry& entry : trace_.Entries()) {
    exchanging |= entry.kind == TraceEntry::Kind::kEcho || entry.kind == TraceEntry::Kind::kReply;
    noise |= exchanging && IsNoise(entry);
  }
  return misses_ > 0 || noise;
}

CommandResult UnitSession::ReadOnce(std::uint8_t unit, OptionTable& held) {
  held_.reset();
  CommandResult result = Run(unit, commands_.compare);
  if (result.Done()) held = *held_;
  result.aftermath.clear();  // a read leaves no trace in the unit
  return result;
}

CommandResult UnitSession::Find(std::uint8_t first, std::uint8_t last, std::int32_t first_poll_ms) {
  commands_.find.SetRange(first, last, first_poll_ms);
  CommandResult result = Run(first, commands_.find);
  result.aftermath.clear();  // Search() has it
  return result;
}

CommandResult UnitSession::SetId(std::uint8_t new_id) { return Run(new_id, commands_.change_id); }

CommandResult UnitSession::Run(std::uint8_t unit, UnitOperation& operation) {
  report_ = {};
  if (unit != unit_) AwaitLateReplies();
  if (environment_.stop.Made()) return {CommandResult::Kind::kCancelled, {}, kNotStarted};
  if (!link_.PortOpen()) return {CommandResult::Kind::kFailed, kPortGone, kNotStarted};
  trace_.Clear();
  unit_ = unit;
  step_.clear();
  box_.clear();
  replies_ = 0;
  misses_ = 0;
  succeeded_ = false;
  operation.Start();
  environment_.waiting.Until([this] { return !commands_.running.Active(); });
  if (succeeded_) return {CommandResult::Kind::kDone, {}, report_.aftermath};
  if (report_.cancelled) return {CommandResult::Kind::kCancelled, {}, report_.aftermath};
  return {CommandResult::Kind::kFailed, Reason(), report_.aftermath};
}

void UnitSession::AwaitLateReplies() {
  if (!std::exchange(unanswered_, false)) return;
  for (int waits = 0; waits < kMaxWaits; ++waits) {
    const bool stopped = WaitUntil(environment_, kLateReplyMs,
                                   [this] { return environment_.stop.Made() || !link_.PortOpen(); });
    if (stopped || environment_.device.ReadAll().empty()) return;
  }
}

// What the line shows says more than a box, unless the last poll was answered.
std::string UnitSession::Reason() const {
  if (!link_.PortOpen()) return kPortGone;
  const LineVerdict verdict = JudgeLine(trace_);
  if (verdict.kind == LineVerdict::Kind::kEchoOnly) {
    return "Unit " + HexByte(trace_.Polls().back().unit) +
           " does not answer: check its power, its ID and the wiring.";
  }
  const bool box_only =
      verdict.kind == LineVerdict::Kind::kAnswers || verdict.kind == LineVerdict::Kind::kNothingAsked;
  if (!box_only) return verdict.sentence;
  const auto* words =
      std::ranges::find_if(kBoxWords, [this](const BoxWords& each) { return box_.starts_with(each.box); });
  return words == std::end(kBoxWords) ? InOneLine(box_) : "Unit " + HexByte(unit_) + words->words;
}

void UnitSession::OnStop() { commands_.Cancel(); }

int UnitSession::FrameWidth() const { return 1; }

void UnitSession::SetTitle(const std::string& title) {
  const std::string before = commands_.running.What() + ": ";
  if (!title.starts_with(before)) return;
  step_ = title.substr(before.size());
  ReportStep();
}

void UnitSession::SetColour(ProgressColour colour) { succeeded_ = colour == ProgressColour::kGreen; }

void UnitSession::Show(const BoxMessage& message) {
  if (box_.empty()) box_ = message.text;
}

void UnitSession::ReportStep() const {
  if (!on_step_ || !commands_.running.Active()) return;
  const bool finding = commands_.running.Operation() == &commands_.find;
  on_step_(step_, finding ? Search().Part() : std::min(1.0, replies_ / static_cast<double>(kPortCount)));
}

}  // namespace tendril::ctl
