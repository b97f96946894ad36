// Bytes that do not belong into a schema file: NUL, those of 128 and more, CR LF line ends, a
// byte-order mark. The result is what it would be without them, or a message names the place.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "ToolRun.h"

namespace {

using std::string_literals::operator""s;

// What is said of a text that `end` cuts off, and of a byte in the place of a value.
std::string cutOff(const std::string& place, const std::string& end) {
  return "@/old/V3.user.at:" + place +
         ": warning: the text in quotes that begins here is cut off by " + end +
         ", since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\n";
}

std::string inPlaceOfAValue(const std::string& place, const std::string& byte,
                            const std::string& definition) {
  return "@/old/V3.user.at:" + place + ": warning: the byte " + byte +
         " takes the place of a value, or of the rest of a list, in the " + definition +
         " that begins in line 1; what stands behind gets lost or is taken for something else; take the byte away, or write the value on the line of its keyword\n";
}

struct Row {
  const char* name;
  std::string text;  // of V3.user.at
  std::string err;
  std::string written;  // of V3.user.at below its header; empty when the file is refused
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const char kWritten[] = "attributetypes=( 1.1 NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\n";

const Row kRows[] = {
    {"ByteOrderMark",
     "\xEF\xBB\xBF"
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n",
     "", kWritten},
    {"OtherByteOrderMark",
     "\xFF\xFE"
     "attributetypes=( 1.1 NAME 'a' OBSOLETE )\x80",
     "", kWritten},
    {"NulsBetweenDefinitions", "\0\0attributetypes=( 1.1 NAME 'a' OBSOLETE )\0\n"s, "", kWritten},
    {"NulBetweenClauses", "attributetypes=( 1.1 NAME 'a' \0 OBSOLETE )\n"s, "", kWritten},
    {"Comment", "# \xC3\xA4\0'\xFF\nattributetypes=( 1.1 NAME 'a' OBSOLETE )\n"s, "", kWritten},
    {"NoBreakSpaceBetweenClauses", "attributetypes=( 1.1 NAME 'a' \xC2\xA0OBSOLETE )\n", "",
     kWritten},
    {"LinesThatEndInCrLf",
     "\r\nattributetypes=( 1.1\r\n NAME ( 'a'\r\n 'b' )\r\n DESC 'd'\r\n OBSOLETE )\r\n"
     "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $ b )\r\n MAY ( c $ d ) )\r\n"
     "ORVAttributetypes=( 1.1 DBNAME ( 'a'\r\n 'b' )\r\n LENGTH 3 )\r\n",
     "",
     "attributetypes=( 1.1 NAME ( 'a' 'b'  )  DESC 'd' OBSOLETE USAGE userApplications  )\n"
     "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'  ) ACCESS-CLASS normal LENGTH 3 )\n"
     "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $ b ) MAY ( c $ d ) )\n"},
    // What stands behind the last ")" counts as one more definition, which has nothing in it.
    {"BlockWhoseLinesEndInCrLf", "attributetypes {\r\n( 1.1 NAME 'a' OBSOLETE )\r\n}\r\n",
     "@/old/V3.user.at:2: warning: attribute type (no OID) gets lost: it has no OID, and in a block such a definition is passed over; give it its OID\n",
     kWritten},
    {"ListThatGoesOnBehindCrLf", "objectclasses=( 1.3 NAME 'c' ABSTRACT MUST ( a $\r\n b ) )\r\n",
     inPlaceOfAValue("1:49", "\\x0D", "object class"),
     "objectclasses=( b NAME 'c' ABSTRACT MUST ( a ) )\n"},
    {"ListBehindCrLf", "objectclasses=( 1.3 NAME 'c' ABSTRACT MAY\r\n ( a $ b ) )\r\n",
     inPlaceOfAValue("1:42", "\\x0D", "object class"), "objectclasses=( 1.3 NAME 'c' ABSTRACT )\n"},
    {"SuperiorBehindCrLf", "objectclasses=( 1.3 NAME 'c' SUP\r\n a ABSTRACT )\r\n",
     inPlaceOfAValue("1:33", "\\x0D", "object class"), "objectclasses=( a NAME 'c' ABSTRACT )\n"},
    {"ValueBehindCrLf", "attributetypes=( 1.1 NAME 'a' DESC\r\n 'd' OBSOLETE )\r\n",
     inPlaceOfAValue("1:35", "\\x0D", "attribute type"),
     "attributetypes=( d NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\n"},
    {"ValueBehindANoBreakSpace",
     "attributetypes=( 1.1 NAME 'a' OBSOLETE USAGE\xA0"
     "x )\n",
     inPlaceOfAValue("1:45", "\\xA0", "attribute type"),
     "attributetypes=( x NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\n"},
    {"ValueBehindADelete", "attributetypes=( 1.1 NAME 'a' OBSOLETE SUP \x7F x )\n",
     inPlaceOfAValue("1:44", "\\x7F", "attribute type"),
     "attributetypes=( x NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\n"},
    {"LetterInANameInABlock",
     "attributetypes {\n( 1.1 NAME 'gr\xC3\xB6\xC3\x9F"
     "e' DESC 'd' OBSOLETE )\n( 1.2 NAME 'b' OBSOLETE )\n}\n",
     cutOff("2:12", "the byte \\xC3"),
     "attributetypes=( 1.1 NAME ( 'gr' 'e' ' DESC ' 'd' ' OBSOLETE )' 'b'  ) OBSOLETE USAGE userApplications  )\n"},
    {"LetterInADescription",
     "attributetypes=( 1.1 NAME 'a' DESC 'caf\xE9' OBSOLETE )\nattributetypes=( 1.2 NAME 'b' OBSOLETE )\n",
     cutOff("1:36", "the byte \\xE9") +
         "@/old/V3.user.at:2:1: error: the attribute type that begins in line 1 is not closed: another definition comes before its \")\"; write \")\" at its end\n",
     ""},
    {"NulInAName",
     "attributetypes=( 1.1 NAME 'a\0b' OBSOLETE )\nattributetypes=( 1.2 NAME 'b' OBSOLETE )\n"s,
     cutOff("1:27", "the byte \\x00"),
     "attributetypes=( 1.1 NAME ( 'a' 'b' ' OBSOLETE )' 'attributetypes'  ) OBSOLETE USAGE userApplications  )\n"},
    {"LineEndInADescription", "attributetypes=( 1.1 NAME 'a' DESC 'two\r\nlines' OBSOLETE )\n",
     cutOff("1:36", "the byte \\x0D") +
         "@/old/V3.user.at:3:1: error: the attribute type that begins in line 1 is not closed: the end of the file comes before its \")\"; write \")\" at its end\n",
     ""},
    {"QuoteBetweenDefinitions",
     "it's one: attributetypes=( 1.1 NAME 'b' OBSOLETE )\nattributetypes=( 1.1 NAME 'a' OBSOLETE )\n",
     cutOff("1:39", "the end of the line"), kWritten},
};

class InputBytes : public testing::TestWithParam<Row> {};

TEST_P(InputBytes, GiveTheRightResultOrAMessage) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", {{"V3.user.at", row.text}});
  folder.install("new", {{"V3.user.at", ""}});
  const std::string before = folder.snapshot();
  const ToolResult result = folder.migrate({}, [] { ::alarm(20); });
  EXPECT_EQ(row.written.empty() ? 3 : 0, result.exitCode);
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
