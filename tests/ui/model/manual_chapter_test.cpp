#include "ui/model/manual_chapter.h"

#include <gtest/gtest.h>

#include <vector>

namespace tendril {
namespace {

TEST(ManualChapter, IsAboutWhatMovesOrIsWrongBeforeWhatTheUserWorksWith) {
  struct Case {
    ManualFacts facts;
    std::string_view page;
  };
  constexpr auto kNumbers = ManualChapter::kNumbers;
  const PortFacts open{.chosen = 3, .open = 3, .requested = 3};
  for (const auto& [facts, page] : std::vector<Case>{
           {{.moves = true, .port = {.chosen = 3, .fault = PortFault::kGone}}, "live-test"},
           {{.port = {.any_listed = false}}, "ports"},
           {{.focus = ManualChapter::kFirstUnit}, "first-unit"},
           {{.port = {.any_listed = false}, .focus = kNumbers}, "numbers"},
           {{.port = {.chosen = 3, .fault = PortFault::kNotAllowed}, .focus = kNumbers}, "ports"},
           {{.port = {.chosen = 3, .open = 2, .fault = PortFault::kControlPanelHasIt}}, "control-panel"},
           {{.port = {.chosen = 3, .fault = PortFault::kGone, .requested = 3}}, "ports"},
           {{.port = open, .no_answer = true, .focus = kNumbers}, "no-answer"},
           {{.port = open, .focus = kNumbers}, "numbers"}}) {
    EXPECT_EQ(PageOf(FittingChapter(facts)), page);
  }
}

}  // namespace
}  // namespace tendril
