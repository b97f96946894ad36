// The record of a migration as a directory.

#ifndef SCHEMA_MIGRATE_RECORD_OUTPUT_H
#define SCHEMA_MIGRATE_RECORD_OUTPUT_H

#include <libschema-migration/MigrationRecord.h>
#include <libschema-migration/OutputDirectory.h>

#include <string>
#include <vector>

struct RecordOptions {
  std::string path;                // of the record; empty for none
  std::vector<std::string> words;  // of the command line
};

// Throws a Failure unless the two are different directories, neither of them in the other, as far
// as their paths tell.
void refuseUnlessApart(const std::string& record, const std::string& out);

// What the record of a migration is made from; it refers to the plan.
migration::RecordRequest recordRequest(const migration::MigrationPlan& plan,
                                       std::vector<migration::NamedText> outputs,
                                       const std::string& out, const RecordOptions& options,
                                       bool isInLibraryLayout);

// Creates the record, brings it to the disk, and makes sure that it is there; it is still to be
// published. Throws a Failure when that cannot be done.
void writeRecord(const migration::RecordRequest& request, migration::OutputDirectory* record);

#endif  // SCHEMA_MIGRATE_RECORD_OUTPUT_H
