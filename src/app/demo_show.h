// What the demonstration does by itself: a show for a machine without a display, and pictures.
#pragma once

#include <QString>

#include "bench/virtual_control_panel.h"
#include "bench/virtual_line.h"
#include "bench/virtual_unit.h"
#include "platform/message_boxes.h"
#include "ui/frm_new_servo_config.h"

namespace tendril {

// Prints boxes, where nobody could press a button, and says Yes.
class PrintedBoxes final : public MessageBoxes {
 public:
  void Show(const BoxMessage& message) override;
  bool AskYesNo(const BoxMessage& message) override;
};

// The units on the line of Comm 1, at 01 and 0A.
struct DemoUnits {
  const VirtualUnit& first;
  const VirtualUnit& second;
};

// Does in `window` what a person would: chooses Comm 1, sends the configuration to unit 01, reads that of unit
// 0A, which is another, and reads unit 01 back. Then asks `panel` for Comm 3, opens it, and closes the window, which
// gives it back. Prints what crosses `line` and the connection to the panel, compares what the units hold with what
// the window shows, and saves pictures of the window in `folder`, which is created. Returns the program's exit code: 0
// when what was sent is what was read back, and the port changed hands.
int ShowWithoutDisplay(frmNewServoConfig& window, VirtualLine& line, const DemoUnits& units,
                       VirtualControlPanel& panel, const QString& folder);

// Edits channels in `window` and saves pictures of the editor with a servo, a digital and a PWM channel, of the
// summary, of a number entry open in it, and of the question for a port, in `folder`, which is created. Returns the
// program's exit code: 0 when all are saved.
int TakePictures(frmNewServoConfig& window, const QString& folder);

}  // namespace tendril
