// The parts of the drawn servo as flat shapes: on the pulse scale, and in the legend.
#pragma once

#include <QPainter>
#include <QRectF>

#include "ui/model/pulse_scale_layout.h"

namespace tendril {

// Fills `box`, in whole device pixels, with the colour of `part`, and with an outline inside its edge. The outline keeps
// a range apart from a light background, and a line from the background and from the ranges that it crosses.
void PaintBar(QPainter& painter, ScalePart part, const QRectF& box);
void PaintLine(QPainter& painter, ScalePart part, const QRectF& box);

// Fills `box` with the colour of the body of the servo, and an outline: a plate for a line.
void PaintPlate(QPainter& painter, const QRectF& box);

}  // namespace tendril
