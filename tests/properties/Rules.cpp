#include "Rules.h"

#include <cctype>
#include <cstddef>
#include <vector>

namespace properties {

namespace {

std::string lower(std::string text) {
  for (char& c : text) {
    c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
  }
  return text;
}

template <typename Definition>
Definition* entryOf(const Table<Definition>& table, const std::string& key) {
  return table.count(key) == 0 ? nullptr : table.at(key);
}

// The look-ups of a manager: null where there is nothing.
Attribute* attributeOf(const State& state, const std::string& key) {
  Attribute* const byName = entryOf(state.attrTable, lower(key));
  return byName != nullptr ? byName : entryOf(state.attrOidTable, key);
}

ObjectClass* classOf(const State& state, const std::string& key) {
  ObjectClass* const byName = entryOf(state.ocTable, key);
  return byName != nullptr ? byName : entryOf(state.ocOidTable, key);
}

template <typename Definition>
void eraseAll(const OidSet& keys, Table<Definition>* table) {
  for (const std::string& key : keys) {
    table->erase(key);
  }
}

bool join(State* self, const State& source, const std::string& oid) {
  const std::size_t file = fileOf(source, oid);
  if (file == source.fileSets.size()) {
    return false;
  }
  self->fileSets[file].insert(oid);
  return true;
}

bool isSpace(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

std::string joined(const std::vector<std::string>& names) {
  std::string text;
  for (const std::string& name : names) {
    text += (text.empty() ? "" : ", ") + name;
  }
  return text;
}

std::string entryOf(const std::string& oid, const std::vector<std::string>& names) {
  return "OID --> " + oid + "\nName --> " + joined(names) + "\n\n";
}

}  // namespace

std::size_t fileOf(const State& state, const std::string& oid) {
  std::size_t file = 0;
  while (file < state.fileSets.size() && state.fileSets[file].count(oid) == 0) {
    ++file;
  }
  return file;
}

int dropFromFileSets(State* self, const std::string& oid) {
  const std::size_t file = fileOf(*self, oid);
  if (file == self->fileSets.size()) {
    return 32;
  }
  self->fileSets[file].erase(oid);
  return 0;
}

// ---- Comparison ----

void compareAttributes(State* self, const State& reference) {
  OidSet dropped;
  for (const auto& entry : self->attrTable) {
    Attribute* const mine = attributeOf(*self, entry.first);
    const std::string name = mine->getFirstNameLower();
    bool isDropped = self->excludedOids.count(mine->getOid()) != 0;
    if (!isDropped && reference.attrTable.count(name) != 0) {
      isDropped = mine->attrsEqual(*attributeOf(reference, entry.first)) == 1;
    }
    if (isDropped) {
      dropped.insert(name);
      dropFromFileSets(self, mine->getOid());
    }
  }
  eraseAll(dropped, &self->attrTable);
}

void compareClasses(State* self, const State& reference) {
  OidSet dropped;
  for (const auto& entry : self->ocTable) {
    ObjectClass* const mine = classOf(*self, entry.first);
    const std::string name = mine->getFirstNameLower();
    bool isDropped = self->excludedOids.count(mine->getOid()) != 0;
    if (!isDropped && reference.ocTable.count(name) != 0) {
      isDropped = mine->objsEqual(*classOf(reference, entry.first));
    }
    if (isDropped) {
      dropped.insert(name);
      dropFromFileSets(self, mine->getOid());
    }
  }
  eraseAll(dropped, &self->ocTable);
}

void compareExtensions(State* self, const State& reference) {
  OidSet dropped;
  for (const auto& [key, mine] : self->orvAttrTable) {
    bool isDropped = self->excludedOids.count(mine->getOid()) != 0;
    if (!isDropped && reference.orvAttrTable.count(mine->getOid()) != 0) {
      isDropped = mine->orvAttrsEqual(*entryOf(reference.orvAttrTable, key));
    }
    if (isDropped) {
      dropped.insert(mine->getOid());
    }
  }
  eraseAll(dropped, &self->orvAttrTable);
}

void compareAll(State* self, const State& reference) {
  compareAttributes(self, reference);
  compareExtensions(self, reference);
  compareClasses(self, reference);
}

// ---- Merge ----

bool mergeAttributes(State* self, State* source) {
  OidSet names;
  OidSet oids;
  for (const auto& entry : source->attrTable) {
    Attribute* const moved = entry.second;
    if (self->attrTable.count(moved->getFirstNameLower()) != 0) {
      if (Attribute* const replaced = attributeOf(*self, moved->getOid())) {
        self->attrTable.erase(replaced->getFirstNameLower());
        self->attrOidTable.erase(replaced->getOid());
      }
    } else if (!join(self, *source, moved->getOid())) {
      return false;
    }
    self->attrTable.insert({moved->getFirstNameLower(), moved});
    self->attrOidTable.insert({moved->getOid(), moved});
    names.insert(moved->getFirstNameLower());
    oids.insert(moved->getOid());
  }
  eraseAll(names, &source->attrTable);
  eraseAll(oids, &source->attrOidTable);
  return true;
}

bool mergeClasses(State* self, State* source) {
  OidSet names;
  OidSet oids;
  for (const auto& entry : source->ocTable) {
    ObjectClass* const moved = entry.second;
    if (self->ocTable.count(moved->getFirstNameLower()) != 0) {
      if (ObjectClass* const replaced = classOf(*self, moved->getOid())) {
        self->ocTable.erase(replaced->getFirstNameLower());
        self->ocOidTable.erase(replaced->getOid());
      }
    } else if (!join(self, *source, moved->getOid())) {
      return false;
    }
    self->ocTable.insert({moved->getFirstNameLower(), moved});
    self->ocOidTable.insert({moved->getOid(), moved});
    names.insert(moved->getFirstNameLower());
    oids.insert(moved->getOid());
  }
  eraseAll(names, &source->ocTable);
  eraseAll(oids, &source->ocOidTable);
  return true;
}

bool mergeExtensions(State* self, State* source) {
  OidSet oids;
  for (const auto& entry : source->orvAttrTable) {
    ORVAttribute* const moved = entry.second;
    if (self->orvAttrTable.count(moved->getOid()) != 0) {
      self->orvAttrTable.erase(moved->getOid());
    } else if (!join(self, *source, moved->getOid())) {
      return false;
    }
    self->orvAttrTable.insert({moved->getOid(), moved});
    oids.insert(moved->getOid());
  }
  eraseAll(oids, &source->orvAttrTable);
  return true;
}

bool mergeAll(State* self, State* source) {
  return mergeAttributes(self, source) && mergeExtensions(self, source) &&
         mergeClasses(self, source);
}

// ---- Collision check ----

void checkClasses(State* self, const State& reference) {
  OidSet kept;
  OidSet dropped;
  for (const auto& entry : self->ocTable) {
    ObjectClass* const mine = classOf(*self, entry.first);
    const std::string oid = mine->getOid();
    const bool collides = reference.ocTable.count(mine->getFirstNameLower()) != 0 ||
                          reference.ocTable.count(oid) != 0 ||
                          reference.attrTable.count(oid) != 0 ||
                          reference.orvAttrTable.count(oid) != 0;
    if (!collides) {
      dropped.insert(mine->getFirstNameLower());
    }
  }
  eraseAll(dropped, &self->ocTable);
}

void checkAttributes(State* self, State* reference) {
  OidSet colliding;
  OidSet dropped;
  for (const auto& entry : self->attrTable) {
    Attribute* const mine = attributeOf(*self, entry.first);
    const std::string oid = mine->getOid();
    const bool collides = reference->attrTable.count(mine->getFirstNameLower()) != 0 ||
                          reference->attrTable.count(oid) != 0 ||
                          reference->ocTable.count(oid) != 0 ||
                          reference->orvAttrTable.count(oid) != 0;
    if (collides) {
      colliding.insert(oid);
    } else {
      dropped.insert(mine->getFirstNameLower());
    }
  }
  eraseAll(dropped, &self->attrTable);
  eraseAll(colliding, &reference->attrOidTable);
}

void checkExtensions(State* self, const State& reference) {
  OidSet dropped;
  for (const auto& entry : self->orvAttrTable) {
    const std::string oid = entry.second->getOid();
    const bool collides = reference.orvAttrTable.count(oid) != 0 ||
                          reference.ocTable.count(oid) != 0 || reference.attrTable.count(oid) != 0;
    if (!collides) {
      dropped.insert(oid);
    }
  }
  eraseAll(dropped, &self->orvAttrTable);
}

void checkAll(State* self, State* reference) {
  checkClasses(self, *reference);
  checkAttributes(self, reference);
  checkExtensions(self, *reference);
}

std::string reportsOf(const State& state) {
  std::string text = state.ocTable.empty()
                         ? "No objectClasses definition collisions found.\n"
                         : "The following objectClasses definition collisions found:\n";
  for (const auto& entry : state.ocTable) {
    text += entryOf(entry.second->getOid(), entry.second->getNames());
  }
  text += state.orvAttrTable.empty()
              ? "No ORVAttributeTypes definition collisions found.\n"
              : "The following ORVAttributeTypes definition collisions found:\n";
  for (const auto& entry : state.orvAttrTable) {
    text += entryOf(entry.second->getOid(), databaseNamesOf(*entry.second));
  }
  text += state.attrTable.empty() ? "No attributeTypes definition collisions found.\n"
                                  : "The following attributeTypes collisions found:\n";
  for (const auto& entry : state.attrTable) {
    text += entryOf(entry.second->getOid(), entry.second->getNames());
  }
  return text;
}

// ---- Lists of OIDs ----

void withdraw(State* self, const OidSet& oids) {
  for (const std::string& oid : oids) {
    if (self->ocOidTable.count(oid) != 0) {
      self->ocTable.erase(classOf(*self, oid)->getFirstNameLower());
    } else if (self->attrOidTable.count(oid) != 0) {
      self->attrTable.erase(attributeOf(*self, oid)->getFirstNameLower());
    } else if (self->orvAttrTable.count(oid) != 0) {
      self->orvAttrTable.erase(oid);
    } else {
      continue;
    }
    self->modSchemaOids.erase(oid);
  }
}

OidSet oidsIn(const std::string& list) {
  OidSet oids;
  std::size_t at = 0;
  for (;;) {
    while (at < list.size() && isSpace(list[at])) {
      ++at;
    }
    std::string word;
    while (at < list.size() && !isSpace(list[at])) {
      word += list[at++];
    }
    if (at == list.size()) {
      return oids;
    }
    if (word.find('#') == std::string::npos) {
      oids.insert(word);
      continue;
    }
    while (at < list.size() && list[at] != '\n') {
      ++at;
    }
    at += at < list.size() ? 1 : 0;
  }
}

}  // namespace properties
