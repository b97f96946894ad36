// The word and comment rules of OID lists, which the lists of OIDs to exclude and to withdraw
// share.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <string>
#include <vector>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"
#include "Rows.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

struct ListCase {
  const char* name;
  std::string list;
  const char* oids;  // that count, each followed by a line end, in byte order
};

class OidList : public testing::TestWithParam<ListCase> {};

// Every OID that a list below names has an attribute type here.
const char* const kOids[] = {"1.1", "1.10", "1.2", "1.3", "1.4", "Word", "word"};

void PrintTo(const ListCase& row, std::ostream* out) { *out << row.name << ":\n" << row.list; }

}  // namespace

TEST_P(OidList, OfOidsToExclude) {
  Installation installation;
  EXPECT_EQ(installation->readExcludedOids(installation.write("list", GetParam().list)), 0);
  EXPECT_EQ(standardOutputOf([&] { installation->dumpEOids(); }),
            "excluded oids\n" + std::string(GetParam().oids) + "\n");
}

TEST_P(OidList, OfOidsToWithdraw) {
  const UnfreedDefinitions unfreed;  // a withdrawn definition is not freed
  std::string definitions;
  int number = 0;
  for (const char* oid : kOids) {
    definitions += attributeType(oid, "n" + std::to_string(number++));
  }
  Installation installation{{"V3.modifiedschema", definitions}};
  EXPECT_EQ(installation->modifySchema(installation.write("list", GetParam().list)), 0);
  std::string withdrawn;
  number = 0;
  for (const char* oid : kOids) {
    const bool isGone =
        attributeUnder(installation.manager(), "n" + std::to_string(number++)) == "nothing";
    withdrawn += isGone ? std::string(oid) + "\n" : "";
    EXPECT_EQ(installation->delOidFromModSch(oid), isGone ? 32 : 0) << oid;
  }
  EXPECT_EQ(withdrawn, GetParam().oids);
}

const ListCase kLists[] = {
    {"Empty", "", ""},
    {"BlankLines", "\n \n\t\n\n", ""},
    {"OneEachLine", "1.1\n1.2\n", "1.1\n1.2\n"},
    {"SeveralOnALine", "1.1 1.2\t1.3   1.4\n", "1.1\n1.2\n1.3\n1.4\n"},
    {"BlanksAround", "  \t1.1  \n\n\t1.2\t\n", "1.1\n1.2\n"},
    {"CarriageReturnIsWhiteSpace", "1.1\r\n1.2\r\n", "1.1\n1.2\n"},
    {"FormFeedAndVerticalTabAreWhiteSpace", "1.1\f1.2\v1.3\n", "1.1\n1.2\n1.3\n"},
    {"AnyOrderIsByteOrder", "1.2\n1.10\n1.1\n", "1.1\n1.10\n1.2\n"},
    {"RepeatedWordCountsOnce", "1.1\n1.1 1.1\n", "1.1\n"},
    {"WordsAreNotChecked", "word\nWord\n", "Word\nword\n"},
    {"LastWordWithoutWhiteSpaceIsLost", "1.1\n1.2", "1.1\n"},
    {"OnlyWordWithoutWhiteSpaceIsLost", "1.1", ""},
    {"LastWordBeforeABlankCounts", "1.1\n1.2 ", "1.1\n1.2\n"},
    {"CommentAfterAnOid", "1.1 # comment\n1.2\n", "1.1\n1.2\n"},
    {"CommentAtTheStartOfALine", "# 1.1 1.2\n1.3\n", "1.3\n"},
    {"CommentSignWithinAWordDropsTheWord", "1.1#note 1.2\n1.3\n", "1.3\n"},
    {"CommentSignAtTheEndOfAWordDropsTheWord", "1.1# 1.2\n1.3\n", "1.3\n"},
    {"CommentSignBeforeAWord", "#1.1 1.2\n1.3\n", "1.3\n"},
    {"WordsBeforeTheCommentCount", "1.1 1.2 #1.3 1.4\n", "1.1\n1.2\n"},
    {"CommentOfOneSign", "#\n1.1\n", "1.1\n"},
    {"CommentWordEndsTheLine", "1.2#\n1.1\n", "1.1\n"},
    {"CommentSkipsOneLineOnly", "#\n\n#\n1.1\n", "1.1\n"},
    {"CommentSignInAComment", "# 1.1 # 1.2\n1.3\n", "1.3\n"},
    {"CommentGoesOnAfterACarriageReturn", "# 1.1\r1.2\n1.3\n", "1.3\n"},
    {"FileEndsInAComment", "1.1\n# 1.2", "1.1\n"},
    {"FileEndsInACommentOnTheLineOfAnOid", "1.1 # 1.2 ", "1.1\n"},
    {"FileEndsInTheWordOfAComment", "1.1\n#", "1.1\n"},
    {"FileEndsAfterTheCommentSign", "1.1\n# ", "1.1\n"},
    {"FileIsACommentWithoutItsEnd", "# nothing else", ""},
};

INSTANTIATE_TEST_SUITE_P(Rows, OidList, testing::ValuesIn(kLists), nameOfRow<ListCase>);

TEST(ReadExcludedOids, WordsAreKeptAsTheyStand) {
  Installation installation;
  installation.write("list", "2.5.4.3\nCN not-an-oid \xC3\xA4 2.5.4.3, \"q\"\n");
  EXPECT_EQ(installation->readExcludedOids(installation.path() + "/list"), 0);
  EXPECT_EQ(standardOutputOf([&] { installation->dumpEOids(); }),
            "excluded oids\n\"q\"\n2.5.4.3\n2.5.4.3,\nCN\nnot-an-oid\n\xC3\xA4\n\n");
}

TEST(ReadExcludedOids, FilesAccumulate) {
  Installation installation;
  installation.exclude({"1.2", "1.1"});
  installation.exclude({"1.3", "1.1"});
  EXPECT_EQ(standardOutputOf([&] { installation->dumpEOids(); }),
            "excluded oids\n1.1\n1.2\n1.3\n\n");
}

TEST(ReadExcludedOids, FileThatCannotBeOpenedIs1AndChangesNothing) {
  Installation installation;
  installation.exclude({"1.1"});
  const std::string folder = installation.path() + "/folder";
  ASSERT_EQ(::mkdir(folder.c_str(), 0755), 0);
  for (const std::string& path : {std::string("/no such/list"), std::string(), folder}) {
    SCOPED_TRACE(path);
    int result = -1;
    std::string messages;
    EXPECT_EQ(standardOutputOf([&] {
                messages = messagesOf([&] { result = installation->readExcludedOids(path); });
              }),
              "");
    EXPECT_EQ(messages, "readExcludedOids: Unable to open file for reading, " + path + ".\n");
    EXPECT_EQ(result, 1);
    EXPECT_EQ(standardOutputOf([&] { installation->dumpEOids(); }), "excluded oids\n1.1\n\n");
  }
}

TEST(ReadExcludedOids, CallsAndExitCodes) {
  Installation installation;
  const std::string list = installation.write("list", "1.1\n");
  EXPECT_EQ(callsOf([&] { installation->readExcludedOids(list); }), "readExcludedOids");
  EXPECT_EQ(callsOf([&] { installation->readExcludedOids("/no such"); }), "readExcludedOids=1");
  EXPECT_EQ(messagesOf([&] { installation->readExcludedOids(list); }), "");
}

TEST(ModifySchema, FileThatCannotBeOpenedIs1AndChangesNothing) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  const std::string folder = installation.path() + "/folder";
  ASSERT_EQ(::mkdir(folder.c_str(), 0755), 0);
  for (const std::string& path : {std::string("/no such/list"), std::string(), folder}) {
    SCOPED_TRACE(path);
    int result = -1;
    EXPECT_EQ(messagesOf([&] { result = installation->modifySchema(path); }),
              "modifySchema: Unable to open file, " + path + ", for reading.\n");
    EXPECT_EQ(result, 1);
    EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\n");
    EXPECT_FALSE(installation->isModFileEmpty());
  }
}
