#include "DefinitionView.h"

#include <algorithm>
#include <unordered_map>
#include <utility>

namespace migration {

namespace {

// Collects the clauses of a kept definition; what is empty or has its default is none.
class KeptClauses {
 public:
  void flag(Clause clause, bool isSet) {
    if (isSet) {
      m_clauses.push_back({clause, std::string(keywordOf(clause)), {}, false});
    }
  }

  void word(Clause clause, const std::string& value) {
    if (!value.empty()) {
      m_clauses.push_back({clause, std::string(keywordOf(clause)), {value}, false});
    }
  }

  void words(Clause clause, const std::vector<std::string>& values) {
    if (!values.empty()) {
      m_clauses.push_back({clause, std::string(keywordOf(clause)), values, values.size() != 1});
    }
  }

  void quoted(Clause clause, const std::vector<std::string>& values) {
    std::vector<std::string> texts;
    texts.reserve(values.size());
    for (const std::string& value : values) {
      texts.push_back("'" + value + "'");
    }
    words(clause, texts);
  }

  std::vector<ClauseText> take() && { return std::move(m_clauses); }

 private:
  std::vector<ClauseText> m_clauses;
};

std::vector<std::string> onlyOne(const std::string& text) {
  return text.empty() ? std::vector<std::string>() : std::vector<std::string>{text};
}

std::vector<ClauseText> clausesOf(const Attribute& type) {
  KeptClauses clauses;
  clauses.quoted(Clause::kName, type.namesInPlace());
  clauses.quoted(Clause::kDesc, onlyOne(type.descriptionInPlace()));
  clauses.flag(Clause::kObsolete, type.getObsolete());
  clauses.words(Clause::kSup, type.superiorsInPlace());
  clauses.word(Clause::kEquality, type.getEquality());
  clauses.word(Clause::kOrdering, type.getOrdering());
  clauses.word(Clause::kSubstr, type.getSubstr());
  clauses.word(Clause::kSyntax, type.getSyntax());
  clauses.flag(Clause::kSingleValue, type.getSingleValue());
  clauses.flag(Clause::kCollective, type.getCollective());
  clauses.flag(Clause::kNoUserModification, !type.getUserModification());
  clauses.word(Clause::kUsage, type.getUsage());
  return std::move(clauses).take();
}

std::vector<ClauseText> clausesOf(const ObjectClass& objectClass) {
  KeptClauses clauses;
  clauses.quoted(Clause::kName, objectClass.namesInPlace());
  clauses.quoted(Clause::kDesc, onlyOne(objectClass.descriptionInPlace()));
  clauses.flag(Clause::kObsolete, objectClass.getObsolete());
  clauses.words(Clause::kSup, objectClass.superiorsInPlace());
  const int type = objectClass.getStructuralType();
  clauses.flag(Clause::kStructural, type == KEY_STRUCTURAL);
  clauses.flag(Clause::kAuxiliary, type == KEY_AUXILIARY);
  clauses.flag(Clause::kAbstract, type == KEY_ABSTRACT);
  clauses.words(Clause::kMust, objectClass.reqAttrsInPlace());
  clauses.words(Clause::kMay, objectClass.optAttrsInPlace());
  return std::move(clauses).take();
}

std::vector<ClauseText> clausesOf(const ORVAttribute& extension) {
  KeptClauses clauses;
  clauses.quoted(Clause::kDbName, extension.getDbNames());
  clauses.word(Clause::kAccessClass, extension.getAccessClass());
  clauses.word(Clause::kLength, extension.getLength() == "0" ? "" : extension.getLength());
  clauses.flag(Clause::kEquality, extension.hasEquality());
  clauses.flag(Clause::kOrdering, extension.hasOrdering());
  clauses.flag(Clause::kSubstr, extension.hasSubstr());
  clauses.flag(Clause::kApprox, extension.hasApprox());
  clauses.flag(Clause::kReverse, extension.hasReverse());
  return std::move(clauses).take();
}

std::vector<ClauseText> clausesOf(const KeptDefinition& kept) {
  switch (kept.kind) {
    case Kind::kAttributeType:
      return clausesOf(kept.attribute());
    case Kind::kObjectClass:
      return clausesOf(kept.objectClass());
    case Kind::kVendorExtension:
      break;
  }
  return clausesOf(kept.extension());
}

std::string textOf(const WrittenValue& value) {
  const char* const quote = value.form == Form::kQuoted         ? "'"
                            : value.form == Form::kDoubleQuoted ? "\""
                                                                : "";
  return quote + std::string(value.raw) + quote;
}

std::vector<ClauseText> clausesOf(const WrittenFile& file, const WrittenDefinition& definition) {
  std::vector<ClauseText> clauses;
  for (const WrittenClause& clause : file.clausesOf(definition)) {
    if (clause.clause == Clause::kOid) {
      continue;
    }
    ClauseText text{clause.clause, std::string(clause.keyword), {}, clause.isList};
    for (const WrittenValue& value : file.valuesOf(clause)) {
      text.values.push_back(textOf(value));
    }
    clauses.push_back(std::move(text));
  }
  return clauses;
}

bool isEqualButForCase(std::string_view left, std::string_view right) {
  const auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; };
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [&](char a, char b) { return lower(a) == lower(b); });
}

bool isSeparatedByDollar(Clause clause) {
  return clause == Clause::kSup || clause == Clause::kMust || clause == Clause::kMay;
}

}  // namespace

std::string ClauseText::text() const {
  std::string result = keyword;
  result += isList ? " (" : "";
  const char* separator = " ";
  for (const std::string& value : values) {
    result += separator + value;
    separator = isSeparatedByDollar(clause) ? " $ " : " ";
  }
  result += isList ? " )" : "";
  return result;
}

Kind DefinitionView::kind() const {
  return m_written == nullptr ? m_entry->kept->kind : m_written->kind;
}

Place DefinitionView::place() const {
  return m_file->source->placeOf(m_written == nullptr ? m_entry->kept->offset : m_written->offset);
}

std::string DefinitionView::title() const {
  return m_written == nullptr ? describe(*m_entry->kept) : m_file->written->describe(*m_written);
}

std::string DefinitionView::oid() const {
  return m_written == nullptr ? m_entry->kept->object->oidInPlace()
                              : m_file->written->textOf(*m_written, Clause::kOid);
}

std::vector<std::string> DefinitionView::names() const {
  return m_written == nullptr ? m_entry->kept->object->namesInPlace()
                              : m_file->written->textsOf(*m_written, Clause::kName);
}

std::vector<ClauseText> DefinitionView::clauses() const {
  return m_written == nullptr ? clausesOf(*m_entry->kept) : clausesOf(*m_file->written, *m_written);
}

bool DefinitionView::isCalled(std::string_view name) const {
  if (isEqualButForCase(oid(), name)) {
    return true;
  }
  const std::vector<std::string> own = names();
  return std::any_of(own.begin(), own.end(),
                     [&](const std::string& each) { return isEqualButForCase(each, name); });
}

std::vector<DefinitionView> definitionsOf(const Installation& installation, Reading reading) {
  std::vector<DefinitionView> views;
  if (reading == Reading::kKept) {
    for (const Entry& entry : installation.entries()) {
      views.emplace_back(&entry);
    }
    return views;
  }
  std::unordered_map<const WrittenDefinition*, const Entry*> kept;
  for (const Entry& entry : installation.entries()) {
    kept.emplace(entry.written, &entry);
  }
  for (const SchemaFile& file : installation.files()) {
    for (const WrittenDefinition& written : file.written->definitions()) {
      const auto twin = kept.find(&written);
      views.emplace_back(&file, &written, twin == kept.end() ? nullptr : twin->second);
    }
  }
  return views;
}

}  // namespace migration
