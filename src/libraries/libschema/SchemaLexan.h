// Turns one schema file into tokens. The file reader creates one analyser for each file and hands
// it to the definitions, which parse themselves from it. It owns its symbol table.
//
// A derived class may use what it inherits. It may read from m_input, replace the stream buffer of
// m_input (which then stays the derived class's own) or open another file with it: the next token
// begins where the stream stands. It may add entries to the symbol table and remove them, and may
// replace m_symtable by another table made by `new`, which the analyser then owns; the keywords are
// what that table finds, and m_scratch_index is the entry that the next new text takes the place
// of. The text of the current token stays in the table, whatever happens to the stream.

#ifndef LIBSCHEMA_SCHEMA_LEXAN_H
#define LIBSCHEMA_SCHEMA_LEXAN_H

#include <cstddef>
#include <string>
#include <string_view>

#include "Clex_analyzer.h"
#include "SchemaSymbolTable.h"

namespace libschema {
class LexerTable;
}

class SchemaLexan : public Clex_analyzer {
 public:
  // Opens directory + "/" + fileName; nothing is read yet. A file that cannot be opened, or that is
  // a directory, is not reported here: fileIsOpen() is false then, and lexan() returns TOKEN_END.
  // From here to the destruction of the analyser the locale of the whole process is "C", and
  // afterwards it is the environment's, also when the construction fails with an exception.
  SchemaLexan(std::string directory, std::string fileName);

  // Reads the `size` bytes at `bytes` in place of a file; directory and fileName are only what
  // getWorkingDir() and getFileName() return. Everything else is as over a file with these bytes,
  // but no file is touched, and the locale neither now nor at the destruction: several threads may
  // each use an analyser of their own. The bytes are not copied, and must stay as they are as long
  // as the analyser reads.
  SchemaLexan(const char* bytes, std::size_t size, std::string directory, std::string fileName);

  ~SchemaLexan() override;

  // True while the input is good: opened, no error, and its end not met yet. Bytes are open from
  // the start.
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
  struct BeforeOpening {};
  explicit SchemaLexan(BeforeOpening);

  void begin(std::string fileName);
  void resetLocale();
  libschema::LexerTable* privateTable();
  CSymbolTable* table();
  int nextToken();
  int nextTokenOfStream();
  int takeCharacter(int token);
  int takeText(std::string_view text, int token);
  int takeStreamText(std::string text, int token);
  int storeText(std::string text, int token);
  int takeIndex(int index, int token);
};

#endif  // LIBSCHEMA_SCHEMA_LEXAN_H
