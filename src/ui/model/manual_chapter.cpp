#include "ui/model/manual_chapter.h"

namespace tendril {

std::string_view PageOf(ManualChapter chapter) {
  constexpr std::string_view kPages[] = {"index",     "first-unit",    "numbers", "configurations",
                                         "live-test", "control-panel", "ports",   "no-answer"};
  return kPages[static_cast<int>(chapter)];
}

ManualChapter FittingChapter(const ManualFacts& facts) {
  const PortFacts& port = facts.port;
  if (facts.moves) return ManualChapter::kLiveTest;
  if (port.chosen == 0) {
    const bool begins = facts.focus == ManualChapter::kContents || facts.focus == ManualChapter::kFirstUnit;
    if (!begins) return facts.focus;
    return port.any_listed ? ManualChapter::kFirstUnit : ManualChapter::kPorts;
  }
  if (port.open != port.chosen) {
    return port.fault == PortFault::kControlPanelHasIt ? ManualChapter::kControlPanel : ManualChapter::kPorts;
  }
  return facts.no_answer ? ManualChapter::kNoAnswer : facts.focus;
}

}  // namespace tendril
