#include "platform/serial_device.h"

namespace tendril {

std::string DeviceDescription::Text() const {
  std::string text = adapter.empty() ? maker : adapter;
  if (!maker.empty() && maker != text) text += " (" + maker + ")";
  if (!text.empty() && !path.empty()) text += ", ";
  return text + path;
}

}  // namespace tendril
