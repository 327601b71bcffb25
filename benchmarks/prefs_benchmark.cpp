// How long the preferences take to be loaded from a registry file with all their keys, the reading of the file
// included: what the program's start spends on them at most.
#include <QFileInfo>
#include <QTemporaryDir>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <vector>

#include "measuring.h"
#include "platform/qt/registry_file.h"
#include "prefs/network_preferences.h"

namespace tendril {
namespace {

void FailOn(const std::string& warning) { throw std::runtime_error(warning); }

// No two items alike.
void Fill(NetworkPreferences& preferences) {
  preferences.SetListNetworks(true);
  preferences.SetCommListenerPort(4711);
  for (std::size_t i = 0; i < NetworkPreferences::kNetworks; ++i) {
    NyxNetworkPreferences& network = preferences.NyxNetwork(i);
    network.Port = static_cast<std::uint8_t>(i + 1);
    network.ACNIPAddress = "239.255.0." + std::to_string(i);
    network.Comment = "Network number " + std::to_string(i);
  }
  for (std::size_t number = 1; number <= NetworkPreferences::kUniverses; ++number) {
    DMXUniversePrefs& universe = preferences.DMXUniverse(number);
    universe.Adapter = "Adapter with the serial number 00" + std::to_string(number);
    universe.E131IPAddress = "239.255." + std::to_string(number / 256) + "." + std::to_string(number % 256);
    universe.Comment = "Universe number " + std::to_string(number);
  }
}

void Write(const QString& path) {
  RegistryFile file(path, {});
  Registry registry(file, {});
  RegistryBranch::Shared(registry).Below("NetVersion").CreateKey();
  RegistryBranch::Shared(registry).Below("NetVersion").SetString("Ver", "2");
  NetworkPreferences preferences(registry);
  Fill(preferences);
  preferences.SaveToRegistry();
}

bool Measure() {
  constexpr int kRuns = 51;
  constexpr double kMaxMs = 20;

  const QTemporaryDir folder;
  const QString path = folder.filePath(QStringLiteral("registry.reg"));
  Write(path);
  std::vector<double> measured_ms;
  for (int run = 0; run < kRuns; ++run) {
    const Stopwatch stopwatch;
    RegistryFile file(path, FailOn);
    Registry registry(file, FailOn);
    NetworkPreferences loaded(registry);
    loaded.InitFromRegistry(false);
    measured_ms.push_back(stopwatch.Ms());

    NetworkPreferences expected(registry);
    Fill(expected);
    if (loaded.DiffersFrom(expected)) throw std::runtime_error("What is loaded is not what was saved");
  }
  std::printf(
      "preferences, median of %d: a file of %lld bytes with 1016 keys loaded in %.2f ms (at most %.0f)\n",
      kRuns, QFileInfo(path).size(), Median(measured_ms), kMaxMs);
  return Median(measured_ms) <= kMaxMs;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::Measure); }
