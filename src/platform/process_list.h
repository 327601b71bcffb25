// ProcessList: what runs on this computer.
#pragma once

#include <string_view>

namespace tendril {

class ProcessList {
 public:
  virtual ~ProcessList() = default;

  // Whether a program of this name, such as "NyxTray.exe", runs. Names are not case-sensitive. A system that
  // does not answer counts as one on which it does not run.
  virtual bool IsRunning(std::string_view program) const = 0;
};

}  // namespace tendril
