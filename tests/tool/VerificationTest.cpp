// Damage done to a written directory is found, whatever it is.

#include "Verification.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "Inventory.h"
#include "Migration.h"
#include "Plan.h"
#include "ToolRun.h"

namespace {

const ToolFolder::Files kOld = {
    {"V3.user.at",
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}};
const ToolFolder::Files kNew = {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                                {"V3.config.at", "# config\n"}};

struct Row {
  const char* name;
  void (*damage)(const ToolFolder& folder);
  const char* problem;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

// Replaces `from` in a written file.
void replace(const ToolFolder& folder, const std::string& file, const std::string& from,
             const std::string& to) {
  std::string text = support::readWholeFile(folder.file("out/" + file));
  const std::size_t place = text.find(from);
  ASSERT_NE(std::string::npos, place) << text;
  text.replace(place, from.size(), to);
  folder.write("out/" + file, text);
}

const Row kRows[] = {
    {"None", [](const ToolFolder&) {}, ""},
    {"ChangedByte", [](const ToolFolder& f) { replace(f, "V3.user.at", "LENGTH 3", "LENGTH 7"); },
     "@/out/V3.user.at:3: error: does not hold what was written: vendor extension (1.1) of @/old/V3.user.at:2; is the disk in order?\n"},
    {"ChangedBlank", [](const ToolFolder& f) { replace(f, "V3.user.at", "  )", " )"); },
     "@/out/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n"},
    {"ChangedHeader", [](const ToolFolder& f) { replace(f, "V3.user.at", "# File", "# Fine"); },
     "@/out/V3.user.at:1: error: does not hold what was written: the header; is the disk in order?\n"},
    {"LineTooMany", [](const ToolFolder& f) { replace(f, "V3.user.at", "\n", "\n\n"); },
     "@/out/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n"},
    {"LineAtTheEnd",
     [](const ToolFolder& f) {
       f.write("out/V3.user.at", support::readWholeFile(f.file("out/V3.user.at")) + "#\n");
     },
     "@/out/V3.user.at:5: error: does not hold what was written: the end of the file; is the disk in order?\n"},
    {"CutShort",
     [](const ToolFolder& f) {
       std::filesystem::resize_file(f.file("out/V3.user.at"),
                                    std::filesystem::file_size(f.file("out/V3.user.at")) - 1);
     },
     "@/out/V3.user.at: error: was not written completely: it ends in line 4, before attribute type b (1.2) of @/new/V3.user.at:1; is there space left on the file system?\n"},
    {"Emptied", [](const ToolFolder& f) { f.write("out/V3.user.at", ""); },
     "@/out/V3.user.at: error: was not written completely: it ends in line 1, before the header; is there space left on the file system?\n"},
    {"FilledThoughEmpty", [](const ToolFolder& f) { f.write("out/V3.orv.oc", "#\n"); },
     "@/out/V3.orv.oc:1: error: does not hold what was written: the header; is the disk in order?\n"},
    {"Missing", [](const ToolFolder& f) { std::filesystem::remove(f.file("out/V3.user.oc")); },
     "@/out/V3.user.oc: error: cannot be read back: No such file or directory\n"},
    {"ChangedCopy", [](const ToolFolder& f) { f.write("out/V3.config.at", "# Config\n"); },
     "@/out/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"ShortCopy", [](const ToolFolder& f) { f.write("out/V3.config.at", "# config"); },
     "@/out/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"LongCopy", [](const ToolFolder& f) { f.write("out/V3.config.at", "# config\n\n"); },
     "@/out/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"MissingCopy",
     [](const ToolFolder& f) { std::filesystem::remove(f.file("out/V3.config.at")); },
     "@/out/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
};

class Verification : public testing::TestWithParam<Row> {};

TEST_P(Verification, FindsDamage) {
  const ToolFolder folder;
  folder.install("old", kOld);
  folder.install("new", kNew);
  folder.install("out", {{"V3.config.at", kNew.at("V3.config.at")}});
  std::string warnings;
  Inventory oldOne("OLD", folder.file("old"), &warnings);
  Inventory newOne("NEW", folder.file("new"), &warnings);
  const Plan plan(oldOne, newOne, {});
  Migration({oldOne, newOne, {}, ""}).write(folder.file("out"));
  GetParam().damage(folder);
  std::string problem;
  try {
    verifyOutput(folder.file("out"), plan, newOne);
  } catch (const Failure& failure) {
    EXPECT_EQ(kNotWritten, failure.exitCode());
    problem = failure.what();
  }
  EXPECT_EQ(GetParam().problem, folder.withoutPath(problem));
}

INSTANTIATE_TEST_SUITE_P(Rows, Verification, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
