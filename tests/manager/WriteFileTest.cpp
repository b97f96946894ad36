// Writing a file's OID set, and any set, back as a schema file.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <set>
#include <string>

#include "Calls.h"
#include "Files.h"
#include "FixedClock.h"
#include "Installation.h"

using namespace support;

namespace {

const std::string kHeader = kHeaderLine;

std::string attributeLine(const std::string& oid, const std::string& name) {
  return "attributetypes=( " + oid + " NAME ( '" + name +
         "'  )  DESC 'text' USAGE userApplications  )\n";
}

std::string classLine(const std::string& oid, const std::string& name) {
  return "objectclasses=( " + oid + " NAME '" + name + "'  DESC 'text' STRUCTURAL )\n";
}

std::string extensionLine(const std::string& oid) {
  return "ORVAttributetypes=( " + oid +
         " DBNAME ( 'column' 'column'  ) ACCESS-CLASS normal LENGTH 9 EQUALITY )\n";
}

}  // namespace

TEST(WriteFile, SevenNamesEachWithItsSet) {
  Installation installation{{"V3.user.oc", objectClass("1.1", "one")},
                            {"V3.user.at", attributeType("1.2", "two")},
                            {"V3.orv.oc", objectClass("1.3", "three")},
                            {"V3.orv.at", attributeType("1.4", "four") + vendorExtension("1.4")},
                            {"V3.system.oc", objectClass("1.5", "five")},
                            {"V3.system.at", attributeType("1.6", "six")},
                            {"V3.modifiedschema", attributeType("1.7", "seven")},
                            {"V3.config.at", attributeType("1.8", "eight")},
                            {"V3.config.oc", objectClass("1.9", "nine")}};
  const std::pair<const char*, std::string> rows[] = {
      {"V3.user.oc", classLine("1.1", "one")},
      {"V3.user.at", attributeLine("1.2", "two")},
      {"V3.orv.oc", classLine("1.3", "three")},
      {"V3.orv.at", attributeLine("1.4", "four") + extensionLine("1.4")},
      {"V3.system.oc", classLine("1.5", "five")},
      {"V3.system.at", attributeLine("1.6", "six")},
      {"V3.modifiedschema", attributeLine("1.7", "seven")},
  };
  for (const auto& [file, definitions] : rows) {
    const TemporaryDirectory directory;
    EXPECT_EQ(installation->writeFile(directory.path(), file), 0);
    EXPECT_EQ(readWholeFile(directory.file(file)), kHeader + definitions) << file;
  }
}

TEST(WriteFile, AnyOtherNameIs89AndNothingIsWritten) {
  Installation installation{{"V3.config.at", attributeType("1.1", "a")}};
  const TemporaryDirectory directory;
  for (const char* file : {"V3.config.at", "V3.config.oc", "V3.User.at", "V3.user", "V3.user.at ",
                           "./V3.user.at", "attr"}) {
    SCOPED_TRACE(file);
    directory.write(file, "untouched");
    int result = -1;
    EXPECT_EQ(messagesOf([&] { result = installation->writeFile(directory.path(), file); }),
              "writeFile: Unexpected file name given, " + std::string(file) + "\n");
    EXPECT_EQ(result, 89);
    EXPECT_EQ(readWholeFile(directory.file(file)), "untouched");
  }
  EXPECT_EQ(installation->writeFile(directory.path(), ""), 89);
}

TEST(WriteFile, DirectoryIsJoinedWithASlashWhateverItsEnd) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  const TemporaryDirectory directory;
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation->writeFile("/no such", "V3.user.at"); }),
            "writeSetToFile: Unable to open file for writing, /no such/V3.user.at.\n");
  EXPECT_EQ(result, 1);
  EXPECT_EQ(messagesOf([&] { result = installation->writeFile("/no such/", "V3.user.at"); }),
            "writeSetToFile: Unable to open file for writing, /no such//V3.user.at.\n");
  EXPECT_EQ(result, 1);
  EXPECT_EQ(installation->writeFile(directory.path() + "/", "V3.user.at"), 0);
  EXPECT_EQ(readWholeFile(directory.file("V3.user.at")), kHeader + attributeLine("1.1", "a"));
}

TEST(WriteFile, DoesNotWriteToTheDirectoryThatWasRead) {
  const std::string text = attributeType("1.1", "a");
  Installation installation{{"V3.user.at", text}};
  writtenFile(installation.manager(), "V3.user.at");
  EXPECT_EQ(readWholeFile(installation.path() + "/V3.user.at"), text);
}

TEST(WriteFile, EmptySetEmptiesTheFile) {
  Installation installation;
  const TemporaryDirectory directory;
  directory.write("V3.user.at", "what was there");
  EXPECT_EQ(installation->writeFile(directory.path(), "V3.user.at"), 0);
  EXPECT_EQ(readWholeFile(directory.file("V3.user.at")), "");
}

TEST(WriteFile, LongerFileIsTruncated) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  const TemporaryDirectory directory;
  directory.write("V3.user.at", std::string(10000, 'x'));
  EXPECT_EQ(installation->writeFile(directory.path(), "V3.user.at"), 0);
  EXPECT_EQ(readWholeFile(directory.file("V3.user.at")), kHeader + attributeLine("1.1", "a"));
}

TEST(WriteFile, LeavesTheManagerAsItIs) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")}};
  const std::string state = stateOf(installation.manager());
  const std::string once = writtenFile(installation.manager(), "V3.user.at");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"), once);
  EXPECT_EQ(stateOf(installation.manager()), state);
}

TEST(WriteFile, CallsAndExitCodes) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1") +
                                               attributeType("1.2", "b") +
                                               objectClass("1.3", "c")}};
  const TemporaryDirectory directory;
  EXPECT_EQ(callsOf([&] { installation->writeFile(directory.path(), "V3.user.at"); }),
            "writeFile{writeSetToFile{Attribute.dump getORVAttr ORVAttribute.dump Attribute.dump "
            "ObjectClass.dump}}");
  EXPECT_EQ(callsOf([&] { installation->writeFile(directory.path(), "V3.user.oc"); }),
            "writeFile{writeSetToFile}");
  EXPECT_EQ(callsOf([&] { installation->writeFile(directory.path(), "V3.config.at"); }),
            "writeFile=89");
  EXPECT_EQ(callsOf([&] { installation->writeFile("/no such", "V3.user.at"); }),
            "writeFile{writeSetToFile=1}=1");
}

// ---- writeSetToFile ----

TEST(WriteSetToFile, DefinitionsInByteOrderOfTheOids) {
  Installation installation{
      {"V3.user.at", attributeType("1.2.6", "six") + attributeType("1.2.10", "ten") +
                         objectClass("1.2.2", "two") + attributeType("B", "upper") +
                         attributeType("a", "lower")}};
  EXPECT_EQ(writtenFor(installation.manager(), {"1.2.6", "a", "1.2.10", "B", "1.2.2"}),
            kHeader + attributeLine("1.2.10", "ten") + classLine("1.2.2", "two") +
                attributeLine("1.2.6", "six") + attributeLine("B", "upper") +
                attributeLine("a", "lower"));
}

TEST(WriteSetToFile, ObjectClassGoesBeforeAttributeTypeOfTheSameOid) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                            {"V3.user.oc", objectClass("1.1", "c")}};
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"), kHeader + classLine("1.1", "c"));
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.oc"), kHeader + classLine("1.1", "c"));
}

TEST(WriteSetToFile, VendorExtensionFollowsItsAttributeTypeWhateverTheFile) {
  Installation installation{{"V3.system.at", attributeType("1.1", "a") + attributeType("1.2", "b")},
                            {"V3.orv.at", vendorExtension("1.1")}};
  EXPECT_EQ(writtenFile(installation.manager(), "V3.system.at"),
            kHeader + attributeLine("1.1", "a") + extensionLine("1.1") + attributeLine("1.2", "b"));
  EXPECT_EQ(writtenFile(installation.manager(), "V3.orv.at"),
            kHeader + attributeLine("1.1", "a") + extensionLine("1.1"));
}

TEST(WriteSetToFile, VendorExtensionWithoutAttributeTypeIsNotWritten) {
  Installation installation{{"V3.orv.at", vendorExtension("1.1") + vendorExtension("1.2")},
                            {"V3.system.at", attributeType("1.2", "b")},
                            {"V3.system.oc", objectClass("1.1", "c")}};
  EXPECT_EQ(writtenFile(installation.manager(), "V3.orv.at"),
            kHeader + classLine("1.1", "c") + attributeLine("1.2", "b") + extensionLine("1.2"));
  Installation alone{{"V3.orv.at", vendorExtension("1.1")}};
  std::string written;
  EXPECT_EQ(messagesOf([&] { written = writtenFile(alone.manager(), "V3.orv.at"); }), "");
  EXPECT_EQ(written, kHeader);
}

TEST(WriteSetToFile, UnknownOidIsPassedOver) {
  Installation installation{{"V3.user.at", attributeType("1.2", "b")}};
  std::string written;
  EXPECT_EQ(messagesOf([&] { written = writtenFor(installation.manager(), {"1.1"}); }), "");
  EXPECT_EQ(written, kHeader);
  EXPECT_EQ(writtenFor(installation.manager(), {"1.1", "1.2", "1.20"}),
            kHeader + attributeLine("1.2", "b"));
}

TEST(WriteSetToFile, NamesAreNoOids) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + objectClass("1.2", "c")}};
  EXPECT_EQ(writtenFor(installation.manager(), {"a", "c"}), kHeader);
}

TEST(WriteSetToFile, SetOfTheCallerStaysAsItIs) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  const TemporaryDirectory directory;
  std::set<std::string> oids = {"1.1", "unknown"};
  EXPECT_EQ(installation->writeSetToFile(oids, directory.file("any")), 0);
  EXPECT_EQ(oids, (std::set<std::string>{"1.1", "unknown"}));
  EXPECT_EQ(readWholeFile(directory.file("any")), kHeader + attributeLine("1.1", "a"));
}

TEST(WriteSetToFile, DirectoryInPlaceOfTheFileIs1) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  const TemporaryDirectory directory;
  ASSERT_EQ(::mkdir(directory.file("V3.user.at").c_str(), 0755), 0);
  int result = -1;
  EXPECT_EQ(
      messagesOf([&] { result = installation->writeFile(directory.path(), "V3.user.at"); }),
      "writeSetToFile: Unable to open file for writing, " + directory.file("V3.user.at") + ".\n");
  EXPECT_EQ(result, 1);
}

TEST(WriteSetToFile, FailureToWriteIsNotDetected) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  EXPECT_EQ(installation->writeSetToFile({"1.1"}, "/dev/full"), 0);
}

// ---- Written and read again ----

TEST(WriteFile, WrittenFileReadsBackTheSame) {
  Installation installation{
      {"V3.user.at",
       "attributetypes=( 1.1 NAME ( 'One' 'uno' ) DESC 'd, e' OBSOLETE SUP name EQUALITY eq "
       "ORDERING or SUBSTR su SYNTAX 1.5{32} SINGLE-VALUE NO-USER-MODIFICATION USAGE "
       "directoryOperation )\n"
       "ORVAttributetypes=( 1.1 DBNAME ( 'one' 'uno' ) ACCESS-CLASS critical LENGTH 256 EQUALITY "
       "ORDERING SUBSTR APPROX REVERSE )\n"
       "objectclasses=( 2.1 NAME ( 'Two' 'dos' ) DESC 'f' OBSOLETE SUP ( a $ b ) AUXILIARY MUST ( "
       "objectClasses $ c ) MAY ( attributeTypes $ e ) )\n"
       "objectclasses=( 2.2 NAME 'three' ABSTRACT )\n"}};
  const std::string written = writtenFile(installation.manager(), "V3.user.at");
  EXPECT_EQ(
      written,
      kHeader +
          "attributetypes=( 1.1 NAME ( 'One' 'uno'  )  DESC 'd, e' OBSOLETE SUP name EQUALITY eq ORDERING or SUBSTR su SYNTAX 1.5{32} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation  )\n"
          "ORVAttributetypes=( 1.1 DBNAME ( 'one' 'uno'  ) ACCESS-CLASS critical LENGTH 256 EQUALITY ORDERING SUBSTR APPROX REVERSE )\n"
          "objectclasses=( 2.1 NAME ( 'Two' 'dos'  )  DESC 'f' OBSOLETE SUP ( a $ b ) AUXILIARY MUST ( objectclasses $ c ) MAY ( attributetypes $ e ) )\n"
          "objectclasses=( 2.2 NAME 'three' ABSTRACT )\n");
  Installation again{{"V3.user.at", written}};
  EXPECT_EQ(stateOf(again.manager()), stateOf(installation.manager()));
  EXPECT_EQ(writtenFile(again.manager(), "V3.user.at"), written);
}
