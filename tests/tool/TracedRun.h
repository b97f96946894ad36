// A run of schema-migrate that gets a signal at a chosen system call.

#ifndef LIBSCHEMA_TESTS_TRACED_RUN_H
#define LIBSCHEMA_TESTS_TRACED_RUN_H

#include <sys/types.h>

// When, counted in the system calls by which the program changes something in a file system: files
// and directories made, written, given a mode, brought to the disk, renamed or removed.
struct Moment {
  int change;     // from 1
  bool isBehind;  // when the call has taken effect, or before it does
};

// To be called in `prepare`, for endAt() to take the program over.
void waitForTracer();

// Lets the program go on until then, sends it `signal`, and waits for its end. Returns false when
// it came to its end before. Its exit code, or 128 and the signal that ended it, is in *exitCode.
bool endAt(pid_t process, const Moment& moment, int signal, int* exitCode);

#endif  // LIBSCHEMA_TESTS_TRACED_RUN_H
