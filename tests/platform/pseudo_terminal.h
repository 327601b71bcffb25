// PseudoTerminal: a serial device of the kernel; the test is its far end.
#pragma once

#include <fcntl.h>
#include <poll.h>
#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <stdexcept>
#include <string>

#include "platform/bytes.h"
#include "platform/paths.h"

namespace tendril::test {

// Makes `device` comm port `number`.
inline void LinkPort(int number, const std::filesystem::path& device) {
  const std::filesystem::path folder = ConfigFolder() / "ports";
  std::filesystem::create_directories(folder);
  const std::filesystem::path link = folder / ("com" + std::to_string(number));
  std::filesystem::remove(link);
  std::filesystem::create_symlink(device, link);
}

class PseudoTerminal {
 public:
  PseudoTerminal() : far_end_(::posix_openpt(O_RDWR | O_NOCTTY | O_NONBLOCK)) {
    if (::unlockpt(far_end_) != 0) throw std::runtime_error("no pseudo-terminal is available");
    path_ = ::ptsname(far_end_);
    observer_ = OpenAsAnother();
  }
  ~PseudoTerminal() {
    Unplug();
    ::close(observer_);
  }
  PseudoTerminal(PseudoTerminal&&) = delete;

  const std::string& path() const { return path_; }
  // Opens the device's own side once more, as another program could.
  int OpenAsAnother() const { return ::open(path_.c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK); }

  // Takes the device away from the programs that have it open.
  void Unplug() {
    if (far_end_ >= 0) ::close(far_end_);
    far_end_ = -1;
  }

  // Sends to the device; returns how many of `bytes` it took.
  std::size_t Send(const Bytes& bytes) const {
    const ssize_t taken = ::write(far_end_, bytes.data(), bytes.size());
    return taken > 0 ? static_cast<std::size_t>(taken) : 0;
  }
  // Sends to the open device and waits, without an event loop, until the bytes can be read.
  bool SendAndSettle(const Bytes& bytes) const {
    pollfd readable = {observer_, POLLIN, 0};
    return Send(bytes) == bytes.size() && ::poll(&readable, 1, 10'000) == 1;
  }
  // Takes what the device has sent so far.
  Bytes Take() const {
    Bytes bytes(65'536);
    const ssize_t got = ::read(far_end_, bytes.data(), bytes.size());
    bytes.resize(got > 0 ? static_cast<std::size_t>(got) : 0);
    return bytes;
  }

 private:
  int far_end_;
  int observer_ = -1;  // on the device's own side; only polls
  std::string path_;
};

}  // namespace tendril::test
