// A server's own parse support: classes with the names and the functions of libschema's, but
// another layout and another way of working.

#include "symbols.h"

#include <array>
#include <fstream>
#include <list>
#include <map>
#include <string>
#include <utility>

class CSymbolTable {
 public:
  CSymbolTable();
  virtual ~CSymbolTable();
  virtual int insertValue(std::string value, int token, bool isKeyword);
  virtual int insertValue(char value, int token, bool isKeyword);
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
  std::list<int> m_order;
  std::map<std::string, int> m_tokens;
  std::array<char, 4096> m_room{};
};

class Clex_analyzer {
 public:
  Clex_analyzer();
  virtual ~Clex_analyzer();
  virtual int size();

 protected:
  std::array<CSymbolTable, 2> m_tables;
};

namespace {

int calls = 0;

}  // namespace

CSymbolTable::CSymbolTable() { ++calls; }
CSymbolTable::~CSymbolTable() { ++calls; }
int CSymbolTable::insertValue(std::string value, int token, bool /*isKeyword*/) {
  ++calls;
  m_tokens[value] = token;
  m_order.push_back(token);
  return -7;
}
int CSymbolTable::insertValue(char value, int token, bool isKeyword) {
  return insertValue(std::string(1, value), token, isKeyword);
}
int CSymbolTable::lookUpValue(std::string value) {
  ++calls;
  return m_tokens.count(value) == 0 ? -7 : m_tokens[value];
}
int CSymbolTable::getTokenValue(int /*index*/) { return ++calls; }
bool CSymbolTable::getValue(int /*index*/, std::string& /*out*/) { return ++calls > 0; }
bool CSymbolTable::getValue(int /*index*/, char& /*out*/) { return ++calls > 0; }
bool CSymbolTable::isString(int /*index*/) { return ++calls > 0; }
bool CSymbolTable::isCharacter(int /*index*/) { return ++calls > 0; }
void CSymbolTable::removeValue(int /*index*/) { ++calls; }
int CSymbolTable::lookUp(int /*first*/, int /*second*/) { return ++calls; }
int CSymbolTable::clear(int /*index*/) { return ++calls; }
int CSymbolTable::getTableSize() {
  ++calls;
  return static_cast<int>(m_order.size()) + m_room[0];
}
void CSymbolTable::tableDump(std::string /*name*/) { ++calls; }
void CSymbolTable::dump(int /*indent*/, std::ofstream& /*out*/) { ++calls; }

Clex_analyzer::Clex_analyzer() { ++calls; }
Clex_analyzer::~Clex_analyzer() { ++calls; }
int Clex_analyzer::size() { return m_tables[0].getTableSize() + m_tables[1].getTableSize(); }

std::string useSymbols() {
  CSymbolTable table;
  table.insertValue("cn", 3, true);
  table.insertValue('$', 4, false);
  Clex_analyzer analyzer;
  const std::string text = "server table: cn " + std::to_string(table.lookUpValue("cn")) + ", $ " +
                           std::to_string(table.lookUpValue("$")) + ", size " +
                           std::to_string(table.getTableSize() + analyzer.size());
  return text + ", calls " + std::to_string(std::exchange(calls, 0));
}
