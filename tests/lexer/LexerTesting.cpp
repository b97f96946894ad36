#include "LexerTesting.h"

#include <cstdio>
#include <filesystem>

#include "Files.h"

namespace lexertesting {

namespace {

const support::TemporaryDirectory& directory() {
  static const support::TemporaryDirectory instance;
  return instance;
}

bool hasText(int token) {
  return token == TOKEN_NAME || (token >= TOKEN_NUMBER && token <= TOKEN_NUMBER_BAD_LENGTH);
}

enum class Detail { kNone, kLine, kState };

std::string listing(const std::string& text, Detail detail) {
  OpenLexer lexer(text);
  std::string all;
  for (;;) {
    const int token = lexer.lexan();
    all += all.empty() ? "" : " ";
    all += std::to_string(token);
    if (hasText(token)) {
      all += ":" + lexer.text();
    }
    if (detail == Detail::kLine) {
      all += "@" + std::to_string(lexer.getLineNumber());
    } else if (detail == Detail::kState) {
      all += "#" + std::to_string(lexer.getTokenValIndex());
      all += "=" + std::to_string(lexer.getCurrentToken());
    }
    if (token == TOKEN_END) {
      return all;
    }
  }
}

}  // namespace

const std::string& inputDirectory() { return directory().path(); }

// A new file each time: to empty an old one makes some file systems write it out at once.
std::string inputFile(const std::string& text) {
  std::filesystem::remove(directory().file(kInputName));
  return directory().write(kInputName, text);
}

OpenLexer::OpenLexer(const std::string& text)
    : SchemaLexan((inputFile(text), inputDirectory()), kInputName) {}

std::string OpenLexer::text() {
  std::string text;
  getStringValue(getTokenValIndex(), text);
  return text;
}

std::string tokensOf(const std::string& text) { return listing(text, Detail::kNone); }

std::string linesOf(const std::string& text) { return listing(text, Detail::kLine); }

std::string stateOf(const std::string& text) { return listing(text, Detail::kState); }

std::string printable(const std::string& text) {
  std::string shown;
  for (const char c : text) {
    if (c >= ' ' && c <= '~') {
      shown += c;
    } else {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\x%02x",
                    static_cast<unsigned>(static_cast<unsigned char>(c)));
      shown += escaped;
    }
  }
  return shown;
}

}  // namespace lexertesting
