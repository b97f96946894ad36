// The accessors of every field, each row with the whole definition as they give it.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Attribute.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "Tokens.h"

namespace {

std::string joined(const std::vector<std::string>& values) {
  std::string text = "[";
  for (const std::string& value : values) {
    text += (text.size() == 1 ? "" : " ") + value;
  }
  return text + "]";
}

const char* flag(bool value, const char* name) { return value ? name : ""; }

std::string commonOf(const ORVSchema& definition) {
  return definition.oidInPlace() + joined(definition.namesInPlace()) + "<" +
         definition.descriptionInPlace() + ">" + joined(definition.superiorsInPlace());
}

std::string fieldsOf(const Attribute& type) {
  return commonOf(type) + " " + type.getEquality() + "/" + type.getOrdering() + "/" +
         type.getSubstr() + " " + type.getSyntax() + "=" + type.getSyntaxOid() + "+" +
         type.getSyntaxLength() + " " + type.getUsage() + flag(type.getObsolete(), " obsolete") +
         flag(type.getSingleValue(), " single") + flag(type.getCollective(), " collective") +
         flag(type.getUserModification(), " modifiable");
}

std::string fieldsOf(const ObjectClass& type) {
  return commonOf(type) + " " + std::to_string(type.getStructuralType()) + " " +
         type.getStructuralTypeName() + joined(type.reqAttrsInPlace()) +
         joined(type.optAttrsInPlace()) + flag(type.getObsolete(), " obsolete");
}

std::string fieldsOf(const ORVAttribute& entry) {
  return entry.oidInPlace() + joined(entry.getDbNames()) + " " + entry.getAccessClass() + " " +
         entry.getLength() + flag(entry.hasEquality(), " equality") +
         flag(entry.hasOrdering(), " ordering") + flag(entry.hasSubstr(), " substr") +
         flag(entry.hasApprox(), " approx") + flag(entry.hasReverse(), " reverse");
}

struct Case {
  const char* rule;
  const char* text;
  const char* fields;
};

template <typename Definition>
void expectFields(const std::vector<Case>& cases) {
  for (const Case& row : cases) {
    SCOPED_TRACE(row.rule);
    Definition definition;
    EXPECT_EQ(support::parseText(row.text, &definition), 1);
    EXPECT_EQ(fieldsOf(definition), row.fields);
  }
}

TEST(Accessors, AttributeType) {
  expectFields<Attribute>({
      {"EveryClause",
       "= ( 1.2 NAME ( 'a' 'B' ) DESC 'd' OBSOLETE SUP s EQUALITY e ORDERING o SUBSTR u "
       "SYNTAX 1.3{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE dSAOperation )",
       "1.2[a B]<d>[s] e/o/u 1.3{64}=1.3+64 dSAOperation obsolete single"},
      {"NoClause", "= ( 1.2 )", "1.2[]<>[] // =+ userApplications modifiable"},
      {"SyntaxWithoutLength", "= ( 1.2 SYNTAX 1.3 )",
       "1.2[]<>[] // 1.3=1.3+ userApplications modifiable"},
      {"SyntaxThatIsAQuotedWordWithAnOpenBrace", "= ( 1.2 SYNTAX 'x{3' )",
       "1.2[]<>[] // x{3=x+ userApplications modifiable"},
      {"SyntaxThatIsAQuotedBrace", "= ( 1.2 SYNTAX '}' )",
       "1.2[]<>[] // }=}+ userApplications modifiable"},
  });
}

// No text leads to a collective attribute type that is complete.
TEST(Accessors, CollectiveIsSetByADerivedDefinition) {
  struct Collective : Attribute {
    Collective() { isCollective = true; }
  };
  EXPECT_EQ(fieldsOf(Collective()), "[]<>[] // =+ userApplications collective modifiable");
}

TEST(Accessors, ObjectClass) {
  expectFields<ObjectClass>({
      {"EveryClause",
       "= ( 1.2 NAME 'c' DESC 'd' OBSOLETE SUP ( s $ t ) AUXILIARY MUST ( m $ m ) MAY ( n ) )",
       "1.2[c]<d>[s t] 1006 AUXILIARY[m m][n] obsolete"},
      {"NoClause", "= ( 1.2 )", "1.2[]<>[] 1009 STRUCTURAL[][]"},
      {"Abstract", "= ( 1.2 ABSTRACT )", "1.2[]<>[] 1023 ABSTRACT[][]"},
  });
}

TEST(Accessors, VendorExtension) {
  expectFields<ORVAttribute>({
      {"EveryClause",
       "= ( 1.2 DBNAME ( 'a' 'a' ) ACCESS-CLASS sensitive LENGTH 8 EQUALITY ORDERING SUBSTR "
       "APPROX REVERSE )",
       "1.2[a a] sensitive 8 equality ordering substr approx reverse"},
      {"NoClause", "= ( 1.2 )", "1.2[] normal 0"},
      {"TheMatchingRulesOfAnAttributeTypeStayEmpty", "= ( 1.2 EQUALITY )",
       "1.2[] normal 0 equality"},
  });
  ORVAttribute entry;
  support::parseText("= ( 1.2 EQUALITY ORDERING SUBSTR )", &entry);
  EXPECT_EQ(entry.getEquality() + entry.getOrdering() + entry.getSubstr(), "");
}

}  // namespace
