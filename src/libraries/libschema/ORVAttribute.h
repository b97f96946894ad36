// The vendor extension of an attribute type that is defined elsewhere under the same OID: one entry
// that starts with "ORVAttributetypes=( ". Of the inherited members only the OID is used. Created
// empty, filled once by parse(), then owned by the schema manager's table.

#ifndef LIBSCHEMA_ORV_ATTRIBUTE_H
#define LIBSCHEMA_ORV_ATTRIBUTE_H

#include <fstream>
#include <string>
#include <vector>

#include "Attribute.h"

class ORVAttribute : public Attribute {
 public:
  ORVAttribute();
  ~ORVAttribute() override;
  ORVAttribute(const ORVAttribute&) = default;
  ORVAttribute& operator=(const ORVAttribute&) = default;

  // Reads one entry. The current token of `lexer` is the one before "(": the "=" or "{" after the
  // keyword or, inside a block, the token on which the previous entry stopped. Returns true, the
  // lexer standing on the token after ")", on "}", or on a "(" that begins a line right after the
  // DBNAME list; returns false at the end of input and at the keyword "attributetypes", and the
  // members keep what was read so far. A DBNAME list that nothing ends never completes.
  bool parse(SchemaLexan* lexer);

  void dump() override;
  void dump(std::ofstream& out) override;

  // Returns true when both entries are the same: database names in any order and letter case,
  // everything else exactly. The database names of this entry must be among those of `other`, with
  // equal counts; the test is not made from the other side.
  bool orvAttrsEqual(const ORVAttribute& other);

  // The same, with the same trace records, of a definition that is constant.
  bool isEqualTo(const ORVAttribute& other) const;

  // Returns `s` with every character passed through tolower.
  std::string convert(std::string s);

  // Returns the entry of a collision report: "OID --> …\nName --> …\n\n". The second line lists the
  // database names, joined by ", ", since an entry has no names.
  std::string getOidAndName();

  // DBNAME in file order, duplicates kept; ACCESS-CLASS, "normal" without the clause; LENGTH as
  // text, "0" without the clause. Valid as long as the entry is there and unchanged.
  const std::vector<std::string>& getDbNames() const { return dbNames; }
  const std::string& getAccessClass() const { return access; }
  const std::string& getLength() const { return length; }

  // Whether the keyword of the same name was there. An entry's getEquality(), getOrdering() and
  // getSubstr() are those of an attribute type, and empty.
  bool hasEquality() const { return equality; }
  bool hasOrdering() const { return ordering; }
  bool hasSubstr() const { return substr; }
  bool hasApprox() const { return approx; }
  bool hasReverse() const { return reverse; }

  // Appends the line that dump(std::ofstream&) writes, with that operation's trace records. For a
  // caller that writes many definitions through a buffer of its own.
  void appendLine(std::string* text) const;

 private:
  int parseClause(SchemaLexan* lexer, int token);
  int parseDatabaseNames(SchemaLexan* lexer, bool* isComplete);
  void composeLine(std::string* text) const;

  std::vector<std::string> dbNames;  // in file order, duplicates kept
  std::string access;
  std::string length;  // as text; "0" is no length
  // Flags, hiding the matching rules of an attribute type that have the same names.
  bool equality = false;
  bool ordering = false;
  bool substr = false;
  bool approx = false;
  bool reverse = false;
};

#endif  // LIBSCHEMA_ORV_ATTRIBUTE_H
