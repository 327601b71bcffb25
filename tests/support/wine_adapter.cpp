// The adapter as wine_modem_lines.cpp notes it: what the program asked of the emulator's port.
#include <cstdlib>
#include <fstream>
#include <string>

#include "support/emulated_adapter.h"

namespace tendril::test {

EmulatedAdapter& Adapter() {
  static EmulatedAdapter adapter;
  static std::ifstream notes(std::string("Z:") + std::getenv("TENDRIL_PORT_NOTES"));
  notes.clear();  // there may be more since the end was reached
  for (std::string what; notes >> what;) {
    if (what == "rts") {
      bool asserted = false;
      notes >> asserted;
      adapter.rts.push_back(asserted);
    } else {
      EmulatedAdapter::LineSettings settings;
      notes >> settings.baud >> settings.data_bits >> settings.parity >> settings.stop_bits >>
          settings.handshaking;
      adapter.settings = {settings};  // wine makes them in several steps
    }
  }
  return adapter;
}

}  // namespace tendril::test
