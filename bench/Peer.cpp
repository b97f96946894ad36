#include "Peer.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstring>
#include <utility>
#include <vector>

namespace bench {

namespace {

// The text of the file last read, in memory that the next one uses again; its last line ends as the
// others do.
std::vector<char>* readText(const std::string& path) {
  static std::vector<char> text;
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  struct stat status {};
  if (descriptor < 0 || ::fstat(descriptor, &status) != 0) {
    return nullptr;
  }
  text.resize(static_cast<std::size_t>(status.st_size) + 1);
  const ssize_t count = ::read(descriptor, text.data(), text.size());
  ::close(descriptor);
  text.back() = '\n';
  return count == status.st_size ? &text : nullptr;
}

char* find(char* begin, char* end, char c) {
  return static_cast<char*>(std::memchr(begin, c, static_cast<std::size_t>(end - begin)));
}

bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

// What the maps of earlier peers lay in.
std::vector<std::vector<std::byte>>& usedMemory() {
  static std::vector<std::vector<std::byte>> used;
  return used;
}

std::vector<std::byte> takeMemory() {
  std::vector<std::byte> memory;
  if (!usedMemory().empty()) {
    memory = std::move(usedMemory().back());
    usedMemory().pop_back();
  }
  return memory;
}

}  // namespace

Peer::Peer()
    : m_memory(takeMemory()),
      m_nodes(m_memory.data(), m_memory.size()),
      m_types(&m_nodes),
      m_classes(&m_nodes) {}

// As much memory as was wanted here is there for the next peer.
Peer::~Peer() {
  constexpr std::size_t kNodes = 160;  // at most, for a definition in two maps
  for (auto type = m_types.read.rbegin(); type != m_types.read.rend(); ++type) {
    ldap_attributetype_free(*type);
  }
  for (auto type = m_classes.read.rbegin(); type != m_classes.read.rend(); ++type) {
    ldap_objectclass_free(*type);
  }
  m_types.byName.clear();
  m_types.byOid.clear();
  m_classes.byName.clear();
  m_classes.byOid.clear();
  if (m_memory.size() < definitions() * kNodes) {
    m_memory.assign(definitions() * kNodes, std::byte());
  }
  usedMemory().push_back(std::move(m_memory));
}

template <typename Parsed>
void Peer::enter(Parsed* parsed, char** names, const char* oid, Tables<Parsed>* tables) {
  tables->read.push_back(parsed);
  const char* const name = names != nullptr && names[0] != nullptr ? names[0] : "";
  tables->byName.try_emplace(name, parsed);
  tables->byOid.try_emplace(oid == nullptr ? "" : oid, parsed);
}

bool Peer::readType(const char* text) {
  int code = 0;
  const char* error = nullptr;
  LDAPAttributeType* const type =
      ldap_str2attributetype(text, &code, &error, LDAP_SCHEMA_ALLOW_ALL);
  if (type != nullptr) {
    enter(type, type->at_names, type->at_oid, &m_types);
  }
  return type != nullptr;
}

bool Peer::readClass(const char* text) {
  int code = 0;
  const char* error = nullptr;
  LDAPObjectClass* const objectClass =
      ldap_str2objectclass(text, &code, &error, LDAP_SCHEMA_ALLOW_ALL);
  if (objectClass != nullptr) {
    enter(objectClass, objectClass->oc_names, objectClass->oc_oid, &m_classes);
  }
  return objectClass != nullptr;
}

// Reads the definition that begins at `text`, which is ended in place by a zero byte, and returns
// the end of its last line. Most stand on one line; what libldap does not find whole there goes on
// in the next one.
char* Peer::readDefinition(char* text, char* lineEnd, char* end, bool isType) {
  while (lineEnd != nullptr) {
    *lineEnd = '\0';
    if (isType ? readType(text) : readClass(text)) {
      return lineEnd;
    }
    *lineEnd = '\n';
    lineEnd = find(lineEnd + 1, end, '\n');
  }
  ++m_refused;
  return end;
}

// A line that begins with a letter begins with the keyword of what follows.
bool Peer::readFile(const std::string& path) {
  std::vector<char>* const text = readText(path);
  if (text == nullptr) {
    return false;
  }
  char* const end = text->data() + text->size();
  bool isType = true;
  for (char* line = text->data(); line < end;) {
    char* lineEnd = find(line, end, '\n');
    line += std::strspn(line, " \t");
    if (isLetter(*line)) {
      isType = *line == 'a';
    }
    char* const opening = *line == '#' ? nullptr : find(line, lineEnd, '(');
    if (opening != nullptr) {
      lineEnd = readDefinition(opening, lineEnd, end, isType);
    }
    line = lineEnd + 1;
  }
  return true;
}

}  // namespace bench
