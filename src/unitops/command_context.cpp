#include "unitops/command_context.h"

namespace tendril {

bool MayStartCommand(const CommandContext& context) {
  if (context.running.Active()) return false;
  if (!context.target.PortChosen()) {
    context.boxes.Show({"No comm port selected!!!\r\n\r\nYou must select a comm port first.",
                        "No Port Selected", BoxIcon::kExclamation});
    return false;
  }
  return !context.make_way || context.make_way();
}

void EndAsFailed(CommandContext& context) {
  context.running.End();
  context.progress.EndCommandProgress(Outcome::kFailure, "COMMAND FAILED!");
}

void ShowCommError(MessageBoxes& boxes, const std::string& failure, const std::string& description) {
  boxes.Show(
      {failure.empty() ? description : failure + "\r\n" + description, "Comm Error!", BoxIcon::kCritical});
}

}  // namespace tendril
