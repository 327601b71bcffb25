#include "ui/connection_area.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QSignalBlocker>
#include <functional>
#include <utility>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr int kDigits = 16;
constexpr std::array kUnitIdTips{
    "First hexadecimal digit of the unit's ID, 0 to F. A unit fresh from the factory has FF.",
    "Second hexadecimal digit of the unit's ID, 0 to F. A unit fresh from the factory has FF."};
constexpr int kLongestPortLine = 7;  // "Comm 25"
constexpr char kPortTip[] = "The serial port that the units are connected to. Choosing it opens it at once.";

// Says when it is about to be opened.
class PortList final : public CalmComboBox {
 public:
  explicit PortList(std::function<void()> opening) : opening_(std::move(opening)) {}

  void showPopup() override {
    opening_();
    CalmComboBox::showPopup();
  }

 private:
  std::function<void()> opening_;
};

}  // namespace

ConnectionArea::ConnectionArea(PortSelection& ports, QWidget* parent)
    : QWidget(parent),
      ports_(ports),
      cmbNYX_(Named(new PortList([this] { RereadCommPorts(); }), QStringLiteral("cmbNYX"))) {
  auto* port_label = new QLabel(QStringLiteral("&Comm Port"));
  port_label->setBuddy(cmbNYX_);
  cmbNYX_->setSizeAdjustPolicy(QComboBox::AdjustToContents);
  cmbNYX_->setMinimumContentsLength(kLongestPortLine);
  cmbNYX_->setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  cmbNYX_->setAccessibleName(QStringLiteral("Comm Port"));

  auto* id_label = new QLabel(QStringLiteral("Select Unit &ID"));
  auto* group = new FrameBox(QStringLiteral("Connection"));
  auto* row = new QHBoxLayout(group);
  row->setContentsMargins(7, 4, 7, 6);
  row->setSpacing(5);
  row->addWidget(port_label);
  row->addWidget(cmbNYX_);
  row->addSpacing(6);
  row->addWidget(id_label);
  for (std::size_t digit = 0; digit < CmbUnitID_.size(); ++digit) {
    auto* box = Named(new CalmComboBox, ArrayName(QStringLiteral("CmbUnitID"), static_cast<int>(digit)));
    box->setMaxVisibleItems(kDigits);
    box->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    box->setMinimumContentsLength(1);
    box->setIconSize({0, 0});  // there are no icons to keep room for
    box->setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
    box->setAccessibleName(digit == 0 ? QStringLiteral("Unit ID, first digit")
                                      : QStringLiteral("Unit ID, second digit"));
    row->addWidget(box);
    QObject::connect(box, &QComboBox::currentIndexChanged, this, [this] {
      if (unit_id_changed_) unit_id_changed_();
    });
    CmbUnitID_[digit] = box;
  }
  id_label->setBuddy(CmbUnitID_[0]);

  auto* layout = new QHBoxLayout(this);
  layout->setContentsMargins(0, 0, 0, 0);
  layout->addWidget(group);
  ShowRunning({});

  // "activated" is the person's own choice, of the same line again too; what the program selects is none.
  QObject::connect(cmbNYX_, &QComboBox::activated, this,
                   [this](int entry) { ports_.Choose(static_cast<std::size_t>(entry)); });
}

void ConnectionArea::FillUnitIds() {
  for (QComboBox* box : CmbUnitID_) {
    for (int digit = 0; digit < kDigits; ++digit) box->addItem(QString::number(digit, kDigits).toUpper());
  }
  CmbUnitID_[1]->setCurrentIndex(1);
}

void ConnectionArea::ListCommPorts() { ShowPorts(ports_.ListCommPorts(), 0); }

void ConnectionArea::ShowPorts(const std::vector<std::string>& lines, std::size_t selected) {
  cmbNYX_->clear();
  for (const std::string& line : lines) cmbNYX_->addItem(QString::fromStdString(line));
  cmbNYX_->setCurrentIndex(static_cast<int>(selected));
}

// An adapter that was plugged in since then is found by whoever looks for it. The ports are described now, since
// asking the system about each takes a moment that the start-up does not have.
void ConnectionArea::RereadCommPorts() {
  const QSignalBlocker nothing_is_chosen(cmbNYX_);
  auto selected = static_cast<std::size_t>(cmbNYX_->currentIndex());
  const std::vector<std::string> lines = ports_.RereadCommPorts(selected);
  ShowPorts(lines, selected);
  for (std::size_t entry = 0; entry < lines.size(); ++entry) {
    const QString device = QString::fromStdString(ports_.DescribePort(entry));
    for (const int role : {Qt::ToolTipRole, Qt::AccessibleDescriptionRole})
      cmbNYX_->setItemData(static_cast<int>(entry), device, role);
  }
}

void ConnectionArea::ShowRunning(const std::string& what) {
  const QString why_not = QString::fromStdString(what);
  EnableUnless(why_not, cmbNYX_, QString::fromUtf8(kPortTip));
  for (std::size_t digit = 0; digit < CmbUnitID_.size(); ++digit) {
    EnableUnless(why_not, CmbUnitID_[digit], QString::fromUtf8(kUnitIdTips[digit]));
  }
}

bool ConnectionArea::PortChosen() const { return cmbNYX_->currentIndex() > 0; }

std::uint8_t ConnectionArea::UnitId() const {
  return static_cast<std::uint8_t>(CmbUnitID_[0]->currentIndex() * kDigits + CmbUnitID_[1]->currentIndex());
}

}  // namespace tendril
