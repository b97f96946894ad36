// A definition in one of its two readings, clause by clause, as a person reads it.

#ifndef LIBSCHEMA_MIGRATION_DEFINITION_VIEW_H
#define LIBSCHEMA_MIGRATION_DEFINITION_VIEW_H

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Definitions.h"
#include "Installation.h"

namespace migration {

// As the library keeps it, or as it is written.
enum class Reading : std::uint8_t { kKept, kWritten };

// A clause as it is shown: quoted texts with their quotes, no value for a flag.
struct ClauseText {
  Clause clause;
  std::string keyword;
  std::vector<std::string> values;
  bool isList;

  // "NAME ( 'cn' 'commonName' )", "MUST ( sn $ cn )", "SUP name", "OBSOLETE".
  std::string text() const;
};

// It refers to the installation that it was taken from.
class DefinitionView {
 public:
  // Of an entry of the installation, as it is kept.
  explicit DefinitionView(const Entry* entry)
      : m_file(entry->file), m_entry(entry), m_written(nullptr) {}
  // As it is written; `entry` is what the library keeps of it, or null.
  DefinitionView(const SchemaFile* file, const WrittenDefinition* written, const Entry* entry)
      : m_file(file), m_entry(entry), m_written(written) {}

  // What the library keeps of it; null when it keeps nothing.
  const Entry* entry() const { return m_entry; }
  const SchemaFile& file() const { return *m_file; }
  Kind kind() const;
  Place place() const;
  const std::string& path() const { return m_file->source->path(); }
  // "attribute type cn (2.5.4.3)".
  std::string title() const;
  std::string oid() const;
  std::vector<std::string> names() const;
  // Without the OID.
  std::vector<ClauseText> clauses() const;

  // Whether `name` is its OID or one of its names, in any letter case.
  bool isCalled(std::string_view name) const;

 private:
  const SchemaFile* m_file;
  const Entry* m_entry;
  const WrittenDefinition* m_written;  // null in the kept reading
};

// All definitions of an installation in a reading, in the order of reading: those that the tables
// get, or all that are written.
std::vector<DefinitionView> definitionsOf(const Installation& installation, Reading reading);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DEFINITION_VIEW_H
