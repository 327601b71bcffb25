// CalmSpinBox: a number in microseconds that can be typed and stepped.
#pragma once

#include <QKeyEvent>
#include <QSpinBox>
#include <QString>
#include <QWheelEvent>
#include <cstdint>
#include <optional>

#include "ui/model/bounded_value.h"
#include "ui/model/typed_number.h"

namespace tendril {

// The wheel changes it only while it has the focus. Nothing changes what is typed. It takes effect when it is complete:
// at Enter, or when the focus leaves. What cannot be taken is marked, and the old value returns then; Escape brings it
// back at once.
class CalmSpinBox : public QSpinBox {
  Q_OBJECT

 public:
  explicit CalmSpinBox(QWidget* parent = nullptr);

  // Shows a value and its limits. Emits no valueChanged(). What is typed stays.
  void Show(const BoundedValue& value);
  // What the number means, and the pulse width that it is relative to: for the hint.
  void SetMeaning(NumberMeaning meaning, int origin);

  // Whether what is typed differs from the value.
  bool Typing() const;
  // Takes what is typed, or drops it: does what leaving the field does.
  void EndTyping();
  // Shows the value again, also in the place of what could be taken.
  void PutBack();
  // Whether the change that valueChanged() just reports goes on with the one before: a held arrow or key repeats.
  bool Repeats() const { return repeats_; }

  void stepBy(int steps) override;
  bool event(QEvent* event) override;

 Q_SIGNALS:
  // Why what is typed cannot be taken, and what to type instead; for the screen, and to be read out. Empty: it can be
  // taken.
  void HintChanged(const QString& hint, const QString& spoken);
  // `typed` cannot be taken, and the old value is shown again; `sentence` says so.
  void Dropped(const QString& typed, const QString& sentence);

 protected:
  QValidator::State validate(QString& text, int& position) const override;
  int valueFromText(const QString& text) const override;
  void fixup(QString& /*text*/) const override {}

  void wheelEvent(QWheelEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void keyReleaseEvent(QKeyEvent* event) override;
  void focusOutEvent(QFocusEvent* event) override;
  void showEvent(QShowEvent* event) override;
  void hideEvent(QHideEvent* event) override;
  void changeEvent(QEvent* event) override;

 private:
  std::optional<long long> Number(QString text) const;
  bool Takes(const QString& text) const;
  QString Hint() const;
  void ShowHint();
  void Mark();
  void ApplyLimits();
  bool ArrowHeld() const;
  bool GoesOn(const QKeyEvent& press) const;

  BoundedValue shown_;
  NumberMeaning meaning_ = NumberMeaning::kDistance;
  int origin_ = 0;
  QString hint_;
  bool pressed_ = false;   // a mouse button went down here; the release may have gone to another widget
  bool key_held_ = false;  // since a key went down here
  bool stepped_ = false;   // the value has changed since then
  bool repeats_ = false;
  int released_ = 0;  // the key that was released last, and when
  std::uint64_t released_at_ = 0;
};

}  // namespace tendril
