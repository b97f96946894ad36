// Turns one schema file into tokens. The file reader creates one analyser for each file and hands
// it to the definitions, which parse themselves from it. It owns its symbol table; from its
// construction to its destruction the locale of the whole process is "C", and afterwards it is the
// environment's.

#ifndef LIBSCHEMA_SCHEMA_LEXAN_H
#define LIBSCHEMA_SCHEMA_LEXAN_H

#include <string>
#include <string_view>

#include "Clex_analyzer.h"
#include "SchemaSymbolTable.h"

class SchemaLexan : public Clex_analyzer {
 public:
  // Opens directory + "/" + fileName. A file that cannot be opened or read is not reported here:
  // fileIsOpen() is false then, and lexan() returns TOKEN_END.
  SchemaLexan(std::string directory, std::string fileName);
  ~SchemaLexan() override;

  // True while the input is good: opened, no error, and its end not met yet.
  bool fileIsOpen();

  // Reads the next token and returns its code; TOKEN_END at the end of the input, and from then on.
  // A word or number with no character after it is lost: TOKEN_END is returned in its place. At
  // TOKEN_END the current token (getCurrentToken) stays what it was.
  int lexan() override;

  // Consumes the current token if it is `expected`: the current token becomes the result of
  // lexan(), TOKEN_END included. Does nothing when it is another token; that is no error.
  void match(int expected) override;

  // The code of the current token; the index of its text in the symbol table, -1 when it has none.
  int getCurrentToken() override;
  int getTokenValIndex() override;

  // Copies the value under `index` to `out` and returns true; returns false, with `out` unchanged,
  // when there is no string (no character) under it.
  bool getStringValue(int index, std::string& out) override;
  bool getCharValue(int index, char& out) override;
  bool isString(int index) override;
  bool isCharacter(int index) override;

  // The symbol table's own lookUp.
  int lookUp(int first, int second) override;

  // Adds an entry to the symbol table, not as a keyword, and returns its index.
  int insertString(std::string value, int token) override;
  int insertCharacter(char value, int token) override;

  // Forgets the current token's text: getTokenValIndex(), and the result, are what the symbol
  // table's clear() returned.
  int clear() override;

  // Writes the symbol table to the file `name`; see CSymbolTable::tableDump.
  void dumpTable(std::string name) override;

  // Writes the state and the symbol table to `out`, each line indented by `indent` TABs.
  void dump(int indent, std::ofstream& out) override;

  // Writes `count` TABs; none when it is not positive.
  void skip(int count, std::ofstream& out) override;

  // The current line, 1-based; the bare file name; the directory.
  int getLineNumber() override;
  std::string getFileName() override;
  std::string getWorkingDir() override;

 private:
  int nextToken();
  int nextTokenOfStream();
  int takeCharacter(int token);
  int takeText(std::string_view text, bool isInBuffer, int token);
};

#endif  // LIBSCHEMA_SCHEMA_LEXAN_H
