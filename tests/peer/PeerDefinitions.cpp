#include "PeerDefinitions.h"

#include <gtest/gtest.h>
#include <ldap.h>
#include <ldap_schema.h>

#include <algorithm>
#include <filesystem>

#include "Files.h"

namespace peer {

namespace {

// Splits the text of a schema file, by rules of its own and not the library's: comments, words and
// definitions in parentheses, with quoted strings that may hold any of these.
class Splitter {
 public:
  explicit Splitter(const std::string& text) : m_text(text) {}

  // Calls use(keyword, "( ... )") for each definition, the keyword in lower case.
  template <typename Use>
  void each(Use use) {
    std::string keyword;
    while (m_place < m_text.size()) {
      const char c = m_text[m_place];
      if (c == '#') {
        m_place = std::min(m_text.find('\n', m_place), m_text.size());
      } else if (c == '(') {
        use(keyword, definition());
      } else if (std::isalpha(static_cast<unsigned char>(c)) != 0) {
        keyword = word();
      } else {
        ++m_place;
      }
    }
  }

 private:
  std::string word() {
    std::string text;
    while (m_place < m_text.size() &&
           std::isalpha(static_cast<unsigned char>(m_text[m_place])) != 0) {
      text += static_cast<char>(std::tolower(static_cast<unsigned char>(m_text[m_place++])));
    }
    return text;
  }

  // From "(" to its ")", without comments.
  std::string definition() {
    std::string text;
    int depth = 0;
    bool isQuoted = false;
    for (; m_place < m_text.size(); ++m_place) {
      const char c = m_text[m_place];
      isQuoted = isQuoted != (c == '\'');
      if (!isQuoted && c == '#') {
        m_place = std::min(m_text.find('\n', m_place), m_text.size() - 1);
      }
      text += m_text[m_place];
      depth += isQuoted ? 0 : (c == '(') - (c == ')');
      if (depth == 0) {
        ++m_place;
        break;
      }
    }
    return text;
  }

  const std::string& m_text;
  std::size_t m_place = 0;
};

std::string fieldOf(const char* label, const char* value) {
  return value == nullptr || *value == '\0' ? std::string()
                                            : std::string(" ") + label + "=" + value;
}

std::string flag(const char* label, int value) {
  return value == 0 ? std::string() : std::string(" ") + label + "=" + std::to_string(value);
}

// Two names are at the same time spellings of a keyword: the library keeps the keyword's spelling.
std::string asKept(const std::string& name) {
  if (name == "objectClasses") {
    return "objectclasses";
  }
  return name == "attributeTypes" ? "attributetypes" : name;
}

std::string list(const char* label, char** values) {
  std::string text;
  for (; values != nullptr && *values != nullptr; ++values) {
    text += std::string(text.empty() ? "" : ",") + asKept(*values);
  }
  return fieldOf(label, text.c_str());
}

std::string describe(const LDAPAttributeType& at) {
  return list("NAME", at.at_names) + fieldOf("DESC", at.at_desc) +
         flag("OBSOLETE", at.at_obsolete) + fieldOf("SUP", at.at_sup_oid) +
         fieldOf("EQUALITY", at.at_equality_oid) + fieldOf("ORDERING", at.at_ordering_oid) +
         fieldOf("SUBSTR", at.at_substr_oid) + fieldOf("SYNTAX", at.at_syntax_oid) +
         flag("LENGTH", at.at_syntax_len) + flag("SINGLE-VALUE", at.at_single_value) +
         flag("COLLECTIVE", at.at_collective) + flag("NO-USER-MODIFICATION", at.at_no_user_mod) +
         flag("USAGE", at.at_usage);
}

std::string describe(const LDAPObjectClass& oc) {
  return list("NAME", oc.oc_names) + fieldOf("DESC", oc.oc_desc) +
         flag("OBSOLETE", oc.oc_obsolete) + list("SUP", oc.oc_sup_oids) +
         " KIND=" + std::to_string(oc.oc_kind) + list("MUST", oc.oc_at_oids_must) +
         list("MAY", oc.oc_at_oids_may);
}

void add(const std::string& key, const std::string& text, Definitions* definitions) {
  std::vector<std::string>& texts = (*definitions)[key];
  if (std::find(texts.begin(), texts.end(), text) == texts.end()) {
    texts.push_back(text);
  }
}

void addParsed(const std::string& keyword, const std::string& text, Definitions* definitions) {
  int code = 0;
  const char* place = nullptr;
  if (keyword == "attributetypes") {
    LDAPAttributeType* const at =
        ldap_str2attributetype(text.c_str(), &code, &place, LDAP_SCHEMA_ALLOW_ALL);
    ASSERT_NE(nullptr, at) << text << "\n" << ldap_scherr2str(code) << " at " << place;
    add(std::string("at ") + at->at_oid, describe(*at), definitions);
    ldap_attributetype_free(at);
  } else if (keyword == "objectclasses") {
    LDAPObjectClass* const oc =
        ldap_str2objectclass(text.c_str(), &code, &place, LDAP_SCHEMA_ALLOW_ALL);
    ASSERT_NE(nullptr, oc) << text << "\n" << ldap_scherr2str(code) << " at " << place;
    add(std::string("oc ") + oc->oc_oid, describe(*oc), definitions);
    ldap_objectclass_free(oc);
  } else {
    ASSERT_EQ("orvattributetypes", keyword) << text;
  }
}

}  // namespace

Definitions readInstallation(const std::string& directory) {
  Definitions definitions;
  for (const auto& file : std::filesystem::directory_iterator(directory)) {
    if (file.path().filename().string().rfind("V3.", 0) == 0) {
      const std::string text = support::readWholeFile(file.path().string());
      Splitter(text).each([&](const std::string& keyword, const std::string& definition) {
        addParsed(keyword, definition, &definitions);
      });
    }
  }
  return definitions;
}

}  // namespace peer
