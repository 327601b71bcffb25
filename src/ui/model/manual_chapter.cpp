#include "ui/model/manual_chapter.h"

namespace tendril {

std::string_view PageOf(ManualChapter chapter) {
  constexpr std::string_view kPages[] = {"index",     "first-unit", "numbers",       "configurations",
                                         "live-test", "many-units", "control-panel", "ports",
                                         "no-answer", "keys",       "support"};
  return kPages[static_cast<int>(chapter)];
}

ManualChapter FittingChapter(const ManualFacts& facts) {
  const PortFacts& port = facts.port;
  if (facts.moves) return ManualChapter::kLiveTest;
  if (!port.any_listed) return ManualChapter::kPorts;
  if (port.chosen == 0) return ManualChapter::kFirstUnit;
  if (port.open != port.chosen) {
    const bool panel = port.fault == PortFault::kControlPanelHasIt || port.requested == port.chosen;
    return panel ? ManualChapter::kControlPanel : ManualChapter::kPorts;
  }
  return facts.no_answer ? ManualChapter::kNoAnswer : facts.focus;
}

}  // namespace tendril
