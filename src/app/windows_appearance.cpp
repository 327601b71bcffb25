#include <windows.h>

#include "app/system_appearance.h"
#include "ui/appearance.h"

namespace tendril {
namespace {

// Colours of high contrast are the user's own, and stay.
bool HighContrast() {
  HIGHCONTRASTW contrast = {};
  contrast.cbSize = sizeof contrast;
  return SystemParametersInfoW(SPI_GETHIGHCONTRAST, sizeof contrast, &contrast, 0) != 0 &&
         (contrast.dwFlags & HCF_HIGHCONTRASTON) != 0;
}

}  // namespace

void FollowSystemAppearance() {
  DWORD light = 1;
  DWORD size = sizeof light;
  RegGetValueW(HKEY_CURRENT_USER, L"Software\\Microsoft\\Windows\\CurrentVersion\\Themes\\Personalize",
               L"AppsUseLightTheme", RRF_RT_REG_DWORD, nullptr, &light, &size);
  if (light == 0 && !HighContrast()) SetDarkAppearance(true);
}

}  // namespace tendril
