// ManualChapter: the chapters of the user's manual, and which of them fits what the window shows.
#pragma once

#include <string_view>

#include "unitops/port_facts.h"

namespace tendril {

// Those that the window opens. The contents lead to the others.
enum class ManualChapter {
  kContents,
  kFirstUnit,
  kNumbers,
  kConfigurations,
  kLiveTest,
  kControlPanel,
  kPorts,
  kNoAnswer
};

// The name of the chapter's file, without a suffix.
std::string_view PageOf(ManualChapter chapter);

// What the window shows when the user asks for the manual.
struct ManualFacts {
  bool moves = false;  // a servo test runs, or the slider moves the servo
  PortFacts port = {};
  bool no_answer = false;                          // the chosen unit did not answer when it was asked last
  ManualChapter focus = ManualChapter::kContents;  // what describes the controls that the user works with
};

// What moves comes first, then what is wrong, then what the user works with. Without a port nothing is wrong yet.
ManualChapter FittingChapter(const ManualFacts& facts);

}  // namespace tendril
