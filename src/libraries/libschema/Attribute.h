// An attribute type: one definition that starts with "attributetypes=( ". Created empty, filled
// once by parse(), then owned by the schema manager's table.

#ifndef LIBSCHEMA_ATTRIBUTE_H
#define LIBSCHEMA_ATTRIBUTE_H

#include <fstream>
#include <string>
#include <vector>

#include "ORVSchema.h"
#include "SchemaLexan.h"

class Attribute : public ORVSchema {
 public:
  Attribute();
  ~Attribute() override;
  Attribute(const Attribute&) = default;
  Attribute& operator=(const Attribute&) = default;

  // Reads one definition. The current token of `lexer` is the one before "(": the "=" or "{" after
  // the keyword or, inside a block, the token on which the previous definition stopped. Returns 1,
  // the lexer standing on the token after ")" or on "}"; returns 0 at the end of input or at the
  // keyword of another definition, and the members keep what was read so far. A definition with
  // COLLECTIVE, or with a NAME clause that no clause keyword ends, never completes.
  int parse(SchemaLexan* lexer);

  void dump() override;
  void dump(std::ofstream& out) override;

  // Returns 1 when both define the same, else 0: names and superiors in any order and letter case,
  // everything else exactly. Each name and superior of this definition must be among those of
  // `other`, with equal counts; the test is not made from the other side.
  int attrsEqual(const Attribute& other);

  // The same, with the same trace records, of a definition that is constant.
  bool isEqualTo(const Attribute& other) const;

  std::string getOid() override;
  std::string getDescription() override;
  std::vector<std::string> getSuperior() override;
  std::string getFirstName() override;
  std::vector<std::string> getNames() override;
  std::string getFirstNameLower() override;

  // Returns `s` with every character passed through tolower.
  std::string convert(std::string s);

  // Returns the entry of a collision report: "OID --> …\nName --> …\n\n", the names joined by ", ".
  std::string getOidAndName();

  // The matching rules, by name or OID as read; empty without the clause. Valid as long as the
  // definition is there and unchanged, like every text returned by reference here.
  const std::string& getEquality() const { return equality; }
  const std::string& getOrdering() const { return ordering; }
  const std::string& getSubstr() const { return substr; }

  // SYNTAX as read, with its length; then the part before "{", and the number in braces as text,
  // empty without one.
  const std::string& getSyntax() const { return syntax; }
  std::string getSyntaxOid() const;
  std::string getSyntaxLength() const;

  // USAGE as read; "userApplications" without the clause.
  const std::string& getUsage() const { return usage; }

  // The flags. An attribute type is modifiable by users unless NO-USER-MODIFICATION says otherwise.
  bool getObsolete() const { return isObsolete; }
  bool getSingleValue() const;
  bool getCollective() const { return isCollective; }
  bool getUserModification() const { return isUserModifiable; }

  // Appends the line that dump(std::ofstream&) writes, with that operation's trace records. For a
  // caller that writes many definitions through a buffer of its own.
  void appendLine(std::string* text) const;

 protected:
  bool isObsolete = false;
  std::string equality;  // a matching rule, by name or OID, like ordering and substr
  std::string usage;
  std::string syntax;  // with its length suffix
  std::string ordering;
  std::string substr;
  int singleValue = kMultiValued;
  bool isCollective = false;
  bool isUserModifiable = true;

 private:
  static constexpr int kMultiValued = 1;  // singleValue is this or the token code KEY_SINGLE_VALUE

  int parseClause(SchemaLexan* lexer, int token);
  void composeLine(std::string* text) const;
};

#endif  // LIBSCHEMA_ATTRIBUTE_H
