// The window with its real adapters, on a kernel terminal device, with the units in another process.
#include <gtest/gtest.h>
#include <sys/resource.h>

#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QLabel>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <memory>
#include <string>
#include <vector>

#include "app/utility_program.h"
#include "platform/posix/paths.h"
#include "support/bench_process.h"

namespace tendril::test {
namespace {

constexpr int kGenerousMs = 20000;

class RealLine : public testing::Test {
 protected:
  // Makes the program. Call it when Comm 1 is there.
  void StartProgram() {
    program_ = std::make_unique<UtilityProgram>();
    program_->window.show();
    // A person who reads each box and presses OK.
    reader_.setInterval(20);
    QObject::connect(&reader_, &QTimer::timeout, &reader_, [this] {
      if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
        read_.push_back(box->text().toStdString());
        box->accept();
      }
    });
    reader_.start();
  }
  void ChooseComm1() {
    auto& ports = *program_->window.findChild<QComboBox*>(QStringLiteral("cmbNYX"));
    ports.setCurrentIndex(0);
    QTest::keyClick(&ports, Qt::Key_Down);
    ASSERT_EQ(ports.currentText().toStdString(), "Comm 1");
  }
  void PressSend() {
    outcome().clear();
    QTest::mouseClick(&Button(), Qt::LeftButton);
  }
  std::string Outcome() {
    return QTest::qWaitFor([this] { return !outcome().text().isEmpty() && Button().isEnabled(); },
                           kGenerousMs)
               ? outcome().text().toStdString()
               : "none";
  }
  bool WaitForBox() {
    return QTest::qWaitFor([this] { return !read_.empty() && QApplication::activeModalWidget() == nullptr; },
                           kGenerousMs);
  }
  QAbstractButton& Button() {
    return *program_->window.findChild<QAbstractButton*>(QStringLiteral("Command3_0"));
  }
  QLabel& outcome() { return *program_->window.findChild<QLabel*>(QStringLiteral("lblProgress")); }

  BenchProcess bench_;
  std::unique_ptr<UtilityProgram> program_;
  QTimer reader_;
  std::vector<std::string> read_;
};

double CpuSeconds() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  const auto seconds = [](const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
  };
  return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}

TEST_F(RealLine, Send_SucceedsWithAndWithoutEcho) {
  for (const QStringList& options : {QStringList{}, QStringList{QStringLiteral("--no-echo")}}) {
    bench_.Start(options);
    if (!program_) StartProgram();
    ChooseComm1();
    PressSend();
    EXPECT_EQ(Outcome(), "SUCCESS: Send Complete!") << options.join(QLatin1Char(' ')).toStdString();
    EXPECT_TRUE(read_.empty());
    bench_.Kill();
    ASSERT_TRUE(QTest::qWaitFor([this] { return !program_->Serial1.PortOpen(); }, kGenerousMs));
  }
  EXPECT_TRUE(std::filesystem::exists(CommandLogPath()));
}

TEST_F(RealLine, NoisyUnits_AreHeardThroughTheNoise) {
  bench_.Start({QStringLiteral("--fault"), QStringLiteral("rambling")});
  StartProgram();
  ChooseComm1();
  PressSend();
  EXPECT_EQ(Outcome(), "SUCCESS: Send Complete!");
}

TEST_F(RealLine, UnpluggedInTheMiddle_IsToldOnceAndThePortWorksAfterReplugging) {
  bench_.Start();
  StartProgram();
  ChooseComm1();
  PressSend();
  QTest::qWait(500);
  bench_.Kill();
  ASSERT_TRUE(WaitForBox());
  EXPECT_EQ(outcome().text().toStdString(), "COMMAND FAILED!");
  EXPECT_EQ(read_.size(), 1u);
  EXPECT_NE(read_[0].find("Open of serial port 1 has failed"), std::string::npos) << read_[0];

  bench_.Start();
  ChooseComm1();
  PressSend();
  EXPECT_EQ(Outcome(), "SUCCESS: Send Complete!");
}

TEST_F(RealLine, UnpluggedWhileIdle_SaysNothingAndCostsNothing) {
  bench_.Start();
  StartProgram();
  ChooseComm1();
  bench_.Kill();
  EXPECT_TRUE(QTest::qWaitFor([this] { return !program_->Serial1.PortOpen(); }, kGenerousMs));
  reader_.stop();
  const double before = CpuSeconds();
  QTest::qWait(1000);
  EXPECT_LT(CpuSeconds() - before, 0.05);
  EXPECT_TRUE(read_.empty());
}

}  // namespace
}  // namespace tendril::test
