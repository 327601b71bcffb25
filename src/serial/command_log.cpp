#include "serial/command_log.h"

#include <fstream>
#include <string>
#include <system_error>
#include <utility>

#include "platform/runtime_error.h"
#include "platform/unicode.h"

namespace tendril {

FileCommandLog::FileCommandLog(std::filesystem::path path) : path_(std::move(path)) {}

void FileCommandLog::Append(std::string_view line) {
  std::error_code ignored;  // a folder that cannot be made shows when the file is opened
  std::filesystem::create_directories(path_.parent_path(), ignored);
  std::ofstream file(path_, std::ios::app);
  file << line << '\n';
  file.close();
  if (!file) {
    throw RuntimeError(kErrPathAccess,
                       "The command log \"" + Utf8(path_.u16string()) + "\" cannot be written");
  }
}

}  // namespace tendril
