// The model of an installation: what is read, found, inherited, compared.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "CheckRun.h"
#include "Comparison.h"
#include "DefinitionView.h"
#include "Inheritance.h"
#include "InputFiles.h"
#include "OidList.h"

namespace {

using migration::Clause;
using migration::Compared;
using migration::Comparison;
using migration::Entry;
using migration::Failure;
using migration::Failures;
using migration::Inherited;
using migration::Installation;
using migration::Kind;
using migration::Reference;
using migration::Source;
using migration::SuperiorTree;
using support::Files;

std::string placeOf(const Entry* entry) {
  return entry == nullptr ? "none" : entry->file->name + ":" + std::to_string(entry->place().line);
}

std::string textOf(const Failures& failures) {
  std::string text;
  for (const Failure& failure : failures) {
    text += failure.file + ": " + failure.text + "\n";
  }
  return text;
}

const Files kFiles = {
    {"V3.modifiedschema", "attributetypes=( 1.1 NAME 'a' DESC 'modified' )\n"},
    {"V3.system.at",
     "attributetypes=( 1.1 NAME ( 'a' 'x' ) DESC 'd' )\n"
     "attributetypes=( 1.2 NAME ( 'b' 'A' ) SUP a )\n"
     "attributetypes {\n( NAME 'noOid' DESC 'd' )\n( 1.3 NAME 'c' DESC 'd' )\n}\n"},
    {"V3.orv.at", "ORVAttributetypes=( 1.2 DBNAME ( 'One' 'two' ) )\n"},
    {"V3.user.oc",
     "objectclasses=( 1.9 NAME 'k' AUXILIARY MUST ( b $ gone ) MAY ( X ) )\n"
     "attributetypes=( 1.8 NAME 'late' DESC 'd'\n"
     "attributetypes=( 1.7 NAME 'later' DESC 'd' )\n"}};

TEST(Installation, FindsByTheKeysOfTheTables) {
  const Installation schema = support::installationOf(kFiles, "", "old");
  EXPECT_EQ("V3.modifiedschema:1", placeOf(schema.byFirstName(Kind::kAttributeType, "a")));
  EXPECT_EQ("none", placeOf(schema.byFirstName(Kind::kAttributeType, "x")));
  EXPECT_EQ("V3.modifiedschema:1", placeOf(schema.byOid(Kind::kAttributeType, "1.1")));
  EXPECT_EQ("none", placeOf(schema.byOid(Kind::kObjectClass, "1.1")));
  EXPECT_EQ("V3.orv.at:1", placeOf(schema.byOid(Kind::kVendorExtension, "1.2")));
  EXPECT_EQ("V3.system.at:2", placeOf(schema.attributeOf(*schema.byDbName("ONE").front())));
}

TEST(Installation, FindsByAnyName) {
  const Installation schema = support::installationOf(kFiles, "", "old");
  EXPECT_EQ(3U, schema.byAnyName(Kind::kAttributeType, "A").size());
  EXPECT_EQ("V3.system.at:1", placeOf(schema.find(Kind::kAttributeType, "X")));
  EXPECT_EQ("V3.system.at:5", placeOf(schema.find(Kind::kAttributeType, "1.3")));
  EXPECT_EQ("none", placeOf(schema.find(Kind::kObjectClass, "a")));
  EXPECT_EQ("none", placeOf(schema.find(Kind::kAttributeType, "")));
  EXPECT_EQ(1U, schema.byDbName("TWO").size());
}

TEST(Installation, HasWhatIsWrittenAndNotKept) {
  const Installation schema = support::installationOf(kFiles, "", "old");
  EXPECT_EQ(6U, schema.entries().size());
  EXPECT_EQ(3U, schema.unkept().size());
  EXPECT_TRUE(schema.isDefined(Kind::kAttributeType, "LATER"));
  EXPECT_TRUE(schema.isDefined(Kind::kAttributeType, "1.8"));
  EXPECT_TRUE(schema.isDefined(Kind::kAttributeType, "noOid"));
  EXPECT_FALSE(schema.isDefined(Kind::kObjectClass, "later"));
  EXPECT_FALSE(schema.isDefined(Kind::kAttributeType, "gone"));
}

TEST(Installation, TellsReferences) {
  const Installation schema = support::installationOf(kFiles, "", "old");
  std::string text;
  for (const Reference& reference : schema.danglingReferences()) {
    text += "dangling " + std::string(reference.name) + " at " +
            std::to_string(reference.place().column) + " of " + describe(reference) + "\n";
  }
  for (const Reference& reference :
       schema.referrersOf(*schema.byOid(Kind::kAttributeType, "1.1"))) {
    text += std::string(keywordOf(reference.clause)) + " of " + describe(reference) + "\n";
  }
  EXPECT_EQ("dangling gone at 51 of object class k (1.9)\nSUP of attribute type b (1.2)\n", text);
}

// A definition whose names differ in letter case alone shares them with nobody.
TEST(Installation, TellsWhatSharesANameOrAnOid) {
  const Installation schema =
      support::installationOf({{"V3.user.at",
                                "attributetypes=( 1.1 NAME ( 'a' 'A' ) DESC 'd' )\n"
                                "attributetypes=( 1.2 NAME ( 'b' 'x' ) DESC 'd' )\n"
                                "attributetypes=( 1.3 NAME ( 'c' 'X' 'B' ) DESC 'd' )\n"
                                "attributetypes=( 1.3 NAME 'B' DESC 'd' )\n"}},
                              "", "old");
  std::string text;
  const auto add = [&](const std::vector<const Entry*>& group) {
    for (const Entry* const entry : group) {
      text += " " + placeOf(entry);
    }
    text += "\n";
  };
  schema.forEachSharedAlias(Kind::kAttributeType,
                            [&](std::string_view name, const std::vector<const Entry*>& group) {
                              text += std::string(name) + ":";
                              add(group);
                            });
  schema.forEachSharedName(Kind::kAttributeType, add);
  schema.forEachSharedOid(Kind::kAttributeType, add);
  EXPECT_EQ(
      "b: V3.user.at:2 V3.user.at:3 V3.user.at:4\nx: V3.user.at:2 V3.user.at:3\n"
      " V3.user.at:2 V3.user.at:4\n V3.user.at:3 V3.user.at:4\n",
      text);
}

std::string viewsOf(const Installation& schema, migration::Reading reading) {
  std::string text;
  for (const migration::DefinitionView& view : migration::definitionsOf(schema, reading)) {
    text += view.title() + ":";
    for (const migration::ClauseText& clause : view.clauses()) {
      text += " " + clause.text();
    }
    text += " -> " + placeOf(view.entry()) + "\n";
  }
  return text;
}

TEST(Definitions, AreThoseThatAreKeptOrThoseThatAreWritten) {
  const Installation schema = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1 NAME ( 'a' 'b' ) DESC 'd' )\n"
        "attributetypes=( 1.2 NAME 'late' DESC 'd'\n"
        "attributetypes=( 1.3 NAME 'later' DESC 'd' )\n"},
       {"V3.user.oc", "objectclasses=( 1.4 NAME 'c' AUXILIARY MUST ( a $ b ) )\n"}},
      "", "old");
  EXPECT_EQ(
      "attribute type a (1.1): NAME ( 'a' 'b' ) DESC 'd' USAGE userApplications -> V3.user.at:1\n"
      "object class c (1.4): NAME 'c' AUXILIARY MUST ( a $ b ) -> V3.user.oc:1\n",
      viewsOf(schema, migration::Reading::kKept));
  EXPECT_EQ(
      "attribute type a (1.1): NAME ( 'a' 'b' ) DESC 'd' -> V3.user.at:1\n"
      "attribute type late (1.2): NAME 'late' DESC 'd' -> none\n"
      "attribute type later (1.3): NAME 'later' DESC 'd' -> none\n"
      "object class c (1.4): NAME 'c' AUXILIARY MUST ( a $ b ) -> V3.user.oc:1\n",
      viewsOf(schema, migration::Reading::kWritten));
}

class Directory : public testing::Test {
 protected:
  Directory() : m_path(testing::TempDir() + "model-XXXXXX") {
    EXPECT_NE(nullptr, ::mkdtemp(m_path.data()));
  }
  ~Directory() override { std::filesystem::remove_all(m_path); }

  void write(const std::string& name, const std::string& text) const {
    std::ofstream(m_path + "/" + name) << text;
  }
  std::string read(std::uint64_t limit) const {
    Failures failures;
    migration::ReadLimits limits;
    limits.bytes = limit;
    const Installation schema = Installation::fromDirectory(m_path, limits, &failures);
    std::string text;
    for (const migration::SchemaFile& file : schema.files()) {
      text += file.name + " " + std::to_string(file.source->bytes().size()) + "\n";
    }
    for (const std::string& name : schema.otherFiles()) {
      text += "other " + name + "\n";
    }
    for (Failure& failure : failures) {
      text += failure.file.substr(m_path.size()) + ": " + failure.text + "\n";
    }
    return text;
  }

  std::string m_path;
};

TEST_F(Directory, IsReadInTheOrderOfReading) {
  write("V3.user.at", "# u\n");
  write("V3.modifiedschema", "");
  write("V3.system.oc", "# system\n");
  write("v3.user.oc", "# u\n");
  write("V3.user.at.old", "# u\n");
  write("README", "");
  EXPECT_EQ(
      "V3.modifiedschema 0\nV3.system.oc 9\nV3.user.at 4\nother V3.user.at.old\nother "
      "v3.user.oc\n",
      read(100));
}

TEST_F(Directory, LimitIsOfAllFilesTogether) {
  write("V3.system.at", "# 45\n");
  write("V3.user.at", "# 4567\n");
  write("V3.user.oc", "# 45\n");
  EXPECT_EQ("V3.system.at 5\nV3.user.at 7\nV3.user.oc 5\n", read(17));
  EXPECT_EQ(
      "V3.system.at 5\nV3.user.oc 5\n/V3.user.at: with this file the inputs have more than 11 bytes "
      "in all\n",
      read(11));
}

TEST_F(Directory, NothingButRegularFilesIsOpened) {
  ASSERT_EQ(0, ::mkfifo((m_path + "/V3.user.at").c_str(), 0600));
  ASSERT_EQ(0, ::mkdir((m_path + "/V3.user.oc").c_str(), 0700));
  ASSERT_EQ(0, ::symlink("/dev/zero", (m_path + "/V3.orv.at").c_str()));
  ASSERT_EQ(0, ::symlink("nowhere", (m_path + "/V3.orv.oc").c_str()));
  EXPECT_EQ(
      "/V3.orv.at: cannot be read: it is a device\n"
      "/V3.orv.oc: cannot be read: No such file or directory\n"
      "/V3.user.at: cannot be read: it is a FIFO\n"
      "/V3.user.oc: cannot be read: it is a directory\n",
      read(100));
}

TEST_F(Directory, ThatIsMissingOrHasNoSchemaFileIsAFailure) {
  EXPECT_EQ(
      ": no V3.* schema file in the directory; name the directory that holds V3.system.at and its "
      "like\n",
      read(100));
  std::filesystem::remove(m_path);
  EXPECT_EQ(": the directory cannot be read: No such file or directory\n", read(100));
}

TEST(Texts, LimitIsOfAllTogether) {
  Failures failures;
  migration::ReadLimits limits;
  limits.bytes = 9;
  const Installation schema = Installation::fromTexts(
      "d", {{"V3.user.oc", "# 3\n"}, {"V3.user.at", "# 34567\n"}}, limits, &failures);
  EXPECT_EQ(1U, schema.files().size());
  EXPECT_TRUE(schema.hasFile("V3.user.oc"));
  EXPECT_EQ("d/V3.user.oc: with this file the inputs have more than 9 bytes in all\n",
            textOf(failures));
}

std::string inherited(const Installation& schema, Kind kind, const char* name) {
  std::string text;
  for (const Inherited& each : inheritedBy(schema, *schema.find(kind, name))) {
    text += std::string(keywordOf(each.clause)) + " " + each.value + " from " +
            each.from->kept->object->namesInPlace().front() + "; ";
  }
  return text;
}

TEST(Inheritance, OfAttributeTypesIsTheNearest) {
  const Installation schema = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1 NAME 'a' EQUALITY e SUBSTR s SYNTAX 1.5{9} )\n"
        "attributetypes=( 1.2 NAME 'b' SUP a EQUALITY f )\n"
        "attributetypes=( 1.3 NAME 'c' SUP B SUBSTR t )\n"
        "attributetypes=( 1.4 NAME 'l' SUP m )\nattributetypes=( 1.5 NAME 'm' SUP l ORDERING o )\n"}},
      "", "old");
  EXPECT_EQ("EQUALITY f from b; SYNTAX 1.5{9} from a; ",
            inherited(schema, Kind::kAttributeType, "c"));
  EXPECT_EQ("ORDERING o from m; ", inherited(schema, Kind::kAttributeType, "l"));
}

TEST(Inheritance, OfClassesIsEachMemberOnce) {
  const Installation schema = support::installationOf(
      {{"V3.user.oc",
        "objectclasses=( 2.0 NAME 'top' ABSTRACT MUST ( k ) )\n"
        "objectclasses=( 2.1 NAME 'p' SUP top STRUCTURAL MUST ( a $ b ) MAY ( c ) )\n"
        "objectclasses=( 2.2 NAME 'q' SUP p STRUCTURAL MUST ( A ) MAY ( b $ d ) )\n"}},
      "", "old");
  EXPECT_EQ("MUST b from p; MUST k from top; MAY c from p; ",
            inherited(schema, Kind::kObjectClass, "q"));
}

void append(const SuperiorTree& tree, std::size_t node, const std::string& indent,
            std::string* text) {
  *text += indent + tree.nodes[node].entry->kept->object->getFirstName() + "\n";
  for (const std::size_t below : tree.nodes[node].below) {
    append(tree, below, indent + " ", text);
  }
}

TEST(Tree, HasEachBelowItsSuperiorsAndNoLoop) {
  const Installation schema = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1 NAME 'z' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' SUP z )\n"
        "attributetypes=( 1.3 NAME 'a' SUP z )\nattributetypes=( 1.4 NAME 'l' SUP m )\n"
        "attributetypes=( 1.5 NAME 'm' SUP l )\nattributetypes=( 1.6 NAME 'lone' SUP gone )\n"}},
      "", "old");
  const SuperiorTree tree = superiorTree(schema, Kind::kAttributeType);
  std::string text;
  for (const std::size_t root : tree.roots) {
    append(tree, root, "", &text);
  }
  EXPECT_EQ("lone\nm\n l\nz\n a\n b\n", text);
}

TEST(NearestNames, AreTheMostAlike) {
  const Installation schema = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1.1 NAME ( 'telephoneNumber' 'phone' ) DESC 'd' )\n"
        "attributetypes=( 1.1.2 NAME 'telexNumber' DESC 'd' )\n"}},
      "", "old");
  EXPECT_EQ(std::vector<std::string>({"telephoneNumber", "telexNumber"}),
            nearestNames(schema, "telefoneNumber"));
  EXPECT_EQ(std::vector<std::string>({"telephoneNumber"}),
            nearestNames(schema, "telefoneNumber", 1));
  EXPECT_EQ(std::vector<std::string>({"phone"}), nearestNames(schema, "PHONEE"));
  EXPECT_EQ(std::vector<std::string>({"phone"}), nearestNames(schema, "pohne"));
  EXPECT_EQ(std::vector<std::string>({"1.1.1", "1.1.2"}), nearestNames(schema, "1.1.3"));
  EXPECT_EQ(std::vector<std::string>(), nearestNames(schema, "mail"));
}

TEST(Compare, DefinitionsOfTwoKindsAreNeverEqual) {
  const Installation schema =
      support::installationOf({{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"},
                               {"V3.user.oc", "objectclasses=( 1.1 NAME 'a' DESC 'd' )\n"},
                               {"V3.orv.at", "ORVAttributetypes=( 1.1 )\n"}},
                              "", "old");
  for (const Entry& left : schema.entries()) {
    for (const Entry& right : schema.entries()) {
      EXPECT_EQ(&left == &right, migration::areEqual(*left.kept, *right.kept))
          << placeOf(&left) << " " << placeOf(&right);
    }
  }
}

TEST(Compare, PairsByOidBeforeName) {
  const Installation left = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
        "attributetypes=( 1.3 NAME 'c' DESC 'd' )\nattributetypes=( 1.4 NAME 'd' DESC 'd' )\n"}},
      "", "old");
  const Installation right = support::installationOf(
      {{"V3.user.at",
        "attributetypes=( 1.1 NAME 'A' DESC 'd' )\nattributetypes=( 1.2 NAME 'c' DESC 'd' )\n"
        "attributetypes=( 1.9 NAME 'D' DESC 'd' )\nattributetypes=( 1.8 NAME 'e' DESC 'd' )\n"}},
      "", "new");
  std::string text;
  for (const Compared& pair : compare(left, right)) {
    text += std::to_string(static_cast<int>(pair.result)) + " " + placeOf(pair.left) + " " +
            placeOf(pair.right) + "\n";
  }
  EXPECT_EQ(
      "0 V3.user.at:1 V3.user.at:1\n1 V3.user.at:2 V3.user.at:2\n2 V3.user.at:3 none\n"
      "1 V3.user.at:4 V3.user.at:3\n3 none V3.user.at:4\n",
      text);
}

}  // namespace
