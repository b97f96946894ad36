// Texts as the files of an output directory.

#ifndef SCHEMA_MIGRATE_TEXT_OUTPUT_H
#define SCHEMA_MIGRATE_TEXT_OUTPUT_H

#include <libschema-migration/Installation.h>
#include <sys/types.h>

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "OutputDirectory.h"
#include "PrivatePlace.h"

// The mode of a file of this name; that of any new file where there is none.
using ModeOf = std::function<std::optional<mode_t>(const std::string& name)>;

// Puts the output in place with these files and no others, brought to the disk, read back and
// compared. Throws a Failure, with nothing in place, when that cannot be done.
void publishTexts(const std::vector<migration::NamedText>& texts, const ModeOf& modeOf,
                  PrivatePlace* place, OutputDirectory* output);

#endif  // SCHEMA_MIGRATE_TEXT_OUTPUT_H
