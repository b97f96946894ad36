// The pages of the rules about references.

#include "Rule.h"

namespace migration {

namespace {

// Pieces of the examples.
constexpr std::string_view kTop = "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n";
constexpr std::string_view kBadge =
    "attributetypes=( 1.3.6.1.4.1.99999.1 NAME ( 'badge' 'pass' ) DESC 'badge' )\n";
constexpr std::string_view kVisitor =
    "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' AUXILIARY MAY ( badge ) )\n";

std::vector<RuleInfo> pagesOfNames() {
  return {
      {"R401",
       "names-nothing",
       Severity::kError,
       "SUP, MUST or MAY names what no definition of the right kind has for a name or OID, in any "
       "of the nine files.",
       "A server may refuse the whole schema for it, or drop the class without a word.",
       "Correct the name, define what is missing, or take the name out. Matching rules and syntaxes "
       "are not looked up.",
       {{"V3.user.oc",
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' AUXILIARY MAY ( badge ) )\n"}},
       {{"V3.user.at", kBadge},
        {"V3.user.oc",
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' AUXILIARY MAY ( badge $ PASS ) )\n"}}},
      {"R402",
       "loop-of-superiors",
       Severity::kError,
       "Definitions are each other's superiors, or one is its own.",
       "What they inherit has no beginning; a server may not start, or never end.",
       "Take the superior out of one of them.",
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' SUP card )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'card' SUP badge )\n"}},
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'card' SUP badge )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.3 NAME 'pass' SUP badge )\n"}}},
  };
}

std::vector<RuleInfo> pagesOfSuperiors() {
  return {
      {"R403",
       "superior-of-another-kind",
       Severity::kWarning,
       "The superior of a class is of another kind (STRUCTURAL, AUXILIARY) and not ABSTRACT, or a "
       "structural class has no superior, so that no abstract class is at the top.",
       "A server may refuse the class.",
       "Choose a superior of the same kind, or an ABSTRACT one; write SUP top.",
       {{"V3.user.oc",
         "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' SUP top STRUCTURAL )\n"
         "objectclasses=( 1.3.6.1.4.1.99999.3 NAME 'guest' SUP visitor AUXILIARY )\n"}},
       {{"V3.user.oc",
         "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' SUP top STRUCTURAL )\n"
         "objectclasses=( 1.3.6.1.4.1.99999.3 NAME 'guest' SUP top AUXILIARY )\n"}}},
      {"R404",
       "name-means-another-oid",
       Severity::kWarning,
       "A name in a clause of a class stands for one OID here and for another in the other "
       "installation.",
       "Carried over, the class would mean another attribute type, or another superior.",
       "Rename one of the two, or refer to one that both have.",
       {{"V3.user.at", kBadge},
        {"V3.user.oc", kVisitor},
        {"against/V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.9 NAME 'badge' DESC 'badge' )\n"}},
       {{"V3.user.at", kBadge},
        {"V3.user.oc", kVisitor},
        {"against/V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME ( 'card' 'badge' ) DESC 'card' )\n"}}},
      {"R405",
       "superior-behind-its-use",
       Severity::kWarning,
       "A superior stands in the same file, behind the definition that names it.",
       "A server that reads the file from its beginning does not know it yet.",
       "Move the superior before its use.",
       {{"V3.user.oc",
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' SUP top STRUCTURAL )\n"
         "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT )\n"}},
       {{"V3.system.oc", kTop},
        {"V3.user.oc",
         "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' SUP top STRUCTURAL )\n"
         "objectclasses=( 1.3.6.1.4.1.99999.3 NAME 'guest' SUP visitor STRUCTURAL )\n"}}},
  };
}

std::vector<RuleInfo> allPages() {
  std::vector<RuleInfo> pages = pagesOfNames();
  const std::vector<RuleInfo> more = pagesOfSuperiors();
  pages.insert(pages.end(), more.begin(), more.end());
  return pages;
}

}  // namespace

const std::vector<RuleInfo>& referenceRules() {
  static const std::vector<RuleInfo> rules = allPages();
  return rules;
}

}  // namespace migration
