// The window with its real adapters, on a kernel terminal device, with the units in another process.
#include <gtest/gtest.h>

#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QTest>
#include <array>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "app/utility_program.h"
#include "config/option_bytes.h"
#include "platform/paths.h"
#include "support/bench_process.h"
#include "support/emulated_adapter.h"
#include "support/user.h"

namespace tendril::test {
namespace {

constexpr int kMaxWaitMs = 20000;

// Options of the bench.
const QStringList kFactoryFresh{QStringLiteral("--unit"), QStringLiteral("FF")};
QStringList Fault(const char* name) { return {QStringLiteral("--fault"), QString::fromLatin1(name)}; }

class RealLine : public testing::Test, protected User {
 protected:
  RealLine() {
    Adapter() = {};
    Adapter().empty_read_every = 5;
  }
  // Whatever a test does, the program sets the adapter up like this.
  void TearDown() override {
#ifdef __linux__
    EXPECT_GT(Adapter().empty_reads, 0u);
#endif
    ASSERT_FALSE(Adapter().settings.empty());
    EXPECT_EQ(Adapter().settings.front(), EmulatedAdapter::LineSettings());
    ASSERT_FALSE(Adapter().rts.empty());
    EXPECT_TRUE(Adapter().rts.front()) << "the program drives the line from the opening on";
  }

  // Restarts the program.
  void StartProgram() {
    program_.reset();
    program_ = std::make_unique<UtilityProgram>();
    program_->window.show();
    SetWindow(program_->window);
  }
  // Of the command that was pressed last.
  std::string Outcome() {
    return QTest::qWaitFor([this] { return CommandOver(); }, kMaxWaitMs) ? OutcomeLabel().text().toStdString()
                                                                         : "none";
  }
  bool WaitForBox() {
    return QTest::qWaitFor([this] { return !read.empty() && QApplication::activeModalWidget() == nullptr; },
                           kMaxWaitMs);
  }
  bool WaitForClosedPort() {
    return QTest::qWaitFor([this] { return !program_->Serial1.PortOpen(); }, kMaxWaitMs);
  }

  BenchProcess bench_;
  std::unique_ptr<UtilityProgram> program_;
};

TEST_F(RealLine, PortOfTheControlPanel_ChangesHandsAndBack) {
  bench_.Start({QStringLiteral("--control-panel"), bench_.WriteRegistry()}, true);
  StartProgram();
  ChoosePort(1);
  ASSERT_TRUE(QTest::qWaitFor([this] { return read.size() == 2; }, kMaxWaitMs));
  EXPECT_EQ(read[0].second.substr(0, 62), "This serial port (Comm1) is in use by the Control Panel.\n\nThe ");
  EXPECT_FALSE(program_->Serial1.PortOpen());
  ASSERT_TRUE(QTest::qWaitFor(
      [this] { return bench_.Printed().find("reply to 1: done") != std::string::npos; }, kMaxWaitMs));

  ChoosePort(1);
  ASSERT_TRUE(program_->Serial1.PortOpen());
  Press(kSend);
  EXPECT_EQ(Outcome(), "SUCCESS: Send Complete!");
  Press(kSend);
  ASSERT_FALSE(Button(kSend).isEnabled());  // it runs
  EXPECT_FALSE(program_->window.close());
  EXPECT_FALSE(program_->Serial1.PortOpen());
  ASSERT_TRUE(QTest::qWaitFor([this] { return !program_->window.isVisible(); }, kMaxWaitMs));
  program_.reset();
  ASSERT_TRUE(QTest::qWaitFor(
      [this] { return bench_.Printed().find("reply to 2: done") != std::string::npos; }, kMaxWaitMs));

  // The frames, to the byte.
  std::size_t at = 0;
  for (const char* frame : {"program  49 30 30 30 30 31 35 54 65 6E 64 72 69 6C 20 55 74 69 6C 69 74 79 ",
                            "panel    31 30 30 30 30 30 30 ", "program  43 31 30 30 30 30 32 01 00 ",
                            "panel    31 31 30 30 30 30 30 ", "program  43 32 30 30 30 30 32 01 01 ",
                            "panel    31 32 30 30 30 30 30 "}) {
    const std::size_t found = bench_.Printed().find(frame, at);
    ASSERT_NE(found, std::string::npos) << frame << bench_.Printed();
    at = found;
  }
}

TEST_F(RealLine, Send_SucceedsWithAndWithoutEcho) {
  for (const QStringList& options : {QStringList{}, QStringList{QStringLiteral("--no-echo")}}) {
    bench_.Start(options);
    if (!program_) StartProgram();
    ChoosePort(1);
    Adapter().rts.clear();
    Press(kSend);
    EXPECT_EQ(Outcome(), "SUCCESS: Send Complete!") << options.join(QLatin1Char(' ')).toStdString();
    EXPECT_TRUE(read.empty());
    // Each of the eight polls releases the line for the reply, once its echo is there, and takes it back.
    std::vector<bool> turns;
    for (int port = 0; port < 8; ++port) {
      if (options.isEmpty()) turns.push_back(false);
      turns.push_back(true);
    }
    EXPECT_EQ(Adapter().rts, turns);
    bench_.Kill();
    ASSERT_TRUE(WaitForClosedPort());
  }
  EXPECT_TRUE(std::filesystem::exists(CommandLogPath()));
}

// A unit whose ports 3 and 8 differ from what the window starts with; the others hold just that.
TEST_F(RealLine, Get_TakesOverAllPorts) {
  for (const QStringList& options : {QStringList{}, QStringList{QStringLiteral("--no-echo")}}) {
    SCOPED_TRACE(options.join(QLatin1Char(' ')).toStdString());
    bench_.Start(options);
    StartProgram();
    ChannelTable expected = program_->window.WorkingConfiguration();
    ChoosePort(1);
    const auto set_port = [this](std::uint8_t port, std::uint8_t flags, std::uint8_t low, std::uint8_t high,
                                 const std::array<std::uint8_t, 6>& others) {
      program_->Serial1.cmdSetManyOptions(0x01, 0, kOptionServoPort, port, flags, low, high, others);
    };
    set_port(3, 159, 61, 239, {101, 199, 102, 198, 149, 151});
    set_port(8, 1, 50, 250, {70, 230, 80, 220, 140, 160});
    expected.At(2) = {kPortPwm, {610, 2390}, {1010, 1990},    {1020, 1980},
                      1490,     1510,        kPowerUpDefault, kLostCommNeutral};
    expected.At(7) = {kPortServo, {500, 2500}, {700, 2300},          {800, 2200},
                      1400,       1600,        kPowerUpFirstCommand, kLostCommStopPulse};
    Press(kGet);
    EXPECT_EQ(Outcome(), "SUCCESS: Upload Complete");
    EXPECT_TRUE(program_->window.WorkingConfiguration() == expected);
    bench_.Kill();
  }
}

TEST_F(RealLine, ChangedId_IsWhereTheUnitAnswersFromThenOn) {
  bench_.Start(kFactoryFresh);
  StartProgram();
  ChoosePort(1);
  QTest::keyClick(&Find<QComboBox>("CmbUnitID_1"), Qt::Key_A);
  Press(kGet);
  ASSERT_TRUE(WaitForBox());  // no unit is at 0A yet
  Press(kChangeId);
  EXPECT_EQ(Outcome(), "SUCCESS: UnitID set to '0A'");
  Press(kGet);
  EXPECT_EQ(Outcome(), "SUCCESS: Upload Complete");
  EXPECT_EQ(read.size(), 1u);
}

TEST_F(RealLine, UnpluggedInTheMiddle_IsReportedOnceAndThePortWorksAfterReplugging) {
  struct Case {
    const char* button;
    QStringList units;
    QStringList fault;  // keeps the command running
    const char* success;
  };
  for (const auto& [button, units, fault, success] :
       {Case{kSend, {}, {}, "SUCCESS: Send Complete!"},
        Case{kGet, {}, Fault("slow"), "SUCCESS: Upload Complete"},
        Case{kChangeId, kFactoryFresh, Fault("mute"), "SUCCESS: UnitID set to '01'"}}) {
    SCOPED_TRACE(success);
    bench_.Start(units + fault);
    read.clear();
    if (!program_) StartProgram();
    ChoosePort(1);
    Press(button);
    QTest::qWait(400);
    ASSERT_FALSE(Button(button).isEnabled());  // it runs
    bench_.Kill();
    ASSERT_TRUE(WaitForBox());
    EXPECT_EQ(OutcomeLabel().text().toStdString(), "COMMAND FAILED!");
    EXPECT_EQ(read.size(), 1u);
    EXPECT_NE(read[0].second.find("Open of serial port 1 has failed"), std::string::npos) << read[0].second;

    bench_.Start(units);
    ChoosePort(1);
    Press(button);
    EXPECT_EQ(Outcome(), success);
    bench_.Kill();
    ASSERT_TRUE(WaitForClosedPort());
  }
}

TEST_F(RealLine, UnpluggedInASweep_EndsItSilentlyAndItCanBeStartedAgain) {
  bench_.Start();
  StartProgram();
  ChoosePort(1);
  QTest::mouseClick(&Find("ServoSimulator2_0"), Qt::LeftButton);
  for (int run = 0; run < 2; ++run) {
    Press(kSweep);
    program_->Serial1.SentByteCount(true);
    QTest::qWait(600);
    EXPECT_GT(program_->Serial1.SentByteCount(false), 0);
    EXPECT_EQ(Button(kSweep).text().toStdString(), "Stop");
    bench_.Kill();
    EXPECT_TRUE(WaitForClosedPort());
    EXPECT_EQ(Button(kSweep).text().toStdString(), "Test");
    QTest::qWait(300);  // no further step comes
    EXPECT_TRUE(read.empty());
    bench_.Start();
  }
  ChoosePort(1);
  Press(kGet);
  EXPECT_EQ(Outcome(), "SUCCESS: Upload Complete");
}

}  // namespace
}  // namespace tendril::test
