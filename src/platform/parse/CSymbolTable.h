// A table of symbols: each entry holds a string or one character, a token code and a keyword flag,
// and is reached by the index that its insertion returned. The index -1 stands for no entry. An
// index stays valid until its own entry is removed.

#ifndef LIBSCHEMA_CSYMBOLTABLE_H
#define LIBSCHEMA_CSYMBOLTABLE_H

#include <array>
#include <cstddef>
#include <fstream>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

class CSymbolTable {
 public:
  CSymbolTable();
  virtual ~CSymbolTable();
  CSymbolTable(const CSymbolTable&) = delete;
  CSymbolTable& operator=(const CSymbolTable&) = delete;

  // Adds an entry behind the last one and returns its index. Equal values may stand more than once.
  int insertValue(std::string value, int token, bool isKeyword);
  int insertValue(char value, int token, bool isKeyword);

  // Returns the lowest index of a string entry with exactly this text, or -1.
  int lookUpValue(std::string value);

  // Returns the token code of the entry, or -1 when there is none under `index`.
  int getTokenValue(int index);

  // Copies the value of a string (a character) entry to `out` and returns true. Returns false, and
  // leaves `out` alone, when there is no entry under `index` or it is of the other kind.
  bool getValue(int index, std::string& out);
  bool getValue(int index, char& out);
  bool isString(int index);
  bool isCharacter(int index);

  // Drops one entry. The other indexes keep their entries; an index without an entry is ignored.
  void removeValue(int index);

  // Returns the lowest index, from `firstIndex` on, of an entry with this token code, or -1.
  int lookUp(int token, int firstIndex);

  // Forgets the current token, given by its index: every entry stays, and the result is -1, the
  // index of no entry.
  int clear(int currentIndex);

  // Returns the number of entries.
  int getTableSize();

  // Writes every entry to the file `fileName`, one line each, below a heading. The file is opened
  // without following a symbolic link, and only when it is, or becomes, a regular file; when it
  // cannot be opened nothing is written.
  void tableDump(std::string fileName);

  // Writes the table to `out`, each line indented by `indent` TABs.
  void dump(int indent, std::ofstream& out);

  // The same as lookUpValue and insertValue, for a caller whose text lies in a buffer of its own.
  int findText(std::string_view text) const;
  int insertText(std::string_view text, int token, bool isKeyword);

  // Removes the entry `index` and adds a string entry, not as a keyword; returns the new index. A
  // borrowed text is not copied: it must stay where it is until the entry goes or keepBorrowed()
  // has copied it. One text at a time is borrowed.
  int replaceText(int index, std::string_view text, int token);
  int replaceBorrowed(int index, std::string_view text, int token);
  void keepBorrowed();

  // Room of kInputRoom bytes for a reader's input, from which texts may be borrowed; it goes with
  // the table. Whether a place lies in it.
  static constexpr int kInputRoom = 1 << 15;
  char* inputRoom();
  bool hasInputRoomAt(const char* place) const;

 private:
  enum class Kind { kNone, kString, kCharacter };
  struct Entry {
    Kind kind = Kind::kNone;
    bool isKeyword = false;
    char character = '\0';
    int token = -1;
    int next = -1;  // the next string entry in the same bucket
    std::string text;
  };

  static constexpr std::size_t kBuckets = 128;

  const Entry* entryAt(int index) const;
  Entry* nextSlot();
  Entry* appendEntry(Kind kind, int token, bool isKeyword);
  std::string_view textAt(int index) const;
  void link(int index);
  void unlink(int index);
  int addBorrowed(int index, std::string_view text, int token);
  static std::size_t bucketOf(std::string_view text);
  std::string describe(std::size_t index) const;

  std::vector<Entry> m_entries;  // slots behind m_used keep their storage for the next insertion
  std::size_t m_used = 0;
  std::size_t m_holes = 0;
  // The entry whose text is borrowed, which is in no bucket, and that text.
  int m_borrower = -1;
  std::string_view m_borrowed;
  std::unique_ptr<char[]> m_inputRoom;
  std::array<int, kBuckets> m_buckets;
};

inline std::size_t CSymbolTable::bucketOf(std::string_view text) {
  if (text.empty()) {
    return 0;
  }
  const std::size_t first = static_cast<unsigned char>(text.front());
  const std::size_t last = static_cast<unsigned char>(text.back());
  return (text.size() * 7 + first * 3 + last) % kBuckets;
}

inline const CSymbolTable::Entry* CSymbolTable::entryAt(int index) const {
  if (index < 0 || static_cast<std::size_t>(index) >= m_used) {
    return nullptr;
  }
  const Entry& entry = m_entries[static_cast<std::size_t>(index)];
  return entry.kind == Kind::kNone ? nullptr : &entry;
}

inline int CSymbolTable::findText(std::string_view text) const {
  int index = m_buckets[bucketOf(text)];
  while (index >= 0) {
    const Entry& entry = m_entries[static_cast<std::size_t>(index)];
    if (entry.text == text) {
      break;
    }
    index = entry.next;
  }
  const bool canBeBorrower = m_borrower >= 0 && (index < 0 || m_borrower < index);
  return canBeBorrower && m_borrowed == text ? m_borrower : index;
}

inline bool CSymbolTable::hasInputRoomAt(const char* place) const {
  const std::less<const char*> isBefore;
  const char* const room = m_inputRoom.get();
  return room != nullptr && !isBefore(place, room) && isBefore(place, room + kInputRoom);
}

inline int CSymbolTable::getTokenValue(int index) {
  const Entry* entry = entryAt(index);
  return entry == nullptr ? -1 : entry->token;
}

inline bool CSymbolTable::getValue(int index, std::string& out) {
  const Entry* entry = entryAt(index);
  if (entry == nullptr || entry->kind != Kind::kString) {
    return false;
  }
  const std::string_view text = textAt(index);
  if (out.capacity() < text.size()) {
    out = std::string(text);
  } else {
    out.assign(text);
  }
  return true;
}

inline std::string_view CSymbolTable::textAt(int index) const {
  return index == m_borrower ? m_borrowed
                             : std::string_view(m_entries[static_cast<std::size_t>(index)].text);
}

inline int CSymbolTable::replaceBorrowed(int index, std::string_view text, int token) {
  if (index < 0 || index != m_borrower || index + 1 != static_cast<int>(m_used) || m_holes != 0) {
    return addBorrowed(index, text, token);
  }
  // The usual case: the last entry borrows one text after the other, and its slot is the one that
  // the removal would leave to the addition.
  m_borrowed = text;
  m_entries[static_cast<std::size_t>(index)].token = token;
  return index;
}

#endif  // LIBSCHEMA_CSYMBOLTABLE_H
