#include "platform/qt/registry_file.h"

#include <gmock/gmock.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <csignal>
#include <functional>

#include "platform/qt/registry_text.h"
#include "platform/runtime_error.h"
#include "platform/system_registry.h"
#include "prefs/registry.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

constexpr char kText[] =
    "Windows Registry Editor Version 5.00\n\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane]\n\"Port\"=dword:00000001\n\n"
    "[HKEY_USERS\\x]\n\"Data\"=hex(7):61,00,00,00,00,00\n\n";

class RegistryFiles : public testing::Test {
 public:
  void Write(const QByteArray& text) const {
    parent.mkpath(parent.path());
    QFile file(path);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(text);
  }
  QByteArray Read() const {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
  }

  QTemporaryDir folder;
  QDir parent = folder.filePath(QStringLiteral("kelvane"));
  QString path = parent.filePath(QStringLiteral("registry.reg"));
  std::vector<std::string> warnings;
  WarningSink note = [this](const std::string& warning) { warnings.push_back(warning); };
};

// A program that uses the file.
struct Program {
  RegistryFile file;
  Registry registry;
  RegistryBranch company = RegistryBranch::Company(registry);

  Program(const QString& path, const WarningSink& warn) : file(path, warn), registry(file, warn) {}
};

TEST_F(RegistryFiles, MissingFile_HasNoKeysAndIsCreatedByTheFirstChange) {
  Program program(path, note);
  for (int time = 0; time < 3; ++time) EXPECT_EQ(program.company.GetNumber("Port", 7), 7);
  EXPECT_THAT(warnings, ElementsAre(HasSubstr("registry.reg is not there")));
  EXPECT_FALSE(parent.exists());
  RegistryHandle root = 0;
  EXPECT_EQ(program.file.OpenKey(RootKey::kCurrentUser, "", kKeyAllAccess, root), kRegSuccess)
      << "is always there";
  program.file.CloseKey(root);

  program.company.CreateKey();
  program.company.SetNumber("Port", 3);
  EXPECT_EQ(parent.entryList(QDir::Files), QStringList(QStringLiteral("registry.reg")));
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 3);
  EXPECT_THAT(warnings, SizeIs(1));
}

TEST_F(RegistryFiles, SystemRegistry_IsTheFileInTheConfigurationFolder) {
  const QByteArray before = qgetenv("XDG_CONFIG_HOME");
  qputenv("XDG_CONFIG_HOME", folder.path().toUtf8());
  Write(kText);
  const std::unique_ptr<RegistryStore> store = OpenSystemRegistry(note);
  Registry registry(*store, note);
  EXPECT_EQ(RegistryBranch::Company(registry).GetNumber("Port", 7), 1);
  qputenv("XDG_CONFIG_HOME", before);
}

TEST_F(RegistryFiles, FileChangedByAnotherProgram_IsReadAgainAndNothingOfItIsLost) {
  Write(kText);
  Program program(path, note);
  EXPECT_EQ(program.company.GetNumber("Port", 7), 1);
  Write(QByteArray(kText).replace("00000001", "00000002"));
  program.registry.InOneGo([&] {
    EXPECT_EQ(program.company.GetNumber("Port", 7), 2);
    Program(path, note).company.SetString("Another", "x");
    EXPECT_EQ(program.company.GetString("Another", ""), "") << "one state of the file while it is read";
    program.company.SetNumber("Port", 3);
    EXPECT_EQ(program.company.GetString("Another", ""), "x") << "the newest one when it is changed";
    program.company.Below("Sub").CreateKey();
    EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 2) << "written once, at the end";
    EXPECT_FALSE(QLockFile(path + QStringLiteral(".lock")).tryLock(0)) << "no other program may change it";
  });
  const RegistryKeys keys = ReadRegistryText(Read(), [](std::size_t line) { ADD_FAILURE() << line; });
  const RegistryValues& values = keys.at(u"HKEY_CURRENT_USER\\Software\\Kelvane");
  EXPECT_EQ(values.at(u"Port"), (RegistryValue{kRegDword, {3, 0, 0, 0}}));
  EXPECT_EQ(values.at(u"Another"), (RegistryValue{kRegSz, {'x', 0, 0, 0}}));
  EXPECT_TRUE(keys.contains(u"HKEY_CURRENT_USER\\Software\\Kelvane\\Sub"));
  EXPECT_EQ(keys.at(u"HKEY_USERS\\x").at(u"Data"), (RegistryValue{kRegMultiSz, {'a', 0, 0, 0, 0, 0}}));
}

TEST_F(RegistryFiles, FileThatCannotBeRead_HasNoKeysAndIsNotReplaced) {
  QByteArray items = "[HKEY_CURRENT_USER\\K]\n";
  for (int i = 0; i < 1'000'000; ++i) items += "@=hex:\n";
  const std::pair<const char*, std::function<void()>> cases[] = {
      {"larger than 64 MiB", [&] { Write(kText), QFile::resize(path, RegistryFile::kMaxBytes + 1); }},
      {"is not read", [&] { ::mkfifo(qPrintable(path), 0600); }},
      {"is not read", [&] { QDir().mkdir(path); }},
      {"neither UTF-16", [&] { Write(QByteArray("\xFE\xFF\0W\0i", 6)); }},
      {"neither UTF-16", [&] { Write(QByteArray("W\0i\0n\0", 6)); }},
      {"neither UTF-16", [&] { Write(QByteArray("\xFF\xFE\0\0W\0\0\0", 8)); }},
      {"neither UTF-16", [&] { Write("REGEDIT4\r\n\"Kate\"=dword:00000001\r\n"); }},
      {"neither UTF-16", [&] { Write(QByteArray(kText) + "\"Comment\"=\"B\xFChne\"\n"); }},
      {"more than a million", [&] { Write(items); }}};
  for (const auto& [text, make] : cases) {
    parent.removeRecursively();
    parent.mkpath(parent.path());
    make();
    const qint64 size = QFileInfo(path).size();
    warnings.clear();
    Program program(path, note);
    program.registry.InOneGo([&] { EXPECT_EQ(program.company.GetNumber("Port", 7), 7); });
    EXPECT_THAT(warnings, ElementsAre(HasSubstr(text)));
    RegistryHandle key = 0;
    EXPECT_EQ(program.file.CreateKey(RootKey::kUsers, "x", key), kRegAccessDenied);
    EXPECT_EQ(QFileInfo(path).size(), size);
  }
}

TEST_F(RegistryFiles, LinesThatCannotBeRead_AreReportedUpToANumber) {
  Write(QByteArray("\x01[\"\\\n").repeated(10000));
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 7);
  EXPECT_THAT(warnings, SizeIs(21));
  EXPECT_THAT(warnings[1], HasSubstr("registry.reg, line 2 "));
  EXPECT_THAT(warnings.back(), HasSubstr("9980 more"));
}

TEST_F(RegistryFiles, FileThatCannotBeWritten_StaysAsItWas) {
  Write(kText);
  Program program(path, note);
  rlimit before = {};
  ::getrlimit(RLIMIT_FSIZE, &before);
  auto* const handler = std::signal(SIGXFSZ, SIG_IGN);
  const rlimit enough_for_the_lock = {256, before.rlim_max};
  ::setrlimit(RLIMIT_FSIZE, &enough_for_the_lock);
  EXPECT_THROW(program.company.SetNumber("Port", 9), RuntimeError);
  ::setrlimit(RLIMIT_FSIZE, &before);
  std::signal(SIGXFSZ, handler);
  EXPECT_EQ(Read(), kText);
  EXPECT_EQ(program.company.GetNumber("Port", 7), 1);
  EXPECT_EQ(parent.entryList(QDir::Files), QStringList(QStringLiteral("registry.reg")));
}

}  // namespace
}  // namespace tendril::test
