// Where a page has the definition that a name or an OID stands for, and texts with links to them.

#ifndef SCHEMA_MIGRATE_HTML_NAMES_H
#define SCHEMA_MIGRATE_HTML_NAMES_H

#include <cstddef>
#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "HtmlPage.h"

namespace html {

// Clauses with several members, and the members of the value of one.
bool isList(std::string_view clause);
std::vector<std::string> membersOf(std::string_view clause, const std::string& value);

class Names {
 public:
  static constexpr std::size_t kNowhere = static_cast<std::size_t>(-1);

  // The definitions of a document; one is called by its place among them.
  explicit Names(const Json& definitions);

  // By name in any letter case or by OID, as any of base, old, new and result has it.
  std::size_t find(std::string_view kind, std::string_view nameOrOid) const;
  // By an OID alone, of an attribute type or an object class.
  std::size_t findOid(std::string_view oid) const;

  // How a member of a list differs: '+' where it is new, '-' where it goes, else ' '; and kNoLink
  // for one that leads to its definition in another cell.
  using Mark = std::function<char(const std::string& member)>;
  static constexpr char kNoLink = '.';

  // Adds a section PART for each part of a value of a clause; names of definitions are links.
  void addValue(std::string_view kind, std::string_view clause, const std::string& value,
                const Mark& mark, Dictionary* dictionary) const;

  // Adds a section for each part of a sentence; where it says "cn (2.5.4.3)" the OID is a link,
  // unless it is the definition `itself`.
  void addSentence(const char* section, const std::string& text, std::size_t itself,
                   Dictionary* dictionary) const;

 private:
  using Table = std::unordered_map<std::string, std::size_t>;

  void enterClause(const std::string& kind, const std::string& clause, const Json& value,
                   std::size_t at);

  std::map<std::string, Table, std::less<>> m_tables;  // by kind
};

// Lets a section of the template be a link to a definition; none to kNowhere.
void linkTo(std::size_t definition, Dictionary* section);

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_NAMES_H
