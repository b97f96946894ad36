// What a test needs from the machine it runs on, and what many a container, chroot or ordinary user
// does not have. Each ability is tried out once in a process.

#ifndef LIBSCHEMA_TESTS_MACHINE_H
#define LIBSCHEMA_TESTS_MACHINE_H

#include <gtest/gtest.h>
#include <sys/types.h>

namespace support {

enum class Ability {
  kMountFileSystems,   // in a mount namespace of the process' own, see SmallFileSystem
  kGiveFilesAway,      // to the user kAnotherUser, and take them back
  kGiveUpPrivileges,   // so that permissions hold for a program that is started, even if it is
                       // root's
  kFilterSystemCalls,  // let system calls of a program fail
  kTraceProcesses,     // stop a program at its system calls
};

// Neither root nor, as a rule, who runs the tests.
constexpr uid_t kAnotherUser = 65534;
constexpr gid_t kAnotherGroup = 65533;

bool machineCan(Ability ability);

// As the skipped test tells it.
const char* nameOf(Ability ability);

}  // namespace support

// At the beginning of a test, or of a SetUp: skips it, with the reason, where the machine cannot.
#define SKIP_UNLESS_MACHINE_CAN(ability)                 \
  if (!support::machineCan(support::Ability::ability))   \
  GTEST_SKIP() << "this machine does not let the tests " \
               << support::nameOf(support::Ability::ability)

#endif  // LIBSCHEMA_TESTS_MACHINE_H
