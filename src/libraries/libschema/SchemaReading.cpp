// Reading one file of a schema: from its tokens to definitions, and from these to the tables.

#include <array>
#include <fstream>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "DiagnosticFile.h"
#include "SchemaManager.h"
#include "SchemaResults.h"
#include "TracePoints.h"

namespace {

constexpr char kTableDump[] = "/tmp/table.txt";
constexpr int kDiagnosticIndent = 5;

// What reading does differently for one kind of definition: the file that a failed one is dumped
// to, and the messages.
template <typename Definition>
struct ReadingOf;

template <>
struct ReadingOf<Attribute> {
  static constexpr std::size_t kDumpFile = 0;
  static constexpr char kSingle[] = "readFile: (1).Error occured while parsing the attribute: %s\n";
  static constexpr char kInBlock[] =
      "readFile: (2).Error occured while parsing the attribute: %s\n";
  static constexpr char kNoOpening[] = "readFile: (3).ATTR: Error occured as } was not found\n";
  static std::string nameOf(const Attribute& failed) { return failed.getFirstNameLower(); }
};

template <>
struct ReadingOf<ORVAttribute> {
  static constexpr std::size_t kDumpFile = 1;
  static constexpr char kSingle[] =
      "readFile: (1).Error occured while parsing the orv attribute: %s\n";
  static constexpr char kInBlock[] =
      "readFile: (2).Error occured while parsing the orv attribute: %s\n";
  static constexpr char kNoOpening[] = "readFile: (3).ORVATTR: Error occured as } was not found\n";
  static std::string nameOf(const ORVAttribute& failed) { return failed.getOidAndName(); }
};

template <>
struct ReadingOf<ObjectClass> {
  static constexpr std::size_t kDumpFile = 2;
  static constexpr char kSingle[] =
      "readFile: (1).Error occured while parsing the objectclass: %s\n";
  static constexpr char kInBlock[] =
      "readFile: (2).Error occured while parsing the objectclass: %s\n";
  static constexpr char kNoOpening[] =
      "readFile: (3).OBJECTCLASS: Error occured as } was not found\n";
  static std::string nameOf(const ObjectClass& failed) { return failed.getFirstName(); }
};

}  // namespace

// Reads the definitions of one file into a manager, from an analyser that has opened it.
class SchemaManager::FileReader {
 public:
  FileReader(SchemaManager* manager, SchemaLexan* lexer, const SchemaFile& file,
             tracepoint::ReadFile* trace)
      : m_manager(*manager), m_lexer(*lexer), m_file(file), m_trace(*trace) {
    openDiagnostics();
  }

  // Reads to the end of the file; false at the first failure, with its diagnostics written.
  bool readAll() {
    int token = m_lexer.lexan();
    while (token != TOKEN_END) {
      bool isRead = true;
      switch (token) {
        case KEY_ATTRIBUTETYPES:
          isRead = readDefinitions<Attribute>(&token);
          break;
        case KEY_ORVATTRIBUTETYPES:
          isRead = readDefinitions<ORVAttribute>(&token);
          break;
        case KEY_OBJECTCLASSES:
          isRead = readDefinitions<ObjectClass>(&token);
          break;
        default:
          // Text between definitions is passed over.
          token = m_lexer.lexan();
      }
      if (!isRead) {
        return false;
      }
    }
    return true;
  }

  // Records that the file could not be read, and writes the analyser's state.
  void reportFailure() {
    TRACE_DEBUG(m_trace, "readFile: There was an error parsing the file, %s.\n", m_file.name);
  }
  void dumpLexer() {
    m_lexer.dump(kDiagnosticIndent, m_diagnostics.back());
    m_lexer.dumpTable(kTableDump);
  }

 private:
  // Opened and emptied at every read, whether or not anything is wrong.
  void openDiagnostics() {
    static constexpr std::array<const char*, 4> kNames = {"/tmp/attr.txt", "/tmp/orvattr.txt",
                                                          "/tmp/objectclass.txt", "/tmp/lexan.txt"};
    for (std::size_t i = 0; i < kNames.size(); ++i) {
      if (!libschema::openDiagnosticFile(kNames[i], &m_diagnostics[i])) {
        TRACE_DEBUG(m_trace, "readFile: unable to open file %s\n", kNames[i]);
      }
    }
  }

  // Reads what follows the keyword of a kind: "=" and one definition, or "{" and a block of them.
  // Leaves in *token the token to go on with.
  template <typename Definition>
  bool readDefinitions(int* token) {
    const int opening = m_lexer.lexan();
    if (opening == '=') {
      return readOne<Definition>(ReadingOf<Definition>::kSingle, true, token);
    }
    if (opening == '{') {
      do {
        if (!readOne<Definition>(ReadingOf<Definition>::kInBlock, false, token)) {
          return false;
        }
      } while (*token != '}');
      return true;
    }
    reportFailure();
    TRACE_DEBUG(m_trace, ReadingOf<Definition>::kNoOpening);
    dumpLexer();
    return false;
  }

  // A definition without an OID is inserted in the single form only, under the empty string.
  // ReadFile.SingleDefinitionWithoutOidIsInserted.
  template <typename Definition>
  bool readOne(const char* message, bool isSingle, int* token) {
    auto definition = std::make_unique<Definition>();
    if (!definition->parse(&m_lexer)) {
      reportFailure();
      TRACE_DEBUG(m_trace, message, ReadingOf<Definition>::nameOf(*definition).c_str());
      definition->dump(m_diagnostics[ReadingOf<Definition>::kDumpFile]);
      dumpLexer();
      return false;
    }
    if (isSingle || !definition->oidInPlace().empty()) {
      insert(std::move(definition));
    }
    *token = m_lexer.getCurrentToken();
    return true;
  }

  // Every table keeps the definition that it has under a key. One that no table takes is deleted.
  // Neighbours in a file often have neighbouring OIDs, so each insertion by OID starts at the last
  // one.
  void insert(std::unique_ptr<Attribute> definition) {
    noteOid(*definition);
    insertByNameAndOid(std::move(definition), &m_manager.attrTable, &m_attributes);
  }

  void insert(std::unique_ptr<ObjectClass> definition) {
    noteOid(*definition);
    insertByNameAndOid(std::move(definition), &m_manager.ocTable, &m_objectClasses);
  }

  void insert(std::unique_ptr<ORVAttribute> definition) {
    noteOid(*definition);
    if (m_extensions.insert(definition->oidInPlace(), definition.get())) {
      static_cast<void>(definition.release());
    }
  }

  void noteOid(const ORVSchema& definition) {
    if (m_file.oids != nullptr) {
      OidSet& oids = m_manager.*m_file.oids;
      m_lastOid = oids.insert(m_lastOid.value_or(oids.end()), definition.oidInPlace());
    }
  }

  template <typename Definition>
  class ByOid {
   public:
    explicit ByOid(OidTable<Definition>* table) : m_table(*table), m_last(table->end()) {}

    // True when the table holds the definition afterwards.
    bool insert(const std::string& oid, Definition* definition) {
      m_last = m_table.try_emplace(m_last, oid, definition);
      return m_last->second == definition;
    }

   private:
    OidTable<Definition>& m_table;
    typename OidTable<Definition>::iterator m_last;
  };

  template <typename Definition>
  static void insertByNameAndOid(std::unique_ptr<Definition> definition,
                                 NameTable<Definition>* byName, ByOid<Definition>* byOid) {
    Definition* const inserted = definition.get();
    if (byName->try_emplace(inserted->getFirstNameLower(), inserted).second) {
      static_cast<void>(definition.release());
    }
    // The index takes the object whether the name table did or not.
    if (byOid->insert(inserted->oidInPlace(), inserted)) {
      static_cast<void>(definition.release());
    }
  }

  SchemaManager& m_manager;
  SchemaLexan& m_lexer;
  const SchemaFile& m_file;
  tracepoint::ReadFile& m_trace;
  ByOid<Attribute> m_attributes{&m_manager.attrOidTable};
  ByOid<ObjectClass> m_objectClasses{&m_manager.ocOidTable};
  ByOid<ORVAttribute> m_extensions{&m_manager.orvAttrTable};
  std::optional<OidSet::iterator> m_lastOid;
  std::array<std::ofstream, 4> m_diagnostics;  // by kind of definition, and the analyser's last
};

int SchemaManager::readFile(std::string fileName) {
  tracepoint::ReadFile trace;
  // The analyser goes, and the locale comes back, at every way out.
  struct Release {
    std::unique_ptr<SchemaLexan>& analyser;
    ~Release() { analyser.reset(); }
  } const release{lexan};
  lexan = std::make_unique<SchemaLexan>(directory, fileName);
  if (!lexan->fileIsOpen()) {
    TRACE_DEBUG(trace, "readFile: Could not open file to be parsed\n");
    return trace.status(kFailed);
  }
  const SchemaFile* const file = findFile(fileName);
  if (file == nullptr) {
    TRACE_DEBUG(trace, "readFile: Unexpected file name given, %s\n", fileName.c_str());
    return trace.status(kUnknownFile);
  }
  TRACE_DEBUG(trace, "readFile: Parsing file: %s in directory: %s \n", fileName.c_str(),
              directory.c_str());
  FileReader reader(this, lexan.get(), *file, &trace);
  if (!reader.readAll()) {
    return trace.status(kFailed);
  }
  if (lexan->lexan() != TOKEN_END) {
    reader.reportFailure();
    reader.dumpLexer();
    return trace.status(kFailed);
  }
  lexan.reset();
  TRACE_DEBUG(trace, "readFile: Successfully parsed the file, %s.\n", fileName.c_str());
  return trace.status(kDone);
}
