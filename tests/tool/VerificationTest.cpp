// Damage done to what was written is found, whatever it is: to what the library wrote in the
// private place, and to what is to be published.

#include "Verification.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>

#include "Migration.h"
#include "OutputDirectory.h"
#include "Plan.h"
#include "StagedRun.h"

namespace {

const ToolFolder::Files kOld = {
    {"V3.user.at",
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}};
const ToolFolder::Files kNew = {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                                {"V3.config.at", "# config\n"}};

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

struct Row {
  const char* name;
  const char* file;
  void (*damage)(const Written& file);
  const char* ofLibrary;  // what is told when the library's file is damaged; null: not to be asked
  const char* ofOutput;   // and when the file to be published is
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"None", "V3.user.at", [](const Written&) {}, "", ""},
    {"ChangedByte", "V3.user.at", [](const Written& f) { f.replace("LENGTH 3", "LENGTH 7"); },
     "@/V3.user.at:3: error: does not hold what was written: vendor extension (1.1) of @/old/V3.user.at:2; is the disk in order?\n",
     "@/V3.user.at:3: error: does not hold what was written: vendor extension (1.1) of @/old/V3.user.at:2; is the disk in order?\n"},
    {"ChangedBlank", "V3.user.at", [](const Written& f) { f.replace("  )", " )"); },
     "@/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n",
     "@/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n"},
    {"ChangedHeader", "V3.user.at", [](const Written& f) { f.replace("# File", "# Fine"); },
     "@/V3.user.at:1: error: does not hold what was written: the header; is the disk in order?\n",
     "@/V3.user.at:1: error: does not hold what was written: the header; is the disk in order?\n"},
    {"ChangedTimeInTheHeader", "V3.user.at",
     [](const Written& f) {
       std::string text = f.text();
       text[text.find('\n') - 1] ^= 1;
       f.write(text);
     },
     nullptr,
     "@/V3.user.at:1: error: does not hold what was written: the header; is the disk in order?\n"},
    {"LineTooMany", "V3.user.at", [](const Written& f) { f.replace("\n", "\n\n"); },
     "@/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n",
     "@/V3.user.at:2: error: does not hold what was written: attribute type a (1.1) of @/old/V3.user.at:1; is the disk in order?\n"},
    {"LineAtTheEnd", "V3.user.at", [](const Written& f) { f.write(f.text() + "#\n"); },
     "@/V3.user.at:5: error: does not hold what was written: the end of the file; is the disk in order?\n",
     "@/V3.user.at:5: error: does not hold what was written: the end of the file; is the disk in order?\n"},
    {"CutShort", "V3.user.at",
     [](const Written& f) {
       const std::string text = f.text();
       f.write(text.substr(0, text.size() - 1));
     },
     "@/V3.user.at: error: was not written completely: it ends in line 4, before attribute type b (1.2) of @/new/V3.user.at:1; is there space left on the file system?\n",
     "@/V3.user.at: error: was not written completely: it ends in line 4, before attribute type b (1.2) of @/new/V3.user.at:1; is there space left on the file system?\n"},
    {"Emptied", "V3.user.at", [](const Written& f) { f.write(""); },
     "@/V3.user.at: error: was not written completely: it ends in line 1, before the header; is there space left on the file system?\n",
     "@/V3.user.at: error: was not written completely: it ends in line 1, before the header; is there space left on the file system?\n"},
    {"FilledThoughEmpty", "V3.orv.oc", [](const Written& f) { f.write("#\n"); },
     "@/V3.orv.oc:1: error: does not hold what was written: the header; is the disk in order?\n",
     "@/V3.orv.oc:1: error: does not hold what was written: the end of the file; is the disk in order?\n"},
    {"Missing", "V3.user.oc", [](const Written& f) { f.remove(); },
     "@/V3.user.oc: error: cannot be read back: No such file or directory\n",
     "@/V3.user.oc: error: cannot be read back: No such file or directory\n"},
    {"ChangedCopy", "V3.config.at", [](const Written& f) { f.write("# Config\n"); }, nullptr,
     "@/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"ShortCopy", "V3.config.at", [](const Written& f) { f.write("# config"); }, nullptr,
     "@/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"LongCopy", "V3.config.at", [](const Written& f) { f.write("# config\n\n"); }, nullptr,
     "@/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
    {"MissingCopy", "V3.config.at", [](const Written& f) { f.remove(); }, nullptr,
     "@/V3.config.at: error: is not the copy of @/new/V3.config.at that it has to be\n"},
};

class Verification : public testing::TestWithParam<Row> {
 protected:
  Verification() {
    folder.install("old", kOld);
    folder.install("new", kNew);
    run = std::make_unique<StagedRun>(folder);
    plan = std::make_unique<Plan>(run->oldOne, run->newOne, run->lists);
    written = &run->place.makeDirectory("written");
    Migration({run->oldOne, run->newOne, {}, nullptr}).write(run->place.pathOf("written"));
  }

  // What is told of a directory, which reads "@".
  template <typename Check>
  std::string problemOf(const Directory& directory, Check check) const {
    try {
      check();
      return "";
    } catch (const Failure& failure) {
      EXPECT_EQ(kNotWritten, failure.exitCode());
      std::string text = failure.what();
      if (text.compare(0, directory.path().size(), directory.path()) == 0) {
        text.replace(0, directory.path().size(), "@");
      }
      return folder.withoutPath(text);
    }
  }

  ToolFolder folder;
  std::unique_ptr<StagedRun> run;
  std::unique_ptr<Plan> plan;
  const OwnDirectory* written = nullptr;
};

TEST_P(Verification, FindsDamageToWhatTheLibraryWrote) {
  if (GetParam().ofLibrary == nullptr) {
    return;
  }
  const Directory& directory = written->directory();
  GetParam().damage(Written(directory.pathOf(GetParam().file)));
  EXPECT_EQ(GetParam().ofLibrary, problemOf(directory, [&] {
              verifyWritten(directory, run->place.pathOf("written"), *plan);
            }));
}

TEST_P(Verification, FindsDamageToWhatIsToBePublished) {
  OutputDirectory output({folder.file("out"), {}, false, 022}, &run->removals, &run->warnings);
  output.create();
  for (std::size_t file = 0; file < kWrittenFiles; ++file) {
    output.copyIn(written->directory(), kSchemaFiles[file]);
  }
  output.copyIn(*run->newInstallation.copies, "V3.config.at", 0644);
  output.sync();
  GetParam().damage(Written(output.directory().pathOf(GetParam().file)));
  EXPECT_EQ(GetParam().ofOutput, problemOf(output.directory(), [&] {
              verifyOutput(output.directory(), written->directory(), *plan, run->newOne);
            }));
}

INSTANTIATE_TEST_SUITE_P(Rows, Verification, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
