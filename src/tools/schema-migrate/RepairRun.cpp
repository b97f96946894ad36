#include "RepairRun.h"

#include <sys/stat.h>

#include <optional>
#include <utility>
#include <vector>

#include "Interruption.h"
#include "OutputDirectory.h"
#include "TextOutput.h"

CheckReport repairDirectory(const CheckOptions& options, const RepairOptions& repairOptions,
                            Console* console) {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  Removals* const removals = interruption::removals();
  interruption::expectOutput();
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
  console->complain(&warnings);
  std::vector<OutputText> texts;
  texts.reserve(files.size());
  for (migration::NamedText& file : files) {
    struct stat status {};
    const bool isThere = ::stat((directory + "/" + file.name).c_str(), &status) == 0;
    texts.push_back({std::move(file.name), std::move(file.bytes),
                     isThere ? std::optional<mode_t>(status.st_mode & 07777) : std::nullopt});
  }
  writeTexts(texts, &output);
  output.publish();
  return report;
}
