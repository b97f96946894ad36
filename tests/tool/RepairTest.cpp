// check --repair: a mended copy, whole, with each change told.

#include <gtest/gtest.h>

#include <string>

#include "ToolRun.h"

namespace {

const ToolFolder::Files kDamaged = {
    {"V3.user.at",
     "# The site's.\n"
     "attributetypes=( 1.1 name 'a' desc 'd' X-ORIGIN 'here' )\n"
     "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"},
    {"V3.user.oc", "objectclasses=( 2.1 NAME 'c' AUXILIARY MAY a )\n"}};

TEST(Repair, ACopyIsMendedAndEachChangeIsTold) {
  const ToolFolder folder;
  folder.install("site", kDamaged);
  const std::string before = folder.snapshot();
  const ToolResult result = folder.run({"check", "--repair", "@/mended", "@/site"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_NE(result.out.find("@/site/V3.user.at:2:"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("mended: "), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("[L110]"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("[D208]"), std::string::npos) << result.out;
  const ToolFolder::Files mended = folder.contents("mended");
  EXPECT_EQ(mended.size(), 2U);
  EXPECT_EQ(mended.at("V3.user.oc"), "objectclasses=( 2.1 NAME 'c' AUXILIARY MAY ( a ) )\n");
  EXPECT_NE(mended.at("V3.user.at").find("NAME 'a' DESC 'd'"), std::string::npos)
      << mended.at("V3.user.at");
  EXPECT_EQ(folder.contents("site"), kDamaged);
  EXPECT_EQ(folder.run({"check", "@/mended"}).exitCode, 0);
}

TEST(Repair, WhatIsWellStaysByteForByte) {
  const ToolFolder folder;
  const ToolFolder::Files files = {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"}};
  folder.install("site", files);
  const ToolResult result = folder.run({"check", "--repair", "@/mended", "@/site"});
  EXPECT_EQ(result.out, "no findings\nWritten and verified: @/mended\n") << result.err;
  EXPECT_EQ(folder.contents("mended"), files);
}

TEST(Repair, NothingIsWrittenWhereTheLibraryWouldNeverEnd) {
  const ToolFolder folder;
  folder.install("site", {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' COLLECTIVE )\n"}});
  const ToolResult result = folder.run({"check", "--repair", "@/mended", "@/site"});
  EXPECT_EQ(result.exitCode, 3);
  EXPECT_EQ(folder.names(), "site");
}

TEST(Repair, OneDirectoryIntoANewOne) {
  const ToolFolder folder;
  folder.install("site", kDamaged);
  folder.install("other", kDamaged);
  const ToolResult two = folder.run({"check", "--repair", "@/mended", "@/site", "@/other"});
  EXPECT_EQ(two.exitCode, 2);
  EXPECT_EQ(
      two.err,
      "schema-migrate: error: --repair takes one DIR; schema-migrate check --help tells how it "
      "is used\n");
  EXPECT_EQ(folder.run({"check", "--repair", "@/other", "@/site"}).exitCode, 5);
  EXPECT_EQ(folder.run({"check", "--repair", "@/site/mended", "@/site"}).exitCode, 2);
  EXPECT_EQ(folder.names(), "other site");
}

}  // namespace
