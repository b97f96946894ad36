// What a test takes from a process that is about to start a program. Each returns false where the
// machine does not let it; see Machine.h.

#ifndef LIBSCHEMA_TESTS_PRIVILEGES_H
#define LIBSCHEMA_TESTS_PRIVILEGES_H

#include <vector>

namespace support {

// Lets permissions hold for the programs that this process starts, if it is root's.
bool giveUpPrivileges();

// Lets these system calls fail with `error` from now on.
bool filterSystemCalls(const std::vector<int>& calls, int error);

}  // namespace support

#endif  // LIBSCHEMA_TESTS_PRIVILEGES_H
