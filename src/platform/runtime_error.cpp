#include "platform/runtime_error.h"

#include <utility>

namespace tendril {

RuntimeError::RuntimeError(std::int32_t number, std::string description, std::string source)
    : number_(number), description_(std::move(description)), source_(std::move(source)) {}

void RuntimeError::SetHelp(std::string file, std::int32_t context) {
  help_file_ = std::move(file);
  help_context_ = context;
}

void RuntimeError::AddLine(std::string_view line) { description_.append("\r\n").append(line); }

RuntimeError CurrentFault() {
  try {
    throw;
  } catch (const RuntimeError& error) {
    return error;
  } catch (...) {
    return {kErrInternal, DescribeCurrentFault()};
  }
}

std::string DescribeCurrentFault() {
  try {
    throw;
  } catch (const std::exception& error) {
    return error.what();
  } catch (...) {
    return "Unknown error";
  }
}

}  // namespace tendril
