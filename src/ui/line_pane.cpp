#include "ui/line_pane.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QScrollBar>
#include <QVBoxLayout>
#include <algorithm>
#include <initializer_list>

#include "ui/controls.h"
#include "ui/line_report.h"

namespace tendril {
namespace {

constexpr std::int32_t kUpdateMs = 100;  // painting takes more than a millisecond
constexpr int kRowsAtFirst = 7;
constexpr int kLeastRows = 2;
constexpr int kCellMargin = 12;
constexpr int kWideWindow = 1000;  // the longest verdict has two lines, in a narrower one three

// The Home and End keys go to the first and the last line, also when that is the current one out of view. Without a
// current line the keys start at the last one in view.
class LinesView : public QTableView {
 public:
  QSize sizeHint() const override { return {0, HeightOf(kRowsAtFirst)}; }
  QSize minimumSizeHint() const override { return {0, HeightOf(kLeastRows)}; }

 protected:
  QModelIndex moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers) override {
    const int last = model()->rowCount() - 1;
    const int column = std::max(0, currentIndex().column());
    if (action == MoveHome) {
      scrollToTop();
      return model()->index(0, column);
    }
    if (action == MoveEnd) {
      scrollToBottom();
      return model()->index(last, column);
    }
    if (currentIndex().isValid()) return QTableView::moveCursor(action, modifiers);
    const int in_view = rowAt(viewport()->height() - 1);
    return model()->index(in_view < 0 ? last : in_view, column);
  }

 private:
  int HeightOf(int rows) const {
    return horizontalHeader()->sizeHint().height() + rows * verticalHeader()->defaultSectionSize() +
           2 * frameWidth();
  }
};

std::optional<SignKind> SignOf(LineVerdict::Kind verdict) {
  switch (verdict) {
    case LineVerdict::Kind::kNotOpened:
    case LineVerdict::Kind::kClosed:
    case LineVerdict::Kind::kNothingAsked:
      return std::nullopt;
    case LineVerdict::Kind::kAnswers:
      return SignKind::kSuccess;
    case LineVerdict::Kind::kCannotOpen:
    case LineVerdict::Kind::kPortGone:
    case LineVerdict::Kind::kSilence:
    case LineVerdict::Kind::kEchoOnly:
    case LineVerdict::Kind::kNoAnswer:
    case LineVerdict::Kind::kTooLate:
    case LineVerdict::Kind::kEchoDamaged:
    case LineVerdict::Kind::kNoReply:
    case LineVerdict::Kind::kOtherAnswer:
    case LineVerdict::Kind::kOtherUnit:
    case LineVerdict::Kind::kNotAccepted:
    case LineVerdict::Kind::kAnswersInNoise:
    case LineVerdict::Kind::kAnswersSometimes:
      return SignKind::kWarning;
  }
  return std::nullopt;
}

template <typename Button>
Button* MakeButton(const char* name, const char* text, const char* accessible_name,
                   const char* what_it_does) {
  auto* button = Named(new Button(QString::fromLatin1(text)), name);
  button->setAccessibleName(QString::fromLatin1(accessible_name));
  Describe(button, what_it_does);
  button->setFixedHeight(LowButtonHeight(*button));
  return button;
}

}  // namespace

LinePane::LinePane(LineTrace& trace, TimerFactory& timers, const HwSerial& link, const UnitTarget& target,
                   const ProgramInfo& info, QWidget& window)
    : QDockWidget(QStringLiteral("Line"), &window),
      trace_(trace),
      link_(link),
      target_(target),
      info_(info),
      model_(trace),
      sign_(new Sign(SignKind::kWarning)),
      lblVerdict_(Named(new Announcement, "lblVerdict")),
      chkFollow_(
          MakeButton<QCheckBox>("chkFollowLine", "Follow", "Follow the line",
                                "Shows the newest lines as they come. Scrolling back ends it, the End key "
                                "begins it again.")),
      chkPause_(
          MakeButton<QCheckBox>("chkPauseLine", "Pause", "Pause the line",
                                "Keeps what is shown. The lines that come meanwhile are shown afterwards.")),
      cmdClear_(MakeButton<QPushButton>("cmdClearLine", "Clear", "Clear the line", "Forgets all lines.")),
      cmdCopy_(
          MakeButton<QPushButton>("cmdCopyLine", "Copy", "Copy the line for support",
                                  "Copies the verdict, the last 200 lines, the version, the system and the "
                                  "port as text, for a message to support. (Ctrl+Shift+L)")),
      lines_(Named(new LinesView, "tblLine")),
      tmrUpdate_(timers.CreateTimer([this] { Update(); })) {
  setObjectName("LinePane");
  setFeatures(DockWidgetClosable);
  setAllowedAreas(Qt::BottomDockWidgetArea);
  auto* content = new QWidget;
  auto* column = AddLayout<QVBoxLayout>(content, {5, 2, 5, 2}, 3);
  column->addLayout(MakeHeader());
  column->addWidget(lines_, 1);
  SetUpTable();
  setWidget(content);
  tmrUpdate_->SetInterval(kUpdateMs);
  hide();
}

QLayout* LinePane::MakeHeader() {
  lblVerdict_->setTextFormat(Qt::PlainText);
  lblVerdict_->setWordWrap(true);
  lblVerdict_->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
  KeepRoomForVerdict();
  chkFollow_->setChecked(true);
  connect(chkFollow_, &QAbstractButton::clicked, this, &LinePane::Follow);
  connect(chkPause_, &QAbstractButton::toggled, this, &LinePane::Pause);
  connect(cmdClear_, &QAbstractButton::clicked, this, &LinePane::Clear);
  connect(cmdCopy_, &QAbstractButton::clicked, this, &LinePane::CopyReport);
  auto* header = new QHBoxLayout;
  header->setSpacing(4);
  header->addWidget(sign_);
  header->addWidget(lblVerdict_, 1);
  for (QAbstractButton* button :
       std::initializer_list<QAbstractButton*>{chkFollow_, chkPause_, cmdClear_, cmdCopy_})
    header->addWidget(button);
  return header;
}

// All columns and rows have sizes that do not depend on what they contain.
void LinePane::SetUpTable() {
  // A current line that drops out has no successor: the next one would be read out, and shown, again and again.
  connect(&model_, &QAbstractItemModel::rowsAboutToBeRemoved, this,
          [this](const QModelIndex& /*parent*/, int /*first*/, int last) {
            if (lines_->currentIndex().row() <= last) lines_->selectionModel()->clearCurrentIndex();
          });
  lines_->setModel(&model_);  // its own connections come after that one
  lines_->setAccessibleName(QStringLiteral("What crosses the line"));
  lines_->setSelectionBehavior(QAbstractItemView::SelectRows);
  lines_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  lines_->setVerticalScrollMode(
      QAbstractItemView::ScrollPerItem);  // the scroll bar's value is the first row shown
  lines_->setTabKeyNavigation(false);
  lines_->setAlternatingRowColors(true);
  lines_->setShowGrid(false);
  lines_->setWordWrap(false);
  QHeaderView& rows = *lines_->verticalHeader();
  rows.setSectionResizeMode(QHeaderView::Fixed);
  rows.setMinimumSectionSize(1);
  rows.setDefaultSectionSize(lines_->fontMetrics().height() + 2);
  rows.hide();
  QHeaderView& columns = *lines_->horizontalHeader();
  columns.setSectionsClickable(false);
  columns.setHighlightSections(false);
  columns.setDefaultAlignment(Qt::AlignLeft | Qt::AlignVCenter);
  columns.setSectionResizeMode(QHeaderView::Stretch);
  const auto fix_width = [this, &columns](TraceColumn column, const char* widest) {
    columns.setSectionResizeMode(static_cast<int>(column), QHeaderView::Fixed);
    columns.resizeSection(static_cast<int>(column),
                          lines_->fontMetrics().horizontalAdvance(QString::fromLatin1(widest)) + kCellMargin);
  };
  fix_width(TraceColumn::kTime, "00:00:00.000");
  fix_width(TraceColumn::kFrom, "program");
  connect(lines_->verticalScrollBar(), &QAbstractSlider::valueChanged, this, &LinePane::OnScrolled);
  connect(lines_->verticalScrollBar(), &QAbstractSlider::rangeChanged, this,
          [this](int /*first*/, int last) { OnScrollRange(last); });
}

void LinePane::Open() {
  focus_before_ = window()->focusWidget();
  KeepRoomForVerdict();
  show();
  lines_->setFocus();
}

void LinePane::resizeEvent(QResizeEvent* event) {
  QDockWidget::resizeEvent(event);
  KeepRoomForVerdict();
}

// No verdict changes the height of the pane.
void LinePane::KeepRoomForVerdict() {
  const int lines = parentWidget()->width() < kWideWindow ? 3 : 2;
  lblVerdict_->setFixedHeight(lines * lblVerdict_->fontMetrics().lineSpacing());
}

void LinePane::showEvent(QShowEvent* event) {
  QDockWidget::showEvent(event);
  trace_.SetChangedHandler([this] { OnChanged(); });
  Update();
}

void LinePane::hideEvent(QHideEvent* event) {
  trace_.SetChangedHandler(nullptr);
  tmrUpdate_->SetEnabled(false);
  if (!event->spontaneous() && isAncestorOf(window()->focusWidget())) {
    QWidget* const next = focus_before_ != nullptr ? focus_before_.data() : window();
    next->setFocus();
  }
  QDockWidget::hideEvent(event);
}

// Is called while the link is at work.
void LinePane::OnChanged() {
  if (!tmrUpdate_->Enabled()) tmrUpdate_->SetEnabled(true);
}

void LinePane::Update() {
  tmrUpdate_->SetEnabled(false);
  if (model_.Frozen()) return ShowWaiting();
  QScrollBar& bar = *lines_->verticalScrollBar();
  const int top = bar.value();
  updating_ = true;
  const int removed = model_.Update();
  if (chkFollow_->isChecked()) {
    lines_->scrollToBottom();
  } else {
    bar.setValue(std::max(0, top - removed));
  }
  updating_ = false;
  ShowVerdict();
}

// A new kind of verdict is read out. The same one about another unit is not: while units are searched for, each poll
// brings one.
void LinePane::ShowVerdict() {
  const LineVerdict verdict = JudgeLine(trace_);
  if (verdict_ && verdict_->sentence == verdict.sentence) return;
  const bool other_kind = !verdict_ || verdict_->kind != verdict.kind;
  verdict_ = verdict;
  const QString sentence = QString::fromStdString(verdict.sentence);
  lblVerdict_->setText(sentence);
  lblVerdict_->setToolTip(sentence);
  const auto sign = SignOf(verdict.kind);
  if (sign) sign_->SetKind(*sign);
  sign_->setVisible(sign.has_value());
  if (other_kind) {
    lblVerdict_->Announce(sentence);
  } else {
    lblVerdict_->setAccessibleName(sentence);
  }
}

void LinePane::ShowWaiting() {
  const auto waiting = model_.Waiting();
  setWindowTitle(waiting == 1 ? QStringLiteral("Line: paused, 1 new line waits")
                              : QStringLiteral("Line: paused, %1 new lines wait").arg(waiting));
}

void LinePane::Pause(bool paused) {
  if (paused) Update();
  model_.SetFrozen(paused);
  setWindowTitle(QStringLiteral("Line"));
  Update();
}

void LinePane::Clear() {
  model_.Clear();
  Update();
}

void LinePane::Follow(bool follow) {
  if (follow) lines_->scrollToBottom();
}

void LinePane::OnScrolled(int value) {
  if (!updating_) chkFollow_->setChecked(value == lines_->verticalScrollBar()->maximum());
}

// More or fewer rows have room.
void LinePane::OnScrollRange(int last) {
  if (chkFollow_->isChecked()) lines_->verticalScrollBar()->setValue(last);
}

void LinePane::CopyReport() {
  Update();  // paused, it is what is shown
  const auto lines = std::min(model_.Entries().size(), kReportedLines);
  QGuiApplication::clipboard()->setText(
      LineReport(info_, link_, target_.UnitId(), verdict_->sentence, model_.Entries()));
  Q_EMIT Said(
      QStringLiteral("Copied for support: version, system, port, verdict and the last %1 lines").arg(lines));
}

}  // namespace tendril
