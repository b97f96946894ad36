// One definition of a plan's document in a page.

#ifndef SCHEMA_MIGRATE_HTML_DEFINITION_H
#define SCHEMA_MIGRATE_HTML_DEFINITION_H

#include <cstddef>

#include "HtmlNames.h"

namespace html {

class DefinitionWriter {
 public:
  // `hasBase`: whether there is a column for BASE.
  DefinitionWriter(const Json& definitions, const Names& names, bool hasBase)
      : m_definitions(definitions), m_names(names), m_hasBase(hasBase) {}

  // Adds a section DEFINITION with base, old, new and result side by side.
  void addWhole(std::size_t at, Dictionary* section) const;
  // The same in a line, for what does not change.
  void addLine(std::size_t at, Dictionary* section) const;

 private:
  void addHead(const Json& definition, std::size_t at, Dictionary* row) const;
  void addReason(const Json& definition, std::size_t at, Dictionary* row) const;
  void addClause(const Json& definition, const Json& clause, Dictionary* row) const;
  void addCell(const Json& definition, const Json& clause, const char* side, Dictionary* row) const;
  void addOthers(const Json& definition, Dictionary* row) const;

  const Json& m_definitions;
  const Names& m_names;
  bool m_hasBase;
};

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_DEFINITION_H
