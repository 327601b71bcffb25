// SavedErr: a failure that is kept while its handler cleans up, and raised again afterwards.
#pragma once

#include <cstdint>
#include <string>

#include "platform/runtime_error.h"

namespace tendril {

// Created in a catch block, it captures the failure that is being handled. What is no RuntimeError becomes
// one (kErrInternal) with its own description. The capture is a copy: nothing done to the original changes
// it.
class SavedErr {
 public:
  SavedErr();

  // Raises the captured failure: a RuntimeError with the same number, source, description and help.
  [[noreturn]] void Raise() const;

  std::int32_t number() const { return error_.number(); }
  const std::string& source() const { return error_.source(); }
  const std::string& description() const { return error_.description(); }
  const std::string& help_file() const { return error_.help_file(); }
  std::int32_t help_context() const { return error_.help_context(); }

 private:
  RuntimeError error_;
};

}  // namespace tendril
