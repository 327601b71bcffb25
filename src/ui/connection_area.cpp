#include "ui/connection_area.h"

#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QSignalBlocker>

#include "ui/model/port_sentences.h"

namespace tendril {
namespace {

constexpr int kDigits = 16;
constexpr int kLongestPortLine = 7;  // "Comm 25"
constexpr char kWhatItDoes[] =
    "The serial port that the units are connected to. Choosing it opens it at once.";

}  // namespace

ConnectionArea::ConnectionArea(PortSelection& ports)
    : ports_(ports),
      cmbNYX_(Named(new ListComboBox(ListComboBox::Enter::kChoosesAgain), "cmbNYX")),
      cmdFindUnits_(Named(new QPushButton(QStringLiteral("&Find...")), "cmdFindUnits")) {
  auto* port_label = new QLabel(QStringLiteral("&Comm Port"));
  port_label->setBuddy(cmbNYX_);
  cmbNYX_->setSizeAdjustPolicy(QComboBox::AdjustToContents);
  cmbNYX_->setMinimumContentsLength(kLongestPortLine);
  cmbNYX_->setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  cmbNYX_->setAccessibleName(QStringLiteral("Comm Port"));
  connect(cmbNYX_, &CalmComboBox::Opening, this, &ConnectionArea::DescribePorts);
  // The user's own choice, also of the current line; what the program selects does not emit "activated".
  connect(cmbNYX_, &QComboBox::activated, this,
          [this](int line) { ports_.Choose(static_cast<std::size_t>(line)); });

  CmbUnitID_ = {MakeDigit(0, "First"), MakeDigit(1, "Second")};
  CmbUnitID_[1]->setCurrentIndex(1);
  auto* id_label = new QLabel(QStringLiteral("Select Unit &ID"));
  id_label->setBuddy(CmbUnitID_[0]);

  Describe(cmdFindUnits_, "Asks every ID from 01 to FD who is there, and lists the units that answer.");
  connect(cmdFindUnits_, &QAbstractButton::clicked, this, &ConnectionArea::FindPressed);

  auto* group = new QGroupBox(QStringLiteral("Connection"));
  auto* row = AddLayout<QHBoxLayout>(group, {7, 4, 7, 6}, 5);
  row->addWidget(port_label);
  row->addWidget(cmbNYX_);
  row->addSpacing(6);
  row->addWidget(id_label);
  for (CalmComboBox* digit : CmbUnitID_) row->addWidget(digit);
  row->addWidget(cmdFindUnits_);
  row->addStretch();
  AddLayout<QHBoxLayout>(this, {})->addWidget(group);
}

CalmComboBox* ConnectionArea::MakeDigit(std::size_t index, const char* which) {
  const QString place = QString::fromUtf8(which);
  auto* box = Named(new CalmComboBox, "CmbUnitID", index);
  for (int digit = 0; digit < kDigits; ++digit) box->addItem(QString::number(digit, kDigits).toUpper());
  box->setMaxVisibleItems(kDigits);
  box->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
  box->setMinimumContentsLength(1);
  box->setIconSize({0, 0});  // keeps no room for icons
  box->setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  box->setAccessibleName(QStringLiteral("Unit ID, %1 digit").arg(place.toLower()));
  Describe(box, QStringLiteral(
                    "%1 hexadecimal digit of the unit's ID, 0 to F. A unit fresh from the factory has FF.")
                    .arg(place));
  connect(box, &QComboBox::currentIndexChanged, this, &ConnectionArea::UnitIdChanged);
  return box;
}

void ConnectionArea::ListCommPorts() { ShowPorts(ports_.ListCommPorts(), 0); }

void ConnectionArea::WatchCommPorts() {
  ports_.WatchPorts([this] { RereadCommPorts(); });
  // Queued: a list that closes gives the focus back before it reports what was chosen in it.
  connect(cmbNYX_, &ListComboBox::FocusArrived, this, &ConnectionArea::RereadCommPorts, Qt::QueuedConnection);
}

void ConnectionArea::ShowPorts(const std::vector<std::string>& lines, std::size_t selected) {
  if (lines_ == lines) return;
  lines_ = lines;
  const QSignalBlocker nothing_is_chosen(cmbNYX_);
  cmbNYX_->clear();
  for (const std::string& line : lines) cmbNYX_->addItem(QString::fromStdString(line));
  cmbNYX_->setCurrentIndex(static_cast<int>(selected));
  Describe(cmbNYX_,
           QString::fromStdString(lines.size() > 1 ? kWhatItDoes : PortSentence({.any_listed = false})));
}

// Not under the user's hand: when the open list closes, the focus arrives again.
void ConnectionArea::RereadCommPorts() {
  if (cmbNYX_->ListOpen()) return;
  auto selected = static_cast<std::size_t>(cmbNYX_->currentIndex());
  const std::vector<std::string> lines = ports_.RereadCommPorts(selected);
  ShowPorts(lines, selected);
}

// When the list opens, not at start-up: it takes the system a moment for each port.
void ConnectionArea::DescribePorts() {
  RereadCommPorts();
  for (std::size_t entry = 0; entry < lines_.size(); ++entry) {
    const QString device = QString::fromStdString(ports_.DescribePort(entry));
    for (const int role : {Qt::ToolTipRole, Qt::AccessibleDescriptionRole})
      cmbNYX_->setItemData(static_cast<int>(entry), device, role);
  }
}

void ConnectionArea::StepUnitId(int by) {
  const int id = UnitId() + by;
  if (id < kFirstUnitId || (id > kLastUnitId && by < 0)) {
    ChooseUnitId(kLastUnitId);
  } else {
    ChooseUnitId(id > kLastUnitId ? kFirstUnitId : static_cast<std::uint8_t>(id));
  }
}

void ConnectionArea::ChooseUnitId(std::uint8_t id) {
  CmbUnitID_[0]->setCurrentIndex(id / kDigits);
  CmbUnitID_[1]->setCurrentIndex(id % kDigits);
}

void ConnectionArea::EnableControls(const QString& running_command, bool finding) {
  EnableUnless(finding ? QString() : running_command, cmdFindUnits_);
  EnableUnless(running_command, cmbNYX_);
  for (CalmComboBox* digit : CmbUnitID_) EnableUnless(running_command, digit);
}

bool ConnectionArea::PortChosen() const { return cmbNYX_->currentIndex() > 0; }

std::uint8_t ConnectionArea::UnitId() const {
  return static_cast<std::uint8_t>(CmbUnitID_[0]->currentIndex() * kDigits + CmbUnitID_[1]->currentIndex());
}

}  // namespace tendril
