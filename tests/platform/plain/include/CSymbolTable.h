// A symbol table: one array, searched from its beginning.

#ifndef PLAIN_CSYMBOLTABLE_H
#define PLAIN_CSYMBOLTABLE_H

#include <fstream>
#include <string>
#include <vector>

class CSymbolTable {
 public:
  CSymbolTable();
  virtual ~CSymbolTable();
  int insertValue(std::string value, int token, bool isKeyword);
  int insertValue(char value, int token, bool isKeyword);
  int lookUpValue(std::string value);
  int getTokenValue(int index);
  bool getValue(int index, std::string& out);
  bool getValue(int index, char& out);
  bool isString(int index);
  bool isCharacter(int index);
  void removeValue(int index);
  int lookUp(int first, int second);
  int clear(int index);
  int getTableSize();
  void tableDump(std::string name);
  void dump(int indent, std::ofstream& out);

 private:
  enum Kind { kRemoved, kString, kCharacter };
  struct Entry {
    Kind kind;
    std::string text;
    char character;
    int token;
    bool isKeyword;
  };

  bool isKind(int index, Kind kind);

  std::vector<Entry> m_entries;
};

#endif  // PLAIN_CSYMBOLTABLE_H
