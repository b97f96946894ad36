#include "GeneratedDirectory.h"

#include <cstddef>

#include "ManagerTables.h"

namespace properties {

namespace {

constexpr const char* kFiles[] = {
    "V3.user.at", "V3.user.oc",   "V3.system.at",      "V3.system.oc", "V3.orv.at",   "V3.orv.oc",
    "V3.user.at", "V3.system.at", "V3.modifiedschema", "V3.config.at", "V3.config.oc"};
constexpr const char* kOids[] = {"1.1", "1.2", "1.3", "1.10", "1.20", "site-oid", "1.1.1", ""};
constexpr const char* kNames[] = {"cn",  "CN",  "commonName", "sn",  "Surname",
                                  "top", "Top", "person",     "1.2", "site-oid"};
constexpr const char* kAttributeClauses[] = {
    "DESC 'as it was' SYNTAX 1.3.6{32}", "DESC 'As it was' SYNTAX 1.3.6{32}",
    "EQUALITY caseIgnoreMatch SINGLE-VALUE", "SUP name OBSOLETE", "USAGE directoryOperation"};
constexpr const char* kClassClauses[] = {"DESC 'as it was' SUP top STRUCTURAL MUST ( cn $ sn )",
                                         "DESC 'as it was' SUP TOP STRUCTURAL MUST ( sn $ cn )",
                                         "AUXILIARY MAY ( cn $ cn )", "AUXILIARY MAY ( cn $ sn )",
                                         "ABSTRACT OBSOLETE"};
constexpr const char* kExtensionClauses[] = {"ACCESS-CLASS normal LENGTH 9 EQUALITY",
                                             "ACCESS-CLASS Normal LENGTH 9 EQUALITY",
                                             "ACCESS-CLASS critical", "LENGTH 09 APPROX", ""};

const char* clausesFor(GeneratedDefinition::Kind kind, Choices* choices) {
  switch (kind) {
    case GeneratedDefinition::kAttribute:
      return choices->oneOf(kAttributeClauses);
    case GeneratedDefinition::kClass:
      return choices->oneOf(kClassClauses);
    case GeneratedDefinition::kExtension:
      break;
  }
  return choices->oneOf(kExtensionClauses);
}

GeneratedDefinition anyDefinition(Choices* choices) {
  GeneratedDefinition definition;
  definition.kind = static_cast<GeneratedDefinition::Kind>(choices->below(3));
  definition.file = choices->oneOf(kFiles);
  definition.oid = choices->oneOf(kOids);
  for (unsigned count = (choices->below(8) + 1) / 3; count > 0; --count) {
    definition.names.emplace_back(choices->oneOf(kNames));
  }
  definition.clauses = clausesFor(definition.kind, choices);
  return definition;
}

// Definitions of one kind that have nothing to do with the others, for tables that are not small.
void addMany(Choices* choices, GeneratedDirectory* directory) {
  const auto kind = static_cast<GeneratedDefinition::Kind>(choices->below(3));
  const char* const file = choices->oneOf(kFiles);
  const char* const clauses = clausesFor(kind, choices);
  for (unsigned number = 10; number < 40; ++number) {
    const std::string digits = std::to_string(number);
    directory->push_back({kind, file, "1." + digits + ".0", {"many" + digits}, clauses});
  }
}

std::string quotedNames(const std::vector<std::string>& names) {
  std::string text;
  for (const std::string& name : names) {
    text += "'" + name + "' ";
  }
  return text;
}

// Every one is closed by a clause behind its names.
std::string textOf(const GeneratedDefinition& definition) {
  const std::string names = "( " + quotedNames(definition.names) + ") ";
  switch (definition.kind) {
    case GeneratedDefinition::kAttribute:
      return "attributetypes=( " + definition.oid + " NAME " + names + definition.clauses + " )\n";
    case GeneratedDefinition::kClass:
      return "objectclasses=( " + definition.oid + " NAME " + names + definition.clauses + " )\n";
    case GeneratedDefinition::kExtension:
      break;
  }
  return "ORVAttributetypes=( " + definition.oid + " DBNAME " + names + definition.clauses + " )\n";
}

}  // namespace

GeneratedDirectory anyDirectory(Choices* choices) {
  GeneratedDirectory directory;
  for (unsigned count = choices->below(13); count > 0; --count) {
    directory.push_back(anyDefinition(choices));
  }
  if (choices->below(8) == 7) {
    addMany(choices, &directory);
  }
  return directory;
}

GeneratedDirectory relativeOf(const GeneratedDirectory& directory, Choices* choices) {
  GeneratedDirectory relative;
  const bool isThin = choices->below(4) == 3;
  std::size_t number = 0;
  for (GeneratedDefinition definition : directory) {
    if (isThin && ++number % 12 != 0) {
      continue;
    }
    switch (choices->below(10)) {
      case 0:
        continue;
      case 1:
        definition.clauses = clausesFor(definition.kind, choices);
        break;
      case 2:
        definition.oid = choices->oneOf(kOids);
        break;
      case 3:
        definition.names.assign(1, choices->oneOf(kNames));
        break;
      case 4:
        definition.names.emplace_back(choices->oneOf(kNames));
        break;
      case 5:
        definition.file = choices->oneOf(kFiles);
        break;
      default:
        break;
    }
    relative.push_back(definition);
  }
  for (unsigned count = choices->below(4); count > 0; --count) {
    relative.push_back(anyDefinition(choices));
  }
  return relative;
}

GeneratedDirectory consistentDirectory(Choices* choices) {
  GeneratedDirectory directory;
  for (unsigned number = 1; number <= 12; ++number) {
    const std::string digits = std::to_string(number);
    const auto kind =
        number % 3 == 0 ? GeneratedDefinition::kClass : GeneratedDefinition::kAttribute;
    if (choices->below(3) != 0) {
      directory.push_back({kind,
                           choices->oneOf(kFileNames),
                           "1.3." + digits,
                           {"name" + digits, "alias" + digits},
                           clausesFor(kind, choices)});
    }
    if (kind == GeneratedDefinition::kAttribute && choices->below(2) != 0) {
      directory.push_back({GeneratedDefinition::kExtension,
                           choices->oneOf(kFileNames),
                           "1.3." + digits,
                           {"column" + digits, "column" + digits},
                           clausesFor(GeneratedDefinition::kExtension, choices)});
    }
  }
  return directory;
}

std::map<std::string, std::string> filesOf(const GeneratedDirectory& directory) {
  std::map<std::string, std::string> files;
  for (const GeneratedDefinition& definition : directory) {
    files[definition.file] += textOf(definition);
  }
  return files;
}

std::string anyOidList(Choices* choices) {
  std::string list;
  for (unsigned count = choices->below(5); count > 0; --count) {
    list += choices->oneOf(kOids);
    list += choices->below(4) == 0 ? " # a remark\n" : "\n";
  }
  return list;
}

}  // namespace properties
