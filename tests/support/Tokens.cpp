#include "Tokens.h"

namespace support {

LexedText::LexedText(const std::string& text) {
  const TemporaryDirectory directory;
  directory.write("V3.user.at", text);
  m_lexer = std::make_unique<SchemaLexan>(directory.path(), "V3.user.at");
}

std::string currentText(SchemaLexan* lexer) {
  std::string text;
  lexer->getStringValue(lexer->getTokenValIndex(), text);
  return text;
}

std::string LexedText::rest() {
  std::string tokens;
  for (;;) {
    const int token = m_lexer->lexan();
    tokens += tokens.empty() ? "" : " ";
    tokens += std::to_string(token);
    if (token == TOKEN_NAME || (token >= TOKEN_NUMBER && token <= TOKEN_NUMBER_BAD_LENGTH)) {
      tokens += ":" + currentText(m_lexer.get());
    }
    if (token == TOKEN_END) {
      return tokens;
    }
  }
}

}  // namespace support
