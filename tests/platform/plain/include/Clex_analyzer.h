// The interface of a lexical analyser.

#ifndef PLAIN_CLEX_ANALYZER_H
#define PLAIN_CLEX_ANALYZER_H

#include <fstream>
#include <string>

#include "CSymbolTable.h"

class Clex_analyzer {
 public:
  Clex_analyzer()
      : m_symtable(nullptr),
        m_tokenvalindex(-1),
        m_lookahead(-1),
        m_line_num(0),
        m_scratch_index(0) {}

  virtual int getLineNumber() = 0;
  virtual std::string getFileName() = 0;
  virtual std::string getWorkingDir() = 0;
  virtual bool isString(int index) = 0;
  virtual bool isCharacter(int index) = 0;
  virtual int getCurrentToken() = 0;
  virtual int getTokenValIndex() = 0;
  virtual bool getStringValue(int index, std::string& out) = 0;
  virtual bool getCharValue(int index, char& out) = 0;
  virtual int lookUp(int first, int second) = 0;
  virtual int lexan() = 0;
  virtual void match(int expected) = 0;
  virtual int insertString(std::string value, int token) = 0;
  virtual int insertCharacter(char value, int token) = 0;
  virtual int clear() = 0;
  virtual void dumpTable(std::string name) = 0;
  virtual void dump(int indent, std::ofstream& out) = 0;
  virtual void skip(int count, std::ofstream& out) = 0;
  virtual ~Clex_analyzer() {}

 protected:
  CSymbolTable* m_symtable;
  std::string m_filename;
  int m_tokenvalindex;
  std::ifstream m_input;
  int m_lookahead;
  int m_line_num;
  int m_scratch_index;
  std::string m_working_dir;
};

#endif  // PLAIN_CLEX_ANALYZER_H
