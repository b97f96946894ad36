// An output compared with what a plan says that it holds: definition by definition, file by file,
// byte by byte.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_COMPARISON_H
#define LIBSCHEMA_MIGRATION_OUTPUT_COMPARISON_H

#include <cstdint>
#include <string>
#include <vector>

#include "Finding.h"
#include "Installation.h"
#include "MigrationPlan.h"

namespace migration {

// What a plan comes to in one of the two layouts.
struct PlannedFiles {
  std::vector<NamedText> texts;
  // The files but the two config files begin with a line that tells the time, which is not
  // compared.
  bool isInLibraryLayout = false;
};

// A clause that is not as planned.
struct ClauseDifference {
  std::string name;
  std::string planned;  // as they are shown; empty without the clause
  std::string found;
};

// A definition that is missing, additional, changed or in the wrong file; or a file.
struct OutputDifference {
  std::string file;
  std::uint64_t line = 0;  // 0 for the file as a whole
  std::string text;        // one sentence without a full stop
  std::vector<ClauseDifference> clauses;
};

// Every difference: definitions in the order of the plan's files, what was not planned behind them,
// then files. Empty when the output is what the plan says.
std::vector<OutputDifference> compareOutput(const MigrationPlan& plan, const PlannedFiles& planned,
                                            const Installation& output);

// What check() finds in the output that neither OLD nor NEW nor the planned files have.
Findings newInOutput(const MigrationPlan& plan, const PlannedFiles& planned,
                     const Installation& output);

// Whether a file begins as the library writes one that has definitions, so that the output may have
// its layout.
bool mayBeInLibraryLayout(const Installation& output);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_COMPARISON_H
