#include "platform/posix/registry_file.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <fstream>
#include <iterator>

#include "platform/runtime_error.h"
#include "prefs/registry.h"

namespace tendril::test {
namespace {

namespace fs = std::filesystem;

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

constexpr char kText[] =
    "Windows Registry Editor Version 5.00\n\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane]\n; a remark\n\"Port\"=dword:00000001\n\"Strange\"=what\n\n"
    "[HKEY_USERS\\x]\n\"Data\"=hex(7):61,00,00,00,00,00\n\n";

class RegistryFiles : public testing::Test {
 public:
  RegistryFiles() {
    std::string name = fs::temp_directory_path() / "tendril-registry-XXXXXX";
    folder = ::mkdtemp(name.data());
    path = folder / "kelvane" / "registry.reg";
  }
  ~RegistryFiles() override { fs::remove_all(folder); }

  static void Write(const fs::path& file, const std::string& text) {
    fs::create_directories(file.parent_path());
    std::ofstream(file) << text;
  }
  static std::string Read(const fs::path& file) {
    std::ifstream stream(file);
    return {std::istreambuf_iterator<char>(stream), {}};
  }

  fs::path folder, path;
  std::vector<std::string> warnings;
  WarningSink note = [this](const std::string& warning) { warnings.push_back(warning); };
};

// A program that uses the file.
struct Program {
  RegistryFile file;
  Registry registry;
  RegistryBranch company = RegistryBranch::Company(registry);

  Program(const fs::path& path, const WarningSink& warn) : file(path, warn), registry(file, warn) {}
};

TEST_F(RegistryFiles, MissingFile_HasNoKeysAndIsMadeByTheFirstChange) {
  Program program(path, note);
  for (int time = 0; time < 3; ++time) EXPECT_EQ(program.company.GetNumber("Port", 7), 7);
  EXPECT_THAT(warnings, ElementsAre(HasSubstr("registry.reg is not there")));
  EXPECT_FALSE(fs::exists(path.parent_path()));

  program.company.CreateKey();
  program.company.SetNumber("Port", 3);
  std::string as_exported = "\xFF\xFE";
  for (const char c :
       std::string_view("Windows Registry Editor Version 5.00\r\n\r\n[HKEY_CURRENT_USER\\Software\\Kelvane]"
                        "\r\n\"Port\"=dword:00000003\r\n\r\n")) {
    as_exported.append({c, '\0'});
  }
  EXPECT_EQ(Read(path), as_exported);
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 3);
}

TEST_F(RegistryFiles, FileChangedByAnotherProgram_IsReadAgainAndNothingOfItIsLost) {
  Write(path, kText);
  Program program(path, note);
  EXPECT_EQ(program.company.GetNumber("Port", 7), 1);
  std::string other = kText;
  other[other.find("00000001") + 7] = '2';  // in place, of the same size, at almost the same time
  Write(path, other);
  EXPECT_EQ(program.company.GetNumber("Port", 7), 2);

  program.registry.InOneGo([&] {
    EXPECT_EQ(program.company.GetNumber("Port", 7), 2);
    Program another(path, note);
    another.company.SetString("Another", "x");
    EXPECT_EQ(program.company.GetString("Another", ""), "") << "one state of the file while it is read";
    program.company.SetNumber("Port", 3);
    EXPECT_EQ(program.company.GetString("Another", ""), "x") << "the newest one when it is changed";
    program.company.Below("Sub").CreateKey();
    EXPECT_EQ(Read(path).find("Sub"), std::string::npos) << "written once, at the end";
    const int lock = ::open((path.string() + ".lock").c_str(), O_RDWR);
    EXPECT_NE(::flock(lock, LOCK_EX | LOCK_NB), 0) << "nobody else may change it meanwhile";
    ::close(lock);
  });
  EXPECT_EQ(Read(path),
            "Windows Registry Editor Version 5.00\n\n"
            "[HKEY_CURRENT_USER\\Software\\Kelvane]\n; a remark\n\"Strange\"=what\n\"Another\"=\"x\"\n"
            "\"Port\"=dword:00000003\n\n[HKEY_CURRENT_USER\\Software\\Kelvane\\Sub]\n\n"
            "[HKEY_USERS\\x]\n\"Data\"=hex(7):61,00,00,00,00,00\n\n");
}

TEST_F(RegistryFiles, KeyLeftOpen_KeepsItsChangesAtTheEnd) {
  {
    Program program(path, note);
    program.company.CreateKey();
    program.company.OpenKey(kKeyRead);
    program.company.SetNumber("Port", 3);
  }
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 3);
}

TEST_F(RegistryFiles, LinkAndPermissions_Stay) {
  const fs::path real = folder / "elsewhere" / "real.reg";
  fs::create_directories(path.parent_path());
  fs::create_symlink("../elsewhere/real.reg", path);
  Program program(path, note);
  program.company.CreateKey();  // through a link that leads to nothing yet
  EXPECT_TRUE(fs::is_regular_file(real));
  fs::permissions(real, fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read);
  program.company.SetNumber("Port", 4);
  EXPECT_TRUE(fs::is_symlink(path));
  EXPECT_EQ(static_cast<int>(fs::status(real).permissions()), 0640);
  EXPECT_EQ(Program(real, note).company.GetNumber("Port", 7), 4);
}

// Two thousand keys, each at the end of a path of 510 others: of its own, or the same for all.
std::string DeepKeys(bool same_path) {
  std::string path;
  for (int part = 0; part < 510; ++part) path += "\\a";
  std::string text = "Windows Registry Editor Version 5.00\n";
  for (int i = 0; i < 2000; ++i) {
    const std::string number = "\\" + std::to_string(i);
    text += "[HKEY_CURRENT_USER" + (same_path ? path + number : number + path) + "]\n";
  }
  return text;
}

TEST_F(RegistryFiles, FileThatCannotBeRead_HasNoKeysAndIsNotReplaced) {
  const auto make_large = [this] {
    Write(path, kText);
    fs::resize_file(path, RegistryFile::kMostBytes + 1);
  };
  const auto make_pipe = [this] { ::mkfifo(path.c_str(), 0600); };
  const auto make_folder = [this] { fs::create_directory(path); };
  const std::pair<const char*, std::function<void()>> cases[] = {
      {"larger than 64 MiB", make_large},
      {"is not read", make_pipe},
      {"is not read", make_folder},
      {"neither UTF-16", [&] { Write(path, std::string("\xFE\xFF\0W\0i", 6)); }},
      {"neither UTF-16", [&] { Write(path, "\xFE\xFF\xC3\xBC\xC3\xBC"); }},
      {"neither UTF-16", [&] { Write(path, std::string("W\0i\0n\0", 6)); }},
      {"neither UTF-16", [&] { Write(path, std::string("\xFF\xFE\0\0W\0\0\0", 8)); }},
      {"neither UTF-16", [&] { Write(path, "REGEDIT4\r\n\"K\xE4te\"=dword:00000001\r\n"); }},
      {"neither UTF-16", [&] { Write(path, std::string(kText) + "\"Comment\"=\"B\xFChne\"\n"); }},
      {"more than a million", [&] { Write(path, DeepKeys(false)); }}};
  for (const auto& [text, make] : cases) {
    fs::remove_all(path);
    fs::create_directories(path.parent_path());
    make();
    warnings.clear();
    Program program(path, note);
    program.registry.InOneGo([&] { EXPECT_EQ(program.company.GetNumber("Port", 7), 7); });
    EXPECT_THAT(warnings, ElementsAre(HasSubstr(text)));
    try {
      program.company.CreateKey();
      ADD_FAILURE() << "made a key in it";
    } catch (const RuntimeError& error) {
      EXPECT_EQ(error.number(), kRegAccessDenied);
    }
    EXPECT_TRUE(fs::exists(path));
  }
  warnings.clear();
  Write(path, DeepKeys(true));
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 7);
  EXPECT_THAT(warnings, SizeIs(0));
}

TEST_F(RegistryFiles, LinesThatCannotBeRead_AreToldUpToANumber) {
  Write(path, kText);
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 1);
  EXPECT_THAT(warnings, ElementsAre(AllOf(HasSubstr("registry.reg"), HasSubstr("line 6"))));
  std::string garbage;
  for (int i = 0; i < 10000; ++i) garbage += "\x01[\"\\\n";
  Write(path, garbage);
  warnings.clear();
  EXPECT_EQ(Program(path, note).company.GetNumber("Port", 7), 7);
  EXPECT_THAT(warnings, SizeIs(21));
  EXPECT_THAT(warnings.back(), HasSubstr("9980 more"));
}

TEST_F(RegistryFiles, FileThatCannotBeWritten_StaysAsItWas) {
  Write(path, kText);
  Program program(path, note);
  rlimit before = {};
  ::getrlimit(RLIMIT_FSIZE, &before);
  auto* const handler = std::signal(SIGXFSZ, SIG_IGN);
  const rlimit no_more_than_half = {sizeof kText / 2, before.rlim_max};
  ::setrlimit(RLIMIT_FSIZE, &no_more_than_half);
  std::int32_t number = 0;
  std::string description;
  try {
    program.company.SetNumber("Port", 9);
  } catch (const RuntimeError& error) {
    number = error.number();
    description = error.description();
  }
  ::setrlimit(RLIMIT_FSIZE, &before);
  std::signal(SIGXFSZ, handler);
  EXPECT_EQ(number, kRegIoFailed);
  EXPECT_EQ(description, "RegSetValueEx failure");
  EXPECT_EQ(Read(path), kText);
  EXPECT_EQ(program.company.GetNumber("Port", 7), 1);
  EXPECT_EQ(std::distance(fs::directory_iterator(path.parent_path()), {}), 2)
      << "it and its lock: no other file";
}

}  // namespace
}  // namespace tendril::test
