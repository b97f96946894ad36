// The construction of an analyser: it reads nothing, and when it fails it leaves the locale as the
// destructor does.

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <new>
#include <string>

#include "Files.h"
#include "PlatformFunctions.h"
#include "SchemaLexan.h"

namespace {

using support::TemporaryDirectory;

constexpr char kName[] = "V3.user.at";

TEST(Construction, ReadsNothing) {
  const TemporaryDirectory directory;
  directory.write(kName, "NAME cn\n");
  const int before = platform::reads();
  SchemaLexan lexer(directory.path(), kName);
  EXPECT_EQ(platform::reads(), before);
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), KEY_NAME);
  EXPECT_GT(platform::reads(), before);
}

TEST(Construction, FindsADirectoryWithoutReadingIt) {
  const TemporaryDirectory directory;
  std::filesystem::create_directory(directory.file(kName));
  const int before = platform::reads();
  SchemaLexan lexer(directory.path(), kName);
  EXPECT_FALSE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_EQ(lexer.getTokenValIndex(), -1);
  EXPECT_EQ(platform::reads(), before);
}

// A file whose first reading fails opens like any other, and ends at once.
TEST(Construction, OpensAFileThatCannotBeRead) {
  const TemporaryDirectory directory;
  std::filesystem::create_symlink("/proc/self/mem", directory.file(kName));
  SchemaLexan lexer(directory.path(), kName);
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_FALSE(lexer.fileIsOpen());
}

// Constructs by `construct` with the first allocation failing, then the second and so on, until it
// succeeds. Calls `check` behind every failure. Returns how many there were.
template <typename Construct, typename Check>
int failuresOf(Construct construct, Check check) {
  for (int failures = 0;; ++failures) {
    try {
      const platform::FailingAllocation failing(failures + 1);
      construct();
      return failures;
    } catch (const std::bad_alloc&) {
      check(failures + 1);
    }
  }
}

// Every test begins in the locale "C", with another one in the environment.
class FailedConstruction : public testing::Test {
 protected:
  FailedConstruction() {
    ::setenv("LC_ALL", kEnvironments, 1);
    directory.write(kName, "NAME cn\n");
  }
  ~FailedConstruction() override {
    ::unsetenv("LC_ALL");
    std::setlocale(LC_ALL, "C");
  }

  static constexpr char kEnvironments[] = "C.UTF-8";
  const TemporaryDirectory directory;
};

TEST_F(FailedConstruction, ResetsTheLocale) {
  const std::string path = directory.path() + "/" + std::string(20, '/');
  const int failures = failuresOf([&] { SchemaLexan(path, kName); },
                                  [&](int allocation) {
                                    // Before the switch the locale in force stays; the arguments
                                    // are made there.
                                    const std::string locale = std::setlocale(LC_ALL, nullptr);
                                    EXPECT_TRUE(locale == kEnvironments || allocation <= 1)
                                        << allocation << " " << locale;
                                    std::setlocale(LC_ALL, "C");
                                  });
  EXPECT_GT(failures, 5);
  EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), kEnvironments);
}

TEST_F(FailedConstruction, OverBytesLeavesTheLocaleAlone) {
  const int failures = failuresOf(
      [&] { SchemaLexan("NAME ", 5, "", ""); },
      [&](int allocation) { EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C") << allocation; });
  EXPECT_GT(failures, 2);
  EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C");
}

}  // namespace
