// The example of tendril-ctl in README.md, in simulated time.
#include <QDir>
#include <QFile>
#include <QRegularExpression>

#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

using Readme = CtlTest;

TEST_F(Readme, ExampleShowsWhatATerminalShows) {
  QFile file(QStringLiteral(TENDRIL_SOURCES "/README.md"));
  ASSERT_TRUE(file.open(QIODevice::ReadOnly));
  const QRegularExpression example(QStringLiteral("(?<=in another terminal:\n\n)(    .*\n)+"));
  const QString shown = example.match(QString::fromUtf8(file.readAll())).captured();
  QDir::setCurrent(folder_.path());
  world_.Attach("", 0x01);  // the units of tendril-bench
  world_.Attach("", 0x0A);
  QString printed;
  const QRegularExpression command(QStringLiteral("\\$ tendril-ctl (.*)\n"));
  for (const auto& match : command.globalMatch(shown)) {
    Run(match.captured(1).toStdString());
    const QString error = QString::fromStdString(terminal_.error);  // a terminal clears the progress
    const qsizetype failure = error.indexOf(u"tendril-ctl: ");
    printed += match.captured() + QString::fromStdString(terminal_.out) +
               (failure < 0 ? QString() : error.mid(failure));
  }
  EXPECT_FALSE(printed.isEmpty());
  printed.replace(QRegularExpression(QStringLiteral("(?m)^(?=.)")), QStringLiteral("    "));
  EXPECT_EQ(printed.toStdString(), shown.toStdString());
}

}  // namespace
}  // namespace tendril::test
