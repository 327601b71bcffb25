#include "platform/posix/serial_hold.h"

#include <gmock/gmock.h>
#include <grp.h>
#include <sys/ioctl.h>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include "platform/posix/port_holder.h"
#include "platform/pseudo_terminal.h"
#include "platform/runtime_error.h"

namespace tendril::test {
namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

// The number, modulo 256, of the failure of a claim on `device` in another process; 0 when it succeeds.
int FailureOfAnother(const std::string& device, bool ordinary_user) {
  const pid_t child = ::fork();
  if (child == 0) {
    constexpr uid_t kNobody = 65534;
    const bool may_switch = ordinary_user && ::geteuid() == 0;
    if (may_switch && (::setgroups(0, nullptr) != 0 || ::setuid(kNobody) != 0)) ::_exit(255);
    try {
      const SerialHold hold(device);
      ::_exit(0);
    } catch (const RuntimeError& error) {
      ::_exit(error.number() % 256);
    }
  }
  int status = 0;
  ::waitpid(child, &status, 0);
  return WEXITSTATUS(status);
}

TEST(SerialHold, DeviceInExclusiveMode_IsBusyAlsoForTheSuperuserUnlessNotAllowed) {
  const PseudoTerminal line;
  const int other = line.OpenAsAnother();
  ::ioctl(other, TIOCEXCL);
  ::chmod(line.path().c_str(), 0);
  EXPECT_EQ(FailureOfAnother(line.path(), true), kErrNotAllowed);
  ::chmod(line.path().c_str(), 0666);
  for (const bool ordinary_user : {true, false}) {
    EXPECT_EQ(FailureOfAnother(line.path(), ordinary_user), kErrPortAlreadyOpen % 256);
  }
  ::ioctl(other, TIOCNXCL);
  EXPECT_EQ(FailureOfAnother(line.path(), true), 0);
  ::close(other);
}

TEST(SerialHold, NotAllowedText_SaysWhatHelpsAndNothingElse) {
  // device, group, whether the group may use it, user, whether the user is a member
  EXPECT_THAT(ExplainNotAllowed({"/dev/ttyUSB0", "dialout", true, "anna", false}),
              AllOf(HasSubstr("/dev/ttyUSB0"), HasSubstr("\"dialout\""), HasSubstr("dialout anna"),
                    HasSubstr("log out")));
  EXPECT_THAT(ExplainNotAllowed({"/dev/ttyUSB0", "dialout", true, "anna", true}),
              AllOf(HasSubstr("log out and in again"), Not(HasSubstr("sudo"))));
  EXPECT_THAT(ExplainNotAllowed({"/dev/ttyUSB0", "root", true, "anna", false}),
              AllOf(HasSubstr("\"root\""), Not(HasSubstr("sudo"))));
  EXPECT_THAT(ExplainNotAllowed({"/dev/ttyUSB0", "dialout", false, "anna", false}),
              AllOf(HasSubstr("\"dialout\""), Not(HasSubstr("sudo"))));
}

TEST(PortHolder, IsAnotherProgramWithTheDeviceOpen) {
  const PseudoTerminal line;  // which this program has open
  EXPECT_EQ(FindPortHolder(line.path()).process, 0);
  const pid_t child = ::fork();
  if (child == 0) {
    ::prctl(PR_SET_NAME, "other program");
    ::kill(::getpid(), SIGSTOP);
    ::_exit(0);
  }
  ::waitpid(child, nullptr, WUNTRACED);
  EXPECT_EQ(FindPortHolder(line.path()), (PortHolder{"other program", child}));
  ::kill(child, SIGKILL);
  ::waitpid(child, nullptr, 0);
  EXPECT_EQ(FindPortHolder(line.path()).process, 0);
}

}  // namespace
}  // namespace tendril::test
