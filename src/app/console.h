// Console: what a program prints for the user.
#pragma once

#include <cstdio>
#include <string>

namespace tendril {

// Standard output, written after the line has been served, because a slow reader delays the writer.
class Console {
 public:
  void Print(const std::string& text) { waiting_ += text + "\n"; }
  void Flush() {
    if (waiting_.empty()) return;
    std::fwrite(waiting_.data(), 1, waiting_.size(), stdout);
    std::fflush(stdout);
    waiting_.clear();
  }

 private:
  std::string waiting_;
};

}  // namespace tendril
