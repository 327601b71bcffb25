#include "ui/command_area.h"

#include <QGroupBox>
#include <QHBoxLayout>
#include <QPushButton>
#include <QVBoxLayout>
#include <utility>

#include "ui/controls.h"

namespace tendril {

void CommandButtons::Add(QAbstractButton* button, const QString& tip, std::function<void()> action) {
  QObject::connect(button, &QAbstractButton::clicked, button, [action = std::move(action)] { action(); });
  Describe(button, tip);
  entries_.push_back({button, tip});
}

void CommandButtons::ShowRunning(const RunningCommand& running) {
  for (const auto& [button, tip] : entries_) {
    if (running.Active()) {
      Disable(button, QString::fromStdString(running.What()));
    } else {
      button->setEnabled(true);
      Describe(button, tip);
    }
  }
}

CommandArea::CommandArea(UnitCommands& commands, CommandButtons& buttons, QWidget* parent)
    : QWidget(parent),
      cmdWriteConfig_(
          Named(new QPushButton(QStringLiteral("Export Config")), QStringLiteral("cmdWriteConfig"))),
      cmdReadConfig_(
          Named(new QPushButton(QStringLiteral("Import Config")), QStringLiteral("cmdReadConfig"))) {
  auto* send =
      Named(new QPushButton(QStringLiteral("&SEND(write) Configuration")), QStringLiteral("Command3_0"));
  auto* get =
      Named(new QPushButton(QStringLiteral("&GET(read) Configuration")), QStringLiteral("Command3_1"));
  auto* update = Named(new QPushButton(QStringLiteral("&UPDATE Unit_ID")), QStringLiteral("Command3_2"));
  buttons.Add(send, kSendTip, [&commands] { commands.Send(); });
  Disable(get, kNoGetTip);
  Disable(update, QStringLiteral("Changing a unit's ID is not in this version yet."));

  auto* frame = Named(new QGroupBox(QStringLiteral("Unit")), QStringLiteral("frmUpDownLoad"));
  auto* commands_row = new QHBoxLayout(frame);
  commands_row->setContentsMargins(7, 4, 7, 6);
  commands_row->setSpacing(5);
  for (QPushButton* button : {send, get, update}) commands_row->addWidget(button);

  auto* summary = Named(new QPushButton(QStringLiteral("Summar&y")), QStringLiteral("cmdShowSummary"));
  Disable(summary, QStringLiteral("The summary of all ports is not in this version yet."));

  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(frame);
  row->addStretch();
  row->addWidget(summary, 0, Qt::AlignVCenter);
  auto* files = new QVBoxLayout;
  files->setSpacing(3);
  files->addWidget(cmdWriteConfig_);
  files->addWidget(cmdReadConfig_);
  row->addLayout(files);
}

void CommandArea::DisableExportAndImport() {
  Disable(cmdWriteConfig_, QStringLiteral("Exporting a configuration is not available."));
  Disable(cmdReadConfig_, QStringLiteral("Importing a configuration is not available."));
}

}  // namespace tendril
