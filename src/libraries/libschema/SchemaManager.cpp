#include "SchemaManager.h"

#include <fstream>
#include <ostream>
#include <string_view>
#include <utility>

#include "AscendingLookup.h"
#include "CaseFolding.h"
#include "OidWords.h"
#include "SchemaResults.h"
#include "StandardOutput.h"
#include "TracePoints.h"
#include "timestamp.h"

using libschema::AscendingLookup;

namespace {

template <typename Table>
void deleteAll(Table* table) {
  for (const auto& entry : *table) {
    const ORVSchema* const definition = entry.second;
    delete definition;
  }
  table->clear();
}

template <typename Table>
typename Table::mapped_type findIn(const Table& table, std::string_view key) {
  const auto entry = table.find(key);
  return entry == table.end() ? nullptr : entry->second;
}

template <typename Table>
bool eraseFrom(Table* table, std::string_view key) {
  const auto entry = table->find(key);
  const bool isThere = entry != table->end();
  if (isThere) {
    table->erase(entry);
  }
  return isThere;
}

// An absent definition reads as a newly constructed one.
template <typename Definition>
Definition copyOf(const Definition* definition) {
  return definition == nullptr ? Definition() : *definition;
}

// A look-up whose answer is known already leaves its trace records all the same.
const ORVAttribute* answerOfGetORVAttr(const ORVAttribute* extension) {
  tracepoint::GetORVAttr trace;
  return extension;
}

template <typename Table>
void printTable(const char* heading, const Table& table) {
  std::ostream& out = libschema::standardOutput();
  out << heading;
  for (const auto& entry : table) {
    out << std::endl << entry.first << '\t';
    entry.second->dump();
    out << std::endl;
  }
  out << std::endl;
}

void printOids(const char* heading, const std::set<std::string>& oids) {
  std::ostream& out = libschema::standardOutput();
  out << heading;
  for (const std::string& oid : oids) {
    out << oid << std::endl;
  }
  out << std::endl;
}

}  // namespace

// In the order in which a name is looked for.
const SchemaManager::SchemaFile SchemaManager::kFiles[9] = {
    {"V3.user.oc", &SchemaManager::userOcOids},
    {"V3.user.at", &SchemaManager::userAtOids},
    {"V3.orv.oc", &SchemaManager::orvOcOids},
    {"V3.orv.at", &SchemaManager::orvAtOids},
    {"V3.system.oc", &SchemaManager::sysOcOids},
    {"V3.system.at", &SchemaManager::sysAtOids},
    {"V3.modifiedschema", &SchemaManager::modSchemaOids},
    {"V3.config.at", nullptr},
    {"V3.config.oc", nullptr},
};

SchemaManager::OidSet SchemaManager::*const SchemaManager::kFileSets[6] = {
    &SchemaManager::userOcOids, &SchemaManager::userAtOids, &SchemaManager::orvOcOids,
    &SchemaManager::orvAtOids,  &SchemaManager::sysOcOids,  &SchemaManager::sysAtOids,
};

const SchemaManager::SchemaFile* SchemaManager::findFile(const std::string& fileName) {
  for (const SchemaFile& file : kFiles) {
    if (fileName == file.name) {
      return &file;
    }
  }
  return nullptr;
}

SchemaManager::SchemaManager(std::string schemaDirectory) : directory(std::move(schemaDirectory)) {}

// The OID indexes only refer: an object that none but they hold is not deleted.
SchemaManager::~SchemaManager() {
  deleteAll(&attrTable);
  deleteAll(&ocTable);
  deleteAll(&orvAttrTable);
}

// ---- Lists of OIDs ----

int SchemaManager::readExcludedOids(std::string path) {
  tracepoint::ReadExcludedOids trace;
  if (!libschema::readOidWords(path, &excludedOids)) {
    TRACE_DEBUG(trace, "readExcludedOids: Unable to open file for reading, %s.\n", path.c_str());
    return trace.status(kFailed);
  }
  return trace.status(kDone);
}

// Only the name table loses an entry. The OID index keeps it, so a file set that lists the OID
// still writes it.  ModifySchema.WithdrawnAttributeIsStillWritten.
int SchemaManager::modifySchema(std::string path) {
  tracepoint::ModifySchema trace;
  OidSet withdrawn;
  if (!libschema::readOidWords(path, &withdrawn)) {
    TRACE_DEBUG(trace, "modifySchema: Unable to open file, %s, for reading.\n", path.c_str());
    return trace.status(kFailed);
  }
  for (const std::string& oid : withdrawn) {
    if (findIn(ocOidTable, oid) != nullptr) {
      eraseFrom(&ocTable, lookUpObjClass(oid)->firstNameLower());
    } else if (findIn(attrOidTable, oid) != nullptr) {
      eraseFrom(&attrTable, lookUpAttr(oid)->firstNameLower());
    } else if (!eraseFrom(&orvAttrTable, oid)) {
      continue;
    }
    static_cast<void>(dropFromModSch(oid));
  }
  return trace.status(kDone);
}

// ---- Looking up ----

// Only this look-up folds the letter case of its key.  Lookups.OnlyGetAttrFoldsItsKey.
const Attribute* SchemaManager::lookUpAttr(const std::string& key) const {
  tracepoint::GetAttr trace;
  const Attribute* const byName = findIn(attrTable, libschema::lowered(key));
  return byName != nullptr ? byName : findIn(attrOidTable, key);
}

const ObjectClass* SchemaManager::lookUpObjClass(const std::string& key) const {
  tracepoint::GetObjClass trace;
  const ObjectClass* const byName = findIn(ocTable, key);
  return byName != nullptr ? byName : findIn(ocOidTable, key);
}

const ORVAttribute* SchemaManager::lookUpORVAttr(const std::string& key) const {
  tracepoint::GetORVAttr trace;
  return findIn(orvAttrTable, key);
}

Attribute SchemaManager::getAttr(std::string key) { return copyOf(lookUpAttr(key)); }

ObjectClass SchemaManager::getObjClass(std::string key) { return copyOf(lookUpObjClass(key)); }

ORVAttribute SchemaManager::getORVAttr(std::string key) { return copyOf(lookUpORVAttr(key)); }

std::string SchemaManager::convert(std::string s) { return libschema::lowered(std::move(s)); }

bool SchemaManager::isExcluded(std::string oid) { return excludes(oid); }

bool SchemaManager::excludes(const std::string& oid) const {
  tracepoint::IsExcluded trace;
  return excludedOids.count(oid) != 0;
}

bool SchemaManager::isModFileEmpty() {
  tracepoint::IsModFileEmpty trace;
  return modSchemaOids.empty();
}

// ---- OID sets ----

int SchemaManager::delOidFromFileSet(std::string oid) { return dropFromFileSets(oid); }

int SchemaManager::dropFromFileSets(const std::string& oid) {
  tracepoint::DelOidFromFileSet trace;
  for (OidSet SchemaManager::*const set : kFileSets) {
    const auto place = (this->*set).find(oid);
    if (place != (this->*set).end()) {
      (this->*set).erase(place);
      return trace.status(kDone);
    }
  }
  TRACE_DEBUG(trace, "delOidFromFileSet: Unable to delete OID from set, %s.\n", oid.c_str());
  return trace.status(kNotInSet);
}

int SchemaManager::delOidFromModSch(std::string oid) { return dropFromModSch(oid); }

int SchemaManager::dropFromModSch(const std::string& oid) {
  tracepoint::DelOidFromModSch trace;
  return trace.status(modSchemaOids.erase(oid) != 0 ? kDone : kNotInSet);
}

// ---- Writing ----

int SchemaManager::writeFile(std::string targetDirectory, std::string fileName) {
  tracepoint::WriteFile trace;
  const std::string path = targetDirectory + "/" + fileName;
  const SchemaFile* const file = findFile(fileName);
  if (file == nullptr || file->oids == nullptr) {
    TRACE_DEBUG(trace, "writeFile: Unexpected file name given, %s\n", fileName.c_str());
    return trace.status(kUnknownFile);
  }
  return trace.status(writeOids(this->*file->oids, path));
}

int SchemaManager::writeSetToFile(std::set<std::string> oids, std::string path) {
  return writeOids(oids, path);
}

int SchemaManager::writeOids(const OidSet& oids, const std::string& path) {
  tracepoint::WriteSetToFile trace;
  std::ofstream out(path);
  if (!out.is_open()) {
    TRACE_DEBUG(trace, "writeSetToFile: Unable to open file for writing, %s.\n", path.c_str());
    return trace.status(kFailed);
  }
  if (oids.empty()) {
    return trace.status(kDone);
  }
  constexpr std::size_t kChunk = std::size_t{1} << 17;
  std::string text = "# File generated by 6.1 migration " + getCurrentTimeStamp(1) + "\n";
  const auto flush = [&] {
    out.write(text.data(), static_cast<std::streamsize>(text.size()));
    out.flush();
    text.clear();
  };
  AscendingLookup<Table<ObjectClass>> objectClasses(ocOidTable);
  AscendingLookup<Table<Attribute>> attributes(attrOidTable);
  AscendingLookup<Table<ORVAttribute>> extensions(orvAttrTable);
  for (const std::string& oid : oids) {
    const auto objectClass = objectClasses.find(oid);
    if (objectClass != ocOidTable.end()) {
      objectClass->second->appendLine(&text);
    } else if (const auto attribute = attributes.find(oid); attribute != attrOidTable.end()) {
      attribute->second->appendLine(&text);
      const auto extension = extensions.find(attribute->second->oidInPlace());
      if (extension != orvAttrTable.end()) {
        answerOfGetORVAttr(extension->second)->appendLine(&text);
      }
    }
    if (text.size() >= kChunk) {
      flush();
    }
  }
  flush();
  return trace.status(kDone);
}

// ---- Debug print ----

void SchemaManager::dumpAttrTable() {
  tracepoint::DumpAttrTable trace;
  printTable("AttributeTable contains:\nKey\nValue\n", attrTable);
}

void SchemaManager::dumpORVAttrTable() {
  tracepoint::DumpORVAttrTable trace;
  printTable("ORVAttributeTable contains:\nKey\nValue\n", orvAttrTable);
}

void SchemaManager::dumpOcTable() {
  tracepoint::DumpOcTable trace;
  printTable("ObjectClassTable contains:\nKey\tValue\n", ocTable);
}

void SchemaManager::dumpUserOc() {
  tracepoint::DumpUserOc trace;
  printOids("OIDs from the V3.user.oc file\n", userOcOids);
}

void SchemaManager::dumpUserAt() {
  tracepoint::DumpUserAt trace;
  printOids("OIDs from the V3.user.at file\n", userAtOids);
}

void SchemaManager::dumpOrvOc() {
  tracepoint::DumpOrvOc trace;
  printOids("OIDs from the V3.orv.oc file\n", orvOcOids);
}

void SchemaManager::dumpOrvAt() {
  tracepoint::DumpOrvAt trace;
  printOids("OIDs from the V3.orv.at file\n", orvAtOids);
}

void SchemaManager::dumpSysOc() {
  tracepoint::DumpSysOc trace;
  printOids("OIDs from the V3.system.oc file\n", sysOcOids);
}

void SchemaManager::dumpSysAt() {
  tracepoint::DumpSysAt trace;
  printOids("OIDs from the V3.system.at file\n", sysAtOids);
}

void SchemaManager::dumpEOids() {
  tracepoint::DumpEOids trace;
  printOids("excluded oids\n", excludedOids);
}
