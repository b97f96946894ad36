#include "SystemCalls.h"

#include <gtest/gtest.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdint>

namespace {

// A stop at a system call, not by a signal.
constexpr int kCallStop = SIGTRAP | 0x80;

// The call that stands before and behind the action.
constexpr long kMark = SYS_getppid;

const char* nameOf(std::uint64_t call) {
  switch (call) {
#ifdef SYS_open
    case SYS_open:
#endif
    case SYS_openat:
      return "open";
    case SYS_fstat:
#ifdef SYS_newfstatat
    case SYS_newfstatat:
#endif
      return "stat";
    case SYS_ftruncate:
      return "truncate";
    case SYS_fcntl:
      return "control";
    case SYS_write:
    case SYS_writev:
      return "write";
    case SYS_close:
      return "close";
    default:
      return nullptr;
  }
}

[[noreturn]] void runTraced(const std::function<void()>& action) {
  if (::ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0 || ::raise(SIGSTOP) != 0) {
    ::_exit(1);
  }
  ::syscall(kMark);
  action();
  ::syscall(kMark);
  ::_exit(0);
}

}  // namespace

std::map<std::string, int> platform::systemCallsOf(const std::function<void()>& action) {
  std::map<std::string, int> counts;
  const pid_t child = ::fork();
  if (child == 0) {
    runTraced(action);
  }
  int status = 0;
  EXPECT_EQ(::waitpid(child, &status, 0), child);
  EXPECT_TRUE(WIFSTOPPED(status)) << "the child is not traced";
  ::ptrace(PTRACE_SETOPTIONS, child, nullptr, PTRACE_O_TRACESYSGOOD | PTRACE_O_EXITKILL);
  int marks = 0;
  while (::ptrace(PTRACE_SYSCALL, child, nullptr, 0) == 0 &&
         ::waitpid(child, &status, 0) == child && WIFSTOPPED(status)) {
    __ptrace_syscall_info info{};
    if (WSTOPSIG(status) != kCallStop ||
        ::ptrace(PTRACE_GET_SYSCALL_INFO, child, sizeof info, &info) <= 0 ||
        info.op != PTRACE_SYSCALL_INFO_ENTRY) {
      continue;
    }
    marks += info.entry.nr == static_cast<std::uint64_t>(kMark) ? 1 : 0;
    const char* const name = nameOf(info.entry.nr);
    if (marks == 1 && name != nullptr) {
      ++counts[name];
    }
  }
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << "the action did not end";
  EXPECT_EQ(marks, 2);
  return counts;
}
