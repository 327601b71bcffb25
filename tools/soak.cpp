// soak: runs simulations, one seed after the other.
#include <QApplication>
#include <QCommandLineParser>
#include <QElapsedTimer>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "simulation/simulation.h"

namespace tendril::test {
namespace {

int Soak(std::uint64_t first, std::uint64_t seeds, bool narrate) {
  std::uint64_t failures = 0, virtual_ms = 0;
  QElapsedTimer time;
  time.start();
  for (std::uint64_t seed = first; seed < first + seeds; ++seed) {
    Simulation simulation(seed, narrate);
    const std::string broken = simulation.Run();
    virtual_ms += simulation.VirtualMs();
    if (broken.empty()) continue;
    ++failures;
    const auto number = static_cast<unsigned long long>(seed);
    std::printf("Seed %llu: does not hold: %s\n  Again: scripts/soak --seed %llu\n", number, broken.c_str(),
                number);
    std::fflush(stdout);
  }
  std::printf("%llu seeds, %llu failures, %.1f seeds a second, %.1f hours simulated\n",
              static_cast<unsigned long long>(seeds), static_cast<unsigned long long>(failures),
              static_cast<double>(seeds) * 1000 / static_cast<double>(time.elapsed() + 1),
              static_cast<double>(virtual_ms) / 3'600'000);
  return failures == 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace
}  // namespace tendril::test

int main(int argc, char** argv) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  // These would change the window.
  for (const char* name : {"QT_SCALE_FACTOR", "QT_SCREEN_SCALE_FACTORS", "QT_FONT_DPI", "QT_STYLE_OVERRIDE"})
    qunsetenv(name);
  qputenv("QT_HASH_SEED", "0");  // the same order of hashes in each run
  QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.setApplicationDescription(
      QStringLiteral("Runs the program in simulated time against a random user and a random world."));
  parser.addHelpOption();
  const QCommandLineOption seeds(QStringLiteral("seeds"), QStringLiteral("How many seeds to run."),
                                 QStringLiteral("count"), QStringLiteral("1000"));
  const QCommandLineOption first(QStringLiteral("first"), QStringLiteral("The first seed."),
                                 QStringLiteral("seed"), QStringLiteral("1"));
  const QCommandLineOption one(QStringLiteral("seed"),
                               QStringLiteral("Run one seed, and print what happens in it."),
                               QStringLiteral("seed"));
  parser.addOptions({seeds, first, one});
  parser.process(application);
  const bool narrate = parser.isSet(one);
  return tendril::test::Soak(parser.value(narrate ? one : first).toULongLong(),
                             narrate ? 1 : parser.value(seeds).toULongLong(), narrate);
}
