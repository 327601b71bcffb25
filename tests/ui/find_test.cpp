// Unit > Find Units...: the search and the list of what it finds.
#include <QTreeWidget>

#include "window_fixture.h"

namespace tendril::test {
namespace {

using FindUnits = Window;

TEST_F(FindUnits, Line_ChoosesItsIdWhileTheSearchRuns) {
  ConnectUnit();
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x0C});
  Keys("Ctrl+F");
  world_.time.Advance(1300);
  auto& list = Find<QTreeWidget>("lstUnits");
  ASSERT_EQ(list.topLevelItemCount(), 2);
  EXPECT_EQ(Find("FoundUnits").windowTitle().toStdString(), "Find Units on Comm 1");
  EXPECT_LT(Find("ShapeProgress").width(), Find("pctProgress").width() / 5) << "12 of 253";
  list.setCurrentItem(list.topLevelItem(1));
  QTest::keyClick(&list, Qt::Key_Return);
  EXPECT_EQ(Find<QComboBox>("CmbUnitID_1").currentIndex(), 0x0C);
  EXPECT_EQ(Text("lblStatus"), "Unit ID 0C");
  QTest::keyClick(&list, Qt::Key_Escape);
  EXPECT_THAT(Text("lblStatus"), testing::StartsWith("Finding units goes on"));
  Press("cmdFindUnits");
  EXPECT_TRUE(Visible("FoundUnits"));
  Press("cmdCancelFind");
  RunToTheEnd();
  EXPECT_THAT(Text("lblFound"), testing::HasSubstr("2 units found: 01 and 0C."));
  Press("Command3_0");
  EXPECT_FALSE(list.isEnabled()) << "the send goes to the chosen unit";
}

}  // namespace
}  // namespace tendril::test
