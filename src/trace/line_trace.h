// LineTrace: what happened on the line to the network, and how the last polls ended.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>

#include "platform/bytes.h"
#include "serial/line_event.h"
#include "serial/reply_parser.h"
#include "trace/packet_meaning.h"

namespace tendril {

// One packet or event.
struct TraceEntry {
  enum class Kind {
    kOpened,
    kOpenFailed,
    kClosed,
    kLost,
    kRtsOn,
    kRtsOff,
    kFault,
    kSent,
    kEcho,   // what the program sent, as the adapter returns it
    kReply,  // the reply to the poll
    kNoise,  // anything else that arrived; also a reply that no poll waits for
    kTimeOut
  };
  // Bytes that an entry keeps.
  static constexpr std::size_t kMaxBytes = 256;

  std::uint64_t number;  // counted from 0; never given again
  std::int64_t time_ms;  // since 1970, UTC
  Kind kind;
  std::uint32_t size = 0;  // of the packet; bytes has the first ones
  Bytes bytes = {};
  std::string text = {};  // what the event says

  // Who sent it: "program", "unit", or "" for what is no packet. An echo is the program's.
  std::string Direction() const;
  // "poll unit 01, kind 'n'"; for an echo "echo: ..."; for an event what happened: "no reply in time".
  std::string Meaning() const;
};

// How a poll ended.
enum class PollOutcome {
  kAnswered,
  kAnsweredInNoise,  // and bytes before the reply that belong to nothing
  kNotAccepted,      // an answer: the unit has not accepted a configuration command since the last such poll
  kSilence,          // nothing arrived, not even the echo
  kEchoOnly,         // no unit answers
  kNoAnswer,         // nothing arrived, but the adapter never returns what is sent
  kTooLate,          // no reply, and then one came; an adapter that switches its driver by itself hears that
  kEchoDamaged,      // the echo came with bytes missing or changed
  kNoReply,          // bytes came that make no reply
  kOtherAnswer,      // a packet came that is no answer to this poll
  kOtherUnit         // the reply names another unit
};

struct PollSeen {
  std::uint8_t unit = 0;
  std::uint8_t kind = 0;
  bool replied = false;  // the link took a reply
  PollOutcome outcome = PollOutcome::kSilence;
};

// IDs that were polled one after the other, to find units.
struct SearchSeen {
  int polled = 0;
  int answered = 0;
};

// Where the port is.
enum class PortSeen { kNeverOpened, kOpen, kOpenFailed, kClosed, kLost };

// Keeps the last entries, in some 1 MiB, at most 4. Follows the line with a parser of its own, as the link does.
class LineTrace {
 public:
  static constexpr std::size_t kMaxEntries = 10'000;
  // Polls that are kept in short, since the port was opened.
  static constexpr std::size_t kMaxPolls = 20;

  // The next event, as from HwSerial::SetLineObserver(), at `time_ms` (see TraceEntry).
  void Note(const LineEvent& event, std::int64_t time_ms);
  // Forgets the entries; how the last polls ended stays.
  void Clear();
  // `handler` is called after each change of the entries. It only asks the trace.
  void SetChangedHandler(std::function<void()> handler) { changed_ = std::move(handler); }

  // In order; the numbers are consecutive.
  const std::deque<TraceEntry>& Entries() const { return entries_; }
  // How the polls ended, the last one last. A poll that waits for its end is not among them.
  const std::deque<PollSeen>& Polls() const { return polls_; }
  // The search that the last poll belongs to; nothing polled when it belongs to none.
  const SearchSeen& Search() const { return search_; }
  // Whether something was sent since the last poll: a live position, which nothing answers.
  bool SentSincePoll() const { return !poll_ && !unechoed_.empty(); }
  PortSeen Port() const { return port_; }
  // Why the port could not be opened, in the system's words.
  const std::string& PortFault() const { return port_fault_; }

 private:
  // The poll that waits for its end.
  struct WaitingPoll {
    std::uint8_t unit = 0;
    std::uint8_t kind = 0;
    bool echoed = false;        // its echo is complete
    bool strays = false;        // bytes after the echo that make no reply
    bool other_answer = false;  // a packet that replies to something else, or to someone else
    Bytes before_echo = {};     // what arrived until the echo was complete, without zero bytes
  };

  void Add(TraceEntry::Kind kind, std::span<const std::uint8_t> bytes = {}, std::string_view text = {});
  void AddAt(std::int64_t time_ms, TraceEntry::Kind kind, std::span<const std::uint8_t> bytes,
             std::string_view text = {});
  void NoteOpened(std::string_view text);
  void NoteClosed(PortSeen port, TraceEntry::Kind kind, std::string_view text = {});
  void NoteSent(std::span<const std::uint8_t> bytes);
  void NotePoll(std::span<const std::uint8_t> packet);
  void NoteReceived(std::span<const std::uint8_t> bytes);
  void NoteDropped(std::span<const std::uint8_t> bytes);
  void NotePacket(const Bytes& packet, ReplyParser::Verdict verdict);
  void NoteTimeOut();
  void NoteLateReply(std::uint8_t code);
  bool EchoBegun() const;
  void FlushReceived();
  void EndPoll(bool replied);
  void NoteSearch(bool replied);
  PollOutcome JudgeReply() const;
  PollOutcome JudgeTimeOut() const;
  bool MostlyEcho(const Bytes& received) const;

  std::deque<TraceEntry> entries_;
  std::deque<PollSeen> polls_;
  SearchSeen search_;
  std::uint64_t next_number_ = 0;
  std::int64_t now_ms_ = 0;
  std::int64_t received_ms_ = 0;  // when the last byte came
  PortSeen port_ = PortSeen::kNeverOpened;
  std::string port_fault_;
  bool no_echo_ = false;  // the last reply came without an echo: the adapter hears nothing while it sends

  std::optional<WaitingPoll> poll_;
  ReplyParser parser_;
  PacketSplitter received_;
  // The last packets that were sent since the last poll ended, without zero bytes.
  std::deque<Bytes> unechoed_;
  std::function<void()> changed_;
};

}  // namespace tendril
