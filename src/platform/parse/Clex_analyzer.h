// The interface of a lexical analyser over one input file, with the members that every one has. As
// with CSymbolTable, a server can have a class of this name of its own beside it.

#ifndef LIBSCHEMA_CLEX_ANALYZER_H
#define LIBSCHEMA_CLEX_ANALYZER_H

#include <fstream>
#include <string>

#include "CSymbolTable.h"

#pragma GCC visibility push(default)
inline namespace libschema_platform {

class Clex_analyzer {
 public:
  // Positions, file and directory of the input.
  virtual int getLineNumber() = 0;
  virtual std::string getFileName() = 0;
  virtual std::string getWorkingDir() = 0;

  // The current token and the values in the symbol table, reached by index.
  virtual bool isString(int index) = 0;
  virtual bool isCharacter(int index) = 0;
  virtual int getCurrentToken() = 0;
  virtual int getTokenValIndex() = 0;
  virtual bool getStringValue(int index, std::string& out) = 0;
  virtual bool getCharValue(int index, char& out) = 0;
  virtual int lookUp(int first, int second) = 0;

  // Reading.
  virtual int lexan() = 0;
  virtual void match(int expected) = 0;

  // Maintenance of the symbol table.
  virtual int insertString(std::string value, int token) = 0;
  virtual int insertCharacter(char value, int token) = 0;
  virtual int clear() = 0;

  // Debug output.
  virtual void dumpTable(std::string name) = 0;
  virtual void dump(int indent, std::ofstream& out) = 0;
  virtual void skip(int count, std::ofstream& out) = 0;

  virtual ~Clex_analyzer() = default;
  Clex_analyzer(const Clex_analyzer&) = delete;
  Clex_analyzer& operator=(const Clex_analyzer&) = delete;

 protected:
  Clex_analyzer() = default;

  CSymbolTable* m_symtable = nullptr;  // owned
  std::string m_filename;              // without the directory
  int m_tokenvalindex = -1;            // where the current token's text is in it, -1 for nowhere
  std::ifstream m_input;
  int m_lookahead = -1;     // the current token code
  int m_line_num = 0;       // 1-based once the file is opened
  int m_scratch_index = 0;  // of the one entry that the analyser itself adds
  std::string m_working_dir;
};

}  // namespace libschema_platform
#pragma GCC visibility pop

#endif  // LIBSCHEMA_CLEX_ANALYZER_H
