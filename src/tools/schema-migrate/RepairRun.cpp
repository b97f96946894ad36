#include "RepairRun.h"

#include <sys/stat.h>

#include <optional>
#include <vector>

#include "Interruption.h"
#include "OutputDirectory.h"
#include "PrivatePlace.h"
#include "RunPlaces.h"
#include "TextOutput.h"

namespace {

std::uint64_t sizeOf(const std::vector<migration::NamedText>& files) {
  std::uint64_t size = 0;
  for (const migration::NamedText& file : files) {
    size += file.bytes.size();
  }
  return size;
}

}  // namespace

CheckReport repairDirectory(const CheckOptions& options, const RepairOptions& repairOptions,
                            Console* console) {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  Removals* const removals = interruption::removals();
  const std::string& directory = options.directories.front();
  std::string warnings;
  OutputDirectory output({repairOptions.out, {directory}, repairOptions.allowForeignParent, mask},
                         removals, &warnings);
  std::vector<migration::NamedText> files;
  CheckReport report = checkRepaired(options, repairOptions.out, &files);
  if (!report.failures.empty()) {
    console->complain(&warnings);
    return report;
  }
  PrivatePlace place(privatePlaceFor(repairOptions.out, sizeOf(files)), removals, &warnings);
  console->complain(&warnings);
  const auto modeOf = [&](const std::string& name) {
    struct stat status {};
    return ::stat((directory + "/" + name).c_str(), &status) == 0
               ? std::optional<mode_t>(status.st_mode & 07777)
               : std::nullopt;
  };
  publishTexts(files, modeOf, &place, &output);
  return report;
}
