#include "ui/test_icons.h"

#include <QIconEngine>
#include <QPainter>

namespace tendril {
namespace {

// The drawing's own units.
constexpr int kIconWidth = 26;
constexpr int kIconHeight = 14;
constexpr double kStroke = 1.5;

// Draws itself anew for each paint: so it is crisp at every scale, and follows the palette.
class TestIconEngine : public QIconEngine {
 public:
  TestIconEngine(TestIcon kind, const QAbstractButton& button) : kind_(kind), button_(button) {}

  QIconEngine* clone() const override { return new TestIconEngine(kind_, button_); }

  void paint(QPainter* painter, const QRect& rect, QIcon::Mode mode, QIcon::State) override {
    const auto group = mode == QIcon::Disabled ? QPalette::Disabled : QPalette::Active;
    painter->setRenderHint(QPainter::Antialiasing);
    painter->translate(rect.topLeft());
    painter->scale(rect.width() / static_cast<double>(kIconWidth),
                   rect.height() / static_cast<double>(kIconHeight));
    painter->setPen(QPen(button_.palette().color(group, QPalette::ButtonText), kStroke, Qt::SolidLine,
                         Qt::FlatCap, Qt::MiterJoin));
    if (kind_ == TestIcon::kDangerSweep) PaintWarning(*painter);
    PaintArrow(*painter);
  }

  QPixmap pixmap(const QSize& size, QIcon::Mode mode, QIcon::State state) override {
    QPixmap pixmap(size);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    paint(&painter, QRect({}, size), mode, state);
    return pixmap;
  }

 private:
  static void PaintWarning(QPainter& painter) {
    const QPointF corners[] = {{1, 12}, {6, 2.5}, {11, 12}};
    painter.drawConvexPolygon(corners, 3);
    painter.drawLine(QPointF(6, 5.5), QPointF(6, 8.5));
    painter.drawLine(QPointF(6, 9.5), QPointF(6, 11));
  }

  void PaintArrow(QPainter& painter) const {
    painter.drawLine(QPointF(13, 7), QPointF(24, 7));
    const QPointF right[] = {{20.5, 3.5}, {24, 7}, {20.5, 10.5}};
    painter.drawPolyline(right, 3);
    if (kind_ == TestIcon::kStep) return;
    const QPointF left[] = {{16.5, 3.5}, {13, 7}, {16.5, 10.5}};
    painter.drawPolyline(left, 3);
  }

  const TestIcon kind_;
  const QAbstractButton& button_;
};

}  // namespace

QSize TestIconSize(const QAbstractButton& button) {
  const int height = button.fontMetrics().height();
  return {height * kIconWidth / kIconHeight, height};
}

QIcon MakeTestIcon(TestIcon kind, const QAbstractButton& button) {
  return QIcon(new TestIconEngine(kind, button));
}

}  // namespace tendril
