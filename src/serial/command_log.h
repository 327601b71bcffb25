// CommandLog: the text file that notes every unit-wide command.
#pragma once

#include <filesystem>
#include <string_view>

namespace tendril {

// Where the serial link notes them.
class CommandLog {
 public:
  virtual ~CommandLog() = default;
  // Adds one line. Raises kErrPathAccess when the log cannot be written.
  virtual void Append(std::string_view line) = 0;
};

// Opens the file, appends and closes it for every line, so that the log is whole whatever happens next. Its
// folder is created when it is missing.
class FileCommandLog final : public CommandLog {
 public:
  explicit FileCommandLog(std::filesystem::path path);
  void Append(std::string_view line) override;

 private:
  std::filesystem::path path_;
};

}  // namespace tendril
