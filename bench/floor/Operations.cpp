// Comparison, merge and collision check of the floor program. Each walks its two ordered tables in
// lock-step; OIDs met on the way, which come in the order of the names, are sorted before they are
// taken out of, or looked for in, the tables and sets that are ordered by OID.

#include <algorithm>
#include <vector>

#include "Cursor.h"
#include "Schema.h"

namespace minimal {

struct Schema::Operations {
  using OidList = std::vector<const std::string*>;

  static void sort(OidList* oids) {
    std::sort(oids->begin(), oids->end(),
              [](const std::string* left, const std::string* right) { return *left < *right; });
  }

  // Takes each OID out of the first searched set that holds it.
  static void takeFromSets(Schema* self, OidList oids) {
    sort(&oids);
    for (std::size_t i = 0; i < kSearchedSets && !oids.empty(); ++i) {
      if (self->m_sets[i].empty()) {
        continue;
      }
      Cursor place(self->m_sets[i]);
      std::size_t left = 0;
      for (const std::string* const oid : oids) {
        if (place.seek(*oid)) {
          place.erase();
        } else {
          oids[left++] = oid;
        }
      }
      oids.resize(left);
    }
  }

  // Puts each OID into the set of the file that the source has it from; false when one has none.
  static bool putIntoSets(Schema* self, const Schema& source, OidList oids) {
    sort(&oids);
    for (std::size_t i = 0; i < kSearchedSets && !oids.empty(); ++i) {
      if (source.m_sets[i].empty()) {
        continue;
      }
      Cursor held(source.m_sets[i]);
      Cursor place(self->m_sets[i]);
      std::size_t left = 0;
      for (const std::string* const oid : oids) {
        if (!held.seek(*oid)) {
          oids[left++] = oid;
        } else if (!place.seek(*oid)) {
          self->m_sets[i].insert(place.place(), *oid);
        }
      }
      oids.resize(left);
    }
    return oids.empty();
  }

  // Whether any name in the table could be spelled like an OID of digits.
  template <typename D>
  static bool hasNumericNames(const Table<D>& byName) {
    const auto first = byName.lower_bound("0");
    return first != byName.end() && first->first[0] <= '9';
  }

  template <typename D>
  static bool hasName(const Table<D>& byName, bool hasNumeric, const std::string& oid) {
    const bool isNumeric = !oid.empty() && oid[0] >= '0' && oid[0] <= '9';
    return (hasNumeric || !isNumeric) && byName.count(oid) != 0;
  }

  template <typename D>
  static void compare(Schema* self, Table<D>* mine, const Table<D>& theirs, bool dropsFromSets) {
    Cursor reference(theirs);
    OidList dropped;
    for (auto entry = mine->begin(); entry != mine->end();) {
      const D& definition = *entry->second;
      const bool isExcluded =
          !self->m_excluded.empty() && self->m_excluded.count(definition.oid) != 0;
      D* const* const found = reference.find(entry->first);
      if (isExcluded || (found != nullptr && definition.isEqual(**found))) {
        if (dropsFromSets) {
          dropped.push_back(&definition.oid);
        }
        entry = mine->erase(entry);
      } else {
        ++entry;
      }
    }
    takeFromSets(self, std::move(dropped));
  }

  // Puts `moved` where the definition with its OID is. Returns the place in the table by name from
  // which to go on.
  template <typename D>
  static typename Table<D>::iterator replace(Table<D>* byName, Table<D>* byOid, bool hasNumeric,
                                             typename Table<D>::iterator place, D* moved) {
    const auto sameOid = byOid->find(moved->oid);
    D* replaced = sameOid == byOid->end() ? nullptr : sameOid->second;
    if (hasName(*byName, hasNumeric, moved->oid)) {
      replaced = byName->at(moved->oid);
    }
    if (replaced != nullptr && replaced->key() != place->first) {
      byName->erase(replaced->key());
    } else if (replaced != nullptr) {
      place->second = moved;
    }
    if (replaced != nullptr && replaced->oid != moved->oid) {
      byOid->erase(replaced->oid);
    } else if (replaced != nullptr) {
      (*byOid)[moved->oid] = moved;
      return place;
    }
    byOid->try_emplace(moved->oid, moved);
    return place;
  }

  template <typename D>
  static bool merge(Schema* self, Schema* source, Table<D> Schema::*names, Table<D> Schema::*oids) {
    Table<D>* const byName = &(self->*names);
    Table<D>* const byOid = &(self->*oids);
    const bool hasNumeric = hasNumericNames(*byName);
    Cursor target(*byName);
    OidList added;
    OidList moved;
    for (const auto& entry : source->*names) {
      D* const definition = entry.second;
      moved.push_back(&definition->oid);
      if (target.seek(entry.first)) {
        target.moveTo(replace(byName, byOid, hasNumeric, target.place(), definition));
        continue;
      }
      added.push_back(&definition->oid);
      target.moveTo(byName->emplace_hint(target.place(), entry.first, definition));
      byOid->try_emplace(definition->oid, definition);
    }
    if (!putIntoSets(self, *source, std::move(added))) {
      return false;
    }
    (source->*names).clear();
    eraseAll(&(source->*oids), std::move(moved));
    return true;
  }

  static bool mergeExtensions(Schema* self, Schema* source) {
    Cursor target(self->m_extensions);
    OidList added;
    for (const auto& [oid, extension] : source->m_extensions) {
      if (target.seek(oid)) {
        target.place()->second = extension;
        continue;
      }
      added.push_back(&extension->oid);
      target.moveTo(self->m_extensions.emplace_hint(target.place(), oid, extension));
    }
    if (!putIntoSets(self, *source, std::move(added))) {
      return false;
    }
    source->m_extensions.clear();
    return true;
  }

  template <typename D>
  static void eraseAll(Table<D>* table, OidList oids) {
    sort(&oids);
    Cursor place(*table);
    for (const std::string* const oid : oids) {
      if (place.seek(*oid)) {
        place.erase();
      }
    }
  }

  // Leaves in `mine` what the reference has under the same key, or whose OID is a key there.
  template <typename D>
  static void check(Table<D>* mine, const Table<D>& theirs, const Schema& reference,
                    OidList* colliding) {
    const bool hasNumericClasses = hasNumericNames(reference.m_classes);
    const bool hasNumericTypes = hasNumericNames(reference.m_types);
    Cursor place(theirs);
    for (auto entry = mine->begin(); entry != mine->end();) {
      const std::string& oid = entry->second->oid;
      if (place.seek(entry->first) || hasName(reference.m_classes, hasNumericClasses, oid) ||
          hasName(reference.m_types, hasNumericTypes, oid) ||
          reference.m_extensions.count(oid) != 0) {
        if (colliding != nullptr) {
          colliding->push_back(&oid);
        }
        ++entry;
      } else {
        entry = mine->erase(entry);
      }
    }
  }
};

bool Schema::compSchemas(Schema* reference) {
  Operations::compare(this, &m_types, reference->m_types, true);
  Operations::compare(this, &m_extensions, reference->m_extensions, false);
  Operations::compare(this, &m_classes, reference->m_classes, true);
  return true;
}

bool Schema::mergeSchemas(Schema* source) {
  return Operations::merge(this, source, &Schema::m_types, &Schema::m_typesByOid) &&
         Operations::mergeExtensions(this, source) &&
         Operations::merge(this, source, &Schema::m_classes, &Schema::m_classesByOid);
}

bool Schema::checkCollisions(Schema* reference) {
  Operations::check(&m_classes, reference->m_classes, *reference, nullptr);
  Operations::OidList colliding;
  Operations::check(&m_types, reference->m_types, *reference, &colliding);
  Operations::eraseAll(&reference->m_typesByOid, std::move(colliding));
  Operations::check(&m_extensions, reference->m_extensions, *reference, nullptr);
  return true;
}

}  // namespace minimal
