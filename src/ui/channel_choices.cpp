#include "ui/channel_choices.h"

#include <QHBoxLayout>
#include <QRadioButton>
#include <QVBoxLayout>
#include <utility>

namespace tendril {
namespace {

// In the order of ChannelConfig's values.
const QStringList kPowerUpCaptions{QStringLiteral("Move to Default Position"),
                                   QStringLiteral("Move to Neutral Position"),
                                   QStringLiteral("Start Pulse on First Command")};
const QStringList kLostCommCaptions{
    QStringLiteral("Hold at Current Position"), QStringLiteral("Move to Default Position"),
    QStringLiteral("Move to Neutral Position"), QStringLiteral("Stop Pulse / Start on First Command")};

constexpr char kNoChannel[] = "Click a servo first, to choose its channel.";

}  // namespace

ChannelChoices::ChannelChoices(ChannelEditor& editor, const ChannelTable& working, Events events,
                               QWidget* parent)
    : QWidget(parent),
      editor_(editor),
      working_(working),
      events_(std::move(events)),
      cmbPresets_(Named(new CalmComboBox, QStringLiteral("cmbPresets"))) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(3);
  auto* presets = new FrameBox(QStringLiteral("Standard Preset Values"));
  cmbPresets_->setAccessibleName(presets->title());
  Describe(cmbPresets_,
           QStringLiteral("Gives all eight channels these values at once: ranges, stops, positions, and "
                          "what happens at power-up and when communication is lost."));
  auto* presets_layout = new QVBoxLayout(presets);
  presets_layout->setContentsMargins(9, 2, 9, 4);
  presets_layout->addWidget(cmbPresets_);
  column->addWidget(presets);
  // "activated" is the person's own choice, of the same line again too.
  QObject::connect(cmbPresets_, &QComboBox::activated, this,
                   [this](int index) { events_.preset_chosen(static_cast<std::size_t>(index)); });

  optChannelType_ = MakeOptions(
      *column, QStringLiteral("Output"), QStringLiteral("optChannelType"),
      {QStringLiteral("Servo"), QStringLiteral("Digital"), QStringLiteral("PWM")},
      {QStringLiteral("The port drives a hobby servo."), QStringLiteral("The port is switched on and off."),
       QStringLiteral("The port gives out a pulse-width modulated signal.")},
      true);
  QObject::connect(optChannelType_, &QButtonGroup::idClicked, this,
                   [this](int id) { events_.kind_chosen(static_cast<std::int16_t>(id - 1)); });
  const auto tips = [](const QStringList& captions, const QString& when) {
    QStringList list;
    for (const QString& caption : captions) list += caption + when;
    return list;
  };
  optPowerUp_ = MakeOptions(*column, QStringLiteral("Power Up Parameters"), QStringLiteral("optPowerUp"),
                            kPowerUpCaptions,
                            tips(kPowerUpCaptions, QStringLiteral(" when the unit is switched on.")), false);
  QObject::connect(optPowerUp_, &QButtonGroup::idClicked, this,
                   [this](int id) { editor_.SetPowerUpOption(id); });
  optLostComm_ =
      MakeOptions(*column, QStringLiteral("Lost Communications Parameters"), QStringLiteral("optLostComm"),
                  kLostCommCaptions,
                  tips(kLostCommCaptions, QStringLiteral(" when the unit hears nothing any more.")), false);
  QObject::connect(optLostComm_, &QButtonGroup::idClicked, this,
                   [this](int id) { editor_.SetLostCommOption(id); });
  column->addStretch();
}

// A frame of radio buttons `array`_0, `array`_1 ... whose ids begin with 1.
QButtonGroup* ChannelChoices::MakeOptions(QLayout& column, const QString& title, const QString& array,
                                          const QStringList& captions, const QStringList& tips,
                                          bool side_by_side) {
  auto* frame = new FrameBox(title);
  auto* layout = new QBoxLayout(side_by_side ? QBoxLayout::LeftToRight : QBoxLayout::TopToBottom, frame);
  layout->setContentsMargins(9, 2, 9, 4);
  layout->setSpacing(2);
  auto* group = new QButtonGroup(this);
  for (int index = 0; index < captions.size(); ++index) {
    auto* option = Named(new QRadioButton(captions[index]), ArrayName(array, index));
    option->setAccessibleName(title + QStringLiteral(": ") + captions[index]);
    options_.push_back({option, tips[index]});
    group->addButton(option, index + 1);
    layout->addWidget(option);
  }
  column.addWidget(frame);
  return group;
}

void ChannelChoices::ListPresets() {
  for (const Preset& preset : kPresets) {
    cmbPresets_->addItem(QString::fromUtf8(preset.name.data(), static_cast<qsizetype>(preset.name.size())));
  }
  cmbPresets_->setCurrentIndex(static_cast<int>(kStartPreset));
}

void ChannelChoices::ShowChoices() {
  const auto channel = editor_.Channel();
  const ChannelConfig record = channel ? working_.At(*channel) : ChannelConfig{.PortType = -1};
  CheckOnly(*optChannelType_, record.PortType + 1);
  CheckOnly(*optPowerUp_, record.PowerUPOpt);
  CheckOnly(*optLostComm_, record.LostCommOption);
  const QString why_not = channel ? QString() : QString::fromUtf8(kNoChannel);
  for (const auto& [button, tip] : options_) EnableUnless(why_not, button, tip);
}

}  // namespace tendril
