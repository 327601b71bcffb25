// MotionParameters: the six parameters that spin buttons set, each with its test beside it.
#pragma once

#include <QLabel>
#include <QPushButton>
#include <array>
#include <functional>
#include <string>
#include <vector>

#include "ui/controls.h"
#include "ui/model/channel_editor.h"
#include "ui/remarks_label.h"
#include "unitops/live_test.h"

namespace tendril {

// Shows what ChannelEditor holds, and brings it what the person sets.
class MotionParameters : public FrameBox {
 public:
  struct Events {
    std::function<void(FollowUp)> edited;                     // the records have changed
    std::function<void(const QWidget& label)> values_wanted;  // a parameter's label was pressed
  };

  // `editor` must outlive the area. `test_buttons` find their places here.
  MotionParameters(ChannelEditor& editor, Events events,
                   const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons,
                   QWidget* parent = nullptr);

  // Shows values, limits and captions. Runs no handler.
  void ShowValues();
  // Shows what is to be said about the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { remarks_->ShowRemarks(sentences); }

 protected:
  bool eventFilter(QObject* object, QEvent* event) override;

 private:
  ChannelEditor& editor_;
  Events events_;
  std::array<CalmSpinBox*, kParameterCount> spins_{};
  std::array<QLabel*, kParameterCount> captions_{};
  QLabel* lblActPulseLeft_;
  RemarksLabel* remarks_;
};

}  // namespace tendril
