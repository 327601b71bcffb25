// soak: runs simulations, one seed after the other, and says what it saw.
#include <QApplication>
#include <QCommandLineParser>
#include <QElapsedTimer>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "simulation/simulation.h"

namespace tendril::test {
namespace {

constexpr std::uint64_t kSeedsBetweenRepetitions = 50;
constexpr std::size_t kMostLeaked = 4u << 20;  // bytes, whatever the number of seeds

struct Result {
  std::string broken;
  std::uint64_t digest;
};

Result RunSeed(std::uint64_t seed, Tally& tally, bool narrate) {
  Simulation simulation(seed, tally, narrate);
  const std::string broken = simulation.Run();
  return {broken, simulation.Digest()};
}

// What does not hold in the run of `seed`; empty when all does.
std::string Check(std::uint64_t seed, Tally& tally, bool narrate) {
  const Result result = RunSeed(seed, tally, narrate);
  if (!result.broken.empty() || narrate || seed % kSeedsBetweenRepetitions != 0) return result.broken;
  Tally not_counted;
  return RunSeed(seed, not_counted, false).digest == result.digest ? std::string() : "a seed repeats exactly";
}

void Print(const char* title, const Counts& counts) {
  std::printf("%s\n", title);
  for (const auto& [what, count] : counts)
    std::printf("%12llu  %s\n", static_cast<unsigned long long>(count), what.c_str());
}

int Soak(std::uint64_t first, std::uint64_t seeds, bool narrate, bool stop) {
  Tally tally;
  std::uint64_t failures = 0;
  std::size_t heap_before = 0;
  QElapsedTimer time;
  time.start();
  for (std::uint64_t seed = first; seed < first + seeds; ++seed) {
    const std::string broken = Check(seed, tally, narrate);
    if (!broken.empty()) {
      ++failures;
      std::printf("Seed %llu: does not hold: %s\n  Again: scripts/soak --seed %llu\n",
                  static_cast<unsigned long long>(seed), broken.c_str(),
                  static_cast<unsigned long long>(seed));
      std::fflush(stdout);
      if (stop) return EXIT_FAILURE;
    }
    if (seed == first + 100) heap_before = HeapInUse();
  }
  if (seeds > 101 && HeapInUse() > heap_before + kMostLeaked) {
    ++failures;
    std::printf("The heap grew from %zu to %zu bytes\n", heap_before, HeapInUse());
  }
  Print("Faults injected:", tally.faults);
  Print("Seen:", tally.seen);
  std::printf("%llu seeds, %llu failures, %.1f seeds a second, %.1f hours simulated\n",
              static_cast<unsigned long long>(seeds), static_cast<unsigned long long>(failures),
              static_cast<double>(seeds) * 1000 / static_cast<double>(time.elapsed() + 1),
              static_cast<double>(tally.virtual_ms) / 3'600'000);
  return failures == 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace
}  // namespace tendril::test

int main(int argc, char** argv) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  // What would make the window another one.
  for (const char* name : {"QT_SCALE_FACTOR", "QT_SCREEN_SCALE_FACTORS", "QT_FONT_DPI", "QT_STYLE_OVERRIDE"})
    qunsetenv(name);
  qputenv("QT_HASH_SEED", "0");  // or a hash would have another order in each run
  QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.setApplicationDescription(
      QStringLiteral("Runs the program in simulated time against a random person and a "
                     "random world."));
  parser.addHelpOption();
  const QCommandLineOption seeds(QStringLiteral("seeds"), QStringLiteral("How many seeds."),
                                 QStringLiteral("count"), QStringLiteral("1000"));
  const QCommandLineOption first(QStringLiteral("first"), QStringLiteral("The first seed."),
                                 QStringLiteral("seed"), QStringLiteral("1"));
  const QCommandLineOption one(QStringLiteral("seed"),
                               QStringLiteral("Runs one seed, and tells what happens."),
                               QStringLiteral("seed"));
  const QCommandLineOption stop(QStringLiteral("stop"), QStringLiteral("Stops at the first failure."));
  parser.addOptions({seeds, first, one, stop});
  parser.process(application);
  const bool narrate = parser.isSet(one);
  return tendril::test::Soak(parser.value(narrate ? one : first).toULongLong(),
                             narrate ? 1 : parser.value(seeds).toULongLong(), narrate, parser.isSet(stop));
}
