// The marks of a channel's picture, and the sign of what differs from a unit.
#pragma once

#include <QColor>
#include <QRectF>

class QPainter;

namespace tendril {

// Paints a dot at the top left of the picture that lies in the middle of `rect`, where no arc reaches.
void PaintMark(QPainter& painter, const QRectF& rect, const QColor& colour);
// Paints the sign of what differs at the bottom left of the picture.
void PaintDiffersMark(QPainter& painter, const QRectF& rect, const QColor& colour);
// Paints that sign, an equals sign with a stroke through it, so that it fills `box`.
void PaintDiffers(QPainter& painter, const QRectF& box, const QColor& colour);

}  // namespace tendril
