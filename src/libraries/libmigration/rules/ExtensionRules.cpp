// V: what vendor extensions say of their attribute types.

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "Check.h"
#include "Rule.h"
#include "RuleSupport.h"

namespace migration {

namespace {

bool isNumber(std::string_view text) {
  return !text.empty() &&
         std::all_of(text.begin(), text.end(), [](char c) { return c >= '0' && c <= '9'; });
}

std::string_view withoutZeros(std::string_view number) {
  return number.substr(std::min(number.find_first_not_of('0'), number.size()));
}

// Of any length.
bool isLess(std::string_view left, std::string_view right) {
  left = withoutZeros(left);
  right = withoutZeros(right);
  return left.size() != right.size() ? left.size() < right.size() : left < right;
}

void checkDatabaseNames(const Installation& installation, Findings* findings) {
  installation.forEachSharedAlias(
      Kind::kVendorExtension, [&](std::string_view name, const std::vector<const Entry*>& group) {
        const Entry& first = *group.front();
        const auto other = std::find_if(group.begin(), group.end(), [&](const Entry* entry) {
          return oidOf(*entry) != oidOf(first);
        });
        if (other == group.end()) {
          return;
        }
        addFinding("V601", Severity::kWarning, **other,
                   placeOfValue(**other, Clause::kDbName, name),
                   "its DBNAME " + std::string(name) + " is that of " + describeWithPlace(first) +
                       " as well, so that two attribute types would share one column; give one of "
                       "them another DBNAME",
                   findings);
      });
}

void checkLength(const Installation& installation, const Entry& entry, Findings* findings) {
  const std::string& length = entry.kept->extension().getLength();
  if (!isNumber(length) || withoutZeros(length).empty()) {
    return;
  }
  const Entry* const attribute = installation.attributeOf(entry);
  if (attribute == nullptr) {
    return;
  }
  const std::string ofSyntax = attribute->kept->attribute().getSyntaxLength();
  if (isNumber(ofSyntax) && isLess(length, ofSyntax)) {
    addFinding("V602", Severity::kWarning, entry, placeOfClause(entry, Clause::kLength),
               "LENGTH " + length + " is below the length in the SYNTAX of " +
                   describeWithPlace(*attribute) + ", " + ofSyntax +
                   ", so that values which the schema allows do not fit; raise LENGTH, or lower "
                   "the length in SYNTAX",
               findings);
  }
}

void checkAccessClass(const std::vector<std::string>& known, const Entry& entry,
                      Findings* findings) {
  const std::string& access = entry.kept->extension().getAccessClass();
  const bool hasClause = entry.written == nullptr ||
                         entry.file->written->find(*entry.written, Clause::kAccessClass) != nullptr;
  if (hasClause && std::find(known.begin(), known.end(), access) == known.end()) {
    std::string names;
    for (const std::string& each : known) {
      names += (names.empty() ? "" : ", ") + each;
    }
    addFinding("V603", Severity::kWarning, entry, placeOfValue(entry, Clause::kAccessClass, access),
               "ACCESS-CLASS " + access + " is none of those that are known (" + names +
                   "), so that the server may give access to nobody, or to everybody; correct it, "
                   "or add it to the known ones",
               findings);
  }
}

}  // namespace

void checkExtensions(const CheckRequest& request, Findings* findings) {
  checkDatabaseNames(*request.installation, findings);
  for (const Entry& entry : request.installation->entries()) {
    if (entry.kind() == Kind::kVendorExtension) {
      checkLength(*request.installation, entry, findings);
      if (!request.knownAccessClasses.empty()) {
        checkAccessClass(request.knownAccessClasses, entry, findings);
      }
    }
  }
}

const std::vector<RuleInfo>& extensionRules() {
  static const std::vector<RuleInfo> kRules = {
      {"V601",
       "database-name-twice",
       Severity::kWarning,
       "One DBNAME, in any letter case, stands in the vendor extensions of two OIDs.",
       "The values of two attribute types would go to one column of the database.",
       "Give one of them another DBNAME.",
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'door' DESC 'door' )\n"},
        {"V3.orv.at",
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 DBNAME ( 'badge' 'badge' ) )\n"
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.2 DBNAME ( 'door' 'BADGE' ) )\n"}},
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'door' DESC 'door' )\n"},
        {"V3.orv.at",
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 DBNAME ( 'badge' 'Badge' ) )\n"
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.2 DBNAME ( 'door' 'badges' ) )\n"}}},
      {"V602",
       "length-below-syntax",
       Severity::kWarning,
       "LENGTH of a vendor extension is below the length in the SYNTAX of its attribute type.",
       "Values that the schema allows do not fit into the column. LENGTH 0, or none, means no "
       "limit.",
       "Raise LENGTH, or lower the length in SYNTAX.",
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' "
         "SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{64} )\n"},
        {"V3.orv.at", "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 LENGTH 63 )\n"}},
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' "
         "SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{64} )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.2 NAME 'door' "
         "SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{64} )\n"},
        {"V3.orv.at",
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 LENGTH 64 )\n"
         "ORVAttributetypes=( 1.3.6.1.4.1.99999.2 LENGTH 0 )\n"}}},
      {"V603",
       "access-class-unknown",
       Severity::kWarning,
       "ACCESS-CLASS is none of those that the settings file names.",
       "The library keeps any word; a server that does not know it may give access to nobody, or to "
       "everybody.",
       "Correct it, or add it to the known access classes.",
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"V3.orv.at", "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 ACCESS-CLASS secret )\n"},
        {".schema-migrate.toml", "access-classes = [\"normal\", \"sensitive\"]\n"}},
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"V3.orv.at", "ORVAttributetypes=( 1.3.6.1.4.1.99999.1 ACCESS-CLASS sensitive )\n"},
        {".schema-migrate.toml", "access-classes = [\"normal\", \"sensitive\"]\n"}}},
  };
  return kRules;
}

}  // namespace migration
