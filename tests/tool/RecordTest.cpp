// migrate --record: what a change ticket needs, as one directory, whole or not at all.

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <nlohmann/json.hpp>

#include "Files.h"
#include "Machine.h"
#include "PlannedFolder.h"
#include "TracedRun.h"

namespace {

constexpr char kEpoch[] = "1795334400";  // 2026-11-22 08:00:00 UTC
void useEpoch() { ::setenv("SOURCE_DATE_EPOCH", kEpoch, 1); }

class Record : public testing::Test {
 protected:
  Record() {
    m_folder.write("excluded.oids", "# none\n");
    m_folder.write("withdrawn", "# none\n");
    m_folder.write("decisions.toml",
                   "# of the board\n[[definition]]\nkind = \"attribute-type\"\nname = \"b\"\n"
                   "take = \"old\"\n");
  }

  static std::vector<std::string> arguments(const std::vector<std::string>& more = {}) {
    std::vector<std::string> all = {"migrate",        "--base",          "@/base",
                                    "--from",         "@/old",           "--to",
                                    "@/new",          "--decisions",     "@/decisions.toml",
                                    "--exclude-oids", "@/excluded.oids", "--withdraw",
                                    "@/withdrawn",    "--out",           "@/out",
                                    "--record",       "@/record"};
    all.insert(all.end(), more.begin(), more.end());
    return all;
  }

  ToolResult migrate(const std::vector<std::string>& more = {}) const {
    return m_folder.run(arguments(more), useEpoch);
  }

  std::string recorded(const std::string& name) const {
    return m_folder.withoutPath(support::readWholeFile(m_folder.file("record/" + name)));
  }

  // Every file in it by its path, with its bytes.
  ToolFolder::Files record() const {
    ToolFolder::Files files;
    if (!std::filesystem::exists(m_folder.file("record"))) {
      return files;
    }
    for (const auto& entry :
         std::filesystem::recursive_directory_iterator(m_folder.file("record"))) {
      if (entry.is_regular_file()) {
        files[std::filesystem::relative(entry.path(), m_folder.file("record")).string()] =
            support::readWholeFile(entry.path().string());
      }
    }
    return files;
  }

  void removeBoth() const {
    std::filesystem::remove_all(m_folder.file("out"));
    std::filesystem::remove_all(m_folder.file("record"));
  }

  // Temporary names beside the two.
  std::vector<std::string> leftovers() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(m_folder.path())) {
      if (entry.path().filename().string().find(".partial-") != std::string::npos) {
        names.push_back(entry.path().string());
      }
    }
    return names;
  }

  PlannedFolder m_folder;
};

int shell(const std::string& command) { return std::system(command.c_str()); }

TEST_F(Record, HoldsWhatAChangeTicketNeeds) {
  const ToolResult result = migrate();
  EXPECT_EQ("", result.err);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_NE(std::string::npos,
            result.out.find("\nWritten and verified: @/out\nRecorded: @/record\n"))
      << result.out;
  std::string names;
  for (const auto& [name, bytes] : record()) {
    names += name + "\n";
  }
  EXPECT_EQ(
      "SHA256SUMS\nbase/V3.system.at\nbase/V3.system.oc\ncommand.txt\nlists/decisions-1.toml\n"
      "lists/exclude-1.txt\nlists/withdraw-1.txt\nnew/V3.config.at\nnew/V3.system.at\n"
      "new/V3.system.oc\nold/V3.system.at\nold/V3.system.oc\nold/V3.user.at\nold/V3.user.oc\n"
      "origins.tsv\noutput/V3.config.at\noutput/V3.system.at\noutput/V3.system.oc\n"
      "output/V3.user.at\noutput/V3.user.oc\nplan.json\nreport.html\nreport.txt\n",
      names);
  for (const char* const side : {"base", "old", "new"}) {
    EXPECT_EQ(m_folder.contents(side), m_folder.contents("record/" + std::string(side)));
  }
  EXPECT_EQ(m_folder.contents("out"), m_folder.contents("record/output"));
  for (const auto& [copy, original] :
       {std::pair{"decisions-1.toml", "decisions.toml"},
        std::pair{"exclude-1.txt", "excluded.oids"}, std::pair{"withdraw-1.txt", "withdrawn"}}) {
    EXPECT_EQ(support::readWholeFile(m_folder.file(original)),
              recorded("lists/" + std::string(copy)));
  }
  EXPECT_EQ("", m_folder.privateCopies());
  EXPECT_TRUE(leftovers().empty());
}

TEST_F(Record, ItsPlanIsTheSavedOne) {
  ASSERT_EQ(0, migrate().exitCode);
  ASSERT_EQ(0, m_folder
                   .runPlanned("plan", {"--decisions", "@/decisions.toml", "--exclude-oids",
                                        "@/excluded.oids", "--withdraw", "@/withdrawn", "--save",
                                        "@/plan.json"})
                   .exitCode);
  EXPECT_EQ(support::readWholeFile(m_folder.file("plan.json")), record().at("plan.json"));
  EXPECT_EQ(0, m_folder.run({"verify", "--plan", "@/record/plan.json", "@/out"}).exitCode);
  EXPECT_EQ(0,
            m_folder.run({"verify", "--plan", "@/record/plan.json", "@/record/output"}).exitCode);
}

TEST_F(Record, ItsReportIsWhatWasPrinted) {
  const ToolResult result = migrate();
  const std::string report = recorded("report.txt");
  EXPECT_NE(std::string::npos, report.find("attribute type b (1.2): changed by release -> old"));
  EXPECT_EQ(0U, result.out.find(report)) << report;
  // As a page, made of the same document.
  EXPECT_EQ(0U, recorded("report.html").find("<!DOCTYPE html>"));
  EXPECT_NE(std::string::npos, recorded("report.html").find("guard"));
  // And whatever the format of the run is.
  removeBoth();
  ASSERT_EQ(0, migrate({"--format", "json"}).exitCode);
  EXPECT_EQ(report, recorded("report.txt"));
}

TEST_F(Record, ItsSumsAreThoseOfEveryFile) {
  ASSERT_EQ(0, migrate().exitCode);
  EXPECT_EQ(0, shell("cd '" + m_folder.file("record") +
                     "' && sha256sum --strict --status -c SHA256SUMS"));
  const std::string sums = recorded("SHA256SUMS");
  EXPECT_EQ(record().size() - 1, support::splitLines(sums).size());
  for (const auto& [name, bytes] : record()) {
    EXPECT_EQ(name == "SHA256SUMS", sums.find("  " + name + "\n") == std::string::npos) << name;
  }
}

// As the inputs were read, whose sums the plan has; what was mended in private copies is told.
TEST_F(Record, OfARepairedRunHasTheInputsAsTheyWereRead) {
  for (const char* const side : {"base", "old", "new"}) {
    m_folder.write(side + std::string("/V3.system.oc"),
                   support::readWholeFile(m_folder.file(side + std::string("/V3.system.oc"))) +
                       "objectclasses=( 2.8 NAME 'm' ABSTRACT X-ORIGIN 'us' )\n");
  }
  const ToolResult result = migrate({"--repair"});
  ASSERT_EQ(0, result.exitCode) << result.err;
  for (const char* const side : {"base", "old", "new"}) {
    EXPECT_EQ(m_folder.contents(side), m_folder.contents("record/" + std::string(side)));
  }
  EXPECT_EQ(0, shell("cd '" + m_folder.file("record") + "' && sha256sum --quiet -c SHA256SUMS"));
  const auto plan = nlohmann::json::parse(record().at("plan.json"));
  const std::string sums = record().at("SHA256SUMS");
  for (const auto& input : plan.at("inputs")) {
    EXPECT_NE(std::string::npos, sums.find(input.at("sha256").get<std::string>()))
        << input.at("path");
  }
  EXPECT_EQ(3U, plan.at("repairs").size());
  EXPECT_NE(std::string::npos,
            recorded("report.txt").find("mended in a private copy: a comment of X-ORIGIN [D201]"));
}

TEST_F(Record, TellsWhereEachDefinitionCameFrom) {
  ASSERT_EQ(0, migrate().exitCode);
  const std::string expected =
      "file\tline\tkind\toid\tname\toutcome\tfrom\tdecision\n"
      "V3.system.at\t2\tattribute-type\t1.1\ta\told\told @/old/V3.system.at:1\t-\n"
      "V3.system.at\t3\tattribute-type\t1.2\tb\told\told @/old/V3.system.at:2\t"
      "@/decisions.toml:2\n"
      "V3.system.at\t4\tvendor-extension\t1.2\t-\tsame\tnew @/new/V3.system.at:4\t-\n"
      "V3.system.oc\t1\tobject-class\t2.1\tc\tmerged\told @/old/V3.system.oc:1, "
      "new @/new/V3.system.oc:1\t-\n"
      "V3.user.at\t2\tattribute-type\t9.1\ts\tadded\told @/old/V3.user.at:1\t-\n"
      "V3.user.oc\t3\tobject-class\t9.2\tguard\tadded\told @/old/V3.user.oc:2\t-\n"
      "V3.config.at\t1\tattribute-type\t3.1\tlimit\tnew\tnew @/new/V3.config.at:1\t-\n";
  EXPECT_EQ(expected, recorded("origins.tsv"));
  // In the library's layout the definitions stand elsewhere, and came from the same places.
  removeBoth();
  ASSERT_EQ(0, migrate({"--layout", "library"}).exitCode);
  EXPECT_NE(
      std::string::npos,
      recorded("origins.tsv")
          .find("V3.user.oc\t2\tobject-class\t9.2\tguard\tadded\told @/old/V3.user.oc:2\t-\n"))
      << recorded("origins.tsv");
}

TEST_F(Record, TellsCommandAndVersion) {
  ASSERT_EQ(0, migrate().exitCode);
  std::string directory = m_folder.withoutPath(std::filesystem::current_path().string());
  EXPECT_EQ(
      "schema-migrate " SCHEMA_MIGRATE_VERSION
      "\n"
      "time: 2026-11-22T08:00:00Z\n"
      "directory: " +
          directory +
          "\n"
          "command: schema-migrate migrate --base @/base --from @/old --to @/new --decisions "
          "@/decisions.toml --exclude-oids @/excluded.oids --withdraw @/withdrawn --out @/out "
          "--record @/record\n"
          "layout: keep\n"
          "\n"
          "base/: copies of the files of @/base\n"
          "old/: copies of the files of @/old\n"
          "new/: copies of the files of @/new\n"
          "lists/exclude-1.txt: a copy of @/excluded.oids\n"
          "lists/withdraw-1.txt: a copy of @/withdrawn\n"
          "lists/decisions-1.toml: a copy of @/decisions.toml\n"
          "output/: copies of the files of @/out\n",
      recorded("command.txt"));
}

TEST_F(Record, TwoRunsAreEqualByteForByte) {
  for (const char* const layout : {"keep", "library"}) {
    ASSERT_EQ(0, migrate({"--layout", layout}).exitCode);
    const ToolFolder::Files first = record();
    removeBoth();
    ASSERT_EQ(0, migrate({"--layout", layout}).exitCode);
    EXPECT_EQ(first, record());
    removeBoth();
  }
}

TEST_F(Record, SourceDateEpochIsATime) {
  for (const char* const wrong : {"now", "-1", "12x", "999999999999999"}) {
    const ToolResult result =
        m_folder.run(arguments(), [&] { ::setenv("SOURCE_DATE_EPOCH", wrong, 1); });
    EXPECT_EQ(2, result.exitCode) << wrong;
    EXPECT_EQ("schema-migrate: error: SOURCE_DATE_EPOCH is \"" + std::string(wrong) +
                  "\", which is no number of seconds from the beginning of 1970\n",
              result.err);
  }
  // In the library's layout the files tell it, too.
  ASSERT_EQ(0, migrate({"--layout", "library"}).exitCode);
  EXPECT_EQ(0U, record()
                    .at("output/V3.user.at")
                    .find("# File generated by 6.1 migration 2026-11-22 08:00:00\n"));
}

TEST_F(Record, OfASavedPlanHoldsIt) {
  ASSERT_EQ(0, m_folder.runPlanned("plan", {"--save", "@/plan.json"}).exitCode);
  const ToolResult result = m_folder.run(
      {"migrate", "--plan", "@/plan.json", "--out", "@/out", "--record", "@/record"}, useEpoch);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(support::readWholeFile(m_folder.file("plan.json")), record().at("plan.json"));
}

TEST_F(Record, NothingIsRecordedOfWhatIsNotDone) {
  EXPECT_EQ(0, migrate({"--dry-run"}).exitCode);
  EXPECT_EQ("base decisions.toml excluded.oids new old withdrawn", m_folder.names());
  const ToolResult refused = m_folder.run(
      {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--record", "@/record"});
  EXPECT_EQ(4, refused.exitCode);
  EXPECT_EQ("base decisions.toml excluded.oids new old withdrawn", m_folder.names());
}

TEST_F(Record, ItsPlaceIsNewOrEmptyAndOutsideTheOthers) {
  m_folder.install("full", {{"mine", "my own\n"}});
  std::filesystem::create_directory(m_folder.file("empty"));
  const std::string before = m_folder.snapshot();
  const struct {
    const char* record;
    const char* out;
    int exitCode;
    const char* told;
  } cases[] = {
      {"@/full", "@/out", 5,
       "@/full: error: the record is not empty; name a new or an empty one\n"},
      {"@/full/mine", "@/out", 5,
       "@/full/mine: error: exists and is not a directory; the record must be new or empty\n"},
      {"@/nowhere/record", "@/out", 5,
       "@/nowhere/record: error: the directory to create it in, @/nowhere, cannot be used: No such "
       "file or directory\n"},
      {"@/old/record", "@/out", 2,
       "schema-migrate: error: the record @/old/record lies inside @/old, which is only read; name "
       "a place outside\n"},
      {"@/out", "@/out", 2,
       "schema-migrate: error: --record @/out and --out @/out must name two directories, neither in "
       "the other\n"},
      {"@/full/../out/", "@/out", 2, "schema-migrate: error: --record @/full/../out/ and --out "},
      {"@/empty/record", "@/empty", 2, "schema-migrate: error: --record @/empty/record and --out "},
      {"@/empty", "@/empty/out", 2, "schema-migrate: error: --record @/empty and --out "},
  };
  for (const auto& row : cases) {
    const ToolResult result =
        m_folder.run({"migrate", "--base", "@/base", "--from", "@/old", "--to", "@/new", "--out",
                      row.out, "--record", row.record});
    EXPECT_EQ(row.exitCode, result.exitCode) << row.record;
    EXPECT_EQ(row.told, result.err.substr(0, std::string(row.told).size()));
    EXPECT_EQ(before, m_folder.snapshot());
  }
  // An empty one is replaced.
  EXPECT_EQ(0, m_folder.runPlanned("migrate", {"--out", "@/out", "--record", "@/empty"}).exitCode);
  EXPECT_TRUE(std::filesystem::exists(m_folder.file("empty/SHA256SUMS")));
}

TEST_F(Record, HasTheModesOfNewFiles) {
  ASSERT_EQ(0, m_folder.run(arguments(), [] { ::umask(027); }).exitCode);
  const auto modeOf = [&](const std::string& name) {
    struct stat status {};
    EXPECT_EQ(0, ::stat(m_folder.file(name).c_str(), &status)) << name;
    return status.st_mode & 07777;
  };
  EXPECT_EQ(0750U, modeOf("record"));
  EXPECT_EQ(0750U, modeOf("record/old"));
  EXPECT_EQ(0640U, modeOf("record/plan.json"));
  EXPECT_EQ(0640U, modeOf("record/old/V3.user.at"));
}

// ---- Faults ----

// The record has larger files than the output: neither is there when one of them cannot be written.
TEST_F(Record, NeitherIsThereWhenTheDiskIsFull) {
  const std::string before = m_folder.snapshot();
  for (const rlim_t size : {1000U, 2000U, 4000U, 8000U, 16000U}) {
    const ToolResult result = m_folder.run(arguments({"--format", "json"}), [&] {
      const rlimit most{size, size};
      ::setrlimit(RLIMIT_FSIZE, &most);
    });
    EXPECT_EQ(5, result.exitCode) << size << result.err;
    EXPECT_NE("", result.err);
    EXPECT_EQ(before, m_folder.snapshot());
  }
  const ToolResult result = m_folder.run(arguments(), [] {
    const rlimit most{4000, 4000};
    ::setrlimit(RLIMIT_FSIZE, &most);
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_NE(std::string::npos,
            result.err.find("/plan.json: error: cannot be written: File too large\n"))
      << result.err;
  EXPECT_EQ(before, m_folder.snapshot());
}

// Replacing an empty directory takes another system call than making a new one.
TEST_F(Record, IsToldWhenTheOutputIsThereAndTheRecordCannotBe) {
  std::filesystem::create_directory(m_folder.file("record"));
  const ToolResult result = m_folder.run(arguments(), [] { failSystemCalls({SYS_renameat}, EIO); });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ(
      "@/record: error: the finished directory cannot be renamed to this: Input/output error\n"
      "@/out: error: is complete and in place, but the record of this run is not\n",
      result.err);
  EXPECT_EQ(5U, m_folder.contents("out").size());
  EXPECT_TRUE(record().empty());
  EXPECT_TRUE(leftovers().empty());
}

TEST_F(Record, IsNotThereWhenTheOutputCannotBe) {
  std::filesystem::create_directory(m_folder.file("out"));
  const ToolResult result = m_folder.run(arguments(), [] { failSystemCalls({SYS_renameat}, EIO); });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ(
      "@/out: error: the finished directory cannot be renamed to this: Input/output error\n"
      "@/record: error: the record was not written either\n",
      result.err);
  EXPECT_TRUE(m_folder.contents("out").empty());
  EXPECT_FALSE(std::filesystem::exists(m_folder.file("record")));
  EXPECT_TRUE(leftovers().empty());
}

class RecordUnderSignals : public Record {
 protected:
  RecordUnderSignals() {
    EXPECT_EQ(0, migrate().exitCode);
    m_whole = record();
    m_output = m_folder.contents("out");
    removeBoth();
    m_before = m_folder.snapshot();
  }

  struct State {
    bool isOutputThere;
    bool isRecordThere;
  };

  // Each of the two is whole or not there, and no record is there of what was not written.
  State takeState() {
    const State state{std::filesystem::exists(m_folder.file("out")),
                      std::filesystem::exists(m_folder.file("record"))};
    EXPECT_EQ(state.isOutputThere ? m_output : ToolFolder::Files(), m_folder.contents("out"));
    EXPECT_EQ(state.isRecordThere ? m_whole : ToolFolder::Files(), record());
    EXPECT_TRUE(state.isOutputThere || !state.isRecordThere);
    removeBoth();
    return state;
  }

  ToolFolder::Files m_whole;
  ToolFolder::Files m_output;
  std::string m_before;
};

const auto kPrepare = [] {
  useEpoch();
  waitForTracer();
};

// Behind each change that the run makes to a file system, as before the next one.
TEST_F(RecordUnderSignals, KilledAtEveryChange) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  int changes = 0;
  int withOutputOnly = 0;
  for (bool isKilled = true; isKilled; ++changes) {
    SCOPED_TRACE("change " + std::to_string(changes + 1));
    int exitCode = 0;
    const pid_t process = m_folder.startRun(arguments(), "run", kPrepare);
    isKilled = endAt(process, {changes + 1, true}, SIGKILL, &exitCode);
    const State state = takeState();
    EXPECT_TRUE(isKilled || state.isRecordThere);
    withOutputOnly += state.isOutputThere && !state.isRecordThere ? 1 : 0;
    for (const std::string& name : leftovers()) {
      std::filesystem::remove_all(name);
    }
    m_folder.removePrivateCopies();
    EXPECT_EQ(m_before, m_folder.snapshot());
    ASSERT_FALSE(HasFailure());
  }
  EXPECT_GT(changes, 100);
  EXPECT_GT(withOutputOnly, 0);
}

TEST_F(RecordUnderSignals, InterruptedAtEveryChange) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  int changes = 0;
  std::array<int, 3> count{};
  for (bool isInterrupted = true; isInterrupted; ++changes) {
    SCOPED_TRACE("change " + std::to_string(changes + 1));
    int exitCode = 0;
    const pid_t process = m_folder.startRun(arguments(), "run", kPrepare);
    isInterrupted = endAt(process, {changes + 1, true}, SIGTERM, &exitCode);
    const State state = takeState();
    const std::string told = m_folder.complaintsOf("run");
    EXPECT_EQ(isInterrupted ? 5 : 0, exitCode);
    EXPECT_EQ(
        !isInterrupted        ? ""
        : state.isRecordThere ? "schema-migrate: error: interrupted; the output directory and "
                                "the record are complete and in place\n"
        : state.isOutputThere ? "schema-migrate: error: interrupted; the output directory is "
                                "complete and in place, but the record was not written\n"
                              : "schema-migrate: error: interrupted; the output directory was "
                                "not written\n",
        told);
    ++count[state.isRecordThere ? 2 : state.isOutputThere ? 1 : 0];
    EXPECT_TRUE(leftovers().empty());
    EXPECT_EQ("", m_folder.privateCopies());
    EXPECT_EQ(m_before, m_folder.snapshot());
    ASSERT_FALSE(HasFailure());
  }
  EXPECT_GT(count[0], 100);
  EXPECT_GT(count[1], 0);
  EXPECT_GT(count[2], 2);
}

}  // namespace
