// The three-way comparison of installations: every definition of BASE, OLD and NEW with who changed
// it and what is to come of it. Nothing is changed by it. Without BASE nobody can tell who changed
// what: then every definition that is not the same is unknown.

#ifndef LIBSCHEMA_MIGRATION_THREE_WAY_H
#define LIBSCHEMA_MIGRATION_THREE_WAY_H

#include <set>
#include <string>
#include <vector>

#include "Decisions.h"
#include "Installation.h"
#include "Verdict.h"

namespace migration {

// What is compared, and how. The installations must stay in place.
struct ThreeWayRequest {
  const Installation* base = nullptr;  // null without one
  const Installation* old = nullptr;
  const Installation* latest = nullptr;  // NEW
  std::set<std::string> excluded;        // OIDs as OLD has them
  std::set<std::string> withdrawn;
  Prefer prefer = Prefer::kNothing;
  std::vector<Decision> decisions;
  bool allowUnused = false;  // decisions that match nothing, or are for other texts
};

struct ThreeWay {
  // What NEW has in its order, and behind it what only OLD, and then only BASE, has; attribute
  // types, object classes, vendor extensions. They refer to the installations.
  std::vector<Verdict> differences;

  // Definitions of NEW that do not count beside another one: a second of its first name, or of its
  // OID. They stay where they are.
  std::vector<const Entry*> uncountedOfNew;

  // "OLD" or "NEW" when BASE equals that one definition by definition while OLD and NEW differ:
  // often a wrong argument. Empty otherwise.
  std::string suspiciousBase;

  // Decisions that could not be carried out.
  Failures failures;
};

// All steps below, one after the other.
ThreeWay compareThreeWay(const ThreeWayRequest& request);

// ---- Its steps, in their order ----

// References of BASE follow a rename that OLD and NEW share.
void followSharedRenames(std::vector<Verdict>* differences);

// Who changed it and what comes of it, each definition for itself.
void classify(const ThreeWayRequest& request, std::vector<Verdict>* differences);
// The same for one definition, without what holds beside the classes but with the preference.
void judgeAlone(const ThreeWayRequest& request, Verdict* difference);

// What stands in a config file of NEW's, and the site changed, can only be NEW's; so can the OID
// and first name of what has another definition behind it.
void keepNewsOwn(const Installation& latest, const std::vector<const Entry*>& uncountedOfNew,
                 std::vector<Verdict>* differences);
bool hasOtherIdentity(const Content& content, const Entry& latest);
std::string whyIdentityStays(const Verdict& difference);
// Why a vendor extension that NEW lacks cannot be carried.
constexpr const char* kNothingBesideItsType =
    "NEW has its attribute type in a config file or in V3.modifiedschema, to which the library adds "
    "nothing";

// What OLD brings with an OID, a name or a DBNAME that NEW gives to another definition, which keeps
// it in the result, is taken.
void findTaken(const ThreeWayRequest& request, const std::vector<const Entry*>& uncountedOfNew,
               std::vector<Verdict>* differences);
class ResultIndex;
// Marks one definition so, and tells whether it did; `index` has what NEW gives.
bool markIfTaken(const ResultIndex& index, Verdict* difference);
// The names of OLD's definition, which must be there, that are those of others in NEW.
Values takenNames(const ResultIndex& index, const Verdict& difference);

// What the library would not write beside another definition of OLD's is undecided.
void findDoubled(const ThreeWayRequest& request, std::vector<Verdict>* differences);

// What the lists name is left out.
void applyLists(const ThreeWayRequest& request, std::vector<Verdict>* differences);

// Decides the clauses in conflict of what OLD and NEW both have under one OID.
void applyPreference(const ThreeWayRequest& request, std::vector<Verdict>* differences);
bool isOpenToPreference(const Verdict& difference);

// Vendor extensions go with an attribute type that OLD or NEW lacks, or that is taken.
void joinExtensions(const ThreeWayRequest& request, std::vector<Verdict>* differences);
void joinExtension(const ThreeWayRequest& request, const Verdict& type, Verdict* extension);
// Notes them with those attribute types.
void noteExtensions(std::vector<Verdict>* differences);

// The vendor extensions that come with what is kept or decided may have a DBNAME that is taken.
void findTakenExtensions(std::vector<Verdict>* differences);

// Vendor extensions have the OID that their attribute type has in the result.
void followOids(std::vector<Verdict>* differences);

// What the release removed is kept where something of the site's that stays refers to it, and
// references to what the release renamed follow.
void settleReferences(const std::vector<const Entry*>& uncountedOfNew,
                      std::vector<Verdict>* differences);

// The files that what NEW does not have goes to.
void placeAdditions(const Installation& old, std::vector<Verdict>* differences);

// How what is carried stands in NEW's layout.
void writeTexts(std::vector<Verdict>* differences);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_THREE_WAY_H
