// The pages of the rules about the library's tables.

#include "Rule.h"

namespace migration {

namespace {

// Pieces of the examples.
constexpr std::string_view kBadge =
    "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n";
constexpr std::string_view kVisitor =
    "objectclasses=( 1.3.6.1.4.1.99999.1 NAME 'visitor' AUXILIARY )\n";
constexpr std::string_view kBadgeColumn =
    "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 DBNAME ( 'badge' 'badge' ) )\n";

std::vector<RuleInfo> pagesOfKeys() {
  return {
      {"T301",
       "key-twice",
       Severity::kError,
       "Two definitions that differ have the same first name, or the same OID.",
       "The library's tables keep the first one that is read, V3.modifiedschema before all other "
       "files; the other one is neither compared nor written. A definition in V3.modifiedschema "
       "that differs from one elsewhere is a warning, since a change on the server leaves it so.",
       "Delete one of the two, or give one another name and OID.",
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'on paper' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'Badge' DESC 'of plastic' )\n"}},
       {{"V3.system.at", kBadge}, {"V3.user.at", kBadge}}},
      {"T302",
       "alias-of-two",
       Severity::kWarning,
       "A further name of a definition is a name of another one, with another OID.",
       "The library finds definitions by their first names, servers by any name: which of the two "
       "is meant where the name is used depends on who reads it.",
       "Take the alias out of one of them.",
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME ( 'card' 'badge' ) DESC 'card' )\n"}},
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME ( 'badge' 'pass' ) DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME ( 'card' 'badges' ) DESC 'card' )\n"}}},
      {"T303",
       "oid-of-two-kinds",
       Severity::kError,
       "An object class and an attribute type have the same OID.",
       "Where the OID is to be written the library writes the object class; the attribute type, and "
       "its vendor extension, are lost.",
       "Give one of them an OID of its own.",
       {{"V3.user.at", kBadge}, {"V3.user.oc", kVisitor}},
       {{"V3.user.at", kBadge},
        {"V3.user.oc", "objectclasses=( 1.3.6.1.4.1.99999.10 NAME 'badge' AUXILIARY )\n"}}},
  };
}

std::vector<RuleInfo> pagesOfFiles() {
  return {
      {"T304",
       "extension-without-type",
       Severity::kError,
       "No attribute type has the OID of a vendor extension.",
       "The library writes an extension only behind its attribute type, so that this one is never "
       "written.",
       "Define the attribute type, or delete the extension.",
       {{"V3.orv.at", kBadgeColumn}},
       {{"V3.user.at", kBadge}, {"V3.orv.at", kBadgeColumn}}},
      {"T305",
       "never-written",
       Severity::kWarning,
       "A definition stands in V3.config.at or V3.config.oc.",
       "The library reads these two files and never writes them: what the new release does not "
       "have in its own configuration files is not carried over.",
       "Move it to V3.user.at or V3.user.oc if the new release has to have it.",
       {{"V3.config.at", kBadge}},
       {{"V3.user.at", kBadge}}},
      {"T306",
       "only-in-modified-schema",
       Severity::kWarning,
       "A definition stands in V3.modifiedschema and in no other file.",
       "V3.modifiedschema holds changes to definitions of other files; what it has alone is gone as "
       "soon as it is withdrawn or the file is emptied.",
       "Define it in V3.user.at or V3.user.oc as well if it has to stay.",
       {{"V3.modifiedschema", kBadge}},
       {{"V3.modifiedschema", kBadge}, {"V3.user.at", kBadge}}},
      {"T307",
       "withdrawn-and-written",
       Severity::kWarning,
       "An OID of the list of withdrawals stands in another file than V3.modifiedschema.",
       "Withdrawing takes a definition out of V3.modifiedschema and out of what is compared, but "
       "every other file that was read with its OID, be it that of the vendor extension, is still "
       "written with it.",
       "Exclude the OID instead.",
       {{"V3.modifiedschema", kBadge},
        {"V3.user.at", kBadge},
        {"withdraw.txt", "1.3.6.1.4.1.99999.1\n"}},
       {{"V3.modifiedschema", kBadge},
        {"V3.config.at", kBadge},
        {"V3.user.oc", "objectclasses=( 1.3.6.1.4.1.99999.10 NAME 'visitor' AUXILIARY )\n"},
        {"withdraw.txt", "1.3.6.1.4.1.99999.1\n"}}},
  };
}

std::vector<RuleInfo> allPages() {
  std::vector<RuleInfo> pages = pagesOfKeys();
  const std::vector<RuleInfo> more = pagesOfFiles();
  pages.insert(pages.end(), more.begin(), more.end());
  return pages;
}

}  // namespace

const std::vector<RuleInfo>& tableRules() {
  static const std::vector<RuleInfo> rules = allPages();
  return rules;
}

}  // namespace migration
