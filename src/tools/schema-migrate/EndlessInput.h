// Foresees what the library's reading of a schema file comes to, without reading it with the
// library, since on some inputs that never ends:
//   - COLLECTIVE where a clause of an attribute type begins;
//   - a NAME clause that the end of the file is met in;
//   - a DBNAME list that the end of the file is met in.
// Everything else ends. The forecast goes token by token through what the reader and the three
// definitions do, once over the input, and stops where they stop; it holds one buffer and two
// words.

#ifndef SCHEMA_MIGRATE_ENDLESS_INPUT_H
#define SCHEMA_MIGRATE_ENDLESS_INPUT_H

#include <cstddef>
#include <string>
#include <string_view>

#include "InputFile.h"
#include "Messages.h"

enum class Reading {
  kSucceeds,   // the library reads the whole file
  kFails,      // it reports the file as not parsable
  kNeverEnds,  // it would not come back
};

enum class DefinitionKind { kAttributeType, kObjectClass, kVendorExtension };

// "attribute type", "object class", "vendor extension".
const char* nameOf(DefinitionKind kind);

struct Forecast {
  Reading reading = Reading::kSucceeds;
  Position position;    // of what is the matter
  std::string problem;  // what was found, why it cannot be read, how to mend the file; else empty
  std::size_t longestText = 0;  // of the words, quoted strings and numbers met
  Position begin{0, 0};  // of the definition that is not read to its end; line 0 when there is none
};

// Is told of what the forecast comes by.
class ForecastObserver {
 public:
  virtual ~ForecastObserver() = default;

  // A definition that is read to its end begins here. In the order in which they are read.
  virtual void definition(DefinitionKind kind, const Position& begin) = 0;

  // Something that the library reads without complaint and hardly as it was meant.
  virtual void oddity(const Position& position, const std::string& problem) = 0;
};

// An error while reading shows in file->problem(); the forecast means nothing then. `observer` may
// be null.
Forecast foreseeReading(InputFile* file, ForecastObserver* observer);
Forecast foreseeReading(std::string_view text, ForecastObserver* observer);

#endif  // SCHEMA_MIGRATE_ENDLESS_INPUT_H
