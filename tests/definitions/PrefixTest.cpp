// Every prefix of a full definition: parse() comes to the end that the clauses read so far imply,
// or is inside a clause that never completes.

#include <gtest/gtest.h>

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "Attribute.h"
#include "EndlessRuns.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "Outcomes.h"
#include "ReferenceParsers.h"

namespace {

// The lengths of the prefixes of `text` that never complete: from the first one that holds `from`
// and one character more, up to the last one that does not hold `to` with one character more. A
// word needs a character after it, or it is lost at the end of the file.
struct EndlessPart {
  std::string from;
  std::string to;  // "" for the end of the text
};

std::size_t endOf(const std::string& text, const std::string& part) {
  const std::size_t at = text.find(part);
  EXPECT_NE(at, std::string::npos) << part;
  return at + part.size();
}

template <typename Reference>
std::string referenceOutcome(const std::string& text) {
  definitions::TokenTape tape(definitions::recordTokens(text));
  tape.lexan();
  Reference definition;
  const int result = definition.parse(&tape);
  if (result == definitions::kEndless) {
    return "endless";
  }
  std::string line = definition.line();
  line.pop_back();
  return std::to_string(result) + " " + line;
}

// Both the reference parser and the text's own words say which prefixes never complete; those run
// in children. All others return 0, except the ones that hold the whole definition.
template <typename Definition, typename Reference>
void expectPrefixes(const std::string& text, const EndlessPart& endless, std::size_t complete) {
  const std::size_t first = endOf(text, endless.from) + 1;
  const std::size_t last = endless.to.empty() ? text.size() : endOf(text, endless.to);
  std::vector<std::function<void()>> actions;
  for (std::size_t length = 0; length <= text.size(); ++length) {
    const std::string prefix = text.substr(0, length);
    SCOPED_TRACE(prefix);
    const std::string expected = referenceOutcome<Reference>(prefix);
    ASSERT_EQ(expected == "endless", first <= length && length <= last);
    if (expected == "endless") {
      actions.push_back([prefix] { definitions::parseWithinLimits<Definition>(prefix); });
      continue;
    }
    EXPECT_EQ(definitions::outcomeOf<Definition>(prefix), expected);
    EXPECT_EQ(expected[0], length >= complete ? '1' : '0');
  }
  EXPECT_EQ(definitions::endsOf(actions), std::vector<std::string>(actions.size(), "endless"));
}

TEST(PrefixDeathTest, AttributeType) {
  const std::string text =
      "=( 2.5.4.3 NAME ( 'cn' 'b' ) DESC 'a name' OBSOLETE SUP name EQUALITY caseIgnoreMatch "
      "ORDERING caseIgnoreOrderingMatch SUBSTR 1.3.6 SYNTAX 1.3.6.1{64} SINGLE-VALUE "
      "NO-USER-MODIFICATION USAGE directoryOperation )\n";
  expectPrefixes<Attribute, definitions::ReferenceAttribute>(text, {"NAME", "DESC"},
                                                             text.size() - 1);
}

TEST(PrefixDeathTest, CollectiveAttributeType) {
  const std::string text = "=( 2.5.4.3 OBSOLETE COLLECTIVE DESC 'd' )\n";
  expectPrefixes<Attribute, definitions::ReferenceAttribute>(text, {"COLLECTIVE", ""}, text.size());
}

TEST(PrefixDeathTest, ObjectClass) {
  const std::string text =
      "=( 2.5.6.6 NAME ( 'person' 'b' ) DESC 'a person' OBSOLETE SUP ( top $ other ) AUXILIARY "
      "MUST ( cn $ sn ) MAY ( seeAlso $ objectClasses ) )\n";
  expectPrefixes<ObjectClass, definitions::ReferenceObjectClass>(text, {"NAME", "DESC"},
                                                                 text.size() - 1);
}

TEST(PrefixDeathTest, ObjectClassWithoutNames) {
  const std::string text = "=( 2.5.6.6 NAME STRUCTURAL )\n";
  expectPrefixes<ObjectClass, definitions::ReferenceObjectClass>(text, {"NAME", "STRUCTURAL"},
                                                                 text.size() - 1);
}

TEST(PrefixDeathTest, VendorExtension) {
  const std::string text =
      "=( 2.5.4.3 DBNAME ( 'cn' 'b' ACCESS-CLASS critical LENGTH 256 EQUALITY ORDERING SUBSTR APPROX "
      "REVERSE )\n";
  expectPrefixes<ORVAttribute, definitions::ReferenceORVAttribute>(text, {"DBNAME", "ACCESS-CLASS"},
                                                                   text.size() - 1);
}

TEST(PrefixDeathTest, VendorExtensionWithAClosedList) {
  const std::string text = "=( 2.5.4.3 DBNAME ( 'cn' 'b' ) ACCESS-CLASS critical LENGTH 256{3} )\n";
  // A parenthesis is a token without a character after it.
  expectPrefixes<ORVAttribute, definitions::ReferenceORVAttribute>(text, {"DBNAME", "( 'cn' 'b' "},
                                                                   text.size() - 1);
}

}  // namespace
