#include "Agreement.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>
#include <vector>

namespace agreement {

namespace {

using migration::Clause;
using migration::Kind;

// One definition, in the form in which both readings are written down.
class Line {
 public:
  Line(Kind kind, bool isExact) : m_text(nameOf(kind)), m_isExact(isExact) {}

  void add(const char* label, const std::vector<std::string>& values) {
    m_text += std::string(" ") + label;
    for (const std::string& value : values) {
      m_text += "|" + (m_isExact ? value : folded(value));
    }
  }
  void add(const char* label, const std::string& value) {
    add(label, std::vector<std::string>{value});
  }
  void add(const char* label, bool isSet) { m_text += isSet ? std::string(" ") + label : ""; }
  std::string text() const { return m_text + "\n"; }

 private:
  static std::string folded(std::string value) {
    for (const char* const word : {"objectClasses", "attributeTypes", "ORVattributeTypes"}) {
      if (value == word) {
        return word[0] == 'O'   ? "ORVAttributetypes"
               : word[0] == 'o' ? "objectclasses"
                                : "attributetypes";
      }
    }
    return value;
  }

  std::string m_text;
  bool m_isExact;
};

class WrittenFields {
 public:
  WrittenFields(const migration::WrittenFile& file, const migration::WrittenDefinition& definition)
      : m_file(file), m_definition(definition) {}

  std::vector<std::string> list(Clause clause) const {
    std::vector<std::string> values;
    for (const migration::WrittenClause& candidate : m_file.clausesOf(m_definition)) {
      for (const migration::WrittenValue& value : m_file.valuesOf(candidate)) {
        if (candidate.clause == clause) {
          values.push_back(value.form == migration::Form::kNumber ? value.text()
                                                                  : std::string(value.raw));
        }
      }
    }
    return values;
  }
  // A value that is given again letter for letter is the same value.
  std::vector<std::string> one(Clause clause, const char* without) const {
    std::vector<std::string> values = list(clause);
    values.erase(std::unique(values.begin(), values.end()), values.end());
    return values.empty() ? std::vector<std::string>{without} : values;
  }
  bool has(Clause clause) const { return m_file.find(m_definition, clause) != nullptr; }

  // The clauses that there is no field for.
  std::vector<std::string> others(Kind kind) const;

 private:
  const migration::WrittenFile& m_file;
  const migration::WrittenDefinition& m_definition;
};

constexpr std::array<Clause, 13> kOfAttributeTypes = {
    Clause::kOid,    Clause::kName,        Clause::kDesc,       Clause::kObsolete,
    Clause::kSup,    Clause::kEquality,    Clause::kOrdering,   Clause::kSubstr,
    Clause::kSyntax, Clause::kSingleValue, Clause::kCollective, Clause::kNoUserModification,
    Clause::kUsage};
constexpr std::array<Clause, 10> kOfClasses = {
    Clause::kOid,        Clause::kName,      Clause::kDesc,     Clause::kObsolete, Clause::kSup,
    Clause::kStructural, Clause::kAuxiliary, Clause::kAbstract, Clause::kMust,     Clause::kMay};
constexpr std::array<Clause, 9> kOfExtensions = {
    Clause::kOid,      Clause::kDbName, Clause::kAccessClass, Clause::kLength, Clause::kEquality,
    Clause::kOrdering, Clause::kSubstr, Clause::kApprox,      Clause::kReverse};

template <typename Clauses>
bool isAmong(const Clauses& clauses, Clause clause) {
  return std::find(clauses.begin(), clauses.end(), clause) != clauses.end();
}

std::vector<std::string> WrittenFields::others(Kind kind) const {
  std::vector<std::string> words;
  for (const migration::WrittenClause& clause : m_file.clausesOf(m_definition)) {
    const bool isKnown = kind == Kind::kAttributeType ? isAmong(kOfAttributeTypes, clause.clause)
                         : kind == Kind::kObjectClass ? isAmong(kOfClasses, clause.clause)
                                                      : isAmong(kOfExtensions, clause.clause);
    // The OID once more says nothing new.
    const bool isOid = clause.clause == Clause::kUnknown && clause.valueCount == 0 &&
                       list(Clause::kOid) == std::vector<std::string>{std::string(clause.keyword)};
    if (!isKnown && !isOid) {
      words.emplace_back(clause.keyword);
    }
  }
  return words;
}

std::string kindOfClass(const WrittenFields& fields) {
  std::string kinds;
  kinds += fields.has(Clause::kStructural) ? "STRUCTURAL" : "";
  kinds += fields.has(Clause::kAuxiliary) ? "AUXILIARY" : "";
  kinds += fields.has(Clause::kAbstract) ? "ABSTRACT" : "";
  return kinds.empty() ? "STRUCTURAL" : kinds;
}

void add(const WrittenFields& fields, Kind kind, Line* line) {
  line->add("oid", fields.one(Clause::kOid, ""));
  switch (kind) {
    case Kind::kAttributeType:
      line->add("names", fields.list(Clause::kName));
      line->add("desc", fields.one(Clause::kDesc, ""));
      line->add("obsolete", fields.has(Clause::kObsolete));
      line->add("sup", fields.list(Clause::kSup));
      line->add("equality", fields.one(Clause::kEquality, ""));
      line->add("ordering", fields.one(Clause::kOrdering, ""));
      line->add("substr", fields.one(Clause::kSubstr, ""));
      line->add("syntax", fields.one(Clause::kSyntax, ""));
      line->add("single", fields.has(Clause::kSingleValue));
      line->add("collective", fields.has(Clause::kCollective));
      line->add("fixed", fields.has(Clause::kNoUserModification));
      line->add("usage", fields.one(Clause::kUsage, "userApplications"));
      break;
    case Kind::kObjectClass:
      line->add("names", fields.list(Clause::kName));
      line->add("desc", fields.one(Clause::kDesc, ""));
      line->add("obsolete", fields.has(Clause::kObsolete));
      line->add("sup", fields.list(Clause::kSup));
      line->add("kind", kindOfClass(fields));
      line->add("must", fields.list(Clause::kMust));
      line->add("may", fields.list(Clause::kMay));
      break;
    case Kind::kVendorExtension:
      line->add("dbnames", fields.list(Clause::kDbName));
      line->add("access", fields.one(Clause::kAccessClass, "normal"));
      line->add("length", fields.one(Clause::kLength, "0"));
      line->add("equality", fields.has(Clause::kEquality));
      line->add("ordering", fields.has(Clause::kOrdering));
      line->add("substr", fields.has(Clause::kSubstr));
      line->add("approx", fields.has(Clause::kApprox));
      line->add("reverse", fields.has(Clause::kReverse));
      break;
  }
  const std::vector<std::string> others = fields.others(kind);
  if (!others.empty()) {
    line->add("others", others);
  }
}

void add(const Attribute& attribute, Line* line) {
  line->add("names", attribute.namesInPlace());
  line->add("desc", attribute.descriptionInPlace());
  line->add("obsolete", attribute.getObsolete());
  line->add("sup", attribute.superiorsInPlace());
  line->add("equality", attribute.getEquality());
  line->add("ordering", attribute.getOrdering());
  line->add("substr", attribute.getSubstr());
  line->add("syntax", attribute.getSyntax());
  line->add("single", attribute.getSingleValue());
  line->add("collective", attribute.getCollective());
  line->add("fixed", !attribute.getUserModification());
  line->add("usage", attribute.getUsage());
}

void add(const ObjectClass& objectClass, Line* line) {
  line->add("names", objectClass.namesInPlace());
  line->add("desc", objectClass.descriptionInPlace());
  line->add("obsolete", objectClass.getObsolete());
  line->add("sup", objectClass.superiorsInPlace());
  line->add("kind", std::string(objectClass.getStructuralTypeName()));
  line->add("must", objectClass.reqAttrsInPlace());
  line->add("may", objectClass.optAttrsInPlace());
}

void add(const ORVAttribute& extension, Line* line) {
  line->add("dbnames", extension.getDbNames());
  line->add("access", extension.getAccessClass());
  line->add("length", extension.getLength());
  line->add("equality", extension.hasEquality());
  line->add("ordering", extension.hasOrdering());
  line->add("substr", extension.hasSubstr());
  line->add("approx", extension.hasApprox());
  line->add("reverse", extension.hasReverse());
}

// Errors at any rate, whether or not a definition is kept otherwise for them.
bool isErrorAnyway(const migration::Finding& finding) {
  constexpr std::array<std::string_view, 9> kRules = {"L101", "L105", "L107", "L108", "L109",
                                                      "D203", "D205", "D209", "D210"};
  // A section with nothing behind its "=" has no definition to be kept.
  return (finding.rule == "D204" && finding.definition.empty()) ||
         std::find(kRules.begin(), kRules.end(), finding.rule) != kRules.end();
}

std::string listed(const migration::Findings& findings) {
  std::string text;
  for (const migration::Finding& finding : findings) {
    text += std::to_string(finding.line) + ":" + std::to_string(finding.column) + " " +
            (finding.severity == migration::Severity::kError ? "error " : "warning ") +
            finding.rule + " " + finding.text + "\n";
  }
  return text;
}

}  // namespace

std::string linesOf(const migration::WrittenFile& file, bool isExact) {
  std::string text;
  for (const migration::WrittenDefinition& definition : file.definitions()) {
    Line line(definition.kind, isExact);
    add(WrittenFields(file, definition), definition.kind, &line);
    text += line.text();
  }
  return text;
}

std::string linesOf(const migration::KeptFile& file, bool isExact) {
  std::string text;
  for (const migration::KeptDefinition& definition : file.definitions()) {
    if (!definition.isEntered) {
      continue;
    }
    Line line(definition.kind, isExact);
    line.add("oid", definition.object->oidInPlace());
    if (definition.kind == Kind::kAttributeType) {
      add(definition.attribute(), &line);
    } else if (definition.kind == Kind::kObjectClass) {
      add(definition.objectClass(), &line);
    } else {
      add(definition.extension(), &line);
    }
    text += line.text();
  }
  return text + (file.ending() == migration::ReadingEnd::kWhole ? "" : "not read whole\n");
}

std::string brokenRule(const migration::SchemaFile& file, const migration::Findings& findings) {
  const bool hasFindings =
      std::any_of(findings.begin(), findings.end(),
                  [](const migration::Finding& finding) { return finding.rule != "L112"; });
  const auto isError = [](const migration::Finding& finding) {
    return finding.severity == migration::Severity::kError;
  };
  const bool hasErrors = std::any_of(findings.begin(), findings.end(), isError);
  const std::string written = linesOf(*file.written, !hasFindings);
  const std::string kept = linesOf(*file.kept, !hasFindings);
  const bool claimsDifference =
      std::any_of(findings.begin(), findings.end(), [&](const migration::Finding& finding) {
        return isError(finding) && !isErrorAnyway(finding);
      });
  // A definition with nothing in it looks like one that the reader has not looked into.
  const bool hasEmpty = std::any_of(
      file.written->definitions().begin(), file.written->definitions().end(),
      [](const migration::WrittenDefinition& definition) { return definition.clauseCount == 0; });
  const std::string exactWritten = linesOf(*file.written, true);
  const std::string exactKept = linesOf(*file.kept, true);
  std::string broken;
  if (!hasErrors && written != kept) {
    broken = "the readings differ, and nothing says so";
  } else if (claimsDifference && !hasEmpty && exactWritten == exactKept) {
    broken = "an error is told, and the readings agree";
  }
  return broken.empty() ? broken
                        : broken + "\n--- written\n" + exactWritten + "--- kept\n" + exactKept +
                              "--- findings\n" + listed(findings);
}

}  // namespace agreement
