#include "Peer.h"

#include <cctype>
#include <cstring>
#include <set>
#include <string_view>

#include "floor/Tokenizer.h"

namespace bench {

namespace {

// The end of the text in parentheses that starts at `text`, behind its ")"; null without one.
char* closingEnd(char* text) {
  int depth = 0;
  for (char* c = text; *c != '\0'; ++c) {
    if (*c == '\'') {
      c = std::strchr(c + 1, '\'');
      if (c == nullptr) {
        return nullptr;
      }
    } else if (*c == '(') {
      ++depth;
    } else if (*c == ')' && --depth == 0) {
      return c + 1;
    }
  }
  return nullptr;
}

bool startsWord(std::string_view word) {
  return word == "attributetypes" || word == "attributeTypes";
}

}  // namespace

// A parsed definition stands in both tables, or in the one that took it.
Peer::~Peer() {
  std::set<LDAPAttributeType*> types;
  std::set<LDAPObjectClass*> classes;
  for (const auto* table : {&m_types.byName, &m_types.byOid}) {
    for (const auto& entry : *table) {
      types.insert(entry.second);
    }
  }
  for (const auto* table : {&m_classes.byName, &m_classes.byOid}) {
    for (const auto& entry : *table) {
      classes.insert(entry.second);
    }
  }
  for (LDAPAttributeType* const type : types) {
    ldap_attributetype_free(type);
  }
  for (LDAPObjectClass* const objectClass : classes) {
    ldap_objectclass_free(objectClass);
  }
}

template <typename Parsed>
void Peer::enter(Parsed* parsed, char** names, const char* oid, void (*release)(Parsed*),
                 Tables<Parsed>* tables) {
  ++m_definitions;
  if (parsed == nullptr) {
    ++m_refused;
    return;
  }
  const char* const name = names != nullptr && names[0] != nullptr ? names[0] : "";
  const bool isNamed = tables->byName.try_emplace(name, parsed).second;
  const bool isNumbered = tables->byOid.try_emplace(oid == nullptr ? "" : oid, parsed).second;
  if (!isNamed && !isNumbered) {
    release(parsed);
  }
}

void Peer::readType(const char* text) {
  int code = 0;
  const char* error = nullptr;
  LDAPAttributeType* const type =
      ldap_str2attributetype(text, &code, &error, LDAP_SCHEMA_ALLOW_ALL);
  enter(type, type == nullptr ? nullptr : type->at_names, type == nullptr ? nullptr : type->at_oid,
        ldap_attributetype_free, &m_types);
}

void Peer::readClass(const char* text) {
  int code = 0;
  const char* error = nullptr;
  LDAPObjectClass* const objectClass =
      ldap_str2objectclass(text, &code, &error, LDAP_SCHEMA_ALLOW_ALL);
  enter(objectClass, objectClass == nullptr ? nullptr : objectClass->oc_names,
        objectClass == nullptr ? nullptr : objectClass->oc_oid, ldap_objectclass_free, &m_classes);
}

// Keywords tell what the next texts in parentheses are; each is ended in place by a zero byte.
bool Peer::readFile(const std::string& path) {
  minimal::FileText file;
  if (!file.read(path)) {
    return false;
  }
  bool isType = true;
  for (char* c = file.bytes.get(); *c != '\0';) {
    if (*c == '#') {
      c += std::strcspn(c, "\n");
    } else if (*c == '(') {
      char* const end = closingEnd(c);
      if (end == nullptr) {
        return false;
      }
      const char after = *end;
      *end = '\0';
      isType ? readType(c) : readClass(c);
      *end = after;
      c = end;
    } else if (std::isalpha(static_cast<unsigned char>(*c)) != 0) {
      const std::size_t length = std::strcspn(c, " ={\t\n");
      isType = startsWord(std::string_view(c, length));
      c += length;
    } else {
      ++c;
    }
  }
  return true;
}

}  // namespace bench
