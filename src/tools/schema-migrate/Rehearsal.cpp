#include "Rehearsal.h"

#include "SchemaFiles.h"

namespace {

std::string shown(const std::string& oid) { return oid.empty() ? "(no OID)" : printable(oid); }

// Why no file set of OLD holds the OID of `lacking`, which NEW lacks.
std::string whyInNoFile(const Definition& lacking) {
  const std::string exclude = orList(lacking.oid, "to go without it");
  if (lacking.file >= kMergedFiles) {
    return "NEW lacks it, and OLD knows it only from " + std::string(kSchemaFiles[lacking.file]) +
           ", so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well" +
           exclude;
  }
  if (lacking.kind == DefinitionKind::kVendorExtension) {
    return "NEW lacks it but defines its attribute type as OLD does, and with that the OID leaves the only file of OLD that holds it; put its line into V3.orv.at of OLD as well" +
           exclude;
  }
  return "NEW lacks it, and its OID leaves the files of OLD with another definition of the same OID, which NEW has; give it an OID of its own" +
         exclude;
}

}  // namespace

Rehearsal::Rehearsal(const Inventory& oldOne, const Inventory& newOne)
    : m_oldOne(oldOne), m_old(oldOne), m_new(newOne), m_fates(oldOne, newOne) {}

// The passes in the library's order.
void Rehearsal::run(const OidLists& lists) {
  constexpr DefinitionKind kOrder[] = {DefinitionKind::kAttributeType,
                                       DefinitionKind::kVendorExtension,
                                       DefinitionKind::kObjectClass};
  withdraw(lists.withdrawn);
  for (const DefinitionKind kind : kOrder) {
    compare(kind, lists.excluded);
  }
  for (const DefinitionKind kind : kOrder) {
    merge(kind);
  }
}

// An object class or attribute type leaves the table keyed by name; a vendor extension goes only
// when neither of them has the OID.
void Rehearsal::withdraw(const std::set<std::string>& oids) {
  for (const std::string& oid : oids) {
    DefinitionKind kind = DefinitionKind::kVendorExtension;
    std::string_view key = oid;
    for (const DefinitionKind named :
         {DefinitionKind::kObjectClass, DefinitionKind::kAttributeType}) {
      if (m_old.atOid(named, oid) != nullptr) {
        kind = named;
        key = m_old.lookUp(named, oid)->key;
        break;
      }
    }
    if (const Definition* const definition = m_old.walkedAt(kind, key)) {
      m_fates[*definition] = Fate::kWithdrawn;
      m_old.walked(kind).erase(key);
    }
  }
}

void Rehearsal::compare(DefinitionKind kind, const std::set<std::string>& excluded) {
  for (const Definition& definition : m_oldOne.definitions()) {
    const std::string_view key = Tables::keyOf(definition);
    if (definition.kind != kind || m_old.walkedAt(kind, key) != &definition) {
      continue;
    }
    const Definition* const reference = m_new.walkedAt(kind, key);
    const bool isExcluded = excluded.count(definition.oid) != 0;
    if (!isExcluded && (reference == nullptr || !isEqual(definition, *reference))) {
      continue;
    }
    m_fates[definition] = isExcluded ? Fate::kExcluded : Fate::kSame;
    m_old.walked(kind).erase(key);
    if (kind != DefinitionKind::kVendorExtension) {
      m_old.dropFromFileSets(definition.oid);
    }
  }
}

void Rehearsal::merge(DefinitionKind kind) {
  for (const Definition* const moved : m_old.inOrder(kind)) {
    const Definition* const named = m_new.walkedAt(kind, Tables::keyOf(*moved));
    if (named != nullptr) {
      replace(*moved, *named);
    } else {
      add(*moved);
    }
  }
}

// `named` is NEW's definition of the same key. The library looks up by OID what goes.
void Rehearsal::replace(const Definition& moved, const Definition& named) {
  if (moved.kind != DefinitionKind::kVendorExtension) {
    const Definition* const going = m_new.lookUp(moved.kind, moved.oid);
    if (going != nullptr && going != &named) {
      return refuse(moved,
                    "NEW has the first name in " + describe(named) + " at " + placeOf(named) +
                        " and the OID in " + describe(*going) + " at " + placeOf(*going) +
                        ", which the merge would remove; make name and OID agree with NEW's" +
                        orList(moved.oid, "to keep what NEW has"));
    }
    if (named.oid != moved.oid) {
      return refuse(
          moved,
          "NEW gives the first name to the OID " + shown(named.oid) + " at " + placeOf(named) +
              ", and the merge would lose OLD's; give it NEW's OID or a first name of its own" +
              orList(moved.oid, "to keep what NEW has"));
    }
    m_new.byOid(moved.kind)[moved.oid] = &moved;
  }
  // The entry's key refers to a text of NEW's definition, which stays in place.
  m_new.walked(moved.kind)[Tables::keyOf(moved)] = &moved;
  m_fates[named] = Fate::kReplaced;
  m_fates[moved] = Fate::kReplaces;
}

void Rehearsal::add(const Definition& moved) {
  const std::size_t file = m_old.fileSetOf(moved.oid);
  if (file == kNoSchemaFile) {
    return refuse(moved, whyInNoFile(moved));
  }
  if (moved.kind != DefinitionKind::kVendorExtension) {
    const Definition* const holder = m_new.atOid(moved.kind, moved.oid);
    if (holder != nullptr && holder->inventory != moved.inventory) {
      return refuse(
          moved,
          "NEW gives the OID to " + describe(*holder) + " at " + placeOf(*holder) +
              ", and the merge would lose OLD's; give it NEW's first name or an OID of its own" +
              orList(moved.oid, "to keep what NEW has"));
    }
    m_new.byOid(moved.kind).try_emplace(moved.oid, &moved);
  }
  m_new.walked(moved.kind).try_emplace(Tables::keyOf(moved), &moved);
  m_new.addToFileSet(file, moved.oid);
  m_fates[moved] = Fate::kAdded;
}

void Rehearsal::releaseTables() {
  m_old = Tables();
  m_new = Tables();
}

void Rehearsal::refuse(const Definition& definition, const std::string& reason) {
  m_fates[definition] = Fate::kRefused;
  m_refusals.push_back({&definition, reason});
}
