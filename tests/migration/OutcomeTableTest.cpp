// The table of outcomes: a row for each combination of what the site and what the release did, for
// each kind of definition, with the whole outcome as text.

#include <gtest/gtest.h>
#include <libschema-migration/Installation.h>

#include <string>
#include <vector>

#include "ThreeWay.h"

namespace {

using migration::Installation;
using migration::Verdict;

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

// What the row is about, in its forms; what stands in all three beside it; and how it is shown.
struct Subject {
  const char* described;
  std::string context;
  std::string shipped;
  std::string sites;
  std::string releases;     // in another clause than the site's
  std::string conflicting;  // in the same clause
  std::string conflict;     // that clause
  std::string shownShipped;
  std::string shownSites;
  std::string shownMerged;
  std::string otherOwner;  // has what the subject has, in NEW
  std::string taken;       // why it is taken then
};

const std::vector<Subject>& subjects() {
  static const std::vector<Subject> kSubjects = {
      {"attribute type a (1.1)", "", at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE site"),
       at("1.1 NAME 'a' SINGLE-VALUE USAGE u"), at("1.1 NAME 'a' USAGE release"), "USAGE",
       "( 1.1 NAME ( 'a' ) USAGE u )", "( 1.1 NAME ( 'a' ) USAGE site )",
       "( 1.1 NAME ( 'a' ) SINGLE-VALUE USAGE site )", at("7.1 NAME ( 'r' 'A' ) USAGE u"),
       "its name 'a' belongs to NEW's attribute type r (7.1), which may be the same one, renamed"},
      {"object class c (2.1)", "", oc("2.1 NAME 'c' ABSTRACT MAY ( x )"),
       oc("2.1 NAME 'c' AUXILIARY MAY ( x )"), oc("2.1 NAME 'c' ABSTRACT MAY ( x $ n )"),
       oc("2.1 NAME 'c' STRUCTURAL MAY ( x )"), "KIND", "( 2.1 NAME ( 'c' ) ABSTRACT MAY ( x ) )",
       "( 2.1 NAME ( 'c' ) AUXILIARY MAY ( x ) )", "( 2.1 NAME ( 'c' ) AUXILIARY MAY ( x $ n ) )",
       at("2.1 NAME 'r' USAGE u"), "its OID 2.1 belongs to NEW's attribute type r (2.1)"},
      {"vendor extension 3.1", at("3.1 NAME 'e' USAGE u"), orv("3.1 DBNAME ( 'd' )"),
       orv("3.1 DBNAME ( 'd' ) ACCESS-CLASS secret"), orv("3.1 DBNAME ( 'd' ) LENGTH 9"),
       orv("3.1 DBNAME ( 'd' ) ACCESS-CLASS open"), "ACCESS-CLASS",
       "( 3.1 DBNAME ( 'd' ) ACCESS-CLASS normal )", "( 3.1 DBNAME ( 'd' ) ACCESS-CLASS secret )",
       "( 3.1 DBNAME ( 'd' ) ACCESS-CLASS secret LENGTH 9 )",
       at("7.1 NAME 'r' USAGE u") + orv("7.1 DBNAME ( 'D' )"),
       "its DBNAME 'd' belongs to NEW's vendor extension 7.1"}};
  return kSubjects;
}

// Of the subject alone: what the rest comes to is told by its own rows.
std::string outcomeOf(const Subject& subject, const std::string& base, const std::string& old,
                      const std::string& latest) {
  migration::Failures failures;
  const auto read = [&](const char* name, const std::string& text) {
    return Installation::fromTexts(name, {{"V3.user.at", subject.context + text}},
                                   migration::ReadLimits(), &failures);
  };
  const Installation ofBase = read("BASE", base);
  const Installation ofOld = read("OLD", old);
  const Installation ofNew = read("NEW", latest);
  const migration::ThreeWay result = migration::compareThreeWay(
      {&ofBase, &ofOld, &ofNew, {}, {}, migration::Prefer::kNothing, {}, false});
  for (const Verdict& row : result.differences) {
    if (describe(row) == subject.described) {
      return nameOf(row.change) + " -> " + std::string(wordOf(row.outcome)) + " (" + row.reason +
             ")" + (row.result ? " " + migration::textOf(*row.result) : "");
    }
  }
  return "nothing";
}

TEST(OutcomeTable, EachCombinationOfEachKind) {
  for (const Subject& subject : subjects()) {
    SCOPED_TRACE(subject.described);
    const std::string& p = subject.shipped;
    const std::string& s = subject.sites;
    const std::string& r = subject.releases;
    const std::string& x = subject.conflicting;
    const struct {
      const char* combination;
      std::string base;
      std::string old;
      std::string latest;
      std::string outcome;
    } rows[] = {
        {"unchanged, unchanged", p, p, p, "same -> same (nobody changed it)"},
        {"unchanged, changed", p, p, r, "changed by release -> new (only the release changed it)"},
        {"unchanged, added", "", "", p, "added by release -> new (the release added it)"},
        {"changed, unchanged", p, s, p,
         "changed by site -> old (only the site changed it) " + subject.shownSites},
        {"changed, changed alike", p, s, s,
         "same -> same (the site and the release changed it alike)"},
        {"changed, changed in another clause", p, s, r,
         "changed by both, mergeable -> merged (the site and the release changed different parts "
         "of it) " +
             subject.shownMerged},
        {"changed, changed in the same clause", p, s, x,
         "changed by both, in conflict -> undecided (the site and the release changed it in two "
         "ways: " +
             subject.conflict + ")"},
        {"absent and there, absent", "", p, "",
         "added by site -> added (the site added it) " + subject.shownShipped},
        {"absent and there, there and equal", "", p, p,
         "same -> same (the site and the release added it alike)"},
        {"absent and there, there and different", "", s, x,
         "changed by both, in conflict -> undecided (the site and the release each added it, and "
         "differ in: " +
             subject.conflict + ")"},
        {"unchanged, removed", p, p, "",
         "removed by release -> dropped (the release removed it, and the site had not changed it)"},
        {"changed, removed", p, s, "",
         "removed by release -> undecided (the release removed it, and the site had changed it)"},
        {"removed, there", p, "", p,
         "removed by site -> new (the site removed it; the release still has it)"},
        {"removed, changed", p, "", r,
         "removed by site -> new (the site removed it; the release still has it)"},
        {"removed, removed", p, "", "", "same -> gone (the site and the release removed it)"},
        {"taken", "", p, subject.otherOwner, "taken -> undecided (" + subject.taken + ")"},
    };
    for (const auto& row : rows) {
      SCOPED_TRACE(row.combination);
      EXPECT_EQ(outcomeOf(subject, row.base, row.old, row.latest), row.outcome);
    }
  }
}

// "Not when only DESC differs": of the kinds that have one.
TEST(OutcomeTable, WhatBothAddedAndDiffersInDescAloneIsTheSites) {
  const Subject type = subjects()[0];
  EXPECT_EQ(
      outcomeOf(type, "", at("1.1 NAME 'a' DESC 's' USAGE u"), at("1.1 NAME 'a' DESC 'r' USAGE u")),
      "changed by both, mergeable -> old (the site and the release each added it, and differ "
      "in DESC alone) ( 1.1 NAME ( 'a' ) DESC 's' USAGE u )");
  const Subject objectClass = subjects()[1];
  EXPECT_EQ(outcomeOf(objectClass, "", oc("2.1 NAME 'c' DESC 's' ABSTRACT"),
                      oc("2.1 NAME 'c' DESC 'r' ABSTRACT")),
            "changed by both, mergeable -> old (the site and the release each added it, and differ "
            "in DESC alone) ( 2.1 NAME ( 'c' ) DESC 's' ABSTRACT )");
}

// What the release removed and the site had not changed is kept where the site's still needs it.
TEST(OutcomeTable, WhatTheSiteStillRefersToIsKept) {
  const Subject type = subjects()[0];
  const std::string guard = oc("9.1 NAME 'guard' ABSTRACT MAY ( a )");
  const std::string kept =
      "removed by release -> kept (the release removed it, but the site's object class guard (9.1) "
      "refers to it) ";
  EXPECT_EQ(outcomeOf(type, type.shipped, type.shipped + guard, ""), kept + type.shownShipped);
  const Subject objectClass = subjects()[1];
  EXPECT_EQ(outcomeOf(objectClass, objectClass.shipped,
                      objectClass.shipped + oc("9.1 NAME 'guard' SUP c ABSTRACT"), ""),
            kept + objectClass.shownShipped);
  // An extension goes with its attribute type.
  Subject extension = subjects()[2];
  extension.context = "";
  const std::string both = at("3.1 NAME 'e' USAGE u") + extension.shipped;
  EXPECT_EQ(outcomeOf(extension, both, both + oc("9.1 NAME 'guard' ABSTRACT MAY ( e )"), ""),
            "removed by release -> kept (goes with its attribute type: the release removed it, but "
            "the site's object class guard (9.1) refers to it) " +
                extension.shownShipped);
}

}  // namespace
