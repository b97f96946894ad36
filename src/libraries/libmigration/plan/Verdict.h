// What became of one definition between the old release as shipped (BASE), the installation (OLD)
// and the new release (NEW), and what is to be done with it.

#ifndef LIBSCHEMA_MIGRATION_VERDICT_H
#define LIBSCHEMA_MIGRATION_VERDICT_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Content.h"
#include "Matching.h"
#include "Merge.h"

namespace migration {

// Who changed it.
enum class Change : std::uint8_t {
  kSame,
  kAddedBySite,
  kRemovedBySite,
  kChangedBySite,
  kAddedByRelease,
  kRemovedByRelease,
  kChangedByRelease,
  kMergeable,   // changed by both, mergeable
  kInConflict,  // changed by both, in conflict
  kTaken,       // an OID, name or DBNAME of it is another definition's in NEW
  kUnknown      // there is no BASE, and the two differ or one lacks it
};

// What is to come of it.
enum class Outcome : std::uint8_t {
  kOld,        // OLD's in the place of NEW's
  kNew,        // NEW's
  kSame,       // NEW's, which is OLD's too
  kMerged,     // clauses of both
  kAdded,      // OLD's, which NEW lacks
  kKept,       // OLD's, which the release removed and the site needs
  kDropped,    // nothing: the release removed it
  kGone,       // nothing: both removed it
  kExcluded,   // NEW's or nothing, by a list
  kWithdrawn,  // NEW's or nothing, by a list
  kText,       // what a decision gives
  kUndecided   // NEW's or nothing, until somebody decides
};

// "same", "added by site", …, "changed by both, mergeable"; with hyphens as in documents:
// "added-by-site", "changed-by-both-mergeable".
std::string nameOf(Change change);
std::string wordOf(Change change);
// "old", "new", …, "undecided".
std::string_view wordOf(Outcome outcome);

struct Verdict {
  MatchRow match;
  Change change = Change::kSame;
  Outcome outcome = Outcome::kSame;
  std::string reason;              // one sentence without a full stop
  std::vector<std::string> notes;  // what else is to be told
  bool isRenamed = false;          // OLD and NEW: one OID, two first names
  bool isRenumbered = false;       // one first name, two OIDs
  bool isTaken = false;            // also where the change is unknown
  bool isNewsOnly = false;         // nothing but NEW's can be taken
  // A definition of NEW that would count if this one went, or got another OID or first name.
  const Entry* behind = nullptr;
  Risk risk = Risk::kNone;
  std::vector<ClauseChange> clauses;
  // What stands in the result where it is not simply NEW's: of kOld, kMerged, kAdded, kKept, kText.
  std::optional<Content> result;
  std::string file;         // where the result goes when NEW does not have it: "V3.user.at"
  bool isTakenOut = false;  // a decision drops what NEW has
  std::string decision;     // where the decision about it stands, "FILE:LINE"; mostly empty
  // Whether NEW's has to go before the result's can come, instead of being replaced; whether the
  // library takes the two for equal.
  bool isNewsInTheWay = false;
  bool isEqualToNews = false;
  // Of what is carried: its definition as it stands in NEW's layout, from "(" to ")".
  std::string text;

  // BASE's, where references in it follow a rename that OLD and NEW share; mostly null.
  std::shared_ptr<const Content> followedBase;
  // Of an attribute type whose vendor extension goes with it: that of BASE, OLD and NEW, or null.
  std::array<const Entry*, 3> extensions{};

  // Of which kind the definition is.
  Kind kind() const { return match.kind; }
  // The definition by which it is called: OLD's, or NEW's, or BASE's.
  const Entry& entry() const;
  bool isUndecided() const { return outcome == Outcome::kUndecided; }
  // Whether the result has OLD's text, or some of it.
  bool isCarried() const { return result.has_value(); }
  // Whether the result has a definition at all.
  bool isInResult() const { return isCarried() || (match.latest != nullptr && !isTakenOut); }
};

// BASE's content, which must be there, as it is to be compared with OLD's and NEW's.
Content baseContentOf(const Verdict& difference);

// "attribute type cn (2.5.4.3)", by its first name and OID as entry() has them.
std::string describe(const Verdict& difference);
// Its first name; of a vendor extension that of its attribute type among `differences`, all those
// of one plan. Empty where there is none.
std::string firstNameOf(const Verdict& difference, const std::vector<Verdict>& differences);
// As above, and a vendor extension by the name of its attribute type among `differences`: "vendor
// extension of cn (2.5.4.3)".
std::string describe(const Verdict& difference, const std::vector<Verdict>& differences);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_VERDICT_H
