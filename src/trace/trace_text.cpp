#include "trace/trace_text.h"

#include <cstddef>
#include <sstream>

#include "trace/packet_meaning.h"

namespace tendril {
namespace {

constexpr std::size_t kShownBytes = 64;

bool ShouldNotHappen(const TraceEntry& entry) {
  switch (entry.kind) {
    case TraceEntry::Kind::kOpenFailed:
    case TraceEntry::Kind::kLost:
    case TraceEntry::Kind::kFault:
    case TraceEntry::Kind::kTimeOut:
      return true;
    case TraceEntry::Kind::kNoise:
      return IsNoise(entry);
    case TraceEntry::Kind::kOpened:
    case TraceEntry::Kind::kClosed:
    case TraceEntry::Kind::kRtsOn:
    case TraceEntry::Kind::kRtsOff:
    case TraceEntry::Kind::kSent:
    case TraceEntry::Kind::kEcho:
    case TraceEntry::Kind::kReply:
      return false;
  }
  return false;
}

}  // namespace

bool IsNoise(const TraceEntry& entry) {
  return entry.kind == TraceEntry::Kind::kNoise && LeadingZeros(entry.bytes) < entry.bytes.size();
}

std::string TraceBytes(const TraceEntry& entry) { return ShownBytes(entry.bytes, kShownBytes, entry.size); }

std::string TraceMeaning(const TraceEntry& entry) {
  std::string text = ShouldNotHappen(entry) ? "⚠" : "";
  // A system's reason may have lines.
  std::istringstream words(entry.Meaning());
  for (std::string word; words >> word;) text += (text.empty() ? "" : " ") + word;
  return text;
}

}  // namespace tendril
