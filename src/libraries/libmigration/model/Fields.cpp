#include "Fields.h"

#include "KeptFields.h"

namespace migration {

namespace {

// Of all kinds; each has its own in this order.
constexpr Clause kOrder[] = {
    Clause::kOid,    Clause::kName,        Clause::kDesc,       Clause::kObsolete,
    Clause::kSup,    Clause::kStructural,  Clause::kAuxiliary,  Clause::kAbstract,
    Clause::kMust,   Clause::kMay,         Clause::kDbName,     Clause::kAccessClass,
    Clause::kLength, Clause::kEquality,    Clause::kOrdering,   Clause::kSubstr,
    Clause::kSyntax, Clause::kSingleValue, Clause::kCollective, Clause::kNoUserModification,
    Clause::kUsage,  Clause::kApprox,      Clause::kReverse};

bool isAbsent(Clause clause, const std::string& text) {
  return clause != Clause::kOid && (text.empty() || (clause == Clause::kLength && text == "0"));
}

}  // namespace

std::vector<Field> fieldsOf(const KeptDefinition& definition) {
  const KeptFields kept(definition);
  std::vector<Field> fields;
  for (const Clause clause : kOrder) {
    const std::string* const text = kept.text(clause);
    const std::vector<std::string>* const list = kept.list(clause);
    if (text != nullptr && !isAbsent(clause, *text)) {
      fields.push_back({clause, {*text}});
    } else if (list != nullptr && !list->empty()) {
      fields.push_back({clause, *list});
    } else if (kept.isFlag(clause) && kept.isSet(clause)) {
      fields.push_back({clause, {}});
    }
  }
  return fields;
}

}  // namespace migration
