// Bytes that do not belong into a schema file: NUL, those of 128 and more, CR LF line ends, a
// byte-order mark. The result is what it would be
// without them, or the run is refused with the place.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "ToolRun.h"

namespace {

using std::string_literals::operator""s;

const char kRefused[] =
    "schema-migrate: error: refused: nothing was written; what can be mended without changing what is said, --repair mends in private copies; a .schema-migrate.toml in the directory accepts what is meant so\n";

std::string told(const std::string& place, const std::string& text) {
  return "@/old/V3.user.at:" + place + ": error: " + text + "\n";
}

const char kCarriageReturn[] =
    "a carriage return stands where the reader takes every byte for a token, and what belongs behind it is not taken; end lines with a line feed alone [L113]";

std::string cutOff(const std::string& place, const std::string& byte) {
  return told(
      place,
      "the byte " + byte +
          " ends the quoted text for the reader, which takes printable ASCII only, and what stands behind is read as if it stood outside; write the text in ASCII [L102]");
}

struct Row {
  const char* name;
  std::string text;  // of V3.user.at
  std::string err;
  int exitCode;
  std::string written;  // of V3.user.at below its header; empty when the file is refused
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const char kWritten[] = "attributetypes=( 1.1 NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\n";

const Row kRows[] = {
    {"ByteOrderMark",
     "\xEF\xBB\xBF"
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n",
     "", 0, kWritten},
    {"OtherByteOrderMark",
     "\xFF\xFE"
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\x80",
     told(
         "1:1",
         "this is text in UTF-16, of which the reader takes nothing; save it as plain text in ASCII [L107]") +
         kRefused,
     4, ""},
    {"NulsBetweenDefinitions", "\0\0attributetypes=( 1.1 NAME 'a' OBSOLETE )\0\n"s, "", 0,
     kWritten},
    {"NulBetweenClauses", "attributetypes=( 1.1 NAME 'a' \0 OBSOLETE )\n"s, "", 0, kWritten},
    {"Comment", "# \xC3\xA4\0'\xFF\nattributetypes=( 1.1 NAME 'a' OBSOLETE )\n"s, "", 0, kWritten},
    {"NoBreakSpaceBetweenClauses", "attributetypes=( 1.1 NAME 'a' \xC2\xA0OBSOLETE )\n",
     told(
         "1:22",
         "no clause that ends NAME stands behind it, and \")\" does not, so that the reader takes what follows for names; put a clause behind the names, such as USAGE userApplications [D203]") +
         told(
             "1:31",
             "\"\\xc2\\xa0OBSOLETE\" stands directly behind the names, and the reader takes it and its values for names; take it away, or make a comment of it [D207]") +
         kRefused,
     4, ""},
    {"LinesThatEndInCrLf",
     "\r\nattributetypes=( 1.1\r\n NAME ( 'a'\r\n 'b' )\r\n DESC 'd'\r\n OBSOLETE )\r\n"
     "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $ b )\r\n MAY ( a $ b ) )\r\n"
     "ORVAttributetypes=( 1.1 DBNAME ( 'a'\r\n 'b' )\r\n LENGTH 3 )\r\n",
     "", 0,
     "attributetypes=( 1.1 NAME ( 'a' 'b'  )  DESC 'd' OBSOLETE USAGE userApplications  )\n"
     "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'  ) ACCESS-CLASS normal LENGTH 3 )\n"
     "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $ b ) MAY ( a $ b ) )\n"},
    {"BlockWhoseLinesEndInCrLf", "attributetypes {\r\n( 1.1 NAME 'a' OBSOLETE )\r\n}\r\n", "", 0,
     kWritten},
    {"ListThatGoesOnBehindCrLf", "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $\r\n b ) )\r\n",
     told("1:49", kCarriageReturn) + kRefused, 4, ""},
    {"ListBehindCrLf", "objectclasses=( 1.3 NAME 'c' ABSTRACT MAY\r\n ( a $ b ) )\r\n",
     told("1:42", kCarriageReturn) + kRefused, 4, ""},
    {"SuperiorBehindCrLf", "objectclasses=( 1.3 NAME 'c' SUP\r\n a ABSTRACT )\r\n",
     told("1:33", kCarriageReturn) + kRefused, 4, ""},
    {"ValueBehindCrLf", "attributetypes=( 1.1 NAME 'a' DESC\r\n 'd' OBSOLETE )\r\n",
     told("1:35", kCarriageReturn) + kRefused, 4, ""},
    {"ValueBehindANoBreakSpace",
     "attributetypes=( 1.1 NAME 'a' OBSOLETE USAGE\xA0"
     "x )\n",
     told(
         "1:40",
         "\"USAGE\\xa0x\" is no clause that the reader knows here, and it or its value takes the place of the OID; take it away, or make a comment of it [D201]") +
         kRefused,
     4, ""},
    {"ValueBehindADelete", "attributetypes=( 1.1 NAME 'a' OBSOLETE SUP \x7F x )\n",
     told(
         "1:44",
         "\"\\x7f\" stands where a name must, and is no name that the reader takes there; write the name [D214]") +
         told(
             "1:46",
             "\"x\" is no clause that the reader knows here, and it or its value takes the place of the OID; take it away, or make a comment of it [D201]") +
         kRefused,
     4, ""},
    {"LetterInANameInABlock",
     "attributetypes {\n( 1.1 NAME 'gr\xC3\xB6\xC3\x9F"
     "e' DESC 'd' OBSOLETE )\n( 1.2 NAME 'b' OBSOLETE )\n}\n",
     cutOff("2:15", "\\xc3") + kRefused, 4, ""},
    {"LetterInADescription",
     "attributetypes=( 1.1 NAME 'a' DESC 'caf\xE9' OBSOLETE )\nattributetypes=( 1.2 NAME 'b' OBSOLETE )\n",
     cutOff("1:40", "\\xe9") +
         told("2:1", "the server's library fails to read this file, and stops here"),
     3, ""},
    {"NulInAName",
     "attributetypes=( 1.1 NAME 'a\0b' OBSOLETE )\nattributetypes=( 1.2 NAME 'b' OBSOLETE )\n"s,
     told(
         "1:27",
         "a byte of zero stands in the text, where the reader ends a word or a quoted text; take it out [L107]") +
         kRefused,
     4, ""},
    {"LineEndInADescription", "attributetypes=( 1.1 NAME 'a' DESC 'two\r\nlines' OBSOLETE )\n",
     told(
         "1:36",
         "a line end stands in the quoted text that begins here, and ends it for the reader; write the text on one line [L103]") +
         told("2:6", "the server's library fails to read this file, and stops here"),
     3, ""},
    {"QuoteBetweenDefinitions",
     "it's one: attributetypes=( 1.1 NAME 'b' OBSOLETE )\nattributetypes=( 1.1 NAME 'a' OBSOLETE )\n",
     told(
         "1:1",
         "this text stands outside definitions and is passed over; make a comment of it with \"#\", or take it out [L105]") +
         kRefused,
     4, ""},
};

class InputBytes : public testing::TestWithParam<Row> {};

TEST_P(InputBytes, GiveTheRightResultOrAMessage) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", {{"V3.user.at", row.text}});
  folder.install("new", {{"V3.user.at", ""}});
  const std::string before = folder.snapshot();
  const ToolResult result = folder.migrate({}, [] { ::alarm(20); });
  EXPECT_EQ(row.exitCode, result.exitCode);
  EXPECT_EQ(row.err, result.err);
  if (!row.written.empty()) {
    EXPECT_EQ(kHeader + row.written, folder.contents("out")["V3.user.at"]);
    std::filesystem::remove_all(folder.file("out"));
  }
  EXPECT_EQ(before, folder.snapshot());
}

INSTANTIATE_TEST_SUITE_P(Rows, InputBytes, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
