// EscapeKey: what Escape does in the window.
#pragma once

#include <QObject>
#include <QWidget>
#include <functional>
#include <utility>
#include <vector>

namespace tendril {

// One press ends one thing. It gets the key only when nothing that has the focus takes it: an open list or menu, or a
// field with typed text, comes first.
class EscapeKey : public QObject {
 public:
  // Ends its thing. False: there was nothing to end.
  using Step = std::function<bool()>;

  // `window` owns it. The first of `steps` that has something to end takes the key.
  EscapeKey(QWidget& window, std::vector<Step> steps);

 protected:
  bool eventFilter(QObject* window, QEvent* event) override;

 private:
  const std::vector<Step> steps_;
};

}  // namespace tendril
