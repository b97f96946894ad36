// without_mounting PROGRAM ARGUMENT...: runs a program that may neither mount a file system nor
// gain privileges, as in a container.

#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "Privileges.h"

int main(int argc, char** argv) {
  if (argc < 2) {
    std::fputs("usage: without_mounting PROGRAM ARGUMENT...\n", stderr);
    return 2;
  }
  if (!support::filterSystemCalls({SYS_unshare, SYS_mount}, EPERM)) {
    std::perror("without_mounting");
    return 125;
  }
  ::execvp(argv[1], argv + 1);
  std::perror(argv[1]);
  return 127;
}
