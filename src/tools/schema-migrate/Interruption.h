// What happens when the program is told to stop (SIGINT, SIGTERM, SIGHUP): what it has made so far
// is removed, and it ends with the code for a run that wrote nothing; what is in place stays, and
// is told.

#ifndef SCHEMA_MIGRATE_INTERRUPTION_H
#define SCHEMA_MIGRATE_INTERRUPTION_H

#include <libschema-migration/Removals.h>

namespace interruption {

// From now on an interruption ends the program so.
void install();

// What an interruption removes.
migration::Removals* removals();

// From now on the run makes an output directory, of which an interruption has to tell.
void expectOutput();

}  // namespace interruption

#endif  // SCHEMA_MIGRATE_INTERRUPTION_H
