// schema-migrate: carries the schema of an old installation over to a new release.

#include <fcntl.h>
#include <malloc.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <iostream>
#include <new>

#include "Arguments.h"
#include "Interruption.h"
#include "Inventory.h"
#include "Messages.h"
#include "Migration.h"
#include "OidList.h"
#include "OutputDirectory.h"
#include "Plan.h"
#include "Report.h"
#include "SeparateProcess.h"
#include "Verification.h"

namespace {

bool print(const std::string& text) {
  return std::fwrite(text.data(), 1, text.size(), stdout) == text.size() &&
         std::fflush(stdout) == 0;
}

// With one of the three closed, the next file to be opened would take its place, and get the
// report.
void holdStandardStreams() {
  int descriptor = 0;
  do {
    descriptor = ::open("/dev/null", O_RDWR);
  } while (descriptor >= 0 && descriptor <= STDERR_FILENO);
  if (descriptor > STDERR_FILENO) {
    ::close(descriptor);
  }
}

// A long text goes back to the system as soon as it is freed. Unless the limit is given, the
// allocator raises it to the length of such texts, and keeps them.
void giveBackLongTexts() {
  constexpr int kLong = 1 << 22;
  ::mallopt(M_MMAP_THRESHOLD, kLong);
}

void complain(std::string* text) {
  std::cerr << *text << std::flush;
  text->clear();
}

OidLists readLists(const Arguments& arguments) {
  OidLists lists;
  for (const std::string& path : arguments.excludeLists) {
    readOidList(path, &lists.excluded);
  }
  if (!arguments.withdrawList.empty()) {
    readOidList(arguments.withdrawList, &lists.withdrawn);
  }
  return lists;
}

void refuseIfNeeded(const Plan& plan) {
  if (plan.refusalCount() != 0) {
    throw Failure(kRefused, plan.refusals() +
                                errorLine("refused: " + counted(plan.refusalCount(), "definition") +
                                          " cannot be migrated; nothing was written"));
  }
}

// The inputs are read three times: to work the run out, for the collision reports, and for the run.
// What one does not need any more it gives back before the next begins; the check for collisions
// cannot, since it empties tables without deleting what was in them.
void migrate(const Arguments& arguments) {
  std::string warnings;
  OutputDirectory output(arguments.out, arguments.from, arguments.to, &warnings);
  complain(&warnings);
  const OidLists lists = readLists(arguments);
  Inventory oldOne("OLD", arguments.from, &warnings);
  Inventory newOne("NEW", arguments.to, &warnings);
  complain(&warnings);
  Plan plan(oldOne, newOne, lists);
  oldOne.releaseObjects();
  newOne.releaseObjects();
  refuseIfNeeded(plan);
  std::cerr << plan.warnings() << std::flush;

  const Installations installations{oldOne, newOne, arguments.excludeLists, arguments.withdrawList};
  if (!print(textFromSeparateProcess([&] { return reportCollisions(installations); }))) {
    throw Failure(kNotWritten, errorLine("the report cannot be written to standard output"));
  }
  {
    Migration migration(installations);
    migration.write(output.create());
  }
  for (std::size_t file = kWrittenFiles; file < kSchemaFiles.size(); ++file) {
    if (newOne.hasFile(file)) {
      output.copyIn(newOne.pathOf(file), kSchemaFiles[file]);
    }
  }
  output.sync();
  verifyOutput(output.partialPath(), plan, newOne);
  const std::string summary = summaryOf(oldOne, newOne, &plan);
  output.publish();
  if (!print("\n" + summary + "Written and verified: " + arguments.out + "\n")) {
    throw Failure(
        kNotWritten,
        errorLine(
            arguments.out,
            "is complete and in place, but the summary cannot be written to standard output"));
  }
}

}  // namespace

int main(int argc, char** argv) {
  holdStandardStreams();
  giveBackLongTexts();
  int exitCode = kDone;
  const std::optional<Arguments> arguments = parseArguments(argc, argv, &exitCode);
  if (!arguments) {
    return exitCode;
  }
  // The library sets the environment's locale when it has read a file. Names are compared without
  // regard to letter case, and what that means must not depend on who starts the program where.
  ::setenv("LC_ALL", "C", 1);
  // A pipe that nobody reads and a file that must not grow are errors of a write, told as such.
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
  interruption::install();
  try {
    migrate(*arguments);
    return kDone;
  } catch (const Failure& failure) {
    std::cerr << failure.what();
    return failure.exitCode();
  } catch (const std::bad_alloc&) {
    std::cerr << errorLine("there is not enough memory; nothing was written");
    return kNotWritten;
  } catch (const std::exception& error) {
    std::cerr << errorLine(error.what());
    return kNotWritten;
  }
}
