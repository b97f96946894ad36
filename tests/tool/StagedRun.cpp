#include "StagedRun.h"

namespace {

const ListFile* openIfThere(const ToolFolder& folder, const std::string& name, Inputs* inputs) {
  return support::fileExists(folder.file(name)) ? &inputs->openList(folder.file(name)) : nullptr;
}

}  // namespace

StagedRun::StagedRun(const ToolFolder& folder)
    : inputs(std::uint64_t{1} << 30),
      exclude(openIfThere(folder, "exclude", &inputs)),
      withdraw(openIfThere(folder, "withdraw", &inputs)),
      oldInstallation(inputs.openInstallation("OLD", folder.file("old"), &warnings)),
      newInstallation(inputs.openInstallation("NEW", folder.file("new"), &warnings)),
      place({{folder.path()}}, &removals, &warnings),
      oldOne(copied(oldInstallation), &warnings),
      newOne(newInstallation, &warnings) {
  if (exclude != nullptr) {
    readOidList(*exclude, &lists.excluded);
  }
  if (withdraw != nullptr) {
    readOidList(*withdraw, &lists.withdrawn);
  }
}

const Installation& StagedRun::copied(const Installation& installation) {
  inputs.copyTo(&place);
  return installation;
}
