#include "ManagerTables.h"

#include <iterator>
#include <utility>

namespace properties {

namespace {

template <typename Definition, typename AnyTable>
Table<Definition> copyOf(const AnyTable& table) {
  Table<Definition> copy;
  for (const auto& [key, definition] : table) {
    copy.emplace(std::string(key), definition);
  }
  return copy;
}

template <typename AnySet>
OidSet copyOf(const AnySet& oids) {
  return OidSet(oids.begin(), oids.end());
}

// Takes out of each table what is owned elsewhere already.
template <typename... AnyTables>
void claim(std::set<ORVSchema*>* owned, AnyTables*... tables) {
  const auto claimIn = [&](auto* table) {
    for (auto entry = table->begin(); entry != table->end();) {
      entry = owned->insert(entry->second).second ? std::next(entry) : table->erase(entry);
    }
  };
  (claimIn(tables), ...);
}

// Access to private members by name: the arguments of an explicit instantiation are not checked for
// access, and the friends defined there are ordinary functions.
struct ExtensionMembers {
  const std::vector<std::string>& databaseNames;
  const std::string& access;
  const std::string& length;
};

State membersOf(const SchemaManager& manager);
void claimOwned(SchemaManager* manager, std::set<ORVSchema*>* owned);
ExtensionMembers membersOf(const ORVAttribute& extension);

template <auto attrTable, auto ocTable, auto orvAttrTable, auto attrOidTable, auto ocOidTable,
          auto modSchemaOids, auto excludedOids, auto... fileSets>
struct OpenManager {
  friend State membersOf(const SchemaManager& manager) {
    return {copyOf<Attribute>(manager.*attrTable),
            copyOf<ObjectClass>(manager.*ocTable),
            copyOf<ORVAttribute>(manager.*orvAttrTable),
            copyOf<Attribute>(manager.*attrOidTable),
            copyOf<ObjectClass>(manager.*ocOidTable),
            {copyOf(manager.*fileSets)...},
            copyOf(manager.*modSchemaOids),
            copyOf(manager.*excludedOids)};
  }

  friend void claimOwned(SchemaManager* manager, std::set<ORVSchema*>* owned) {
    claim(owned, &(manager->*attrTable), &(manager->*ocTable), &(manager->*orvAttrTable));
  }
};
template struct OpenManager<
    &SchemaManager::attrTable, &SchemaManager::ocTable, &SchemaManager::orvAttrTable,
    &SchemaManager::attrOidTable, &SchemaManager::ocOidTable, &SchemaManager::modSchemaOids,
    &SchemaManager::excludedOids, &SchemaManager::userOcOids, &SchemaManager::userAtOids,
    &SchemaManager::orvOcOids, &SchemaManager::orvAtOids, &SchemaManager::sysOcOids,
    &SchemaManager::sysAtOids>;

template <auto databaseNames, auto access, auto length>
struct OpenExtension {
  friend ExtensionMembers membersOf(const ORVAttribute& extension) {
    return {extension.*databaseNames, extension.*access, extension.*length};
  }
};
template struct OpenExtension<&ORVAttribute::dbNames, &ORVAttribute::access, &ORVAttribute::length>;

template <typename Definition>
std::string describe(const Table<Definition>& table) {
  std::string text;
  for (const auto& [key, definition] : table) {
    text += " '" + key + "'=" + definition->getOid() + "(" + definition->getFirstName() + ", " +
            definition->getDescription() + ")";
  }
  return text;
}

std::string describe(const OidSet& oids) {
  std::string text;
  for (const std::string& oid : oids) {
    text += " '" + oid + "'";
  }
  return text;
}

template <typename Value>
void compare(const char* name, const Value& expected, const Value& actual, std::string* text) {
  if (!(expected == actual)) {
    *text += std::string(name) + ": expected" + describe(expected) + ", is" + describe(actual) +
             (describe(expected) == describe(actual) ? " (other objects)\n" : "\n");
  }
}

template <typename Definition>
void collect(const Table<Definition>& table, std::set<ORVSchema*>* definitions) {
  for (const auto& entry : table) {
    definitions->insert(entry.second);
  }
}

}  // namespace

State stateOf(const SchemaManager& manager) { return membersOf(manager); }

std::string differenceOf(const State& expected, const State& actual) {
  std::string text;
  compare("attrTable", expected.attrTable, actual.attrTable, &text);
  compare("ocTable", expected.ocTable, actual.ocTable, &text);
  compare("orvAttrTable", expected.orvAttrTable, actual.orvAttrTable, &text);
  compare("attrOidTable", expected.attrOidTable, actual.attrOidTable, &text);
  compare("ocOidTable", expected.ocOidTable, actual.ocOidTable, &text);
  for (std::size_t i = 0; i < kFileNames.size(); ++i) {
    compare(kFileNames[i], expected.fileSets[i], actual.fileSets[i], &text);
  }
  compare("V3.modifiedschema", expected.modSchemaOids, actual.modSchemaOids, &text);
  compare("excluded OIDs", expected.excludedOids, actual.excludedOids, &text);
  return text;
}

const std::vector<std::string>& databaseNamesOf(const ORVAttribute& extension) {
  return membersOf(extension).databaseNames;
}

const std::string& accessOf(const ORVAttribute& extension) { return membersOf(extension).access; }

const std::string& lengthOf(const ORVAttribute& extension) { return membersOf(extension).length; }

std::set<ORVSchema*> definitionsOf(const SchemaManager& manager) {
  const State state = stateOf(manager);
  std::set<ORVSchema*> definitions;
  collect(state.attrTable, &definitions);
  collect(state.ocTable, &definitions);
  collect(state.orvAttrTable, &definitions);
  collect(state.attrOidTable, &definitions);
  collect(state.ocOidTable, &definitions);
  return definitions;
}

void destroyWithAllDefinitions(const std::set<ORVSchema*>& read,
                               std::vector<std::unique_ptr<SchemaManager>>* managers) {
  std::set<ORVSchema*> owned;
  for (const auto& manager : *managers) {
    claimOwned(manager.get(), &owned);
  }
  managers->clear();
  for (ORVSchema* const definition : read) {
    if (owned.count(definition) == 0) {
      delete definition;
    }
  }
}

}  // namespace properties
