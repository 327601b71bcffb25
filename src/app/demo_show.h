// The demonstration for a machine without a display.
#pragma once

#include <QString>

#include "bench/virtual_line.h"
#include "bench/virtual_unit.h"
#include "platform/message_boxes.h"
#include "ui/frm_new_servo_config.h"

namespace tendril {

// Prints boxes, where nobody could press a button.
class PrintedBoxes final : public MessageBoxes {
 public:
  void Show(const BoxMessage& message) override;
  bool AskYesNo(const BoxMessage& message) override;
};

// Does in `window` what a person would: chooses Comm 1 and unit 01, sends the configuration and waits for the
// end. Prints what crosses `line`, compares what `unit` holds afterwards with what the window shows, and
// saves pictures of the window in `folder`, which is created. Returns the program's exit code: 0 when the
// unit holds what was sent.
int ShowWithoutDisplay(frmNewServoConfig& window, VirtualLine& line, const VirtualUnit& unit,
                       const QString& folder);

}  // namespace tendril
