#include "ui/summary_area.h"

#include <QFrame>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QPushButton>
#include <QRadioButton>
#include <QSpinBox>
#include <array>

#include "config/channel_config.h"
#include "ui/controls.h"

namespace tendril {
namespace {

constexpr char kNotYet[] = "The summary of all ports is not in this version yet.";

// Columns: the channel, its five values, three options for power-up, four for lost communications.
constexpr int kValueColumn = 1;
constexpr int kPowerUpColumn = 6;
constexpr int kLostCommColumn = 9;
constexpr int kColumns = 13;
constexpr int kValueWidth = 80;
constexpr int kOptionWidth = 56;

struct Value {
  const char* caption;
  const char* box;
  bool range;
};
constexpr std::array<Value, 5> kValues{{{"Actual Range", "txtSumActualRange", true},
                                        {"Virtual Range", "txtSumVirtualRange", true},
                                        {"Virtual Stops", "txtSumStopRange", true},
                                        {"Neutral\nPosition", "txtSumNeutralPosition", false},
                                        {"Default\nPosition", "txtSumDefaultPosition", false}}};
struct Option {
  const char* caption;
  const char* button;
};
// Broken where the columns are narrow.
constexpr std::array<Option, 7> kOptions{{{"Move to\nDefault\nPosition", "optSumPUDefault"},
                                          {"Move to\nNeutral\nPosition", "optSumPUNeutral"},
                                          {"Start Pulse\non First\nCommand", "optSumPUFirstCmd"},
                                          {"Hold at\nCurrent\nPosition", "optSumLCcurrent"},
                                          {"Move to\nDefault\nPosition", "optSumLCdefault"},
                                          {"Move to\nNeutral\nPosition", "optSumLCneutral"},
                                          {"Stop Pulse /\nStart on First\nCommand", "optSumLCfirstcmd"}}};

QString OnOneLine(const char* caption) {
  return QString::fromUtf8(caption).replace(QLatin1Char('\n'), QLatin1Char(' '));
}

// The columns that header, rows and trailer have in common.
QGridLayout* MakeColumns(QWidget* frame) {
  auto* grid = new QGridLayout(frame);
  grid->setContentsMargins(6, 0, 6, 0);
  grid->setColumnMinimumWidth(0, kValueWidth);
  for (int column = kValueColumn; column < kColumns; ++column) {
    grid->setColumnMinimumWidth(column, column < kPowerUpColumn ? kValueWidth : kOptionWidth);
    grid->setColumnStretch(column, 1);
  }
  return grid;
}

QLabel* MakeCaption(const char* text) {
  auto* caption = BoldLabel(QString::fromUtf8(text));
  caption->setAlignment(Qt::AlignCenter);
  return caption;
}

}  // namespace

SummaryArea::SummaryArea(UnitCommands& commands, CommandButtons& buttons, QWidget* parent) : QWidget(parent) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->addWidget(MakeHeader());
  for (int channel = 0; channel < static_cast<int>(kPortCount); ++channel)
    column->addWidget(MakeRow(channel));
  column->addWidget(MakeTrailer());

  column->addLayout(MakeButtons(commands, buttons));
  column->addStretch();
  MakeNumberEntry();
}

QLayout* SummaryArea::MakeButtons(UnitCommands& commands, CommandButtons& buttons) {
  // The same actions as those of the unit commands above.
  auto* send = Named(new QPushButton(QStringLiteral("Send to Tendril")), QStringLiteral("Command3_3"));
  buttons.Add(send, kSendTip, [&commands] { commands.Send(); });
  auto* get = Named(new QPushButton(QStringLiteral("Get from Tendril")), QStringLiteral("Command3_4"));
  buttons.Add(get, kGetTip, [&commands] { commands.Get(); });
  auto* back = Named(new QPushButton(QStringLiteral("Simulator")), QStringLiteral("cmdShowConfig"));
  Disable(back, QString::fromUtf8(kNotYet));
  auto* row = new QHBoxLayout;
  row->addStretch();
  for (QPushButton* button : {send, get, back}) row->addWidget(button);
  return row;
}

// The panel in which a value of the table is changed; hidden until a value is pressed.
void SummaryArea::MakeNumberEntry() {
  auto* panel = Named(new QFrame(this), QStringLiteral("fraNumberEntry"));
  panel->setFrameShape(QFrame::StyledPanel);
  panel->setAutoFillBackground(true);
  panel->hide();
  auto* grid = new QGridLayout(panel);
  grid->addWidget(Named(BoldLabel({}), QStringLiteral("lblDisplay")), 0, 0, 1, 2);
  for (int index = 0; index < 2; ++index) {
    auto* spin = Named(new QSpinBox, ArrayName(QStringLiteral("spnSumValue"), index));
    spin->setAccessibleName(index == 0 ? QStringLiteral("New value") : QStringLiteral("New right stop"));
    Disable(spin, QString::fromUtf8(kNotYet));
    grid->addWidget(spin, 1, index);
    grid->addWidget(Named(new QLabel, ArrayName(QStringLiteral("lblSumValue"), index)), 2, index);
  }
}

QWidget* SummaryArea::MakeHeader() {
  auto* header = Named(new QFrame, QStringLiteral("frmSumHeader"));
  QGridLayout* grid = MakeColumns(header);
  grid->addWidget(MakeCaption("Actual Motion Parameters in µs"), 0, kValueColumn, 1,
                  kPowerUpColumn - kValueColumn);
  grid->addWidget(MakeCaption("Power Up Params"), 0, kPowerUpColumn, 2, kLostCommColumn - kPowerUpColumn);
  grid->addWidget(MakeCaption("Lost Comm Params"), 0, kLostCommColumn, 2, kColumns - kLostCommColumn);
  for (int value = 0; value < static_cast<int>(kValues.size()); ++value) {
    grid->addWidget(MakeCaption(kValues[static_cast<std::size_t>(value)].caption), 1, kValueColumn + value);
  }
  return header;
}

QWidget* SummaryArea::MakeRow(int channel) {
  auto* row = Named(new QFrame, ArrayName(QStringLiteral("frmSumTable"), channel));
  row->setFrameShape(QFrame::StyledPanel);
  QGridLayout* grid = MakeColumns(row);
  const QString name = QStringLiteral("CHAN %1").arg(channel + 1);
  grid->addWidget(Named(BoldLabel(name), ArrayName(QStringLiteral("lblSumChannel"), channel)), 0, 0);
  int column = kValueColumn;
  for (const Value& value : kValues) {
    auto* box = Named(new QLineEdit, ArrayName(QString::fromUtf8(value.box), channel));
    box->setReadOnly(true);
    box->setAlignment(Qt::AlignCenter);
    box->setAccessibleName(name + QStringLiteral(", ") + OnOneLine(value.caption));
    Disable(box, QString::fromUtf8(kNotYet));
    if (value.range) range_boxes_.push_back(box);
    grid->addWidget(box, 0, column++);
  }
  for (const Option& option : kOptions) {
    auto* button = Named(new QRadioButton, ArrayName(QString::fromUtf8(option.button), channel));
    const QString group =
        column < kLostCommColumn ? QStringLiteral("power up") : QStringLiteral("lost communications");
    button->setAccessibleName(QStringLiteral("%1, %2: %3").arg(name, group, OnOneLine(option.caption)));
    Disable(button, QString::fromUtf8(kNotYet));
    grid->addWidget(button, 0, column++, Qt::AlignCenter);
  }
  return row;
}

QWidget* SummaryArea::MakeTrailer() {
  auto* trailer = Named(new QFrame, QStringLiteral("frmSumTrailer"));
  QGridLayout* grid = MakeColumns(trailer);
  for (int option = 0; option < static_cast<int>(kOptions.size()); ++option) {
    auto* caption = Named(DimLabel(QString::fromUtf8(kOptions[static_cast<std::size_t>(option)].caption)),
                          ArrayName(QStringLiteral("lblParameters"), option));
    caption->setAlignment(Qt::AlignHCenter | Qt::AlignTop);
    grid->addWidget(caption, 0, kPowerUpColumn + option);
  }
  return trailer;
}

void SummaryArea::SetRangeCaptions(const QString& caption) {
  for (QLineEdit* box : range_boxes_) box->setText(caption);
}

}  // namespace tendril
