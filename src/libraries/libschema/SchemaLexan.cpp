#include "SchemaLexan.h"

#include <clocale>
#include <ios>
#include <memory>
#include <utility>

#include "TokenScanner.h"
#include "TracePoints.h"

using libschema::BufferAccess;
using libschema::BufferedToken;
using libschema::Scanned;

namespace {

// A spelling of a definition's start, and the keyword that it stands for.
struct Spelling {
  std::string_view text;
  std::string_view keyword;
};
constexpr Spelling kSpellings[] = {
    {"objectClasses", "objectclasses"},
    {"attributeTypes", "attributetypes"},
    {"ORVattributeTypes", "ORVAttributetypes"},
};

// The index of the keyword that a text stands for; -1 when it stands for none.
int findStart(std::string_view text, const CSymbolTable& table) {
  for (const Spelling& start : kSpellings) {
    if (text == start.text) {
      return table.findText(start.keyword);
    }
  }
  return -1;
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
  auto table = std::make_unique<SchemaSymbolTable>();
  // One byte stays free: a zero can always stand behind what the stream has read.
  m_input.rdbuf()->pubsetbuf(table->inputRoom(), CSymbolTable::kInputRoom - 1);
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
  m_symtable = table.release();
  m_scratch_index = m_symtable->getTableSize();
  m_filename = std::move(fileName);
}

SchemaLexan::~SchemaLexan() {
  TRACE_DEBUG(ldtr_fun,
              "~SchemaLexan: resetting locale before returning to system default settings. \n");
  std::setlocale(LC_ALL, "");
  TRACE_DEBUG(ldtr_fun, "lexan: locale settings after resetting is: %s",
              localeName(std::setlocale(LC_ALL, nullptr)));
  // The stream's buffer goes with the table.
  m_input.close();
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
  if (m_input.good()) {
    // Nearly every token lies in the stream's buffer as a whole.
    std::streambuf* const buffer = m_input.rdbuf();
    const char* const next = BufferAccess::next(*buffer);
    char* const end = BufferAccess::end(*buffer);
    if (m_symtable->hasInputRoomAt(end)) {
      *end = '\0';
      const BufferedToken token = libschema::tokenInBuffer(next, end);
      if (token.next != nullptr) {
        BufferAccess::advance(buffer, static_cast<int>(token.next - next));
        m_line_num += token.lines;
        return token.text == nullptr
                   ? takeCharacter(token.code)
                   : takeText(std::string_view(token.text, token.size), true, token.code);
      }
    }
  } else if (m_input.eof()) {
    return TOKEN_END;
  }
  return nextTokenOfStream();
}

int SchemaLexan::nextTokenOfStream() {
  int token = TOKEN_END;
  libschema::StreamInput input(&m_input, m_symtable);
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
  return takeText(input.text(), input.isTextInBuffer(), token);
}

int SchemaLexan::takeCharacter(int token) {
  m_tokenvalindex = -1;
  m_lookahead = token;
  return token;
}

// Makes a text the current token. The scratch entry takes part in the look-up: a text equal to the
// one stored before is that entry, with the code that it had then. A text in the stream's buffer is
// not copied to the table as long as it stays there.
int SchemaLexan::takeText(std::string_view text, bool isInBuffer, int token) {
  int index = m_symtable->findText(text);
  if (index < 0 && token == TOKEN_NAME) {
    index = findStart(text, *m_symtable);
  }
  if (index < 0) {
    index = isInBuffer ? m_symtable->replaceBorrowed(m_scratch_index, text, token)
                       : m_symtable->replaceText(m_scratch_index, text, token);
    m_scratch_index = index;
  } else {
    token = m_symtable->getTokenValue(index);
  }
  m_tokenvalindex = index;
  m_lookahead = token;
  return token;
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
