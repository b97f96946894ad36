// Damage done to what is to be published is found, whatever it is.

#include <gtest/gtest.h>
#include <libschema-migration/OutputDirectory.h>

#include <filesystem>
#include <fstream>
#include <memory>

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

const std::vector<migration::OutputText> kTexts = {
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
     "@/V3.user.at:2: does not hold what was written; is the disk in order?\n"},
    {"ChangedFirstByte", "V3.user.at", [](const Written& f) { f.replace("# head", "! head"); },
     "@/V3.user.at:1: does not hold what was written; is the disk in order?\n"},
    {"ChangedLastByte", "V3.user.at", [](const Written& f) { f.replace("end\n", "end\r"); },
     "@/V3.user.at:3: does not hold what was written; is the disk in order?\n"},
    {"ByteTooMany", "V3.user.at", [](const Written& f) { f.write(f.text() + "#"); },
     "@/V3.user.at:4: does not hold what was written; is the disk in order?\n"},
    {"CutShort", "V3.user.at",
     [](const Written& f) {
       const std::string text = f.text();
       f.write(text.substr(0, text.size() - 1));
     },
     "@/V3.user.at: was not written completely: it has 44 of 45 bytes; is there space left on the file system?\n"},
    {"Emptied", "V3.user.at", [](const Written& f) { f.write(""); },
     "@/V3.user.at: was not written completely: it has 0 of 45 bytes; is there space left on the file system?\n"},
    {"FilledThoughEmpty", "V3.user.oc", [](const Written& f) { f.write("#\n"); },
     "@/V3.user.oc:1: does not hold what was written; is the disk in order?\n"},
    {"Missing", "V3.user.oc", [](const Written& f) { f.remove(); },
     "@/V3.user.oc: cannot be read back: No such file or directory\n"},
    {"ChangedFarInside", "V3.config.at",
     [](const Written& f) {
       std::string text = f.text();
       text[70000] = '\n';
       f.write(text);
     },
     "@/V3.config.at:1: does not hold what was written; is the disk in order?\n"},
    {"CutShortBehindTheBuffer", "V3.config.at",
     [](const Written& f) { f.write(f.text().substr(0, 65536)); },
     "@/V3.config.at: was not written completely: it has 65536 of 100001 bytes; is there space left on the file system?\n"},
    {"FileTooMany", "V3.orv.at", [](const Written& f) { f.write(""); },
     "@: holds other files than those that were written\n"},
};

class Verification : public testing::TestWithParam<Row> {};

TEST_P(Verification, FindsDamage) {
  const ToolFolder folder;
  migration::Removals removals;
  migration::OutputDirectory::Problems problems;
  const std::unique_ptr<migration::OutputDirectory> output =
      migration::OutputDirectory::open({folder.file("out"), {}}, &removals, &problems);
  migration::Failures failures;
  ASSERT_TRUE(output != nullptr && output->fill(kTexts, &failures));
  const std::string directory = output->temporaryPath();
  GetParam().damage(Written(directory + "/" + GetParam().file));
  std::string problem;
  EXPECT_EQ(*GetParam().problem == '\0', output->verify(kTexts, &failures));
  for (const migration::Failure& failure : failures) {
    ASSERT_EQ(0U, failure.file.find(directory)) << failure.file;
    problem += "@" + failure.file.substr(directory.size()) +
               (failure.line == 0 ? "" : ":" + std::to_string(failure.line)) + ": " + failure.text +
               "\n";
  }
  EXPECT_EQ(GetParam().problem, problem);
}

INSTANTIATE_TEST_SUITE_P(Rows, Verification, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
