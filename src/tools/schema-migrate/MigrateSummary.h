// What a migration came to, file by file.

#ifndef SCHEMA_MIGRATE_MIGRATE_SUMMARY_H
#define SCHEMA_MIGRATE_MIGRATE_SUMMARY_H

#include <libschema-migration/MigrationPlan.h>

#include <string>
#include <vector>

// A table with a line for each file: how many definitions OLD and NEW have in it, and how many of
// those in the result are NEW's, added, in the place of NEW's, or merged.
std::string summaryOf(const migration::MigrationPlan& plan,
                      const std::vector<migration::NamedText>& result, bool isInLibraryLayout);

#endif  // SCHEMA_MIGRATE_MIGRATE_SUMMARY_H
