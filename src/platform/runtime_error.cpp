#include "platform/runtime_error.h"

#include <utility>

namespace tendril {

RuntimeError::RuntimeError(std::int32_t number, std::string description, std::string source,
                           std::string help_file, std::int32_t help_context)
    : number_(number),
      description_(std::move(description)),
      source_(std::move(source)),
      help_file_(std::move(help_file)),
      help_context_(help_context) {}

void RuntimeError::AddLine(std::string_view line) { description_.append("\r\n").append(line); }

RuntimeError CurrentFault() {
  try {
    throw;
  } catch (const RuntimeError& error) {
    return error;
  } catch (const std::exception& error) {
    return {kErrInternal, error.what()};
  } catch (...) {
    return {kErrInternal, "Unknown error"};
  }
}

std::string DescribeCurrentFault() { return CurrentFault().description(); }

}  // namespace tendril
