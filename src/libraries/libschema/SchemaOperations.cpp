// The operations between two managers: comparison, merge, collision check, and the reports of the
// last.

#include "SchemaOperations.h"

#include <string>
#include <string_view>

#include "OperationBatches.h"
#include "SchemaManager.h"
#include "TracePoints.h"

namespace {

template <typename Table>
void erase(Table* table, std::string_view key) {
  const auto entry = table->find(key);
  if (entry != table->end()) {
    table->erase(entry);
  }
}

// Enters a definition unless the table has the key already.
template <typename Table>
void enter(Table* table, std::string_view key, typename Table::mapped_type definition) {
  const auto place = table->lower_bound(key);
  if (place == table->end() || place->first != key) {
    table->emplace_hint(place, key, definition);
  }
}

}  // namespace

// ---- Comparison ----

// Drops from the manager's table what is excluded there, and what the reference defines alike.
// Erased definitions are not deleted: the OID indexes of attribute types and object classes still
// hold them.
template <typename Definition>
void SchemaManager::Operations::compare(SchemaManager* self, SchemaManager* reference) {
  Walk<Definition> walk(self, reference);
  FileSetRemovals removals(self);
  while (walk.next()) {
    const Definition& mine = walk.mine();
    const Definition* const theirs = walk.lookUpTheirs();
    const std::string& oid = mine.oidInPlace();
    if (self->excludes(oid) || (theirs != nullptr && mine.isEqualTo(*theirs))) {
      walk.drop();
      if (Kind<Definition>::kIsKeyedByName) {
        removals.add(oid);
      }
    }
  }
  walk.eraseDropped();
  removals.apply();
}

bool SchemaManager::compSchemas(SchemaManager* reference) {
  tracepoint::CompSchemas trace;
  return compAttrTables(reference) && compORVAttrTables(reference) && compObjTables(reference);
}

bool SchemaManager::compAttrTables(SchemaManager* reference) {
  tracepoint::CompAttrTables trace;
  Operations::compare<Attribute>(this, reference);
  return true;
}

bool SchemaManager::compORVAttrTables(SchemaManager* reference) {
  tracepoint::CompORVAttrTables trace;
  Operations::compare<ORVAttribute>(this, reference);
  return true;
}

bool SchemaManager::compObjTables(SchemaManager* reference) {
  tracepoint::CompObjTables trace;
  Operations::compare<ObjectClass>(this, reference);
  return true;
}

// ---- Merge ----

std::set<std::string>* SchemaManager::findOidInSet(SchemaManager* source, std::string oid) {
  return Operations::findFileSet(this, source, oid);
}

SchemaManager::OidSet* SchemaManager::Operations::findFileSet(SchemaManager* self,
                                                              SchemaManager* source,
                                                              const std::string& oid) {
  tracepoint::FindOidInSet trace;
  for (OidSet SchemaManager::*const set : kFileSets) {
    if ((source->*set).count(oid) != 0) {
      return &(self->*set);
    }
  }
  TRACE_DEBUG(trace, "findOidInSet: Unable to find OID, %s, in set.\n", oid.c_str());
  return nullptr;
}

// Puts `moved` in the place of the definition that the manager finds under its OID; `place` is the
// entry found under its key. What goes is the definition with the OID, which can be another one
// than that with the first name: then the old entry under the name stays, and `moved` is entered by
// OID only. A vendor extension has no other key.
// MergeAttrs.NameUnderAnotherOidRemovesTheOtherDefinition.
template <typename Definition>
void SchemaManager::Operations::replace(SchemaManager* self,
                                        typename Table<Definition>::iterator place,
                                        const std::string& key, Definition* moved) {
  using Rules = Kind<Definition>;
  if constexpr (!Rules::kIsKeyedByName) {
    place->second = moved;
  } else {
    Table<Definition>& byOid = self->*Rules::kOidTable;
    const std::string& oid = moved->oidInPlace();
    const Definition* const replaced = Rules::lookUp(*self, oid);
    if (replaced != nullptr) {
      const std::string replacedKey = Rules::keyOf(*replaced);
      if (replacedKey == key) {
        place->second = moved;
      } else {
        erase(&(self->*Rules::kTable), replacedKey);
      }
      erase(&byOid, replaced->oidInPlace());
    }
    enter(&byOid, oid, moved);
  }
}

// Moves the source's definitions, in the order of their keys. Stops, with the source's tables as
// they were, at one that is lacking here and whose OID is in none of the source's file sets. What
// has been moved leaves the source: every entry that was met, and the OIDs of the definitions.
template <typename Definition>
bool SchemaManager::Operations::merge(SchemaManager* self, SchemaManager* source) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Additions<Definition> additions(self);
  OidErasures movedOids;
  for (const auto& entry : source->*Rules::kTable) {
    Definition* const moved = entry.second;
    const auto& key = Rules::keyOf(*moved);
    const auto place = table.lower_bound(std::string_view(key));
    if (place != table.end() && place->first == std::string_view(key)) {
      additions.enter();
      replace(self, place, key, moved);
    } else if (OidSet* const oids = findFileSet(self, source, moved->oidInPlace())) {
      additions.add(oids, moved);
      table.emplace_hint(place, std::string_view(key), moved);
    } else {
      additions.enter();
      return false;
    }
    movedOids.add(moved->oidInPlace());
  }
  additions.enter();
  (source->*Rules::kTable).clear();
  if constexpr (Rules::kIsKeyedByName) {
    movedOids.apply(&(source->*Rules::kOidTable));
  }
  return true;
}

bool SchemaManager::mergeSchemas(SchemaManager* source) {
  tracepoint::MergeSchemas trace;
  return mergeAttrs(source) && mergeORVAttrs(source) && mergeObjClasses(source);
}

// Of the three passes only this one records its success.  MergeTrace.OnlyMergeAttrsRecordsSuccess.
bool SchemaManager::mergeAttrs(SchemaManager* source) {
  tracepoint::MergeAttrs trace;
  if (!Operations::merge<Attribute>(this, source)) {
    TRACE_DEBUG(trace, "mergeAttrs: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return trace.status(1) != 0;
}

bool SchemaManager::mergeORVAttrs(SchemaManager* source) {
  tracepoint::MergeORVAttrs trace;
  if (!Operations::merge<ORVAttribute>(this, source)) {
    TRACE_DEBUG(trace, "mergeORVAttrs: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return true;
}

bool SchemaManager::mergeObjClasses(SchemaManager* source) {
  tracepoint::MergeObjClasses trace;
  if (!Operations::merge<ObjectClass>(this, source)) {
    TRACE_DEBUG(trace, "mergeObjClasses: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return true;
}

// ---- Collision check ----

// Whether the OID is a key of any of the three tables. Two of them have names for keys: an OID is
// found there only when a definition's first name is spelled like it.
// CheckCollisions.OidIsLookedUpAmongNames.
bool SchemaManager::Operations::isKey(const SchemaManager& reference, std::string_view oid) {
  return reference.ocTable.count(oid) != 0 || reference.attrTable.count(oid) != 0 ||
         reference.orvAttrTable.count(oid) != 0;
}

// Leaves in the manager's table what collides with the reference by its key (first name, or OID of
// a vendor extension) or by its OID.
template <typename Definition>
void SchemaManager::Operations::check(SchemaManager* self, SchemaManager* reference) {
  Walk<Definition> walk(self, reference);
  OidErasures collidingOids;
  while (walk.next()) {
    const std::string& oid = walk.mine().oidInPlace();
    if (!walk.isInReference() && !isKey(*reference, oid)) {
      walk.drop();
    } else if (Kind<Definition>::kPrunesReference) {
      collidingOids.add(oid);
    }
  }
  walk.eraseDropped();
  collidingOids.apply(&reference->attrOidTable);
}

// The order of the passes is its own: comparison and merge take object classes last.
// CheckCollisions.ObjectClassesComeFirst.
bool SchemaManager::checkCollisions(SchemaManager* reference) {
  tracepoint::CheckCollisions trace;
  return checkObjClasses(reference) && checkAttrs(reference) && checkORVAttrs(reference);
}

bool SchemaManager::checkObjClasses(SchemaManager* reference) {
  tracepoint::CheckObjClasses trace;
  Operations::check<ObjectClass>(this, reference);
  return true;
}

// The one change to the reference: its OID index loses the OIDs of the colliding attribute types.
// CheckAttrs.CollidingOidsLeaveTheOidIndexOfTheReference.
bool SchemaManager::checkAttrs(SchemaManager* reference) {
  tracepoint::CheckAttrs trace;
  Operations::check<Attribute>(this, reference);
  return true;
}

bool SchemaManager::checkORVAttrs(SchemaManager* reference) {
  tracepoint::CheckORVAttrs trace;
  Operations::check<ORVAttribute>(this, reference);
  return true;
}

// ---- Reports ----

template <typename Definition>
std::string SchemaManager::Operations::report(const char* noneText, const char* heading,
                                              const Table<Definition>& table) {
  if (table.empty()) {
    return noneText;
  }
  std::string text = heading;
  for (const auto& entry : table) {
    text += entry.second->getOidAndName();
  }
  return text;
}

std::string SchemaManager::getOcTable() {
  tracepoint::GetOcTable trace;
  return Operations::report("No objectClasses definition collisions found.\n",
                            "The following objectClasses definition collisions found:\n", ocTable);
}

std::string SchemaManager::getORVAttrTable() {
  tracepoint::GetORVAttrTable trace;
  return Operations::report("No ORVAttributeTypes definition collisions found.\n",
                            "The following ORVAttributeTypes definition collisions found:\n",
                            orvAttrTable);
}

std::string SchemaManager::getAttrTable() {
  tracepoint::GetAttrTable trace;
  return Operations::report("No attributeTypes definition collisions found.\n",
                            "The following attributeTypes collisions found:\n", attrTable);
}
