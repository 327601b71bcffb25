#include "ui/sign.h"

#include <QPainter>
#include <QPolygonF>
#include <array>

#include "ui/hatch.h"

namespace tendril {
namespace {

// The sign lies in a square with sides of 1.
constexpr double kLine = 0.13;
constexpr std::array kCheck{QPointF(0.12, 0.55), QPointF(0.4, 0.82), QPointF(0.88, 0.2)};
constexpr std::array kCross{QLineF(0.2, 0.2, 0.8, 0.8), QLineF(0.2, 0.8, 0.8, 0.2)};
constexpr std::array kTriangle{QPointF(0.5, 0.1), QPointF(0.95, 0.9), QPointF(0.05, 0.9)};
constexpr QLineF kExclamation(0.5, 0.4, 0.5, 0.62);
constexpr QPointF kDot(0.5, 0.77);
constexpr std::array kDots{QPointF(0.15, 0.7), QPointF(0.5, 0.7), QPointF(0.85, 0.7)};

}  // namespace

Sign::Sign(SignKind kind) : kind_(kind) { setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed); }

void Sign::SetKind(SignKind kind) {
  kind_ = kind;
  update();
}

QSize Sign::sizeHint() const { return {fontMetrics().height(), fontMetrics().height()}; }

void Sign::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.scale(width(), height());
  QPen pen(palette().color(QPalette::WindowText), kLine, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin);
  painter.setPen(pen);
  switch (kind_) {
    case SignKind::kRunning:
      painter.drawPoints(kDots.data(), static_cast<int>(kDots.size()));
      break;
    case SignKind::kSuccess:
      painter.drawPolyline(kCheck.data(), static_cast<int>(kCheck.size()));
      break;
    case SignKind::kFailure:
      painter.drawLines(kCross.data(), static_cast<int>(kCross.size()));
      break;
    case SignKind::kWarning:
      pen.setWidthF(kLine * 2 / 3);
      painter.setPen(pen);
      painter.drawConvexPolygon(kTriangle.data(), static_cast<int>(kTriangle.size()));
      painter.drawLine(kExclamation);
      painter.drawPoint(kDot);
      break;
    case SignKind::kUnstored: {
      painter.resetTransform();
      const QRectF box = QRectF(rect()).adjusted(2.5, 2.5, -2.5, -2.5);
      const QColor colour = palette().color(QPalette::WindowText);
      PaintHatch(painter, box, colour);
      painter.setPen(QPen(colour, 1));
      painter.drawRect(box);
      break;
    }
  }
}

}  // namespace tendril
