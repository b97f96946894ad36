// decide, as a person has it: the questions, the letters, and what comes of the answers.

#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <functional>

#include "DecideRun.h"

namespace {

constexpr char kLast[] = "  ?  explain   s  leave it undecided   b  back   q  quit\n";

TEST_F(Deciding, AQuestionTellsTheDifferenceClauseByClauseWhatDependsOnItAndTheChoices) {
  TerminalRun run(m_folder, command());
  EXPECT_EQ(onScreen(run.until("Your choice: ")),
            "3 definitions have to be decided. Type a letter and Enter; ? explains the\n"
            "choices, and q quits. Each answer is added to d.toml at once.\n"
            "\n"
            "Question 1 of 3: attribute type gone (1.9)\n"
            "  removed by release [data]: the release removed it, and the site had changed it\n"
            "  BASE V3.system.at:2, OLD V3.system.at:2\n"
            "\n"
            "  SINGLE-VALUE [data]\n"
            "    base     (none)\n"
            "    old      SINGLE-VALUE\n"
            "\n"
            "  In OLD, this refers to it: object class c (2.1).\n"
            "\n"
            "  o  keep OLD's, which NEW does not have\n"
            "  n  do as NEW does: the definition goes\n"
            "  a  take BASE's, as the old release shipped it\n"
            "  t  write the definition yourself\n" +
                std::string(kLast) + "Your choice:");
  run.type("s");
  EXPECT_EQ(onScreen(run.until("Your choice: ")),
            "s\n"
            "\n"
            "Question 2 of 3: attribute type badge (9.1)\n"
            "  taken [structure]: its name 'badge' belongs to NEW's attribute type x (1.5),\n"
            "  which may be the same one, renamed\n"
            "  OLD V3.user.at:1\n"
            "\n"
            "    base     (none)\n"
            "    old      ( 9.1 NAME ( 'badge' ) USAGE userApplications )\n"
            "    new      (none)\n"
            "\n"
            "  In OLD, this refers to it: object class guard (9.2).\n"
            "\n"
            "  n  do as NEW does: the definition goes\n"
            "  r  keep OLD's beside NEW's, under another name or OID\n"
            "  t  write the definition yourself\n" +
                std::string(kLast) + "Your choice:");
  run.type("skip");
  EXPECT_EQ(onScreen(run.until("Your choice: ")),
            "skip\n"
            "\n"
            "Question 3 of 3: object class c (2.1)\n"
            "  changed by both, in conflict [structure]: the site and the release changed it\n"
            "  in two ways: KIND\n"
            "  BASE V3.system.oc:1, OLD V3.system.oc:1, NEW V3.system.oc:1\n"
            "\n"
            "  KIND, to be decided [structure]\n"
            "    base     ABSTRACT\n"
            "    old      AUXILIARY\n"
            "    new      STRUCTURAL\n"
            "  MAY [structure]\n"
            "    base     a\n"
            "    old      a $ gone\n"
            "    new      x $ a\n"
            "    merged   x $ a $ gone\n"
            "\n"
            "  Nothing refers to it.\n"
            "\n"
            "  o  take OLD's, in the place of NEW's\n"
            "  n  take NEW's; what only OLD has of it is lost\n"
            "  a  take BASE's, as the old release shipped it\n"
            "  d  drop it: neither OLD's nor NEW's stays\n"
            "  c  decide clause by clause\n"
            "  t  write the definition yourself\n" +
                std::string(kLast) + "Your choice:");
}

TEST_F(Deciding, ExplainTellsWhatEachChoiceLeavesInTheResult) {
  const auto run = started();
  run->type("?");
  EXPECT_EQ(onScreen(run->until("Your choice: ")),
            "?\n"
            "\n"
            "What each choice leaves in the result:\n"
            "  o  keep OLD's, which NEW does not have:\n"
            "     ( 1.9 NAME ( 'gone' ) SINGLE-VALUE USAGE userApplications )\n"
            "  n  do as NEW does: the definition goes:\n"
            "     nothing: the definition goes\n"
            "  a  take BASE's, as the old release shipped it:\n"
            "     ( 1.9 NAME ( 'gone' ) USAGE userApplications )\n"
            "  t  asks for the text of the definition, from \"(\" to \")\"\n"
            "What is decided about an attribute type covers its vendor extension where that\n"
            "goes with it. An answer is added to d.toml at once, with the reason if you give\n"
            "one. s leaves this question open and goes on; b goes back to the question\n"
            "before, and takes its answer out of the file again; q stops, and what was\n"
            "answered is kept. What is left open is asked again when the program is started\n"
            "again.\n"
            "\n"
            "  o  keep OLD's, which NEW does not have\n"
            "  n  do as NEW does: the definition goes\n"
            "  a  take BASE's, as the old release shipped it\n"
            "  t  write the definition yourself\n" +
                std::string(kLast) + "Your choice:");
}

TEST_F(Deciding, EverythingAnsweredMigrates) {
  const auto run = started();
  EXPECT_EQ(answer(run.get(), "o", "mail still uses it"),
            "o\n"
            "Reason (Enter for none): mail still uses it\n"
            "\n");
  EXPECT_EQ(file(),
            "[[definition]]\n"
            "# attribute type gone (1.9)\n"
            "kind = \"attribute-type\"\n"
            "oid = \"1.9\"\n"
            "fingerprint = \"...\"\n"
            "take = \"old\"\n"
            "reason = \"mail still uses it\"\n");
  EXPECT_NE(run->until("Your choice: ").find("Question 2 of 3: attribute type badge (9.1)"),
            std::string::npos);
  run->type("r");
  run->until("Its name beside NEW's (Enter to keep \"badge\"): ");
  run->type("siteBadge");
  run->until("Its OID beside NEW's (Enter to keep 9.1): ");
  run->type("");
  run->until("Reason (Enter for none): ");
  run->type("");
  EXPECT_NE(run->until("Your choice: ").find("Question 3 of 3: object class c (2.1)"),
            std::string::npos);
  run->type("c");
  EXPECT_EQ(onScreen(run->until("KIND: ")),
            "c\n"
            "\n"
            "  KIND\n"
            "    base     ABSTRACT\n"
            "    old      AUXILIARY\n"
            "    new      STRUCTURAL\n"
            "\n"
            "  o  OLD's\n"
            "  n  NEW's\n"
            "  a  BASE's\n"
            "  ?  explain   b  back   q  quit\n"
            "KIND:");
  run->type("n");
  run->until("MAY (Enter for merged): ");
  run->type("?");
  EXPECT_NE(onScreen(run->until("MAY (Enter for merged): "))
                .find("What each choice makes of MAY:\n"
                      "  o        a $ gone\n"
                      "  n        x $ a\n"
                      "  a        a\n"
                      "  u        x $ a $ gone\n"
                      "  Enter    x $ a $ gone\n"),
            std::string::npos);
  run->type("u");
  run->until("Reason (Enter for none): ");
  run->type("");
  EXPECT_EQ(onScreen(run->rest()),
            "\n"
            "\n"
            "Written to d.toml: object class c (2.1) -> merged\n"
            "\n"
            "3 answers written to d.toml.\n"
            "Everything is decided.\n"
            "Next:\n"
            "  schema-migrate migrate --from old --to new --base base --decisions d.toml \\\n"
            "      --out DIR\n");
  EXPECT_EQ(run->exitCode(), 0);
  EXPECT_NE(file().find("rename = \"siteBadge\"\n"), std::string::npos) << file();
  EXPECT_NE(file().find("clauses = { KIND = \"new\", MAY = \"union\" }\n"), std::string::npos)
      << file();
  EXPECT_EQ(planned(), "0\n");
  const ToolResult result = m_folder.run({"migrate", "--from", "@/old", "--to", "@/new", "--base",
                                          "@/base", "--decisions", "@/d.toml", "--out", "@/out"});
  EXPECT_EQ(result.exitCode, 0) << result.err;
  const ToolFolder::Files files = m_folder.contents("out");
  EXPECT_NE(files.at("V3.system.oc").find("STRUCTURAL MAY ( x $ a $ gone )"), std::string::npos)
      << files.at("V3.system.oc");
  EXPECT_NE(files.at("V3.user.oc").find("siteBadge"), std::string::npos);
  EXPECT_NE(files.at("V3.system.at").find("'gone'"), std::string::npos);
}

TEST_F(Deciding, AWrongLetterIsToldAndAskedAgain) {
  const auto run = started();
  run->type("m");
  EXPECT_EQ(onScreen(run->until("Your choice: ")),
            "m\n"
            "\"m\" is none of the choices; type one of these letters: o n a t ? s b q\n"
            "Your choice:");
  run->type("");
  EXPECT_EQ(onScreen(run->until("Your choice: ")),
            "\n"
            "Type one of these letters: o n a t ? s b q\n"
            "Your choice:");
  run->type(" O ");
  run->until("Reason (Enter for none): ");
  EXPECT_EQ(file(), "");
}

TEST_F(Deciding, BackTakesOutWhatWasAnsweredLast) {
  const auto run = started();
  answer(run.get(), "o");
  run->until("Your choice: ");
  const std::string first = file();
  answer(run.get(), "n");
  run->until("Your choice: ");
  EXPECT_NE(file(), first);
  run->type("b");
  EXPECT_NE(
      onScreen(run->until("Your choice: "))
          .find("Taken out of d.toml again.\n\nQuestion 2 of 3: attribute type badge (9.1)\n"),
      std::string::npos);
  EXPECT_EQ(file(), first);
  run->type("back");
  EXPECT_NE(run->until("Your choice: ").find("Question 1 of 3: attribute type gone (1.9)"),
            std::string::npos);
  EXPECT_EQ(file(), "");
  run->type("b");
  EXPECT_EQ(onScreen(run->until("Your choice: ")),
            "b\n"
            "This is the first question; what the file held before is for an editor.\n"
            "Your choice:");
  answer(run.get(), "n");
  EXPECT_NE(run->until("Your choice: ").find("Question 2 of 3: attribute type badge (9.1)"),
            std::string::npos);
  EXPECT_NE(file().find("take = \"new\""), std::string::npos);
}

TEST_F(Deciding, BackFromWhatWasLeftOpenAsksItAgain) {
  const auto run = started();
  run->type("s");
  run->until("Your choice: ");
  run->type("b");
  const std::string again = run->until("Your choice: ");
  EXPECT_NE(again.find("Question 1 of 3: attribute type gone (1.9)"), std::string::npos);
  EXPECT_EQ(again.find("Taken out"), std::string::npos);
}

TEST_F(Deciding, BackWithinAQuestionGoesToItsBeginning) {
  const auto run = started();
  run->type("s");
  run->until("Your choice: ");
  run->type("s");
  run->until("Your choice: ");
  run->type("c");
  run->until("KIND: ");
  run->type("o");
  run->until("MAY (Enter for merged): ");
  run->type("b");
  run->until("KIND: ");
  run->type("b");
  run->until("Your choice: ");
  run->type("r");
  EXPECT_NE(run->until("Your choice: ").find("none of the choices"), std::string::npos);
  EXPECT_EQ(file(), "");
}

TEST_F(Deciding, AMovingThatMovesNothingGoesBackToTheChoices) {
  const auto run = started();
  run->type("s");
  run->until("Your choice: ");
  run->type("r");
  run->until("): ");
  run->type("");
  run->until("): ");
  run->type("");
  EXPECT_NE(run->until("Your choice: ").find("Nothing was chosen."), std::string::npos);
}

TEST_F(Deciding, QuitKeepsWhatWasAnsweredAndTheNextRunAsksTheRest) {
  const auto run = started();
  answer(run.get(), "o");
  run->until("Your choice: ");
  run->type("q");
  EXPECT_EQ(onScreen(run->rest()),
            "q\n"
            "\n"
            "1 answer written to d.toml.\n"
            "2 definitions are left undecided.\n"
            "1 other reason stands against the migration; plan tells it.\n"
            "To go on:\n"
            "  schema-migrate decide --from old --to new --base base --decisions d.toml\n");
  EXPECT_EQ(run->exitCode(), 4);
  const std::string first = file();
  TerminalRun again(m_folder, command());
  EXPECT_NE(again.until("Your choice: ").find("Question 1 of 2: attribute type badge (9.1)"),
            std::string::npos);
  again.type("quit");
  again.rest();
  EXPECT_EQ(again.exitCode(), 4);
  EXPECT_EQ(file(), first);
}

// What ends the dialogue where something is answered and something is not.
struct Ending {
  const char* name;
  std::function<void(TerminalRun*)> end;
  bool isOnScreen;
};

TEST_F(Deciding, HoweverItEndsWhatWasAnsweredIsKept) {
  const Ending kEndings[] = {
      {"ControlC", [](TerminalRun* run) { run->send("\x03"); }, true},
      {"ControlD", [](TerminalRun* run) { run->send("\x04"); }, true},
      {"Terminated", [](TerminalRun* run) { run->signal(SIGTERM); }, true},
      {"HungUp", [](TerminalRun* run) { run->hangUp(); }, false},
      {"HungUpBySignal", [](TerminalRun* run) { run->signal(SIGHUP); }, false},
      {"Killed", [](TerminalRun* run) { run->signal(SIGKILL); }, false},
  };
  for (const Ending& ending : kEndings) {
    SCOPED_TRACE(ending.name);
    std::remove(m_folder.file("d.toml").c_str());
    const auto run = started();
    answer(run.get(), "o", "kept");
    run->until("Your choice: ");
    run->type("n");
    run->until("Reason (Enter for none): ");
    const std::string first = file();
    EXPECT_NE(first.find("reason = \"kept\""), std::string::npos);
    // Between the letter and the reason, and so not answered yet.
    if (std::string(ending.name) == "ControlD") {
      run->type("");
      run->until("Your choice: ");
    }
    const std::string before = file();
    ending.end(run.get());
    const std::string screen = onScreen(run->rest());
    EXPECT_EQ(screen.find("left undecided.\n") != std::string::npos, ending.isOnScreen) << screen;
    const bool isKilled = std::string(ending.name) == "Killed";
    EXPECT_EQ(run->exitCode(), isKilled ? 128 + SIGKILL : 4);
    EXPECT_EQ(file(), before);
  }
}

TEST_F(Deciding, TheEndOfTheInputBehindAChoiceIsNoReason) {
  const auto run = started();
  run->type("o");
  run->until("Reason (Enter for none): ");
  run->send("\x04");
  run->until("Your choice: ");
  run->send("\x04");
  run->rest();
  EXPECT_EQ(run->exitCode(), 4);
  EXPECT_NE(file().find("take = \"old\"\n"), std::string::npos);
  EXPECT_EQ(file().find("reason"), std::string::npos);
}

TEST_F(Deciding, WhatTheEngineRefusesIsToldAndAskedAgain) {
  const auto run = started();
  run->type("s");
  run->until("Your choice: ");
  const auto move = [&](const std::string& name, const std::string& oid) {
    run->type("r");
    run->until("): ");
    run->type(name);
    run->until("): ");
    run->type(oid);
    run->until("Reason (Enter for none): ");
    run->type("");
    return wordsOnScreen(run->until("Your choice: "));
  };
  const std::string taken = move("a", "");
  EXPECT_NE(taken.find("That cannot be done, and nothing was written: the decision about attribute "
                       "type badge (9.1) cannot be carried out: its name 'a' would also be that of "
                       "attribute type a (1.1); rename or renumber it, or take NEW's Question 2 of "
                       "3: attribute type badge (9.1)"),
            std::string::npos)
      << taken;
  EXPECT_NE(move("no name", "").find("\"no name\" is no name"), std::string::npos);
  EXPECT_NE(move("y", "no.oid").find("\"no.oid\" is no OID"), std::string::npos);
  EXPECT_EQ(file(), "");
  EXPECT_NE(move("y", "9.77").find("Written to d.toml: attribute type badge (9.1) -> added"),
            std::string::npos);
  EXPECT_NE(file().find("rename = \"y\"\nrenumber = \"9.77\"\n"), std::string::npos);
}

TEST_F(Deciding, ATextOfOnesOwnMayTakeSeveralLines) {
  const auto run = started();
  run->type("t");
  run->until("> ");
  run->type("( 1.9 NAME 'gone'");
  run->until("> ");
  run->type("USAGE userApplications");
  run->until("> ");
  run->type("");
  run->until("Reason (Enter for none): ");
  run->type("");
  {
    const std::string text = wordsOnScreen(run->until("Your choice: "));
    EXPECT_NE(text.find("That cannot be done, and nothing was written:"), std::string::npos)
        << text;
    EXPECT_NE(text.find("its text"), std::string::npos) << text;
  }
  run->type("t");
  run->until("> ");
  run->type("");
  EXPECT_NE(run->until("Your choice: ").find("Nothing was written."), std::string::npos);
  run->type("t");
  run->until("> ");
  run->type("( 1.9 NAME 'gone' DESC 'kept \"as is\"'");
  run->until("> ");
  run->type("USAGE userApplications )");
  run->until("> ");
  run->type("");
  run->until("Reason (Enter for none): ");
  run->type("");
  run->until("Your choice: ");
  EXPECT_NE(file().find("text = \"( 1.9 NAME 'gone' DESC 'kept \\\"as is\\\"' USAGE "
                        "userApplications )\"\n"),
            std::string::npos)
      << file();
}

TEST_F(Deciding, AnAnswerSettlesAndOpensOtherQuestions) {
  m_folder.install(
      "old2", {{"V3.user.at", attribute("3.1 NAME 'p' SINGLE-VALUE USAGE userApplications") +
                                  extension("3.1 DBNAME ( 'p' 'p' ) LENGTH 9") +
                                  attribute("3.3 NAME 'r' SINGLE-VALUE USAGE userApplications") +
                                  extension("3.3 DBNAME ( 'q' 'q' )")}});
  m_folder.install("base2", {{"V3.user.at", attribute("3.1 NAME 'p' USAGE userApplications") +
                                                extension("3.1 DBNAME ( 'p' 'p' ) LENGTH 7") +
                                                attribute("3.3 NAME 'r' USAGE userApplications") +
                                                extension("3.3 DBNAME ( 'q' 'q' )")}});
  m_folder.install("new2", {{"V3.user.at", attribute("3.1 NAME 'p' USAGE dSAOperation "
                                                     "SYNTAX 1.2{3}") +
                                               extension("3.1 DBNAME ( 'p' 'p' ) LENGTH 8") +
                                               attribute("3.2 NAME 'q' USAGE userApplications") +
                                               extension("3.2 DBNAME ( 'q' 'q' )")}});
  TerminalRun run(m_folder, {"decide", "--from", "old2", "--to", "new2", "--base", "base2",
                             "--decisions", "d.toml"});
  std::string text = run.until("Your choice: ");
  EXPECT_NE(text.find("Question 1 of 2: attribute type r (3.3)"), std::string::npos) << text;
  answer(&run, "o");
  text = onScreen(run.until("Your choice: "));
  EXPECT_NE(text.find("This opens a question about vendor extension 3.3.\n"), std::string::npos)
      << text;
  EXPECT_NE(text.find("Question 2 of 3: vendor extension 3.1\n"), std::string::npos) << text;
  EXPECT_NE(text.find("\n  It belongs to attribute type p (3.1).\n"), std::string::npos) << text;
  run.type("q");
  run.rest();
}

TEST_F(Deciding, AClauseThatASideLacksIsToldSo) {
  m_folder.install("old2",
                   {{"V3.user.at", attribute("1.1 NAME 'a' SUP b USAGE userApplications")}});
  m_folder.install("new2", {{"V3.user.at", attribute("1.1 NAME 'a' EQUALITY m SYNTAX 1.2{3} USAGE "
                                                     "userApplications")}});
  TerminalRun run(m_folder, {"decide", "--from", "old2", "--to", "new2", "--decisions", "d.toml"});
  const std::string text = onScreen(run.until("Your choice: "));
  EXPECT_NE(text.find("  SUP, to be decided [structure]\n"
                      "    old      b\n"
                      "    new      (none)\n"
                      "  EQUALITY, to be decided [data]\n"
                      "    old      (none)\n"
                      "    new      m\n"
                      "  SYNTAX, to be decided [data]\n"
                      "    old      (none)\n"
                      "    new      1.2{3}\n"),
            std::string::npos)
      << text;
  run.type("q");
  run.rest();
}

TEST_F(Deciding, NothingUndecidedAsksNothingAndMakesNoFile) {
  TerminalRun run(m_folder, {"decide", "--from", "new", "--to", "new", "--decisions", "d.toml"});
  EXPECT_EQ(onScreen(run.rest()),
            "Nothing is undecided.\n"
            "Everything is decided.\n"
            "Next:\n"
            "  schema-migrate migrate --from new --to new --out DIR\n");
  EXPECT_EQ(run.exitCode(), 0);
  EXPECT_EQ(file(), "(no file)");
}

TEST_F(Deciding, OtherOptionsOfPlanCount) {
  m_folder.write("x.oids", "9.1\n");
  TerminalRun run(m_folder, command({"--prefer", "new", "--exclude-oids", "x.oids"}));
  EXPECT_NE(run.until("Your choice: ").find("Question 1 of 1: attribute type gone (1.9)"),
            std::string::npos);
  run.type("q");
  EXPECT_NE(onScreen(run.rest())
                .find("  schema-migrate decide --from old --to new --base base --exclude-oids "
                      "x.oids \\\n      --prefer new --decisions d.toml\n"),
            std::string::npos);
}

TEST_F(Deciding, LinesOfAnotherProgramAreTakenForWhatWouldBeTyped) {
  m_folder.write("typed", "o\nwhy not\nx\nq");
  const ToolResult result = m_folder.run(
      {"decide", "--from", "@/old", "--to", "@/new", "--base", "@/base", "--decisions", "@/d.toml"},
      [&] {
        if (std::freopen(m_folder.file("typed").c_str(), "r", stdin) == nullptr) {
          ::_exit(126);
        }
      });
  EXPECT_EQ(result.exitCode, 4);
  EXPECT_EQ(result.err, "");
  EXPECT_NE(result.out.find("Your choice: o\nReason (Enter for none): why not\n"),
            std::string::npos)
      << result.out;
  EXPECT_NE(result.out.find("Your choice: x\n\"x\" is none of the choices"), std::string::npos);
  EXPECT_EQ(result.out.find('\x1b'), std::string::npos);
  EXPECT_LE(widestLine(result.out), 80U);
  EXPECT_NE(file().find("reason = \"why not\""), std::string::npos);
}

}  // namespace
