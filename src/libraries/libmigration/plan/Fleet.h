// What the saved plans of many installations say together: who has which definition and how, what
// is undecided anywhere, and which decisions settle it at how many of them.

#ifndef LIBSCHEMA_MIGRATION_FLEET_H
#define LIBSCHEMA_MIGRATION_FLEET_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Finding.h"
#include "Source.h"

namespace migration {

// How an installation stands to a definition of its BASE. Without BASE, what equals NEW's is
// unchanged, and what else the installation has is unknown.
enum class Standing : std::uint8_t { kUnchanged, kChanged, kAdded, kRemoved, kAbsent, kUnknown };

// "unchanged", "changed", "added", "removed", "absent", "unknown".
std::string_view wordOf(Standing standing);

// A clause that is not the same in BASE, OLD and NEW; empty where one does not have it.
struct FleetClause {
  std::string clause;  // "SYNTAX"
  std::string base;
  std::string old;
  std::string latest;
};
// A clause that is the same wherever the definition is, and its value.
using FleetValue = std::pair<std::string, std::string>;

// Installations that have a definition alike, and of which the same comes.
struct FleetGroup {
  Standing standing = Standing::kUnchanged;
  std::string change;   // the class, "changed-by-site"
  std::string outcome;  // "undecided"
  std::vector<FleetClause> clauses;
  std::vector<FleetValue> values;
  std::vector<std::size_t> installations;  // places in the fleet's list, ascending
};

// A definition, and how the installations of a release have it.
struct FleetDefinition {
  std::size_t release = 0;  // a place in the fleet's list
  std::string kind;         // "attribute-type"
  std::string oid;          // BASE's, or without BASE NEW's, or OLD's; and so the name
  std::string name;
  std::size_t has = 0;        // so many installations of the release have it,
  std::size_t unchanged = 0;  // so many of them unchanged,
  std::size_t ways = 0;       // the others in so many ways;
  std::size_t undecided = 0;  // and at so many it is undecided
  // All that have it otherwise than unchanged, or lack what BASE has, or have not decided about it;
  // without BASE also those that lack it. Most installations first.
  std::vector<FleetGroup> groups;
};

// What one decision settles: a definition that several installations have not decided about, with
// the same texts in BASE, OLD and NEW.
struct FleetQuestion {
  std::string kind;
  std::string oid;   // as decisions call it
  std::string name;  // the same
  bool isByName = false;
  std::string fingerprint;
  std::string reason;
  std::vector<FleetClause> clauses;
  std::vector<FleetValue> values;
  std::vector<std::string> takes;        // what may be taken at each of them: "old", "new", …
  std::vector<std::string> openClauses;  // that may be decided clause by clause
  bool mayMove = false;                  // OLD's may stand beside NEW's
  std::vector<std::size_t> installations;
  // So many installations are ready once this question and those before it are answered.
  std::size_t readyThen = 0;
};

// An installation, and how far its plan is.
struct FleetInstallation {
  std::string name;
  std::string path;  // of its plan
  std::size_t release = 0;
  bool isReady = false;
  std::size_t definitions = 0;
  std::size_t undecided = 0;  // definitions
  std::size_t questions = 0;  // that remain for them
  std::size_t refusals = 0;   // other reasons for which the migration must not go ahead
};

// Installations whose plans have the same BASE and the same NEW, byte for byte.
struct FleetRelease {
  std::string base;  // the directories, as its first plan names them; empty without BASE
  std::string latest;
  std::vector<std::string> differing;    // "NEW V3.config.at": not as in the first release
  std::size_t installations = 0;         // how many
  std::size_t definitions = 0;           // of all of them together
  std::size_t unchangedDefinitions = 0;  // that no installation changed, or has to decide about
};

struct Fleet {
  std::vector<FleetInstallation> installations;  // in the order in which they were added
  std::vector<FleetRelease> releases;            // in the order in which they were met
  std::vector<FleetDefinition> definitions;      // by release, kind and name
  std::vector<FleetQuestion> questions;          // what settles most comes first
  std::size_t readyCount = 0;                    // installations
  std::size_t refusedCount = 0;                  // installations that are not, whatever is decided
  std::size_t questionCount = 0;                 // of all installations, each of them counted
};

// What of it is wanted.
struct FleetQuery {
  std::string definition;        // a name or OID, in any letter case; empty for all
  bool isWithUnchanged = false;  // also definitions that no installation changed
};

// Adds up plans, one after another. Of each it keeps what is shown, each text once, and counts the
// rest: what no installation changed takes no more room for more plans.
class FleetReader {
 public:
  // Begins without any plan.
  explicit FleetReader(FleetQuery query);
  FleetReader(const FleetReader&) = delete;
  FleetReader& operator=(const FleetReader&) = delete;
  ~FleetReader();

  // Adds the plan of an installation. Returns false, with a failure at its line, when the document
  // is no saved plan that can be read here; it counts for nothing then. The source is not kept.
  bool add(const std::string& installation, const Source& plan, Failures* failures);

  // All that was added. Nothing can be added afterwards.
  Fleet take();

 private:
  class Collection;
  std::unique_ptr<Collection> m_collection;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FLEET_H
