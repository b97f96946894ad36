#include "SchemaLexan.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <ext/stdio_filebuf.h>

#include <clocale>
#include <ios>
#include <typeinfo>
#include <utility>

#include "Keywords.h"
#include "LexerTable.h"
#include "PlacedLexan.h"
#include "StreamInput.h"
#include "TokenScanner.h"
#include "TracePoints.h"

using libschema::BufferedToken;
using libschema::LexerTable;
using libschema::Scanned;
using libschema::Window;

namespace {

const char* localeName(const char* name) { return name == nullptr ? "" : name; }

// The class adds no data to its base: what the destructor must know about the locale is noted with
// the stream.
enum class Locale : long { kSwitched, kLeftAlone };

long& localeNoteOf(std::ios_base& stream) {
  static const int index = std::ios_base::xalloc();
  return stream.iword(index);
}

void note(Locale locale, std::ios_base& stream) {
  localeNoteOf(stream) = static_cast<long>(locale);
}

// Opens the file for reading, with a buffer of its own that is larger than usual. A directory could
// be opened too, but not be read.
bool open(const std::string& path, std::filebuf* file) {
  constexpr std::size_t kBufferSize = std::size_t{1} << 15;
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) {
    return false;
  }
  struct stat status {};
  if (::fstat(descriptor, &status) != 0 || S_ISDIR(status.st_mode)) {
    ::close(descriptor);
    return false;
  }
  // The stream takes over the descriptor and closes it.
  __gnu_cxx::stdio_filebuf<char> buffer(descriptor, std::ios_base::in, kBufferSize);
  if (!buffer.is_open()) {
    ::close(descriptor);
    return false;
  }
  *file = std::move(buffer);
  return true;
}

// Where a record cannot be written, the facility's exception goes no further.
template <typename Write>
void tryTo(Write write) {
  try {
    write();
  } catch (...) {
  }
}

}  // namespace

// ---- Construction ----

// An analyser that is complete, so that the destructor runs when the rest of the construction
// fails.
SchemaLexan::SchemaLexan(BeforeOpening /*tag*/) {
  m_symtable = nullptr;
  m_tokenvalindex = -1;
  m_lookahead = -1;
  m_line_num = 0;
  m_scratch_index = 0;
  note(Locale::kLeftAlone, m_input);
}

SchemaLexan::SchemaLexan(std::string directory, std::string fileName)
    : SchemaLexan(BeforeOpening()) {
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: current locale settings on the system is: %s\n",
              localeName(std::setlocale(LC_ALL, nullptr)));
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: changing locale settings to \"C\" \n");
  const char* const changed = std::setlocale(LC_ALL, "C");
  note(Locale::kSwitched, m_input);
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: locale settings on the system after changing is: %s \n",
              localeName(changed));

  m_working_dir = std::move(directory);
  if (!open(m_working_dir + "/" + fileName, m_input.rdbuf())) {
    m_input.setstate(std::ios_base::failbit);
  }
  begin(std::move(fileName));
}

SchemaLexan::SchemaLexan(const char* bytes, std::size_t size, std::string directory,
                         std::string fileName)
    : SchemaLexan(BeforeOpening()) {
  m_working_dir = std::move(directory);
  // A file buffer without a file reads what lies in it, and has nothing behind that.
  Window::set(bytes, size, m_input.rdbuf());
  begin(std::move(fileName));
}

void SchemaLexan::begin(std::string fileName) {
  m_input.unsetf(std::ios_base::skipws);
  m_line_num = 1;
  m_symtable = new LexerTable;
  m_scratch_index = m_symtable->getTableSize();
  m_filename = std::move(fileName);
}

SchemaLexan::~SchemaLexan() {
  if (localeNoteOf(m_input) == static_cast<long>(Locale::kSwitched)) {
    resetLocale();
  }
  delete m_symtable;
}

void SchemaLexan::resetLocale() {
  tryTo([] {
    TRACE_DEBUG(ldtr_fun,
                "~SchemaLexan: resetting locale before returning to system default settings. \n");
  });
  std::setlocale(LC_ALL, "");
  tryTo([] {
    TRACE_DEBUG(ldtr_fun, "lexan: locale settings after resetting is: %s",
                localeName(std::setlocale(LC_ALL, nullptr)));
  });
}

bool SchemaLexan::fileIsOpen() {
  tracepoint::LexanFileIsOpen trace;
  return m_input.good();
}

// ---- The symbol table ----

// The table of an analyser that nobody but this library has derived from, as long as everything in
// it is known; null otherwise. A derived class may have another table, or use the one that it has.
// A class that is compiled without type information is a derived one.
inline LexerTable* SchemaLexan::privateTable() {
  if (&typeid(*this) != &typeid(SchemaLexan) && &typeid(*this) != &typeid(PlacedLexan)) {
    return nullptr;
  }
  auto* const own = static_cast<LexerTable*>(m_symtable);
  return own->isPrivate() ? own : nullptr;
}

// The table with everything in it that belongs there.
CSymbolTable* SchemaLexan::table() {
  if (LexerTable* const own = privateTable()) {
    own->publish();
  }
  return m_symtable;
}

// ---- Reading ----

int SchemaLexan::lexan() {
  tracepoint::LexanLexan trace;
  return trace.status(nextToken());
}

// At the end of the input m_lookahead stays what it was. m_tokenvalindex becomes -1 when the end is
// met between tokens, and stays too when a token that the end cuts short is dropped.
int SchemaLexan::nextToken() {
  if (!m_input.good()) {
    m_tokenvalindex = m_input.eof() ? m_tokenvalindex : -1;
    return TOKEN_END;
  }
  // Nearly every token lies in the stream's buffer as a whole.
  std::streambuf* const buffer = libschema::bufferOf(m_input);
  const BufferedToken token =
      libschema::tokenInBuffer(Window::begin(*buffer), Window::end(*buffer));
  if (token.next == nullptr) {
    return nextTokenOfStream();
  }
  Window::moveTo(token.next, buffer);
  m_line_num += token.lines;
  return token.text == nullptr ? takeCharacter(token.code)
                               : takeText(std::string_view(token.text, token.size), token.code);
}

int SchemaLexan::nextTokenOfStream() {
  if (LexerTable* const own = privateTable()) {
    // The buffer may be filled anew.
    own->keepText();
  }
  int token = TOKEN_END;
  libschema::StreamInput input(&m_input);
  switch (libschema::scanToken(&input, &m_line_num, &token)) {
    case Scanned::kEndBetweenTokens:
      m_tokenvalindex = -1;
      return TOKEN_END;
    case Scanned::kEndWithinToken:
      return TOKEN_END;
    case Scanned::kCharacter:
      return takeCharacter(token);
    case Scanned::kText:
      break;
  }
  return takeStreamText(input.takeText(), token);
}

int SchemaLexan::takeCharacter(int token) { return takeIndex(-1, token); }

int SchemaLexan::takeIndex(int index, int token) {
  m_tokenvalindex = index;
  m_lookahead = token;
  return token;
}

// Each of these makes a text the current token: one that lies in the stream's buffer, one that does
// not, and any text by way of the table alone. The scratch entry takes part in the look-up: a text
// equal to the one stored before is that entry, with the code that it had then.
int SchemaLexan::takeText(std::string_view text, int token) {
  LexerTable* const own = privateTable();
  if (own == nullptr) {
    return storeText(std::string(text), token);
  }
  const int index = own->find(text);
  return index < 0 ? takeIndex(own->borrowText(text, token), token)
                   : takeIndex(index, own->tokenAt(index));
}

int SchemaLexan::takeStreamText(std::string text, int token) {
  LexerTable* const own = privateTable();
  if (own == nullptr) {
    return storeText(std::move(text), token);
  }
  const int index = own->find(text);
  return index < 0 ? takeIndex(own->takeText(std::move(text), token), token)
                   : takeIndex(index, own->tokenAt(index));
}

int SchemaLexan::storeText(std::string text, int token) {
  int index = m_symtable->lookUpValue(text);
  if (index < 0 && token == TOKEN_NAME) {
    const std::string_view keyword = libschema::keywordOfSpelling(text);
    index = keyword.empty() ? -1 : m_symtable->lookUpValue(std::string(keyword));
  }
  if (index >= 0) {
    return takeIndex(index, m_symtable->getTokenValue(index));
  }
  m_symtable->removeValue(m_scratch_index);
  m_scratch_index = m_symtable->insertValue(std::move(text), token, false);
  return takeIndex(m_scratch_index, token);
}

void SchemaLexan::match(int expected) {
  tracepoint::LexanMatch trace;
  if (m_symtable == nullptr) {
    TRACE_DEBUG(trace, "match: No pointer to symbol table");
    return;
  }
  if (m_lookahead == expected) {
    m_lookahead = lexan();
  }
}

int SchemaLexan::getCurrentToken() { return m_lookahead; }

int SchemaLexan::getTokenValIndex() { return m_tokenvalindex; }

bool SchemaLexan::getStringValue(int index, std::string& out) {
  libschema::LexerTable* const own = privateTable();
  return own != nullptr ? own->getText(index, out) : m_symtable->getValue(index, out);
}

bool SchemaLexan::getCharValue(int index, char& out) { return table()->getValue(index, out); }

bool SchemaLexan::isString(int index) { return table()->isString(index); }

bool SchemaLexan::isCharacter(int index) { return table()->isCharacter(index); }

int SchemaLexan::lookUp(int first, int second) {
  tracepoint::LexanLookUp trace;
  return trace.status(table()->lookUp(first, second));
}

int SchemaLexan::insertString(std::string value, int token) {
  tracepoint::LexanInsertString trace;
  return trace.status(table()->insertValue(std::move(value), token, false));
}

int SchemaLexan::insertCharacter(char value, int token) {
  tracepoint::LexanInsertCharacter trace;
  return trace.status(table()->insertValue(value, token, false));
}

int SchemaLexan::clear() {
  m_tokenvalindex = table()->clear(m_tokenvalindex);
  return m_tokenvalindex;
}

void SchemaLexan::dumpTable(std::string name) {
  tracepoint::LexanDumpTable trace;
  table()->tableDump(std::move(name));
}

void SchemaLexan::dump(int indent, std::ofstream& out) {
  tracepoint::LexanDump trace;
  const auto line = [&]() -> std::ofstream& {
    skip(indent, out);
    return out;
  };
  line() << "SchemaLexan\n";
  line() << "{ \n";
  line() << "  m_filename \"" << m_filename << "\"\n";
  line() << "  m_tokenvalindex " << m_tokenvalindex << '\n';
  line() << "  m_line_num " << m_line_num << '\n';
  line() << "  m_lookahead " << m_lookahead << '\n';
  line() << "  m_symtable ";
  if (m_symtable == nullptr) {
    out << "EMPTY\n";
  } else {
    out << '\n';
    table()->dump(indent + 1, out);
  }
  line() << "}\n";
}

void SchemaLexan::skip(int count, std::ofstream& out) {
  for (int i = 0; i < count; ++i) {
    out << '\t';
  }
}

int SchemaLexan::getLineNumber() {
  tracepoint::LexanGetLineNumber trace;
  return trace.status(m_line_num);
}

std::string SchemaLexan::getFileName() {
  tracepoint::LexanGetFileName trace;
  return m_filename;
}

std::string SchemaLexan::getWorkingDir() {
  tracepoint::LexanGetWorkingDir trace;
  return m_working_dir;
}
