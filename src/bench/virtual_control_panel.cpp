#include "bench/virtual_control_panel.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace tendril {
namespace {

constexpr std::size_t kFrameHeader = 7;  // identifier, sequence digit, five digits of the length
constexpr std::uint8_t kDone = '1';
constexpr std::uint8_t kRefused = '0';

constexpr std::size_t kKeptRequests = 1000;

// Programs wait a second for a reply.
constexpr std::int32_t kSlowMs = 600;
constexpr std::int32_t kTooSlowMs = 1500;
constexpr std::int32_t kByteGapMs = 50;

// Ten times the largest frame that there can be.
constexpr std::size_t kFloodPieces = 100;
constexpr std::size_t kFloodPieceBytes = 10'000;

constexpr PanelBehaviourKind kBehaviourKinds[] = {
    {"refuse", "refuses every request", PanelBehaviour::kRefuse},
    {"silent", "never answers", PanelBehaviour::kSilent},
    {"slow", "answers after 600 ms, just soon enough", PanelBehaviour::kSlow},
    {"too-slow", "answers after 1500 ms", PanelBehaviour::kTooSlow},
    {"byte-by-byte", "sends one byte of its answer every 50 ms", PanelBehaviour::kByteByByte},
    {"wrong-sequence", "answers with the next sequence digit", PanelBehaviour::kWrongSequence},
    {"wrong-identifier", "answers with neither \"done\" nor \"refused\"", PanelBehaviour::kWrongIdentifier},
    {"letter-in-length", "answers with a letter in the length", PanelBehaviour::kLetterInLength},
    {"flood", "answers with a million bytes", PanelBehaviour::kFlood},
    {"close-in-middle", "hangs up in the middle of its answer", PanelBehaviour::kCloseInMiddle},
};

bool IsDigit(std::uint8_t byte) { return byte >= '0' && byte <= '9'; }
bool IsLetter(std::uint8_t byte) { return (byte >= 'A' && byte <= 'Z') || (byte >= 'a' && byte <= 'z'); }

// The payload's length, from a header whose digits are digits.
std::size_t PayloadSize(std::span<const std::uint8_t> frame) {
  std::size_t size = 0;
  for (const std::uint8_t digit : frame.subspan(2, 5)) size = size * 10 + (digit - std::size_t{'0'});
  return size;
}

bool IsFrame(std::span<const std::uint8_t> bytes) {
  return bytes.size() >= kFrameHeader &&
         std::all_of(bytes.begin() + 1, bytes.begin() + kFrameHeader, IsDigit) &&
         bytes.size() == kFrameHeader + PayloadSize(bytes);
}

bool IsSwitch(std::uint8_t byte) { return byte <= 1; }

}  // namespace

std::span<const PanelBehaviourKind> PanelBehaviourKinds() { return kBehaviourKinds; }

const PanelBehaviourKind* FindPanelBehaviour(std::string_view name) {
  const auto kind = std::find_if(std::begin(kBehaviourKinds), std::end(kBehaviourKinds),
                                 [&](const PanelBehaviourKind& each) { return each.name == name; });
  return kind == std::end(kBehaviourKinds) ? nullptr : kind;
}

std::optional<PanelRequest> ParsePanelFrame(std::span<const std::uint8_t> frame) {
  if (!IsFrame(frame)) return std::nullopt;
  const auto payload = frame.subspan(kFrameHeader);
  return PanelRequest{.identifier = frame[0],
                      .sequence = frame[1],
                      .payload = Bytes(payload.begin(), payload.end()),
                      .nested = IsFrame(payload) && payload[0] == frame[0]};
}

void VirtualControlPanel::SetBehaviour(PanelBehaviour behaviour, std::optional<std::size_t> replies) {
  behaviour_ = behaviour;
  replies_left_ = replies;
}

void VirtualControlPanel::SetListener(PanelListener listener) {
  listener_ = listener;
  if (listener != PanelListener::kOff) return;
  for (PanelSession* session : std::vector(sessions_)) session->HangUp();
}

void VirtualControlPanel::AddPort(std::uint8_t port) {
  ports_.insert(port);
  held_.insert(port);
}

void VirtualControlPanel::SetPortHandler(std::function<void(std::uint8_t, bool)> handler) {
  port_handler_ = std::move(handler);
}

void VirtualControlPanel::SetTap(std::function<void(PanelSide, std::span<const std::uint8_t>)> tap) {
  tap_ = std::move(tap);
}

// A program that was not answered repeats its request inside another. To a panel that is a payload which
// begins with, say, 'C', '4': give back port 67, which no program means. So it says "done" and does nothing. What
// the program still wants it has to request again; the first request was most likely done when it arrived.
bool VirtualControlPanel::Obey(const PanelRequest& request) {
  const Bytes& payload = request.payload;
  if (request.nested) return true;
  switch (request.identifier) {
    case 'I':
    case 'L':  // what the lights do is not seen here
      return true;
    case 'C':
      if (payload.size() != 2 || !IsSwitch(payload[1])) return false;
      ControlPort(payload[0], payload[1] == 1);
      return true;
    case 'P':
      return payload.size() == 1 && IsSwitch(payload[0]);
    case 'A':
      return payload.empty();
    default:
      return false;
  }
}

void VirtualControlPanel::ControlPort(std::uint8_t port, bool held) {
  if (!ports_.contains(port) || held_.contains(port) == held) return;
  if (held) {
    held_.insert(port);
  } else {
    held_.erase(port);
  }
  if (port_handler_) port_handler_(port, held);
}

PanelBehaviour VirtualControlPanel::NextBehaviour() {
  if (!replies_left_) return behaviour_;
  if (*replies_left_ == 0) return PanelBehaviour::kProper;
  --*replies_left_;
  return behaviour_;
}

void VirtualControlPanel::Show(PanelSide from, std::span<const std::uint8_t> bytes) const {
  if (tap_) tap_(from, bytes);
}

PanelSession::PanelSession(VirtualControlPanel& panel, PanelConnection connection)
    : panel_(panel), connection_(std::move(connection)) {
  timer_ = panel_.timers_.CreateTimer([this] {
    pieces_.front().delay_ms = 0;
    SendDuePieces();
  });
  panel_.sessions_.push_back(this);
}

PanelSession::~PanelSession() { std::erase(panel_.sessions_, this); }

void PanelSession::Receive(std::span<const std::uint8_t> bytes) {
  for (const std::uint8_t byte : bytes) {
    if (!open_) return;
    Take(byte);
  }
}

// The panel hangs up at the first byte that no frame can have there. So it never keeps more than one frame of a
// connection.
void PanelSession::Take(std::uint8_t byte) {
  const std::size_t at = frame_.size();
  frame_.push_back(byte);
  if (at < kFrameHeader && !(at == 0 ? IsLetter(byte) : IsDigit(byte))) {
    panel_.Show(PanelSide::kProgram, frame_);
    return HangUp();
  }
  if (frame_.size() >= kFrameHeader && frame_.size() == kFrameHeader + PayloadSize(frame_)) HandleRequest();
}

void PanelSession::HandleRequest() {
  const Bytes frame = std::exchange(frame_, {});
  panel_.Show(PanelSide::kProgram, frame);
  const PanelRequest request = *ParsePanelFrame(frame);
  panel_.requests_.push_back(request);
  if (panel_.requests_.size() > kKeptRequests) panel_.requests_.pop_front();

  const PanelBehaviour behaviour = panel_.NextBehaviour();
  const bool done = behaviour != PanelBehaviour::kRefuse && panel_.Obey(request);
  QueueReply(behaviour, {done ? kDone : kRefused, request.sequence, '0', '0', '0', '0', '0'});
  if (!timer_->Enabled()) SendDuePieces();
}

void PanelSession::QueueReply(PanelBehaviour behaviour, const Bytes& reply) {
  Bytes altered = reply;
  switch (behaviour) {
    case PanelBehaviour::kProper:
    case PanelBehaviour::kRefuse:
      pieces_.push_back({.bytes = reply});
      return;
    case PanelBehaviour::kSilent:
      return;
    case PanelBehaviour::kSlow:
      pieces_.push_back({.delay_ms = kSlowMs, .bytes = reply});
      return;
    case PanelBehaviour::kTooSlow:
      pieces_.push_back({.delay_ms = kTooSlowMs, .bytes = reply});
      return;
    case PanelBehaviour::kByteByByte:
      for (const std::uint8_t byte : reply) pieces_.push_back({.delay_ms = kByteGapMs, .bytes = {byte}});
      return;
    case PanelBehaviour::kWrongSequence:
      altered[1] = reply[1] == '9' ? std::uint8_t{'0'} : static_cast<std::uint8_t>(reply[1] + 1);
      break;
    case PanelBehaviour::kWrongIdentifier:
      altered[0] = '2';
      break;
    case PanelBehaviour::kLetterInLength:
      altered[4] = 'A';
      break;
    case PanelBehaviour::kFlood:  // begins as the largest frame, and goes on after its end
      std::fill(altered.begin() + 2, altered.end(), std::uint8_t{'9'});
      pieces_.push_back({.bytes = altered});
      for (std::size_t i = 0; i < kFloodPieces; ++i) {
        pieces_.push_back({.delay_ms = 1, .bytes = Bytes(kFloodPieceBytes, 'x')});
      }
      return;
    case PanelBehaviour::kCloseInMiddle:
      pieces_.push_back({.bytes = Bytes(reply.begin(), reply.begin() + kFrameHeader / 2), .hang_up = true});
      return;
  }
  pieces_.push_back({.bytes = altered});
}

void PanelSession::SendDuePieces() {
  timer_->SetEnabled(false);
  while (!pieces_.empty() && pieces_.front().delay_ms == 0) {
    const Piece piece = std::move(pieces_.front());
    pieces_.pop_front();
    panel_.Show(PanelSide::kPanel, piece.bytes);
    connection_.send(piece.bytes);
    if (piece.hang_up) return HangUp();
  }
  if (pieces_.empty()) return;
  timer_->SetInterval(pieces_.front().delay_ms);
  timer_->SetEnabled(true);
}

void PanelSession::HangUp() {
  if (!std::exchange(open_, false)) return;
  timer_->SetEnabled(false);
  pieces_.clear();
  connection_.hang_up();
}

}  // namespace tendril
