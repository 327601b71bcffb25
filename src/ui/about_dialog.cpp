#include "ui/about_dialog.h"

#include <QClipboard>
#include <QDialogButtonBox>
#include <QFontMetrics>
#include <QGuiApplication>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>
#include <algorithm>

#include "ui/controls.h"
#include "ui/system_info.h"

namespace tendril {
namespace {

constexpr int kIconSize = 64;
// A longer fact scrolls in its field.
constexpr int kWidestFact = 480;

// A line edit and no label: it can be read and selected by keyboard, also by a screen reader.
QLineEdit* FactField(const QString& value) {
  auto* field = new QLineEdit(value);
  field->setReadOnly(true);
  field->setFrame(false);
  SetPaletteColour(field, QPalette::Base, Qt::transparent);
  field->setCursorPosition(0);
  constexpr int kMargins = 8;
  field->setMinimumWidth(std::min(kWidestFact, field->fontMetrics().horizontalAdvance(value) + kMargins));
  return field;
}

}  // namespace

AboutDialog::AboutDialog(const ProgramInfo& info, QWidget& window)
    : QDialog(&window), text_(QStringLiteral("Tendril Configuration Utility\n")) {
  setObjectName(QStringLiteral("AboutDialog"));
  setWindowTitle(QStringLiteral("About Tendril Configuration Utility"));
  facts_->setVerticalSpacing(4);
  auto* heading = new QHBoxLayout;
  auto* icon = new QLabel;
  icon->setPixmap(windowIcon().pixmap(QSize(kIconSize, kIconSize), devicePixelRatioF()));
  heading->addWidget(icon);
  heading->addWidget(BoldLabel("Tendril Configuration Utility"), 1);
  auto* column = AddLayout<QVBoxLayout>(this, {16, 16, 16, 12}, 12);
  column->addLayout(heading);
  column->addLayout(facts_);
  AddFact(QStringLiteral("Version"), info.version.Text());
  AddFact(QStringLiteral("Qt"), DescribeQt());
  AddFact(QStringLiteral("Licence of Qt"),
          QStringLiteral("GNU LGPL version 3, https://www.gnu.org/licenses/lgpl-3.0.html"));
  AddFact(QStringLiteral("System"), DescribeSystem());
  AddFact(QStringLiteral("Command log"), info.command_log);
  AddFact(QStringLiteral("Registry"), info.registry);
  column->addStretch();
  AddButtons();
}

void AboutDialog::AddFact(const QString& what, const QString& value) {
  facts_->addRow(what, FactField(value));
  text_ += what + QStringLiteral(": ") + value + QLatin1Char('\n');
}

void AboutDialog::AddButtons() {
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  auto* copy = buttons->addButton(QStringLiteral("Cop&y"), QDialogButtonBox::ActionRole);
  Describe(copy, "Copies all of this as text, for a message to support.");
  connect(copy, &QPushButton::clicked, this, [this] { QGuiApplication::clipboard()->setText(text_); });
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  layout()->addWidget(buttons);
  auto* close = buttons->button(QDialogButtonBox::Close);
  close->setDefault(true);
  close->setFocus();
}

void ShowAbout(QWidget& window, const ProgramInfo& info) {
  auto* dialog = window.findChild<AboutDialog*>();
  if (dialog == nullptr) dialog = new AboutDialog(info, window);
  dialog->show();
  dialog->raise();
  dialog->activateWindow();
}

}  // namespace tendril
