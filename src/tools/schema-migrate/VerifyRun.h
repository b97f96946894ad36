// One run of `verify`.

#ifndef SCHEMA_MIGRATE_VERIFY_RUN_H
#define SCHEMA_MIGRATE_VERIFY_RUN_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/OutputComparison.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Console.h"

struct VerifyOptions {
  std::string plan;
  std::string directory;
  migration::ReadLimits limits;
};

struct VerifyReport {
  migration::Failures planChanges;  // why the plan holds no longer
  std::vector<migration::OutputDifference> differences;
  migration::Findings newFindings;
  bool isInLibraryLayout = false;
  std::size_t definitionCount = 0;
  std::size_t fileCount = 0;

  bool isVerified() const {
    return planChanges.empty() && differences.empty() && newFindings.empty();
  }
};

// Compares the directory with the plan. What a run that was killed has left is told. Throws a
// Failure when the plan or the directory cannot be read.
VerifyReport verify(const VerifyOptions& options, Console* console);

// As docs/json/verify.schema.json says.
std::string renderVerificationJson(const VerifyReport& report, const VerifyOptions& options);

// For people.
std::string renderVerification(const VerifyReport& report, const VerifyOptions& options);

#endif  // SCHEMA_MIGRATE_VERIFY_RUN_H
