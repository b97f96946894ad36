#include "SeparateProcess.h"

#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <exception>

#include "Descriptor.h"
#include "Messages.h"

namespace {

[[noreturn]] void failSystem() {
  throw Failure(kNotWritten,
                errorLine("a process of its own for the collision reports cannot be made: " +
                          systemError(errno)));
}

std::string readAll(int descriptor) {
  std::string text;
  std::array<char, 65536> buffer{};
  for (;;) {
    const ssize_t count = ::read(descriptor, buffer.data(), buffer.size());
    if (count == 0 || (count < 0 && errno != EINTR)) {
      return text;
    }
    text.append(buffer.data(), static_cast<std::size_t>(count > 0 ? count : 0));
  }
}

// Hands over the text of `make`, or the lines of its failure; the exit code tells which.
[[noreturn]] void serve(int descriptor, pid_t parent, const std::function<std::string()>& make) {
  // It must not outlive the program, which may have ended already; an interruption is the
  // program's to tell.
  ::prctl(PR_SET_PDEATHSIG, SIGKILL);
  if (::getppid() != parent) {
    ::_exit(kNotWritten);
  }
  for (const int number : {SIGINT, SIGTERM, SIGHUP}) {
    std::signal(number, SIG_DFL);
  }
  try {
    const std::string text = make();
    ::_exit(writeAll(descriptor, text) ? kDone : kNotWritten);
  } catch (const Failure& failure) {
    writeAll(descriptor, failure.what());
    ::_exit(failure.exitCode());
  } catch (const std::exception& error) {
    writeAll(descriptor, errorLine(error.what()));
    ::_exit(kNotWritten);
  } catch (...) {
    writeAll(descriptor, errorLine("the collision reports could not be made"));
    ::_exit(kNotWritten);
  }
}

}  // namespace

std::string textFromSeparateProcess(const std::function<std::string()>& make) {
  std::array<int, 2> ends{};
  if (::pipe2(ends.data(), O_CLOEXEC) != 0) {
    failSystem();
  }
  const pid_t parent = ::getpid();
  const pid_t child = ::fork();
  if (child == 0) {
    ::close(ends[0]);
    serve(ends[1], parent, make);
  }
  ::close(ends[1]);
  std::string text = child < 0 ? std::string() : readAll(ends[0]);
  ::close(ends[0]);
  int status = 0;
  if (child < 0 || ::waitpid(child, &status, 0) != child) {
    failSystem();
  }
  if (!WIFEXITED(status)) {
    throw Failure(kNotWritten,
                  errorLine("the collision reports could not be made: ended by signal " +
                            std::to_string(WTERMSIG(status))));
  }
  switch (const int code = WEXITSTATUS(status)) {
    case kDone:
      return text;
    case kUsage:
    case kBadInput:
    case kRefused:
    case kNotWritten:
      throw Failure(static_cast<ExitCode>(code), text);
    default:
      throw Failure(kNotWritten,
                    text + errorLine("the collision reports could not be made: ended with code " +
                                     std::to_string(code)));
  }
}
