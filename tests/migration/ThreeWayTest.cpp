// Three-way differences: one row for each combination, with the whole outcome as text.

#include "ThreeWay.h"
#include "ToldClauses.h"

#include <gtest/gtest.h>

#include <set>
#include <string>
#include <utility>
#include <vector>

#include "Installation.h"
#include "Verdict.h"

namespace {

using migration::Installation;
using migration::NamedText;
using migration::Prefer;
using migration::ThreeWay;
using migration::ThreeWayRequest;
using migration::Verdict;

Installation installationOf(const std::string& name, std::vector<NamedText> texts) {
  migration::Failures failures;
  Installation installation =
      Installation::fromTexts(name, std::move(texts), migration::ReadLimits(), &failures);
  EXPECT_TRUE(failures.empty());
  return installation;
}

// Every definition of a side stands in one file, which may hold any kind.
Installation inUserFile(const std::string& name, const std::string& text) {
  return installationOf(name, {{"V3.user.at", text}});
}

std::string clauseOf(const migration::ToldClause& clause) {
  return clause.name + "<" + clause.base + "><" + clause.old + "><" + clause.latest +
         ">=" + (clause.isDecided ? "<" + clause.result + ">" : "?");
}

std::string outcomeOf(const Verdict& row) {
  std::string text = describe(row) + ": " + nameOf(row.change) +
                     (row.isRenamed ? ", renamed" : "") + (row.isRenumbered ? ", renumbered" : "") +
                     " -> " + std::string(wordOf(row.outcome)) + " (" + row.reason + ")";
  for (const std::string& note : row.notes) {
    text += " [" + note + "]";
  }
  if (row.result) {
    text += " " + migration::textOf(*row.result);
  }
  return text;
}

struct Inputs {
  std::string base;
  std::string old;
  std::string latest;
};

// A line for each definition that is not the same, and the risk and clauses of each if wanted.
std::string outcomesOf(const Inputs& inputs, Prefer prefer = Prefer::kNothing,
                       bool hasBase = true) {
  const Installation base = inUserFile("BASE", inputs.base);
  const Installation old = inUserFile("OLD", inputs.old);
  const Installation latest = inUserFile("NEW", inputs.latest);
  ThreeWayRequest request;
  request.base = hasBase ? &base : nullptr;
  request.old = &old;
  request.latest = &latest;
  request.prefer = prefer;
  std::string text;
  for (const Verdict& row : migration::compareThreeWay(request).differences) {
    if (row.outcome != migration::Outcome::kSame) {
      text += outcomeOf(row) + "\n";
    }
  }
  return text;
}

std::string clausesOf(const Inputs& inputs) {
  const Installation base = inUserFile("BASE", inputs.base);
  const Installation old = inUserFile("OLD", inputs.old);
  const Installation latest = inUserFile("NEW", inputs.latest);
  const ThreeWay result =
      migration::compareThreeWay({&base, &old, &latest, {}, {}, Prefer::kNothing, {}, false});
  std::string text;
  for (const Verdict& row : result.differences) {
    for (const migration::ClauseChange& change : row.clauses) {
      for (const migration::ToldClause& clause : toldClauses(change)) {
        text += clauseOf(clause) + " " + std::string(wordOf(clause.risk)) + "\n";
      }
    }
  }
  return text;
}

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

struct Case {
  const char* rule;
  Inputs inputs;
  const char* outcomes;
};

void expectOutcomes(const std::vector<Case>& cases, Prefer prefer = Prefer::kNothing,
                    bool hasBase = true) {
  for (const Case& row : cases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(outcomesOf(row.inputs, prefer, hasBase), row.outcomes);
  }
}

const std::string kPlain = at("1.1 NAME 'a' DESC 'd' USAGE u");
const std::string kSites = at("1.1 NAME 'a' DESC 'd' USAGE site");
const std::string kReleases = at("1.1 NAME 'a' DESC 'd' SINGLE-VALUE USAGE u");

// ---- The table of outcomes, for an attribute type ----

TEST(ThreeWay, AttributeTypesByWhoChangedThem) {
  expectOutcomes({
      {"NobodyChangedIt", {kPlain, kPlain, kPlain}, ""},
      {"TheReleaseChangedIt",
       {kPlain, kPlain, kReleases},
       "attribute type a (1.1): changed by release -> new (only the release changed it)\n"},
      {"TheSiteChangedIt",
       {kPlain, kSites, kPlain},
       "attribute type a (1.1): changed by site -> old (only the site changed it) "
       "( 1.1 NAME ( 'a' ) DESC 'd' USAGE site )\n"},
      {"BothChangedItAlike", {kPlain, kSites, kSites}, ""},
      {"BothChangedDifferentClauses",
       {kPlain, kSites, kReleases},
       "attribute type a (1.1): changed by both, mergeable -> merged (the site and the release "
       "changed different parts of it) ( 1.1 NAME ( 'a' ) DESC 'd' SINGLE-VALUE USAGE site )\n"},
      {"BothChangedOneClauseInTwoWays",
       {kPlain, kSites, at("1.1 NAME 'a' DESC 'd' USAGE release")},
       "attribute type a (1.1): changed by both, in conflict -> undecided (the site and the release "
       "changed it in two ways: USAGE)\n"},
      {"TheSiteAddedIt",
       {"", kPlain, ""},
       "attribute type a (1.1): added by site -> added (the site added it) "
       "( 1.1 NAME ( 'a' ) DESC 'd' USAGE u )\n"},
      {"TheReleaseAddedIt",
       {"", "", kPlain},
       "attribute type a (1.1): added by release -> new (the release added it)\n"},
      {"BothAddedItAlike", {"", kPlain, kPlain}, ""},
      {"BothAddedItDifferently",
       {"", kSites, kPlain},
       "attribute type a (1.1): changed by both, in conflict -> undecided (the site and the release "
       "each added it, and differ in: USAGE)\n"},
      {"BothAddedItAndDifferInDescAlone",
       {"", at("1.1 NAME 'a' DESC 's' USAGE u"), kPlain},
       "attribute type a (1.1): changed by both, mergeable -> old (the site and the release each "
       "added it, and differ in DESC alone) [DESC differs; the site's is taken] "
       "( 1.1 NAME ( 'a' ) DESC 's' USAGE u )\n"},
      {"TheReleaseRemovedWhatTheSiteHadNotChanged",
       {kPlain, kPlain, ""},
       "attribute type a (1.1): removed by release -> dropped (the release removed it, and the site "
       "had not changed it)\n"},
      {"TheReleaseRemovedWhatTheSiteHadChanged",
       {kPlain, kSites, ""},
       "attribute type a (1.1): removed by release -> undecided (the release removed it, and the "
       "site had changed it)\n"},
      {"TheSiteRemovedWhatTheReleaseHas",
       {kPlain, "", kReleases},
       "attribute type a (1.1): removed by site -> new (the site removed it; the release still has "
       "it)\n"},
      {"BothRemovedIt",
       {kPlain, "", ""},
       "attribute type a (1.1): same -> gone (the site and the release removed it)\n"},
  });
}

TEST(ThreeWay, ObjectClassesByWhoChangedThem) {
  const std::string plain = oc("2.1 NAME 'c' SUP top STRUCTURAL MUST ( m ) MAY ( x $ y )");
  const std::string sites = oc("2.1 NAME 'c' SUP top STRUCTURAL MUST ( m ) MAY ( x $ y $ site )");
  const std::string releases = oc("2.1 NAME 'c' SUP top STRUCTURAL MUST ( m ) MAY ( y $ new )");
  expectOutcomes({
      {"TheReleaseChangedIt",
       {plain, plain, releases},
       "object class c (2.1): changed by release -> new (only the release changed it)\n"},
      {"TheSiteChangedIt",
       {plain, sites, plain},
       "object class c (2.1): changed by site -> old (only the site changed it) "
       "( 2.1 NAME ( 'c' ) SUP ( top ) STRUCTURAL MUST ( m ) MAY ( x $ y $ site ) )\n"},
      {"MembersMergeInTheOrderOfNewAndThenOfOld",
       {plain, sites, releases},
       "object class c (2.1): changed by both, mergeable -> merged (the site and the release "
       "changed different parts of it) "
       "( 2.1 NAME ( 'c' ) SUP ( top ) STRUCTURAL MUST ( m ) MAY ( y $ new $ site ) )\n"},
      {"AMemberOfMustAndMayStaysInMust",
       {oc("2.1 NAME 'c' ABSTRACT MAY ( x )"), oc("2.1 NAME 'c' ABSTRACT MUST ( z ) MAY ( x )"),
        oc("2.1 NAME 'c' ABSTRACT MAY ( x $ z )")},
       "object class c (2.1): changed by both, mergeable -> old (the site and the release "
       "changed different parts of it) [a member of both MUST and MAY stays in MUST] "
       "( 2.1 NAME ( 'c' ) ABSTRACT MUST ( z ) MAY ( x ) )\n"},
      {"TheKindIsOneClause",
       {oc("2.1 NAME 'c' ABSTRACT"), oc("2.1 NAME 'c' STRUCTURAL"), oc("2.1 NAME 'c' AUXILIARY")},
       "object class c (2.1): changed by both, in conflict -> undecided (the site and the release "
       "changed it in two ways: KIND)\n"},
      {"SuperiorsAreOneClauseComparedAsASet",
       {oc("2.1 NAME 'c' SUP ( p $ q ) ABSTRACT"), oc("2.1 NAME 'c' SUP ( q $ P ) ABSTRACT"),
        oc("2.1 NAME 'c' SUP ( p $ r ) ABSTRACT")},
       "object class c (2.1): changed by release -> new (only the release changed it)\n"},
  });
}

TEST(ThreeWay, VendorExtensionsAreJudgedByThemselvesWhereTheAttributeTypeIsInBoth) {
  const std::string plain = kPlain + orv("1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 8");
  const std::string sites = kPlain + orv("1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS secret LENGTH 8");
  const std::string releases = kPlain + orv("1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 9");
  expectOutcomes({
      {"TheSiteChangedIt",
       {plain, sites, plain},
       "vendor extension 1.1: changed by site -> old (only the site changed it) "
       "( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS secret LENGTH 8 )\n"},
      {"BothChangedDifferentClauses",
       {plain, sites, releases},
       "vendor extension 1.1: changed by both, mergeable -> merged (the site and the release "
       "changed different parts of it) ( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS secret LENGTH 9 )\n"},
      {"AlsoWhenTheAttributeTypeIsUndecided",
       {plain, kSites + orv("1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS secret LENGTH 8"),
        at("1.1 NAME 'a' DESC 'd' USAGE release") +
            orv("1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 8")},
       "attribute type a (1.1): changed by both, in conflict -> undecided (the site and the release "
       "changed it in two ways: USAGE)\n"
       "vendor extension 1.1: changed by site -> old (only the site changed it) "
       "( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS secret LENGTH 8 )\n"},
      {"DbNameIsComparedWithItsOrder",
       {kPlain + orv("1.1 DBNAME ( 'a' 'b' )"), kPlain + orv("1.1 DBNAME ( 'b' 'a' )"),
        kPlain + orv("1.1 DBNAME ( 'A' 'b' )")},
       "vendor extension 1.1: changed by site -> old (only the site changed it) "
       "( 1.1 DBNAME ( 'b' 'a' ) ACCESS-CLASS normal )\n"},
      {"ItIsAddedWithItsAttributeType",
       {"", plain, ""},
       "attribute type a (1.1): added by site -> added (the site added it) "
       "( 1.1 NAME ( 'a' ) DESC 'd' USAGE u )\n"
       "vendor extension 1.1: added by site -> added (goes with its attribute type: the site added "
       "it) ( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 8 )\n"},
      {"ItIsDroppedWithItsAttributeTypeAlsoWhenTheSiteChangedIt",
       {plain, sites, ""},
       "attribute type a (1.1): removed by release -> dropped (the release removed it, and the site "
       "had not changed it)\n"
       "vendor extension 1.1: removed by release -> dropped (goes with its attribute type: the "
       "release removed it, and the site had not changed it)\n"},
      {"TheReleaseRemovedItAlone",
       {plain, plain, kPlain},
       "vendor extension 1.1: removed by release -> dropped (the release removed it, and the site "
       "had not changed it)\n"},
  });
}

// ---- Names and OIDs ----

TEST(ThreeWay, RenamedAndRenumbered) {
  expectOutcomes({
      {"TheReleaseRenamedIt",
       {kPlain, kPlain, at("1.1 NAME ( 'b' 'a' ) DESC 'd' USAGE u")},
       "attribute type a (1.1): changed by release, renamed -> new (only the release changed it)\n"},
      {"TheSiteRenumberedIt",
       {kPlain, at("9.9 NAME 'a' DESC 'd' USAGE u"), kPlain},
       "attribute type a (9.9): changed by site, renumbered -> old (only the site changed it) "
       "( 9.9 NAME ( 'a' ) DESC 'd' USAGE u )\n"},
      {"TheFirstNameIsAClause",
       {kPlain, at("1.1 NAME 's' DESC 'd' USAGE u"), at("1.1 NAME 'r' DESC 'd' USAGE u")},
       "attribute type s (1.1): changed by both, in conflict, renamed -> undecided (the site and "
       "the release changed it in two ways: NAME)\n"},
      {"AnOidMatchesBeforeAFirstName",
       {at("1.1 NAME 'a' USAGE u") + at("1.2 NAME 'b' USAGE u"),
        at("1.1 NAME 'b' USAGE u") + at("1.2 NAME 'a' USAGE u"),
        at("1.1 NAME 'a' USAGE u") + at("1.2 NAME 'b' USAGE u")},
       "attribute type b (1.1): changed by site, renamed -> old (only the site changed it) "
       "( 1.1 NAME ( 'b' ) USAGE u )\n"
       "attribute type a (1.2): changed by site, renamed -> old (only the site changed it) "
       "( 1.2 NAME ( 'a' ) USAGE u )\n"},
      {"AnAttributeTypeDoesNotMatchAClass",
       {"", at("1.1 NAME 'a' USAGE u"), oc("1.1 NAME 'a' ABSTRACT")},
       "attribute type a (1.1): taken -> undecided (its OID 1.1 belongs to NEW's object class a "
       "(1.1))\n"
       "object class a (1.1): added by release -> new (the release added it)\n"},
  });
}

TEST(ThreeWay, WhatIsTakenIsUndecidedAndItsExtensionGoesWithIt) {
  const std::string site = at("9.1 NAME 'badge' USAGE u");
  expectOutcomes({
      {"AName",
       {"", site + orv("9.1 DBNAME ( 'badge' )"), at("1.5 NAME ( 'x' 'Badge' ) USAGE u")},
       "attribute type x (1.5): added by release -> new (the release added it)\n"
       "attribute type badge (9.1): taken -> undecided (its name 'badge' belongs to NEW's "
       "attribute type x (1.5), which may be the same one, renamed)\n"
       "vendor extension 9.1: taken -> undecided (goes with its attribute type: its name 'badge' "
       "belongs to NEW's attribute type x (1.5), which may be the same one, renamed)\n"},
      {"AnAliasThatTheSiteAdded",
       {kPlain, at("1.1 NAME ( 'a' 'badge' ) DESC 'd' USAGE u"),
        kPlain + at("1.5 NAME 'badge' USAGE u")},
       "attribute type a (1.1): taken -> undecided (its name 'badge' belongs to NEW's attribute "
       "type badge (1.5))\n"
       "attribute type badge (1.5): added by release -> new (the release added it)\n"},
      {"ADbName",
       {"", site + orv("9.1 DBNAME ( 'col' )"),
        at("1.5 NAME 'x' USAGE u") + orv("1.5 DBNAME ( 'COL' )")},
       "attribute type x (1.5): added by release -> new (the release added it)\n"
       "attribute type badge (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'badge' ) USAGE u )\n"
       "vendor extension 1.5: added by release -> new (goes with its attribute type: the release "
       "added it)\n"
       "vendor extension 9.1: taken -> undecided (its DBNAME 'col' belongs to NEW's vendor "
       "extension 1.5)\n"},
      {"NotByAnAliasThatOnlyOldBrings",
       {kPlain, at("1.1 NAME ( 'a' 'z' ) DESC 'd' USAGE u") + at("9.1 NAME 'z' USAGE u"), kPlain},
       "attribute type a (1.1): changed by site -> old (only the site changed it) "
       "( 1.1 NAME ( 'a' 'z' ) DESC 'd' USAGE u )\n"
       "attribute type z (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'z' ) USAGE u )\n"},
      {"ADbNameOfWhatIsKept",
       {kPlain + orv("1.1 DBNAME ( 'col' )"),
        kPlain + orv("1.1 DBNAME ( 'col' )") + oc("9.1 NAME 'guard' ABSTRACT MAY ( a )"),
        at("1.5 NAME 'x' USAGE u") + orv("1.5 DBNAME ( 'COL' )")},
       "attribute type x (1.5): added by release -> new (the release added it)\n"
       "attribute type a (1.1): removed by release -> kept (the release removed it, but the site's "
       "object class guard (9.1) refers to it) ( 1.1 NAME ( 'a' ) DESC 'd' USAGE u )\n"
       "object class guard (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'guard' ) ABSTRACT MAY ( a ) )\n"
       "vendor extension 1.5: added by release -> new (goes with its attribute type: the release "
       "added it)\n"
       "vendor extension 1.1: taken -> undecided (its DBNAME 'col' belongs to NEW's vendor "
       "extension 1.5)\n"},
      {"NotWhatTheOtherGivesUp",
       {kPlain, at("1.1 NAME 'z' DESC 'd' USAGE u") + at("9.1 NAME 'a' USAGE u"), kPlain},
       "attribute type z (1.1): changed by site, renamed -> old (only the site changed it) "
       "( 1.1 NAME ( 'z' ) DESC 'd' USAGE u )\n"
       "attribute type a (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'a' ) USAGE u )\n"},
  });
}

// ---- References ----

TEST(ThreeWay, WhatTheSiteRefersToIsKept) {
  const std::string badge = at("1.1 NAME 'badge' SUP id USAGE u") + at("1.2 NAME 'id' USAGE u");
  const std::string person = oc("2.1 NAME 'person' ABSTRACT MAY ( badge )");
  expectOutcomes({
      {"ByTheSitesOwnAndSoOn",
       {badge + orv("1.1 DBNAME ( 'b' )"),
        badge + orv("1.1 DBNAME ( 'b' )") + oc("9.1 NAME 'guard' ABSTRACT MUST ( Badge )"), ""},
       "attribute type badge (1.1): removed by release -> kept (the release removed it, but the "
       "site's object class guard (9.1) refers to it) ( 1.1 NAME ( 'badge' ) SUP id USAGE u )\n"
       "attribute type id (1.2): removed by release -> kept (the release removed it, but the "
       "site's attribute type badge (1.1) refers to it) ( 1.2 NAME ( 'id' ) USAGE u )\n"
       "object class guard (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'guard' ) ABSTRACT MUST ( Badge ) )\n"
       "vendor extension 1.1: removed by release -> kept (goes with its attribute type: the "
       "release removed it, but the site's object class guard (9.1) refers to it) "
       "( 1.1 DBNAME ( 'b' ) ACCESS-CLASS normal )\n"},
      {"NotByWhatIsDroppedItself",
       {at("1.2 NAME 'id' USAGE u") + person, at("1.2 NAME 'id' USAGE u") + person, ""},
       "attribute type id (1.2): removed by release -> dropped (the release removed it, and the "
       "site had not changed it)\n"
       "object class person (2.1): removed by release -> dropped (the release removed it, and the "
       "site had not changed it)\n"},
      {"NotByWhatIsUndecided",
       {at("1.2 NAME 'id' USAGE u") + oc("2.1 NAME 'p' ABSTRACT"),
        at("1.2 NAME 'id' USAGE u") + oc("2.1 NAME 'p' AUXILIARY MAY ( id )"),
        oc("2.1 NAME 'p' STRUCTURAL")},
       "attribute type id (1.2): removed by release -> dropped (the release removed it, and the "
       "site had not changed it)\n"
       "object class p (2.1): changed by both, in conflict -> undecided (the site and the release "
       "changed it in two ways: KIND)\n"},
  });
}

TEST(ThreeWay, ReferencesOfWhatIsCarriedFollowARename) {
  expectOutcomes({
      {"WhereTheOldNameIsGone",
       {kPlain, kPlain + oc("9.1 NAME 'guard' ABSTRACT MAY ( A $ x )"),
        at("1.1 NAME 'b' DESC 'd' USAGE u")},
       "attribute type a (1.1): changed by release, renamed -> new (only the release changed it)\n"
       "object class guard (9.1): added by site -> added (the site added it) [MAY names 'A', which "
       "is called 'b' in the result: the reference follows] ( 9.1 NAME ( 'guard' ) ABSTRACT MAY ( b $ x ) )\n"},
      {"AlsoWhereNewGivesTheNameToAnother",
       {kPlain, kPlain + oc("9.1 NAME 'guard' ABSTRACT MAY ( a )"),
        at("1.1 NAME 'b' DESC 'd' USAGE u") + at("2.2 NAME 'a' USAGE u")},
       "attribute type a (1.1): changed by release, renamed -> new (only the release changed it)\n"
       "attribute type a (2.2): added by release -> new (the release added it)\n"
       "object class guard (9.1): added by site -> added (the site added it) [MAY names 'a', which "
       "is called 'b' in the result: the reference follows] "
       "( 9.1 NAME ( 'guard' ) ABSTRACT MAY ( b ) )\n"},
      {"NotWhereItIsStillAName",
       {kPlain, kPlain + oc("9.1 NAME 'guard' ABSTRACT MAY ( a )"),
        at("1.1 NAME ( 'b' 'a' ) DESC 'd' USAGE u")},
       "attribute type a (1.1): changed by release, renamed -> new (only the release changed it)\n"
       "object class guard (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'guard' ) ABSTRACT MAY ( a ) )\n"},
  });
}

// The result of a migration is OLD of the next: its references bear the new name already.
TEST(ThreeWay, AReferenceThatFollowedARenameIsNoChange) {
  const std::string renamed = at("1.1 NAME 'b' DESC 'd' USAGE u");
  expectOutcomes({
      {"OfWhatIsKept",
       {kPlain + at("1.2 NAME 'k' SUP a USAGE u"),
        renamed + at("1.2 NAME 'k' SUP b USAGE u") + oc("9.1 NAME 'guard' ABSTRACT MAY ( k )"),
        renamed},
       "attribute type k (1.2): removed by release -> kept (the release removed it, but the site's "
       "object class guard (9.1) refers to it) ( 1.2 NAME ( 'k' ) SUP b USAGE u )\n"
       "object class guard (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'guard' ) ABSTRACT MAY ( k ) )\n"},
      {"OfWhatTheReleaseRemoved",
       {kPlain + oc("2.1 NAME 'c' ABSTRACT MUST ( a )"),
        renamed + oc("2.1 NAME 'c' ABSTRACT MUST ( b )"), renamed},
       "object class c (2.1): removed by release -> dropped (the release removed it, and the site "
       "had not changed it)\n"},
      {"NotWhereTheOldNameIsInUse",
       {kPlain + oc("2.1 NAME 'c' ABSTRACT MUST ( a )"),
        renamed + oc("2.1 NAME 'c' ABSTRACT MUST ( a $ b )"), renamed},
       "object class c (2.1): removed by release -> undecided (the release removed it, and the "
       "site had changed it)\n"},
  });
}

TEST(ThreeWay, AReferenceThatFollowsMeetsNoneTwice) {
  expectOutcomes({
      {"InOneList",
       {kPlain, kPlain + oc("9.1 NAME 'guard' ABSTRACT MUST ( a $ b )"),
        at("1.1 NAME 'b' DESC 'd' USAGE u")},
       "attribute type a (1.1): changed by release, renamed -> new (only the release changed it)\n"
       "object class guard (9.1): added by site -> added (the site added it) [MUST names 'a', "
       "which is called 'b' in the result: the reference follows] [what it names twice now is "
       "named once, in MUST rather than in MAY] ( 9.1 NAME ( 'guard' ) ABSTRACT MUST ( b ) )\n"},
  });
}

TEST(ThreeWay, AMemberThatMovesToMustIsToldAlsoWhereMayDidNotChange) {
  EXPECT_EQ(clausesOf({oc("2.1 NAME 'c' ABSTRACT MAY ( x )"),
                       oc("2.1 NAME 'c' ABSTRACT MUST ( x ) MAY ( x )"),
                       oc("2.1 NAME 'c' DESC 'n' ABSTRACT MAY ( x )")}),
            "DESC<><><'n'>=<'n'> cosmetic\n"
            "MUST<><x><>=<x> data\n"
            "MAY<x><x><x>=<> data\n");
}

TEST(ThreeWay, OfTwoThatTheSiteHasUnderOneOidOneIsWritten) {
  expectOutcomes({
      {"TheFirst",
       {"", at("9.1 NAME 'x' USAGE u") + at("9.1 NAME 'y' USAGE u"), ""},
       "attribute type x (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'x' ) USAGE u )\n"
       "attribute type y (9.1): added by site -> undecided (its OID 9.1 is that of OLD's attribute "
       "type x (9.1) too, and the library writes only that one)\n"},
      {"TheClass",
       {"", at("9.1 NAME 'x' USAGE u") + oc("9.1 NAME 'c' ABSTRACT"), ""},
       "attribute type x (9.1): added by site -> undecided (its OID 9.1 is that of OLD's object "
       "class c (9.1) too, and the library writes only that one)\n"
       "object class c (9.1): added by site -> added (the site added it) "
       "( 9.1 NAME ( 'c' ) ABSTRACT )\n"},
  });
}

// ---- Without BASE, and with a preference ----

TEST(ThreeWay, WithoutBaseNobodyCanTell) {
  expectOutcomes(
      {
          {"Same", {"", kPlain, kPlain}, ""},
          {"OnlyOldHasIt",
           {"", kPlain, ""},
           "attribute type a (1.1): unknown -> added (only OLD has it) "
           "( 1.1 NAME ( 'a' ) DESC 'd' USAGE u )\n"},
          {"OnlyNewHasIt",
           {"", "", kPlain},
           "attribute type a (1.1): unknown -> new (only NEW has it)\n"},
          {"TheyDiffer",
           {"", kSites, kPlain},
           "attribute type a (1.1): unknown -> undecided (OLD and NEW differ, and without BASE "
           "nobody can tell who changed: USAGE)\n"},
          {"ListsToo",
           {"", oc("2.1 NAME 'c' ABSTRACT MAY ( x )"), oc("2.1 NAME 'c' ABSTRACT MAY ( x $ y )")},
           "object class c (2.1): unknown -> undecided (OLD and NEW differ, and without BASE nobody "
           "can tell who changed: MAY)\n"},
          {"TheyDifferInDescAlone",
           {"", at("1.1 NAME 'a' DESC 's' USAGE u"), kPlain},
           "attribute type a (1.1): unknown -> old (OLD and NEW differ in DESC alone) [DESC "
           "differs; the site's is taken] ( 1.1 NAME ( 'a' ) DESC 's' USAGE u )\n"},
          {"TakenIsToldByTheReason",
           {"", at("9.1 NAME 'x' USAGE u"), at("1.5 NAME ( 'y' 'x' ) USAGE u")},
           "attribute type y (1.5): unknown -> new (only NEW has it)\n"
           "attribute type x (9.1): unknown -> undecided (its name 'x' belongs to NEW's attribute "
           "type y (1.5), which may be the same one, renamed)\n"},
      },
      Prefer::kNothing, false);
}

TEST(ThreeWay, APreferenceDecidesOnlyClausesInConflict) {
  const Inputs conflict = {kPlain, at("1.1 NAME 'a' DESC 's' SINGLE-VALUE USAGE site"),
                           at("1.1 NAME 'a' DESC 'r' USAGE release")};
  EXPECT_EQ(
      outcomesOf(conflict, Prefer::kOld),
      "attribute type a (1.1): changed by both, in conflict -> old (the site and the release "
      "changed it in two ways: USAGE; OLD's is preferred) [DESC differs; the site's is taken] "
      "( 1.1 NAME ( 'a' ) DESC 's' SINGLE-VALUE USAGE site )\n");
  EXPECT_EQ(outcomesOf(conflict, Prefer::kNew),
            "attribute type a (1.1): changed by both, in conflict -> merged (the site and the "
            "release changed it in two ways: USAGE; NEW's is preferred) [DESC differs; the new "
            "release's is preferred] ( 1.1 NAME ( 'a' ) DESC 'r' SINGLE-VALUE USAGE release )\n");
  expectOutcomes(
      {
          {"NotWhatWasRemoved",
           {kPlain, kSites, ""},
           "attribute type a (1.1): removed by release -> undecided (the release removed it, and "
           "the site had changed it)\n"},
          {"NotWhatIsTaken",
           {"", at("9.1 NAME 'x' USAGE u"), at("1.5 NAME ( 'y' 'x' ) USAGE u")},
           "attribute type y (1.5): added by release -> new (the release added it)\n"
           "attribute type x (9.1): taken -> undecided (its name 'x' belongs to NEW's attribute "
           "type y (1.5), which may be the same one, renamed)\n"},
          {"NotWhatHasTwoOids",
           {"", at("9.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE u")},
           "attribute type a (9.1): changed by both, in conflict, renumbered -> undecided (the site "
           "and the release each added it, and differ in: OID)\n"},
      },
      Prefer::kOld);
}

// ---- Clauses and risks ----

TEST(ThreeWay, ClausesAreToldWithTheirRisk) {
  const struct {
    const char* rule;
    Inputs inputs;
    const char* clauses;
  } cases[] = {
      {"MatchingRulesAndSyntaxAreOne",
       {at("1.1 NAME 'a' EQUALITY e SYNTAX 1.2{8} USAGE u"),
        at("1.1 NAME 'a' EQUALITY f SYNTAX 1.2{8} USAGE u"),
        at("1.1 NAME 'a' EQUALITY e SYNTAX 1.2{9} USAGE u")},
       "EQUALITY<e><f><e>=? data\n"
       "SYNTAX<1.2{8}><1.2{8}><1.2{9}>=? data\n"},
      {"WhatIsEqualAmongThemIsNotTold",
       {at("1.1 NAME 'a' EQUALITY e ORDERING o SUBSTR s SYNTAX 1.2{8}"),
        at("1.1 NAME 'a' EQUALITY e SUBSTR s SYNTAX 1.2{8}"),
        at("1.1 NAME 'a' EQUALITY e ORDERING o SUBSTR S SYNTAX 1.2{8}")},
       "ORDERING<o><><o>=? data\n"
       "SUBSTR<s><s><S>=? cosmetic\n"},
      {"SingleValueAdded",
       {at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE u"),
        at("1.1 NAME 'a' SINGLE-VALUE USAGE u")},
       "SINGLE-VALUE<><><SINGLE-VALUE>=<SINGLE-VALUE> data\n"},
      {"SingleValueRemoved",
       {at("1.1 NAME 'a' SINGLE-VALUE USAGE u"), at("1.1 NAME 'a' SINGLE-VALUE USAGE u"),
        at("1.1 NAME 'a' USAGE u")},
       "SINGLE-VALUE<SINGLE-VALUE><SINGLE-VALUE><>=<> structure\n"},
      {"MustAddedAndMayRemoved",
       {oc("2.1 NAME 'c' ABSTRACT MAY ( x )"), oc("2.1 NAME 'c' ABSTRACT MAY ( x )"),
        oc("2.1 NAME 'c' ABSTRACT MUST ( x )")},
       "MUST<><><x>=<x> data\nMAY<x><x><>=<> data\n"},
      {"MustRemovedAndMayAdded",
       {oc("2.1 NAME 'c' ABSTRACT MUST ( x )"), oc("2.1 NAME 'c' ABSTRACT MUST ( x )"),
        oc("2.1 NAME 'c' ABSTRACT MAY ( x )")},
       "MUST<x><x><>=<> structure\nMAY<><><x>=<x> structure\n"},
      {"LengthLowered",
       {kPlain + orv("1.1 LENGTH 9"), kPlain + orv("1.1 LENGTH 9"), kPlain + orv("1.1 LENGTH 8")},
       "LENGTH<9><9><8>=<8> data\n"},
      {"LengthGoneIsNoLimit",
       {kPlain + orv("1.1 LENGTH 9"), kPlain + orv("1.1 LENGTH 9"), kPlain + orv("1.1")},
       "LENGTH<9><9><>=<> structure\n"},
      {"DbName",
       {kPlain + orv("1.1 DBNAME ( 'a' )"), kPlain + orv("1.1 DBNAME ( 'a' )"),
        kPlain + orv("1.1 DBNAME ( 'a' 'a' )")},
       "DBNAME<'a'><'a'><'a' 'a'>=<'a' 'a'> data\n"},
      {"Structure",
       {at("1.1 NAME 'a' SUP s USAGE u"), at("1.1 NAME 'a' OBSOLETE SUP s USAGE u"),
        at("1.1 NAME 'a' SUP t NO-USER-MODIFICATION USAGE v")},
       "OBSOLETE<><OBSOLETE><>=<OBSOLETE> structure\n"
       "SUP<s><s><t>=<t> structure\n"
       "NO-USER-MODIFICATION<><><NO-USER-MODIFICATION>=<NO-USER-MODIFICATION> structure\n"
       "USAGE<u><u><v>=<v> structure\n"},
      {"AliasesAddedAndLetterCase",
       {at("1.1 NAME 'a' DESC 'd' EQUALITY e USAGE u"),
        at("1.1 NAME ( 'a' 'b' ) DESC 'd' EQUALITY e USAGE u"),
        at("1.1 NAME 'a' DESC 'x' EQUALITY e USAGE U")},
       "ALIASES<><'b'><>=<'b'> cosmetic\n"
       "DESC<'d'><'d'><'x'>=<'x'> cosmetic\n"
       "USAGE<u><u><U>=<U> cosmetic\n"},
      {"AliasRemoved",
       {at("1.1 NAME ( 'a' 'b' ) USAGE u"), at("1.1 NAME ( 'a' 'b' ) USAGE u"),
        at("1.1 NAME 'a' USAGE u")},
       "ALIASES<'b'><'b'><>=<> structure\n"},
  };
  for (const auto& row : cases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(clausesOf(row.inputs), row.clauses);
  }
}

// ---- Files and lists ----

TEST(ThreeWay, WhatNewHasOnlyInAConfigFileStaysUndecided) {
  const Installation base = installationOf("BASE", {{"V3.config.at", kPlain}});
  const Installation old = installationOf("OLD", {{"V3.config.at", kSites}});
  const Installation latest = installationOf("NEW", {{"V3.config.at", kPlain}});
  for (const Prefer prefer : {Prefer::kNothing, Prefer::kOld, Prefer::kNew}) {
    const ThreeWay result =
        migration::compareThreeWay({&base, &old, &latest, {}, {}, prefer, {}, false});
    ASSERT_EQ(result.differences.size(), 1U);
    EXPECT_EQ(outcomeOf(result.differences.front()),
              "attribute type a (1.1): changed by site -> undecided (NEW has it only in "
              "V3.config.at, which is carried over as it is, and the site changed it)");
  }
}

// The library's merge adds nothing to V3.modifiedschema.
TEST(ThreeWay, AnExtensionOfWhatNewHasInModifiedSchemaIsUndecided) {
  const Installation base = installationOf("BASE", {{"V3.modifiedschema", kPlain}});
  const Installation old = installationOf(
      "OLD", {{"V3.modifiedschema", kPlain}, {"V3.user.at", orv("1.1 DBNAME ( 'a' )")}});
  const Installation latest = installationOf("NEW", {{"V3.modifiedschema", kPlain}});
  const ThreeWay result =
      migration::compareThreeWay({&base, &old, &latest, {}, {}, Prefer::kOld, {}, false});
  ASSERT_EQ(result.differences.size(), 2U);
  EXPECT_EQ(outcomeOf(result.differences.back()),
            "vendor extension 1.1: added by site -> undecided (NEW has its attribute type in a "
            "config file or in V3.modifiedschema, to which the library adds nothing)");
}

// Nor what lies behind such a definition, or before one.
TEST(ThreeWay, WhatHasToStayNewsIsUndecidedWhereTheSiteChangedIt) {
  const std::string extension = orv("1.1 DBNAME ( 'a' )");
  const std::string secret = orv("1.1 DBNAME ( 'a' ) ACCESS-CLASS secret");
  const std::string renumbered = at("9.1 NAME 'a' DESC 'd' USAGE u");
  const struct {
    const char* rule;
    std::vector<NamedText> shipped;
    std::vector<NamedText> old;
    const char* outcomes;
  } cases[] = {
      {"AnExtensionBesideAnAttributeTypeThere",
       {{"V3.user.at", extension}, {"V3.config.at", kPlain}},
       {{"V3.user.at", secret}, {"V3.config.at", kPlain}},
       "vendor extension 1.1: changed by site -> undecided (NEW has its attribute type only in "
       "V3.config.at, which is carried over as it is)\n"},
      {"ARepeatThereOfWhatTheSiteRenumbered",
       {{"V3.user.at", kPlain}, {"V3.config.at", kPlain}},
       {{"V3.user.at", renumbered}},
       "attribute type a (9.1): changed by site, renumbered -> undecided (NEW's OID and first name "
       "have to stay, because of attribute type a (1.1) of V3.config.at:1 in NEW, which has one of "
       "them too)\n"},
      {"AnotherOfTheFirstNameThatTheSiteRenumbered",
       {{"V3.system.at", kPlain}, {"V3.user.at", at("1.2 NAME 'A' USAGE v")}},
       {{"V3.user.at", renumbered}},
       "attribute type a (9.1): changed by site, renumbered -> undecided (NEW's OID and first name "
       "have to stay, because of attribute type A (1.2) of V3.user.at:1 in NEW, which has one of "
       "them too)\n"},
      {"AnObjectClassOfTheOidOfWhatTheSiteRenamed",
       {{"V3.user.at", kPlain + oc("1.1 NAME 'c' ABSTRACT")}},
       {{"V3.user.at", at("1.1 NAME 'b' DESC 'd' USAGE u") + oc("1.1 NAME 'c' ABSTRACT")}},
       "attribute type b (1.1): changed by site, renamed -> undecided (NEW's OID and first name "
       "have to stay, because of object class c (1.1) of V3.user.at:2 in NEW, which has one of "
       "them too)\n"},
      {"TheSecondOfAnOid",
       {{"V3.user.at", kPlain + at("1.1 NAME 'b' USAGE u")}},
       {{"V3.user.at", kPlain + at("1.1 NAME 'b' USAGE site")}},
       "attribute type b (1.1): changed by site -> undecided (NEW has attribute type a (1.1) of "
       "V3.user.at:1 under its OID too, and the library finds only that one)\n"},
  };
  for (const auto& row : cases) {
    SCOPED_TRACE(row.rule);
    const Installation base = installationOf("BASE", row.shipped);
    const Installation old = installationOf("OLD", row.old);
    const Installation latest = installationOf("NEW", row.shipped);
    for (const Prefer prefer : {Prefer::kNothing, Prefer::kOld, Prefer::kNew}) {
      std::string text;
      for (const Verdict& verdict :
           migration::compareThreeWay({&base, &old, &latest, {}, {}, prefer, {}, false})
               .differences) {
        text += verdict.outcome == migration::Outcome::kSame ? "" : outcomeOf(verdict) + "\n";
      }
      EXPECT_EQ(text, row.outcomes);
    }
  }
}

TEST(ThreeWay, AnOidOfWhatDoesNotCountInNewIsTakenToo) {
  const Installation none = installationOf("BASE", {});
  const Installation old = inUserFile("OLD", at("1.2 NAME 'mine' USAGE u"));
  const Installation latest = inUserFile("NEW", kPlain + at("1.2 NAME 'a' USAGE u"));
  const ThreeWay result =
      migration::compareThreeWay({&none, &old, &latest, {}, {}, Prefer::kNothing, {}, false});
  ASSERT_EQ(result.differences.size(), 2U);
  EXPECT_EQ(outcomeOf(result.differences.back()),
            "attribute type mine (1.2): taken -> undecided (its OID 1.2 belongs to NEW's attribute "
            "type a (1.2) of V3.user.at:2)");
  ASSERT_EQ(result.uncountedOfNew.size(), 1U);
}

TEST(ThreeWay, AnAdditionGoesWhereTheMergePutsItsOid) {
  const struct {
    std::vector<NamedText> old;
    const char* file;
  } cases[] = {
      {{{"V3.system.at", kPlain}}, "V3.system.at"},
      {{{"V3.system.at", kPlain}, {"V3.orv.at", kPlain}}, "V3.orv.at"},
      {{{"V3.user.at", kPlain}, {"V3.user.oc", kPlain}}, "V3.user.oc"},
      {{{"V3.modifiedschema", kPlain}}, "V3.user.at"},
      {{{"V3.config.oc", kPlain}}, "V3.user.at"},
      {{{"V3.config.at", oc("2.1 NAME 'c' ABSTRACT")}}, "V3.user.oc"},
  };
  const Installation none = installationOf("NEW", {});
  for (const auto& row : cases) {
    SCOPED_TRACE(row.old.back().name);
    const Installation old = installationOf("OLD", row.old);
    const ThreeWay result =
        migration::compareThreeWay({&none, &old, &none, {}, {}, Prefer::kNothing, {}, false});
    ASSERT_EQ(result.differences.size(), 1U);
    EXPECT_EQ(result.differences.front().file, row.file);
  }
}

TEST(ThreeWay, ListsLeaveOutWhatOldBrings) {
  const Installation base = inUserFile("BASE", kPlain);
  const Installation old =
      inUserFile("OLD", kSites + orv("1.1 DBNAME ( 'x' )") + at("9.1 NAME 'b' USAGE u") +
                            orv("9.1 DBNAME ( 'b' )"));
  const Installation latest = inUserFile("NEW", kPlain);
  const auto outcomes = [&](const std::set<std::string>& excluded,
                            const std::set<std::string>& withdrawn) {
    std::string text;
    for (const Verdict& row :
         migration::compareThreeWay(
             {&base, &old, &latest, excluded, withdrawn, Prefer::kNothing, {}, false})
             .differences) {
      text += describe(row) + ": " + nameOf(row.change) + " -> " +
              std::string(wordOf(row.outcome)) + "\n";
    }
    return text;
  };
  EXPECT_EQ(outcomes({"1.1", "9.1"}, {}),
            "attribute type a (1.1): changed by site -> excluded\n"
            "attribute type b (9.1): added by site -> excluded\n"
            "vendor extension 1.1: added by site -> excluded\n"
            "vendor extension 9.1: added by site -> excluded\n");
  EXPECT_EQ(outcomes({}, {"1.1", "9.1"}),
            "attribute type a (1.1): changed by site -> withdrawn\n"
            "attribute type b (9.1): added by site -> withdrawn\n"
            "vendor extension 1.1: added by site -> added\n"
            "vendor extension 9.1: added by site -> withdrawn\n");
}

// ---- BASE ----

TEST(ThreeWay, ABaseThatEqualsOneOfTheOthersIsSuspicious) {
  const Installation plain = inUserFile("P", kPlain);
  const Installation again = inUserFile("Q", kPlain);
  const Installation other = inUserFile("R", kSites);
  const auto suspicion = [](const Installation& base, const Installation& old,
                            const Installation& latest) {
    return migration::compareThreeWay({&base, &old, &latest, {}, {}, Prefer::kNothing, {}, false})
        .suspiciousBase;
  };
  EXPECT_EQ(suspicion(plain, again, other), "OLD");
  EXPECT_EQ(suspicion(plain, other, again), "NEW");
  EXPECT_EQ(suspicion(plain, again, plain), "");
  EXPECT_EQ(suspicion(other, plain, again), "");
}

TEST(ThreeWay, SwappingTheSidesSwapsTheWords) {
  const Inputs inputs = {kPlain + at("1.2 NAME 'x' USAGE u"), kSites + at("1.3 NAME 'y' USAGE u"),
                         kReleases + at("1.2 NAME 'x' USAGE u") + at("1.4 NAME 'z' USAGE u")};
  const auto words = [](const Inputs& from) {
    std::multiset<std::string> found;
    const Installation base = inUserFile("BASE", from.base);
    const Installation old = inUserFile("OLD", from.old);
    const Installation latest = inUserFile("NEW", from.latest);
    for (const Verdict& row :
         migration::compareThreeWay({&base, &old, &latest, {}, {}, Prefer::kNothing, {}, false})
             .differences) {
      found.insert(describe(row) + " " + nameOf(row.change));
    }
    return found;
  };
  EXPECT_EQ(words(inputs),
            (std::multiset<std::string>{"attribute type a (1.1) changed by both, mergeable",
                                        "attribute type x (1.2) removed by site",
                                        "attribute type y (1.3) added by site",
                                        "attribute type z (1.4) added by release"}));
  EXPECT_EQ(words({inputs.base, inputs.latest, inputs.old}),
            (std::multiset<std::string>{"attribute type a (1.1) changed by both, mergeable",
                                        "attribute type x (1.2) removed by release",
                                        "attribute type y (1.3) added by release",
                                        "attribute type z (1.4) added by site"}));
}

}  // namespace
