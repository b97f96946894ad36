// The locale of the process: "C" while an analyser lives, the environment's default afterwards.

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <memory>
#include <string>

#include "Files.h"
#include "LexerTesting.h"
#include "TraceRecorder.h"

namespace {

using lexertesting::OpenLexer;

constexpr char kOther[] = "C.UTF-8";

std::string currentLocale() { return std::setlocale(LC_ALL, nullptr); }

// Every test begins in the locale "C" with nothing about it in the environment, and leaves it so.
class Locale : public testing::Test {
 protected:
  Locale() { reset(); }
  ~Locale() override { reset(); }

  static void reset() {
    for (const char* name : {"LC_ALL", "LC_CTYPE", "LC_TIME", "LC_NUMERIC", "LANG", "LANGUAGE"}) {
      ::unsetenv(name);
    }
    std::setlocale(LC_ALL, "C");
  }
};

TEST_F(Locale, IsCBetweenConstructionAndDestruction) {
  ASSERT_NE(std::setlocale(LC_ALL, kOther), nullptr);
  ::setenv("LC_ALL", kOther, 1);
  {
    OpenLexer lexer("cn ");
    EXPECT_EQ(currentLocale(), "C");
    lexer.lexan();
    EXPECT_EQ(currentLocale(), "C");
  }
  EXPECT_EQ(currentLocale(), kOther);
}

TEST_F(Locale, IsTheEnvironmentsDefaultAfterwardsNotTheOneBefore) {
  ::setenv("LC_ALL", kOther, 1);
  { OpenLexer lexer(""); }
  EXPECT_EQ(currentLocale(), kOther);

  ::setenv("LC_ALL", "C", 1);
  { OpenLexer lexer(""); }
  EXPECT_EQ(currentLocale(), "C");
}

TEST_F(Locale, IsSetInEveryCategory) {
  ASSERT_NE(std::setlocale(LC_CTYPE, kOther), nullptr);
  ::setenv("LC_CTYPE", kOther, 1);
  {
    OpenLexer lexer("");
    EXPECT_EQ(currentLocale(), "C");
  }
  EXPECT_STREQ(std::setlocale(LC_CTYPE, nullptr), kOther);
  EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
}

TEST_F(Locale, IsSwitchedForAFileThatIsNotThereToo) {
  support::TemporaryDirectory directory;
  ASSERT_NE(std::setlocale(LC_ALL, kOther), nullptr);
  {
    OpenLexer lexer(directory.path(), "V3.user.at");
    EXPECT_EQ(currentLocale(), "C");
  }
  EXPECT_EQ(currentLocale(), "C");
}

TEST_F(Locale, TokensAreTheSameWhateverTheEnvironmentSays) {
  const std::string text = "caf\xc3\xa9 'd\xe9j\xe0 vu' \xaa\xb5 1\xb2\n";
  const std::string expected = "259:caf -61 -87 259:d 259:j -32 259:vu 259:  -75 2024:1 -78 260";
  EXPECT_EQ(lexertesting::tokensOf(text), expected);
  ::setenv("LC_ALL", kOther, 1);
  ASSERT_NE(std::setlocale(LC_ALL, ""), nullptr);
  EXPECT_EQ(lexertesting::tokensOf(text), expected);
}

// ---- What is reported ----

constexpr char kHead[] = "debug global level 0x3400000 0xc8010000: ";

std::string changing(const std::string& before) {
  return std::string(kHead) + "SchemaLexan: current locale settings on the system is: " + before +
         "\n" + kHead + "SchemaLexan: changing locale settings to \"C\" \n" + kHead +
         "SchemaLexan: locale settings on the system after changing is: C \n";
}

std::string resetting(const std::string& after) {
  return std::string(kHead) +
         "~SchemaLexan: resetting locale before returning to system default settings. \n" + kHead +
         "lexan: locale settings after resetting is: " + after;
}

std::string joined(const support::TraceRecorder& recorder) {
  std::string all;
  for (const std::string& record : recorder.records()) {
    all += record;
  }
  return all;
}

TEST_F(Locale, ChangesAreReportedOutsideAnyNumberedFunction) {
  ASSERT_NE(std::setlocale(LC_ALL, kOther), nullptr);
  ::setenv("LC_ALL", kOther, 1);
  support::TraceRecorder recorder(support::kAllEvents);
  auto lexer = std::make_unique<OpenLexer>("");
  EXPECT_EQ(joined(recorder), changing(kOther));
  recorder.clear();
  lexer.reset();
  EXPECT_EQ(joined(recorder), resetting(kOther));
}

TEST_F(Locale, ReportNamesEveryCategoryWhenTheyDiffer) {
  ASSERT_NE(std::setlocale(LC_CTYPE, kOther), nullptr);
  ::setenv("LC_CTYPE", kOther, 1);
  const std::string mixed = currentLocale();
  ASSERT_NE(mixed.find(';'), std::string::npos);
  support::TraceRecorder recorder(support::kDebugEvents);
  auto lexer = std::make_unique<OpenLexer>("");
  EXPECT_EQ(joined(recorder), changing(mixed));
  recorder.clear();
  lexer.reset();
  EXPECT_EQ(joined(recorder), resetting(mixed));
}

TEST_F(Locale, EnvironmentsLocaleThatIsNotInstalledLeavesC) {
  ::setenv("LC_ALL", "xx_YY.no-such-locale", 1);
  support::TraceRecorder recorder(support::kDebugEvents);
  auto lexer = std::make_unique<OpenLexer>("cn ");
  EXPECT_EQ(lexer->lexan(), 259);
  recorder.clear();
  lexer.reset();
  EXPECT_EQ(joined(recorder), resetting("C"));
  EXPECT_EQ(currentLocale(), "C");
}

TEST_F(Locale, NothingIsReportedWithoutDebugEvents) {
  support::TraceRecorder recorder(support::kAllEvents & ~support::kDebugEvents);
  { OpenLexer lexer(""); }
  EXPECT_EQ(joined(recorder), "");
}

}  // namespace
