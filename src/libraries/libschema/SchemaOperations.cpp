// The operations between two managers: comparison, merge, collision check, and the reports of the
// last.

#include "SchemaOperations.h"

#include <string>
#include <utility>
#include <vector>

#include "SchemaManager.h"
#include "TracePoints.h"

// ---- Comparison ----

// Drops from the manager's table what is excluded there, and what the reference defines alike.
// Erased definitions are not deleted: the OID indexes of attribute types and object classes still
// hold them.
template <typename Definition>
void SchemaManager::Operations::compare(SchemaManager* self, SchemaManager* reference) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Walk<Definition> walk(*self, &(reference->*Rules::kTable));
  Erasures<Definition> dropped;
  Removals removals(self);
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    const Met<Definition> met = walk.meet(*entry);
    const Definition* theirs = walk.findInReference(met);
    if (theirs != nullptr) {
      theirs = met.isOwnKey ? answerOf<Definition>(theirs)
                            : &orNew(Rules::lookUp(*reference, std::string(entry->first)));
    }
    const Definition& mine = met.definition;
    const std::string& oid = mine.oidInPlace();
    if (!self->excludes(oid) && (theirs == nullptr || !Rules::areEqual(mine, *theirs))) {
      continue;
    }
    dropped.add(entry, met.key);
    if (Rules::kHasFileSet) {
      removals.add(oid);
    }
  }
  dropped.apply(&table);
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
// entry found under its name. What goes is the definition with the OID, which can be another one
// than that with the name: then the old entry under the name stays, and `moved` is entered by OID
// only. MergeAttrs.NameUnderAnotherOidRemovesTheOtherDefinition.
template <typename Definition>
void SchemaManager::Operations::replace(SchemaManager* self, const std::string& name,
                                        Iterator<Definition> place, Definition* moved) {
  using Rules = Kind<Definition>;
  Table<Definition>& byName = self->*Rules::kTable;
  OidTable<Definition>& byOid = self->*Rules::kOidTable;
  const std::string& oid = moved->oidInPlace();
  const Definition* const replaced = Rules::lookUp(*self, oid);
  if (replaced != nullptr) {
    const std::string replacedName = Rules::keyOf(*replaced);
    const std::string replacedOid = replaced->oidInPlace();
    if (replacedName == name) {
      place->second = moved;
    } else {
      byName.erase(replacedName);
    }
    const auto indexed = byOid.find(replacedOid);
    if (indexed != byOid.end() && replacedOid == oid) {
      rebind(&byOid, indexed, moved);
      return;
    }
    if (indexed != byOid.end()) {
      byOid.erase(indexed);
    }
  }
  byOid.try_emplace(oid, moved);
}

// Erases from the source what has been moved out of it: by the names and by the OIDs of the moved
// definitions.
template <typename Definition>
void SchemaManager::Operations::eraseMoved(SchemaManager* source) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = source->*Rules::kTable;
  typename Rules::KeyTest isKeyOf;
  Erasures<Definition> moved;
  OidList movedOids;
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    if (isKeyOf(entry->first, *entry->second)) {
      moved.add(entry, Rules::keyAt(*entry));
    } else {
      moved.add(entry, Rules::keyOf(*entry->second));
    }
    movedOids.push_back(&entry->second->oidInPlace());
  }
  moved.apply(&table);
  if constexpr (Rules::kHasFileSet) {
    eraseAll(&(source->*Rules::kOidTable), std::move(movedOids));
  }
}

// Moves the source's definitions, in the order of their keys. Stops, with the source's tables as
// they were, at one that is lacking here and whose OID is in none of the source's file sets.
template <typename Definition>
bool SchemaManager::Operations::merge(SchemaManager* self, SchemaManager* source) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Additions<Definition> additions(self);
  for (const auto& entry : source->*Rules::kTable) {
    Definition* const moved = entry.second;
    const auto& key = Rules::keyOf(*moved);
    const auto place = table.lower_bound(key);
    if (place != table.end() && place->first == key) {
      additions.enter();
      if constexpr (Rules::kHasFileSet) {
        replace(self, key, place, moved);
      } else {
        rebind(&table, place, moved);
      }
      continue;
    }
    OidSet* const oids = findFileSet(self, source, moved->oidInPlace());
    if (oids == nullptr) {
      additions.enter();
      return false;
    }
    additions.add(oids, moved);
    table.try_emplace(place, key, moved);
  }
  additions.enter();
  eraseMoved<Definition>(source);
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
bool SchemaManager::Operations::isKey(const SchemaManager& reference, const std::string& oid) {
  return reference.ocTable.count(oid) != 0 || reference.attrTable.count(oid) != 0 ||
         reference.orvAttrTable.count(oid) != 0;
}

// Leaves in the manager's table what collides with the reference by its key (first name, or OID of
// a vendor extension) or by its OID.
template <typename Definition>
void SchemaManager::Operations::check(SchemaManager* self, SchemaManager* reference) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Walk<Definition> walk(*self, &(reference->*Rules::kTable));
  Erasures<Definition> dropped;
  OidList collidingOids;
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    const Met<Definition> met = walk.meet(*entry);
    const std::string& oid = met.definition.oidInPlace();
    if (walk.findInReference(met) == nullptr && !isKey(*reference, oid)) {
      dropped.add(entry, met.key);
    } else if (Rules::kPrunesOidTable) {
      collidingOids.push_back(&oid);
    }
  }
  dropped.apply(&table);
  eraseAll(&reference->attrOidTable, std::move(collidingOids));
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

template <typename Definitions>
std::string SchemaManager::Operations::report(const char* noneText, const char* heading,
                                              const Definitions& table) {
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
