// schema-migrate: checks and shows schemas, and carries that of an old installation over to a new
// release.

#include <fcntl.h>
#include <malloc.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <iostream>
#include <new>

#include "CommandLine.h"
#include "Console.h"
#include "Interruption.h"
#include "Messages.h"
#include "Progress.h"
#include "Terminal.h"

namespace {

// With one of the three closed, the next file to be opened would take its place, and get the
// report.
void holdStandardStreams() {
  int descriptor = 0;
  do {
    descriptor = ::open("/dev/null", O_RDWR);
  } while (descriptor >= 0 && descriptor <= STDERR_FILENO);
  if (descriptor > STDERR_FILENO) {
    ::close(descriptor);
  }
}

// A long text goes back to the system as soon as it is freed. Unless the limit is given, the
// allocator raises it to the length of such texts, and keeps them.
void giveBackLongTexts() {
  constexpr int kLong = 1 << 22;
  ::mallopt(M_MMAP_THRESHOLD, kLong);
}

}  // namespace

int main(int argc, char** argv) {
  holdStandardStreams();
  giveBackLongTexts();
  noteLocale();
  int exitCode = kDone;
  const Commands commands = allCommands();
  Command* const command = parseCommandLine(argc, argv, commands, &exitCode);
  if (command == nullptr) {
    return exitCode;
  }
  // The library sets the environment's locale when it has read a file. Names are compared without
  // regard to letter case, and what that means must not depend on who starts the program where.
  ::setenv("LC_ALL", "C", 1);
  // A pipe that nobody reads and a file that must not grow are errors of a write, told as such.
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
  // The caller may ignore it, and then nothing could be learned of a process that has ended.
  std::signal(SIGCHLD, SIG_DFL);
  interruption::install();
  try {
    Console console;
    const int ended = command->run(&console);
    progress::end();
    return ended;
  } catch (const Failure& failure) {
    progress::end();
    std::cerr << asComplaint(failure.what());
    return failure.exitCode();
  } catch (const std::bad_alloc&) {
    progress::end();
    std::cerr << errorLine("there is not enough memory; nothing was written");
    return kNotWritten;
  } catch (const std::exception& error) {
    progress::end();
    std::cerr << asComplaint(errorLine(error.what()));
    return kNotWritten;
  }
}
