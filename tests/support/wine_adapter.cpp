// The adapter as wine_modem_lines.cpp notes it: what the program asked of the emulator's port.
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

#include "support/emulated_adapter.h"

namespace tendril::test {

EmulatedAdapter& Adapter() {
  static EmulatedAdapter adapter;
  static int taken = 0;
  std::ifstream notes(std::string("Z:") + std::getenv("TENDRIL_PORT_NOTES"));
  int number = 0;
  for (std::string line; std::getline(notes, line);) {
    if (++number <= taken) continue;
    taken = number;
    std::istringstream words(line);
    std::string what;
    words >> what;
    if (what == "rts") {
      bool asserted = false;
      words >> asserted;
      adapter.rts.push_back(asserted);
    } else {
      EmulatedAdapter::LineSettings settings;
      words >> settings.baud >> settings.data_bits >> settings.parity >> settings.stop_bits >>
          settings.handshaking;
      adapter.settings = {settings};  // wine makes them in several steps
    }
  }
  return adapter;
}

}  // namespace tendril::test
