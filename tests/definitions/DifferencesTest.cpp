// The deliberate differences between attribute types, object classes and vendor extensions, side by
// side: each row gives the three kinds the same input and has what each of them makes of it.

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "Attribute.h"
#include "EndlessRuns.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "Outcomes.h"
#include "TraceRecorder.h"

namespace {

using definitions::outcomeOf;
using definitions::parsed;

// "RESULT on CODE LINE": what parse() returned, the token on which the lexer stands, what was read.
template <typename Definition>
std::string ending(const std::string& text) {
  const std::string standing = definitions::standingAfter<Definition>(text);
  const std::string outcome = outcomeOf<Definition>(text);
  return standing.substr(0, standing.find(" line")) + outcome.substr(1);
}

struct Row {
  const char* rule;
  const char* input;
  const char* attribute;
  const char* objectClass;
  const char* vendor;
};

TEST(Differences, WhatEndsADefinition) {
  const Row kRows[] = {
      {"ClosingParenthesis", "=( 1.1 ) word ",
       "1 on 259 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 on 259 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"ClosingBrace", "=( 1.1 } word ",
       "1 on 125 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 on 125 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 125 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"EndOfInput", "=( 1.1 $\n",
       "0 on 36 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "0 on 36 objectclasses=( 1.1 NAME STRUCTURAL )",
       "0 on 36 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"OpeningParenthesis", "=( 1.1\n( 2.2 ) word ",
       "1 on 259 attributetypes=( 2.2 NAME (  ) USAGE userApplications  )",
       "1 on 40 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"StartOfAnAttributeType", "=( 1.1 attributetypes 2.2 ) word ",
       "0 on 1010 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 on 259 objectclasses=( 2.2 NAME STRUCTURAL )",
       "0 on 1010 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"StartOfAnObjectClass", "=( 1.1 objectclasses 2.2 ) word ",
       "0 on 1002 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "0 on 1002 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"StartOfAVendorExtension", "=( 1.1 ORVAttributetypes 2.2 ) word ",
       "0 on 1016 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 on 259 objectclasses=( 2.2 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"NumberWithABadLength", "=( 1.1 2.2{x ) word ",
       "1 on 259 attributetypes=( x NAME (  ) USAGE userApplications  )",
       "0 on 2026 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( x ACCESS-CLASS normal )"},
      {"NumberWithALength", "=( 1.1 2.2{3} ) word ",
       "1 on 259 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 on 259 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 259 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"DatabaseNamesAtTheEndOfALine", "=( 1.1 DBNAME ( a )\n( 2.2 ) word ",
       "1 on 40 attributetypes=( a NAME (  ) USAGE userApplications  )",
       "1 on 40 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 on 40 ORVAttributetypes=( 1.1 DBNAME ( 'a'  ) ACCESS-CLASS normal )"},
  };
  for (const Row& row : kRows) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(ending<Attribute>(row.input), row.attribute);
    EXPECT_EQ(ending<ObjectClass>(row.input), row.objectClass);
    EXPECT_EQ(ending<ORVAttribute>(row.input), row.vendor);
  }
}

TEST(Differences, WhatAClauseTakes) {
  const Row kRows[] = {
      {"SupWord", "=( 1.1 SUP a )",
       "1 attributetypes=( 1.1 NAME (  ) SUP a USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME SUP ( a ) STRUCTURAL )",
       "1 ORVAttributetypes=( a ACCESS-CLASS normal )"},
      {"SupNumber", "=( 1.1 SUP 2.2 )",
       "1 attributetypes=( 1.1 NAME (  ) SUP 2.2 USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"SupList", "=( 1.1 SUP ( a $ b ) )",
       "1 attributetypes=( b NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME SUP ( a $ b ) STRUCTURAL )",
       "1 ORVAttributetypes=( b ACCESS-CLASS normal )"},
      {"SupStartKeyword", "=( 1.1 SUP objectClasses )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"SupListStartKeyword", "=( 1.1 SUP ( attributeTypes ) )",
       "0 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME SUP ( attributetypes ) STRUCTURAL )",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"DescString", "=( 1.1 DESC 'd' )",
       "1 attributetypes=( 1.1 NAME (  )  DESC 'd' USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME  DESC 'd' STRUCTURAL )",
       "1 ORVAttributetypes=( d ACCESS-CLASS normal )"},
      {"DescNumber", "=( 1.1 DESC 2.2 )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"Equality", "=( 1.1 EQUALITY a )",
       "1 attributetypes=( 1.1 NAME (  ) EQUALITY a USAGE userApplications  )",
       "1 objectclasses=( a NAME STRUCTURAL )",
       "1 ORVAttributetypes=( a ACCESS-CLASS normal EQUALITY )"},
      {"Ordering", "=( 1.1 ORDERING 2.2 )",
       "1 attributetypes=( 1.1 NAME (  ) ORDERING 2.2 USAGE userApplications  )",
       "1 objectclasses=( 2.2 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 2.2 ACCESS-CLASS normal ORDERING )"},
      {"Substr", "=( 1.1 SUBSTR a )",
       "1 attributetypes=( 1.1 NAME (  ) SUBSTR a USAGE userApplications  )",
       "1 objectclasses=( a NAME STRUCTURAL )",
       "1 ORVAttributetypes=( a ACCESS-CLASS normal SUBSTR )"},
      {"EqualityWithALength", "=( 1.1 EQUALITY 2.2{3} )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal EQUALITY )"},
      {"SyntaxWithALength", "=( 1.1 SYNTAX 2.2 {3} )",
       "1 attributetypes=( 1.1 NAME (  ) SYNTAX 2.2{3} USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"SyntaxWithABadLength", "=( 1.1 SYNTAX 2.2{ )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "0 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"LengthWithALength", "=( 1.1 LENGTH 2{3} )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 2{3} )"},
      {"LengthWithABadLength", "=( 1.1 LENGTH 2{ )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "0 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 2{ )"},
      {"KeywordAsAValue", "=( 1.1 ACCESS-CLASS OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS OBSOLETE )"},
      {"MustWithoutParentheses", "=( 1.1 MUST a ABSTRACT )",
       "1 attributetypes=( a NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME ABSTRACT MUST ( a ) )",
       "1 ORVAttributetypes=( a ACCESS-CLASS normal )"},
      {"Collective", "=( 1.1 COLLECTIVE )", nullptr, "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"NoClauseButTheOid", "=( 1.1 )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
  };
  for (const Row& row : kRows) {
    SCOPED_TRACE(row.rule);
    if (row.attribute !=
        nullptr) {  // else never completes: AttributeParse.CollectiveNeverCompletes
      EXPECT_EQ(outcomeOf<Attribute>(row.input), row.attribute);
    }
    EXPECT_EQ(outcomeOf<ObjectClass>(row.input), row.objectClass);
    EXPECT_EQ(outcomeOf<ORVAttribute>(row.input), row.vendor);
  }
}

// The names of a definition: NAME of an attribute type and of an object class, DBNAME of a vendor
// extension. `members` follows the keyword; a clause that ends the list in every kind does not
// exist, so each kind has its own after it.
struct NamesRow {
  const char* rule;
  const char* members;
  const char* attribute;
  const char* objectClass;
  const char* vendor;
};

TEST(Differences, WhatTheNamesTake) {
  const NamesRow kRows[] = {
      {"OneIsWrittenAsAList", "'a'", "NAME ( 'a'  )", "NAME 'a'", "DBNAME ( 'a'  )"},
      {"OneInParentheses", "( 'a' )", "NAME ( 'a'  )", "NAME 'a'", "DBNAME ( 'a'  )"},
      {"Two", "( 'a' 'b' )", "NAME ( 'a' 'b'  )", "NAME ( 'a' 'b'  )", "DBNAME ( 'a' 'b'  )"},
      {"Repeats", "( 'a' 'b' 'a' )", "NAME ( 'a' 'b'  )", "NAME ( 'a' 'b' 'a'  )",
       "DBNAME ( 'a' 'b' 'a'  )"},
      {"None", "( )", "NAME (  )", "NAME", ""},
      {"Numbers", "( 1.2 1.2{3} 1.2{ )", "NAME (  )", "NAME", ""},
      {"ObjectClasses", "( 'objectClasses' )", "NAME ( 'objectclasses'  )", "NAME",
       "DBNAME ( 'objectclasses'  )"},
      {"AttributeTypes", "( 'attributeTypes' )", "NAME ( 'attributetypes'  )", "NAME",
       "DBNAME ( 'attributetypes'  )"},
      {"ORVAttributeTypes", "( 'ORVattributeTypes' )", "NAME (  )", "NAME",
       "DBNAME ( 'ORVAttributetypes'  )"},
  };
  for (const NamesRow& row : kRows) {
    SCOPED_TRACE(row.rule);
    const std::string members = row.members;
    const std::string vendor = row.vendor;
    EXPECT_EQ(outcomeOf<Attribute>("=( 1.1 NAME " + members + " SINGLE-VALUE )"),
              "1 attributetypes=( 1.1 " + std::string(row.attribute) +
                  " SINGLE-VALUE USAGE userApplications  )");
    EXPECT_EQ(outcomeOf<ObjectClass>("=( 1.1 NAME " + members + " ABSTRACT )"),
              "1 objectclasses=( 1.1 " + std::string(row.objectClass) + " ABSTRACT )");
    EXPECT_EQ(outcomeOf<ORVAttribute>("=( 1.1 DBNAME " + members + " REVERSE )"),
              "1 ORVAttributetypes=( 1.1 " + vendor + (vendor.empty() ? "" : " ") +
                  "ACCESS-CLASS normal REVERSE )");
  }
}

// Which tokens end the names. After each stands the word "more", which becomes a name as well when
// the token did not end them, and then a keyword that ends them in any case. COLLECTIVE ends the
// names of an attribute type and then never completes.
TEST(Differences, WhatTheNamesStopAt) {
  const struct {
    const char* token;
    const char* stops;  // "A" attribute type, "O" object class, "V" vendor extension
  } kRows[] = {
      {"objectclasses", ""},
      {"NAME", ""},
      {"DESC", "AO"},
      {"SUP", "AO"},
      {"AUXILIARY", "O"},
      {"MUST", "O"},
      {"MAY", "O"},
      {"STRUCTURAL", "O"},
      {"attributetypes", ""},
      {"EQUALITY", "AV"},
      {"SYNTAX", "A"},
      {"SINGLE-VALUE", "A"},
      {"USAGE", "A"},
      {"NO-USER-MODIFICATION", "A"},
      {"ORVAttributetypes", ""},
      {"ACCESS-CLASS", "V"},
      {"DBNAME", ""},
      {"SUBSTR", "AV"},
      {"REVERSE", "V"},
      {"ORDERING", "AV"},
      {"COLLECTIVE", "A"},
      {"OBSOLETE", "AO"},
      {"ABSTRACT", "O"},
      {"LENGTH", "V"},
      {"APPROX", "V"},
      {")", "V"},
      {"(", ""},
      {"$", ""},
      {"{", ""},
      {"}", ""},
      {"1.2", ""},
      {"1.2{3}", ""},
      {"1.2{ ", ""},
  };
  const auto takesMore = [](const std::string& outcome) {
    return outcome.find("'more'") != std::string::npos;
  };
  for (const auto& row : kRows) {
    SCOPED_TRACE(row.token);
    const std::string rest = " 'a' " + std::string(row.token) + " 'more' ";
    std::string stops;
    if (std::string(row.token) == "COLLECTIVE") {
      stops += definitions::endsOf({[&rest] {
                 definitions::parseWithinLimits<Attribute>("=( 1.1 NAME" + rest + "USAGE u )");
               }})[0] == "endless"
                   ? "A"
                   : "";
    } else {
      // A description is written between quotes too; a second one replaces it.
      stops += takesMore(outcomeOf<Attribute>("=( 1.1 NAME" + rest + "DESC 'd' )")) ? "" : "A";
    }
    stops += takesMore(outcomeOf<ObjectClass>("=( 1.1 NAME" + rest + "DESC 'd' )")) ? "" : "O";
    stops += takesMore(outcomeOf<ORVAttribute>("=( 1.1 DBNAME" + rest + "REVERSE )")) ? "" : "V";
    EXPECT_EQ(stops, row.stops);
  }
}

// A keyword that ends the names, standing where the first name is expected.
TEST(Differences, WhetherTheFirstTokenOfTheNamesIsTested) {
  EXPECT_EQ(outcomeOf<Attribute>("=( 1.1 NAME DESC 'd' OBSOLETE )"),
            "1 attributetypes=( 1.1 NAME ( 'd'  ) OBSOLETE USAGE userApplications  )");
  EXPECT_EQ(outcomeOf<ObjectClass>("=( 1.1 NAME DESC 'd' OBSOLETE )"),
            "1 objectclasses=( 1.1 NAME  DESC 'd' OBSOLETE STRUCTURAL )");
  EXPECT_EQ(outcomeOf<ORVAttribute>("=( 1.1 DBNAME LENGTH 'd' REVERSE )"),
            "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH d REVERSE )");
}

TEST(Differences, ResultTypesAndTracedResults) {
  static_assert(std::is_same_v<decltype(std::declval<Attribute>().parse(nullptr)), int>);
  static_assert(std::is_same_v<decltype(std::declval<ObjectClass>().parse(nullptr)), bool>);
  static_assert(std::is_same_v<decltype(std::declval<ORVAttribute>().parse(nullptr)), bool>);
  static_assert(std::is_same_v<decltype(std::declval<Attribute>().attrsEqual(Attribute())), int>);
  static_assert(
      std::is_same_v<decltype(std::declval<ObjectClass>().objsEqual(ObjectClass())), bool>);
  static_assert(
      std::is_same_v<decltype(std::declval<ORVAttribute>().orvAttrsEqual(ORVAttribute())), bool>);

  // The last record of each call is its exit record.
  support::TraceRecorder recorder(support::kAllEvents);
  const auto exitOf = [&recorder](const std::function<void()>& call) {
    recorder.clear();
    call();
    return recorder.records().back();
  };
  Attribute attribute;
  ObjectClass objectClass;
  ORVAttribute vendor;
  Attribute otherAttribute = parsed<Attribute>("=( 1.1 )");
  const struct {
    const char* rule;
    std::function<void()> call;
    const char* record;
  } kRows[] = {
      {"equal", [&] { attribute.attrsEqual(attribute); },
       "exit 0x53010100 kind 33 bit 4096 code 1"},
      {"not equal", [&] { attribute.attrsEqual(otherAttribute); },
       "exit 0x53010100 kind 33 bit 4096 code 0"},
      {"equal", [&] { objectClass.objsEqual(objectClass); },
       "exit 0x53030100 kind 33 bit 4096 code 0"},
      {"equal", [&] { vendor.orvAttrsEqual(vendor); }, "exit 0x53020200 kind 33 bit 4096 code 0"},
  };
  for (const auto& row : kRows) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(exitOf(row.call), row.record);
  }
}

// The records of parse() itself, without those of the lexer that it calls.
template <typename Definition>
std::vector<std::string> parseRecords(const std::string& text) {
  support::LexedText input(text);
  input.lexer().lexan();
  Definition definition;
  const support::TraceRecorder recorder(support::kAllEvents);
  definition.parse(&input.lexer());
  std::vector<std::string> records;
  for (const std::string& record : recorder.records()) {
    if (record.find(" 0x5304") == std::string::npos) {
      records.push_back(record);
    }
  }
  return records;
}

TEST(Differences, TracedResultOfParse) {
  using Records = std::vector<std::string>;
  EXPECT_EQ(
      parseRecords<Attribute>("=( 1.1 )"),
      (Records{"entry 0x53010200 level 0x3200000", "exit 0x53010200 kind 33 bit 4096 code 1"}));
  EXPECT_EQ(
      parseRecords<Attribute>("=( 1.1 "),
      (Records{"entry 0x53010200 level 0x3200000", "exit 0x53010200 kind 33 bit 4096 code 0"}));
  for (const char* text : {"=( 1.1 )", "=( 1.1 "}) {
    EXPECT_EQ(
        parseRecords<ObjectClass>(text),
        (Records{"entry 0x53030200 level 0x3200000", "exit 0x53030200 kind 33 bit 4096 code 0"}));
    EXPECT_EQ(
        parseRecords<ORVAttribute>(text),
        (Records{"entry 0x53020100 level 0x3200000", "exit 0x53020100 kind 33 bit 4096 code 0"}));
  }
}

TEST(Differences, WhatTheCollisionReportNames) {
  EXPECT_EQ(parsed<Attribute>("=( 1.1 NAME ( 'a' 'b' ) OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> a, b\n\n");
  EXPECT_EQ(parsed<ObjectClass>("=( 1.1 NAME ( 'a' 'b' ) OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> a, b\n\n");
  EXPECT_EQ(parsed<ORVAttribute>("=( 1.1 NAME x DBNAME ( 'a' 'b' ) 1.1 )").getOidAndName(),
            "OID --> 1.1\nName --> a, b\n\n");
}

}  // namespace
