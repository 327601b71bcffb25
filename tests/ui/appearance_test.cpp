#include "ui/appearance.h"

#include <QCheckBox>
#include <QGroupBox>
#include <QImage>
#include <QLineEdit>
#include <QPushButton>
#include <QRadioButton>
#include <QSlider>
#include <QStyle>
#include <QToolTip>
#include <algorithm>
#include <vector>

#include "window_fixture.h"

namespace tendril::test {
namespace {

TEST(Palette, EveryPair_HasItsContrastAndGoodColoursStay) {
  using P = QPalette;
  struct Pairs {
    P::ColorRole colour;
    std::vector<P::ColorRole> backgrounds;
    double ratio = kTextContrast;
  };
  const std::vector<Pairs> table{{P::WindowText, {P::Window}},
                                 {P::Text, {P::Base, P::AlternateBase}},
                                 {P::ButtonText, {P::Button}},
                                 {P::HighlightedText, {P::Highlight}},
                                 {P::PlaceholderText, {P::Window, P::Base}},
                                 {P::ToolTipText, {P::ToolTipBase}},
                                 {P::Link, {P::Window, P::Base}},
                                 {P::LinkVisited, {P::Window, P::Base}},
                                 {P::Highlight, {P::Window, P::Base}, kEdgeContrast},
                                 {P::Mid, {P::Window, P::Base}, kEdgeContrast}};
  QPalette pale(QColor(0xEEE8D5), QColor(0xFDF6E3));
  for (const auto role : {P::WindowText, P::Text, P::ButtonText, P::Highlight, P::ToolTipText})
    pale.setColor(role, QColor(0x93A1A1));
  for (const QPalette& system : {ThemePalette(false), ThemePalette(true), pale, QPalette(Qt::gray)}) {
    const QPalette shown = WithContrast(system);
    for (const auto group : {P::Active, P::Inactive}) {
      for (const auto& [colour, backgrounds, ratio] : table) {
        for (const auto background : backgrounds)
          EXPECT_GE(ContrastRatio(shown.color(group, colour), shown.color(group, background)), ratio)
              << colour << " on " << background << " in " << system.color(P::Window).name().toStdString();
      }
      EXPECT_EQ(shown.color(group, P::Window), system.color(group, P::Window));
    }
  }
  QPalette good = WithContrast(pale);
  good.setColor(P::WindowText, QColor(0x00, 0x2B, 0x80));
  EXPECT_EQ(WithContrast(good), good);
}

class Appearance : public ::testing::TestWithParam<bool> {
 protected:
  Appearance() {
    InstallAppearance();
    SetDarkAppearance(GetParam());
  }
  ~Appearance() override { SetDarkAppearance(false); }
};

// The best contrast among the first pixels that differ from the background, on the way from `point` into the picture.
double EdgeOnTheWay(const QImage& image, QPoint point, QPoint step) {
  constexpr int kPixels = 3;
  const QColor background = image.pixelColor(0, 0);
  while (image.rect().contains(point) && image.pixelColor(point) == background) point += step;
  double best = 1;
  for (int i = 0; i < kPixels && image.rect().contains(point); ++i, point += step)
    best = std::max(best, ContrastRatio(image.pixelColor(point), background));
  return best;
}

// How many pixels have changed, and have contrast.
int ChangedPixels(const QImage& image, const QImage& before) {
  int count = 0;
  for (int i = 0; i < image.width() * image.height(); ++i) {
    const QPoint point(i % image.width(), i / image.width());
    const QColor colour = image.pixelColor(point);
    if (colour != before.pixelColor(point) && ContrastRatio(colour, image.pixelColor(0, 0)) >= kEdgeContrast)
      ++count;
  }
  return count;
}

TEST_P(Appearance, EveryControl_HasAnEdgeAndShowsTheFocus) {
  struct Sample {
    const char* name;
    QWidget* control;
    std::vector<int> columns;  // where a line down from the top meets an edge
    bool takes_focus = true;
  };
  const QString text = QStringLiteral("Test");
  auto* slider = new QSlider(Qt::Horizontal);
  slider->setValue(50);
  const std::vector<Sample> samples{{"button", new QPushButton(text), {30}},
                                    {"check box", new QCheckBox(text), {7}},
                                    {"radio button", new QRadioButton(text), {7}},
                                    {"spin box", new QSpinBox, {20}},
                                    {"combo box", new QComboBox, {30}},
                                    {"line edit", new QLineEdit, {30}},
                                    {"slider", slider, {20, 42, 70}},
                                    {"group box", new QGroupBox(text), {50}, false}};
  for (const Sample& sample : samples) {
    QWidget window;
    QWidget other(&window);
    other.setFocusPolicy(Qt::StrongFocus);
    sample.control->setParent(&window);
    sample.control->setGeometry(QRect({10, 10}, sample.control->sizeHint().expandedTo({84, 15})));
    window.resize(sample.control->size() + QSize(20, 20));
    window.show();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window));
    other.setFocus();
    const QImage image = window.grab().toImage();
    EXPECT_GE(EdgeOnTheWay(image, {0, image.height() / 2}, {1, 0}), kEdgeContrast) << sample.name;
    for (const int column : sample.columns)
      EXPECT_GE(EdgeOnTheWay(image, {10 + column, 0}, {0, 1}), kEdgeContrast) << sample.name << " " << column;
    QTest::keyClick(&window, Qt::Key_Tab);
    if (sample.takes_focus) {
      EXPECT_GE(ChangedPixels(window.grab().toImage(), image), 40) << sample.name;
    }
  }
}

TEST_P(Appearance, SwitchingTwice_ComesBackToTheSamePalette) {
  const QPalette palette = QGuiApplication::palette();
  EXPECT_EQ(IsDark(palette), GetParam());
  for (const bool dark : {!GetParam(), GetParam()}) {
    SetDarkAppearance(dark);
    EXPECT_EQ(DarkAppearance(), dark);
    EXPECT_EQ(IsDark(QToolTip::palette()), dark);
  }
  EXPECT_EQ(QGuiApplication::palette(), palette);
  SetDarkAppearance(false);
  EXPECT_EQ(QGuiApplication::palette(), WithContrast(QApplication::style()->standardPalette()))
      << "the system's, not that of the other theme";
}

// The colour that fills the widget's place: its own, or that of what lies behind it.
QColor ColourBehind(const QWidget* widget) {
  while (!widget->isWindow() && !widget->autoFillBackground()) widget = widget->parentWidget();
  return widget->palette().color(widget->backgroundRole());
}

TEST_F(Window, EveryLabel_CanBeReadWhenTheThemeChanges) {
  ConnectUnit();
  Run("Command3_0");
  for (const bool dark : {true, false}) {
    SetDarkAppearance(dark);
    for (const QLabel* label : window_->findChildren<QLabel*>()) {
      if (!label->isEnabled()) continue;
      EXPECT_GE(ContrastRatio(label->palette().color(label->foregroundRole()), ColourBehind(label)),
                kTextContrast)
          << label->text().toStdString();
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Themes, Appearance, ::testing::Bool());

}  // namespace
}  // namespace tendril::test
