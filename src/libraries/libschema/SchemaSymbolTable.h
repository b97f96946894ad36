// The 25 keywords of the schema-file language. The lexical analyser owns one table and keeps the
// text of the current word or number in it as well.

#ifndef LIBSCHEMA_SCHEMA_SYMBOL_TABLE_H
#define LIBSCHEMA_SCHEMA_SYMBOL_TABLE_H

#include "CSymbolTable.h"
#include "SchemaTokens.h"

class SchemaSymbolTable : public CSymbolTable {
 public:
  // Fills the table with the keywords, at the indexes 0 to 24.
  SchemaSymbolTable();
  ~SchemaSymbolTable() override;
};

#endif  // LIBSCHEMA_SCHEMA_SYMBOL_TABLE_H
