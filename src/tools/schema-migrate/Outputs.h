// What a run makes on the disk: the library's outputs, with the failures of this program.

#ifndef SCHEMA_MIGRATE_OUTPUTS_H
#define SCHEMA_MIGRATE_OUTPUTS_H

#include <libschema-migration/NewFile.h>
#include <libschema-migration/OutputDirectory.h>
#include <libschema-migration/PrivatePlace.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

// All of these throw a Failure when they cannot do what they say, and what is not complete goes at
// an interruption. Leftovers of runs that were killed are named in *warnings, a line each.

// Looks whether the directory can be made.
std::unique_ptr<migration::OutputDirectory> openOutput(migration::OutputOptions options,
                                                       std::string* warnings);
// The directory with these files, verified, but not yet in its place.
void fill(const std::vector<migration::OutputText>& texts, migration::OutputDirectory* output);
// Puts it in its place.
void publish(migration::OutputDirectory* output);

// Where private copies lie: in memory where it can be had; beside the output `out` at last.
// `inputSize` is that of everything that is read, in bytes. It has the folders that the execution
// of a plan needs.
std::unique_ptr<migration::PrivatePlace> makePrivatePlace(const std::string& out,
                                                          std::uint64_t inputSize,
                                                          std::string* warnings);

// Puts a file with these bytes in the place of `path`.
void writeNewFile(const std::string& path, const std::string& bytes,
                  migration::Over over = migration::Over::kNothing);

// A line for each, for standard error.
std::string errorLinesOf(const migration::Failures& failures);

#endif  // SCHEMA_MIGRATE_OUTPUTS_H
