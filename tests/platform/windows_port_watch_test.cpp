#include <gtest/gtest.h>
#include <windows.h>
// After windows.h, which it needs.
#include <dbt.h>

#include <memory>

#include "platform/qt/port_watch.h"
#include "platform/wait_for.h"

namespace tendril::test {
namespace {

TEST(WindowsPortWatch, BurstOfReports_IsOneChange) {
  int changes = 0;
  auto watch = std::make_unique<PortWatch>([&changes] { ++changes; });
  const auto report = [] {
    PostThreadMessageW(GetCurrentThreadId(), WM_DEVICECHANGE, DBT_DEVNODES_CHANGED, 0);
  };
  for (int round = 0; round < 3; ++round) report();
  EXPECT_TRUE(WaitFor([&] { return changes > 0; }));
  report();
  EXPECT_TRUE(WaitFor([&] { return changes > 1; }));
  EXPECT_EQ(changes, 2);
  report();
  watch.reset();
  RunFor(50);
  EXPECT_EQ(changes, 2);
}

}  // namespace
}  // namespace tendril::test
