// A file that opens, and whose reading fails later: the analyser's input ends there.

#include <gtest/gtest.h>

#include <string>

#include "Installation.h"
#include "PlatformFunctions.h"
#include "SchemaLexan.h"

using namespace support;
using platform::BrokenFile;

namespace {

constexpr char kName[] = "V3.user.at";

// A file of which no piece holds all, that begins with `text` and has more such text behind it.
std::string longFile(const std::string& text) {
  return text + "#" + std::string(200000, '-') + "\n" + attributeType("1.9", "last");
}

TEST(ReadError, EndsTheTokens) {
  const Installation installation;
  const std::string path = installation.write(kName, longFile("NAME (\n"));
  SchemaLexan lexer(installation.path(), kName);
  const BrokenFile broken(path);
  EXPECT_EQ(lexer.lexan(), KEY_NAME);
  EXPECT_EQ(lexer.lexan(), '(');
  EXPECT_TRUE(lexer.fileIsOpen());
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(lexer.lexan(), TOKEN_END);
    EXPECT_FALSE(lexer.fileIsOpen());
    EXPECT_EQ(lexer.getCurrentToken(), '(');
    EXPECT_EQ(lexer.getTokenValIndex(), -1);
  }
  EXPECT_EQ(broken.failures(), 1);
}

TEST(ReadError, WithinADefinitionFailsTheFile) {
  Installation installation;
  const std::string path =
      installation.write(kName, longFile(attributeType("1.1", "a") + "attributetypes=( 1.2"));
  const BrokenFile broken(path);
  EXPECT_EQ(installation->readFile(kName), 1);
  EXPECT_EQ(broken.failures(), 1);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
}

// Between definitions it cannot be told from the end of the file.
TEST(ReadError, BetweenDefinitionsEndsTheFile) {
  Installation installation;
  const std::string path = installation.write(kName, longFile(attributeType("1.1", "a")));
  const BrokenFile broken(path);
  EXPECT_EQ(installation->readFile(kName), 0);
  EXPECT_EQ(broken.failures(), 1);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
}

}  // namespace
