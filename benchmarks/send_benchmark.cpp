// How long a send of eight ports takes over a paced pseudo-terminal, against the floor that the protocol
// sets: the bytes on the wire at 19200 baud in both directions, the echo counted once, and the eight steps of
// 300 ms.
#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QLabel>
#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <exception>

#include "app/qt_platform.h"
#include "platform/posix/paths.h"
#include "platform/qt/qt_serial_device.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "support/bench_process.h"
#include "ui/frm_new_servo_config.h"

namespace {

using namespace tendril;

constexpr int kRuns = 5;
constexpr double kMaxRatio = 1.05;
constexpr int kLongestSendMs = 20000;

// A device that counts the bytes that come in: on an echoing line these are all bytes on the wire, once.
class CountingDevice final : public SerialDevice {
 public:
  explicit CountingDevice(SerialDevice& device) : device_(device) {}

  void SetEventHandler(std::function<void(SerialEvent)> handler) override {
    device_.SetEventHandler(std::move(handler));
  }
  bool Exists(std::int32_t number) const override { return device_.Exists(number); }
  void SetSettings(const std::string& settings) override { device_.SetSettings(settings); }
  void SetPortNumber(std::int32_t number) override { device_.SetPortNumber(number); }
  void SetLineOptions(const LineOptions& options) override { device_.SetLineOptions(options); }
  void Open() override { device_.Open(); }
  void Close() noexcept override { device_.Close(); }
  bool IsOpen() const override { return device_.IsOpen(); }
  void SetReceiveThreshold(std::int32_t bytes) override { device_.SetReceiveThreshold(bytes); }
  void SetTransmitThreshold(std::int32_t bytes) override { device_.SetTransmitThreshold(bytes); }
  void SetRts(bool asserted) override { device_.SetRts(asserted); }
  void Write(std::span<const std::uint8_t> bytes) override {
    sent += bytes.size();
    device_.Write(bytes);
  }
  Bytes ReadAll() override {
    Bytes bytes = device_.ReadAll();
    received += bytes.size();
    return bytes;
  }
  void ClearInput() override { received += device_.ReadAll().size(); }
  std::size_t PendingOutput() const override { return device_.PendingOutput(); }

  std::size_t sent = 0;
  std::size_t received = 0;

 private:
  SerialDevice& device_;
};

int Measure() {
  test::BenchProcess bench;
  bench.Start();

  QtPlatform platform;
  QtSerialDevice device(platform.on_fault);
  CountingDevice counting(device);
  FileCommandLog log(CommandLogPath());
  HwSerial link(counting, platform.timers, platform.clock, log);
  frmNewServoConfig window(link, platform.timers, platform.boxes, {1, 0, 0});
  window.show();
  auto& ports = *window.findChild<QComboBox*>(QStringLiteral("cmbNYX"));
  ports.setCurrentIndex(1);
  Q_EMIT ports.activated(1);
  auto& send = *window.findChild<QAbstractButton*>(QStringLiteral("Command3_0"));
  auto& outcome = *window.findChild<QLabel*>(QStringLiteral("lblProgress"));

  struct Run {
    double measured_ms, floor_ms;
    double Ratio() const { return measured_ms / floor_ms; }
  };
  std::array<Run, kRuns> runs{};
  for (Run& run : runs) {
    counting.received = 0;
    counting.sent = 0;
    outcome.clear();
    QElapsedTimer timer;
    timer.start();
    send.click();
    while (outcome.text().isEmpty() && timer.elapsed() < kLongestSendMs) {
      QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
    const double measured_ms = static_cast<double>(timer.nsecsElapsed()) / 1e6;
    if (outcome.text() != QStringLiteral("SUCCESS: Send Complete!")) {
      std::printf("The send failed: %s\n", qPrintable(outcome.text()));
      return EXIT_FAILURE;
    }
    run = {measured_ms, static_cast<double>(counting.received) * 10 / 19200 * 1000 + 8 * 300.0};
    std::printf("  %zu bytes sent, %zu on the wire: measured %.1f ms, floor %.1f ms\n", counting.sent,
                counting.received, run.measured_ms, run.floor_ms);
  }
  std::sort(runs.begin(), runs.end(), [](const Run& a, const Run& b) { return a.Ratio() < b.Ratio(); });
  const Run& median = runs[kRuns / 2];
  std::printf("send, median of %d: measured %.1f ms, floor %.1f ms, ratio %.4f (at most %.2f)\n", kRuns,
              median.measured_ms, median.floor_ms, median.Ratio(), kMaxRatio);
  return median.Ratio() <= kMaxRatio ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace

int main(int argc, char** argv) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  QApplication application(argc, argv);
  try {
    return Measure();
  } catch (const std::exception& fault) {
    std::printf("%s\n", fault.what());
    return EXIT_FAILURE;
  }
}
