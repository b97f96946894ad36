// The lexical analyser over any bytes, step by step against a second one that is as simple as can
// be.

#include <algorithm>
#include <cstddef>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "ReferenceLexer.h"
#include "SchemaLexan.h"
#include "Target.h"

namespace {

constexpr char kFile[] = "V3.user.at";

std::string textOf(SchemaLexan* lexer) {
  std::string text;
  lexer->getStringValue(lexer->getTokenValIndex(), text);
  return text;
}

std::string state(const std::string& text, int index, int current, int line) {
  return "'" + text + "' index " + std::to_string(index) + " current " + std::to_string(current) +
         " line " + std::to_string(line);
}

class BothLexers {
 public:
  BothLexers() : m_lexer(fuzz::folder(), kFile), m_reference(fuzz::folder() + "/" + kFile) {}

  int lexan() {
    const int expected = m_reference.lexan();
    fuzz::requireEqual(std::to_string(expected), std::to_string(m_lexer.lexan()), "lexan()");
    compare("after lexan()");
    return expected;
  }

  void match(int token) {
    m_reference.match(token);
    m_lexer.match(token);
    compare("after match()");
  }

  int currentToken() const { return m_reference.currentToken(); }

  void dump() {
    std::ofstream out(fuzz::folder() + "/dump");
    m_lexer.dump(1, out);
    m_lexer.dumpTable(fuzz::folder() + "/table");
  }

 private:
  void compare(const char* when) {
    fuzz::requireEqual(state(m_reference.text(), m_reference.valueIndex(),
                             m_reference.currentToken(), m_reference.line()),
                       state(textOf(&m_lexer), m_lexer.getTokenValIndex(),
                             m_lexer.getCurrentToken(), m_lexer.getLineNumber()),
                       when);
  }

  SchemaLexan m_lexer;
  ReferenceLexer m_reference;
};

// To the end and behind it.
void readAll() {
  BothLexers lexers;
  for (int behindEnd = 0; behindEnd < 3;) {
    behindEnd += lexers.lexan() == TOKEN_END ? 1 : 0;
  }
  lexers.dump();
}

// By lexan() and match() in an order that the text itself gives.
void readMatching(const std::string& text) {
  BothLexers lexers;
  for (std::size_t i = 0; i < text.size() && i < 256; ++i) {
    switch (text[i] & 3) {
      case 0:
        lexers.lexan();
        break;
      case 1:
        lexers.match('(');
        break;
      default:
        lexers.match(lexers.currentToken());
    }
  }
}

std::vector<std::string> tokensIn(const std::string& text) {
  fuzz::write(kFile, text);
  SchemaLexan lexer(fuzz::folder(), kFile);
  std::vector<std::string> tokens;
  int token = 0;
  do {
    token = lexer.lexan();
    tokens.push_back(std::to_string(token) + " " +
                     state(textOf(&lexer), lexer.getTokenValIndex(), lexer.getCurrentToken(),
                           lexer.getLineNumber()));
  } while (token != TOKEN_END);
  return tokens;
}

// Blanks in front change nothing, though they have the end of the first buffer of the input stream
// fall on any place in the text.
void readBehindBlanks(const std::string& text) {
  // What the stream reads at a time: all of its buffer but the byte that it keeps.
  constexpr std::size_t kBuffer = (1 << 15) - 1;
  const std::vector<std::string> expected = tokensIn(text);
  const std::size_t place = std::hash<std::string>()(text) % (text.size() + 1);
  const std::string blanks(kBuffer - std::min(place, kBuffer), ' ');
  fuzz::require(tokensIn(blanks + text) == expected, "behind blanks");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string text = fuzz::textOf(data, size);
  fuzz::write(kFile, text);
  readAll();
  readMatching(text);
  readBehindBlanks(text);
  return 0;
}
