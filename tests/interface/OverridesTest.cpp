// A class derived from one of the library's overrides every virtual function, by the function's
// name and arguments alone, and is called.

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "Attribute.h"
#include "Files.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "SchemaLexan.h"

// What a server's own class says is said without `override`.
#pragma GCC diagnostic ignored "-Wsuggest-override"
#ifdef __clang__
#pragma clang diagnostic ignored "-Winconsistent-missing-override"
#pragma clang diagnostic ignored "-Winconsistent-missing-destructor-override"
#endif

namespace {

using Strings = std::vector<std::string>;

// NOLINTBEGIN(modernize-use-override,cppcoreguidelines-explicit-virtual-functions)
template <typename Definition>
class Own : public Definition {
 public:
  explicit Own(std::string* calls) : m_calls(*calls) {}
  ~Own() { m_calls += "destructor "; }
  void dump() { m_calls += "dump "; }
  void dump(std::ofstream& /*out*/) { m_calls += "dump(out) "; }
  std::string getOid() { return "own OID"; }
  std::string getDescription() { return "own description"; }
  Strings getSuperior() { return {"own superior"}; }
  std::string getFirstName() { return "own first name"; }
  Strings getNames() { return {"own name"}; }
  std::string getFirstNameLower() { return "own name in lower case"; }

 private:
  std::string& m_calls;
};

template <typename Definition>
class DefinitionOverrides : public testing::Test {};

using Definitions = testing::Types<Attribute, ObjectClass, ORVAttribute>;
TYPED_TEST_SUITE(DefinitionOverrides, Definitions, );

TYPED_TEST(DefinitionOverrides, AreCalledThroughTheBase) {
  std::string calls;
  std::unique_ptr<ORVSchema> definition = std::make_unique<Own<TypeParam>>(&calls);
  EXPECT_EQ(definition->getOid(), "own OID");
  EXPECT_EQ(definition->getDescription(), "own description");
  EXPECT_EQ(definition->getSuperior(), Strings{"own superior"});
  EXPECT_EQ(definition->getFirstName(), "own first name");
  EXPECT_EQ(definition->getNames(), Strings{"own name"});
  EXPECT_EQ(definition->getFirstNameLower(), "own name in lower case");
  definition->dump();
  std::ofstream out;
  definition->dump(out);
  definition.reset();
  EXPECT_EQ(calls, "dump dump(out) destructor ");
}

class OwnLexer : public SchemaLexan {
 public:
  OwnLexer(std::string* calls, const std::string& directory)
      : SchemaLexan(directory, "none"), m_calls(*calls) {}
  ~OwnLexer() { m_calls += "destructor "; }
  int getLineNumber() { return 4711; }
  std::string getFileName() { return "own name"; }
  std::string getWorkingDir() { return "own directory"; }
  bool isString(int index) { return index == 1; }
  bool isCharacter(int index) { return index == 2; }
  int getCurrentToken() { return 3; }
  int getTokenValIndex() { return 4; }
  bool getStringValue(int /*index*/, std::string& out) { return !(out = "own text").empty(); }
  bool getCharValue(int /*index*/, char& out) { return (out = 'o') != '\0'; }
  int lookUp(int first, int second) { return first * second; }
  int lexan() { return 260; }
  void match(int expected) { m_calls += "match(" + std::to_string(expected) + ") "; }
  int insertString(std::string value, int token) { return token + static_cast<int>(value.size()); }
  int insertCharacter(char value, int token) { return token + value; }
  int clear() { return 5; }
  void dumpTable(std::string name) { m_calls += "dumpTable(" + name + ") "; }
  void dump(int indent, std::ofstream& out) { skip(indent, out); }
  void skip(int count, std::ofstream& /*out*/) {
    m_calls += "skip(" + std::to_string(count) + ") ";
  }

 private:
  std::string& m_calls;
};
// NOLINTEND(modernize-use-override,cppcoreguidelines-explicit-virtual-functions)

TEST(AnalyserOverrides, AreCalledThroughTheBase) {
  const support::TemporaryDirectory directory;
  std::string calls;
  std::unique_ptr<Clex_analyzer> lexer = std::make_unique<OwnLexer>(&calls, directory.path());
  EXPECT_EQ(lexer->getLineNumber(), 4711);
  EXPECT_EQ(lexer->getFileName(), "own name");
  EXPECT_EQ(lexer->getWorkingDir(), "own directory");
  EXPECT_TRUE(lexer->isString(1));
  EXPECT_TRUE(lexer->isCharacter(2));
  EXPECT_EQ(lexer->getCurrentToken(), 3);
  EXPECT_EQ(lexer->getTokenValIndex(), 4);
  std::string text;
  char character = '\0';
  EXPECT_TRUE(lexer->getStringValue(0, text));
  EXPECT_TRUE(lexer->getCharValue(0, character));
  EXPECT_EQ(text + character, "own texto");
  EXPECT_EQ(lexer->lookUp(6, 7), 42);
  EXPECT_EQ(lexer->lexan(), 260);
  lexer->match(40);
  EXPECT_EQ(lexer->insertString("xy", 100), 102);
  EXPECT_EQ(lexer->insertCharacter('\1', 100), 101);
  EXPECT_EQ(lexer->clear(), 5);
  lexer->dumpTable("t");
  std::ofstream out;
  lexer->dump(2, out);
  lexer.reset();
  EXPECT_EQ(calls, "match(40) dumpTable(t) skip(2) destructor ");
}

// A definition reads through the functions that an analyser of a caller's own overrides.
class OneDefinition : public SchemaLexan {
 public:
  explicit OneDefinition(const std::string& directory) : SchemaLexan(directory, "none") {}
  int getCurrentToken() override { return m_token; }
  void match(int expected) override { m_token = m_token == expected ? lexan() : m_token; }
  int lexan() override { return m_token = kTokens[m_next++]; }
  int getTokenValIndex() override { return m_token == TOKEN_NUMBER ? 99 : -1; }
  bool getStringValue(int index, std::string& out) override {
    out = index == 99 ? "1.2.3" : "";
    return index == 99;
  }

 private:
  static constexpr int kTokens[] = {'(', TOKEN_NUMBER, ')', TOKEN_END};
  int m_next = 0;
  int m_token = '=';
};

TYPED_TEST(DefinitionOverrides, OfTheAnalyserAreCalledByParse) {
  const support::TemporaryDirectory directory;
  OneDefinition lexer(directory.path());
  TypeParam definition;
  EXPECT_TRUE(definition.parse(&lexer));
  EXPECT_EQ(definition.getOid(), "1.2.3");
  EXPECT_EQ(lexer.getCurrentToken(), TOKEN_END);
}

}  // namespace
