// A planned migration carried out by libschema itself, on private copies, and the proof that what
// it came to is what was planned.
//
// libschema reads by path, rewrites its diagnostic files in /tmp, and changes the locale of the
// process: one execution at a time in a process.

#ifndef LIBSCHEMA_MIGRATION_EXECUTION_H
#define LIBSCHEMA_MIGRATION_EXECUTION_H

#include <array>
#include <string>
#include <vector>

#include "Finding.h"
#include "Installation.h"
#include "ThreeWay.h"

namespace migration {

struct Execution {
  // The result in NEW's layout, and as the library writes it, both with NEW's config files. The
  // library reads both alike.
  std::vector<NamedText> inNewsLayout;
  std::vector<NamedText> inLibraryLayout;

  // Why there is no result; empty when all went as planned. The texts mean nothing otherwise.
  Failures failures;
  // The failures are about definitions of which the library makes something else than planned.
  bool departsFromPlan = false;

  // What NEW itself holds that the library's writer does not carry, a failure for each definition:
  // then there is no result in that layout.
  Failures notCarriedByLibrary;
};

// Works in the folders kExecutionFolders of `directory`, which are there, empty, and which nobody
// but the user can reach; the files that it leaves in them are the caller's to remove. What is
// undecided is NEW's.
constexpr std::array<const char*, 5> kExecutionFolders = {"old", "new", "merged", "kept",
                                                          "kept-written"};
Execution execute(const ThreeWayRequest& request, const ThreeWay& threeWay,
                  const std::string& directory);

// What `texts` hold that differs from the plan, a failure for each definition.
Failures differencesFromPlan(const ThreeWay& threeWay, const Installation& result);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_EXECUTION_H
