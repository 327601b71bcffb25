#include "ui/command_area.h"

#include <QHBoxLayout>
#include <QPushButton>
#include <QVBoxLayout>
#include <utility>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr char kUpdateTip[] =
    "Gives the unit on the line the chosen ID. "
    "Connect one unit only: every unit that hears it would take the same ID.";
constexpr char kNoUnitZero[] = "A unit cannot have the ID 00: nothing could ever find it again.";

}  // namespace

void CommandButtons::Add(QAbstractButton* button, const QString& tip, std::function<void()> action,
                         Objection objection) {
  QObject::connect(button, &QAbstractButton::clicked, button, [action = std::move(action)] { action(); });
  Describe(button, tip);
  entries_.push_back({button, tip, std::move(objection)});
}

void CommandButtons::ShowRunning(const RunningCommand& running) {
  for (const auto& [button, tip, objection] : entries_) {
    QString why_not = QString::fromStdString(running.What());
    if (why_not.isEmpty() && objection) why_not = objection();
    EnableUnless(why_not, button, tip);
  }
}

CommandArea::CommandArea(UnitCommands& commands, const UnitTarget& target, CommandButtons& buttons,
                         std::function<void()> show_summary, QWidget* parent)
    : QWidget(parent),
      cmdShowSummary_(Named(new QPushButton(QStringLiteral("Summar&y")), QStringLiteral("cmdShowSummary"))),
      cmdWriteConfig_(
          Named(new QPushButton(QStringLiteral("Export Config")), QStringLiteral("cmdWriteConfig"))),
      cmdReadConfig_(
          Named(new QPushButton(QStringLiteral("Import Config")), QStringLiteral("cmdReadConfig"))) {
  auto* send =
      Named(new QPushButton(QStringLiteral("&SEND(write) Configuration")), QStringLiteral("Command3_0"));
  auto* get =
      Named(new QPushButton(QStringLiteral("&GET(read) Configuration")), QStringLiteral("Command3_1"));
  auto* update = Named(new QPushButton(QStringLiteral("&UPDATE Unit_ID")), QStringLiteral("Command3_2"));
  buttons.Add(send, kSendTip, [&commands] { commands.send.Start(); });
  buttons.Add(get, kGetTip, [&commands] { commands.get.Start(); });
  buttons.Add(
      update, QString::fromUtf8(kUpdateTip), [&commands] { commands.change_id.Start(); },
      [&target] { return target.UnitId() == 0 ? QString::fromUtf8(kNoUnitZero) : QString(); });

  auto* frame = Named(new FrameBox(QStringLiteral("Unit")), QStringLiteral("frmUpDownLoad"));
  auto* commands_row = new QHBoxLayout(frame);
  commands_row->setContentsMargins(7, 4, 7, 6);
  commands_row->setSpacing(5);
  for (QPushButton* button : {send, get, update}) commands_row->addWidget(button);

  QObject::connect(cmdShowSummary_, &QAbstractButton::clicked, this, std::move(show_summary));
  ShowSummaryButton(true);

  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(frame);
  row->addStretch();
  row->addWidget(cmdShowSummary_, 0, Qt::AlignVCenter);
  auto* files = new QVBoxLayout;
  files->setSpacing(3);
  files->addWidget(cmdWriteConfig_);
  files->addWidget(cmdReadConfig_);
  row->addLayout(files);
}

void CommandArea::ShowSummaryButton(bool enabled) {
  EnableUnless(enabled ? QString() : QStringLiteral("The summary is shown. \"Simulator\" goes back."),
               cmdShowSummary_, QStringLiteral("Shows all eight channels in one table."));
}

void CommandArea::DisableExportAndImport() {
  Disable(cmdWriteConfig_, QStringLiteral("Exporting a configuration is not available."));
  Disable(cmdReadConfig_, QStringLiteral("Importing a configuration is not available."));
}

}  // namespace tendril
