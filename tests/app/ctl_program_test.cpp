// tendril-ctl as scripts use it: on a kernel terminal device, with the units in another process.
#include <gmock/gmock.h>

#include <QDir>
#include <csignal>
#include <memory>
#include <string>

#include "support/bench_process.h"
#include "support/ctl_process.h"
#ifdef __linux__
#include "platform/posix/serial_hold.h"
#endif

namespace tendril::test {
namespace {

using testing::HasSubstr;

constexpr char kThirdPortOfUnit01[] = "set options of port 3 of unit 01";

QStringList Words(const char* line) { return QString::fromUtf8(line).split(QLatin1Char(' ')); }

class CtlProgram : public testing::Test {
 protected:
  CtlProgram() {
    home_ = QDir::currentPath();
    QDir::setCurrent(folder_.path());
    Expect("preset medium --output show.json", 0, "");
  }
  ~CtlProgram() override { QDir::setCurrent(home_); }

  std::string Files() const {
    const auto all = QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot;
    return QDir(folder_.path()).entryList(all).join(QLatin1Char(' ')).toStdString();
  }
  static void Expect(const char* arguments, int exit_code, const char* error,
                     const char* redirection = "true") {
    CtlProcess ctl(Words(arguments), redirection);
    EXPECT_EQ(ctl.ExitCode(), exit_code) << arguments << "\n" << ctl.Error();
    EXPECT_THAT(ctl.Error(), HasSubstr(error)) << arguments;
  }

  QTemporaryDir folder_;
  QString home_;
  BenchProcess bench_;
};

TEST_F(CtlProgram, WrongUseAndBadFiles_EndWith2WithoutAPort) {
  Expect("find --nonsense", 2, "nonsense");
  Expect("send missing.json 01", 2, "missing.json");
  Expect("preset wide --output show.json", 2, "show.json");
  EXPECT_EQ(Files(), "show.json");
}

TEST_F(CtlProgram, PortThatCannotBeOpened_EndsWith3) {
  Expect("get 01 --port 1", 3, "Comm 1");  // its link leads nowhere
#ifdef __linux__
  bench_.Start();
  const auto hold = std::make_unique<SerialHold>(QFileInfo(bench_.Link()).canonicalFilePath().toStdString());
  Expect("get 01 --port 1", 3, ("process " + std::to_string(::getpid())).c_str());
#endif
  EXPECT_EQ(Files(), "show.json");
}

TEST_F(CtlProgram, Configuration_GoesThereAndBack) {
  bench_.Start();
  Expect("send show.json 0A --port 1", 0, "");
  Expect("get 0A --port 1 --output read.json", 0, "");
  Expect("compare show.json read.json", 0, "");
  Expect("compare show.json 0A 03 --port 1", 1, "");
}

#ifdef __linux__
TEST_F(CtlProgram, Signal_EndsTheCommandAndNamesTheUnit) {
  bench_.Start();
  struct Case {
    const char* arguments;
    const char* when;
    int signal;
    const char* left;  // in what is printed
  };
  const Case cases[] = {
      {"send show.json 01 0A --port 1 --trace", kThirdPortOfUnit01, SIGINT,
       "It holds half a configuration: ports 1 to "},
      {"send show.json 01 0A --port 1 --trace", kThirdPortOfUnit01, SIGTERM,
       "It holds half a configuration: ports 1 to "},
      {"find --port 1 --trace", "poll unit 03", SIGHUP, "tendril-ctl: Stopped. Only IDs up to 0"},
      {"backup saved 01 0A --port 1 --trace", "poll unit 0A", SIGINT, "0A"},
  };
  for (const Case& each : cases) {
    CtlProcess ctl(Words(each.arguments));
    ASSERT_TRUE(ctl.WaitFor(each.when)) << ctl.Error();
    ctl.Signal(each.signal);
    EXPECT_EQ(ctl.ExitCode(), 128 + each.signal) << ctl.Error();
    EXPECT_THAT(ctl.Out() + ctl.Error(), HasSubstr(each.left));
  }
  EXPECT_EQ(QDir(folder_.filePath(QStringLiteral("saved"))).entryList(QDir::Files | QDir::Hidden),
            QStringList{QStringLiteral("unit-01.json")});
}
#endif

TEST_F(CtlProgram, UnpluggedAdapter_LeavesTheOtherUnitsAlone) {
  bench_.Start();
  CtlProcess ctl(Words("send show.json 01 0A --port 1 --trace"));
  ASSERT_TRUE(ctl.WaitFor(kThirdPortOfUnit01)) << ctl.Error();
  bench_.Kill();
  EXPECT_EQ(ctl.ExitCode(), 1);
  EXPECT_THAT(ctl.Out(), HasSubstr("The port went away: plug the adapter in again."));
  EXPECT_THAT(ctl.Out(), HasSubstr("0A    no       -         Not tried."));
  EXPECT_THAT(ctl.Error(), HasSubstr("1 of 2 units failed, 1 was not tried. For another run: 01,0A."));
}

#ifdef __linux__
TEST_F(CtlProgram, FullDisk_LeavesTheOldFileAndNoOther) {
  bench_.Start();
  for (const char* file : {"read.json", "show.json"}) {
    const QByteArray arguments = QByteArray("get 01 --port 1 --force --output ") + file;
    Expect(arguments, 1, (file + std::string(" cannot be written: File too large.")).c_str(), "ulimit -f 1");
  }
  Expect("show show.json", 0, "");
  Expect("preset wide", 1, "The result cannot be written: No space left on device", "exec >/dev/full");
  EXPECT_EQ(Files(), "show.json");
}
#endif

TEST_F(CtlProgram, PortOfTheControlPanel_IsTakenAndGivenBack) {
  bench_.Start({QStringLiteral("--control-panel"), bench_.WriteRegistry()}, true);
  Expect("get 01 --port 1", 3, "--take-port");
  EXPECT_EQ(bench_.Printed().find("panel    "), std::string::npos) << bench_.Printed();
  Expect("get 01 --port 1 --take-port --output read.json", 0, "");
  const auto given_back = [this](int times) {
    const QLatin1String words("The Control Panel holds Comm 1 again.");
    return WaitFor([&] { return QString::fromStdString(bench_.Printed()).count(words) == times; });
  };
  EXPECT_TRUE(given_back(1)) << bench_.Printed();
#ifdef __linux__
  CtlProcess ctl(Words("send show.json 01 --port 1 --take-port --trace"));
  ASSERT_TRUE(ctl.WaitFor(kThirdPortOfUnit01)) << ctl.Error();
  ctl.Signal(SIGTERM);
  EXPECT_EQ(ctl.ExitCode(), 128 + SIGTERM);
  EXPECT_TRUE(given_back(2)) << bench_.Printed();
#endif
}

}  // namespace
}  // namespace tendril::test
