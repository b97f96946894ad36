// What the rules about tables, references, lists, extensions and installations find, and what
// nearly has a finding and must not.

#include <gtest/gtest.h>

#include <string>

#include "CheckRun.h"

namespace {

using support::Files;

struct RuleCase {
  const char* name;
  Files files;
  const char* findings;
};

constexpr char kTop[] = "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n";
constexpr char kA[] = "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n";
constexpr char kDifferentA[] = "attributetypes=( 1.1 NAME 'a' DESC 'other' )\n";
constexpr char kB[] = "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n";

const RuleCase kTables[] = {
    {"FirstNameTwice",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'A' DESC 'd' )\n"}},
     "T301 error V3.user.at:2:16\n"},
    {"OidTwice",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.1 NAME 'b' DESC 'd' )\n"}},
     "T301 error V3.user.at:2:16\n"},
    {"NameAndOidOfOneOtherIsOneFinding",
     {{"V3.system.at", kA}, {"V3.user.at", kDifferentA}},
     "T301 error V3.user.at:1:16\n"},
    {"NameOfOneAndOidOfAnotherAreTwo",
     {{"V3.system.at", std::string_view("attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
                                        "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n")},
      {"V3.user.at", "attributetypes=( 1.1 NAME 'b' DESC 'd' )\n"}},
     "T301 error V3.user.at:1:16\nT301 error V3.user.at:1:16\n"},
    {"EqualRepeatsAreSilent", {{"V3.system.at", kA}, {"V3.orv.at", kA}, {"V3.user.at", kA}}, ""},
    {"EqualityIsAskedFromBothSides",
     {{"V3.system.at", "attributetypes=( 1.1 NAME ( 'a' 'A' ) DESC 'd' )\n"},
      {"V3.user.at", "attributetypes=( 1.1 NAME ( 'a' 'b' ) DESC 'd' )\n"}},
     "T301 error V3.user.at:1:16\n"},
    {"ModifiedDefinitionThatDiffersIsAWarning",
     {{"V3.modifiedschema", kDifferentA}, {"V3.system.at", kA}},
     "T301 warning V3.system.at:1:16\n"},
    {"EqualModifiedDefinitionIsSilent", {{"V3.modifiedschema", kA}, {"V3.system.at", kA}}, ""},
    {"TwoThatDifferInModifiedSchemaAreAnError",
     {{"V3.modifiedschema",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
       "attributetypes=( 1.1 NAME 'a' DESC 'e' )\n"},
      {"V3.user.at", kA}},
     "T301 error V3.modifiedschema:2:16\n"},
    {"TwoThatDifferBesideAModifiedOneAreAnError",
     {{"V3.modifiedschema", "attributetypes=( 1.1 NAME 'a' DESC 'm' )\n"},
      {"V3.system.at", kA},
      {"V3.user.at", kDifferentA}},
     "T301 warning V3.system.at:1:16\nT301 error V3.user.at:1:16\n"},
    {"KindsHaveTablesOfTheirOwn",
     {{"V3.user.at", kA},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'a' AUXILIARY )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'a' ) )\n"}},
     ""},
    {"ExtensionTwice",
     {{"V3.user.at", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\nORVAttributetypes=( 1.1 LENGTH 2 )\n"}},
     "T301 error V3.orv.at:2:19\n"},
    {"TwoWithoutANameShareTheNameTable",
     {{"V3.user.at", "attributetypes=( 1.1 DESC 'd' )\nattributetypes=( 1.2 DESC 'd' )\n"}},
     "T301 error V3.user.at:2:16\n"},
    {"OidThatAWordReplacedIsNoRepeat",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' X-ORIGIN 'RFC' )\n"
       "attributetypes=( 1.2 NAME 'b' DESC 'd' X-ORIGIN 'RFC' )\n"}},
     ""},

    {"AliasIsAnothersName",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
       "attributetypes=( 1.2 NAME ( 'b' 'A' ) DESC 'd' )\n"}},
     "T302 warning V3.user.at:2:33\n"},
    {"AliasIsAnothersNameThatComesLater",
     {{"V3.user.at",
       "attributetypes=( 1.2 NAME ( 'b' 'a' ) DESC 'd' )\n"
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"}},
     "T302 warning V3.user.at:1:33\n"},
    {"AliasOfTwo",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"
       "attributetypes=( 1.2 NAME ( 'b' 'x' ) DESC 'd' )\n"}},
     "T302 warning V3.user.at:2:33\n"},
    {"AliasOfOneOidTwice",
     {{"V3.modifiedschema", "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"},
      {"V3.user.at", "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"}},
     ""},
    {"AliasOfAnotherKind",
     {{"V3.user.at", "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'x' AUXILIARY )\n"}},
     ""},
    {"AliasThatAModifiedDefinitionTookOut",
     {{"V3.modifiedschema", "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"},
      {"V3.user.at",
       "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"
       "attributetypes=( 1.2 NAME 'x' DESC 'd' )\n"}},
     "T301 warning V3.user.at:1:16\n"},

    {"OidOfClassAndAttribute",
     {{"V3.user.at", kA}, {"V3.user.oc", "objectclasses=( 1.1 NAME 'c' AUXILIARY )\n"}},
     "T303 error V3.user.at:1:16\n"},

    {"ExtensionWithoutItsType",
     {{"V3.user.at", kA}, {"V3.orv.at", "ORVAttributetypes=( 1.10 LENGTH 1 )\n"}},
     "T304 error V3.orv.at:1:19\n"},
    {"ExtensionWithAClassOnly",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'c' AUXILIARY )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"}},
     "T304 error V3.orv.at:1:19\n"},
    {"ExtensionWhoseTypeLostItsOid",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' X-ORIGIN 'RFC' )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"}},
     ""},
    {"ExtensionInAFileOfAnyName",
     {{"V3.user.at",
       "ORVAttributetypes=( 1.1 LENGTH 1 )\nattributetypes=( 1.1 NAME 'a' DESC 'd' )\n"}},
     ""},

    {"ConfigIsToldForEach",
     {{"V3.user.at", kA},
      {"V3.config.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n"},
      {"V3.config.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY )\n"}},
     "T305 warning V3.config.at:1:16\nT305 warning V3.config.at:2:16\n"
     "T305 warning V3.config.oc:1:15\n"},

    {"OnlyInModifiedSchema",
     {{"V3.modifiedschema",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n"},
      {"V3.config.at", kA}},
     "T306 warning V3.modifiedschema:2:16\nT305 warning V3.config.at:1:16\n"},
    {"TypeInModifiedSchemaAndExtensionElsewhere",
     {{"V3.modifiedschema", kA}, {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"}},
     "T306 warning V3.modifiedschema:1:16\n"},
    {"ModifiedDefinitionWhoseOtherOneIsNotKept",
     {{"V3.modifiedschema", kA},
      {"V3.user.at",
       "attributetypes=( 1.2 NAME 'b' DESC 'd' attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"}},
     ""},

    {"WithdrawnAndInAnotherFile",
     {{"V3.modifiedschema", kA}, {"V3.system.at", kA}, {"withdraw.txt", "# a\n 1.1\n"}},
     "T307 warning withdraw.txt:2:2\n"},
    {"WithdrawnAndWrittenThroughItsExtension",
     {{"V3.modifiedschema", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"},
      {"withdraw.txt", "1.1\n"}},
     "T306 warning V3.modifiedschema:1:16\nT307 warning withdraw.txt:1:1\n"},
    {"WithdrawnAndWithoutAModifiedDefinition",
     {{"V3.user.at", kA}, {"withdraw.txt", "1.1\n"}},
     "T307 warning withdraw.txt:1:1\n"},
    {"WithdrawnExtensionIsNotWritten",
     {{"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"}, {"withdraw.txt", "1.1\n"}},
     "T304 error V3.orv.at:1:19\n"},
    {"WithdrawnAndInAConfigFileOnly",
     {{"V3.modifiedschema", kA}, {"V3.config.at", kA}, {"withdraw.txt", "1.1\n"}},
     "T305 warning V3.config.at:1:16\n"},
    {"ExclusionAloneIsNoWithdrawal",
     {{"V3.modifiedschema", kA}, {"V3.system.at", kA}, {"exclude.txt", "1.1\n"}},
     ""},
};

const RuleCase kReferences[] = {
    {"MustAndMayNameNothing",
     {{"V3.user.at", kA},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( a $ x ) MAY ( y ) )\n"}},
     "R401 error V3.user.oc:1:51\nR401 error V3.user.oc:1:61\n"},
    {"SupNamesNothing",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' SUP x )\n"},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' SUP y STRUCTURAL )\n"}},
     "R401 error V3.user.at:1:35\nR401 error V3.user.oc:1:34\n"},
    {"AnyNameInAnyLetterCaseInAnyFile",
     {{"V3.config.at", "attributetypes=( 1.1 NAME ( 'a' 'Alias' ) DESC 'd' )\n"},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( A $ aLIAS ) )\n"}},
     "T305 warning V3.config.at:1:16\n"},
    {"SupByOid",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' SUP 1.1 )\n"}},
     ""},
    {"RightKind",
     {{"V3.user.at", kA}, {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' SUP a STRUCTURAL )\n"}},
     "R401 error V3.user.oc:1:34\n"},
    {"MatchingRulesAndSyntaxesAreNotLookedUp",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' EQUALITY x ORDERING y SUBSTR z SYNTAX 9.9 )\n"}},
     ""},
    {"DefinitionThatIsOnlyWritten",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( b ) )\n"}},
     ""},
    {"ReferenceThatIsOnlyWritten",
     {{"V3.user.oc",
       "objectclasses=( 1.8 NAME 'b' AUXILIARY DESC 'd'\n"
       "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( x ) )\n"}},
     "R401 error V3.user.oc:2:47\n"},
    {"ExtensionOfTheName",
     {{"V3.user.at", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'column' ) )\n"},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( column ) )\n"}},
     "R401 error V3.user.oc:1:47\n"},

    {"LoopOfThree",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' SUP c )\nattributetypes=( 1.2 NAME 'b' SUP a )\n"
       "attributetypes=( 1.3 NAME 'c' SUP b )\nattributetypes=( 1.4 NAME 'd' SUP a )\n"}},
     "R402 error V3.user.at:1:31\n"},
    {"OwnSuperior",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME ( 'a' 'x' ) SUP X STRUCTURAL )\n"}},
     "R402 error V3.user.oc:1:38\n"},
    {"TwoLoops",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' SUP b )\nattributetypes=( 1.2 NAME 'b' SUP a )\n"
       "attributetypes=( 1.3 NAME 'c' SUP d )\nattributetypes=( 1.4 NAME 'd' SUP c )\n"}},
     "R402 error V3.user.at:1:31\nR402 error V3.user.at:3:31\n"},
    {"LoopThatAlsoLeadsToWhatIsNone",
     {{"V3.user.oc",
       "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\n"
       "objectclasses=( 1.2 NAME 'b' SUP ( a $ c ) STRUCTURAL )\n"
       "objectclasses=( 1.3 NAME 'c' SUP b STRUCTURAL )\n"}},
     "R402 error V3.user.oc:3:30\n"},
    {"TwoWaysToOneSuperior",
     {{"V3.user.oc",
       "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\n"
       "objectclasses=( 1.2 NAME 'b' SUP top STRUCTURAL )\n"
       "objectclasses=( 1.3 NAME 'c' SUP ( a $ b ) STRUCTURAL )\n"}},
     ""},

    {"StructuralBelowAuxiliary",
     {{"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' AUXILIARY )\nobjectclasses=( 1.2 NAME 'b' SUP a STRUCTURAL )\n"}},
     "R403 warning V3.user.oc:2:34\n"},
    {"AuxiliaryBelowStructural",
     {{"V3.system.oc", kTop},
      {"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\nobjectclasses=( 1.2 NAME 'b' SUP a AUXILIARY )\n"}},
     "R403 warning V3.user.oc:2:34\n"},
    {"AbstractBelowStructural",
     {{"V3.system.oc", kTop},
      {"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\nobjectclasses=( 1.2 NAME 'b' SUP a ABSTRACT )\n"}},
     "R403 warning V3.user.oc:2:34\n"},
    {"AbstractSuitsEveryKind",
     {{"V3.system.oc", kTop},
      {"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\nobjectclasses=( 1.2 NAME 'b' SUP top AUXILIARY )\n"
       "objectclasses=( 1.3 NAME 'c' SUP top ABSTRACT )\n"}},
     ""},
    {"StructuralWithoutAnAbstractClassAtTheTop",
     {{"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' STRUCTURAL )\nobjectclasses=( 1.2 NAME 'b' SUP a STRUCTURAL )\n"}},
     "R403 warning V3.user.oc:1:15\n"},
    {"ClassWithoutAKindIsStructural",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' DESC 'd' )\n"}},
     "R403 warning V3.user.oc:1:15\n"},
    {"AuxiliaryNeedsNoSuperior",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' AUXILIARY )\n"}},
     ""},

    {"NameMeansAnotherOidThere",
     {{"V3.user.at", kA},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( a ) )\n"},
      {"against/V3.user.at", "attributetypes=( 1.5 NAME 'a' DESC 'd' )\n"}},
     "R404 warning V3.user.oc:1:47\n"},
    {"SuperiorMeansAnotherOidThere",
     {{"V3.user.oc",
       "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\nobjectclasses=( 1.9 NAME 'c' SUP top STRUCTURAL )\n"},
      {"against/V3.user.oc", "objectclasses=( 1.5 NAME ( 'x' 'top' ) ABSTRACT )\n"}},
     "R404 warning V3.user.oc:2:34\n"},
    {"SuperiorOfAnAttributeTypeIsNotConcerned",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' SUP a )\n"},
      {"against/V3.user.at", "attributetypes=( 1.5 NAME 'a' DESC 'd' )\n"}},
     ""},
    {"NameThatIsNotThere",
     {{"V3.user.at", kA},
      {"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( a ) )\n"},
      {"against/V3.user.at", kB}},
     ""},

    {"SuperiorBehindItsUse",
     {{"V3.user.at",
       "attributetypes=( 1.2 NAME 'b' SUP a )\nattributetypes=( 1.1 NAME 'a' DESC 'd' )\n"}},
     "R405 warning V3.user.at:1:35\n"},
    {"SuperiorInALaterFile",
     {{"V3.system.oc", "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\n"},
      {"V3.user.oc", kTop}},
     ""},
    {"SuperiorInAnEarlierFileAsWell",
     {{"V3.system.oc", kTop},
      {"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' SUP top STRUCTURAL )\nobjectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"}},
     ""},
    {"MembersMayComeLater",
     {{"V3.user.at",
       "objectclasses=( 1.9 NAME 'c' AUXILIARY MUST ( a ) )\nattributetypes=( 1.1 NAME 'a' DESC 'd' )\n"}},
     ""},
};

const RuleCase kLists[] = {
    {"LastWord", {{"V3.user.at", kA}, {"exclude.txt", "1.1"}}, "O501 error exclude.txt:1:1\n"},
    {"LastWordBeforeABlank", {{"V3.user.at", kA}, {"exclude.txt", "1.1 "}}, ""},
    {"HashInAWord",
     {{"V3.user.at", kA}, {"exclude.txt", "\n1.1#badge\n"}},
     "O501 error exclude.txt:2:1\n"},
    {"HashInTheLastWordIsOneFinding",
     {{"V3.user.at", kA}, {"exclude.txt", "1.1#badge"}},
     "O501 error exclude.txt:1:1\n"},
    {"LostWordThatStandsElsewhere",
     {{"V3.user.at", kA}, {"exclude.txt", "1.1 1.1#again\n1.1"}},
     "O501 warning exclude.txt:1:5\nO501 warning exclude.txt:2:1\n"},
    {"Comments",
     {{"V3.user.at", kA}, {"exclude.txt", "#1.9 1.8\n# 1.7#1\n1.1 # badge#1 x\n#end"}},
     ""},
    {"CommentWithoutALineEnd", {{"V3.user.at", kA}, {"exclude.txt", "1.1 # the last 1.9"}}, ""},
    {"NoOid",
     {{"V3.user.at", kA}, {"exclude.txt", "a 1.1,1.2 '1.1' 1.01 1 .1 1. 1..1\n"}},
     "O502 error exclude.txt:1:1\nO502 error exclude.txt:1:3\nO502 error exclude.txt:1:11\n"
     "O502 error exclude.txt:1:17\nO502 error exclude.txt:1:22\nO502 error exclude.txt:1:24\n"
     "O502 error exclude.txt:1:27\nO502 error exclude.txt:1:30\n"},
    {"WordThatADefinitionHasForItsOid",
     {{"V3.user.at", "attributetypes=( a-oid NAME 'a' DESC 'd' )\n"}, {"exclude.txt", "a-oid\n"}},
     ""},
    {"OidOfNoDefinition",
     {{"V3.user.at", kA}, {"exclude.txt", "1.1 1.10 1.0\n"}, {"withdraw.txt", "1.2\n"}},
     "O503 error exclude.txt:1:5\nO503 error exclude.txt:1:10\nO503 error withdraw.txt:1:1\n"},
    {"OidOfAnyKind",
     {{"V3.user.oc", "objectclasses=( 1.9 NAME 'c' AUXILIARY )\n"}, {"exclude.txt", "1.9\n"}},
     ""},
    {"OidThatIsOnlyWritten",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' X-ORIGIN 'RFC' )\n"},
      {"exclude.txt", "1.1\n"}},
     ""},
    {"Twice",
     {{"V3.user.at", kA}, {"exclude.txt", "1.1\n1.1 1.1\n"}},
     "O504 warning exclude.txt:2:1\nO504 warning exclude.txt:2:5\n"},
    {"OnceInEachOfTwoLists",
     {{"V3.user.at", kA}, {"exclude.txt", "1.1\n"}, {"exclude-more.txt", "1.1\n"}},
     ""},
    {"ListsStandBehindTheFilesInTheirOrder",
     {{"V3.config.at", kA},
      {"exclude-z.txt", "1.5\n"},
      {"exclude-a.txt", "1.6\n"},
      {"withdraw.txt", "1.7\n"}},
     "T305 warning V3.config.at:1:16\nO503 error exclude-z.txt:1:1\nO503 error exclude-a.txt:1:1\n"
     "O503 error withdraw.txt:1:1\n"},
};

const RuleCase kExtensions[] = {
    {"DatabaseNameOfTwo",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
       "attributetypes=( 1.3 NAME 'c' DESC 'd' )\n"},
      {"V3.orv.at",
       "ORVAttributetypes=( 1.1 DBNAME ( 'x' 'y' ) )\nORVAttributetypes=( 1.2 DBNAME ( 'z' 'Y' ) )\n"
       "ORVAttributetypes=( 1.3 DBNAME ( 'y' 'z' ) )\n"}},
     "V601 warning V3.orv.at:2:38\nV601 warning V3.orv.at:3:38\n"},
    {"DatabaseNameOfOneTwice",
     {{"V3.user.at", kA}, {"V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'x' 'X' ) )\n"}},
     ""},
    {"DatabaseNameOfOneOidInTwoFiles",
     {{"V3.user.at", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'x' ) )\n"},
      {"V3.config.at", "ORVAttributetypes=( 1.1 DBNAME ( 'x' ) )\n"}},
     "T305 warning V3.config.at:1:19\n"},
    {"LengthBelowSyntax",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' SYNTAX 1.5{100} )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 99 )\n"}},
     "V602 warning V3.orv.at:1:25\n"},
    {"LengthOfTheSyntax",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' SYNTAX 1.5{100} )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 100 )\n"}},
     ""},
    {"LengthZeroOrNoneIsNoLimit",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' SYNTAX 1.5{100} )\nattributetypes=( 1.2 NAME 'b' SYNTAX 1.5{100} )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 0 )\nORVAttributetypes=( 1.2 EQUALITY )\n"}},
     ""},
    {"SyntaxWithoutALength",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' SYNTAX 1.5 )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"}},
     ""},
    {"LengthsOfAnySize",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' SYNTAX 1.5{0100000000000000000000000000} )\n"},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 99999999999999999999999999 )\n"}},
     "V602 warning V3.orv.at:1:25\n"},
    {"AccessClassUnknown",
     {{"V3.user.at", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 ACCESS-CLASS Normal )\n"},
      {".schema-migrate.toml", "access-classes = [\"normal\"]\n"}},
     "V603 warning V3.orv.at:1:38\n"},
    {"AccessClassIsNotAskedAboutWithoutSettings",
     {{"V3.user.at", kA}, {"V3.orv.at", "ORVAttributetypes=( 1.1 ACCESS-CLASS x )\n"}},
     ""},
    {"AccessClassThatIsNotGiven",
     {{"V3.user.at", kA},
      {"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 1 )\n"},
      {".schema-migrate.toml", "access-classes = [\"critical\"]\n"}},
     ""},
};

const RuleCase kInstallations[] = {
    {"FileThatTheOtherHas",
     {{"V3.user.at", kA}, {"against/V3.user.at", kA}, {"against/V3.orv.oc", ""}},
     "I701 warning V3.orv.oc:0:0\n"},
    {"FileThatTheOtherHasNot",
     {{"V3.user.at", kA}, {"V3.orv.oc", ""}, {"against/V3.user.at", kA}},
     ""},
    {"UnknownFile", {{"V3.user.at", kA}, {"V3.user.xt", ""}}, "I702 warning V3.user.xt:0:0\n"},
    {"LetterCaseSilencesUnknown",
     {{"V3.user.at", kA}, {"v3.USER.oc", ""}},
     "I703 warning v3.USER.oc:0:0\n"},
    {"OtherFiles",
     {{"V3.user.at", kA}, {"README", ""}, {"V3", ""}, {"V3user.at", ""}, {"v3.notes", ""}},
     ""},
};

class RuleCases : public testing::Test {
 protected:
  template <std::size_t kCount>
  static void expectFindings(const RuleCase (&cases)[kCount]) {
    for (const RuleCase& row : cases) {
      SCOPED_TRACE(row.name);
      EXPECT_EQ(row.findings, support::linesOf(support::findingsOf(row.files), "TROVI"));
    }
  }
};

TEST_F(RuleCases, Tables) { expectFindings(kTables); }
TEST_F(RuleCases, References) { expectFindings(kReferences); }
TEST_F(RuleCases, Lists) { expectFindings(kLists); }
TEST_F(RuleCases, Extensions) { expectFindings(kExtensions); }
TEST_F(RuleCases, Installations) { expectFindings(kInstallations); }

}  // namespace
