#include "ui/command_area.h"

#include <QGroupBox>
#include <QVBoxLayout>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr int kApart = 24;  // between the commands that come often and the one that gives a unit another ID
constexpr double kSmallType = 0.85;

}  // namespace

CommandArea::CommandArea()
    : cmdSend_(Named(new QPushButton(QStringLiteral("&SEND(write) Configuration")), "Command3_0")),
      cmdGet_(Named(new QPushButton(QStringLiteral("&GET(read) Configuration")), "Command3_1")),
      cmdCompare_(Named(new QPushButton(QStringLiteral("Comp&are")), "cmdCompare", 0)),
      cmdChangeId_(Named(new QPushButton(QStringLiteral("UPDATE Unit_ID")), "Command3_2")),
      cmdShowSummary_(Named(new QPushButton(QStringLiteral("Summar&y")), "cmdShowSummary")) {
  Describe(cmdSend_, kSendTip);
  Describe(cmdGet_, kGetTip);
  Describe(cmdCompare_, kCompareTip);
  Describe(cmdChangeId_,
           "Gives the unit on the line the chosen ID. "
           "Connect one unit only: every unit that hears it would take the same ID.");
  Describe(cmdShowSummary_, "Shows all eight channels in one table.");
  connect(cmdSend_, &QAbstractButton::clicked, this, &CommandArea::SendPressed);
  connect(cmdGet_, &QAbstractButton::clicked, this, &CommandArea::GetPressed);
  connect(cmdCompare_, &QAbstractButton::clicked, this, &CommandArea::ComparePressed);
  connect(cmdChangeId_, &QAbstractButton::clicked, this, &CommandArea::ChangeIdPressed);
  connect(cmdShowSummary_, &QAbstractButton::clicked, this, &CommandArea::SummaryPressed);

  auto* frame = Named(new QGroupBox(QStringLiteral("Unit")), "frmUpDownLoad");
  auto* commands = AddLayout<QHBoxLayout>(frame, {7, 4, 7, 6}, 5);
  for (QPushButton* button : {cmdSend_, cmdGet_, cmdCompare_}) commands->addWidget(button);
  commands->addSpacing(kApart);
  commands->addWidget(cmdChangeId_);

  // Without function.
  auto* write = Named(new QPushButton(QStringLiteral("Export Config")), "cmdWriteConfig");
  auto* read = Named(new QPushButton(QStringLiteral("Import Config")), "cmdReadConfig");
  EnableUnless(QStringLiteral("Exporting a configuration is not available."), write);
  EnableUnless(QStringLiteral("Importing a configuration is not available."), read);

  auto* row = AddLayout<QHBoxLayout>(this, {});
  row->addWidget(frame);
  row->addStretch();
  row->addWidget(cmdShowSummary_, 0, Qt::AlignVCenter);
  auto* files = new QVBoxLayout;
  files->setSpacing(3);
  for (QPushButton* file : {write, read}) {
    ScaleType(file, kSmallType);
    files->addWidget(file);
  }
  row->addLayout(files);
}

void CommandArea::EnableCommands(const QString& running_command, std::uint8_t unit_id, bool summary_shown) {
  EnableUnless(running_command, cmdSend_);
  EnableUnless(running_command, cmdGet_);
  EnableUnless(running_command, cmdCompare_);
  EnableUnless(running_command.isEmpty() && unit_id == 0
                   ? QStringLiteral("A unit cannot have the ID 00: nothing could ever find it again.")
                   : running_command,
               cmdChangeId_);
  EnableUnless(running_command.isEmpty() && summary_shown
                   ? QStringLiteral("The summary is shown. \"Simulator\" goes back.")
                   : running_command,
               cmdShowSummary_);
}

}  // namespace tendril
