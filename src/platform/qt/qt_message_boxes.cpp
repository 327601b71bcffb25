#include "platform/qt/qt_message_boxes.h"

#include <QAbstractButton>
#include <QApplication>
#include <QClipboard>
#include <QEventLoop>
#include <QKeyEvent>
#include <QLabel>
#include <QString>

namespace tendril {
namespace {

constexpr char kBoxName[] = "messageBox";

// The result of a box's event loop when the box has closed; with any other, the program ends.
constexpr int kSettled = 0x5E77;

QMessageBox::Icon QtIcon(BoxIcon icon) {
  switch (icon) {
    case BoxIcon::kNone:
      return QMessageBox::NoIcon;
    case BoxIcon::kExclamation:
      return QMessageBox::Warning;
    case BoxIcon::kCritical:
      return QMessageBox::Critical;
  }
  return QMessageBox::NoIcon;
}

// Ctrl+C copies its title and text, unless a part of the text is selected: then that. Qt's own copies on Windows alone.
class CopyableBox : public QMessageBox {
 public:
  explicit CopyableBox(QWidget* parent) : QMessageBox(parent) {}

  // The text takes part in the focus chain, so that the keyboard can select in it.
  void MakeTextSelectable() {
    setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    text_ = findChild<QLabel*>(QStringLiteral("qt_msgbox_label"));
    text_->setFocusPolicy(Qt::StrongFocus);
    text_->installEventFilter(this);
  }

 protected:
  void keyPressEvent(QKeyEvent* event) override {
    if (!CopyAll(*event)) QMessageBox::keyPressEvent(event);
  }
  bool eventFilter(QObject* object, QEvent* event) override {
    if (object == text_ && event->type() == QEvent::KeyPress && !text_->hasSelectedText() &&
        CopyAll(static_cast<QKeyEvent&>(*event))) {
      return true;
    }
    return QMessageBox::eventFilter(object, event);
  }

 private:
  bool CopyAll(const QKeyEvent& event) const {
    if (!event.matches(QKeySequence::Copy)) return false;
    QGuiApplication::clipboard()->setText(windowTitle() + QStringLiteral("\n\n") + text());
    return true;
  }

  QLabel* text_ = nullptr;
};

}  // namespace

QtMessageBoxes::QtMessageBoxes() {
  QObject::connect(qApp, &QCoreApplication::aboutToQuit, &context_, [this] { closing_ = true; });
}

QtMessageBoxes::~QtMessageBoxes() { CloseAll(); }

void QtMessageBoxes::CloseAll() {
  closing_ = true;
  const std::vector<QMessageBox*> open = open_;
  for (QMessageBox* box : open) box->reject();
}

void QtMessageBoxes::Show(const BoxMessage& message) { Ask(message, QMessageBox::Ok); }

bool QtMessageBoxes::AskYesNo(const BoxMessage& message) {
  return Ask(message, QMessageBox::Yes | QMessageBox::No) == QMessageBox::Yes;
}

// The window that the user is in gets the focus back. Never a modal one: a box would end with the box that it belongs to.
QWidget* QtMessageBoxes::Owner() const {
  QWidget* const active = QApplication::activeWindow();
  const bool owned = active != nullptr && parent_ != nullptr && active->parentWidget() == parent_;
  return owned && !active->isModal() ? active : parent_.data();
}

QMessageBox::StandardButton QtMessageBoxes::Ask(const BoxMessage& message,
                                                QMessageBox::StandardButtons buttons) {
  if (closing_) return QMessageBox::NoButton;

  // On the heap: the parent may destroy the box.
  const QPointer<CopyableBox> box = new CopyableBox(Owner());
  box->setObjectName(QLatin1String(kBoxName));
  box->setTextFormat(Qt::PlainText);  // a text with a "<" in it could become rich text
  box->setText(QString::fromStdString(message.text).replace(QLatin1String("\r\n"), QLatin1String("\n")));
  box->setWindowTitle(QString::fromStdString(message.title));
  box->setIcon(QtIcon(message.icon));
  box->setStandardButtons(buttons);
  // No, where there is one: Yes must not be hit by accident.
  box->setDefaultButton(QMessageBox::No);
  box->MakeTextSelectable();
  // Not the text, which comes first in the focus chain.
  box->button(buttons.testFlag(QMessageBox::No) ? QMessageBox::No : QMessageBox::Ok)->setFocus();

  // The box's own exec() cannot distinguish an answer from a quit, which closes the box as a user does and then ends
  // every event loop.
  QEventLoop loop;
  const auto settle = [&loop] { loop.exit(kSettled); };
  QObject::connect(box, &QMessageBox::finished, &loop, settle);
  QObject::connect(box, &QObject::destroyed, &loop, settle);

  const QPointer<QObject> alive = &context_;
  QMessageBox* const opened = box;
  open_.push_back(opened);
  box->setModal(true);
  box->show();
  const bool ended_from_outside = loop.exec() != kSettled;
  if (alive) {
    std::erase(open_, opened);
    closing_ = closing_ || ended_from_outside;
  }
  if (!box) return QMessageBox::NoButton;
  const QMessageBox::StandardButton answer = box->standardButton(box->clickedButton());
  delete box;
  return answer;
}

}  // namespace tendril
