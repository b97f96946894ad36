// Damage done to what is to be published is found, whatever it is.

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "Messages.h"
#include "OutputDirectory.h"
#include "Removals.h"
#include "TextOutput.h"
#include "ToolRun.h"

namespace {

// A written file, which reads as a text and can be put in the place of.
class Written {
 public:
  explicit Written(std::string path) : m_path(std::move(path)) {}

  std::string text() const { return support::readWholeFile(m_path); }
  void write(const std::string& text) const { std::ofstream(m_path, std::ios::binary) << text; }
  void replace(const std::string& from, const std::string& to) const {
    std::string changed = text();
    const std::size_t place = changed.find(from);
    ASSERT_NE(std::string::npos, place) << changed;
    write(changed.replace(place, from.size(), to));
  }
  void remove() const { std::filesystem::remove(m_path); }

 private:
  std::string m_path;
};

const std::vector<OutputText> kTexts = {
    {"V3.user.at", "# head\nattributetypes=( 1.1 NAME 'a' )\n# end\n", std::nullopt},
    {"V3.user.oc", "", std::nullopt},
    {"V3.config.at", std::string(100000, '#') + "\n", 0640}};

struct Row {
  const char* name;
  const char* file;
  void (*damage)(const Written& file);
  const char* problem;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"None", "V3.user.at", [](const Written&) {}, ""},
    {"ChangedByte", "V3.user.at", [](const Written& f) { f.replace("'a'", "'b'"); },
     "@/V3.user.at:2: error: does not hold what was written; is the disk in order?\n"},
    {"ChangedFirstByte", "V3.user.at", [](const Written& f) { f.replace("# head", "! head"); },
     "@/V3.user.at:1: error: does not hold what was written; is the disk in order?\n"},
    {"ChangedLastByte", "V3.user.at", [](const Written& f) { f.replace("end\n", "end\r"); },
     "@/V3.user.at:3: error: does not hold what was written; is the disk in order?\n"},
    {"ByteTooMany", "V3.user.at", [](const Written& f) { f.write(f.text() + "#"); },
     "@/V3.user.at:4: error: does not hold what was written; is the disk in order?\n"},
    {"CutShort", "V3.user.at",
     [](const Written& f) {
       const std::string text = f.text();
       f.write(text.substr(0, text.size() - 1));
     },
     "@/V3.user.at: error: was not written completely: it has 44 of 45 bytes; is there space left on the file system?\n"},
    {"Emptied", "V3.user.at", [](const Written& f) { f.write(""); },
     "@/V3.user.at: error: was not written completely: it has 0 of 45 bytes; is there space left on the file system?\n"},
    {"FilledThoughEmpty", "V3.user.oc", [](const Written& f) { f.write("#\n"); },
     "@/V3.user.oc:1: error: does not hold what was written; is the disk in order?\n"},
    {"Missing", "V3.user.oc", [](const Written& f) { f.remove(); },
     "@/V3.user.oc: error: cannot be read back: No such file or directory\n"},
    {"ChangedFarInside", "V3.config.at",
     [](const Written& f) {
       std::string text = f.text();
       text[70000] = '\n';
       f.write(text);
     },
     "@/V3.config.at:1: error: does not hold what was written; is the disk in order?\n"},
    {"CutShortBehindTheBuffer", "V3.config.at",
     [](const Written& f) { f.write(f.text().substr(0, 65536)); },
     "@/V3.config.at: error: was not written completely: it has 65536 of 100001 bytes; is there space left on the file system?\n"},
    {"FileTooMany", "V3.orv.at", [](const Written& f) { f.write(""); },
     "@: error: holds other files than those that were written\n"},
};

class Verification : public testing::TestWithParam<Row> {};

TEST_P(Verification, FindsDamage) {
  const ToolFolder folder;
  Removals removals;
  std::string warnings;
  OutputDirectory output({folder.file("out"), {}, false, 022}, &removals, &warnings);
  writeTexts(kTexts, &output);
  const Directory& directory = output.directory();
  GetParam().damage(Written(directory.pathOf(GetParam().file)));
  std::string problem;
  try {
    verifyTexts(directory, kTexts);
  } catch (const Failure& failure) {
    EXPECT_EQ(kNotWritten, failure.exitCode());
    problem = failure.what();
    ASSERT_EQ(0U, problem.find(directory.path())) << problem;
    problem.replace(0, directory.path().size(), "@");
  }
  EXPECT_EQ(GetParam().problem, problem);
}

INSTANTIATE_TEST_SUITE_P(Rows, Verification, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
