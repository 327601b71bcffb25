#include "ui/number_entry.h"

#include <QGridLayout>
#include <QKeyEvent>
#include <algorithm>

namespace tendril {
namespace {

constexpr std::int32_t kOpenMs = 3500;
// The room for a hint.
constexpr int kHintLines = 2;
constexpr char kHintLine[] = "-1000 to 1000. This is relative to 1500";

}  // namespace

NumberEntry::NumberEntry(SummaryEditor& editor, TimerFactory& timers, QWidget& window)
    : PopUp("fraNumberEntry", window),
      editor_(editor),
      tmrAdjustDual_(timers.CreateTimer([this] { OnAdjustDual(); })),
      lblDisplay_(Named(BoldLabel(), "lblDisplay")),
      typed_(Named(new NoticeLabel(kHintLines), "lblSumTyped")) {
  tmrAdjustDual_->SetInterval(kOpenMs);
  auto* grid = new QGridLayout(this);
  grid->addWidget(lblDisplay_, 0, 0, 1, 3);
  for (std::size_t i = 0; i < spnSumValue_.size(); ++i) {
    spnSumValue_[i] = MakeSpin(i);
    auto* reading = lblSumValue_[i] = Named(new QLabel, "lblSumValue", i);
    reading->setAlignment(Qt::AlignCenter);
    grid->addWidget(spnSumValue_[i], 1, static_cast<int>(i));
    grid->addWidget(reading, 2, static_cast<int>(i));
  }
  typed_->setMinimumWidth(typed_->fontMetrics().horizontalAdvance(QString::fromLatin1(kHintLine)));
  grid->addWidget(typed_, 3, 0, 1, 3);
  grid->setColumnStretch(2, 1);
}

CalmSpinBox* NumberEntry::MakeSpin(std::size_t index) {
  auto* spin = Named(new CalmSpinBox, "spnSumValue", index);
  spin->setAccessibleName(index == 0 ? QStringLiteral("New value") : QStringLiteral("New right stop"));
  Describe(spin, "The new value, in µs.");
  spin->installEventFilter(this);
  connect(spin, &QSpinBox::valueChanged, this, [this, index](int value) { OnSpin(index, value); });
  connect(spin, &CalmSpinBox::HintChanged, typed_, &NoticeLabel::ShowNotice);
  connect(spin, &CalmSpinBox::Dropped, this, &NumberEntry::NumberDropped);
  return spin;
}

void NumberEntry::OnSpin(std::size_t index, int value) {
  if (!editor_.OpenEntry()) return;
  tmrAdjustDual_->SetEnabled(true);
  editor_.ChangeEntry(index, value);
  ShowEntry();
  Q_EMIT Changed(editor_.OpenEntry()->channel);
}

void NumberEntry::OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text) {
  for (CalmSpinBox* spin : spnSumValue_) spin->EndTyping();  // it was meant for the value before
  tmrAdjustDual_->SetEnabled(false);
  text_ = &text;
  editor_.OpenNumberEntry(channel, field);
  ShowEntry();
  OpenBeside(text, 200, 300);
  // The Tab key moves on from here as it would from the text.
  setTabOrder(&text, spnSumValue_[0]);
  setTabOrder(spnSumValue_[0], spnSumValue_[1]);
  spnSumValue_[0]->setFocus();
  spnSumValue_[0]->selectAll();
}

void NumberEntry::ShowEntry() {
  lblDisplay_->setText(QString::fromStdString(editor_.Title()));
  const auto readings = editor_.Readings();
  const auto [meaning, origin] = editor_.Meaning();
  const bool two = editor_.ShownSpins() > 1;
  for (std::size_t i = 0; i < spnSumValue_.size(); ++i) {
    CalmSpinBox& spin = *spnSumValue_[i];
    const QString side = !two ? QString() : i == 0 ? QStringLiteral(", left") : QStringLiteral(", right");
    spin.SetMeaning(meaning, origin);
    spin.Show(editor_.Spin(i));
    spin.setVisible(i == 0 || two);
    spin.setAccessibleName(lblDisplay_->text() + side);
    Describe(
        &spin,
        QStringLiteral("From %1 to %2 µs. Escape closes the entry.").arg(spin.minimum()).arg(spin.maximum()));
    lblSumValue_[i]->setText(QString::fromStdString(readings[i]));
  }
}

void NumberEntry::OnAdjustDual() {
  tmrAdjustDual_->SetEnabled(false);
  for (CalmSpinBox* spin : spnSumValue_) spin->EndTyping();  // a typed number is a change, too
  if (!tmrAdjustDual_->Enabled()) Close();
}

void NumberEntry::Leave() {
  for (CalmSpinBox* spin : spnSumValue_) spin->EndTyping();
  Close();
}

bool NumberEntry::Close() {
  tmrAdjustDual_->SetEnabled(false);
  for (CalmSpinBox* spin : spnSumValue_) spin->PutBack();
  editor_.CloseNumberEntry();
  if (!isVisible()) return false;
  const bool had_focus = isAncestorOf(window()->focusWidget());
  hide();
  if (had_focus && text_) text_->setFocus();
  return true;
}

bool NumberEntry::Repeats() const {
  return std::any_of(spnSumValue_.begin(), spnSumValue_.end(),
                     [](const CalmSpinBox* spin) { return spin->Repeats(); });
}

// Escape closes the panel whatever is typed.
bool NumberEntry::eventFilter(QObject* spin, QEvent* event) {
  const bool key = event->type() == QEvent::ShortcutOverride || event->type() == QEvent::KeyPress;
  if (!key || static_cast<QKeyEvent*>(event)->key() != Qt::Key_Escape) return PopUp::eventFilter(spin, event);
  event->accept();
  if (event->type() == QEvent::KeyPress) Close();
  return true;
}

}  // namespace tendril
