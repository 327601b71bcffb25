// PulseWidthLabel: the pulse widths of a parameter.
#pragma once

#include <QLabel>
#include <QString>

#include "config/channel_config.h"

namespace tendril {

// Shows "600 to 2400 µs" or "1600 µs" in bold; where that is too wide, "600–2400". The sign of what differs has a place
// before it. Its size does not depend on what it shows.
class PulseWidthLabel : public QLabel {
 public:
  PulseWidthLabel();

  // Shows the two ends of a range, or one position.
  void ShowRange(const PulsePair& ends);
  void ShowPosition(Microseconds position);

  // Hatches it from below unless the record holds it.
  void ShowStored(bool stored);

  // Signs it as different from what a unit holds, as `words` say; empty: it is not.
  void ShowDiffers(const QString& words);

  // What it shows, in full.
  const QString& InFull() const { return full_; }

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void paintEvent(QPaintEvent* event) override;

 private:
  void Show(const QString& full, const QString& brief);
  void Fit();

  QString full_;
  QString brief_;
  bool stored_ = true;
  bool differs_ = false;
};

}  // namespace tendril
