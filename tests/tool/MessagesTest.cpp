// What is told of the mistakes that administrators make most: each is called what it is, and what
// is advised works when it is done.

#include <gtest/gtest.h>

#include <string>

#include "ToolRun.h"

namespace {

bool holds(const std::string& text, const std::string& part) {
  return text.find(part) != std::string::npos;
}

class Messages : public testing::Test {
 protected:
  // "check" of one file, and what it prints.
  std::string checkOf(const std::string& name, const std::string& text, int exitCode = 1) const {
    folder.install("dir", {{name, text}});
    const ToolResult result = folder.run({"check", "@/dir"});
    EXPECT_EQ(exitCode, result.exitCode) << result.out << result.err;
    EXPECT_EQ("", result.err);
    return result.out;
  }

  ToolResult migrate(const std::vector<std::string>& more = {}) const {
    std::vector<std::string> arguments = {"migrate", "--from", "@/old", "--to",
                                          "@/new",   "--out",  "@/out"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return folder.run(arguments);
  }

  ToolFolder folder;
};

const char kType[] = "attributetypes=( 1.1 NAME 'cn' DESC 'd' )\n";

TEST_F(Messages, AMemberWithoutParenthesesIsNoUnclosedDefinition) {
  folder.install("dir", {{"V3.user.at", kType}});
  EXPECT_EQ(
      "@/dir/V3.user.oc:1:39: error: MAY has no parentheses round its value and stands last, so "
      "that the reader takes the \")\" of the definition for the end of the list; write MAY ( cn ) "
      ") [D208]\n1 error, 0 warnings\n",
      checkOf("V3.user.oc", "objectclasses=( 1.2 NAME 'c' ABSTRACT MAY cn )\n"));
  EXPECT_EQ("no findings\n",
            checkOf("V3.user.oc", "objectclasses=( 1.2 NAME 'c' ABSTRACT MAY ( cn ) )\n", 0));
}

TEST_F(Messages, KeywordsInTheWrongLetterCaseAreCalledSo) {
  EXPECT_EQ(
      "@/dir/V3.user.at:1:22: error: \"name\" is a keyword in the wrong letter case, so that the "
      "reader takes it for a plain word; write NAME [L110]\n"
      "@/dir/V3.user.at:1:32: error: \"desc\" is a keyword in the wrong letter case, so that the "
      "reader takes it for a plain word; write DESC [L110]\n2 errors, 0 warnings\n",
      checkOf("V3.user.at", "attributetypes=( 1.2 name 'cn' desc 'd' )\n"));
  EXPECT_EQ("no findings\n",
            checkOf("V3.user.at", "attributetypes=( 1.2 NAME 'cn' DESC 'd' )\n", 0));
}

TEST_F(Messages, LdifIsCalledLdif) {
  EXPECT_EQ(
      "@/dir/V3.user.at:1:1: error: this is an LDIF file and no schema file, of which the reader "
      "takes nothing; convert it to definitions as \"attributetypes=( ... )\" [L108]\n"
      "1 error, 0 warnings\n",
      checkOf("V3.user.at", "dn: cn=schema\nattributeTypes: ( 1.1 NAME 'cn' DESC 'd' )\n"));
}

// A list separates OIDs by blanks, so that none with a blank can be named there: each word is told
// by itself, and what is advised is something else.
TEST_F(Messages, NoAdviceHasAnOidWithBlanks) {
  folder.install("dir", {{"V3.user.at", kType}});
  folder.write("list", "list s badge in a file\n");
  const ToolResult result = folder.run({"check", "@/dir", "--exclude-oids", "@/list"});
  EXPECT_EQ(1, result.exitCode);
  EXPECT_TRUE(holds(result.out,
                    "@/list:1:6: error: s is no OID, and therefore names nothing; write the OID as "
                    "digits with dots, without quotes and without zeros in front [O502]\n"))
      << result.out;
  folder.install("old", {{"V3.user.at", "attributetypes=( 's badge' NAME 'cn' DESC 'd' )\n"}});
  folder.install("new", {{"V3.user.at", kType}});
  const ToolResult refused = migrate();
  EXPECT_EQ(4, refused.exitCode) << refused.err;
  EXPECT_FALSE(holds(refused.out + refused.err, "list s badge")) << refused.out << refused.err;
}

TEST_F(Messages, AConfigFileThatTheReleaseChangedLosesNothing) {
  const std::string before = "attributetypes=( 1.1 NAME 'cn' DESC 'before' )\n";
  const std::string after = "attributetypes=( 1.1 NAME 'cn' DESC 'after' )\n";
  folder.install("base", {{"V3.config.at", before}});
  folder.install("old", {{"V3.config.at", before},
                         {"V3.user.at", "attributetypes=( 1.2 NAME 'site' DESC 'd' )\n"}});
  folder.install("new", {{"V3.config.at", after}});
  const ToolResult result = migrate({"--base", "@/base"});
  EXPECT_EQ(0, result.exitCode) << result.err;
  EXPECT_TRUE(holds(result.out,
                    "attribute type cn (1.1): changed by release -> new [cosmetic]\n"
                    "  only the release changed it\n"))
      << result.out;
  EXPECT_FALSE(holds(result.out + result.err, "lost")) << result.out << result.err;
  EXPECT_EQ(after, folder.contents("out")["V3.config.at"]);
}

TEST_F(Messages, BadDefinitionsAndAFullOutputHaveCodesOfTheirOwn) {
  folder.install("old", {{"V3.user.at", "attributetypes=( 1.2 NAME 'x' DESC \"d\" )\n"}});
  folder.install("new", {{"V3.user.at", kType}});
  const ToolResult bad = migrate();
  EXPECT_EQ(4, bad.exitCode);
  EXPECT_TRUE(holds(bad.err, "@/old/V3.user.at:1:36: error: ")) << bad.err;
  folder.install("old", {{"V3.user.at", "attributetypes=( 1.2 NAME 'x' DESC 'd' )\n"}});
  folder.install("out", {{"file", "text"}});
  const ToolResult full = migrate();
  EXPECT_EQ(5, full.exitCode);
  EXPECT_EQ("@/out: error: the output directory is not empty; name a new or an empty one\n",
            full.err);
}

// The text of a mending page speaks of a copy wherever a server's own files would have to change.
TEST_F(Messages, PagesMendInACopy) {
  for (const char* const rule : {"L101", "D208", "T301", "R401", "V601", "I702"}) {
    EXPECT_TRUE(holds(folder.run({"explain", rule}).out, "\n  How to mend it, in a copy: "))
        << rule;
  }
  for (const char* const rule : {"O502", "T307", "S801"}) {
    EXPECT_TRUE(holds(folder.run({"explain", rule}).out, "\n  How to mend it: ")) << rule;
  }
}

// Two definitions of different OIDs and first names that share an alias may be one, renamed; an OID
// is a rename by itself.
TEST_F(Messages, ARenameIsRecognised) {
  folder.install("old", {{"V3.user.at",
                          "attributetypes=( 1.2 NAME ( 'a' 'shared' ) DESC 'd' )\n"
                          "attributetypes=( 1.4 NAME 'before' DESC 'd' )\n"}});
  folder.install("new", {{"V3.user.at",
                          "attributetypes=( 1.3 NAME ( 'b' 'shared' ) DESC 'd' )\n"
                          "attributetypes=( 1.4 NAME 'after' DESC 'd' )\n"}});
  const ToolResult result = migrate();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_TRUE(holds(result.out, "attribute type before (1.4): unknown, renamed -> undecided"))
      << result.out;
  EXPECT_TRUE(
      holds(result.err,
            "schema-migrate: error: undecided: attribute type a (1.2): its name 'shared' "
            "belongs to NEW's attribute type b (1.3), which may be the same one, renamed\n"))
      << result.err;
}

}  // namespace
