// PulseScale: the values of the editor on one axis in microseconds.
#pragma once

#include <QString>
#include <QWidget>
#include <optional>
#include <vector>

#include "ui/model/pulse_scale_layout.h"
#include "ui/model/unstored.h"

class QPainter;

namespace tendril {

// Shows ranges, positions and the moving arm of a channel in the colours of the drawn servo, and in words to assistive
// technology. While no channel is chosen there is only the axis, dimmed.
class PulseScale : public QWidget {
  Q_OBJECT

 public:
  PulseScale();

  // Shows the pulse fields of `shown`, hatched where they are `unstored`; the axis alone when there is none.
  void ShowValues(const std::optional<ChannelConfig>& shown, const Unstored& unstored);
  // Moves the arm alone.
  void MoveArm(Microseconds arm);

  // All that it shows, in words.
  QString InWords() const;

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  ScaleRoom Room() const;
  void Paint(QPainter& painter, const ScaleElement& element) const;
  void PaintUnstored(QPainter& painter, const ScaleElement& element,
                     const std::vector<ScaleElement>& elements) const;
  bool IsUnstored(ScalePart part) const;

  std::optional<ChannelConfig> shown_;
  Unstored unstored_;
  Microseconds arm_ = kCentrePulseWidth;
};

}  // namespace tendril
