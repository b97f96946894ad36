// The parts of a run up to what the library writes, for their tests.

#ifndef LIBSCHEMA_TESTS_STAGED_RUN_H
#define LIBSCHEMA_TESTS_STAGED_RUN_H

#include <string>

#include "Inputs.h"
#include "Inventory.h"
#include "OidList.h"
#include "PrivatePlace.h"
#include "Rehearsal.h"
#include "Removals.h"
#include "ToolRun.h"

// Reads old/ and new/ of a folder, and its lists, if it has these, exclude and withdraw.
class StagedRun {
 public:
  explicit StagedRun(const ToolFolder& folder);

  std::string warnings;
  Removals removals;
  Inputs inputs;
  const ListFile* exclude = nullptr;
  const ListFile* withdraw = nullptr;
  const Installation& oldInstallation;
  const Installation& newInstallation;
  PrivatePlace place;
  OidLists lists;
  const Inventory oldOne;
  const Inventory newOne;

 private:
  const Installation& copied(const Installation& installation);
};

#endif  // LIBSCHEMA_TESTS_STAGED_RUN_H
