// One schema file as libschema's reader keeps it: the definitions in the order in which they are
// read, made by the library's own classes from the bytes of the source, without a file, a locale or
// any other state of the process.

#ifndef LIBSCHEMA_MIGRATION_KEPT_H
#define LIBSCHEMA_MIGRATION_KEPT_H

#include <libschema/Attribute.h>
#include <libschema/ORVAttribute.h>
#include <libschema/ObjectClass.h>

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "Definitions.h"
#include "Source.h"

namespace migration {

// How the reading of a file ends.
enum class ReadingEnd {
  kWhole,     // the reader takes the whole file
  kFails,     // it reports a failure; what it read before stays
  kNeverEnds  // it would not come back
};

// A definition as the library keeps it.
struct KeptDefinition {
  Kind kind;
  bool isInBlock;
  bool isEntered;      // false: parsed, but without an OID in a block, so that no table gets it
  std::size_t offset;  // of the token where its parsing began to take text: its "("
  std::size_t end;     // behind the last token that belongs to it
  std::unique_ptr<ORVSchema> object;

  // The object, which must be of this kind.
  const Attribute& attribute() const { return static_cast<const Attribute&>(*object); }
  const ObjectClass& objectClass() const { return static_cast<const ObjectClass&>(*object); }
  const ORVAttribute& extension() const { return static_cast<const ORVAttribute&>(*object); }
};

// The definitions of one source. It refers to the source, which must stay in place.
class KeptFile {
 public:
  // Reads it. There is no failure: what the reader makes of bad bytes is what is asked for.
  explicit KeptFile(const Source& source);

  // What was read, the definitions in the order of reading, and how it ended.
  const Source& source() const { return *m_source; }
  const std::vector<KeptDefinition>& definitions() const { return m_definitions; }
  ReadingEnd ending() const { return m_ending; }
  // Where reading failed, or stopped coming back; the end of the bytes when it took the whole file.
  std::size_t endOffset() const { return m_endOffset; }

  // Of a failed or endless reading, the definition in which it happened (it is not among
  // definitions()); its object holds what was read so far. Null when it was between definitions.
  const KeptDefinition* unfinished() const { return m_unfinished.get(); }

 private:
  class Reader;

  const Source* m_source;
  std::vector<KeptDefinition> m_definitions;
  ReadingEnd m_ending = ReadingEnd::kWhole;
  std::size_t m_endOffset = 0;
  std::unique_ptr<KeptDefinition> m_unfinished;
};

// "attribute type cn (2.5.4.3)", as WrittenFile::describe does.
std::string describe(const KeptDefinition& definition);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_KEPT_H
