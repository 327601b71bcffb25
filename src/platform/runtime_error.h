// RuntimeError: the one kind of failure that the program raises on purpose.
#pragma once

#include <cstdint>
#include <exception>
#include <string>
#include <string_view>

namespace tendril {

// Error numbers that the program raises or distinguishes. The serial ones follow the published list of the platform's
// serial control, so that support staff can look them up.
inline constexpr std::int32_t kErrOverflow = 6;
inline constexpr std::int32_t kErrOutOfRange = 9;  // an index outside its table
inline constexpr std::int32_t kErrDivisionByZero = 11;
inline constexpr std::int32_t kErrInternal = 37;
inline constexpr std::int32_t kErrDeviceIo = 57;  // the device failed, or does not obey
inline constexpr std::int32_t kErrNotAllowed = 70;
inline constexpr std::int32_t kErrPathAccess = 75;
inline constexpr std::int32_t kErrInvalidPropertyValue = 380;
inline constexpr std::int32_t kErrUnsupported = 445;       // the object does not support this action
inline constexpr std::int32_t kErrInvalidPort = 8002;      // no such device
inline constexpr std::int32_t kErrPortAlreadyOpen = 8005;  // in use, here or in another program
inline constexpr std::int32_t kErrPortNotOpen = 8012;
inline constexpr std::int32_t kErrSettingsRefused = 8015;
inline constexpr std::int32_t kErrReadFault = 8020;

// A failure with a number and a description, as the user sees it. An operation that passes one on adds a line
// "Trace: ..." to the description, so that the description shows the path of the failure.
class RuntimeError : public std::exception {
 public:
  // `description` is UTF-8, its lines separated by CR LF. `source` names the part that raised it; the last two say where
  // help on the failure is.
  RuntimeError(std::int32_t number, std::string description, std::string source = {},
               std::string help_file = {}, std::int32_t help_context = 0);

  std::int32_t number() const { return number_; }
  const std::string& description() const { return description_; }
  const std::string& source() const { return source_; }
  const std::string& help_file() const { return help_file_; }
  std::int32_t help_context() const { return help_context_; }

  // Adds a line to the description (a CR LF, then `line`).
  void AddLine(std::string_view line);

  const char* what() const noexcept override { return description_.c_str(); }

 private:
  std::int32_t number_;
  std::string description_;
  std::string source_;
  std::string help_file_;
  std::int32_t help_context_;
};

// The exception that is being handled, converted to a RuntimeError (kErrInternal) if it is none. Call it in a catch
// block only.
RuntimeError CurrentFault();

// Its description: "Unknown error" for an exception that is no std::exception.
std::string DescribeCurrentFault();

// Runs `operation`, and adds the line `trace` to a failure in it. An exception of another type becomes a RuntimeError
// (kErrInternal), so that no failure loses its trace.
template <typename Operation>
decltype(auto) Traced(std::string_view trace, Operation&& operation) {
  try {
    return operation();
  } catch (...) {
    RuntimeError traced = CurrentFault();
    traced.AddLine(trace);
    throw traced;
  }
}

}  // namespace tendril
