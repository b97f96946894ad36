#include "RepairRun.h"

#include <sys/stat.h>

#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "Outputs.h"

CheckReport repairDirectory(const CheckOptions& options, const RepairOptions& repairOptions,
                            Console* console) {
  const std::string& directory = options.directories.front();
  std::string warnings;
  migration::OutputOptions place;
  place.path = repairOptions.out;
  place.inputs = {directory};
  place.allowForeignParent = repairOptions.allowForeignParent;
  place.option = "--out";
  const std::unique_ptr<migration::OutputDirectory> output = openOutput(place, &warnings);
  std::vector<migration::NamedText> files;
  CheckReport report = checkRepaired(options, repairOptions.out, &files);
  if (!report.failures.empty()) {
    console->complain(&warnings);
    return report;
  }
  console->complain(&warnings);
  std::vector<migration::OutputText> texts;
  texts.reserve(files.size());
  for (migration::NamedText& file : files) {
    struct stat status {};
    const bool isThere = ::stat((directory + "/" + file.name).c_str(), &status) == 0;
    texts.push_back({std::move(file.name), std::move(file.bytes),
                     isThere ? std::optional<mode_t>(status.st_mode & 07777) : std::nullopt});
  }
  fill(texts, output.get());
  publish(output.get());
  return report;
}
