// An object class: one definition that starts with "objectclasses=( ". Created empty, filled once
// by parse(), then owned by the schema manager's table.

#ifndef LIBSCHEMA_OBJECT_CLASS_H
#define LIBSCHEMA_OBJECT_CLASS_H

#include <cstdint>
#include <fstream>
#include <string>
#include <vector>

#include "ORVSchema.h"
#include "SchemaLexan.h"

class ObjectClass : public ORVSchema {
 public:
  ObjectClass();
  ~ObjectClass() override;
  ObjectClass(const ObjectClass&) = default;
  ObjectClass& operator=(const ObjectClass&) = default;

  // Reads one definition. The current token of `lexer` is the one before "(": the "=" or "{" after
  // the keyword or, inside a block, the token on which the previous definition stopped. Returns
  // true, the lexer standing on the token after ")", or on a "}" or "(" met between clauses.
  // Returns false at the end of input, at the keyword of another object class, and at a number with
  // an incomplete length; the members keep what was read so far. A definition with a NAME clause
  // that none of DESC, STRUCTURAL, AUXILIARY, ABSTRACT, OBSOLETE, SUP, MUST and MAY ends never
  // completes.
  bool parse(SchemaLexan* lexer);

  void dump() override;
  void dump(std::ofstream& out) override;

  // Returns true when both define the same class: names, superiors, MUST and MAY lists in any order
  // and letter case, everything else exactly. The members of this definition's lists must be among
  // those of `other`, with equal counts; the test is not made from the other side.
  bool objsEqual(const ObjectClass& other);

  // The same, with the same trace records, of a definition that is constant.
  bool isEqualTo(const ObjectClass& other) const;

  std::string getOid() override;
  std::string getDescription() override;
  std::vector<std::string> getSuperior() override;
  std::string getFirstName() override;
  std::vector<std::string> getNames() override;
  std::string getFirstNameLower() override;

  // Copies of the MUST and of the MAY list.
  std::vector<std::string> getReqAttrs();
  std::vector<std::string> getOptAttrs();

  // Returns `s` with every character passed through tolower.
  std::string convert(std::string s);

  // Returns the entry of a collision report: "OID --> …\nName --> …\n\n", the names joined by ", ".
  std::string getOidAndName();

  // The lists in place: valid as long as the definition is there and unchanged.
  const std::vector<std::string>& reqAttrsInPlace() const { return reqAttrs; }
  const std::vector<std::string>& optAttrsInPlace() const { return optAttrs; }

  // The kind of class as the code of its keyword (KEY_STRUCTURAL, KEY_AUXILIARY or KEY_ABSTRACT),
  // and as that keyword.
  int getStructuralType() const { return structuralType; }
  const char* getStructuralTypeName() const;
  bool getObsolete() const { return obsolete; }

  // Appends the line that dump(std::ofstream&) writes, with that operation's trace records. For a
  // caller that writes many definitions through a buffer of its own.
  void appendLine(std::string* text) const;

 private:
  int parseClause(SchemaLexan* lexer, int token);
  void composeLine(std::string* text) const;

  bool obsolete = false;
  std::int32_t structuralType = KEY_STRUCTURAL;  // or KEY_AUXILIARY or KEY_ABSTRACT
  std::vector<std::string> reqAttrs;             // MUST, in file order, duplicates kept
  std::vector<std::string> optAttrs;             // MAY, in file order, duplicates kept
};

#endif  // LIBSCHEMA_OBJECT_CLASS_H
