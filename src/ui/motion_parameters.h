// MotionParameters: the six parameters that spin buttons set, each with its pulse widths and its test beside it, and all
// of them on a scale.
#pragma once

#include <QGridLayout>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <array>
#include <string>
#include <vector>

#include "ui/calm_spin_box.h"
#include "ui/controls.h"
#include "ui/editor_notes.h"
#include "ui/model/channel_editor.h"
#include "ui/model/comparison.h"
#include "ui/notice_label.h"
#include "ui/pulse_scale.h"
#include "ui/pulse_width_label.h"
#include "unitops/live_test.h"

namespace tendril {

// Shows what ChannelEditor holds, and passes it what the user sets.
class MotionParameters : public QGroupBox {
  Q_OBJECT

 public:
  // `working` are the records that `editor` edits, and `comparison` compares. All must outlive the area.
  MotionParameters(ChannelEditor& editor, const ChannelTable& working, const Comparison& comparison);

  // Shows values, limits and captions, and whether there is a channel to edit. Emits no signal.
  void ShowValues();
  // Signs what differs from the unit that is compared, and says it in words. ShowValues() does it, too.
  void ShowDifferences();
  // Shows remarks on the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { notes_->ShowRemarks(sentences); }
  // Captions test button `button`, 0 to 4: "Stop" while its sweep runs, else "Test".
  void ShowTestRunning(int button, bool running);
  // The scale, for its arm.
  PulseScale& Scale() { return *scale_; }
  // Enables the spin buttons unless there is a reason not to.
  void EnableEditing(const QString& why_not);
  // Enables the test buttons unless there is a reason not to.
  void EnableTests(const QString& why_not);
  // Whether the edit that is reported just now goes on with the one before.
  bool Repeats() const;

 Q_SIGNALS:
  // The user has changed `what` in the records.
  void Edited(const QString& what, FollowUp follow_up);
  // The user pressed a parameter's label.
  void LabelPressed(const QWidget* label);
  // The user pressed a test button, 0 to 4.
  void TestPressed(int button);
  // The user wants what is shown to be stored.
  void StorePressed();
  // A typed number cannot be taken; see CalmSpinBox.
  void NumberDropped(const QString& typed, const QString& sentence);

 protected:
  bool eventFilter(QObject* object, QEvent* event) override;

 private:
  void AddParameters(QGridLayout& grid);
  CalmSpinBox* MakeSpin(std::size_t index);
  void AddTests(QGridLayout& grid);
  void AddSpacing(QGridLayout& grid);
  void MakePressable(QLabel* label);
  void ShowHasChannel();
  void DescribeValues(const Unstored& unstored);
  void DescribeValue(std::size_t index, const Unstored& unstored);
  void OnStore();

  ChannelEditor& editor_;
  const ChannelTable& working_;
  const Comparison& comparison_;
  std::array<CalmSpinBox*, kParameterCount> spins_{};
  std::array<QLabel*, kParameterCount> names_{};
  std::array<QLabel*, kParameterCount> captions_{};
  std::array<PulseWidthLabel*, kParameterCount> pulse_widths_{};
  std::array<QPushButton*, LiveTest::kTestButtons> cmdTest_{};
  QLabel* lblActPulseLeft_;
  QLabel* heading_;     // of what is relative to the neutral position
  NoticeLabel* typed_;  // lies on the heading
  EditorNotes* notes_;
  PulseScale* scale_;
  QLabel* hint_;  // that no channel is chosen; lies on the scale
};

}  // namespace tendril
