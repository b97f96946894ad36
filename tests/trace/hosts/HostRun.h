// What every host program here does: it reads DIRECTORY/V3.user.at and, when OUT is given, writes
// the file there; it prints the results to standard output.

#ifndef LIBSCHEMA_TESTS_HOST_RUN_H
#define LIBSCHEMA_TESTS_HOST_RUN_H

#include <cstdio>

#include "SchemaManager.h"

inline int runHost(int argumentCount, char** arguments) {
  if (argumentCount < 2) {
    return 2;
  }
  SchemaManager manager(arguments[1]);
  std::printf("read %d\n", manager.readFile("V3.user.at"));
  if (argumentCount > 2) {
    std::printf("write %d\n", manager.writeFile(arguments[2], "V3.user.at"));
  }
  std::fflush(stdout);
  return 0;
}

#endif  // LIBSCHEMA_TESTS_HOST_RUN_H
