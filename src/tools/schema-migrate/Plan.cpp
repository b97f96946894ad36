#include "Plan.h"

#include <algorithm>
#include <iterator>

namespace {

constexpr char kNoOid[] =
    "it has no OID, and in a block such a definition is passed over; give it its OID";

// True when losing `repeated` loses nothing: it says what `earlier` says, or what V3.modifiedschema
// says in its place.
bool isOnlyRepeated(const Definition& repeated, const Definition& earlier) {
  const bool isSuperseded = earlier.file == kModifiedSchema && repeated.file != kModifiedSchema &&
                            earlier.oid == repeated.oid && earlier.key == repeated.key;
  return isSuperseded || isEqual(repeated, earlier);
}

std::string named(const Definition& definition) {
  return describe(definition) + " at " + placeOf(definition);
}

// What to do when NEW's definition is to be kept.
std::string orExclude(const Definition& definition) {
  return orList(definition.oid, "to keep what NEW has");
}

}  // namespace

Plan::Plan(const Inventory& oldOne, const Inventory& newOne, const OidLists& lists)
    : m_rehearsal(oldOne, newOne) {
  Marks writtenBefore = markWritten(oldOne, newOne);
  m_rehearsal.run(lists);
  Marks written = markWritten(oldOne, newOne);
  for (const Refusal& refusal : m_rehearsal.refusals()) {
    refuse(*refusal.definition, refusal.reason);
  }
  for (const Definition& definition : oldOne.definitions()) {
    judgeOld(definition, &written);
  }
  for (const Definition& definition : newOne.definitions()) {
    const bool isCopied = definition.file >= kWrittenFiles;
    if (!written[definition] && !isCopied && fateOf(definition) != Fate::kReplaced) {
      judgeNew(definition, writtenBefore[definition] != 0);
    }
  }
  fillContents();
  m_rehearsal.releaseTables();
}

// Marks what is written from NEW's tables as they stand.
Plan::Marks Plan::markWritten(const Inventory& oldOne, const Inventory& newOne) const {
  Marks marks(oldOne, newOne);
  const Tables& tables = m_rehearsal.newTables();
  for (const Tables::FiledOid& filed : tables.filedOids()) {
    for (const Definition* const definition : tables.writtenFor(filed.oid)) {
      if (definition != nullptr) {
        marks[*definition] = 1;
      }
    }
  }
  return marks;
}

void Plan::judgeOld(const Definition& definition, Marks* written) {
  switch (fateOf(definition)) {
    case Fate::kAdded:
    case Fate::kReplaces:
      if (!(*written)[definition]) {
        return judgeMoved(definition);
      }
      ++(fateOf(definition) == Fate::kAdded ? m_balance.added : m_balance.replacing);
      return;
    case Fate::kSame:
      ++m_balance.same;
      return;
    case Fate::kExcluded:
      ++m_balance.excluded;
      return;
    case Fate::kWithdrawn:
      ++m_balance.withdrawn;
      return;
    case Fate::kStays:
      return judgeUnread(definition);
    case Fate::kRefused:
    case Fate::kReplaced:
      return;
  }
}

// A definition of OLD that came into the tables and is written nowhere.
void Plan::judgeMoved(const Definition& definition) {
  if (isWithdrawnWithItsAttribute(definition)) {
    ++m_balance.withdrawn;
    return;
  }
  const Definition* culprit = nullptr;
  const std::string reason = whyNotWritten(definition, &culprit);
  if (culprit != nullptr && culprit->inventory != definition.inventory) {
    refuse(definition, reason + orExclude(definition));
  } else {
    lose(definition, reason);
  }
}

// Withdrawing an attribute type leaves its extension, which then has nothing to extend.
bool Plan::isWithdrawnWithItsAttribute(const Definition& extension) {
  if (extension.kind != DefinitionKind::kVendorExtension) {
    return false;
  }
  const Definition* const attribute =
      m_rehearsal.oldTables().atOid(DefinitionKind::kAttributeType, extension.oid);
  return attribute != nullptr && fateOf(*attribute) == Fate::kWithdrawn;
}

// A definition of OLD that the table compared and merged did not take.
void Plan::judgeUnread(const Definition& definition) {
  const Definition* const earlier = m_rehearsal.oldTables().earlierByKey(definition);
  if (earlier == nullptr) {
    lose(definition, kNoOid);
  } else if (isOnlyRepeated(definition, *earlier)) {
    ++m_balance.repeated;
  } else if (definition.kind == DefinitionKind::kVendorExtension) {
    lose(definition, "the one at " + placeOf(*earlier) +
                         " has the same OID and is read first; remove one of the two");
  } else {
    lose(
        definition,
        named(*earlier) +
            " has the same first name and is read first; remove one of the two, or give it a name of its own");
  }
}

// A definition of NEW that is neither written nor replaced.
void Plan::judgeNew(const Definition& definition, bool wasWritten) {
  const Definition* culprit = nullptr;
  const std::string reason = whyNotWritten(definition, &culprit);
  if (wasWritten) {
    return refuse(definition, "the merge would remove it: " + reason + orExclude(definition));
  }
  if (definition.isInBlock && definition.oid.empty()) {
    return warn(definition, kNoOid);
  }
  const Tables& tables = m_rehearsal.newTables();
  const bool isExtension = definition.kind == DefinitionKind::kVendorExtension;
  const Definition* const earlier =
      isExtension ? tables.earlierByKey(definition) : tables.earlierByOid(definition);
  if (earlier == nullptr) {
    warn(definition, reason);
  } else if (!isOnlyRepeated(definition, *earlier)) {
    warn(
        definition,
        named(*earlier) +
            " has the same OID and is read first; remove one of the two, or give it an OID of its own");
  }
}

// Says why nothing is written of a definition that is in a table; the other definition that is the
// cause, if one is, comes back in *culprit.
std::string Plan::whyNotWritten(const Definition& definition, const Definition** culprit) const {
  const Tables& tables = m_rehearsal.newTables();
  const bool isExtension = definition.kind == DefinitionKind::kVendorExtension;
  const Definition* const holder =
      isExtension ? nullptr : tables.atOid(definition.kind, definition.oid);
  const Definition* const objectClass = tables.atOid(DefinitionKind::kObjectClass, definition.oid);
  if (definition.kind != DefinitionKind::kObjectClass && objectClass != nullptr) {
    *culprit = objectClass;
    return named(*objectClass) +
           " has the same OID, and of the two only the object class is written; give one of them an OID of its own";
  }
  if (holder != nullptr && holder != &definition) {
    *culprit = holder;
    return named(*holder) +
           " has the same OID, and only one of the two is written; give one of them an OID of its own";
  }
  if (isExtension && tables.atOid(DefinitionKind::kAttributeType, definition.oid) == nullptr) {
    return "no attribute type has its OID, and a vendor extension is written with its attribute type only; define the attribute type, or remove the extension";
  }
  return std::string("NEW has ") + (isExtension ? "its attribute type" : "it") +
         " in a V3.config.* file only, and those are copied from NEW unchanged; if the change is still wanted, make it in the output by hand";
}

void Plan::fillContents() {
  const Tables& tables = m_rehearsal.newTables();
  std::vector<Tables::FiledOid> oids = tables.filedOids();
  std::sort(oids.begin(), oids.end(),
            [](const auto& one, const auto& other) { return one.oid < other.oid; });
  m_isWrittenEmpty.fill(true);
  for (const Tables::FiledOid& filed : oids) {
    const auto definitions = tables.writtenFor(filed.oid);
    for (std::size_t file = 0; file < kWrittenFiles; ++file) {
      if (filed.isIn(file)) {
        m_isWrittenEmpty[file] = false;
        std::copy_if(definitions.begin(), definitions.end(), std::back_inserter(m_contents[file]),
                     [](const Definition* definition) { return definition != nullptr; });
      }
    }
  }
}

void Plan::refuse(const Definition& definition, const std::string& reason) {
  m_refusals +=
      errorLine(placeOf(definition), describe(definition) + " cannot be migrated: " + reason);
  ++m_refusalCount;
}

void Plan::warn(const Definition& definition, const std::string& reason) {
  m_warnings += warningLine(placeOf(definition), describe(definition) + " gets lost: " + reason);
}

void Plan::lose(const Definition& definition, const std::string& reason) {
  ++m_balance.notCarried;
  warn(definition, reason);
}
