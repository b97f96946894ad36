#include "CSymbolTable.h"

CSymbolTable::CSymbolTable() {}

CSymbolTable::~CSymbolTable() {}

int CSymbolTable::insertValue(std::string value, int token, bool isKeyword) {
  m_entries.push_back({kString, value, '\0', token, isKeyword});
  return static_cast<int>(m_entries.size()) - 1;
}

int CSymbolTable::insertValue(char value, int token, bool isKeyword) {
  m_entries.push_back({kCharacter, "", value, token, isKeyword});
  return static_cast<int>(m_entries.size()) - 1;
}

int CSymbolTable::lookUpValue(std::string value) {
  for (std::size_t i = 0; i < m_entries.size(); ++i) {
    if (m_entries[i].kind == kString && m_entries[i].text == value) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

int CSymbolTable::getTokenValue(int index) {
  return isString(index) || isCharacter(index) ? m_entries[static_cast<std::size_t>(index)].token
                                               : -1;
}

bool CSymbolTable::isKind(int index, Kind kind) {
  return index >= 0 && static_cast<std::size_t>(index) < m_entries.size() &&
         m_entries[static_cast<std::size_t>(index)].kind == kind;
}

bool CSymbolTable::isString(int index) { return isKind(index, kString); }

bool CSymbolTable::isCharacter(int index) { return isKind(index, kCharacter); }

bool CSymbolTable::getValue(int index, std::string& out) {
  if (!isString(index)) {
    return false;
  }
  out = m_entries[static_cast<std::size_t>(index)].text;
  return true;
}

bool CSymbolTable::getValue(int index, char& out) {
  if (!isCharacter(index)) {
    return false;
  }
  out = m_entries[static_cast<std::size_t>(index)].character;
  return true;
}

void CSymbolTable::removeValue(int index) {
  if (isString(index) || isCharacter(index)) {
    m_entries[static_cast<std::size_t>(index)].kind = kRemoved;
  }
  while (!m_entries.empty() && m_entries.back().kind == kRemoved) {
    m_entries.pop_back();
  }
}

int CSymbolTable::lookUp(int first, int second) {
  for (int i = second; i >= 0 && static_cast<std::size_t>(i) < m_entries.size(); ++i) {
    const Entry& entry = m_entries[static_cast<std::size_t>(i)];
    if (entry.kind != kRemoved && entry.token == first) {
      return i;
    }
  }
  return -1;
}

// Drops what is no keyword.
int CSymbolTable::clear(int /*index*/) {
  for (int i = static_cast<int>(m_entries.size()) - 1; i >= 0; --i) {
    if (!m_entries[static_cast<std::size_t>(i)].isKeyword) {
      removeValue(i);
    }
  }
  return -1;
}

int CSymbolTable::getTableSize() {
  int size = 0;
  for (const Entry& entry : m_entries) {
    size += entry.kind == kRemoved ? 0 : 1;
  }
  return size;
}

void CSymbolTable::tableDump(std::string name) {
  std::ofstream out(name);
  dump(0, out);
}

void CSymbolTable::dump(int indent, std::ofstream& out) {
  for (const Entry& entry : m_entries) {
    out << std::string(static_cast<std::size_t>(indent < 0 ? 0 : indent), '\t') << entry.token
        << ' ' << entry.text << '\n';
  }
}
