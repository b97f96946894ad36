#include "CSymbolTable.h"

#include <utility>

#include "DiagnosticFile.h"

CSymbolTable::CSymbolTable() {
  constexpr std::size_t kUsualEntries = 32;
  m_entries.reserve(kUsualEntries);
  m_buckets.fill(-1);
}

CSymbolTable::~CSymbolTable() = default;

// The slot behind the last entry. It keeps the text that it had.
CSymbolTable::Entry* CSymbolTable::nextSlot() {
  if (m_used == m_entries.size()) {
    m_entries.emplace_back();
  }
  return &m_entries[m_used];
}

CSymbolTable::Entry* CSymbolTable::appendEntry(Kind kind, int token, bool isKeyword) {
  Entry* entry = nextSlot();
  ++m_used;
  entry->kind = kind;
  entry->isKeyword = isKeyword;
  entry->token = token;
  entry->next = -1;
  return entry;
}

int CSymbolTable::insertValue(std::string value, int token, bool isKeyword) {
  return insertText(value, token, isKeyword);
}

int CSymbolTable::insertText(std::string_view text, int token, bool isKeyword) {
  // The copy comes first: where there is no memory for it, the table stays as it is.
  nextSlot()->text.assign(text);
  appendEntry(Kind::kString, token, isKeyword);
  const int index = static_cast<int>(m_used) - 1;
  link(index);
  return index;
}

int CSymbolTable::replaceText(int index, std::string_view text, int token) {
  removeValue(index);
  return insertText(text, token, false);
}

int CSymbolTable::addBorrowed(int index, std::string_view text, int token) {
  removeValue(index);
  keepBorrowed();
  appendEntry(Kind::kString, token, false);
  m_borrower = static_cast<int>(m_used) - 1;
  m_borrowed = text;
  return m_borrower;
}

char* CSymbolTable::inputRoom() {
  if (m_inputRoom == nullptr) {
    m_inputRoom.reset(new char[kInputRoom]);
  }
  return m_inputRoom.get();
}

void CSymbolTable::keepBorrowed() {
  if (m_borrower >= 0) {
    m_entries[static_cast<std::size_t>(m_borrower)].text.assign(m_borrowed);
    link(std::exchange(m_borrower, -1));
  }
}

int CSymbolTable::insertValue(char value, int token, bool isKeyword) {
  appendEntry(Kind::kCharacter, token, isKeyword)->character = value;
  return static_cast<int>(m_used) - 1;
}

int CSymbolTable::lookUpValue(std::string value) { return findText(value); }

bool CSymbolTable::getValue(int index, char& out) {
  if (!isCharacter(index)) {
    return false;
  }
  out = entryAt(index)->character;
  return true;
}

bool CSymbolTable::isString(int index) {
  const Entry* entry = entryAt(index);
  return entry != nullptr && entry->kind == Kind::kString;
}

bool CSymbolTable::isCharacter(int index) {
  const Entry* entry = entryAt(index);
  return entry != nullptr && entry->kind == Kind::kCharacter;
}

// Puts the entry into its bucket so that a look-up meets the lowest index first.
void CSymbolTable::link(int index) {
  Entry& entry = m_entries[static_cast<std::size_t>(index)];
  int* place = &m_buckets[bucketOf(entry.text)];
  while (*place >= 0 && *place < index) {
    place = &m_entries[static_cast<std::size_t>(*place)].next;
  }
  entry.next = *place;
  *place = index;
}

void CSymbolTable::unlink(int index) {
  const Entry& entry = m_entries[static_cast<std::size_t>(index)];
  int* place = &m_buckets[bucketOf(entry.text)];
  while (*place != index) {
    place = &m_entries[static_cast<std::size_t>(*place)].next;
  }
  *place = entry.next;
}

void CSymbolTable::removeValue(int index) {
  if (entryAt(index) == nullptr) {
    return;
  }
  Entry& entry = m_entries[static_cast<std::size_t>(index)];
  if (index == m_borrower) {
    m_borrower = -1;
  } else if (entry.kind == Kind::kString) {
    unlink(index);
  }
  entry.kind = Kind::kNone;
  ++m_holes;
  while (m_used > 0 && m_entries[m_used - 1].kind == Kind::kNone) {
    --m_used;
    --m_holes;
  }
}

int CSymbolTable::lookUp(int token, int firstIndex) {
  for (int index = firstIndex < 0 ? 0 : firstIndex; index < static_cast<int>(m_used); ++index) {
    const Entry* entry = entryAt(index);
    if (entry != nullptr && entry->token == token) {
      return index;
    }
  }
  return -1;
}

int CSymbolTable::clear(int /*currentIndex*/) { return -1; }

int CSymbolTable::getTableSize() { return static_cast<int>(m_used - m_holes); }

std::string CSymbolTable::describe(std::size_t index) const {
  const Entry& entry = m_entries[index];
  std::string line = std::to_string(index) + ' ' + std::to_string(entry.token) + ' ';
  if (entry.kind == Kind::kString) {
    line.append(1, '"').append(textAt(static_cast<int>(index))).append(1, '"');
  } else {
    line += std::string("'") + entry.character + "'";
  }
  if (entry.isKeyword) {
    line += " keyword";
  }
  return line;
}

void CSymbolTable::tableDump(std::string fileName) {
  std::ofstream out;
  if (libschema::openDiagnosticFile(fileName, &out)) {
    dump(0, out);
  }
}

void CSymbolTable::dump(int indent, std::ofstream& out) {
  const std::string margin(indent > 0 ? static_cast<std::size_t>(indent) : 0, '\t');
  out << margin << "CSymbolTable, " << getTableSize() << " entries\n";
  for (std::size_t i = 0; i < m_used; ++i) {
    if (m_entries[i].kind != Kind::kNone) {
      out << margin << describe(i) << '\n';
    }
  }
}
