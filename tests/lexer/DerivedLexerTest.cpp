// What a class derived from the analyser may do with the members that it inherits: read from the
// stream, give it another buffer or file, and use or replace the symbol table.

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <streambuf>
#include <string>
#include <utility>

#include "Files.h"
#include "LexerTesting.h"
#include "WithoutTypeInformation.h"

namespace {

using lexertesting::inputDirectory;
using lexertesting::inputFile;
using lexertesting::kInputName;

// Shows every member.
class Derived : public SchemaLexan {
 public:
  explicit Derived(const std::string& text)
      : SchemaLexan((inputFile(text), inputDirectory()), kInputName) {}

  std::ifstream& input() { return m_input; }
  CSymbolTable& table() { return *m_symtable; }
  void replaceTable(CSymbolTable* table) {
    delete m_symtable;
    m_symtable = table;
    m_scratch_index = table->getTableSize();
  }

  // What the table has under the index of the current token.
  std::string textInTable() {
    std::string text = "(none)";
    m_symtable->getValue(m_tokenvalindex, text);
    return text;
  }
};

// Reads on to the end: each token, with the text that the table has for it.
std::string restOf(Derived* lexer) {
  std::string all;
  for (int token = lexer->lexan(); token != TOKEN_END; token = lexer->lexan()) {
    all += std::to_string(token);
    all += lexer->getTokenValIndex() < 0 ? " " : ":" + lexer->textInTable() + " ";
  }
  return all;
}

// ---- The stream ----

TEST(DerivedLexer, ReadsFromItsInputBetweenTwoTokens) {
  Derived lexer("NAME 'cn' to be left out\nDESC 'd' ");
  lexer.lexan();
  lexer.lexan();
  std::string line;
  ASSERT_TRUE(std::getline(lexer.input(), line));
  EXPECT_EQ(line, " to be left out");
  EXPECT_EQ(lexer.textInTable(), "cn");
  EXPECT_EQ(lexer.input().get(), 'D');
  EXPECT_EQ(restOf(&lexer), "259:ESC 259:d ");
}

TEST(DerivedLexer, KeepsTheCurrentTextWhenItReadsFarAhead) {
  const std::string far(100000, '-');
  for (const char* const word :
       {"cn", "aWordThatIsLongerThanAnyTextKeptInPlace", "1.2.840.113549"}) {
    Derived lexer(std::string(word) + " " + far + "! behind ");
    lexer.lexan();
    std::string left;
    std::getline(lexer.input(), left, '!');
    EXPECT_GE(left.size(), far.size());
    EXPECT_EQ(lexer.textInTable(), word);
    std::string text;
    EXPECT_TRUE(lexer.getStringValue(lexer.getTokenValIndex(), text));
    EXPECT_EQ(text, word);
    EXPECT_EQ(restOf(&lexer), "259:behind ");
  }
}

TEST(DerivedLexer, MeetsTheEndThatItReadItself) {
  Derived lexer("cn sn ");
  lexer.lexan();
  std::string rest;
  std::getline(lexer.input(), rest);
  EXPECT_FALSE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_EQ(lexer.textInTable(), "cn");
  EXPECT_EQ(lexer.getTokenValIndex(), 25);
}

TEST(DerivedLexer, PutsACharacterBackThatWasNotThere) {
  Derived lexer("cn sn ");
  lexer.lexan();
  ASSERT_TRUE(lexer.input().get());
  ASSERT_TRUE(lexer.input().putback('x'));
  EXPECT_EQ(restOf(&lexer), "259:xsn ");
}

TEST(DerivedLexer, ReadsAgainFromTheStart) {
  Derived lexer("NAME cn\n");
  EXPECT_EQ(restOf(&lexer), "1003:NAME 259:cn ");
  lexer.input().clear();
  lexer.input().seekg(0);
  EXPECT_EQ(restOf(&lexer), "1003:NAME 259:cn ");
}

TEST(DerivedLexer, OpensAnotherFile) {
  const support::TemporaryDirectory directory;
  directory.write("other", "DESC aTextThatIsLongerThanAnyKeptInPlace\n(");
  Derived lexer("NAME anotherTextThatIsLongerThanAnyKeptInPlace sn");
  lexer.lexan();
  lexer.lexan();
  lexer.input().close();
  EXPECT_EQ(lexer.textInTable(), "anotherTextThatIsLongerThanAnyKeptInPlace");
  lexer.input().open(directory.file("other"));
  EXPECT_EQ(lexer.input().peek(), 'D');
  EXPECT_EQ(lexer.textInTable(), "anotherTextThatIsLongerThanAnyKeptInPlace");
  EXPECT_EQ(restOf(&lexer), "1004:DESC 259:aTextThatIsLongerThanAnyKeptInPlace 40 ");
}

TEST(DerivedLexer, OpensAnotherFileThroughABufferOfItsOwn) {
  const support::TemporaryDirectory directory;
  directory.write("other", "DESC 'a description that is longer than the buffer' 1.2 {3} \n(");
  char buffer[16];
  Derived lexer("NAME cn ");
  EXPECT_EQ(restOf(&lexer), "1003:NAME 259:cn ");
  lexer.input().close();
  lexer.input().rdbuf()->pubsetbuf(buffer, sizeof buffer);
  lexer.input().open(directory.file("other"));
  EXPECT_EQ(restOf(&lexer),
            "1004:DESC 259:a description that is longer than the buffer 2025:1.2{3} 40 ");
  lexer.input().close();
}

TEST(DerivedLexer, TakesTheStreamOfAnotherFile) {
  const support::TemporaryDirectory directory;
  directory.write("other", "MUST sn\n");
  Derived lexer("NAME cn ");
  lexer.lexan();
  lexer.input() = std::ifstream(directory.file("other"));
  EXPECT_EQ(restOf(&lexer), "1007:MUST 259:sn ");
}

TEST(DerivedLexer, ReadsFromAStreamBufferOfItsOwn) {
  std::stringbuf other("MAY 'x y' 1.2\n");
  Derived lexer("NAME cn sn ");
  lexer.lexan();
  lexer.lexan();
  std::ios& stream = lexer.input();
  std::streambuf* const file = stream.rdbuf(&other);
  EXPECT_EQ(lexer.textInTable(), "cn");
  EXPECT_EQ(restOf(&lexer), "1008:MAY 259:x y 2024:1.2 ");
  stream.rdbuf(file);
  EXPECT_EQ(restOf(&lexer), "259:sn ");
}

// A stream buffer without a buffer: each character is asked for.
class OneByOne : public std::streambuf {
 public:
  explicit OneByOne(std::string text) : m_text(std::move(text)) {}

 protected:
  int_type underflow() override {
    return m_next == m_text.size() ? traits_type::eof() : traits_type::to_int_type(m_text[m_next]);
  }
  int_type uflow() override {
    const int_type character = underflow();
    m_next += character == traits_type::eof() ? 0 : 1;
    return character;
  }

 private:
  std::string m_text;
  std::size_t m_next = 0;
};

TEST(DerivedLexer, ReadsFromAStreamBufferThatHasNoBuffer) {
  OneByOne other("attributetypes=( 2.5.4.3{16} NAME 'c n' # c\n\t$ \xe9)1.2 {3} x y");
  Derived lexer("");
  std::ios& stream = lexer.input();
  stream.rdbuf(&other);
  EXPECT_EQ(restOf(&lexer),
            "1010:attributetypes 61 40 2025:2.5.4.3{16} 1003:NAME 259:c n 36 -23 41 2025:1.2{3} "
            "259:x ");
  EXPECT_EQ(lexer.getLineNumber(), 2);
}

class Throwing : public std::streambuf {
 protected:
  int_type underflow() override { throw 4711; }
};

TEST(DerivedLexer, TakesAStreamBufferThatThrowsForAnError) {
  Throwing other;
  Derived lexer("cn sn ");
  lexer.lexan();
  std::ios& stream = lexer.input();
  stream.rdbuf(&other);
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_TRUE(stream.bad());
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_EQ(lexer.getCurrentToken(), TOKEN_NAME);
}

TEST(DerivedLexer, WithoutAStreamBufferHasNoTokens) {
  Derived lexer("cn sn ");
  std::ios& stream = lexer.input();
  std::streambuf* const file = stream.rdbuf(nullptr);
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  stream.rdbuf(file);
  EXPECT_EQ(restOf(&lexer), "259:cn 259:sn ");
}

// ---- The symbol table ----

// The words of another language; one is a keyword of this one too.
class OtherKeywords : public CSymbolTable {
 public:
  OtherKeywords() {
    insertValue(std::string("create"), 1, true);
    insertValue(std::string("NAME"), 2, true);
    insertValue('x', 3, true);
  }
};

TEST(DerivedLexer, ReplacesTheTableByOneWithOtherKeywords) {
  Derived lexer("NAME cn create sn NAME DESC 1.2 'create' x objectClasses cn cn ");
  EXPECT_EQ(lexer.lexan(), KEY_NAME);
  EXPECT_EQ(lexer.lexan(), TOKEN_NAME);
  lexer.replaceTable(new OtherKeywords);
  EXPECT_EQ(restOf(&lexer),
            "1:create 259:sn 2:NAME 259:DESC 2024:1.2 1:create 259:x 259:objectClasses 259:cn "
            "259:cn ");
  EXPECT_EQ(lexer.table().getTableSize(), 4);
  EXPECT_EQ(lexer.getTokenValIndex(), -1);
  EXPECT_EQ(lexer.lookUp(2, 0), 1);
  lexer.replaceTable(new CSymbolTable);
}

TEST(DerivedLexer, ReplacesTheTableBeforeTheFirstToken) {
  Derived lexer("create attributeTypes aTextThatIsLongerThanAnyKeptInPlace ");
  lexer.replaceTable(new OtherKeywords);
  lexer.insertString("attributetypes", 4);
  EXPECT_EQ(lexer.lexan(), 1);
  EXPECT_EQ(lexer.lexan(), 4);
  EXPECT_EQ(lexer.getTokenValIndex(), 3);
  EXPECT_EQ(restOf(&lexer), "259:aTextThatIsLongerThanAnyKeptInPlace ");
}

TEST(DerivedLexer, HasTheTextOfEveryTokenInTheTable) {
  Derived lexer("( cn 1.2{3} 'x y' NAME objectClasses cn 'NAME' ");
  const struct {
    int token;
    const char* text;
  } rows[] = {{40, "(none)"},          {259, "cn"}, {2025, "1.2{3}"}, {259, "x y"}, {1003, "NAME"},
              {1002, "objectclasses"}, {259, "cn"}, {1003, "NAME"}};
  for (const auto& row : rows) {
    EXPECT_EQ(lexer.lexan(), row.token);
    EXPECT_EQ(lexer.textInTable(), row.text);
    EXPECT_EQ(lexer.table().getTokenValue(lexer.getTokenValIndex()),
              row.token == 40 ? -1 : row.token);
    EXPECT_EQ(row.token == 40 ? -1 : lexer.table().lookUpValue(row.text), lexer.getTokenValIndex());
  }
}

// An entry counts from its insertion to its removal, and the lowest index wins.
TEST(DerivedLexer, SeesEveryChangeOfTheTable) {
  Derived lexer("DESC NAME extra NAME NAME extra extra extra DESC ");
  lexer.table().insertValue(std::string("DESC"), 5, false);
  const int extra = lexer.table().insertValue(std::string("extra"), 6, false);
  EXPECT_EQ(lexer.lexan(), KEY_DESC);
  EXPECT_EQ(lexer.lexan(), KEY_NAME);
  EXPECT_EQ(lexer.lexan(), 6);
  lexer.table().removeValue(1);
  EXPECT_EQ(lexer.lexan(), TOKEN_NAME);
  const int name = lexer.table().insertValue(std::string("NAME"), 7, true);
  EXPECT_EQ(lexer.lexan(), TOKEN_NAME);
  lexer.table().removeValue(lexer.getTokenValIndex());
  EXPECT_EQ(lexer.table().lookUpValue("NAME"), name);
  lexer.table().removeValue(extra);
  const int again = lexer.table().insertValue(std::string("extra"), 8, true);
  EXPECT_EQ(lexer.lexan(), 8);
  EXPECT_EQ(lexer.getTokenValIndex(), again);
  lexer.table().insertValue(std::string("extra"), 9, true);
  EXPECT_EQ(lexer.lexan(), 8);
  lexer.table().removeValue(again);
  EXPECT_EQ(lexer.lexan(), 9);
  lexer.table().removeValue(2);
  EXPECT_EQ(lexer.lexan(), TOKEN_NAME);
}

TEST(DerivedLexer, MayBeCompiledWithoutTypeInformation) {
  inputFile("NAME extra 'cn' extra 1.2 {3} ");
  const auto lexer = analyserWithoutTypeInformation(inputDirectory(), kInputName);
  std::string tokens;
  for (int token = lexer->lexan(); token != TOKEN_END; token = lexer->lexan()) {
    std::string text;
    lexer->getStringValue(lexer->getTokenValIndex(), text);
    tokens += std::to_string(token) + ":" + text + " ";
  }
  EXPECT_EQ(tokens, "1003:NAME 777:extra 259:cn 777:extra 2025:1.2{3} ");
}

// ---- An analyser of no derived class ----

// Its table is what its operations show: the same as of a derived one at every step.
TEST(PlainLexer, ShowsTheTableThatADerivedOneHas) {
  const std::string text = "NAME cn extra 1.2 extra x cn objectClasses 'cn' ";
  inputFile(text);
  const support::TemporaryDirectory directory;
  const auto seen = [&](SchemaLexan* lexer) {
    std::string text25 = "(none)";
    char character = '?';
    lexer->getStringValue(25, text25);
    lexer->getCharValue(26, character);
    lexer->dumpTable(directory.file("table"));
    return text25 + " " + character + " " + std::to_string(lexer->isString(25)) +
           std::to_string(lexer->isCharacter(26)) + " " + std::to_string(lexer->lookUp(259, 0)) +
           " " + std::to_string(lexer->getTokenValIndex()) + "\n" +
           support::readWholeFile(directory.file("table"));
  };
  using Step = int (*)(SchemaLexan*);
  const Step look = [](SchemaLexan* lexer) { return lexer->isString(25) ? 1 : 0; };
  const Step insert = [](SchemaLexan* lexer) { return lexer->insertString("extra", 777); };
  const Step insertCharacter = [](SchemaLexan* lexer) { return lexer->insertCharacter('x', 120); };
  const Step clear = [](SchemaLexan* lexer) { return lexer->clear(); };
  for (const Step step : {look, insert, insertCharacter, clear}) {
    for (int before = 0; before < 9; ++before) {
      Derived derived(text);
      SchemaLexan plain(inputDirectory(), kInputName);
      for (int i = 0; i < before; ++i) {
        ASSERT_EQ(plain.lexan(), derived.lexan());
      }
      EXPECT_EQ(step(&plain), step(&derived)) << before;
      EXPECT_EQ(seen(&plain), seen(&derived)) << before;
      for (int i = before; i < 10; ++i) {
        ASSERT_EQ(plain.lexan(), derived.lexan()) << before;
        ASSERT_EQ(seen(&plain), seen(&derived)) << before;
      }
    }
  }
}

}  // namespace
