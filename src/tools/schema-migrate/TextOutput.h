// Texts as the files of an output directory.

#ifndef SCHEMA_MIGRATE_TEXT_OUTPUT_H
#define SCHEMA_MIGRATE_TEXT_OUTPUT_H

#include <string>
#include <vector>

#include "OutputDirectory.h"

// Creates the output directory with these files, their folders and no others, brings them to the
// disk, and makes sure that they are there; it is still to be published. Throws a Failure when that
// cannot be done.
void writeTexts(const std::vector<OutputText>& texts, OutputDirectory* output);

// Throws a Failure unless the directory, which is this folder of the output, holds those of the
// files that are in it, byte for byte, and no others.
void verifyTexts(const Directory& directory, const std::vector<OutputText>& texts,
                 const std::string& folder = "");

#endif  // SCHEMA_MIGRATE_TEXT_OUTPUT_H
