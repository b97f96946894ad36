// The decisions file of decide: what stood in it stays, whoever wrote it and whenever; and what a
// terminal gets to see of hostile and of foreign text.

#include <sys/resource.h>
#include <unistd.h>

#include <array>
#include <filesystem>
#include <string>
#include <vector>

#include "DecideRun.h"

namespace {

constexpr char kMine[] =
    "# Decided in the meeting of Monday.\n"
    "\n"
    "[[definition]]   # the old mail gateway\n"
    "kind='attribute-type'\n"
    "name = \"gone\"\n"
    "take   = \"old\"";  // and no line end

constexpr char kBadgeGoes[] =
    "\n\n[[definition]]\n"
    "# attribute type badge (9.1)\n"
    "kind = \"attribute-type\"\n"
    "oid = \"9.1\"\n"
    "fingerprint = \"...\"\n"
    "take = \"new\"\n";

TEST_F(Deciding, WhatAPersonWroteStaysByteForByte) {
  m_folder.write("d.toml", kMine);
  const auto run = started();
  answer(run.get(), "n");
  run->until("Your choice: ");
  EXPECT_EQ(file(), std::string(kMine) + kBadgeGoes);
  run->type("b");
  run->until("Your choice: ");
  EXPECT_EQ(file(), kMine);
  run->type("b");
  EXPECT_NE(run->until("Your choice: ").find("This is the first question"), std::string::npos);
  EXPECT_EQ(file(), kMine);
  run->type("q");
  run->rest();
  EXPECT_EQ(file(), kMine);
}

TEST_F(Deciding, AFileThatSomebodyChangesMeanwhileIsReadAgain) {
  const auto run = started();
  answer(run.get(), "o");
  run->until("Your choice: ");
  const std::string mine =
      support::readWholeFile(m_folder.file("d.toml")) +
      "# mine\n[[definition]]\nkind = \"object-class\"\nname = \"c\"\ntake = \"old\"\n";
  m_folder.write("d.toml", mine);
  run->type("n");
  run->until("Reason (Enter for none): ");
  run->type("");
  const std::string text = wordsOnScreen(run->until("Your choice: "));
  EXPECT_NE(
      text.find("d.toml was changed by somebody else meanwhile. It is read again; nothing was "
                "added"),
      std::string::npos)
      << text;
  EXPECT_NE(text.find("Question 1 of 1: attribute type badge (9.1) taken"), std::string::npos)
      << text;
  EXPECT_EQ(support::readWholeFile(m_folder.file("d.toml")), mine);
  run->type("b");
  EXPECT_NE(run->until("Your choice: ").find("This is the first question"), std::string::npos);
  run->type("n");
  run->until("Reason (Enter for none): ");
  run->type("");
  EXPECT_NE(onScreen(run->rest()).find("2 answers written to d.toml.\n"), std::string::npos);
  EXPECT_EQ(run->exitCode(), 4);  // the site's guard means another badge then
  EXPECT_EQ(support::readWholeFile(m_folder.file("d.toml")).substr(0, mine.size()), mine);
  EXPECT_NE(file().find("oid = \"9.1\""), std::string::npos);
}

TEST_F(Deciding, AnAnswerIsNotTakenBackFromAFileThatSomebodyChanged) {
  const auto run = started();
  answer(run.get(), "o");
  run->until("Your choice: ");
  const std::string mine = support::readWholeFile(m_folder.file("d.toml")) + "# mine\n";
  m_folder.write("d.toml", mine);
  run->type("b");
  EXPECT_NE(run->until("Your choice: ").find("changed by somebody else"), std::string::npos);
  EXPECT_EQ(support::readWholeFile(m_folder.file("d.toml")), mine);
}

TEST_F(Deciding, AFileThatIsReplacedMeanwhileIsTheOneThatCounts) {
  const auto run = started();
  answer(run.get(), "o");
  run->until("Your choice: ");
  std::filesystem::remove(m_folder.file("d.toml"));
  run->type("n");
  run->until("Reason (Enter for none): ");
  run->type("");
  EXPECT_NE(run->until("Your choice: ").find("Question 1 of 3: attribute type badge (9.1)"),
            std::string::npos);
  EXPECT_EQ(file(), "");
  run->type("q");
  run->rest();
  EXPECT_EQ(file(), "(no file)");
}

TEST_F(Deciding, TheLastOfSeveralFilesGetsTheAnswers) {
  m_folder.write("first.toml", kMine);
  TerminalRun run(m_folder, {"decide", "--decisions", "first.toml", "--from", "old", "--to", "new",
                             "--base", "base", "--decisions", "d.toml"});
  run.until("Question 1 of 2: attribute type badge (9.1)");
  run.until("Your choice: ");
  answer(&run, "n");
  run.until("Your choice: ");
  run.type("q");
  EXPECT_NE(onScreen(run.rest()).find("--decisions first.toml \\\n      --decisions d.toml\n"),
            std::string::npos);
  EXPECT_EQ(file("first.toml"), kMine);
  EXPECT_EQ(file(), std::string(kBadgeGoes).substr(2));
}

TEST_F(Deciding, WhatIsStaleWrongOrUnusedIsToldBeforeAnythingIsAsked) {
  struct Row {
    const char* entry;
    int exitCode;
    const char* told;
  };
  const Row kRows[] = {
      {"name = 'gone'\nfingerprint = 'sha256:00'\ntake = 'old'", 4, "is stale"},
      {"name = 'nobody'\ntake = 'old'", 4, "it matches no definition"},
      {"name = 'badge'\ntake = 'old'", 4, "cannot be carried out"},
      {"name = 'gone'\ntake = 'odd'", 3, "cannot be taken"},
      {"name = 'gone'", 3, "nothing is decided"},
      {"name = 'gone", 3, "is not TOML"},
  };
  for (const Row& row : kRows) {
    SCOPED_TRACE(row.entry);
    const std::string text = std::string("[[definition]]\nkind = 'attribute-type'\n") + row.entry;
    m_folder.write("d.toml", text);
    TerminalRun run(m_folder, command());
    const std::string screen = wordsOnScreen(run.rest());
    EXPECT_NE(screen.find("d.toml:"), std::string::npos) << screen;
    EXPECT_NE(screen.find(row.told), std::string::npos) << screen;
    EXPECT_EQ(screen.find("Question"), std::string::npos) << screen;
    EXPECT_EQ(run.exitCode(), row.exitCode);
    EXPECT_EQ(support::readWholeFile(m_folder.file("d.toml")), text);
  }
}

TEST_F(Deciding, AnArrayThatNothingCanFollowIsRefused) {
  const std::string text =
      "definition = [ { kind = 'attribute-type', name = 'gone', take = 'old' } ]\n";
  m_folder.write("d.toml", text);
  TerminalRun run(m_folder, command());
  const std::string screen = onScreen(run.rest());
  EXPECT_NE(screen.find("can be added at its end"), std::string::npos) << screen;
  EXPECT_EQ(run.exitCode(), 3);
  EXPECT_EQ(support::readWholeFile(m_folder.file("d.toml")), text);
}

TEST_F(Deciding, AFileThatCannotBeWrittenIsToldBeforeAnythingIsAsked) {
  std::filesystem::create_directory(m_folder.file("directory"));
  for (const char* const name : {"missing/d.toml", "directory", "/dev/null"}) {
    SCOPED_TRACE(name);
    const ToolResult result =
        m_folder.run({"decide", "--from", "@/old", "--to", "@/new", "--decisions",
                      name[0] == '/' ? name : "@/" + std::string(name)});
    EXPECT_TRUE(result.exitCode == 5 || result.exitCode == 3) << result.exitCode;
    EXPECT_NE(result.err.find(name), std::string::npos) << result.err;
    EXPECT_EQ(result.out, "");
  }
}

// As on a disk that gets full in the middle of an entry.
TEST_F(Deciding, AnEntryThatCannotBeWrittenWholeIsNotThereAtAll) {
  m_folder.write("d.toml", kMine);
  std::vector<std::string> words = command();
  words.insert(words.begin(), SCHEMA_MIGRATE);
  TerminalRun run(m_folder, [&] {
    const rlimit limit{sizeof kMine + 20, sizeof kMine + 20};
    std::vector<char*> pointers;
    for (std::string& word : words) {
      pointers.push_back(word.data());
    }
    pointers.push_back(nullptr);
    ::setrlimit(RLIMIT_FSIZE, &limit);
    ::execv(SCHEMA_MIGRATE, pointers.data());
    return 127;
  });
  run.until("Your choice: ");
  run.type("n");
  run.until("Reason (Enter for none): ");
  run.type("");
  const std::string text = wordsOnScreen(run.rest());
  EXPECT_NE(text.find("d.toml: error: cannot be written: File too large; the last answer is not in "
                      "it, those before it are"),
            std::string::npos)
      << text;
  EXPECT_EQ(run.exitCode(), 5);
  EXPECT_EQ(file(), kMine);
}

TEST_F(Deciding, TwoRunsDoNotAddToOneFileAtATime) {
  const auto run = started();
  TerminalRun other(m_folder, command());
  EXPECT_NE(onScreen(other.rest()).find("d.toml: error: another schema-migrate decide"),
            std::string::npos);
  EXPECT_EQ(other.exitCode(), 4);
  answer(run.get(), "o");
  EXPECT_NE(file().find("take = \"old\""), std::string::npos);
}

TEST_F(Deciding, AReasonIsUtf8AndStaysSo) {
  const auto run = started({80, {{"LANG", "de_DE.UTF-8"}}});
  run->type("o");
  run->until("Reason (Enter for none): ");
  run->type("nicht \xff UTF-8");
  EXPECT_NE(run->until("Reason (Enter for none): ").find("That is not UTF-8"), std::string::npos);
  run->type("f\xc3\xbcr M\xc3\xbcller \"\\\"");
  run->until("Your choice: ");
  EXPECT_NE(file().find("reason = \"f\xc3\xbcr M\xc3\xbcller \\\"\\\\\\\"\"\n"), std::string::npos)
      << file();
  EXPECT_EQ(planned().substr(0, 2), "4\n");
}

// A name of a file is as hostile as it likes: no control sequence of it reaches the terminal.
TEST_F(Deciding, HostileTextIsShownPrintable) {
  const std::string name = "d\x1b]0;x\x07\xc2\x9b\xe2\x80\xae\xc3\xbc.toml";
  for (const bool isUtf8 : {false, true}) {
    SCOPED_TRACE(isUtf8);
    TerminalSettings settings;
    settings.environment = {{"LC_ALL", isUtf8 ? "C.UTF-8" : "C"}, {"NO_COLOR", "1"}};
    TerminalRun run(
        m_folder, {"decide", "--from", "old", "--to", "new", "--base", "base", "--decisions", name},
        settings);
    std::string text = run.until("Your choice: ");
    const std::string shown = "d\\x1B]0;x\\x07\\xC2\\x9B\\xE2\\x80\\xAE" +
                              std::string(isUtf8 ? "\xc3\xbc" : "\\xC3\\xBC") + ".toml";
    EXPECT_NE(text.find(shown), std::string::npos) << text;
    run.type("\x16\x1b[2J");  // typed as it is, and echoed as ^[ by the terminal
    text += run.until("Your choice: ");
    EXPECT_NE(text.find("\"\\x1B[2J\" is none of the choices"), std::string::npos) << text;
    run.type("q");
    text += run.rest();
    EXPECT_EQ(text.find('\x1b'), std::string::npos) << text;
    EXPECT_EQ(text.find('\x07'), std::string::npos);
    EXPECT_NE(text.find("--decisions $'d\\x1B]0;x"), std::string::npos) << text;
  }
}

TEST_F(Deciding, EveryLineFitsTheTerminalWhateverItsWidthBecomes) {
  const auto run = std::make_unique<TerminalRun>(m_folder, command(), TerminalSettings{80, {}});
  EXPECT_LE(widestLine(onScreen(run->until("Your choice: "))), 80U);
  for (const unsigned short columns : std::array<unsigned short, 4>{40, 60, 100, 33}) {
    SCOPED_TRACE(columns);
    run->resize(columns);
    run->type("?");
    const std::string screen = onScreen(run->until("Your choice: "));
    EXPECT_LE(widestLine(screen), columns) << screen;
    EXPECT_GT(widestLine(screen), columns - 14U) << screen;
  }
  run->type("o");
  run->until("Reason (Enter for none): ");
  run->type("");
  EXPECT_LE(widestLine(onScreen(run->until("Your choice: "))), 33U);
  run->type("q");
  run->rest();
}

TEST_F(Deciding, ColumnsSaysHowWideTheTerminalIs) {
  TerminalRun run(m_folder, command(), {80, {{"COLUMNS", "45"}}});
  const std::string screen = onScreen(run.until("Your choice: "));
  EXPECT_LE(widestLine(screen), 45U) << screen;
}

TEST_F(Deciding, ColourIsOnlyWhereItIsWanted) {
  const auto isColoured = [&](const TerminalSettings& settings,
                              const std::vector<std::string>& more) {
    TerminalRun run(m_folder, command(more), settings);
    return run.until("Your choice: ").find("\x1b[") != std::string::npos;
  };
  EXPECT_TRUE(isColoured({}, {}));
  EXPECT_FALSE(isColoured({80, {{"NO_COLOR", "1"}}}, {}));
  EXPECT_FALSE(isColoured({80, {{"TERM", "dumb"}}}, {}));
  EXPECT_FALSE(isColoured({}, {"--color", "never"}));
  EXPECT_TRUE(isColoured({80, {{"NO_COLOR", "1"}}}, {"--color", "always"}));
  EXPECT_TRUE(isColoured({}, {"--color=auto"}));
}

}  // namespace
