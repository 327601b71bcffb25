// Sign: a drawn sign beside a text.
#pragma once

#include <QWidget>

namespace tendril {

enum class SignKind { kRunning, kSuccess, kFailure, kWarning, kUnstored };

// Shows in its form what a colour shows. It is as high as the type, and has the text's colour.
class Sign : public QWidget {
  Q_OBJECT

 public:
  explicit Sign(SignKind kind);

  SignKind Kind() const { return kind_; }
  void SetKind(SignKind kind);

  QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  SignKind kind_;
};

}  // namespace tendril
