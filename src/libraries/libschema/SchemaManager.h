// The schema of one directory: the definitions read from its V3.* files in tables, the OIDs that
// each file contributed, and the operations between two schemas.
//
// A manager owns the definitions in its two name-keyed tables and in the table of vendor
// extensions, and deletes them when it is destroyed. An entry that an operation erases is not
// deleted. A merge moves the definitions of one manager into another. Every table keeps the first
// definition under a key. One thread at a time: reading changes the locale of the process and
// rewrites diagnostic files with fixed names (/tmp/attr.txt, /tmp/orvattr.txt,
// /tmp/objectclass.txt, /tmp/lexan.txt and, after a failure, /tmp/table.txt).
//
// The file names are "V3.user.oc", "V3.user.at", "V3.orv.oc", "V3.orv.at", "V3.system.oc",
// "V3.system.at" and "V3.modifiedschema", each with a set of the OIDs it contributed, and
// "V3.config.at" and "V3.config.oc", without one.

#ifndef LIBSCHEMA_SCHEMA_MANAGER_H
#define LIBSCHEMA_SCHEMA_MANAGER_H

#include <functional>
#include <map>
#include <memory>
#include <memory_resource>
#include <set>
#include <string>

#include "Attribute.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "SchemaLexan.h"

class SchemaManager {
 public:
  // `directory` is kept as given; readFile looks every file up in it.
  SchemaManager(std::string directory);
  ~SchemaManager();
  SchemaManager(const SchemaManager&) = delete;
  SchemaManager& operator=(const SchemaManager&) = delete;

  // ---- Reading ----

  // Reads one file and adds its definitions to the tables and to the file's OID set. Returns 0 when
  // the whole file was read; 1 when it could not be opened or parsed (what was read before the
  // failure stays); 89 when the name is not one of the nine.
  int readFile(std::string fileName);

  // Adds the OIDs listed in the file `path` (words separated by white space; a word with "#" begins
  // a comment) to the excluded OIDs. A last word without white space after it is not stored.
  // Returns 0, or 1 when the file could not be opened.
  int readExcludedOids(std::string path);

  // Withdraws every definition that the list of OIDs in the file `path` names (words as above): its
  // entry leaves the table keyed by name (the one of the vendor extensions when the OID names
  // neither an object class nor an attribute type), and its OID the set of V3.modifiedschema. It is
  // still found by OID, and written. Returns 0, or 1 when the file could not be opened.
  int modifySchema(std::string path);

  // ---- Looking up ----

  // A copy of the definition with this first name or, failing that, this OID. Only getAttr folds
  // the letter case of the key; getObjClass wants a name in lower case. getORVAttr takes an OID.
  // For an absent key the result is a newly constructed definition.
  Attribute getAttr(std::string key);
  ObjectClass getObjClass(std::string key);
  ORVAttribute getORVAttr(std::string key);

  // Returns `s` with every character passed through tolower.
  std::string convert(std::string s);

  // True when the OID was listed, character for character, in a file of excluded OIDs.
  bool isExcluded(std::string oid);

  // True when the OID set of V3.modifiedschema is empty.
  bool isModFileEmpty();

  // ---- Between two managers ----

  // Leaves in this manager only what `reference` lacks or defines differently, less every
  // definition whose OID is excluded here. Attribute types and object classes are matched by first
  // name, vendor extensions by OID; the OIDs of dropped attribute types and object classes leave
  // their file's set. `reference` is not changed. Always true.
  bool compSchemas(SchemaManager* reference);
  bool compAttrTables(SchemaManager* reference);
  bool compORVAttrTables(SchemaManager* reference);
  bool compObjTables(SchemaManager* reference);

  // Moves every definition of `source` here. One that is here already (matched as above) is
  // replaced and keeps its file; one that is not joins the OID set of the file that `source` read
  // it from. Returns false at the first definition that is lacking here and that none of the six
  // sets of `source` holds (it came from V3.modifiedschema or a config file): both managers then
  // hold the definitions of the interrupted pass, and must not both be destroyed.
  bool mergeSchemas(SchemaManager* source);
  bool mergeAttrs(SchemaManager* source);
  bool mergeORVAttrs(SchemaManager* source);
  bool mergeObjClasses(SchemaManager* source);

  // Returns the OID set of this manager for the file whose set in `source` holds the OID, or null
  // when none of the six does. The set belongs to this manager.
  std::set<std::string>* findOidInSet(SchemaManager* source, std::string oid);

  // Leaves in the tables of this manager only what collides with `reference`, and takes the OIDs of
  // colliding attribute types out of the OID index of `reference`. Always true.
  bool checkCollisions(SchemaManager* reference);
  bool checkObjClasses(SchemaManager* reference);
  bool checkAttrs(SchemaManager* reference);
  bool checkORVAttrs(SchemaManager* reference);

  // The report of a collision check: a heading and an entry for each definition in the table, or
  // the text that there is none.
  std::string getOcTable();
  std::string getAttrTable();
  std::string getORVAttrTable();

  // ---- OID sets ----

  // Takes the OID out of the first file set that holds it (V3.modifiedschema has no part in this).
  // Returns 0, or 32 when no set held it.
  int delOidFromFileSet(std::string oid);

  // Takes the OID out of the set of V3.modifiedschema. Returns 0, or 32 when it was not there.
  int delOidFromModSch(std::string oid);

  // ---- Writing ----

  // Writes the definitions in the OID set of `fileName` to directory + "/" + fileName. Returns 0; 1
  // when the file could not be opened; 89, with nothing written, when the name is not one of the
  // seven that have a set. A failure to write after opening is not detected.
  int writeFile(std::string directory, std::string fileName);

  // Writes the definitions with these OIDs, in the order of the set, below a header line; an empty
  // set makes an empty file. For each OID the object class or else the attribute type, followed by
  // its vendor extension; an OID without either is passed over. Returns 0, or 1 when the file could
  // not be opened.
  int writeSetToFile(std::set<std::string> oids, std::string path);

  // ---- Debug print, to standard output ----

  // Each prints one table, or one set of OIDs: the attribute types, vendor extensions and object
  // classes; the sets of the user, vendor and system files; the excluded OIDs. Nothing is changed.
  void dumpAttrTable();
  void dumpORVAttrTable();
  void dumpOcTable();
  void dumpUserOc();
  void dumpUserAt();
  void dumpOrvOc();
  void dumpOrvAt();
  void dumpSysOc();
  void dumpSysAt();
  void dumpEOids();

 private:
  using OidSet = std::set<std::string>;

  // The keys are the manager's own, in its pool like the entries: a table can be searched whatever
  // has become of the definitions.
  template <typename Definition>
  using Table = std::pmr::map<std::pmr::string, Definition*, std::less<>>;

  // A schema file that can be read; `oids` is null for the two that have no set.
  struct SchemaFile {
    const char* name;
    OidSet SchemaManager::*oids;
  };
  static const SchemaFile kFiles[9];
  static const SchemaFile* findFile(const std::string& fileName);

  // The six sets that comparison and merge maintain, in the order in which they are searched.
  static OidSet SchemaManager::*const kFileSets[6];

  // Reading one file, and the operations between two managers.
  class FileReader;
  struct Operations;

  // The public operations on their arguments in place, with the same trace records. The look-ups
  // return null for an absent key.
  const Attribute* lookUpAttr(const std::string& key) const;
  const ObjectClass* lookUpObjClass(const std::string& key) const;
  const ORVAttribute* lookUpORVAttr(const std::string& key) const;
  bool excludes(const std::string& oid) const;
  int dropFromFileSets(const std::string& oid);
  int dropFromModSch(const std::string& oid);
  int writeOids(const OidSet& oids, const std::string& path);

  std::unique_ptr<SchemaLexan> lexan;  // null but while a file is read
  // Not the default resource of the process, which the host may replace, and take away.
  std::pmr::monotonic_buffer_resource pool{std::pmr::new_delete_resource()};
  Table<Attribute> attrTable{&pool};        // by lower-cased first name; owner
  Table<ObjectClass> ocTable{&pool};        // by lower-cased first name; owner
  Table<ORVAttribute> orvAttrTable{&pool};  // by OID; owner
  Table<Attribute> attrOidTable{&pool};     // by OID; the objects of attrTable
  Table<ObjectClass> ocOidTable{&pool};     // by OID; the objects of ocTable
  std::string directory;
  OidSet userAtOids;
  OidSet userOcOids;
  OidSet orvAtOids;
  OidSet orvOcOids;
  OidSet sysAtOids;
  OidSet sysOcOids;
  OidSet modSchemaOids;
  OidSet excludedOids;
};

#endif  // LIBSCHEMA_SCHEMA_MANAGER_H
