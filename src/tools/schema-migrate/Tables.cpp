#include "Tables.h"

#include <algorithm>

namespace {

constexpr unsigned bitOf(std::size_t file) { return 1U << file; }

// Of ASCII letters: the library lower-cases in the "C" locale.
std::string lowered(std::string text) {
  for (char& c : text) {
    c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
  }
  return text;
}

const Definition* findIn(const Tables::Table& table, std::string_view key) {
  const auto entry = table.find(key);
  return entry == table.end() ? nullptr : entry->second;
}

// Returns the definition that stands there already, or null.
const Definition* enterInto(Tables::Table* table, std::string_view key,
                            const Definition& definition) {
  const auto [entry, isEntered] = table->try_emplace(key, &definition);
  return isEntered ? nullptr : entry->second;
}

}  // namespace

Tables::Tables(const Inventory& inventory) : m_earlier(inventory.definitions().size()) {
  for (const Definition& definition : inventory.definitions()) {
    // In a block, a definition without an OID enters nothing.
    if (!definition.isInBlock || !definition.oid.empty()) {
      enter(definition);
    }
  }
}

void Tables::enter(const Definition& definition) {
  Earlier& earlier = m_earlier[definition.index];
  earlier.byKey = enterInto(&walked(definition.kind), keyOf(definition), definition);
  if (definition.kind != DefinitionKind::kVendorExtension) {
    earlier.byOid = enterInto(&byOid(definition.kind), definition.oid, definition);
  }
  if (definition.file < kWrittenFiles) {
    m_sets[definition.oid] |= bitOf(definition.file);
  }
}

std::string_view Tables::keyOf(const Definition& definition) {
  return definition.kind == DefinitionKind::kVendorExtension ? definition.oid : definition.key;
}

const Definition* Tables::walkedAt(DefinitionKind kind, std::string_view key) const {
  return findIn(m_walked[static_cast<std::size_t>(kind)], key);
}

const Definition* Tables::atOid(DefinitionKind kind, std::string_view oid) const {
  return findIn(m_byOid[static_cast<std::size_t>(kind)], oid);
}

// Only the look-up of attribute types folds the letter case of its key.
const Definition* Tables::lookUp(DefinitionKind kind, const std::string& key) const {
  const bool folds = kind == DefinitionKind::kAttributeType;
  const Definition* const named = walkedAt(kind, folds ? lowered(key) : key);
  return named != nullptr ? named : atOid(kind, key);
}

std::vector<const Definition*> Tables::inOrder(DefinitionKind kind) const {
  std::vector<const Definition*> definitions;
  const Table& table = m_walked[static_cast<std::size_t>(kind)];
  definitions.reserve(table.size());
  for (const auto& entry : table) {
    definitions.push_back(entry.second);
  }
  std::sort(
      definitions.begin(), definitions.end(),
      [](const Definition* one, const Definition* other) { return keyOf(*one) < keyOf(*other); });
  return definitions;
}

void Tables::dropFromFileSets(const std::string& oid) {
  const std::size_t file = fileSetOf(oid);
  if (file != kNoSchemaFile) {
    m_sets[oid] &= ~bitOf(file);
  }
}

std::size_t Tables::fileSetOf(const std::string& oid) const {
  const auto entry = m_sets.find(oid);
  for (std::size_t file = 0; file < kMergedFiles && entry != m_sets.end(); ++file) {
    if ((entry->second & bitOf(file)) != 0) {
      return file;
    }
  }
  return kNoSchemaFile;
}

void Tables::addToFileSet(std::size_t file, const std::string& oid) { m_sets[oid] |= bitOf(file); }

std::vector<Tables::FiledOid> Tables::filedOids() const {
  std::vector<FiledOid> oids;
  oids.reserve(m_sets.size());
  for (const auto& entry : m_sets) {
    if (entry.second != 0) {
      oids.push_back({entry.first, entry.second});
    }
  }
  return oids;
}

std::array<const Definition*, 2> Tables::writtenFor(std::string_view oid) const {
  if (const Definition* const objectClass = atOid(DefinitionKind::kObjectClass, oid)) {
    return {objectClass, nullptr};
  }
  const Definition* const attribute = atOid(DefinitionKind::kAttributeType, oid);
  if (attribute == nullptr) {
    return {nullptr, nullptr};
  }
  return {attribute, walkedAt(DefinitionKind::kVendorExtension, attribute->oid)};
}
