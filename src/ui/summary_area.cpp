#include "ui/summary_area.h"

#include <QFrame>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QPainter>
#include <QPushButton>
#include <QRadioButton>
#include <QVBoxLayout>
#include <utility>

#include "ui/controls.h"

namespace tendril {
namespace {

// Columns: an edge, the channel, its five values, three options for power-up, four for lost communications, an edge.
constexpr int kChannelColumn = 1;
constexpr int kValueColumn = 2;
constexpr int kPowerUpColumn = 7;
constexpr int kLostCommColumn = 10;
constexpr int kLastColumn = 14;
constexpr int kEdgeWidth = 4;
constexpr int kChannelWidth = 56;
constexpr int kValueWidth = 70;
constexpr int kOptionWidth = 74;

// Lines: two of the header, the channels, the trailer.
constexpr int kHeaderLines = 2;
constexpr int kTrailerLine = kHeaderLines + static_cast<int>(kPortCount);
constexpr int kTallestTable = 500;

// Captions are broken into lines, so that the columns can be narrow.
struct Value {
  const char* caption;
  const char* text;
  SummaryField field;
};
constexpr std::size_t kRangeValues = 3;  // the first ones show two pulse widths
constexpr std::array<Value, 5> kValues{
    {{"Actual\nRange", "txtSumActualRange", SummaryField::kActualRange},
     {"Virtual\nRange", "txtSumVirtualRange", SummaryField::kVirtualRange},
     {"Virtual\nStops", "txtSumStopRange", SummaryField::kStops},
     {"Neutral\nPosition", "txtSumNeutralPosition", SummaryField::kNeutralTrim},
     {"Default\nPosition", "txtSumDefaultPosition", SummaryField::kDefaultPosition}}};
struct Option {
  const char* caption;
  const char* button;
};
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

// What lies in the columns does not make them wider.
void SetUpColumns(QGridLayout& table) {
  table.setContentsMargins(0, 0, 0, 0);
  table.setHorizontalSpacing(4);
  table.setColumnMinimumWidth(0, kEdgeWidth);
  table.setColumnMinimumWidth(kLastColumn, kEdgeWidth);
  table.setColumnMinimumWidth(kChannelColumn, kChannelWidth);
  for (int column = kValueColumn; column < kLastColumn; ++column) {
    table.setColumnMinimumWidth(column, column < kPowerUpColumn ? kValueWidth : kOptionWidth);
    table.setColumnStretch(column, 1);
  }
}

// A thin outline. It keeps clear of the edge, which is cut where a pixel is no whole number of device pixels.
class Outline : public QFrame {
 protected:
  void paintEvent(QPaintEvent* /*event*/) override {
    QPainter painter(this);
    painter.setPen(QPen(palette().color(QPalette::Mid), 0));
    painter.drawRect(rect().adjusted(1, 1, -2, -2));
  }
};

// The frame of one or more lines, behind what stands in them.
QFrame* AddFrame(QGridLayout& table, QFrame* frame, const QString& name, int line, int lines) {
  frame->setObjectName(name);
  table.addWidget(frame, line, 0, lines, kLastColumn + 1);
  return frame;
}

void LeaveWidthToColumn(QWidget* widget) {
  widget->setSizePolicy(QSizePolicy::Ignored, widget->sizePolicy().verticalPolicy());
}

// Hidden, it leaves its place empty.
void KeepPlace(QWidget* widget) {
  QSizePolicy policy = widget->sizePolicy();
  policy.setRetainSizeWhenHidden(true);
  widget->setSizePolicy(policy);
}

QLabel* MakeCaption(const char* text) {
  auto* caption = BoldLabel(QString::fromUtf8(text));
  caption->setAlignment(Qt::AlignHCenter | Qt::AlignBottom);
  LeaveWidthToColumn(caption);
  return caption;
}

}  // namespace

SummaryArea::SummaryArea(UnitCommands& commands, CommandButtons& buttons, TimerFactory& timers,
                         ChannelTable& working, Events events, QWidget* parent)
    : QWidget(parent), working_(working), editor_(working), events_(std::move(events)) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  auto* table_area = new QWidget;
  table_area->setMaximumHeight(kTallestTable);
  column->addWidget(table_area, 1);
  auto& table = *new QGridLayout(table_area);
  SetUpColumns(table);
  AddHeader(table);
  for (int channel = 0; channel < static_cast<int>(kPortCount); ++channel) AddRow(table, channel);
  AddTrailer(table);
  column->addLayout(MakeButtons(commands, buttons));
  column->addStretch();
  entry_ = new NumberEntry(
      editor_, timers,
      [this](std::size_t channel) {
        ShowTexts(channel);
        events_.edited(channel);
      },
      *window());
}

QLayout* SummaryArea::MakeButtons(UnitCommands& commands, CommandButtons& buttons) {
  // The same actions as those of the unit commands above.
  auto* send = Named(new QPushButton(QStringLiteral("Send to Tendril")), QStringLiteral("Command3_3"));
  buttons.Add(send, kSendTip, [&commands] { commands.send.Start(); });
  auto* get = Named(new QPushButton(QStringLiteral("Get from Tendril")), QStringLiteral("Command3_4"));
  buttons.Add(get, kGetTip, [&commands] { commands.get.Start(); });
  auto* simulator = Named(new QPushButton(QStringLiteral("Si&mulator")), QStringLiteral("cmdShowConfig"));
  Describe(simulator, QStringLiteral("Shows the servos and the editor again."));
  QObject::connect(simulator, &QAbstractButton::clicked, this, events_.back);
  auto* row = new QHBoxLayout;
  row->addStretch();
  for (QPushButton* button : {send, get, simulator}) row->addWidget(button);
  return row;
}

void SummaryArea::AddHeader(QGridLayout& table) {
  AddFrame(table, new QFrame, QStringLiteral("frmSumHeader"), 0, kHeaderLines);
  table.addWidget(MakeCaption("Actual Motion Parameters in µs"), 0, kValueColumn, 1,
                  kPowerUpColumn - kValueColumn);
  table.addWidget(MakeCaption("Power Up Params"), 0, kPowerUpColumn, 2, kLostCommColumn - kPowerUpColumn);
  table.addWidget(MakeCaption("Lost Comm Params"), 0, kLostCommColumn, 2, kLastColumn - kLostCommColumn);
  int column = kValueColumn;
  for (const Value& value : kValues) table.addWidget(MakeCaption(value.caption), 1, column++);
}

void SummaryArea::AddRow(QGridLayout& table, int channel) {
  Row& row = rows_[static_cast<std::size_t>(channel)];
  const int line = kHeaderLines + channel;
  QFrame* frame = AddFrame(table, new Outline, ArrayName(QStringLiteral("frmSumTable"), channel), line, 1);
  frame->setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Expanding);
  const QString name = QStringLiteral("CHAN %1").arg(channel + 1);
  table.addWidget(Named(BoldLabel(name), ArrayName(QStringLiteral("lblSumChannel"), channel)), line,
                  kChannelColumn);
  int column = kValueColumn;
  for (std::size_t value = 0; value < kValues.size(); ++value) {
    const QString caption = OnOneLine(kValues[value].caption);
    auto* text = Named(new PressableText([this, value, slot = static_cast<std::size_t>(channel)] {
                         entry_->OpenNumberEntry(slot, kValues[value].field, *rows_[slot].texts[value]);
                       }),
                       ArrayName(QString::fromUtf8(kValues[value].text), channel));
    text->setAlignment(Qt::AlignCenter);
    text->setAccessibleName(name + QStringLiteral(", ") + caption);
    Describe(text, QStringLiteral("%1 of channel %2, in µs. Press on it, or Enter, to change it.")
                       .arg(caption)
                       .arg(channel + 1));
    LeaveWidthToColumn(text);
    KeepPlace(text);
    table.addWidget(text, line, column++);
    row.texts[value] = text;
  }

  AddOptions(table, channel, name);

  row.lblSumDIOPWM = Named(BoldLabel({}), ArrayName(QStringLiteral("lblSumDIOPWM"), channel));
  row.lblSumDIOPWM->setAlignment(Qt::AlignCenter);
  row.lblSumDIOPWM->hide();
  table.addWidget(row.lblSumDIOPWM, line, kValueColumn, 1, kLastColumn - kValueColumn);
}

void SummaryArea::AddOptions(QGridLayout& table, int channel, const QString& name) {
  const auto slot = static_cast<std::size_t>(channel);
  Row& row = rows_[slot];
  const int line = kHeaderLines + channel;
  int column = kPowerUpColumn;
  row.power_up = new QButtonGroup(this);
  row.lost_comm = new QButtonGroup(this);
  for (const Option& option : kOptions) {
    const bool power_up = column < kLostCommColumn;
    QButtonGroup& group = power_up ? *row.power_up : *row.lost_comm;
    auto* button = Named(new QRadioButton, ArrayName(QString::fromUtf8(option.button), channel));
    const QString what = power_up ? QStringLiteral("power up") : QStringLiteral("lost communications");
    button->setAccessibleName(QStringLiteral("%1, %2: %3").arg(name, what, OnOneLine(option.caption)));
    Describe(button, button->accessibleName());
    group.addButton(button, static_cast<int>(group.buttons().size()) + 1);
    KeepPlace(button);
    table.addWidget(button, line, column++, Qt::AlignCenter);
    row.options.push_back(button);
  }
  QObject::connect(row.power_up, &QButtonGroup::idClicked, this, [this, slot](int id) {
    entry_->Close();
    working_.At(slot).PowerUPOpt = id;
  });
  QObject::connect(row.lost_comm, &QButtonGroup::idClicked, this, [this, slot](int id) {
    entry_->Close();
    working_.At(slot).LostCommOption = id;
  });
}

void SummaryArea::ShowRecords() {
  entry_->Close();
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    editor_.Normalise(channel);
    ShowRow(channel);
  }
}

void SummaryArea::ShowRow(std::size_t channel) {
  const ChannelConfig& record = working_.At(channel);
  const Row& row = rows_[channel];
  const bool servo = record.PortType == kPortServo;
  for (QLineEdit* text : row.texts) text->setVisible(servo);
  for (QAbstractButton* option : row.options) option->setVisible(servo);
  row.lblSumDIOPWM->setVisible(!servo);
  row.lblSumDIOPWM->setText(record.PortType == kPortDigital ? QStringLiteral("Digital")
                            : record.PortType == kPortPwm   ? QStringLiteral("PWM")
                                                            : QString());
  CheckOnly(*row.power_up, record.PowerUPOpt);
  CheckOnly(*row.lost_comm, record.LostCommOption);
  ShowTexts(channel);
}

void SummaryArea::ShowTexts(std::size_t channel) {
  const ChannelConfig& record = working_.At(channel);
  const auto range = [](const PulsePair& pair) { return QStringLiteral("%1-%2").arg(pair[0]).arg(pair[1]); };
  const std::array<QString, kFields> texts{
      range(record.ActualRange), range(record.VirtualRange), range(record.VirtualStops),
      QString::number(record.NeutralPosition), QString::number(record.DefaultPosition)};
  for (std::size_t value = 0; value < texts.size(); ++value)
    rows_[channel].texts[value]->setText(texts[value]);
}

void SummaryArea::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Escape) {
    entry_->Close();
  } else {
    QWidget::keyPressEvent(event);
  }
}

void SummaryArea::TakeFocus() {
  for (const Row& row : rows_) {
    if (row.texts[0]->isHidden()) continue;
    row.texts[0]->setFocus();
    return;
  }
}

void SummaryArea::AddTrailer(QGridLayout& table) {
  AddFrame(table, new QFrame, QStringLiteral("frmSumTrailer"), kTrailerLine, 1);
  remarks_ = Named(new RemarksLabel, ArrayName(QStringLiteral("lblRemarks"), 1));
  table.addWidget(remarks_, kTrailerLine, kChannelColumn, 1, kPowerUpColumn - kChannelColumn, Qt::AlignTop);
  for (int option = 0; option < static_cast<int>(kOptions.size()); ++option) {
    auto* caption = Named(new QLabel(QString::fromUtf8(kOptions[static_cast<std::size_t>(option)].caption)),
                          ArrayName(QStringLiteral("lblParameters"), option));
    caption->setAlignment(Qt::AlignHCenter | Qt::AlignTop);
    QFont small = caption->font();
    small.setPointSizeF(small.pointSizeF() * 0.9);
    caption->setFont(small);
    LeaveWidthToColumn(caption);
    table.addWidget(caption, kTrailerLine, kPowerUpColumn + option);
  }
}

void SummaryArea::SetRangeCaptions(const QString& caption) {
  for (const Row& row : rows_) {
    for (std::size_t value = 0; value < kRangeValues; ++value) row.texts[value]->setText(caption);
  }
}

}  // namespace tendril
