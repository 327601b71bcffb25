// The hatching of what is shown and not stored.
#pragma once

#include <QColor>
#include <QPainter>
#include <QRectF>

namespace tendril {

// Draws diagonal lines across `box`, within the clipping of `painter`.
void PaintHatch(QPainter& painter, const QRectF& box, const QColor& colour);

}  // namespace tendril
