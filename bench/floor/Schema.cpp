#include "Schema.h"

#include <fcntl.h>
#include <unistd.h>

#include <cctype>
#include <utility>

#include "Cursor.h"
#include "LineBuffer.h"
#include "Tokenizer.h"
#include "timestamp.h"

namespace minimal {

namespace {

constexpr int kUnknown = -1;
constexpr int kConfiguration = 7;  // a file without a set

template <typename D>
void deleteAll(const std::map<std::string, D*>& table) {
  for (const auto& entry : table) {
    delete entry.second;
  }
}

// Calls `use` with every word of the file; a word with "#" begins a comment.
template <typename Use>
bool forEachWord(const std::string& path, Use use) {
  FileText file;
  if (!file.read(path)) {
    return false;
  }
  std::string_view rest(file.bytes.get(), file.size);
  while (!rest.empty()) {
    if (std::isspace(static_cast<unsigned char>(rest.front())) != 0) {
      rest.remove_prefix(1);
      continue;
    }
    const std::string_view word = rest.substr(0, rest.find_first_of(" \t\n\v\f\r"));
    if (word.find('#') != std::string_view::npos) {
      rest.remove_prefix(std::min(rest.size(), rest.find('\n')));
      continue;
    }
    rest.remove_prefix(word.size());
    if (!rest.empty()) {
      use(std::string(word));
    }
  }
  return true;
}

}  // namespace

Schema::Schema(std::string directory) : m_directory(std::move(directory)) {}

Schema::~Schema() {
  deleteAll(m_types);
  deleteAll(m_classes);
  deleteAll(m_extensions);
}

int Schema::fileNumber(const std::string& fileName) {
  static const char* const kNames[] = {"V3.user.oc",       "V3.user.at",   "V3.orv.oc",
                                       "V3.orv.at",        "V3.system.oc", "V3.system.at",
                                       "V3.modifiedschema"};
  for (int i = 0; i < static_cast<int>(kSets); ++i) {
    if (fileName == kNames[i]) {
      return i;
    }
  }
  return fileName == "V3.config.at" || fileName == "V3.config.oc" ? kConfiguration : kUnknown;
}

// ---- Reading ----

namespace {

// Every table keeps what it has under a key.
template <typename D>
void enter(std::unique_ptr<D> definition, std::map<std::string, D*>* byName,
           std::map<std::string, D*>* byOid) {
  D* const entered = definition.get();
  const bool isOwned = byName->try_emplace(entered->key(), entered).second;
  if (byOid->try_emplace(entered->oid, entered).second || isOwned) {
    static_cast<void>(definition.release());
  }
}

void enter(std::unique_ptr<Extension> definition, std::map<std::string, Extension*>* byOid,
           std::nullptr_t) {
  Extension* const entered = definition.get();
  if (byOid->try_emplace(entered->oid, entered).second) {
    static_cast<void>(definition.release());
  }
}

// Reads what follows the keyword of a kind: "=" and a definition, or "{" and a block of them.
template <typename D, typename ByOid>
bool readDefinitions(Tokenizer* input, std::set<std::string>* oids,
                     std::map<std::string, D*>* table, ByOid byOid) {
  const Token opening = input->next();
  if (opening != kEquals && opening != kOpenBrace) {
    return false;
  }
  do {
    auto definition = std::make_unique<D>();
    if (!definition->parse(input)) {
      return false;
    }
    if (opening == kEquals || !definition->oid.empty()) {
      if (oids != nullptr) {
        oids->insert(definition->oid);
      }
      enter(std::move(definition), table, byOid);
    }
  } while (opening == kOpenBrace && input->current() != kCloseBrace);
  return true;
}

}  // namespace

int Schema::readFile(const std::string& fileName) {
  const int number = fileNumber(fileName);
  if (number == kUnknown) {
    return 89;
  }
  FileText file;
  if (!file.read(m_directory + "/" + fileName)) {
    return 1;
  }
  Oids* const oids = number == kConfiguration ? nullptr : &m_sets[static_cast<std::size_t>(number)];
  Tokenizer input(file);
  input.next();
  bool isRead = true;
  while (isRead && input.current() != kEnd) {
    switch (input.current()) {
      case kAttributeTypes:
        isRead = readDefinitions(&input, oids, &m_types, &m_typesByOid);
        break;
      case kObjectClasses:
        isRead = readDefinitions(&input, oids, &m_classes, &m_classesByOid);
        break;
      case kExtensions:
        isRead = readDefinitions(&input, oids, &m_extensions, nullptr);
        break;
      default:
        input.next();
    }
  }
  return isRead ? 0 : 1;
}

std::size_t Schema::countTokens(const std::string& directory, const std::string& fileName) {
  FileText file;
  std::size_t count = 0;
  if (file.read(directory + "/" + fileName)) {
    Tokenizer input(file);
    while (input.next() != kEnd) {
      ++count;
    }
  }
  return count;
}

int Schema::readExcludedOids(const std::string& path) {
  return forEachWord(path, [&](std::string oid) { m_excluded.insert(std::move(oid)); }) ? 0 : 1;
}

int Schema::modifySchema(const std::string& path) {
  Oids withdrawn;
  if (!forEachWord(path, [&](std::string oid) { withdrawn.insert(std::move(oid)); })) {
    return 1;
  }
  for (const std::string& oid : withdrawn) {
    const auto objectClass = m_classesByOid.find(oid);
    const auto type = m_typesByOid.find(oid);
    if (objectClass != m_classesByOid.end()) {
      m_classes.erase(objectClass->second->key());
    } else if (type != m_typesByOid.end()) {
      m_types.erase(type->second->key());
    } else if (m_extensions.erase(oid) == 0) {
      continue;
    }
    m_sets.back().erase(oid);
  }
  return 0;
}

// ---- Writing ----

int Schema::writeFile(const std::string& directory, const std::string& fileName) const {
  const int number = fileNumber(fileName);
  if (number == kUnknown || number == kConfiguration) {
    return 89;
  }
  const std::string path = directory + "/" + fileName;
  const int descriptor = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
  if (descriptor < 0) {
    return 1;
  }
  LineBuffer text;
  const Oids& oids = m_sets[static_cast<std::size_t>(number)];
  if (!oids.empty()) {
    const std::string header = "# File generated by 6.1 migration " + getCurrentTimeStamp(1) + "\n";
    text.reserve(header.size() + oids.size() * 200);
    text.add(header);
  }
  Cursor classes(m_classesByOid);
  Cursor types(m_typesByOid);
  Cursor extensions(m_extensions);
  for (const std::string& oid : oids) {
    if (const auto* objectClass = classes.find(oid)) {
      (*objectClass)->write(&text);
    } else if (const auto* type = types.find(oid)) {
      (*type)->write(&text);
      if (const auto* extension = extensions.find(oid)) {
        (*extension)->write(&text);
      }
    }
  }
  const bool isWritten =
      ::write(descriptor, text.data(), text.size()) == static_cast<ssize_t>(text.size());
  ::close(descriptor);
  return isWritten ? 0 : 1;
}

// ---- Reports ----

namespace {

template <typename D>
std::string report(const char* none, const char* heading, const std::map<std::string, D*>& table) {
  if (table.empty()) {
    return none;
  }
  std::string text = heading;
  for (const auto& entry : table) {
    text.append("OID --> ").append(entry.second->oid).append("\nName --> ");
    bool isFirst = true;
    for (const std::string& name : entry.second->reportNames()) {
      text.append(isFirst ? "" : ", ").append(name);
      isFirst = false;
    }
    text.append("\n\n");
  }
  return text;
}

}  // namespace

std::string Schema::getOcTable() const {
  return report("No objectClasses definition collisions found.\n",
                "The following objectClasses definition collisions found:\n", m_classes);
}

std::string Schema::getAttrTable() const {
  return report("No attributeTypes definition collisions found.\n",
                "The following attributeTypes collisions found:\n", m_types);
}

std::string Schema::getORVAttrTable() const {
  return report("No ORVAttributeTypes definition collisions found.\n",
                "The following ORVAttributeTypes definition collisions found:\n", m_extensions);
}

}  // namespace minimal
