#include "ui/summary_area.h"

#include <QFrame>
#include <QPainter>
#include <QRadioButton>
#include <QVBoxLayout>
#include <utility>

#include "ui/command_area.h"

namespace tendril {
namespace {

// Columns: an edge, the channel, its five values, three options for power-up, four for lost communications, an edge.
constexpr int kChannelColumn = 1;
constexpr int kValueColumn = 2;
constexpr int kPowerUpColumn = 7;
constexpr int kLostCommColumn = 10;
constexpr int kLastColumn = 14;
constexpr int kEdgeWidth = 2;
constexpr int kChannelWidth = 52;
constexpr int kValueWidth = 73;
constexpr int kOptionWidth = 56;
constexpr int kSpacing = 3;
constexpr double kOptionType = 0.85;  // of the captions' type size

// Lines: two of the header, the channels, the trailer.
constexpr int kHeaderLines = 2;
constexpr int kTrailerLine = kHeaderLines + static_cast<int>(kPortCount);
constexpr int kTallestTable = 500;

// The captions' line breaks keep the columns narrow.
struct Value {
  const char* caption;
  const char* name;
  SummaryField field;
  ComparedPart part;
  const char* first_text;
};
constexpr std::array<Value, 5> kValues{
    {{"Actual\nRange", "txtSumActualRange", SummaryField::kActualRange, ComparedPart::kActualRange,
      "1000--2000"},
     {"Virtual\nRange", "txtSumVirtualRange", SummaryField::kVirtualRange, ComparedPart::kVirtualRange,
      "1000--2000"},
     {"Virtual\nStops", "txtSumStopRange", SummaryField::kStops, ComparedPart::kStops, "1000--2000"},
     {"Neutral\nPosition", "txtSumNeutralPosition", SummaryField::kNeutralTrim,
      ComparedPart::kNeutralPosition, ""},
     {"Default\nPosition", "txtSumDefaultPosition", SummaryField::kDefaultPosition,
      ComparedPart::kDefaultPosition, ""}}};
constexpr std::size_t kPairs = 3;  // the first of them have a low and a high end
struct Option {
  const char* caption;
  const char* name;
};
constexpr std::array<Option, 7> kOptions{{{"Move to\nDefault\nPosition", "optSumPUDefault"},
                                          {"Move to\nNeutral\nPosition", "optSumPUNeutral"},
                                          {"Start\nPulse on\nFirst\nCommand", "optSumPUFirstCmd"},
                                          {"Hold at\nCurrent\nPosition", "optSumLCcurrent"},
                                          {"Move to\nDefault\nPosition", "optSumLCdefault"},
                                          {"Move to\nNeutral\nPosition", "optSumLCneutral"},
                                          {"Stop Pulse\n/ Start on\nFirst\nCommand", "optSumLCfirstcmd"}}};

QString OnOneLine(const char* caption) {
  return QString::fromUtf8(caption).replace(QLatin1Char('\n'), QLatin1Char(' '));
}

// Fixed columns, whatever they contain.
void SetUpColumns(QGridLayout& table) {
  table.setContentsMargins(0, 0, 0, 0);
  table.setHorizontalSpacing(kSpacing);
  table.setColumnMinimumWidth(0, kEdgeWidth);
  table.setColumnMinimumWidth(kLastColumn, kEdgeWidth);
  table.setColumnMinimumWidth(kChannelColumn, kChannelWidth);
  for (int column = kValueColumn; column < kLastColumn; ++column) {
    table.setColumnMinimumWidth(column, column < kPowerUpColumn ? kValueWidth : kOptionWidth);
    table.setColumnStretch(column, 1);
  }
}

// Adds the frame of one or more lines, behind their controls.
void AddFrame(QGridLayout& table, QFrame* frame, int line, int lines) {
  table.addWidget(frame, line, 0, lines, kLastColumn + 1);
}

void LeaveWidthToColumn(QWidget* widget) {
  widget->setSizePolicy(QSizePolicy::Ignored, widget->sizePolicy().verticalPolicy());
}

// Keeps the widget's place while the widget is hidden.
void KeepPlace(QWidget* widget) {
  QSizePolicy policy = widget->sizePolicy();
  policy.setRetainSizeWhenHidden(true);
  widget->setSizePolicy(policy);
}

QLabel* MakeCaption(const char* text) {
  auto* caption = BoldLabel(text);
  caption->setAlignment(Qt::AlignHCenter | Qt::AlignBottom);
  LeaveWidthToColumn(caption);
  return caption;
}

// Adds the captions of the options to a line of the table.
std::array<QLabel*, kOptions.size()> AddOptionCaptions(QGridLayout& table, int line,
                                                       Qt::Alignment vertically) {
  std::array<QLabel*, kOptions.size()> captions{};
  for (std::size_t i = 0; i < kOptions.size(); ++i) {
    auto* caption = captions[i] = new QLabel(QString::fromUtf8(kOptions[i].caption));
    caption->setAlignment(Qt::AlignHCenter | vertically);
    ScaleType(caption, kOptionType);
    LeaveWidthToColumn(caption);
    table.addWidget(caption, line, kPowerUpColumn + static_cast<int>(i));
  }
  return captions;
}

}  // namespace

SummaryArea::SummaryArea(TimerFactory& timers, ChannelTable& working, const Comparison& comparison,
                         QWidget* parent)
    : QWidget(parent), working_(working), comparison_(comparison), editor_(working) {
  auto* column = AddLayout<QVBoxLayout>(this, {});
  auto* table_area = new QWidget;
  table_area->setMaximumHeight(kTallestTable);
  column->addWidget(table_area, 1);
  auto& table = *new QGridLayout(table_area);
  SetUpColumns(table);
  AddHeader(table);
  for (std::size_t channel = 0; channel < kPortCount; ++channel) AddRow(table, channel);
  AddTrailer(table);
  column->addLayout(MakeButtons());
  column->addStretch();
  entry_ = new NumberEntry(editor_, timers, *window());
  connect(entry_, &NumberEntry::Changed, this, [this](std::size_t channel) {
    ShowTexts(channel);
    Q_EMIT Edited(channel);
  });
  connect(entry_, &NumberEntry::NumberDropped, this, &SummaryArea::NumberDropped);
}

QLayout* SummaryArea::MakeButtons() {
  cmdSend_ = Named(new QPushButton(QStringLiteral("Send to Tendril")), "Command3_3");
  cmdGet_ = Named(new QPushButton(QStringLiteral("Get from Tendril")), "Command3_4");
  cmdCompare_ = Named(new QPushButton(QStringLiteral("Compare with Tendril")), "cmdCompare", 1);
  auto* simulator = Named(new QPushButton(QStringLiteral("Si&mulator")), "cmdShowConfig");
  Describe(cmdSend_, QString::fromUtf8(kSendTip) + QStringLiteral(" (Ctrl+Return)"));
  Describe(cmdGet_, QString::fromUtf8(kGetTip) + QStringLiteral(" (Ctrl+G)"));
  Describe(cmdCompare_, QString::fromUtf8(kCompareTip) + QStringLiteral(" (Ctrl+M)"));
  Describe(simulator, "Shows the servos and the editor again. (F6)");
  connect(cmdSend_, &QAbstractButton::clicked, this, &SummaryArea::SendPressed);
  connect(cmdGet_, &QAbstractButton::clicked, this, &SummaryArea::GetPressed);
  connect(cmdCompare_, &QAbstractButton::clicked, this, &SummaryArea::ComparePressed);
  connect(simulator, &QAbstractButton::clicked, this, &SummaryArea::SimulatorPressed);
  auto* row = new QHBoxLayout;
  row->addStretch();
  for (QPushButton* button : {cmdSend_, cmdGet_, cmdCompare_, simulator}) row->addWidget(button);
  return row;
}

void SummaryArea::AddHeader(QGridLayout& table) {
  AddFrame(table, Named(new QFrame, "frmSumHeader"), 0, kHeaderLines);
  table.addWidget(MakeCaption("Actual Motion Parameters in µs"), 0, kValueColumn, 1,
                  kPowerUpColumn - kValueColumn);
  table.addWidget(MakeCaption("Power Up Params"), 0, kPowerUpColumn, 1, kLostCommColumn - kPowerUpColumn);
  table.addWidget(MakeCaption("Lost Comm Params"), 0, kLostCommColumn, 1, kLastColumn - kLostCommColumn);
  int column = kValueColumn;
  for (const Value& value : kValues) table.addWidget(MakeCaption(value.caption), 1, column++);
  AddOptionCaptions(table, 1, Qt::AlignBottom);
}

void SummaryArea::AddRow(QGridLayout& table, std::size_t channel) {
  Row& row = rows_[channel];
  const int line = kHeaderLines + static_cast<int>(channel);
  row.frame = Named(new SummaryRowFrame, "frmSumTable", channel);
  row.frame->setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Expanding);
  AddFrame(table, row.frame, line, 1);
  const QString name = QStringLiteral("Channel %1").arg(channel + 1);
  row.lblSumChannel = Named(BoldLabel(QStringLiteral("CHAN %1").arg(channel + 1)), "lblSumChannel", channel);
  table.addWidget(row.lblSumChannel, line, kChannelColumn);
  for (std::size_t value = 0; value < kValues.size(); ++value) {
    const QString caption = OnOneLine(kValues[value].caption);
    auto* text = row.texts[value] = Named(new PressableText, kValues[value].name, channel);
    text->setText(QString::fromUtf8(kValues[value].first_text));
    text->setAlignment(Qt::AlignCenter);
    text->setAccessibleName(QStringLiteral("%1, %2").arg(name, caption));
    Describe(text, QStringLiteral("%1 of channel %2, in µs. Press on it, or Enter, to change it.")
                       .arg(caption)
                       .arg(channel + 1));
    LeaveWidthToColumn(text);
    KeepPlace(text);
    table.addWidget(text, line, kValueColumn + static_cast<int>(value));
    connect(text, &PressableText::Pressed, this, [this, channel, text, field = kValues[value].field] {
      entry_->OpenNumberEntry(channel, field, *text);
    });
  }
  AddOptions(table, channel, name);

  row.lblSumDIOPWM = Named(BoldLabel(), "lblSumDIOPWM", channel);
  row.lblSumDIOPWM->setAlignment(Qt::AlignCenter);
  row.lblSumDIOPWM->hide();
  table.addWidget(row.lblSumDIOPWM, line, kValueColumn, 1, kLastColumn - kValueColumn);
}

void SummaryArea::AddOptions(QGridLayout& table, std::size_t channel, const QString& name) {
  Row& row = rows_[channel];
  row.power_up = new QButtonGroup(this);
  row.lost_comm = new QButtonGroup(this);
  int column = kPowerUpColumn;
  for (const Option& option : kOptions) {
    const bool power_up = column < kLostCommColumn;
    QButtonGroup& group = power_up ? *row.power_up : *row.lost_comm;
    auto* button = Named(new QRadioButton, option.name, channel);
    const QString what = power_up ? QStringLiteral("power up") : QStringLiteral("lost communications");
    button->setAccessibleName(QStringLiteral("%1, %2: %3").arg(name, what, OnOneLine(option.caption)));
    Describe(button, button->accessibleName());
    group.addButton(button, static_cast<int>(group.buttons().size()) + 1);
    KeepPlace(button);
    table.addWidget(button, kHeaderLines + static_cast<int>(channel), column++, Qt::AlignCenter);
  }
  connect(row.power_up, &QButtonGroup::idClicked, this, [this, channel](int id) {
    entry_->Leave();
    working_.At(channel).PowerUPOpt = id;
    Q_EMIT OptionChosen();
  });
  connect(row.lost_comm, &QButtonGroup::idClicked, this, [this, channel](int id) {
    entry_->Leave();
    working_.At(channel).LostCommOption = id;
    Q_EMIT OptionChosen();
  });
}

void SummaryArea::EnableControls(const QString& running_command) {
  EnableUnless(running_command, cmdSend_);
  EnableUnless(running_command, cmdGet_);
  EnableUnless(running_command, cmdCompare_);
  for (const Row& row : rows_) {
    for (PressableText* text : row.texts) EnableUnless(running_command, text);
    for (const QButtonGroup* group : {row.power_up, row.lost_comm}) {
      for (QAbstractButton* option : group->buttons()) EnableUnless(running_command, option);
    }
  }
}

void SummaryArea::NormaliseAndShowRecords() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) editor_.Normalise(channel);
  ShowRecords();
}

void SummaryArea::ShowRecords() {
  entry_->Close();
  for (std::size_t channel = 0; channel < kPortCount; ++channel) ShowRow(channel);
  ShowDifferencesInWords();
}

void SummaryArea::ShowRow(std::size_t channel) {
  const ChannelConfig& record = working_.At(channel);
  const Row& row = rows_[channel];
  const bool servo = record.PortType == kPortServo;
  for (PressableText* text : row.texts) text->setVisible(servo);
  for (const QButtonGroup* group : {row.power_up, row.lost_comm}) {
    for (QAbstractButton* option : group->buttons()) option->setVisible(servo);
  }
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
  const std::array<QString, kTexts> texts{range(record.ActualRange), range(record.VirtualRange),
                                          range(record.VirtualStops), QString::number(record.NeutralPosition),
                                          QString::number(record.DefaultPosition)};
  for (std::size_t value = 0; value < texts.size(); ++value)
    rows_[channel].texts[value]->setText(texts[value]);
  ShowDifferences(channel);
}

void SummaryArea::ShowDifferences() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) ShowDifferences(channel);
  ShowDifferencesInWords();
}

void SummaryArea::ShowDifferencesInWords() {
  QStringList lines;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    const QString differs = QString::fromStdString(comparison_.InWords(channel));
    for (const QString& line : differs.split(QLatin1Char('\n'), Qt::SkipEmptyParts))
      lines += QStringLiteral("Channel %1: %2").arg(channel + 1).arg(line);
  }
  remarks_->ShowDifferences(lines);
}

// A row without values and options is signed as a whole, whatever differs.
void SummaryArea::ShowDifferences(std::size_t channel) {
  const Row& row = rows_[channel];
  const bool servo = working_.At(channel).PortType == kPortServo;
  std::vector<const QWidget*> signed_controls;
  const auto words = [&](ComparedPart part) {
    return QString::fromStdString(comparison_.InWords(channel, part));
  };
  const auto sign = [&](const QWidget* control, const QString& differs) {
    if (servo && !differs.isEmpty()) signed_controls.push_back(control);
  };
  for (std::size_t value = 0; value < kValues.size(); ++value) {
    const QString differs = words(kValues[value].part);
    DescribeDifference(row.texts[value], differs);
    sign(row.texts[value], differs);
  }
  for (const auto& [group, part] :
       {std::pair(row.power_up, ComparedPart::kPowerUp), {row.lost_comm, ComparedPart::kLostComm}}) {
    const QString differs = words(part);
    const auto options = group->buttons();
    for (QAbstractButton* option : options) DescribeDifference(option, differs);
    sign(group->checkedButton() != nullptr ? group->checkedButton() : options.constFirst(), differs);
  }
  const QString row_differs =
      servo ? words(ComparedPart::kOutput) : QString::fromStdString(comparison_.InWords(channel));
  row.frame->ShowDiffers(!row_differs.isEmpty(), signed_controls);
  for (QLabel* label : {row.lblSumChannel, row.lblSumDIOPWM}) DescribeDifference(label, row_differs);
}

QString SummaryArea::TableText() const {
  QStringList captions{QStringLiteral("Channel"), QStringLiteral("Output")};
  for (std::size_t value = 0; value < kValues.size(); ++value) {
    const QString caption = OnOneLine(kValues[value].caption);
    captions += value < kPairs
                    ? QStringList{caption + QStringLiteral(" low"), caption + QStringLiteral(" high")}
                    : QStringList{caption};
  }
  captions += {QStringLiteral("Power Up"), QStringLiteral("Lost Comm")};
  QStringList lines{captions.join(QLatin1Char('\t'))};
  const auto chosen = [](const QButtonGroup& group, int column) {
    const int option = column - kPowerUpColumn + group.checkedId() - 1;
    return group.checkedId() < 0 ? QString() : OnOneLine(kOptions[static_cast<std::size_t>(option)].caption);
  };
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    const ChannelConfig& record = working_.At(channel);
    const Row& row = rows_[channel];
    const bool servo = record.PortType == kPortServo;
    QStringList cells{QString::number(channel + 1),
                      servo ? QStringLiteral("Servo") : row.lblSumDIOPWM->text()};
    if (servo) {
      for (const PulsePair& pair : {record.ActualRange, record.VirtualRange, record.VirtualStops})
        cells += {QString::number(pair[0]), QString::number(pair[1])};
      cells += {QString::number(record.NeutralPosition), QString::number(record.DefaultPosition),
                chosen(*row.power_up, kPowerUpColumn), chosen(*row.lost_comm, kLostCommColumn)};
    }
    cells.resize(captions.size());
    lines += cells.join(QLatin1Char('\t'));
  }
  return lines.join(QLatin1Char('\n')) + QLatin1Char('\n');
}

void SummaryArea::TakeFocus() {
  for (const Row& row : rows_) {
    if (row.texts[0]->isHidden()) continue;
    row.texts[0]->setFocus();
    return;
  }
}

void SummaryArea::AddTrailer(QGridLayout& table) {
  AddFrame(table, Named(new QFrame, "frmSumTrailer"), kTrailerLine, 1);
  remarks_ = Named(new RemarksLabel, "lblRemarks", 1);
  table.addWidget(remarks_, kTrailerLine, kChannelColumn, 1, kPowerUpColumn - kChannelColumn, Qt::AlignTop);
  const auto captions = AddOptionCaptions(table, kTrailerLine, Qt::AlignTop);
  for (std::size_t i = 0; i < captions.size(); ++i) Named(captions[i], "lblParameters", i);
}

}  // namespace tendril
