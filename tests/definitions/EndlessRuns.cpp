#include "EndlessRuns.h"

#include <sys/resource.h>
#include <sys/wait.h>

#include <algorithm>
#include <csignal>
#include <cstddef>
#include <cstdio>
#include <fstream>

#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define LIBSCHEMA_TESTS_ASAN 1
#endif
#endif
#if defined(__SANITIZE_ADDRESS__)
#define LIBSCHEMA_TESTS_ASAN 1
#endif

#if defined(LIBSCHEMA_TESTS_ASAN)
// The sanitizer's own tables do not fit into a small data segment. A growing list is met by a bound
// on the size of one block instead, and the alarm does not cut the report of that short.
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" const char* __asan_default_options();
extern "C" const char* __asan_default_options() { return "max_allocation_size_mb=2"; }
extern "C" void __asan_on_error();
extern "C" void __asan_on_error() { ::alarm(0); }
// NOLINTEND(bugprone-reserved-identifier)
#endif

namespace definitions {

namespace {

constexpr std::size_t kAtATime = 16;

#if !defined(LIBSCHEMA_TESTS_ASAN)
// The size of this process's data segment.
rlim_t dataBytes() {
  rlim_t pages = 0;
  std::ifstream statm("/proc/self/statm");
  for (int field = 0; field < 6; ++field) {
    statm >> pages;
  }
  return pages * static_cast<rlim_t>(::sysconf(_SC_PAGESIZE));
}
#endif

std::string endOf(pid_t child) {
  int status = 0;
  if (::waitpid(child, &status, 0) != child) {
    return "lost";
  }
  if (WIFSIGNALED(status)) {
    const int signal = WTERMSIG(status);
    return signal == SIGALRM ? "endless" : "signal " + std::to_string(signal);
  }
  const int code = WEXITSTATUS(status);
  return code == 0 ? "returned" : "status " + std::to_string(code);
}

}  // namespace

void limitThisProcess() {
#if !defined(LIBSCHEMA_TESTS_ASAN)
  constexpr rlim_t kMore = 4u << 20;
  const rlim_t bytes = dataBytes() + kMore;
  const rlimit data = {bytes, bytes};
  if (::setrlimit(RLIMIT_DATA, &data) != 0) {
    ::_exit(2);
  }
#endif
  const rlimit core = {0, 0};
  ::setrlimit(RLIMIT_CORE, &core);
  ::alarm(1);
}

std::vector<std::string> endsOf(const std::vector<std::function<void()>>& actions) {
  std::vector<std::string> ends;
  std::fflush(nullptr);
  for (std::size_t first = 0; first < actions.size(); first += kAtATime) {
    std::vector<pid_t> children;
    for (std::size_t at = first; at < std::min(actions.size(), first + kAtATime); ++at) {
      const pid_t child = ::fork();
      if (child == 0) {
        actions[at]();
        ::_exit(3);
      }
      children.push_back(child);
    }
    for (const pid_t child : children) {
      ends.push_back(endOf(child));
    }
  }
  return ends;
}

}  // namespace definitions
