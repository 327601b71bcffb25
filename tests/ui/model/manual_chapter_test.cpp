#include "ui/model/manual_chapter.h"

#include <gtest/gtest.h>

#include <vector>

namespace tendril {
namespace {

TEST(ManualChapter, IsAboutThePortWhileThatIsNotOpen) {
  struct Case {
    PortFacts port;
    std::string_view page;
  };
  for (const auto& [port, page] : std::vector<Case>{
           {{.any_listed = false}, "ports"},
           {{}, "first-unit"},
           {{.chosen = 3, .fault = PortFault::kNotAllowed}, "ports"},
           {{.chosen = 3, .open = 2, .fault = PortFault::kControlPanelHasIt}, "control-panel"},
           {{.chosen = 3, .requested = 3, .request = PortControl::kUnanswered}, "control-panel"},
           {{.chosen = 3, .fault = PortFault::kGone, .requested = 2}, "ports"},
           {{.chosen = 3, .open = 3, .requested = 3}, "numbers"}}) {
    EXPECT_EQ(PageOf(FittingChapter({.port = port, .focus = ManualChapter::kNumbers})), page);
  }
}

}  // namespace
}  // namespace tendril
