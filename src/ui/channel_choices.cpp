#include "ui/channel_choices.h"

#include <QGroupBox>
#include <QRadioButton>

#include "config/option_texts.h"
#include "ui/list_combo_box.h"

namespace tendril {

ChannelChoices::ChannelChoices(ChannelEditor& editor, const ChannelTable& working,
                               const Comparison& comparison)
    : editor_(editor), working_(working), comparison_(comparison) {
  auto* column = AddLayout<QVBoxLayout>(this, {}, 3);
  column->addWidget(MakePresets());
  optChannelType_ =
      AddOptions(QStringLiteral("Output"), "optChannelType",
                 {{QLatin1StringView(kOutputTexts[0]), QStringLiteral("The port drives a hobby servo.")},
                  {QLatin1StringView(kOutputTexts[1]), QStringLiteral("The port is switched on and off.")},
                  {QLatin1StringView(kOutputTexts[2]),
                   QStringLiteral("The port gives out a pulse-width modulated signal.")}},
                 QBoxLayout::LeftToRight);
  optPowerUp_ = AddOptions(QStringLiteral("Power Up Parameters"), "optPowerUp",
                           Choices(kPowerUpTexts, " when the unit is switched on."), QBoxLayout::TopToBottom);
  optLostComm_ =
      AddOptions(QStringLiteral("Lost Communications Parameters"), "optLostComm",
                 Choices(kLostCommTexts, " when the unit hears nothing any more."), QBoxLayout::TopToBottom);
  column->addStretch();
  connect(optChannelType_, &QButtonGroup::idClicked, this,
          [this](int id) { Q_EMIT KindChosen(static_cast<std::int16_t>(id - 1)); });
  connect(optPowerUp_, &QButtonGroup::idClicked, this, [this](int id) {
    editor_.SetPowerUpOption(id);
    Q_EMIT OptionChosen(QStringLiteral("Power Up Parameters"));
  });
  connect(optLostComm_, &QButtonGroup::idClicked, this, [this](int id) {
    editor_.SetLostCommOption(id);
    Q_EMIT OptionChosen(QStringLiteral("Lost Communications Parameters"));
  });
}

std::vector<ChannelChoices::Choice> ChannelChoices::Choices(std::span<const char* const> captions,
                                                            const char* when) {
  std::vector<Choice> choices;
  for (const char* text : captions) {
    const QString caption = QString::fromUtf8(text);
    choices.push_back({caption, caption + QString::fromUtf8(when)});
  }
  return choices;
}

QWidget* ChannelChoices::MakePresets() {
  auto* frame = new QGroupBox(QStringLiteral("Standard Preset Values"));
  // Enter only opens the list: one slip would overwrite eight channels.
  auto* presets = cmbPresets_ = Named(new ListComboBox(ListComboBox::Enter::kOpensList), "cmbPresets");
  presets->setAccessibleName(frame->title());
  Describe(presets,
           "Gives all eight channels these values at once: ranges, stops, positions, and "
           "what happens at power-up and when communication is lost.");
  for (const Preset& preset : kPresets) presets->addItem(QAnyStringView(preset.name).toString());
  presets->setCurrentIndex(static_cast<int>(kStartPreset));
  AddLayout<QVBoxLayout>(frame, {5, 2, 5, 4})->addWidget(presets);
  // The user's own choice, also of the current line.
  connect(presets, &QComboBox::activated, this,
          [this](int index) { Q_EMIT PresetChosen(static_cast<std::size_t>(index)); });
  return frame;
}

// Adds a frame of radio buttons `array`_0, `array`_1 ... whose ids begin with 1.
QButtonGroup* ChannelChoices::AddOptions(const QString& title, const char* array,
                                         const std::vector<Choice>& choices,
                                         QBoxLayout::Direction direction) {
  auto* frame = new QGroupBox(title);
  auto* box = AddLayout<QVBoxLayout>(frame, {5, 2, 5, 4}, 2);
  box->setDirection(direction);
  auto* group = new QButtonGroup(this);
  for (std::size_t i = 0; i < choices.size(); ++i) {
    auto* option = Named(new QRadioButton(choices[i].caption), array, i);
    option->setAccessibleName(QStringLiteral("%1: %2").arg(title, choices[i].caption));
    Describe(option, choices[i].tip);
    group->addButton(option, static_cast<int>(i) + 1);
    box->addWidget(option);
  }
  layout()->addWidget(frame);
  return group;
}

void ChannelChoices::ShowChoices() {
  const auto channel = editor_.Channel();
  const ChannelConfig record = channel ? working_.At(*channel) : ChannelConfig{.PortType = -1};
  CheckOnly(*optChannelType_, record.PortType + 1);
  CheckOnly(*optPowerUp_, record.PowerUPOpt);
  CheckOnly(*optLostComm_, record.LostCommOption);
  ShowDifferences();
  EnableOptions();
}

// The title has room for the sign: the options below it are wider.
void ChannelChoices::ShowDifferences() {
  const auto channel = editor_.Channel();
  const auto show = [&](const QButtonGroup& group, ComparedPart part) {
    const QString words = channel ? QString::fromStdString(comparison_.InWords(*channel, part)) : QString();
    auto& frame = *static_cast<QGroupBox*>(group.buttons().constFirst()->parentWidget());
    const QString sign = QStringLiteral("≠ ");
    if (frame.title().startsWith(sign) == words.isEmpty())
      frame.setTitle(words.isEmpty() ? frame.title().mid(sign.size()) : sign + frame.title());
    DescribeDifference(&frame, words);
    for (QAbstractButton* option : group.buttons()) DescribeDifference(option, words);
  };
  show(*optChannelType_, ComparedPart::kOutput);
  show(*optPowerUp_, ComparedPart::kPowerUp);
  show(*optLostComm_, ComparedPart::kLostComm);
}

void ChannelChoices::EnableControls(const QString& running_command) {
  running_command_ = running_command;
  EnableUnless(running_command, cmbPresets_);
  EnableOptions();
}

void ChannelChoices::EnableOptions() {
  const QString why_not = running_command_.isEmpty() && !editor_.Channel()
                              ? QStringLiteral("Choose a channel first: click a servo, or Ctrl+1.")
                              : running_command_;
  for (const QButtonGroup* group : {optChannelType_, optPowerUp_, optLostComm_}) {
    for (QAbstractButton* option : group->buttons()) EnableUnless(why_not, option);
  }
}

}  // namespace tendril
