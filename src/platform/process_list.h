// ProcessList: the programs that run on this computer.
#pragma once

#include <string_view>

namespace tendril {

// The Control Panel's program.
inline constexpr char kControlPanelProgram[] = "NyxTray.exe";

class ProcessList {
 public:
  virtual ~ProcessList() = default;

  // Whether a program of this name runs. Names are not case-sensitive. False when the system does not answer.
  virtual bool IsRunning(std::string_view program) const = 0;
};

}  // namespace tendril
