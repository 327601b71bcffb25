#include "ui/servo_parts.h"

#include <algorithm>
#include <cmath>

#include "simulator/servo_simulator.h"

namespace tendril {
namespace {

DialColour FillOf(ScalePart part) {
  switch (part) {
    case ScalePart::kActual:
      return kRangeFill;
    case ScalePart::kVirtual:
      return kLimitFill;
    case ScalePart::kStops:
      return kStopsFill;
    case ScalePart::kDefault:
      return kDefaultFill;
    case ScalePart::kArm:
      return kArmFill;
    case ScalePart::kNeutral:
    case ScalePart::kAxis:
      break;
  }
  return kNeutralFill;
}

// A box that covers whole device pixels, and the width of its outline: equal on all sides at every scale.
struct Pixels {
  Pixels(const QPainter& painter, const QRectF& about) {
    const QTransform to_device = painter.deviceTransform();
    box = to_device.inverted().mapRect(QRectF(to_device.mapRect(about).toRect()));
    edge = std::max(1.0, std::floor(to_device.m11())) / to_device.m11();
  }

  QRectF box;
  double edge;
};

void PaintOutlined(QPainter& painter, const QRectF& box, DialColour fill) {
  const Pixels pixels(painter, box);
  painter.fillRect(pixels.box, ToColour(kBodyOutline));
  painter.fillRect(pixels.box.adjusted(pixels.edge, pixels.edge, -pixels.edge, -pixels.edge), ToColour(fill));
}

}  // namespace

void PaintBar(QPainter& painter, ScalePart part, const QRectF& box) {
  PaintOutlined(painter, box, FillOf(part));
}

void PaintLine(QPainter& painter, ScalePart part, const QRectF& box) {
  const Pixels pixels(painter, box);
  // The neutral line is black, on a dark background too.
  painter.fillRect(pixels.box, part == ScalePart::kNeutral ? Qt::white : Qt::black);
  painter.fillRect(pixels.box.adjusted(pixels.edge, 0, -pixels.edge, 0), ToColour(FillOf(part)));
}

void PaintPlate(QPainter& painter, const QRectF& box) { PaintOutlined(painter, box, kInnerBodyFill); }

}  // namespace tendril
