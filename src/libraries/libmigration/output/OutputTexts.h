// Texts as the files of an output directory.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_TEXTS_H
#define LIBSCHEMA_MIGRATION_OUTPUT_TEXTS_H

#include <string>
#include <vector>

#include "OutputDirectory.h"
#include "OutputWork.h"

namespace migration {

// Creates the output directory with these files, their folders and no others, brings them to the
// disk, and makes sure that they are there; it is still to be published. Stopped (OutputStop) when
// that cannot be done.
void writeTexts(const std::vector<OutputText>& texts, OutputWork* output);

// Stopped unless the output holds these files, byte for byte, and no others.
void verifyAllTexts(const OutputWork& output, const std::vector<OutputText>& texts);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_TEXTS_H
