// Nothing that a lab does reaches the machine that it runs on. Each case looks for a way out and
// fails where there is one; none would harm the machine by finding it.

#include <fcntl.h>
#include <sys/syscall.h>

#include <cerrno>
#include <filesystem>

#include "tests/hosts/lab/lab_test.h"

namespace {

TEST(Power, ProgramsAreTheLabsOwn) {
  for (const char* name : {"poweroff", "reboot"}) {
    EXPECT_EQ(RunLine(std::string("readlink -f $(command -v ") + name + ")"),
              "/bin/lab-program\n= 0\n")
        << name;
  }
  for (const char* name : {"halt", "shutdown", "init", "telinit", "systemctl", "loginctl", "kexec",
                           "rtcwake", "dbus-send"}) {
    EXPECT_EQ(RunLine(std::string("command -v ") + name), "= 127\n") << name;
  }
}

// The kernel looks at the permission before it looks at the numbers, of which none is one.
TEST(Power, TheKernelRefusesToRestart) {
  EXPECT_EQ(syscall(SYS_reboot, 0, 0, 0, nullptr), -1);
  EXPECT_EQ(errno, EPERM);
}

TEST(Power, NoDoorLeadsToTheMachine) {
  for (const char* path :
       {"/proc/sysrq-trigger", "/proc/sys/kernel/ctrl-alt-del", "/proc/sys/kernel/core_pattern",
        "/proc/acpi/sleep", "/sys/power/state", "/dev/initctl", "/dev/watchdog", "/dev/mem",
        "/dev/port", "/dev/kmsg", "/dev/console", "/dev/tty1"}) {
    const int fd = open(path, O_WRONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
    EXPECT_EQ(fd, -1) << path;
    if (fd != -1) close(fd);
  }
  for (const char* path : {"/run", "/sys", "/var/run/systemd", "/var/run/dbus", "/var/run/initctl",
                           "/var/run/docker.sock", "/lib/modules", "/boot"}) {
    EXPECT_FALSE(std::filesystem::exists(path)) << path;
  }
}

}  // namespace
