// MemoryLog: a command log that a test can read.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/runtime_error.h"
#include "serial/command_log.h"

namespace tendril::test {

class MemoryLog final : public CommandLog {
 public:
  void Append(std::string_view line) override {
    if (broken) throw RuntimeError(kErrPathAccess, "The command log cannot be written");
    if (on_append) on_append();
    lines.emplace_back(line);
  }

  std::vector<std::string> lines;
  bool broken = false;
  std::function<void()> on_append;
};

}  // namespace tendril::test
