// ManualChapter: the chapters of the user's manual, and which of them fits what the window shows.
#pragma once

#include <string_view>

namespace tendril {

// In the order of the manual's contents.
enum class ManualChapter {
  kContents,
  kFirstUnit,
  kNumbers,
  kConfigurations,
  kLiveTest,
  kManyUnits,
  kControlPanel,
  kPorts,
  kNoAnswer,
  kKeys,
  kSupport
};

// The name of the chapter's file, without a suffix.
constexpr std::string_view PageOf(ManualChapter chapter) {
  constexpr std::string_view kPages[] = {"index",     "first-unit", "numbers",       "configurations",
                                         "live-test", "many-units", "control-panel", "ports",
                                         "no-answer", "keys",       "support"};
  return kPages[static_cast<int>(chapter)];
}

}  // namespace tendril
