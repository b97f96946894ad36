// What comes back from a process of its own, however it ends.

#include "SeparateProcess.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <stdexcept>

#include "Messages.h"

namespace {

struct Row {
  const char* name;
  std::string (*make)();
  int exitCode;
  const char* text;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

std::string fail(ExitCode code) { throw Failure(code, "path: error: text\n"); }

[[noreturn]] void endBy(int signal) {
  std::signal(signal, SIG_DFL);
  std::raise(signal);
  std::abort();
}

const Row kRows[] = {
    {"Text", [] { return std::string("text\n"); }, kDone, "text\n"},
    {"NoText", [] { return std::string(); }, kDone, ""},
    {"FailureOfTheInput", [] { return fail(kBadInput); }, kBadInput, "path: error: text\n"},
    {"Refusal", [] { return fail(kRefused); }, kRefused, "path: error: text\n"},
    {"FailureToWrite", [] { return fail(kNotWritten); }, kNotWritten, "path: error: text\n"},
    {"OtherException", []() -> std::string { throw std::runtime_error("odd"); }, kNotWritten,
     "schema-migrate: error: odd\n"},
    {"ExceptionThatIsNone", []() -> std::string { throw 1; }, kNotWritten,
     "schema-migrate: error: the collision reports could not be made\n"},
    {"Killed", []() -> std::string { endBy(SIGKILL); }, kNotWritten,
     "schema-migrate: error: the collision reports could not be made: ended by signal 9\n"},
    {"Terminated", []() -> std::string { endBy(SIGTERM); }, kNotWritten,
     "schema-migrate: error: the collision reports could not be made: ended by signal 15\n"},
    {"ExitOfItsOwn", []() -> std::string { ::_exit(1); }, kNotWritten,
     "schema-migrate: error: the collision reports could not be made: ended with code 1\n"},
};

class SeparateProcess : public testing::TestWithParam<Row> {};

TEST_P(SeparateProcess, ComesToAnEnd) {
  std::string text;
  int exitCode = kDone;
  try {
    text = textFromSeparateProcess(GetParam().make);
  } catch (const Failure& failure) {
    exitCode = failure.exitCode();
    text = failure.what();
  }
  EXPECT_EQ(GetParam().exitCode, exitCode);
  EXPECT_EQ(GetParam().text, text);
}

INSTANTIATE_TEST_SUITE_P(Rows, SeparateProcess, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(SeparateProcessText, MayBeLong) {
  const std::string text(3000000, 'x');
  EXPECT_EQ(text, textFromSeparateProcess([&] { return text; }));
}

// When the program is killed, the process that it started does not go on.
TEST(SeparateProcessEnd, ComesWithThatOfTheProgram) {
  int ends[2] = {-1, -1};
  ASSERT_EQ(0, ::pipe(ends));
  const pid_t program = ::fork();
  if (program == 0) {
    ::close(ends[0]);
    textFromSeparateProcess([&]() -> std::string {
      static_cast<void>(!::write(ends[1], "x", 1));
      ::alarm(60);
      for (;;) {
        ::pause();
      }
    });
    ::_exit(0);
  }
  ::close(ends[1]);
  char byte = 0;
  ASSERT_EQ(1, ::read(ends[0], &byte, 1));
  ::kill(program, SIGKILL);
  EXPECT_EQ(program, ::waitpid(program, nullptr, 0));
  // The pipe ends when nobody holds its other end any more.
  const unsigned before = ::alarm(20);
  EXPECT_EQ(0, ::read(ends[0], &byte, 1));
  ::alarm(before);
  ::close(ends[0]);
}

}  // namespace
