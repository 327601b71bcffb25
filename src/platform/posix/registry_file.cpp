#include "platform/posix/registry_file.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

namespace fs = std::filesystem;

constexpr std::size_t kMostWarnedLines = 20;
constexpr std::int64_t kNsPerSecond = 1'000'000'000;

// A file descriptor that closes itself.
class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  ~Descriptor() {
    if (number_ >= 0) ::close(number_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

  int number() const { return number_; }
  int Release() { return std::exchange(number_, -1); }

 private:
  int number_;
};

std::int64_t Nanoseconds(const timespec& time) {
  return std::int64_t{time.tv_sec} * kNsPerSecond + time.tv_nsec;
}

#ifdef __APPLE__
std::int64_t ModifiedNs(const struct stat& about) { return Nanoseconds(about.st_mtimespec); }
std::int64_t ChangedNs(const struct stat& about) { return Nanoseconds(about.st_ctimespec); }
#else
std::int64_t ModifiedNs(const struct stat& about) { return Nanoseconds(about.st_mtim); }
std::int64_t ChangedNs(const struct stat& about) { return Nanoseconds(about.st_ctim); }
#endif

// Two changes shortly after each other may leave the same times.
bool IsSettled(std::int64_t changed_ns) {
  timespec now = {};
  ::clock_gettime(CLOCK_REALTIME, &now);
  return Nanoseconds(now) - changed_ns > kNsPerSecond;
}

std::int32_t CodeOf(int error) {
  switch (error) {
    case EACCES:
    case EPERM:
    case EROFS:
      return kRegAccessDenied;
    case ENOSPC:
    case EDQUOT:
      return kRegDiskFull;
    default:
      return kRegIoFailed;
  }
}

// The file that a link leads to, whether it is there or not.
fs::path BehindLinks(fs::path path) {
  constexpr int kMostLinks = 40;
  std::error_code error;
  for (int links = 0; links < kMostLinks && fs::is_symlink(path, error); ++links) {
    path = path.parent_path() / fs::read_symlink(path, error);
  }
  return path;
}

// The whole of an open file. Sets `errno` and returns nothing on failure; EFBIG for one that is too large.
std::optional<Bytes> ReadWhole(int descriptor, std::uintmax_t most_bytes) {
  struct stat about {};
  if (::fstat(descriptor, &about) != 0) return std::nullopt;
  if (!S_ISREG(about.st_mode)) {
    errno = EINVAL;
    return std::nullopt;
  }
  if (static_cast<std::uintmax_t>(about.st_size) > most_bytes) {
    errno = EFBIG;
    return std::nullopt;
  }
  Bytes bytes(static_cast<std::size_t>(about.st_size));
  std::size_t size = 0;
  while (size < bytes.size()) {
    const ssize_t got = ::read(descriptor, bytes.data() + size, bytes.size() - size);
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) return std::nullopt;
    if (got == 0) break;  // it was cut meanwhile
    size += static_cast<std::size_t>(got);
  }
  bytes.resize(size);
  return bytes;
}

bool WriteAll(int descriptor, const Bytes& bytes) {
  std::size_t size = 0;
  while (size < bytes.size()) {
    const ssize_t put = ::write(descriptor, bytes.data() + size, bytes.size() - size);
    if (put < 0 && errno != EINTR) return false;
    if (put > 0) size += static_cast<std::size_t>(put);
  }
  return true;
}

// Puts `bytes` in the place of the file `target`, whole or not at all, with its permissions. False with `errno` set.
bool Replace(const fs::path& target, const Bytes& bytes) {
  struct stat old {};
  const bool exists = ::stat(target.c_str(), &old) == 0;
  if (exists && ::access(target.c_str(), W_OK) != 0) return false;
  std::string temporary = target.string() + ".XXXXXX";
  const Descriptor file(::mkstemp(temporary.data()));
  if (file.number() < 0) return false;
  if (exists) (void)!::fchown(file.number(), old.st_uid, old.st_gid);  // not everybody may
  constexpr mode_t kNewMode = 0644;
  constexpr mode_t kPermissions = 0777;
  if (::fchmod(file.number(), exists ? old.st_mode & kPermissions : kNewMode) != 0 ||
      !WriteAll(file.number(), bytes) || ::fsync(file.number()) != 0 ||
      ::rename(temporary.c_str(), target.c_str()) != 0) {
    const int error = errno;
    ::unlink(temporary.c_str());
    errno = error;
    return false;
  }
  const Descriptor folder(::open(target.parent_path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (folder.number() >= 0) ::fsync(folder.number());
  return true;
}

}  // namespace

RegistryFile::RegistryFile(fs::path path, WarningSink warn)
    : path_(std::move(path)), warn_(std::move(warn)) {}

RegistryFile::~RegistryFile() {
  if (changed_) Settle();
  Unlock();
}

void RegistryFile::Warn(const std::string& text) const {
  try {
    if (warn_) warn_(path_.string() + text);
  } catch (...) {
    // That nobody hears of it changes nothing.
  }
}

RegistryFile::Stamp RegistryFile::CurrentStamp() const {
  struct stat about {};
  if (::stat(path_.c_str(), &about) != 0) return {};
  return {true, about.st_dev, about.st_ino, about.st_size, ModifiedNs(about), ChangedNs(about)};
}

void RegistryFile::Refresh() {
  const Stamp current = CurrentStamp();
  if (stamp_ == current) return;
  stamp_.reset();
  try {
    Load();
    if (!current.exists || IsSettled(current.changed_ns)) stamp_ = current;
  } catch (...) {
    memory_.SetTree({});
    writable_ = false;
    Warn(" is not read: " + DescribeCurrentFault());
  }
}

void RegistryFile::Load() {
  memory_.SetTree({});
  form_ = {};
  writable_ = false;
  // Non-blocking: opening a pipe would wait.
  const Descriptor file(::open(path_.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  const std::optional<Bytes> bytes = file.number() >= 0 ? ReadWhole(file.number(), kMostBytes) : std::nullopt;
  if (bytes) {
    if (bytes->empty()) Warn(" is empty.");
    Parse(*bytes);
    writable_ = true;
  } else if (file.number() < 0 && (errno == ENOENT || errno == ENOTDIR)) {
    writable_ = true;
    Warn(" is not there.");
  } else if (errno == EFBIG) {
    Warn(" is not read: it is larger than " + std::to_string(kMostBytes >> 20) + " MiB.");
  } else {
    Warn(" is not read: " + std::generic_category().message(errno) + ".");
  }
}

void RegistryFile::Parse(const Bytes& bytes) {
  std::size_t unread_lines = 0;
  RegistryTree tree;
  form_ = ReadRegistryText(bytes, tree, [&](std::size_t line) {
    if (++unread_lines <= kMostWarnedLines) Warn(", line " + std::to_string(line) + " cannot be read.");
  });
  if (unread_lines > kMostWarnedLines) {
    Warn(": " + std::to_string(unread_lines - kMostWarnedLines) + " more lines cannot be read.");
  }
  memory_.SetTree(std::move(tree));
}

std::int32_t RegistryFile::Lock() {
  std::error_code ignored;  // a folder that cannot be made shows when the lock file is
  const fs::path real = BehindLinks(path_);
  fs::create_directories(real.parent_path(), ignored);
  Descriptor lock(::open((real.string() + ".lock").c_str(), O_RDONLY | O_CREAT | O_CLOEXEC, 0644));
  if (lock.number() < 0) return CodeOf(errno);
  // The others hold it while they write a file: for moments.
  constexpr int kMostTries = 200;
  constexpr timespec kPause = {0, kNsPerSecond / 100};
  for (int tries = 0; ::flock(lock.number(), LOCK_EX | LOCK_NB) != 0; ++tries) {
    if (errno != EWOULDBLOCK) return CodeOf(errno);
    if (tries == kMostTries) return kRegLockViolation;
    ::nanosleep(&kPause, nullptr);
  }
  lock_ = lock.Release();
  return kRegSuccess;
}

void RegistryFile::Unlock() {
  if (lock_ >= 0) ::close(std::exchange(lock_, -1));
}

std::int32_t RegistryFile::BeginChange() {
  if (lock_ < 0) {
    const std::int32_t code = Lock();
    if (code != kRegSuccess) return code;
    Refresh();
  }
  return writable_ ? kRegSuccess : kRegAccessDenied;
}

std::int32_t RegistryFile::Change(const std::function<std::int32_t()>& call) {
  std::int32_t code = BeginChange();
  if (code == kRegSuccess) code = call();
  if (code == kRegSuccess) changed_ = true;
  if (!memory_.HasOpenKeys()) Settle();
  return code;
}

std::int32_t RegistryFile::Settle() {
  std::int32_t code = kRegSuccess;
  if (std::exchange(changed_, false)) {
    // What could not be kept is forgotten too.
    stamp_.reset();
    try {
      const Bytes bytes = WriteRegistryText(form_, memory_.tree());
      if (bytes.size() > kMostBytes) {
        code = kRegDiskFull;  // it could not be read again
      } else if (!Replace(BehindLinks(path_), bytes)) {
        code = CodeOf(errno);
      }
    } catch (...) {
      code = kRegIoFailed;
    }
    if (code != kRegSuccess) Warn(" cannot be written (error " + std::to_string(code) + ").");
  }
  Unlock();
  return code;
}

std::int32_t RegistryFile::OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                                   RegistryHandle& key) {
  if (!memory_.HasOpenKeys()) Refresh();
  return memory_.OpenKey(root, path, access, key);
}

std::int32_t RegistryFile::CreateKey(RootKey root, const std::string& path, RegistryHandle& key) {
  if (OpenKey(root, path, kKeyAllAccess, key) == kRegSuccess) return kRegSuccess;
  return Change([&] { return memory_.CreateKey(root, path, key); });
}

std::int32_t RegistryFile::QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                                      std::uint8_t* data, std::uint32_t& size) {
  return memory_.QueryValue(key, name, type, data, size);
}

std::int32_t RegistryFile::SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                                    std::span<const std::uint8_t> data) {
  return Change([&] { return memory_.SetValue(key, name, type, data); });
}

std::int32_t RegistryFile::DeleteKey(RegistryHandle key, const std::string& subkey) {
  return Change([&] { return memory_.DeleteKey(key, subkey); });
}

std::int32_t RegistryFile::CloseKey(RegistryHandle key) {
  const std::int32_t code = memory_.CloseKey(key);
  if (code != kRegSuccess || memory_.HasOpenKeys()) return code;
  return Settle();
}

}  // namespace tendril
