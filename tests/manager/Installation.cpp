#include "Installation.h"

#include <gtest/gtest.h>

#include <set>
#include <utility>

namespace support {

namespace {

std::string shown(const std::string& text) { return text.empty() ? "''" : text; }

std::string valueAfter(const std::string& label, const std::vector<std::string>& lines,
                       std::size_t from) {
  for (std::size_t i = from; i < lines.size(); ++i) {
    const std::size_t start = lines[i].find(label);
    if (start != std::string::npos) {
      return lines[i].substr(start + label.size());
    }
  }
  return "no " + label;
}

constexpr std::size_t kHeadingLines = 3;

// The entries of a printed table: a line with a TAB begins one, with its key.
std::string entriesOf(const std::string& printed, bool isKeyedByOid, const std::string& detail) {
  std::vector<std::string> lines = splitLines(printed);
  std::string entries;
  for (std::size_t i = kHeadingLines; i < lines.size(); ++i) {
    const std::size_t tab = lines[i].find('\t');
    if (tab != std::string::npos) {
      const std::string oid = shown(valueAfter("oid --> ", lines, i));
      const std::string key = shown(lines[i].substr(0, tab));
      entries += " " + key + (isKeyedByOid && key == oid ? "" : "=" + oid);
      entries += "(" + valueAfter(detail, lines, i) + ")";
    }
  }
  return entries;
}

std::string line(const std::string& label, const std::string& entries) {
  return entries.empty() ? "" : label + ":" + entries + "\n";
}

std::string oidsOf(const std::string& printed) {
  std::vector<std::string> lines = splitLines(printed);
  std::string oids;
  for (std::size_t i = 1; i + 1 < lines.size(); ++i) {
    oids += " " + shown(lines[i]);
  }
  return oids;
}

template <typename Definition>
std::string found(Definition definition) {
  if (definition.getOid().empty() && definition.getNames().empty() &&
      definition.getDescription().empty()) {
    return "nothing";
  }
  return shown(definition.getFirstNameLower()) + "=" + shown(definition.getOid()) + "(" +
         definition.getDescription() + ")";
}

// Managers that share definitions after a failed merge are never destroyed; from here they stay
// reachable, which is no leak.
std::vector<SchemaManager*>& keptManagers() {
  static auto* kept = new std::vector<SchemaManager*>;
  return *kept;
}

}  // namespace

Installation::Installation(std::initializer_list<SchemaText> files)
    : Installation(std::vector<SchemaText>(files)) {}

Installation::Installation(const std::vector<SchemaText>& files)
    : m_manager(std::make_unique<SchemaManager>(m_directory.path())) {
  for (const SchemaText& file : files) {
    EXPECT_EQ(read(file.file, file.text), 0) << file.file << "\n" << file.text;
  }
}

std::string Installation::write(const std::string& name, const std::string& text) const {
  return m_directory.write(name, text);
}

int Installation::read(const std::string& file, const std::string& text) {
  m_directory.write(file, text);
  return m_manager->readFile(file);
}

void Installation::exclude(const std::vector<std::string>& oids) {
  std::string list;
  for (const std::string& oid : oids) {
    list += oid + "\n";
  }
  EXPECT_EQ(m_manager->readExcludedOids(write("excluded-oids.txt", list)), 0);
}

void Installation::keepForGood() { keptManagers().push_back(m_manager.release()); }

std::string attributeType(const std::string& oid, const std::string& name,
                          const std::string& description) {
  return "attributetypes=( " + oid + " NAME '" + name + "' DESC '" + description + "' )\n";
}

std::string objectClass(const std::string& oid, const std::string& name,
                        const std::string& description) {
  return "objectclasses=( " + oid + " NAME '" + name + "' DESC '" + description +
         "' STRUCTURAL )\n";
}

std::string vendorExtension(const std::string& oid, const std::string& access) {
  return "ORVAttributetypes=( " + oid + " DBNAME ( 'column' 'column' ) ACCESS-CLASS " + access +
         " LENGTH 9 EQUALITY )\n";
}

std::string tablesOf(SchemaManager* manager) {
  const std::string attributes = standardOutputOf([&] { manager->dumpAttrTable(); });
  const std::string classes = standardOutputOf([&] { manager->dumpOcTable(); });
  const std::string extensions = standardOutputOf([&] { manager->dumpORVAttrTable(); });
  // The heading of the object classes is one line shorter.
  return line("attributes", entriesOf(attributes, false, "description --> ")) +
         line("classes", entriesOf("\n" + classes, false, "description --> ")) +
         line("extensions", entriesOf(extensions, true, "accessClass --> "));
}

std::string setsOf(SchemaManager* manager) {
  const std::pair<const char*, void (SchemaManager::*)()> sets[] = {
      {"V3.user.oc", &SchemaManager::dumpUserOc},  {"V3.user.at", &SchemaManager::dumpUserAt},
      {"V3.orv.oc", &SchemaManager::dumpOrvOc},    {"V3.orv.at", &SchemaManager::dumpOrvAt},
      {"V3.system.oc", &SchemaManager::dumpSysOc}, {"V3.system.at", &SchemaManager::dumpSysAt},
  };
  std::string text;
  for (const auto& [name, print] : sets) {
    text += line(name, oidsOf(standardOutputOf([&, call = print] { (manager->*call)(); })));
  }
  return text;
}

std::string stateOf(SchemaManager* manager) { return tablesOf(manager) + setsOf(manager); }

std::string attributeUnder(SchemaManager* manager, const std::string& key) {
  return found(manager->getAttr(key));
}

std::string objectClassUnder(SchemaManager* manager, const std::string& key) {
  return found(manager->getObjClass(key));
}

std::string extensionUnder(SchemaManager* manager, const std::string& key) {
  ORVAttribute extension = manager->getORVAttr(key);
  const std::string printed = standardOutputOf([&] { extension.dump(); });
  const std::vector<std::string> lines = splitLines(printed);
  if (extension.getOid().empty() && valueAfter("names--> ", lines, 0).empty()) {
    return "nothing";
  }
  return shown(extension.getOid()) + "(" + valueAfter("accessClass --> ", lines, 0) + ")";
}

std::string takeFromModifiedSchema(SchemaManager* manager, const std::vector<std::string>& oids) {
  std::string taken;
  for (const std::string& oid : oids) {
    if (manager->delOidFromModSch(oid) == 0) {
      taken += (taken.empty() ? "" : " ") + oid;
    }
  }
  return taken;
}

std::string writtenFor(SchemaManager* manager, const std::vector<std::string>& oids) {
  const TemporaryDirectory directory;
  const std::string path = directory.file("written");
  EXPECT_EQ(manager->writeSetToFile(std::set<std::string>(oids.begin(), oids.end()), path), 0);
  return readWholeFile(path);
}

std::string writtenFile(SchemaManager* manager, const std::string& file) {
  const TemporaryDirectory directory;
  EXPECT_EQ(manager->writeFile(directory.path(), file), 0) << file;
  return readWholeFile(directory.file(file));
}

}  // namespace support
