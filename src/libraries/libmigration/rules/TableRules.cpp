// T: what the library's tables make of definitions that share a key, and which of them are written.
//
// The first definition under a key counts, in the order of reading: attribute types and object
// classes have their lower-cased first name and their OID for keys, vendor extensions their OID. A
// file is written from the OIDs that were read from it, each as the class or, failing that, the
// attribute type that counts under the OID, with the extension that counts under it.

#include <algorithm>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "Check.h"
#include "Comparison.h"
#include "OidList.h"
#include "Rule.h"
#include "RuleSupport.h"
#include "TextIndex.h"

namespace migration {

namespace {

constexpr Kind kKinds[] = {Kind::kAttributeType, Kind::kObjectClass, Kind::kVendorExtension};
constexpr Kind kNamedKinds[] = {Kind::kAttributeType, Kind::kObjectClass};

using Group = std::vector<const Entry*>;

// ---- T301 ----

// The definitions that repeat a key, each told once for each definition that it repeats.
class RepeatedKeys {
 public:
  explicit RepeatedKeys(Findings* findings) : m_findings(*findings) {}

  void look(const Group& group, const char* key, bool (*isAsWritten)(const Entry&)) {
    const Entry* counting = nullptr;
    const Entry* ofOtherFiles = nullptr;  // the first that does not stand in V3.modifiedschema
    for (const Entry* const entry : group) {
      if (!isAsWritten(*entry)) {
        continue;
      }
      const bool isModified = isModifiedSchema(*entry->file);
      if (counting == nullptr) {
        counting = entry;
      } else if (ofOtherFiles != nullptr && !areEqual(*ofOtherFiles->kept, *entry->kept)) {
        tell(*entry, *ofOtherFiles, *counting, key, Severity::kError);
      } else if (!areEqual(*counting->kept, *entry->kept)) {
        const bool isElsewhere = isModifiedSchema(*counting->file) && !isModified;
        tell(*entry, *counting, *counting, key,
             isElsewhere ? Severity::kWarning : Severity::kError);
      }
      if (ofOtherFiles == nullptr && !isModified) {
        ofOtherFiles = entry;
      }
    }
  }

 private:
  void tell(const Entry& entry, const Entry& other, const Entry& counting, const char* key,
            Severity severity) {
    if (!m_told[&entry].insert(&other).second) {
      return;
    }
    std::string text = "has the same " + std::string(key) + " as " + describeWithPlace(other) +
                       " and is different; ";
    if (severity == Severity::kWarning) {
      text +=
          "V3.modifiedschema is read first, so that its definition counts and this one is not "
          "used; make the two equal, or delete the one that is not meant";
    } else {
      text += "only the first that is read counts, " + describeWithPlace(counting) +
              ", and this one is lost; delete one of them, or give one another " + key;
    }
    addFinding("T301", severity, entry, entry.kept->offset, std::move(text), &m_findings);
  }

  Findings& m_findings;
  std::unordered_map<const Entry*, std::unordered_set<const Entry*>> m_told;
};

void checkRepeatedKeys(const Installation& installation, Findings* findings) {
  RepeatedKeys keys(findings);
  for (const Kind kind : kKinds) {
    installation.forEachSharedOid(
        kind, [&](const Group& group) { keys.look(group, "OID", isOidAsWritten); });
    installation.forEachSharedName(
        kind, [&](const Group& group) { keys.look(group, "first name", isFirstNameAsWritten); });
  }
}

// ---- T302 ----

bool countsByOid(const Installation& installation, const Entry& entry) {
  return installation.byOid(entry.kind(), oidOf(entry)) == &entry;
}

// `all` have the name. Each that has it as an alias is told beside the one whose first name it is
// or, where it is nobody's, beside the first alias.
void checkAlias(const Installation& installation, std::string_view name, const Group& all,
                Findings* findings) {
  Group group;
  const Entry* owner = nullptr;
  for (const Entry* const entry : all) {
    if (countsByOid(installation, *entry) && isOidAsWritten(*entry)) {
      group.push_back(entry);
      owner = owner == nullptr && equalsFolded(firstNameOf(*entry), name) ? entry : owner;
    }
  }
  if (group.empty()) {
    return;
  }
  const bool isAliasOnly = owner == nullptr;
  owner = isAliasOnly ? group.front() : owner;
  for (const Entry* const entry : group) {
    if (entry == owner || oidOf(*entry) == oidOf(*owner) ||
        equalsFolded(firstNameOf(*entry), name)) {
      continue;
    }
    addFinding("T302", Severity::kWarning, *entry, placeOfValue(*entry, Clause::kName, name),
               "its alias " + std::string(name) +
                   (isAliasOnly ? " is an alias of " : " is the name of ") +
                   describeWithPlace(*owner) +
                   " as well, so that nobody can tell which is meant; take the alias out of one "
                   "of them",
               findings);
  }
}

void checkAliases(const Installation& installation, Findings* findings) {
  for (const Kind kind : kNamedKinds) {
    installation.forEachSharedAlias(kind, [&](std::string_view name, const Group& group) {
      if (!name.empty()) {
        checkAlias(installation, name, group, findings);
      }
    });
  }
}

// ---- T303 to T306 ----

void checkSharedByKinds(const Installation& installation, const Entry& objectClass,
                        Findings* findings) {
  const Entry* const attribute = installation.byOid(Kind::kAttributeType, oidOf(objectClass));
  if (attribute != nullptr && !oidOf(objectClass).empty() &&
      countsByOid(installation, objectClass) && isOidAsWritten(objectClass) &&
      isOidAsWritten(*attribute)) {
    addFinding("T303", Severity::kError, *attribute, attribute->kept->offset,
               "has the OID of " + describeWithPlace(objectClass) +
                   "; the library writes the object class in its place, so that the attribute "
                   "type is lost; give one of them an OID of its own",
               findings);
  }
}

void checkLoneExtension(const Installation& installation, const Entry& entry, Findings* findings) {
  if (installation.attributeOf(entry) == nullptr && countsByOid(installation, entry) &&
      !oidOf(entry).empty() && isOidAsWritten(entry) &&
      !installation.isDefined(Kind::kAttributeType, oidOf(entry))) {
    addFinding("T304", Severity::kError, entry, entry.kept->offset,
               "no attribute type has the OID " + oidOf(entry) +
                   ", so that this vendor extension is never written; define the attribute type, "
                   "or delete the extension",
               findings);
  }
}

void checkConfig(const Installation& installation, const Entry& entry, Findings* findings) {
  const Entry* const counting = installation.byOid(entry.kind(), oidOf(entry));
  std::string text = entry.file->name +
                     " is read but never written, and none of its definitions is carried over to "
                     "another file; ";
  text +=
      counting == &entry || counting == nullptr
          ? "if the new release has to have it, move the definition to a user's file in a copy of "
            "the directory, and migrate that"
          : "what is written under this OID is the definition of " + fileAndLine(*counting) +
                "; look whether that one is meant";
  addFinding("T305", Severity::kWarning, entry, entry.kept->offset, std::move(text), findings);
}

// Definitions that are written outside V3.modifiedschema, and not kept: a key for each.
using WrittenKeys = std::unordered_set<std::string>;

std::string keyOf(Kind kind, std::string_view oid) {
  return std::string(wordOf(kind)).append(" ").append(oid);
}

WrittenKeys unkeptKeys(const Installation& installation) {
  WrittenKeys keys;
  for (const UnkeptEntry& entry : installation.unkept()) {
    if (!isModifiedSchema(*entry.file)) {
      keys.insert(
          keyOf(entry.written->kind, entry.file->written->textOf(*entry.written, Clause::kOid)));
    }
  }
  return keys;
}

void checkSoleSource(const Installation& installation, const WrittenKeys& unkept,
                     const Entry& entry, Findings* findings) {
  const Group all = installation.allByOid(entry.kind(), oidOf(entry));
  const bool isSole = std::all_of(all.begin(), all.end(),
                                  [&](const Entry* other) { return other->file == entry.file; });
  if (isSole && all.front() == &entry && isOidAsWritten(entry) &&
      unkept.count(keyOf(entry.kind(), oidOf(entry))) == 0) {
    addFinding("T306", Severity::kWarning, entry, entry.kept->offset,
               "no other file defines it, so that it is gone as soon as it is withdrawn or "
               "V3.modifiedschema is emptied; define it in V3.user.at or V3.user.oc as well if it "
               "has to stay",
               findings);
  }
}

// ---- T307 ----

// The names of the files, but V3.modifiedschema and the two of the configuration, whose OID sets
// hold the OID.
std::string filesWith(const Installation& installation, std::string_view oid) {
  std::string names;
  for (const SchemaFile& file : installation.files()) {
    if (isModifiedSchema(file) || isConfigFile(file)) {
      continue;
    }
    for (const Kind kind : kKinds) {
      const Group group = installation.allByOid(kind, oid);
      if (std::any_of(group.begin(), group.end(),
                      [&](const Entry* entry) { return entry->file == &file; })) {
        names += (names.empty() ? "" : ", ") + file.name;
        break;
      }
    }
  }
  return names;
}

void checkWithdrawal(const CheckRequest& request, Findings* findings) {
  if (request.withdrawList == nullptr) {
    return;
  }
  const Installation& installation = *request.installation;
  std::unordered_set<std::string_view> met;
  for (const OidWord& word : readOidList(*request.withdrawList)) {
    const Entry* entry = installation.byOid(Kind::kObjectClass, word.text);
    entry = entry == nullptr ? installation.byOid(Kind::kAttributeType, word.text) : entry;
    if (word.use != WordUse::kTaken || entry == nullptr || !met.insert(word.text).second) {
      continue;
    }
    const std::string files = filesWith(installation, word.text);
    if (!files.empty()) {
      const Place place = request.withdrawList->placeOf(word.offset);
      findings->push_back({"T307", Severity::kWarning, request.withdrawList->path(), place.line,
                           place.column,
                           describeWithPlace(*entry) +
                               " is withdrawn, and is still written, "
                               "since its OID stands in " +
                               files + "; exclude the OID instead",
                           describe(*entry)});
    }
  }
}

}  // namespace

void checkTables(const CheckRequest& request, Findings* findings) {
  const Installation& installation = *request.installation;
  checkRepeatedKeys(installation, findings);
  checkAliases(installation, findings);
  const WrittenKeys unkept = unkeptKeys(installation);
  for (const Entry& entry : installation.entries()) {
    if (entry.kind() == Kind::kObjectClass) {
      checkSharedByKinds(installation, entry, findings);
    } else if (entry.kind() == Kind::kVendorExtension) {
      checkLoneExtension(installation, entry, findings);
    }
    if (isConfigFile(*entry.file)) {
      checkConfig(installation, entry, findings);
    } else if (isModifiedSchema(*entry.file)) {
      checkSoleSource(installation, unkept, entry, findings);
    }
  }
  checkWithdrawal(request, findings);
}

}  // namespace migration
