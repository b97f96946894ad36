#include "Outputs.h"

#include <libschema-migration/Execution.h>
#include <sys/stat.h>

#include <cstdlib>
#include <utility>

#include "Interruption.h"
#include "Messages.h"

namespace {

std::string placeTold(const migration::Failure& failure) {
  return failure.line == 0 ? failure.file : placeOf(failure.file, failure.line);
}

[[noreturn]] void failWith(const migration::Failures& failures, ExitCode exitCode = kNotWritten) {
  throw Failure(exitCode, errorLinesOf(failures));
}

void warn(const migration::Failures& leftovers, std::string* warnings) {
  for (const migration::Failure& left : leftovers) {
    *warnings += warningLine(placeTold(left), left.text);
  }
}

}  // namespace

std::string errorLinesOf(const migration::Failures& failures) {
  std::string lines;
  for (const migration::Failure& failure : failures) {
    lines += failure.file.empty() ? errorLine(failure.text)
                                  : errorLine(placeTold(failure), failure.text);
  }
  return lines;
}

std::unique_ptr<migration::OutputDirectory> openOutput(migration::OutputOptions options,
                                                       std::string* warnings) {
  interruption::expectOutput();
  options.mask = ::umask(0);
  ::umask(options.mask);
  options.riskOption = "--allow-foreign-parent";
  migration::OutputDirectory::Problems problems;
  auto output = migration::OutputDirectory::open(options, interruption::removals(), &problems);
  if (output == nullptr) {
    failWith(problems.failures, problems.isOfRequest ? kUsage : kNotWritten);
  }
  warn(problems.leftovers, warnings);
  return output;
}

void fill(const std::vector<migration::OutputText>& texts, migration::OutputDirectory* output) {
  migration::Failures failures;
  if (!output->fill(texts, &failures)) {
    failWith(failures);
  }
}

void publish(migration::OutputDirectory* output) {
  migration::Failures failures;
  if (!output->publish(&failures)) {
    failWith(failures);
  }
}

std::unique_ptr<migration::PrivatePlace> makePrivatePlace(const std::string& out,
                                                          std::uint64_t inputSize,
                                                          std::string* warnings) {
  // A definition can be written into several files, and all of it is there twice for a while.
  constexpr std::uint64_t kTimes = 5;
  constexpr std::uint64_t kMore = std::uint64_t{1} << 20;
  migration::PrivatePlaceOptions options;
  options.room = kTimes * inputSize + kMore;
  options.prefix = "schema-migrate-";
  options.advice = "name one in TMPDIR";
  const char* const chosen = std::getenv("TMPDIR");
  if (chosen != nullptr && *chosen != '\0') {
    options.candidates.emplace_back(chosen);
  }
  for (const char* const directory : {"/dev/shm", "/tmp", "/var/tmp"}) {
    options.candidates.emplace_back(directory);
  }
  options.candidates.push_back(migration::parentOf(out));
  migration::Failures failures;
  migration::Failures leftovers;
  auto place =
      migration::PrivatePlace::make(options, interruption::removals(), &failures, &leftovers);
  if (place == nullptr) {
    failWith(failures);
  }
  warn(leftovers, warnings);
  for (const char* const folder : migration::kExecutionFolders) {
    if (!place->makeFolder(folder, &failures)) {
      failWith(failures);
    }
  }
  return place;
}

void writeNewFile(const std::string& path, const std::string& bytes, migration::Over over) {
  migration::Failures failures;
  if (!migration::writeNewFile({path, over}, bytes, interruption::removals(), &failures)) {
    failWith(failures);
  }
}
