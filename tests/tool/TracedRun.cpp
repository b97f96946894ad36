#include "TracedRun.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>

namespace {

// A stop at a system call, not by a signal.
constexpr int kCallStop = SIGTRAP | 0x80;

// The undefined-behaviour sanitizer asks whether memory can be read by writing it to a pipe.
bool isPipe(pid_t process, std::uint64_t descriptor) {
  std::error_code error;
  const std::filesystem::path place =
      "/proc/" + std::to_string(process) + "/fd/" + std::to_string(descriptor);
  return std::filesystem::read_symlink(place, error).string().rfind("pipe:", 0) == 0;
}

bool isChange(pid_t process, std::uint64_t call, const __ptrace_syscall_info& info) {
  switch (call) {
    case SYS_openat:
      return (info.entry.args[2] & O_CREAT) != 0;
    case SYS_write:
    case SYS_writev:
      return info.entry.args[0] > STDERR_FILENO && !isPipe(process, info.entry.args[0]);
#ifdef SYS_mkdir
    case SYS_mkdir:
    case SYS_rename:
    case SYS_unlink:
    case SYS_rmdir:
#endif
    case SYS_mkdirat:
    case SYS_ftruncate:
    case SYS_fchmod:
    case SYS_fchown:
    case SYS_fsync:
    case SYS_renameat:
    case SYS_renameat2:
    case SYS_unlinkat:
      return true;
    default:
      return false;
  }
}

// Counts on the way in, so that the way out of a call belongs to the same number.
class Changes {
 public:
  bool isReached(pid_t process, const Moment& moment) {
    __ptrace_syscall_info info{};
    EXPECT_GT(::ptrace(PTRACE_GET_SYSCALL_INFO, process, sizeof info, &info), 0);
    if (info.op == PTRACE_SYSCALL_INFO_ENTRY) {
      m_isInChange = isChange(process, info.entry.nr, info);
      m_count += m_isInChange ? 1 : 0;
    }
    const bool isBehind = info.op == PTRACE_SYSCALL_INFO_EXIT;
    return m_isInChange && m_count == moment.change && isBehind == moment.isBehind;
  }

 private:
  int m_count = 0;
  bool m_isInChange = false;
};

}  // namespace

void waitForTracer() {
  // The leak checker cannot work in a program that is traced.
  ::setenv("ASAN_OPTIONS", "detect_leaks=0", 1);
  if (::ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0) {
    ::_exit(125);
  }
}

bool endAt(pid_t process, const Moment& moment, int signal, int* exitCode) {
  int status = 0;
  EXPECT_EQ(process, ::waitpid(process, &status, 0));
  EXPECT_TRUE(WIFSTOPPED(status)) << "the program is not traced";
  ::ptrace(PTRACE_SETOPTIONS, process, nullptr, PTRACE_O_TRACESYSGOOD | PTRACE_O_EXITKILL);
  Changes changes;
  bool isSent = false;
  int passedOn = 0;
  for (;;) {
    // Fails when the process was killed, and there is its end to be waited for.
    ::ptrace(PTRACE_SYSCALL, process, nullptr, passedOn);
    if (::waitpid(process, &status, 0) != process || !WIFSTOPPED(status)) {
      break;
    }
    const bool isAtCall = WSTOPSIG(status) == kCallStop;
    passedOn = isAtCall ? 0 : WSTOPSIG(status);
    if (isAtCall && !isSent && changes.isReached(process, moment)) {
      ::kill(process, signal);
      isSent = true;
    }
  }
  *exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  return isSent;
}
