// The commands that README.md and the manual show, with tendril-ctl in simulated time. Each document starts with a new
// folder and new units: on Comm 1 those of the tendril-bench command that it shows, or those of the bench itself; on Comm 2
// one fresh from the factory.
#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <string>
#include <vector>

#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

const QString kSources = QStringLiteral(TENDRIL_SOURCES);

QString TextOf(const QString& document) {
  QFile file(kSources + u'/' + document);
  return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

std::vector<std::string> EveryDocument() {
  std::vector<std::string> documents{"README.md"};
  const QDir manual(kSources + QStringLiteral("/docs/manual"));
  for (const QString& chapter : manual.entryList({QStringLiteral("*.md")}))
    documents.push_back("docs/manual/" + chapter.toStdString());
  return documents;
}

// Those that show commands and what they print.
std::vector<std::string> WithExamples() {
  std::vector<std::string> documents = EveryDocument();
  std::erase_if(documents, [](const std::string& document) {
    return !TextOf(QString::fromStdString(document)).contains(u"\n    $ ");
  });
  return documents;
}

class ShownIn : public CtlTest, public testing::WithParamInterface<std::string> {
 protected:
  // Attaches what options such as "--unit 0A" and "--fault mute:0B" name.
  void AttachUnits(const QString& text) {
    const QRegularExpression unit(QStringLiteral("--(?:unit |fault ([a-z-]+):)([0-9A-F]{2})"));
    const QString options =
        QRegularExpression(QStringLiteral("`tendril-bench ([^`]*)`")).match(text).captured();
    for (const auto& match :
         unit.globalMatch(options.isEmpty() ? QStringLiteral("--unit 01 --unit 0A") : options))
      world_.Attach(match.captured(1).toStdString(),
                    static_cast<std::uint8_t>(match.captured(2).toInt(nullptr, 16)));
  }
  void Save(const char* name, const std::string& text) const {
    QFile file(Path(name));
    if (file.open(QIODevice::WriteOnly)) file.write(text.c_str());
  }
  // What a terminal shows when the command has ended: it clears the progress.
  std::string Failure() const {
    const std::size_t failure = terminal_.error.find("tendril-ctl: ");
    return failure == std::string::npos ? std::string() : terminal_.error.substr(failure);
  }
};

TEST_P(ShownIn, CommandsPrintWhatIsShown) {
  const QString document = QString::fromStdString(GetParam());
  AttachUnits(TextOf(document));
  world_.bench.Attach<VirtualUnit>(2, std::uint8_t{0xFF});
  ASSERT_TRUE(QDir(folder_.path()).mkdir(QStringLiteral("home")));
  QDir::setCurrent(Path("home"));
  QProcess shell;
  shell.setReadChannel(QProcess::StandardError);
  shell.start(QStringLiteral("bash"),
              {kSources + QStringLiteral("/tests/ctl/run_document.sh"), kSources + u'/' + document});
  while (shell.canReadLine() || shell.waitForReadyRead()) {
    if (!shell.canReadLine()) continue;
    const int code = Run(QString::fromUtf8(shell.readLine()).chopped(1).split(u'\t'));
    Save("out", terminal_.out);
    Save("error", Failure());
    shell.write(QByteArray::number(code) + '\n');
  }
  ASSERT_TRUE(shell.state() == QProcess::NotRunning || shell.waitForFinished()) << "a command does not end";
  EXPECT_EQ(shell.exitCode(), 0) << shell.readAllStandardOutput().constData();
}

using CommandsInTheText = CtlTest;

TEST_F(CommandsInTheText, Work) {
  world_.Attach("", 0x01);
  QDir::setCurrent(folder_.path());
  const QRegularExpression command(QStringLiteral("`tendril-ctl ([^`]*)`"));
  for (const std::string& document : EveryDocument()) {
    for (const auto& match : command.globalMatch(TextOf(QString::fromStdString(document))))
      EXPECT_EQ(Run(match.captured(1).split(u' ')), 0) << match.captured().toStdString() << terminal_.error;
  }
}

INSTANTIATE_TEST_SUITE_P(Manual, ShownIn, testing::ValuesIn(WithExamples()), [](const auto& instance) {
  QString name = QString::fromStdString(instance.param).section(u'/', -1);
  return name.remove(QRegularExpression(QStringLiteral("\\W"))).toStdString();
});

}  // namespace
}  // namespace tendril::test
