#include "ui/live_test_area.h"

#include <QCheckBox>
#include <QEvent>
#include <QGridLayout>
#include <QLabel>
#include <QSlider>
#include <array>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr int kSliderMaximum = 1000;

struct ReadOut {
  const char* title;
  const char* scale;
  const char* name;
};
constexpr std::array<ReadOut, 3> kReadOuts{{{"Nyx Value", "0%..100%", "lblPositionValue_0"},
                                            {"DMX Value", "0..255", "lblPositionValue_1"},
                                            {"Pulse Width", "1000..2000", "txtPositionValue"}}};

}  // namespace

LiveTestArea::LiveTestArea(QWidget* parent) : QGroupBox(QStringLiteral("Live Test"), parent) {
  const QString not_yet = QStringLiteral("Moving a servo live is not in this version yet.");
  auto* send = Named(new QCheckBox(QStringLiteral("Use Slider to Test Intensity Values")),
                     QStringLiteral("chkSendSlideCommands"));
  Disable(send, not_yet);
  warning_ = BoldLabel(
      QStringLiteral("WARNING: Possible Servo Damage: Limits present in the controller are bypassed."));

  auto* slider = Named(new QSlider(Qt::Horizontal), QStringLiteral("HScrollSendServoPosition"));
  slider->setRange(0, kSliderMaximum);
  slider->setValue(kSliderMaximum / 2);
  slider->setAccessibleName(QStringLiteral("Servo position"));
  Disable(slider, not_yet);

  auto* grid = new QGridLayout(this);
  grid->setContentsMargins(9, 3, 9, 6);
  grid->setVerticalSpacing(1);
  grid->setHorizontalSpacing(16);
  grid->addWidget(warning_, 0, 0);
  grid->addWidget(slider, 1, 0);
  grid->addWidget(send, 2, 0);
  int column = 1;
  for (const ReadOut& read_out : kReadOuts) {
    const QString title = QString::fromUtf8(read_out.title);
    auto* value = Named(BoldLabel(QStringLiteral("–")), QString::fromUtf8(read_out.name));
    QFont font = value->font();
    font.setPointSizeF(font.pointSizeF() * 1.5);
    value->setFont(font);
    value->setMinimumWidth(value->fontMetrics().horizontalAdvance(QStringLiteral("0000")));
    grid->addWidget(new QLabel(title), 0, column);
    grid->addWidget(value, 1, column);
    grid->addWidget(DimLabel(QString::fromUtf8(read_out.scale)), 2, column);
    ++column;
  }
  grid->setColumnStretch(0, 1);
  ColourWarning();
}

void LiveTestArea::changeEvent(QEvent* event) {
  QGroupBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ColourWarning();
}

void LiveTestArea::ColourWarning() {
  QPalette palette = warning_->palette();
  palette.setColor(QPalette::WindowText, IsDark(*this) ? QColor(0xFF, 0x8A, 0x80) : QColor(0xA8, 0x00, 0x20));
  warning_->setPalette(palette);
}

}  // namespace tendril
