// Reading one file of a schema: from its tokens to definitions, and from these to the tables.

#include <array>
#include <fstream>
#include <memory>
#include <string>
#include <utility>

#include "DiagnosticFile.h"
#include "NewDefinitions.h"
#include "SchemaManager.h"
#include "SchemaResults.h"
#include "TracePoints.h"

using libschema::NewDefinitions;

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
  static std::string nameOf(Attribute& failed) { return failed.getFirstNameLower(); }
};

template <>
struct ReadingOf<ORVAttribute> {
  static constexpr std::size_t kDumpFile = 1;
  static constexpr char kSingle[] =
      "readFile: (1).Error occured while parsing the orv attribute: %s\n";
  static constexpr char kInBlock[] =
      "readFile: (2).Error occured while parsing the orv attribute: %s\n";
  static constexpr char kNoOpening[] = "readFile: (3).ORVATTR: Error occured as } was not found\n";
  static std::string nameOf(ORVAttribute& failed) { return failed.getOidAndName(); }
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
  static std::string nameOf(ObjectClass& failed) { return failed.getFirstName(); }
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

  // Reads to the end of the file; false at the first failure, with its diagnostics written. What
  // was read is in the tables then, in any case, also when an exception passes.
  bool readAll() {
    try {
      if (!readToTheEnd()) {
        return false;
      }
    } catch (...) {
      enterAll();
      throw;
    }
    enterAll();
    return true;
  }

  // Records that the file could not be read.
  void reportFailure() {
    enterAll();
    TRACE_DEBUG(m_trace, "readFile: There was an error parsing the file, %s.\n", m_file.name);
  }

  // Writes the analyser's state.
  void dumpLexer() {
    m_lexer.dump(kDiagnosticIndent, m_diagnostics.back().stream());
    m_lexer.dumpTable(kTableDump);
  }

 private:
  // Opened and emptied at every read, whether or not anything is wrong.
  void openDiagnostics() {
    if (!m_diagnostics[0].open("/tmp/attr.txt")) {
      TRACE_DEBUG(m_trace, "readFile: unable to open file /tmp/attr.txt\n");
    }
    if (!m_diagnostics[1].open("/tmp/orvattr.txt")) {
      TRACE_DEBUG(m_trace, "readFile: unable to open file /tmp/orvattr.txt\n");
    }
    if (!m_diagnostics[2].open("/tmp/objectclass.txt")) {
      TRACE_DEBUG(m_trace, "readFile: unable to open file /tmp/objectclass.txt\n");
    }
    if (!m_diagnostics[3].open("/tmp/lexan.txt")) {
      TRACE_DEBUG(m_trace, "readFile: unable to open file /tmp/lexan.txt\n");
    }
  }

  bool readToTheEnd() {
    int token = m_lexer.lexan();
    while (token != TOKEN_END) {
      bool isRead = true;
      switch (token) {
        case KEY_ATTRIBUTETYPES:
          isRead = readDefinitions(&m_attributes, &token);
          break;
        case KEY_ORVATTRIBUTETYPES:
          isRead = readDefinitions(&m_extensions, &token);
          break;
        case KEY_OBJECTCLASSES:
          isRead = readDefinitions(&m_objectClasses, &token);
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

  // Reads what follows the keyword of a kind: "=" and one definition, or "{" and a block of them.
  // Leaves in *token the token to go on with.
  template <typename Definition>
  bool readDefinitions(NewDefinitions<Definition>* read, int* token) {
    const int opening = m_lexer.lexan();
    if (opening == '=') {
      return readOne(read, ReadingOf<Definition>::kSingle, true, token);
    }
    if (opening == '{') {
      do {
        if (!readOne(read, ReadingOf<Definition>::kInBlock, false, token)) {
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
  bool readOne(NewDefinitions<Definition>* read, const char* message, bool isSingle, int* token) {
    auto definition = std::make_unique<Definition>();
    if (!definition->parse(&m_lexer)) {
      reportFailure();
      TRACE_DEBUG(m_trace, message, ReadingOf<Definition>::nameOf(*definition).c_str());
      definition->dump(m_diagnostics[ReadingOf<Definition>::kDumpFile].stream());
      dumpLexer();
      return false;
    }
    if (isSingle || !definition->oidInPlace().empty()) {
      read->add(std::move(definition));
    }
    *token = m_lexer.getCurrentToken();
    return true;
  }

  // Enters what was read into the tables and the OID set of the file. Nobody looks into them while
  // the file is read, so that this is done once for all.
  void enterAll() {
    OidSet* const oids = m_file.oids == nullptr ? nullptr : &(m_manager.*m_file.oids);
    m_attributes.enterByName(&m_manager.attrTable);
    m_attributes.enterByOid(&m_manager.attrOidTable, oids);
    m_objectClasses.enterByName(&m_manager.ocTable);
    m_objectClasses.enterByOid(&m_manager.ocOidTable, oids);
    m_extensions.enterByOid(&m_manager.orvAttrTable, oids);
  }

  SchemaManager& m_manager;
  SchemaLexan& m_lexer;
  const SchemaFile& m_file;
  tracepoint::ReadFile& m_trace;
  NewDefinitions<Attribute> m_attributes;
  NewDefinitions<ORVAttribute> m_extensions;
  NewDefinitions<ObjectClass> m_objectClasses;
  // By kind of definition, and the analyser's last.
  std::array<libschema::DiagnosticFile, 4> m_diagnostics;
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
