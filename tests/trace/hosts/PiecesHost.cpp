// Its C library writes one byte at a time to standard error, after an interruption by a signal.

#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "HostRun.h"

extern "C" ssize_t write(int descriptor, const void* bytes, size_t size) {
  static int calls = 0;
  if (descriptor != STDERR_FILENO) {
    return ::syscall(SYS_write, descriptor, bytes, size);
  }
  if (++calls % 2 == 1) {
    errno = EINTR;
    return -1;
  }
  return ::syscall(SYS_write, descriptor, bytes, std::min<size_t>(size, 1));
}

int main(int argumentCount, char** arguments) {
  ::alarm(20);  // for a record that is never written whole
  return runHost(argumentCount, arguments);
}
