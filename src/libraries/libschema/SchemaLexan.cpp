#include "SchemaLexan.h"

#include <array>
#include <clocale>
#include <ios>
#include <streambuf>
#include <utility>

#include "TracePoints.h"

namespace {

// What a byte may be part of, in the "C" locale. Bytes of 128 and more are of no class.
enum ByteClass : unsigned char {
  kDigit = 1,        // 0 to 9
  kNumberPart = 2,   // a digit or "."
  kWordStart = 4,    // a letter, "'" or "-"
  kWordPart = 8,     // a letter, a digit, "_", "-" or a TAB
  kQuotedPart = 16,  // what a word takes, a blank, and any punctuation but "'"
  kBlank = 32,       // a blank or a TAB
  kCommentPart = 64  // anything but a newline
};

constexpr std::array<unsigned char, 256> classifyBytes() {
  std::array<unsigned char, 256> classes{};
  for (int c = 0; c < 256; ++c) {
    const bool digit = c >= '0' && c <= '9';
    const bool letter = (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
    const bool punctuation = c > ' ' && c < 127 && !digit && !letter;
    const bool word = letter || digit || c == '_' || c == '-' || c == '\t';
    classes[static_cast<std::size_t>(c)] = static_cast<unsigned char>(
        (digit ? kDigit : 0) | (digit || c == '.' ? kNumberPart : 0) |
        (letter || c == '\'' || c == '-' ? kWordStart : 0) | (word ? kWordPart : 0) |
        (word || c == ' ' || (punctuation && c != '\'') ? kQuotedPart : 0) |
        (c == ' ' || c == '\t' ? kBlank : 0) | (c != '\n' ? kCommentPart : 0));
  }
  return classes;
}

constexpr std::array<unsigned char, 256> kClasses = classifyBytes();

bool isOf(char c, ByteClass byteClass) {
  return (kClasses[static_cast<unsigned char>(c)] & byteClass) != 0;
}

// The protected members of a stream buffer, by name.
struct BufferAccess : std::streambuf {
  static const char* next(const std::streambuf& buffer) { return (buffer.*&BufferAccess::gptr)(); }
  static const char* end(const std::streambuf& buffer) { return (buffer.*&BufferAccess::egptr)(); }
  static void advance(std::streambuf* buffer, int count) { (buffer->*&BufferAccess::gbump)(count); }
};

// Reads the characters of one token in place, in the buffer of the input stream, and gathers the
// token's text. A read that fails leaves the character as it was and the stream at end of file (or,
// after an input error, bad); every later read fails too. The stream stands behind what was read
// once the scanner is gone.
class Scanner {
 public:
  explicit Scanner(std::ifstream* input) : m_input(input), m_buffer(input->rdbuf()) {
    if (m_input->good()) {
      takeWindow();
    }
  }
  Scanner(const Scanner&) = delete;
  Scanner& operator=(const Scanner&) = delete;
  ~Scanner() { giveBack(); }

  char current() const { return m_current; }
  bool atEnd() const { return m_input->eof(); }

  // Reads one character; false when there is none.
  bool read() {
    if (m_next == m_end && !refill()) {
      return false;
    }
    m_current = *m_next++;
    return true;
  }

  // Puts the current character back, unless the last read failed.
  void putBack() {
    if (m_input->good()) {
      --m_next;
    }
  }

  // Passes over characters of the class, from the one read last on; false when the input ends
  // there.
  bool skipRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      m_next = endOfRun(byteClass);
      if (!read()) {
        return false;
      }
    }
    return true;
  }

  // Passes over the characters of the class that lie ahead in the window.
  void passRun(ByteClass byteClass) { m_next = endOfRun(byteClass); }

  // Passes over characters of the class like skipRun, appending them to the text.
  bool takeRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      const char* const start = m_next - 1;
      m_next = endOfRun(byteClass);
      append(start, m_next);
      if (!read()) {
        return false;
      }
    }
    return true;
  }

  // Appends the current character to the text and reads on.
  bool take() {
    append(m_next - 1, m_next);
    return read();
  }

  // The text gathered so far; valid until the scanner reads on or goes.
  std::string_view text() const { return m_isKept ? std::string_view(m_kept) : m_text; }

 private:
  void takeWindow() {
    m_start = m_next = BufferAccess::next(*m_buffer);
    m_end = BufferAccess::end(*m_buffer);
  }

  // The first character of the window, from the next one on, that is not of the class.
  const char* endOfRun(ByteClass byteClass) const {
    const char* place = m_next;
    const char* const end = m_end;
    while (place != end && isOf(*place, byteClass)) {
      ++place;
    }
    return place;
  }

  void giveBack() { BufferAccess::advance(m_buffer, static_cast<int>(m_next - m_start)); }

  bool refill() {
    if (!m_input->good()) {
      return false;
    }
    keepText();
    giveBack();
    m_start = m_next = m_end = nullptr;
    try {
      if (m_buffer->sgetc() == std::char_traits<char>::eof()) {
        m_input->setstate(std::ios_base::eofbit | std::ios_base::failbit);
        return false;
      }
    } catch (...) {
      m_input->setstate(std::ios_base::badbit);
      return false;
    }
    takeWindow();
    return true;
  }

  // The text is a piece of the window as long as it is contiguous, and a copy from then on.
  void append(const char* from, const char* to) {
    const auto count = static_cast<std::size_t>(to - from);
    if (!m_isKept && m_text.empty()) {
      m_text = std::string_view(from, count);
    } else if (!m_isKept && m_text.data() + m_text.size() == from) {
      m_text = std::string_view(m_text.data(), m_text.size() + count);
    } else {
      keepText();
      m_kept.append(from, count);
    }
  }

  void keepText() {
    if (!m_isKept) {
      m_kept.assign(m_text);
      m_isKept = true;
    }
  }

  std::ifstream* m_input;
  std::streambuf* m_buffer;
  const char* m_start = nullptr;
  const char* m_next = nullptr;
  const char* m_end = nullptr;
  char m_current = '\0';
  bool m_isKept = false;
  std::string_view m_text;
  std::string m_kept;
};

// Reads a number from its first digit on; leaves the character after it current. Returns the code.
int scanNumber(Scanner* scanner) {
  scanner->takeRun(kNumberPart);
  while (scanner->current() == ' ' && scanner->read()) {
  }
  if (scanner->atEnd() || scanner->current() != '{') {
    return TOKEN_NUMBER;
  }
  scanner->take();
  if (!isOf(scanner->current(), kDigit)) {
    return TOKEN_NUMBER_BAD_LENGTH;
  }
  scanner->takeRun(kDigit);
  if (scanner->current() != '}') {
    return TOKEN_NUMBER_BAD_LENGTH;
  }
  scanner->take();
  return TOKEN_NUMBER_LENGTH;
}

// Reads a word or a quoted string; leaves the character after it current. Whatever ends a quoted
// string, its closing quote or not, is dropped, and a newline dropped so is not counted.
void scanWord(Scanner* scanner) {
  if (scanner->current() != '\'') {
    scanner->takeRun(kWordPart);
    return;
  }
  scanner->read();
  scanner->takeRun(kQuotedPart);
  scanner->read();
}

// The keyword that a spelling of a definition's start stands for; empty for any other text.
std::string_view foldStart(std::string_view text) {
  if (text == "objectClasses") {
    return "objectclasses";
  }
  if (text == "attributeTypes") {
    return "attributetypes";
  }
  if (text == "ORVattributeTypes") {
    return "ORVAttributetypes";
  }
  return {};
}

const char* localeName(const char* name) { return name == nullptr ? "" : name; }

}  // namespace

SchemaLexan::SchemaLexan(std::string directory, std::string fileName) {
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: current locale settings on the system is: %s\n",
              localeName(std::setlocale(LC_ALL, nullptr)));
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: changing locale settings to \"C\" \n");
  const char* const changed = std::setlocale(LC_ALL, "C");
  TRACE_DEBUG(ldtr_fun, "SchemaLexan: locale settings on the system after changing is: %s \n",
              localeName(changed));

  m_working_dir = std::move(directory);
  m_input.open(m_working_dir + "/" + fileName);
  m_input.unsetf(std::ios_base::skipws);
  if (m_input.is_open()) {
    // A directory opens, but the first read fails: such an input counts as not opened.
    try {
      m_input.rdbuf()->sgetc();
    } catch (...) {
      m_input.setstate(std::ios_base::badbit);
    }
  }
  m_line_num = 1;
  m_symtable = new SchemaSymbolTable;
  m_scratch_index = m_symtable->getTableSize();
  m_filename = std::move(fileName);
}

SchemaLexan::~SchemaLexan() {
  TRACE_DEBUG(ldtr_fun,
              "~SchemaLexan: resetting locale before returning to system default settings. \n");
  std::setlocale(LC_ALL, "");
  TRACE_DEBUG(ldtr_fun, "lexan: locale settings after resetting is: %s",
              localeName(std::setlocale(LC_ALL, nullptr)));
  delete m_symtable;
}

bool SchemaLexan::fileIsOpen() {
  tracepoint::LexanFileIsOpen trace;
  return m_input.good();
}

int SchemaLexan::lexan() {
  tracepoint::LexanLexan trace;
  return trace.status(nextToken());
}

// At the end of the input m_lookahead stays what it was. m_tokenvalindex becomes -1 when the end is
// met between tokens, and stays too when a token that the end cuts short is dropped.
int SchemaLexan::nextToken() {
  if (m_input.eof()) {
    return TOKEN_END;
  }
  Scanner scanner(&m_input);
  for (;;) {
    if (!scanner.read()) {
      m_tokenvalindex = -1;
      return TOKEN_END;
    }
    const char c = scanner.current();
    if (isOf(c, kBlank)) {
      scanner.passRun(kBlank);
      continue;
    }
    if (c == '\n') {
      ++m_line_num;
      continue;
    }
    if (c == '#') {
      // The end of the file ends the last comment and counts as its line end.
      scanner.skipRun(kCommentPart);
      ++m_line_num;
      continue;
    }
    if (isOf(c, kDigit)) {
      const int token = scanNumber(&scanner);
      if (scanner.atEnd()) {
        return TOKEN_END;
      }
      scanner.putBack();
      return storeText(scanner.text(), token);
    }
    if (isOf(c, kWordStart)) {
      scanWord(&scanner);
      if (scanner.atEnd()) {
        return TOKEN_END;
      }
      scanner.putBack();
      return storeText(scanner.text(), TOKEN_NAME);
    }
    m_tokenvalindex = -1;
    m_lookahead = c;
    return m_lookahead;
  }
}

// Makes `text` the current token. The scratch entry takes part in the look-up: a text equal to the
// one stored before is that entry, with the code that it had then.
int SchemaLexan::storeText(std::string_view text, int token) {
  int index = m_symtable->findText(text);
  if (index < 0 && token == TOKEN_NAME) {
    const std::string_view keyword = foldStart(text);
    index = keyword.empty() ? -1 : m_symtable->findText(keyword);
  }
  if (index < 0) {
    m_symtable->removeValue(m_scratch_index);
    index = m_scratch_index = m_symtable->insertText(text, token, false);
  }
  m_tokenvalindex = index;
  m_lookahead = m_symtable->getTokenValue(index);
  return m_lookahead;
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
  return m_symtable->getValue(index, out);
}

bool SchemaLexan::getCharValue(int index, char& out) { return m_symtable->getValue(index, out); }

bool SchemaLexan::isString(int index) { return m_symtable->isString(index); }

bool SchemaLexan::isCharacter(int index) { return m_symtable->isCharacter(index); }

int SchemaLexan::lookUp(int first, int second) {
  tracepoint::LexanLookUp trace;
  return trace.status(m_symtable->lookUp(first, second));
}

int SchemaLexan::insertString(std::string value, int token) {
  tracepoint::LexanInsertString trace;
  return trace.status(m_symtable->insertValue(std::move(value), token, false));
}

int SchemaLexan::insertCharacter(char value, int token) {
  tracepoint::LexanInsertCharacter trace;
  return trace.status(m_symtable->insertValue(value, token, false));
}

int SchemaLexan::clear() {
  m_tokenvalindex = m_symtable->clear(m_tokenvalindex);
  return m_tokenvalindex;
}

void SchemaLexan::dumpTable(std::string name) {
  tracepoint::LexanDumpTable trace;
  m_symtable->tableDump(std::move(name));
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
    m_symtable->dump(indent + 1, out);
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
