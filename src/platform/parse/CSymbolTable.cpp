#include "CSymbolTable.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <ext/stdio_filebuf.h>

#include <utility>

inline namespace libschema_platform {

namespace {

std::size_t hashOf(const std::string& text) {
  return text.empty()
             ? 0
             : text.size() * 7 + static_cast<unsigned char>(text.front()) * std::size_t{3} +
                   static_cast<unsigned char>(text.back());
}

// Opens `path` for writing, emptied; true when it is a regular file with a single name. The folder
// may be one that anyone can write to: no symbolic link is followed, and neither a FIFO nor a
// device blocks or is touched.
bool openRegularFile(const std::string& path, std::ofstream* out) {
  constexpr int kFlags = O_WRONLY | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;
  const int descriptor = ::open(path.c_str(), kFlags, 0666);
  if (descriptor < 0) {
    return false;
  }
  struct stat status {};
  if (::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode) || status.st_nlink != 1 ||
      ::ftruncate(descriptor, 0) != 0) {
    ::close(descriptor);
    return false;
  }
  // The stream takes over the descriptor and closes it.
  __gnu_cxx::stdio_filebuf<char> buffer(descriptor, std::ios_base::out);
  *out->rdbuf() = std::move(buffer);
  return out->is_open();
}

}  // namespace

CSymbolTable::CSymbolTable() {
  constexpr std::size_t kUsualEntries = 32;
  m_entries.reserve(kUsualEntries);
  m_buckets.fill(-1);
}

CSymbolTable::~CSymbolTable() = default;

const CSymbolTable::Entry* CSymbolTable::entryAt(int index) const {
  if (index < 0 || static_cast<std::size_t>(index) >= m_entries.size()) {
    return nullptr;
  }
  const Entry& entry = m_entries[static_cast<std::size_t>(index)];
  return entry.kind == Kind::kNone ? nullptr : &entry;
}

int CSymbolTable::append(Entry entry) {
  m_entries.push_back(std::move(entry));
  return static_cast<int>(m_entries.size()) - 1;
}

// Where the index of a string entry stands, or is to stand, in its bucket: behind every lower one.
int* CSymbolTable::placeInBucket(int index) {
  const std::size_t hash = hashOf(m_entries[static_cast<std::size_t>(index)].text);
  int* place = &m_buckets[hash % m_buckets.size()];
  while (*place >= 0 && *place < index) {
    place = &m_entries[static_cast<std::size_t>(*place)].next;
  }
  return place;
}

int CSymbolTable::insertValue(std::string value, int token, bool isKeyword) {
  const int index = append({Kind::kString, isKeyword, '\0', token, -1, std::move(value)});
  *placeInBucket(index) = index;
  return index;
}

int CSymbolTable::insertValue(char value, int token, bool isKeyword) {
  return append({Kind::kCharacter, isKeyword, value, token, -1, std::string()});
}

int CSymbolTable::lookUpValue(std::string value) {
  int index = m_buckets[hashOf(value) % m_buckets.size()];
  while (index >= 0 && m_entries[static_cast<std::size_t>(index)].text != value) {
    index = m_entries[static_cast<std::size_t>(index)].next;
  }
  return index;
}

int CSymbolTable::getTokenValue(int index) {
  const Entry* const entry = entryAt(index);
  return entry == nullptr ? -1 : entry->token;
}

bool CSymbolTable::getValue(int index, std::string& out) {
  if (!isString(index)) {
    return false;
  }
  out = entryAt(index)->text;
  return true;
}

bool CSymbolTable::getValue(int index, char& out) {
  if (!isCharacter(index)) {
    return false;
  }
  out = entryAt(index)->character;
  return true;
}

bool CSymbolTable::isString(int index) {
  const Entry* const entry = entryAt(index);
  return entry != nullptr && entry->kind == Kind::kString;
}

bool CSymbolTable::isCharacter(int index) {
  const Entry* const entry = entryAt(index);
  return entry != nullptr && entry->kind == Kind::kCharacter;
}

void CSymbolTable::removeValue(int index) {
  if (entryAt(index) == nullptr) {
    return;
  }
  Entry& entry = m_entries[static_cast<std::size_t>(index)];
  if (entry.kind == Kind::kString) {
    *placeInBucket(index) = entry.next;
  }
  entry.kind = Kind::kNone;
  ++m_removed;
  while (!m_entries.empty() && m_entries.back().kind == Kind::kNone) {
    m_entries.pop_back();
    --m_removed;
  }
}

int CSymbolTable::lookUp(int token, int firstIndex) {
  for (int index = firstIndex < 0 ? 0 : firstIndex;
       static_cast<std::size_t>(index) < m_entries.size(); ++index) {
    const Entry* const entry = entryAt(index);
    if (entry != nullptr && entry->token == token) {
      return index;
    }
  }
  return -1;
}

int CSymbolTable::clear(int /*currentIndex*/) { return -1; }

int CSymbolTable::getTableSize() { return static_cast<int>(m_entries.size() - m_removed); }

std::string CSymbolTable::describe(std::size_t index) const {
  const Entry& entry = m_entries[index];
  const std::string value = entry.kind == Kind::kString ? '"' + entry.text + '"'
                                                        : std::string("'") + entry.character + "'";
  return std::to_string(index) + ' ' + std::to_string(entry.token) + ' ' + value +
         (entry.isKeyword ? " keyword" : "");
}

void CSymbolTable::tableDump(std::string fileName) {
  std::ofstream out;
  if (openRegularFile(fileName, &out)) {
    dump(0, out);
  }
}

void CSymbolTable::dump(int indent, std::ofstream& out) {
  const std::string margin(indent > 0 ? static_cast<std::size_t>(indent) : 0, '\t');
  out << margin << "CSymbolTable, " << getTableSize() << " entries\n";
  for (std::size_t i = 0; i < m_entries.size(); ++i) {
    if (m_entries[i].kind != Kind::kNone) {
      out << margin << describe(i) << '\n';
    }
  }
}

}  // namespace libschema_platform
