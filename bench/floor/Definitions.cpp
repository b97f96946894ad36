#include "Definitions.h"

#include <algorithm>
#include <utility>

#include "LineBuffer.h"
#include "Tokenizer.h"

namespace minimal {

namespace {

constexpr std::uint64_t kPlainValue = setOf(kWord);
constexpr std::uint64_t kReference = setOf(kWord, kNumber);
constexpr std::uint64_t kListMember = setOf(kWord, kDollar, kObjectClasses, kAttributeTypes);

char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c; }

bool equalFolded(const std::string& left, const std::string& right) {
  return left.size() == right.size() &&
         std::equal(left.begin(), left.end(), right.begin(),
                    [](char a, char b) { return lower(a) == lower(b); });
}

// Equal counts, and each of mine among theirs whatever its letter case.
bool equalLists(const std::vector<std::string>& mine, const std::vector<std::string>& theirs) {
  if (mine.size() != theirs.size()) {
    return false;
  }
  for (std::size_t i = 0; i < mine.size(); ++i) {
    if (mine[i] == theirs[i]) {
      continue;
    }
    if (std::none_of(theirs.begin(), theirs.end(),
                     [&](const std::string& other) { return equalFolded(mine[i], other); })) {
      return false;
    }
  }
  return true;
}

// Reads the token after the current one as a value, and the token behind it.
void readValue(Tokenizer* input, std::uint64_t accepted, std::string* value) {
  if (isIn(input->next(), accepted)) {
    *value = input->text();
  }
  input->next();
}

void readFlag(Tokenizer* input, bool* flag) {
  *flag = true;
  input->next();
}

void readList(Tokenizer* input, std::vector<std::string>* list) {
  while (isIn(input->current(), kListMember)) {
    if (input->current() != kDollar) {
      list->emplace_back(input->text());
    }
    input->next();
  }
  if (input->current() == kClose) {
    input->next();
  }
}

// MUST and MAY, whose "(" may be missing.
void readMembers(Tokenizer* input, std::vector<std::string>* list) {
  if (input->next() == kOpen) {
    input->next();
  }
  readList(input, list);
}

// Passes over the "(" that a definition begins with.
void open(Tokenizer* input) {
  if (input->next() == kOpen) {
    input->next();
  }
}

bool readTypeNames(Tokenizer* input, std::vector<std::string>* names) {
  constexpr std::uint64_t kEnds =
      setOf(kDesc, kSyntax, kObsolete, kSup, kUsage, kNoUserModification, kCollective, kSingleValue,
            kSubstr, kOrdering, kEquality);
  input->next();
  do {
    if (isIn(input->current(), setOf(kWord, kObjectClasses, kAttributeTypes)) &&
        std::find(names->begin(), names->end(), input->text()) == names->end()) {
      names->emplace_back(input->text());
    }
    if (input->next() == kEnd) {
      return false;
    }
  } while (!isIn(input->current(), kEnds));
  return true;
}

bool readClassNames(Tokenizer* input, std::vector<std::string>* names) {
  constexpr std::uint64_t kEnds =
      setOf(kDesc, kStructural, kAuxiliary, kAbstract, kObsolete, kSup, kMust, kMay);
  for (Token token = input->next(); !isIn(token, kEnds); token = input->next()) {
    if (token == kWord) {
      names->emplace_back(input->text());
    }
    if (token == kEnd) {
      return false;
    }
  }
  return true;
}

void addList(LineBuffer* out, std::string_view keyword, const std::vector<std::string>& values) {
  if (values.empty()) {
    return;
  }
  out->add(keyword);
  out->add("( ");
  out->add(values.front());
  for (std::size_t i = 1; i < values.size(); ++i) {
    out->add(" $ ");
    out->add(values[i]);
  }
  out->add(" ) ");
}

void addDescription(LineBuffer* out, const std::string& description) {
  if (!description.empty()) {
    out->add(" DESC '");
    out->add(description);
    out->add("' ");
  }
}

}  // namespace

std::string Definition::key() const {
  std::string text = names.empty() ? std::string() : names.front();
  std::transform(text.begin(), text.end(), text.begin(), lower);
  return text;
}

bool AttributeType::parse(Tokenizer* input) {
  open(input);
  for (;;) {
    switch (input->current()) {
      case kClose:
        input->next();
        return true;
      case kCloseBrace:
        return true;
      case kEnd:
      case kExtensions:
      case kObjectClasses:
      case kAttributeTypes:
        return false;
      case kName:
        if (!readTypeNames(input, &names)) {
          return false;
        }
        break;
      case kWord:
      case kNumber:
        oid = input->text();
        input->next();
        break;
      case kDesc:
        readValue(input, kPlainValue, &description);
        break;
      case kObsolete:
        readFlag(input, &isObsolete);
        break;
      case kSup:
        if (isIn(input->next(), kReference)) {
          superiors.emplace_back(input->text());
        }
        input->next();
        break;
      case kEquality:
        readValue(input, kReference, &equality);
        break;
      case kOrdering:
        readValue(input, kReference, &ordering);
        break;
      case kSubstr:
        readValue(input, kReference, &substr);
        break;
      case kSyntax:
        readValue(input, kReference | bit(kNumberLength), &syntax);
        break;
      case kSingleValue:
        singleValue = kSingleValue;
        input->next();
        break;
      case kNoUserModification:
        isUserModifiable = false;
        input->next();
        break;
      case kUsage:
        readValue(input, kPlainValue, &usage);
        break;
      case kCollective:
        return false;
      default:
        input->next();
    }
  }
}

bool ObjectClass::parse(Tokenizer* input) {
  open(input);
  for (;;) {
    switch (input->current()) {
      case kClose:
        input->next();
        return true;
      case kCloseBrace:
      case kOpen:
        return true;
      case kEnd:
      case kObjectClasses:
      case kNumberBadLength:
        return false;
      case kName:
        if (!readClassNames(input, &names)) {
          return false;
        }
        break;
      case kWord:
      case kNumber:
        oid = input->text();
        input->next();
        break;
      case kDesc:
        readValue(input, kPlainValue, &description);
        break;
      case kObsolete:
        readFlag(input, &isObsolete);
        break;
      case kStructural:
        kind = Kind::kStructural;
        input->next();
        break;
      case kAuxiliary:
        kind = Kind::kAuxiliary;
        input->next();
        break;
      case kAbstract:
        kind = Kind::kAbstract;
        input->next();
        break;
      case kSup:
        if (input->next() == kOpen) {
          input->next();
          readList(input, &superiors);
        } else {
          if (input->current() == kWord) {
            superiors.emplace_back(input->text());
          }
          input->next();
        }
        break;
      case kMust:
        readMembers(input, &required);
        break;
      case kMay:
        readMembers(input, &optional);
        break;
      default:
        input->next();
    }
  }
}

bool Extension::parse(Tokenizer* input) {
  constexpr std::uint64_t kNamesEnd =
      setOf(kClose, kLength, kAccessClass, kEquality, kApprox, kSubstr, kOrdering, kReverse);
  constexpr std::uint64_t kNames = setOf(kWord, kObjectClasses, kAttributeTypes, kExtensions);
  open(input);
  for (;;) {
    switch (input->current()) {
      case kClose:
        input->next();
        return true;
      case kCloseBrace:
        return true;
      case kEnd:
      case kAttributeTypes:
        return false;
      case kDbName:
        for (Token token = input->next(); !isIn(token, kNamesEnd); token = input->next()) {
          if (token == kEnd) {
            return false;
          }
          if (isIn(token, kNames)) {
            databaseNames.emplace_back(input->text());
          }
        }
        if (input->current() == kClose) {
          const int line = input->line();
          if (input->next() == kOpen && input->line() > line) {
            return true;
          }
        }
        break;
      case kWord:
      case kNumber:
        oid = input->text();
        input->next();
        break;
      case kAccessClass:
        input->next();
        access = input->text();
        input->next();
        break;
      case kLength:
        input->next();
        length = input->text();
        input->next();
        break;
      case kEquality:
        readFlag(input, &hasEquality);
        break;
      case kOrdering:
        readFlag(input, &hasOrdering);
        break;
      case kSubstr:
        readFlag(input, &hasSubstr);
        break;
      case kApprox:
        readFlag(input, &hasApprox);
        break;
      case kReverse:
        readFlag(input, &isReverse);
        break;
      default:
        input->next();
    }
  }
}

void AttributeType::write(LineBuffer* out) const {
  out->reserve(240 + oid.size() + description.size() + equality.size() + ordering.size() +
               substr.size() + syntax.size() + usage.size() + LineBuffer::room(names) +
               LineBuffer::room(superiors));
  out->add("attributetypes=( ");
  out->add(oid);
  out->add(" NAME ( ");
  out->addQuoted(names);
  out->add(" ) ");
  addDescription(out, description);
  out->addIf(isObsolete, "OBSOLETE ");
  if (!superiors.empty()) {
    out->add("SUP ");
    for (const std::string& superior : superiors) {
      out->add(superior);
      out->add(" ");
    }
  }
  out->addValue("EQUALITY ", equality);
  out->addValue("ORDERING ", ordering);
  out->addValue("SUBSTR ", substr);
  out->addValue("SYNTAX ", syntax);
  out->addIf(singleValue == kSingleValue, "SINGLE-VALUE ");
  out->addIf(isCollective, "COLLECTIVE ");
  out->addIf(!isUserModifiable, "NO-USER-MODIFICATION ");
  out->addValue("USAGE ", usage);
  out->add(" )\n");
}

void ObjectClass::write(LineBuffer* out) const {
  constexpr std::string_view kKinds[] = {"STRUCTURAL ", "AUXILIARY ", "ABSTRACT "};
  out->reserve(160 + oid.size() + description.size() + LineBuffer::room(names) +
               LineBuffer::room(superiors) + LineBuffer::room(required) +
               LineBuffer::room(optional));
  out->add("objectclasses=( ");
  out->add(oid);
  out->add(names.size() > 1 ? " NAME ( " : " NAME ");
  out->addQuoted(names);
  out->addIf(names.size() > 1, " ) ");
  addDescription(out, description);
  out->addIf(isObsolete, "OBSOLETE ");
  addList(out, "SUP ", superiors);
  out->add(kKinds[static_cast<std::size_t>(kind)]);
  addList(out, "MUST ", required);
  addList(out, "MAY ", optional);
  out->add(")\n");
}

void Extension::write(LineBuffer* out) const {
  out->reserve(160 + oid.size() + access.size() + length.size() + LineBuffer::room(databaseNames));
  out->add("ORVAttributetypes=( ");
  out->add(oid);
  out->add(" ");
  if (!databaseNames.empty()) {
    out->add("DBNAME ( ");
    out->addQuoted(databaseNames);
    out->add(" ) ");
  }
  out->addValue("ACCESS-CLASS ", access);
  if (length != "0") {
    out->add("LENGTH ");
    out->add(length);
    out->add(" ");
  }
  out->addIf(hasEquality, "EQUALITY ");
  out->addIf(hasOrdering, "ORDERING ");
  out->addIf(hasSubstr, "SUBSTR ");
  out->addIf(hasApprox, "APPROX ");
  out->addIf(isReverse, "REVERSE ");
  out->add(")\n");
}

bool AttributeType::isEqual(const AttributeType& other) const {
  return oid == other.oid && description == other.description && equality == other.equality &&
         usage == other.usage && syntax == other.syntax && ordering == other.ordering &&
         substr == other.substr && singleValue == other.singleValue &&
         isObsolete == other.isObsolete && isCollective == other.isCollective &&
         isUserModifiable == other.isUserModifiable && equalLists(names, other.names) &&
         equalLists(superiors, other.superiors);
}

bool ObjectClass::isEqual(const ObjectClass& other) const {
  return oid == other.oid && description == other.description && isObsolete == other.isObsolete &&
         kind == other.kind && equalLists(names, other.names) &&
         equalLists(required, other.required) && equalLists(optional, other.optional) &&
         equalLists(superiors, other.superiors);
}

bool Extension::isEqual(const Extension& other) const {
  return oid == other.oid && access == other.access && hasEquality == other.hasEquality &&
         hasOrdering == other.hasOrdering && hasSubstr == other.hasSubstr &&
         hasApprox == other.hasApprox && isReverse == other.isReverse && length == other.length &&
         equalLists(databaseNames, other.databaseNames);
}

}  // namespace minimal
