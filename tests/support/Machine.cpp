#include "Machine.h"

#include <sys/ptrace.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "Privileges.h"
#include "SmallFileSystem.h"

namespace support {

namespace {

// What it tries stays in a process of its own.
bool succeedsInAChild(bool (*trial)()) {
  const pid_t child = ::fork();
  if (child == 0) {
    ::_exit(trial() ? 0 : 1);
  }
  int status = 0;
  return ::waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

bool givesAFileAway() {
  std::string name = (std::filesystem::temp_directory_path() / "libschema-test-XXXXXX").string();
  const int file = ::mkstemp(name.data());
  const bool isAway = file >= 0 && ::geteuid() != kAnotherUser &&
                      ::fchown(file, kAnotherUser, kAnotherGroup) == 0 && ::fchmod(file, 0600) == 0;
  if (::unlink(name.c_str()) == 0) {
    return isAway;
  }
  // In a sticky directory: not without its being the user's own again.
  static_cast<void>(::fchown(file, ::geteuid(), ::getegid()));
  static_cast<void>(::unlink(name.c_str()));
  return false;
}

bool tracesAChild() {
  const pid_t child = ::fork();
  if (child == 0) {
    ::_exit(::ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) == 0 && ::raise(SIGSTOP) == 0 ? 0 : 1);
  }
  int status = 0;
  if (::waitpid(child, &status, WUNTRACED) != child || !WIFSTOPPED(status)) {
    return false;
  }
  __ptrace_syscall_info info{};
  const bool canAsk =
      ::ptrace(PTRACE_SETOPTIONS, child, nullptr, PTRACE_O_TRACESYSGOOD | PTRACE_O_EXITKILL) == 0 &&
      ::ptrace(PTRACE_GET_SYSCALL_INFO, child, sizeof info, &info) > 0;
  ::kill(child, SIGKILL);
  ::waitpid(child, &status, 0);
  return canAsk;
}

}  // namespace

bool machineCan(Ability ability) {
  switch (ability) {
    case Ability::kMountFileSystems:
      return SmallFileSystem::canBeMade();
    case Ability::kGiveFilesAway: {
      static const bool can = succeedsInAChild(givesAFileAway);
      return can;
    }
    case Ability::kGiveUpPrivileges: {
      static const bool can = succeedsInAChild(giveUpPrivileges);
      return can;
    }
    case Ability::kFilterSystemCalls: {
      static const bool can = succeedsInAChild([] { return filterSystemCalls({}, 0); });
      return can;
    }
    case Ability::kTraceProcesses: {
      static const bool can = succeedsInAChild(tracesAChild);
      return can;
    }
  }
  return false;
}

const char* nameOf(Ability ability) {
  switch (ability) {
    case Ability::kMountFileSystems:
      return "mount file systems";
    case Ability::kGiveFilesAway:
      return "give files to another user";
    case Ability::kGiveUpPrivileges:
      return "give up privileges of root";
    case Ability::kFilterSystemCalls:
      return "filter system calls";
    case Ability::kTraceProcesses:
      return "trace processes";
  }
  return "";
}

}  // namespace support
