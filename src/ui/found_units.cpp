#include "ui/found_units.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QVBoxLayout>

#include "platform/hex_text.h"
#include "ui/controls.h"

namespace tendril {
namespace {

constexpr QSize kFoundUnitsSize(420, 380);
constexpr int kLinesOfResult = 4;

}  // namespace

FoundUnits::FoundUnits(const UnitSearch& search, QWidget& window)
    : QDialog(&window),
      search_(search),
      lstUnits_(Named(new QTreeWidget, "lstUnits")),
      lblFound_(Named(new Announcement, "lblFound")) {
  setObjectName("FoundUnits");
  lstUnits_->setHeaderLabels({QStringLiteral("ID"), QStringLiteral("What is there")});
  lstUnits_->setAccessibleName(QStringLiteral("Units found"));
  Describe(lstUnits_, "The units that answered, by ID. A click on a line, or Enter, chooses its ID.");
  lstUnits_->setRootIsDecorated(false);
  lstUnits_->setUniformRowHeights(true);
  lstUnits_->setAlternatingRowColors(true);
  lstUnits_->header()->resizeSection(0, fontMetrics().horizontalAdvance(QStringLiteral("0000000")));
  connect(lstUnits_, &QTreeWidget::itemClicked, this, [this](QTreeWidgetItem* line) { ChooseUnit(line); });
  connect(lstUnits_, &QTreeWidget::itemActivated, this, [this](QTreeWidgetItem* line) { ChooseUnit(line); });
  lblFound_->setTextFormat(Qt::PlainText);
  lblFound_->setWordWrap(true);
  lblFound_->setAlignment(Qt::AlignLeft | Qt::AlignTop);
  lblFound_->setMinimumHeight(kLinesOfResult * fontMetrics().lineSpacing());  // the list does not jump
  auto* column = new QVBoxLayout(this);
  column->addWidget(DimLabel("Click a line, or press Enter on it, to choose its ID."));
  column->addWidget(lstUnits_, 1);
  column->addWidget(lblFound_);
  AddButtons();
  resize(kFoundUnitsSize);
}

void FoundUnits::AddButtons() {
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  cmdCancelFind_ =
      Named(buttons->addButton(QStringLiteral("C&ancel"), QDialogButtonBox::ActionRole), "cmdCancelFind");
  cmdFindAgain_ =
      Named(buttons->addButton(QStringLiteral("&Find Again"), QDialogButtonBox::ActionRole), "cmdFindAgain");
  Describe(cmdCancelFind_, "Ends the search after the poll that is out. What was found stays in the list.");
  Describe(cmdFindAgain_, "Empties the list and asks every ID from 01 to FD again.");
  auto* close = buttons->button(QDialogButtonBox::Close);
  Describe(close,
           "Closes the list. A search goes on: \"Find Units\" in the menu shows the list again. (Escape)");
  connect(cmdCancelFind_, &QPushButton::clicked, this, &FoundUnits::CancelPressed);
  connect(cmdFindAgain_, &QPushButton::clicked, this, &FoundUnits::FindPressed);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  // Enter in the list chooses a unit and presses no button.
  for (QPushButton* button : {cmdCancelFind_, cmdFindAgain_, close}) button->setAutoDefault(false);
  layout()->addWidget(buttons);
}

void FoundUnits::ShowSearch() {
  setWindowTitle(QStringLiteral("Find Units on Comm %1").arg(search_.port));
  if (lstUnits_->topLevelItemCount() > static_cast<int>(search_.found.size())) lstUnits_->clear();
  const auto shown = static_cast<std::size_t>(lstUnits_->topLevelItemCount());
  for (std::size_t i = shown; i < search_.found.size(); ++i) AddUnit(search_.found[i]);
  lblFound_->setText(QString::fromStdString(finding_ ? search_.Step() : search_.Sentence()));
}

void FoundUnits::AddUnit(const FoundUnit& unit) {
  const QString id = QString::fromStdString(HexByte(unit.id));
  const QString words = QString::fromStdString(unit.Words());
  new QTreeWidgetItem(lstUnits_, {id, words});
  if (isVisible()) lblFound_->Announce(id + QLatin1Char(' ') + words);
}

void FoundUnits::ChooseUnit(QTreeWidgetItem* line) {
  Q_EMIT UnitChosen(search_.found.at(static_cast<std::size_t>(lstUnits_->indexOfTopLevelItem(line))).id);
}

void FoundUnits::EnableControls(const QString& running_command, bool finding, bool cancelled, bool moves) {
  finding_ = finding;
  const bool had_focus = cmdCancelFind_->hasFocus() || cmdFindAgain_->hasFocus();
  EnableUnless(!finding    ? QStringLiteral("No search runs.")
               : cancelled ? QStringLiteral("The search ends with the poll that is out.")
                           : QString(),
               cmdCancelFind_);
  EnableUnless(running_command, cmdFindAgain_);
  // The search does not use the chosen unit; any other command does.
  EnableUnless(moves     ? QStringLiteral("A servo test moves the chosen unit.")
               : finding ? QString()
                         : running_command,
               lstUnits_);
  if (had_focus && lstUnits_->isEnabled()) lstUnits_->setFocus();
  ShowSearch();
}

}  // namespace tendril
