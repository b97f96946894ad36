// A table of symbols: each entry holds a string or one character, a token code and a keyword flag,
// and is reached by the index that its insertion returned. The index -1 stands for no entry. An
// index stays valid until its own entry is removed.
//
// The class is compiled into libschema and cannot be replaced when a program is linked. Its symbols
// carry the name of an inline namespace, so that a server can have a class CSymbolTable of its own
// beside it, in other sources than those that include this header. To build libschema over a
// server's own class, see LIBSCHEMA_PLATFORM in README.md.

#ifndef LIBSCHEMA_CSYMBOLTABLE_H
#define LIBSCHEMA_CSYMBOLTABLE_H

#include <array>
#include <cstddef>
#include <fstream>
#include <string>
#include <vector>

#pragma GCC visibility push(default)
inline namespace libschema_platform {

class CSymbolTable {
 public:
  CSymbolTable();
  virtual ~CSymbolTable();
  CSymbolTable(const CSymbolTable&) = delete;
  CSymbolTable& operator=(const CSymbolTable&) = delete;

  // Adds an entry behind the last one and returns its index. Equal values may stand more than once.
  // The index of a removed entry is given out again when no entry stands behind it.
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

 private:
  enum class Kind { kNone, kString, kCharacter };
  struct Entry {
    Kind kind;
    bool isKeyword;
    char character;
    int token;
    int next;  // the next string entry in the same bucket
    std::string text;
  };

  const Entry* entryAt(int index) const;
  int append(Entry entry);
  int* placeInBucket(int index);
  std::string describe(std::size_t index) const;

  std::vector<Entry> m_entries;  // the last one is none that was removed
  std::size_t m_removed = 0;     // how many of them were
  std::array<int, 64> m_buckets;
};

}  // namespace libschema_platform
#pragma GCC visibility pop

#endif  // LIBSCHEMA_CSYMBOLTABLE_H
