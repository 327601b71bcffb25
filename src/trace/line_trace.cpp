#include "trace/line_trace.h"

#include <algorithm>

#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

// More than the input buffer has room for: while nothing is polled, nothing takes the echoes out of it.
constexpr std::size_t kMaxUnechoed = 2048;
// Packets that one exchange can have: a configuration command with its unlock, the poll, and what was held back.
constexpr std::size_t kPacketsOfExchange = 8;
// What arrives without any end is cut here.
constexpr std::size_t kLongestPiece = ReplyParser::kMaxData;

static_assert(LineTrace::kMaxEntries * (sizeof(TraceEntry) + TraceEntry::kMaxBytes + 2 * sizeof(void*)) <
              std::size_t{4} * 1024 * 1024);

Bytes WithoutZeros(std::span<const std::uint8_t> bytes) {
  Bytes rest;
  std::copy_if(bytes.begin(), bytes.end(), std::back_inserter(rest),
               [](std::uint8_t byte) { return byte != kFrameByte; });
  return rest;
}

// Whether the code of a reply is the kind of its poll. The others are no letters, or have replies of several codes.
bool NamesItsReply(std::uint8_t kind) { return kind > ' ' && kind != 100 && kind != 111 && kind < 200; }

constexpr std::uint8_t kKindAcknowledge = '0';
constexpr std::uint8_t kKindSearch = '*';

// Whether a reply to this kind begins with the unit's ID.
bool NamesTheUnit(std::uint8_t kind) { return kind == kKindSearch || kind == '+'; }

}  // namespace

std::string TraceEntry::Direction() const {
  switch (kind) {
    case Kind::kSent:
    case Kind::kEcho:
      return "program";
    case Kind::kReply:
    case Kind::kNoise:
      return "unit";
    case Kind::kOpened:
    case Kind::kOpenFailed:
    case Kind::kClosed:
    case Kind::kLost:
    case Kind::kRtsOn:
    case Kind::kRtsOff:
    case Kind::kFault:
    case Kind::kTimeOut:
      break;
  }
  return {};
}

std::string TraceEntry::Meaning() const {
  switch (kind) {
    case Kind::kOpened:
      return text + " is open";
    case Kind::kOpenFailed:
      return "the port cannot be opened: " + text;
    case Kind::kClosed:
      return "the port is closed";
    case Kind::kLost:
      return "the adapter was unplugged: the port is closed";
    case Kind::kRtsOn:
      return "RTS on: the program has the line";
    case Kind::kRtsOff:
      return "RTS off: the line is free for the reply";
    case Kind::kFault:
      return text;
    case Kind::kSent:
      return DescribeSent(bytes);
    case Kind::kEcho:
      return "echo: " + DescribeSent(bytes);
    case Kind::kReply:
      return DescribeReceived(bytes);
    case Kind::kNoise:
      if (!IsReply(bytes)) return DescribeReceived(bytes);
      return DescribeReceived(bytes) +
             (bytes.back() == kFrameByte ? ", not waited for" : ", without its end");
    case Kind::kTimeOut:
      return "no reply in time";
  }
  return {};
}

void LineTrace::Note(const LineEvent& event, std::int64_t time_ms) {
  now_ms_ = time_ms;
  switch (event.kind) {
    case LineEvent::Kind::kOpened:
      return NoteOpened(event.text);
    case LineEvent::Kind::kOpenFailed:
      return NoteClosed(PortSeen::kOpenFailed, TraceEntry::Kind::kOpenFailed, event.text);
    case LineEvent::Kind::kClosed:
      return NoteClosed(PortSeen::kClosed, TraceEntry::Kind::kClosed);
    case LineEvent::Kind::kLost:
      return NoteClosed(PortSeen::kLost, TraceEntry::Kind::kLost);
    case LineEvent::Kind::kRtsOn:
      return Add(TraceEntry::Kind::kRtsOn);
    case LineEvent::Kind::kRtsOff:
      return Add(TraceEntry::Kind::kRtsOff);
    case LineEvent::Kind::kFault:
      return Add(TraceEntry::Kind::kFault, {}, event.text);
    case LineEvent::Kind::kSent:
      return NoteSent(event.bytes);
    case LineEvent::Kind::kPollSent:
      return NotePoll(event.bytes);
    case LineEvent::Kind::kReceived:
      return NoteReceived(event.bytes);
    case LineEvent::Kind::kDropped:
      return NoteDropped(event.bytes);
    case LineEvent::Kind::kTimeOut:
      return NoteTimeOut();
  }
}

void LineTrace::Clear() {
  entries_.clear();
  if (changed_) changed_();
}

void LineTrace::Add(TraceEntry::Kind kind, std::span<const std::uint8_t> bytes, std::string_view text) {
  AddAt(now_ms_, kind, bytes, text);
}

void LineTrace::AddAt(std::int64_t time_ms, TraceEntry::Kind kind, std::span<const std::uint8_t> bytes,
                      std::string_view text) {
  const auto kept = bytes.first(std::min(bytes.size(), TraceEntry::kMaxBytes));
  entries_.push_back({.number = next_number_++,
                      .time_ms = time_ms,
                      .kind = kind,
                      .size = static_cast<std::uint32_t>(bytes.size()),
                      .bytes = {kept.begin(), kept.end()},
                      .text = std::string(text.substr(0, TraceEntry::kMaxBytes))});
  if (entries_.size() > kMaxEntries) entries_.pop_front();
  if (changed_) changed_();
}

void LineTrace::NoteOpened(std::string_view text) {
  port_ = PortSeen::kOpen;
  no_echo_ = false;
  polls_.clear();
  unechoed_.clear();
  Add(TraceEntry::Kind::kOpened, {}, text);
}

void LineTrace::NoteClosed(PortSeen port, TraceEntry::Kind kind, std::string_view text) {
  port_ = port;
  port_fault_ = text;
  poll_.reset();
  FlushReceived();
  Add(kind, {}, text);
}

// Packets that were held back during a poll come in one piece.
void LineTrace::NoteSent(std::span<const std::uint8_t> bytes) {
  PacketSplitter sent;
  const auto add = [&] {
    const Bytes packet = sent.Take();
    Add(TraceEntry::Kind::kSent, packet);
    if (Bytes content = WithoutZeros(packet); !content.empty()) unechoed_.push_back(std::move(content));
    if (unechoed_.size() > kMaxUnechoed) unechoed_.pop_front();
  };
  for (const std::uint8_t byte : bytes) {
    if (sent.Push(byte)) add();
  }
  if (!sent.Empty()) add();
}

void LineTrace::NotePoll(std::span<const std::uint8_t> packet) {
  if (!EchoBegun()) FlushReceived();
  poll_ = WaitingPoll{.unit = packet[1], .kind = packet[3]};
  parser_.Start(packet[1]);
  NoteSent(packet);
}

void LineTrace::NoteReceived(std::span<const std::uint8_t> bytes) {
  received_ms_ = now_ms_;
  for (const std::uint8_t byte : bytes) {
    if (poll_ && !poll_->echoed && byte != kFrameByte && poll_->before_echo.size() < TraceEntry::kMaxBytes)
      poll_->before_echo.push_back(byte);
    const auto verdict = poll_ ? parser_.Push(byte) : ReplyParser::Verdict::kNeedMore;
    const bool ended = received_.Push(byte) || verdict != ReplyParser::Verdict::kNeedMore;
    if (ended || received_.Size() >= kLongestPiece) NotePacket(received_.Take(), verdict);
  }
}

void LineTrace::NoteDropped(std::span<const std::uint8_t> bytes) {
  received_ms_ = now_ms_;
  for (const std::uint8_t byte : bytes) {
    if (received_.Push(byte) || received_.Size() >= kLongestPiece)
      NotePacket(received_.Take(), ReplyParser::Verdict::kNeedMore);
  }
}

void LineTrace::NotePacket(const Bytes& packet, ReplyParser::Verdict verdict) {
  if (verdict == ReplyParser::Verdict::kReplyComplete) {
    AddAt(received_ms_, TraceEntry::Kind::kReply, packet);
    return EndPoll(true);
  }
  const Bytes content = WithoutZeros(packet);
  const auto sent = std::find(unechoed_.begin(), unechoed_.end(), content);
  const bool echo = verdict == ReplyParser::Verdict::kEchoSeen || sent != unechoed_.end();
  const bool ended = packet.back() == kFrameByte;
  if (sent != unechoed_.end() && ended) unechoed_.erase(unechoed_.begin(), sent + 1);
  AddAt(received_ms_, echo ? TraceEntry::Kind::kEcho : TraceEntry::Kind::kNoise, packet);
  if (!poll_) {
    if (ended && IsReply(packet)) NoteLateReply(content[1]);
    return;
  }
  if (verdict == ReplyParser::Verdict::kEchoSeen) {
    poll_->echoed = true;
  } else if (poll_->echoed && !content.empty()) {
    poll_->strays = true;
    const bool of_other_address = ended && content.size() > 1 && content[1] == poll_->kind;
    poll_->other_answer = poll_->other_answer || of_other_address;
  }
}

// `code`: of a reply that no poll waits for.
void LineTrace::NoteLateReply(std::uint8_t code) {
  if (polls_.empty()) return;
  PollSeen& poll = polls_.back();
  const bool none_came = poll.outcome == PollOutcome::kSilence || poll.outcome == PollOutcome::kEchoOnly ||
                         poll.outcome == PollOutcome::kNoAnswer;
  if (none_came && code == poll.kind) poll.outcome = PollOutcome::kTooLate;
}

// On a busy machine some bytes of a command come back before the poll is sent.
bool LineTrace::EchoBegun() const {
  const Bytes begun = WithoutZeros(received_.Seen());
  return !begun.empty() && std::any_of(unechoed_.begin(), unechoed_.end(), [&begun](const Bytes& sent) {
    return begun.size() <= sent.size() && std::equal(begun.begin(), begun.end(), sent.begin());
  });
}

// What came without an end is shown, too.
void LineTrace::FlushReceived() {
  if (received_.HasContent()) return NotePacket(received_.Take(), ReplyParser::Verdict::kNeedMore);
  received_.Take();
}

void LineTrace::NoteTimeOut() {
  if (!poll_) return;
  if (!received_.Empty()) NotePacket(received_.Take(), ReplyParser::Verdict::kNeedMore);
  Add(TraceEntry::Kind::kTimeOut);
  EndPoll(false);
}

void LineTrace::EndPoll(bool replied) {
  NoteSearch(replied);
  polls_.push_back({poll_->unit, poll_->kind, replied, replied ? JudgeReply() : JudgeTimeOut()});
  if (polls_.size() > kMaxPolls) polls_.pop_front();
  // A damaged echo is one, too.
  if (replied) no_echo_ = !poll_->echoed && poll_->before_echo.front() == kProgramAddress;
  poll_.reset();
  unechoed_.clear();
  if (changed_) changed_();
}

// A search polls one ID after the other, and some of them twice.
void LineTrace::NoteSearch(bool replied) {
  const bool of_search = poll_->kind == kKindSearch && poll_->unit != kAllUnits;
  const std::uint8_t before = polls_.empty() ? kAllUnits : polls_.back().unit;
  if (!of_search || poll_->unit < before) search_ = {};
  if (!of_search) return;
  const bool again = search_.polled > 0 && poll_->unit == before;
  if (!again) ++search_.polled;
  if (replied && !(again && polls_.back().replied)) ++search_.answered;
}

PollOutcome LineTrace::JudgeReply() const {
  if (NamesItsReply(poll_->kind) && parser_.code() != poll_->kind) return PollOutcome::kOtherAnswer;
  const bool names_other = NamesTheUnit(poll_->kind) && poll_->unit != kAllUnits && !parser_.data().empty() &&
                           parser_.data()[0] != poll_->unit;
  if (names_other) return PollOutcome::kOtherUnit;
  const bool refused =
      poll_->kind == kKindAcknowledge && parser_.data().size() > 1 && parser_.data()[1] != kReplyAccepted;
  if (refused) return PollOutcome::kNotAccepted;
  return poll_->strays ? PollOutcome::kAnsweredInNoise : PollOutcome::kAnswered;
}

PollOutcome LineTrace::JudgeTimeOut() const {
  if (!poll_->echoed) {
    if (poll_->before_echo.empty()) return no_echo_ ? PollOutcome::kNoAnswer : PollOutcome::kSilence;
    return MostlyEcho(poll_->before_echo) ? PollOutcome::kEchoDamaged : PollOutcome::kNoReply;
  }
  if (poll_->other_answer) return PollOutcome::kOtherAnswer;
  return poll_->strays ? PollOutcome::kNoReply : PollOutcome::kEchoOnly;
}

// Whether at least half of what was sent last is in `received`, in order: a damaged echo lacks bytes.
bool LineTrace::MostlyEcho(const Bytes& received) const {
  Bytes sent;
  const std::size_t older = unechoed_.size() - std::min(unechoed_.size(), kPacketsOfExchange);
  for (std::size_t i = older; i < unechoed_.size(); ++i)
    sent.insert(sent.end(), unechoed_[i].begin(), unechoed_[i].end());
  std::size_t found = 0;
  auto next = sent.begin();
  for (const std::uint8_t byte : received) {
    const auto match = std::find(next, sent.end(), byte);
    if (match == sent.end()) continue;
    ++found;
    next = match + 1;
  }
  return found > 0 && 2 * found >= sent.size();
}

}  // namespace tendril
