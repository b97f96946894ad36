// The analyser against a second one that is as simple as can be, over generated inputs.

#include <gtest/gtest.h>

#include <array>
#include <random>
#include <string>
#include <string_view>
#include <utility>

#include "LexerTesting.h"
#include "ReferenceLexer.h"

namespace {

using lexertesting::OpenLexer;
using lexertesting::printable;
using namespace std::string_literals;

std::string state(int token, const std::string& text, int index, int current, int line) {
  return std::to_string(token) + " '" + text + "' index " + std::to_string(index) + " current " +
         std::to_string(current) + " line " + std::to_string(line);
}

std::string state(int token, SchemaLexan* lexer) {
  std::string text;
  lexer->getStringValue(lexer->getTokenValIndex(), text);
  return state(token, text, lexer->getTokenValIndex(), lexer->getCurrentToken(),
               lexer->getLineNumber());
}

std::string state(int token, const ReferenceLexer& lexer) {
  return state(token, lexer.text(), lexer.valueIndex(), lexer.currentToken(), lexer.line());
}

// The analysers that must agree over one text: in a file, as a caller makes it and as the base of a
// class; over bytes in memory; and the reference.
class Analysers {
 public:
  explicit Analysers(const std::string& text) : m_text(text) {}

  // Lets all read a token and returns "" when they agree, and the token in *token.
  std::string lexan(int* token) {
    *token = m_reference.lexan();
    return differenceTo(state(*token, m_reference), [](SchemaLexan* lexer) {
      const int code = lexer->lexan();
      return state(code, lexer);
    });
  }

  std::string match(int asked) {
    m_reference.match(asked);
    return differenceTo(state(0, m_reference), [asked](SchemaLexan* lexer) {
      lexer->match(asked);
      return state(0, lexer);
    });
  }

  int currentToken() const { return m_reference.currentToken(); }

 private:
  template <typename Step>
  std::string differenceTo(const std::string& expected, Step step) {
    const std::pair<const char*, SchemaLexan*> lexers[] = {
        {"derived", &m_derived}, {"file", &m_file}, {"bytes", &m_bytes}};
    for (const auto& [name, lexer] : lexers) {
      const std::string actual = step(lexer);
      if (actual != expected || lexer->fileIsOpen() != m_derived.fileIsOpen()) {
        return printable(std::string(name) + " got " + actual + ", expected " + expected + " in " +
                         m_text);
      }
    }
    return "";
  }

  const std::string m_text;
  OpenLexer m_derived{m_text};
  SchemaLexan m_file{lexertesting::inputDirectory(), lexertesting::kInputName};
  SchemaLexan m_bytes{m_text.data(), m_text.size(), "", ""};
  ReferenceLexer m_reference{lexertesting::inputDirectory() + "/" + lexertesting::kInputName};
};

// Reads all to the end and twice more. Returns "" when they agree all the way.
std::string differenceOverLexan(const std::string& text) {
  Analysers analysers(text);
  for (int behindEnd = 0; behindEnd < 3;) {
    int token = 0;
    const std::string difference = analysers.lexan(&token);
    if (!difference.empty()) {
      return difference;
    }
    behindEnd += token == 260 ? 1 : 0;
  }
  return "";
}

// The same, reading by lexan() and match() in an order that `seed` gives.
std::string differenceOverMatch(const std::string& text, std::mt19937::result_type seed) {
  Analysers analysers(text);
  std::mt19937 random(seed);
  for (std::size_t step = 0; step < text.size() + 5; ++step) {
    const auto choice = random() % 4;
    int token = 0;
    const std::string difference =
        choice == 0 ? analysers.lexan(&token)
                    : analysers.match(choice == 1 ? 40 : analysers.currentToken());
    if (!difference.empty()) {
      return difference;
    }
  }
  return "";
}

const std::array<std::string, 64> kPieces = {"'",
                                             "'",
                                             "''",
                                             "(",
                                             ")",
                                             "{",
                                             "}",
                                             "$",
                                             "=",
                                             " ",
                                             " ",
                                             "  ",
                                             "\t",
                                             "\n",
                                             "\n\n",
                                             "#",
                                             "# c\n",
                                             "#'\n",
                                             "1",
                                             "2.5.4.3",
                                             "2.5.4.3 ",
                                             ".",
                                             "{32}",
                                             " {12",
                                             "{x",
                                             "7{8}",
                                             "NAME",
                                             "NAME ",
                                             "DESC",
                                             "'DESC'",
                                             "SINGLE-VALUE",
                                             "objectclasses",
                                             "objectClasses",
                                             "attributeTypes",
                                             "ORVattributeTypes",
                                             "ORVAttributetypes",
                                             "attributetypes",
                                             "OBJECTCLASSES",
                                             "ObjectClasses ",
                                             "REVERSE",
                                             "a",
                                             "cn",
                                             "cn ",
                                             "-",
                                             "_",
                                             "\x80",
                                             "\xff",
                                             "\xc3\xa9",
                                             "\0"s,
                                             "\r\n",
                                             "\r",
                                             "\v",
                                             "\"",
                                             "\\",
                                             "'a b,c'",
                                             "'2.5.4.3'",
                                             "'cn'",
                                             "name",
                                             "x1_-y",
                                             "\x7f",
                                             "~",
                                             "`",
                                             "attributetypes=( 1.2 NAME 'a' )\n",
                                             "    "};

std::string generated(std::mt19937* random, std::size_t pieces) {
  std::string text;
  for (std::size_t i = 0; i < pieces; ++i) {
    const auto choice = (*random)();
    if (choice % 16 == 0) {
      text += static_cast<char>((choice >> 8) & 0xff);
    } else {
      text += kPieces[(choice >> 8) % kPieces.size()];
    }
  }
  return text;
}

TEST(AgainstReference, EveryShortInput) {
  // All texts of up to three bytes over the bytes that matter.
  const std::string_view alphabet("'a1-_.#{} \t\n(\x80\0N", 16);
  std::string text;
  for (std::size_t length = 0; length <= 3; ++length) {
    std::size_t count = 1;
    for (std::size_t i = 0; i < length; ++i) {
      count *= alphabet.size();
    }
    for (std::size_t number = 0; number < count; ++number) {
      text.clear();
      for (std::size_t i = 0, rest = number; i < length; ++i, rest /= alphabet.size()) {
        text += alphabet[rest % alphabet.size()];
      }
      ASSERT_EQ(differenceOverLexan(text), "");
    }
  }
}

TEST(AgainstReference, EveryByteInEveryPlace) {
  for (int value = 0; value < 256; ++value) {
    const std::string byte(1, static_cast<char>(value));
    for (const std::string& text :
         {byte, byte + "x ", "cn" + byte + "x ", "'a" + byte + "b' c ", "1" + byte + "2 ) ",
          "1{" + byte + "} ) ", "1{2" + byte + "} ) ", "# " + byte + " x\ny ",
          "1 " + byte + "{2} ) "}) {
      ASSERT_EQ(differenceOverLexan(text), "");
    }
  }
}

TEST(AgainstReference, GeneratedInputs) {
  std::mt19937 random(20010203);
  for (int i = 0; i < 12000; ++i) {
    const std::string text = generated(&random, random() % 24);
    ASSERT_EQ(differenceOverLexan(text), "") << "input " << i;
  }
}

TEST(AgainstReference, GeneratedInputsReadByLexanAndMatch) {
  std::mt19937 random(40506);
  for (int i = 0; i < 4000; ++i) {
    const std::string text = generated(&random, random() % 16);
    ASSERT_EQ(differenceOverMatch(text, random()), "") << "input " << i;
  }
}

TEST(AgainstReference, GeneratedInputsOverSeveralBuffers) {
  std::mt19937 random(70809);
  for (int i = 0; i < 12; ++i) {
    const std::string text = generated(&random, 3000 + random() % 3000);
    ASSERT_EQ(differenceOverLexan(text), "") << "input " << i;
  }
}

constexpr char kUserAttributes[] =
    "# File generated by 6.1 migration 2001-02-03 04:05:06\n"
    "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName'  )  DESC 'Common, given name.' SUP name "
    "EQUALITY caseIgnoreMatch SUBSTR caseIgnoreSubstringsMatch SYNTAX "
    "1.3.6.1.4.1.1466.115.121.1.15{32768} SINGLE-VALUE USAGE userApplications  )\n"
    "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn'  ) ACCESS-CLASS normal LENGTH 256 EQUALITY )\n";

constexpr char kUserClasses[] =
    "objectClasses = {\n"
    "\t( 2.5.6.6 NAME 'person'\t DESC 'a person' SUP top STRUCTURAL\r\n"
    "    MUST ( cn $ sn ) MAY ( userPassword $ objectClasses ) )  # the first\n"
    "\n"
    "  ( 2.5.6.7 {12} NAME ( 'organizationalPerson' ) SUP ( person ) AUXILIARY )\n"
    "}\n"
    "attributeTypes={ ( caf\xc3\xa9-oid NAME '\xe9t\xe9' ORDERING 2.5.13.3 OBSOLETE ) }";

TEST(AgainstReference, EveryPrefixOfAFile) {
  for (const std::string& file : {std::string(kUserAttributes), std::string(kUserClasses)}) {
    for (std::size_t length = 0; length <= file.size(); ++length) {
      ASSERT_EQ(differenceOverLexan(file.substr(0, length)), "") << length;
      ASSERT_EQ(differenceOverMatch(file.substr(0, length), 1), "") << length;
    }
  }
}

TEST(AgainstReference, EverySuffixOfAFile) {
  const std::string file = std::string(kUserAttributes) + kUserClasses;
  for (std::size_t start = 0; start <= file.size(); ++start) {
    ASSERT_EQ(differenceOverLexan(file.substr(start)), "") << start;
  }
}

TEST(AgainstReference, MissingFile) {
  SchemaLexan lexer(lexertesting::inputDirectory(), "not there");
  ReferenceLexer reference(lexertesting::inputDirectory() + "/not there");
  EXPECT_EQ(state(lexer.lexan(), &lexer), state(reference.lexan(), reference));
}

}  // namespace
