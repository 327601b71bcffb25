// EmulatedAdapter: lets a pseudo-terminal behave towards this process as a serial adapter with its driver does.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <vector>

namespace tendril::test {

// A pseudo-terminal has no RTS line and no driver settings, keeps no parity and no character size, and reports a hang-up
// in every way at once. emulated_adapter.cpp, compiled into a test program, takes the calls ioctl, read, write and poll of
// the whole process and adds what is missing, for the pseudo-terminal that was set up as a serial port last; all other
// calls pass unchanged. Linux only.
struct EmulatedAdapter {
  // As the network wants them, unless set otherwise.
  struct LineSettings {
    std::uint32_t baud = 19200;
    int data_bits = 8;
    bool parity = false;
    int stop_bits = 1;
    bool handshaking = false;
    bool receives_without_carrier = true;  // CREAD and CLOCAL
    bool reads_at_once = true;             // VMIN 0, VTIME 0
    friend bool operator==(const LineSettings&, const LineSettings&) = default;
  };

  // What the driver does.
  std::function<int(bool asserted)> rts_error;  // the error number of a turn of RTS; 0 or none: it obeys
  std::uint32_t empty_read_every =
      0;                         // every so many reads find nothing; with the error number of an earlier call
  int write_error = 0;           // the error number of each write; 0: none
  int queued_output = 0;         // bytes in the driver, not sent yet
  bool gone_silently = false;    // poll() reports that the device has gone, and no event does
  std::uint32_t fixed_baud = 0;  // the only speed that it can do; 0: all

  // What the program asked of it.
  std::vector<LineSettings> settings;  // each time
  std::vector<bool> rts;               // each turn that it obeyed
  std::vector<int> flushes;            // TCIFLUSH, TCOFLUSH or TCIOFLUSH
  bool low_latency = false;
  std::uint64_t empty_reads = 0;  // reads that found nothing
};

// Shared by the adapters of this process.
EmulatedAdapter& Adapter();

}  // namespace tendril::test
