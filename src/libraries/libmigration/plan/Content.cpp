#include "Content.h"

#include <algorithm>

#include "Comparison.h"
#include "TextIndex.h"

namespace migration {

namespace {

constexpr std::array<std::string_view, kAspectCount> kNames = {
    "OID",          "NAME",     "ALIASES",      "DESC",       "OBSOLETE",
    "SUP",          "MATCHING", "SINGLE-VALUE", "COLLECTIVE", "NO-USER-MODIFICATION",
    "USAGE",        "KIND",     "MUST",         "MAY",        "DBNAME",
    "ACCESS-CLASS", "LENGTH",   "EQUALITY",     "ORDERING",   "SUBSTR",
    "APPROX",       "REVERSE"};

void setFlag(Content* fields, Aspect aspect, bool isSet) {
  if (isSet) {
    (*fields)[aspect] = {std::string(nameOf(aspect))};
  }
}

void setText(Content* fields, Aspect aspect, const std::string& text) {
  if (!text.empty()) {
    (*fields)[aspect].assign(1, text);
  }
}

void takeCommon(const ORVSchema& definition, Content* fields) {
  const Values& names = definition.namesInPlace();
  if (!names.empty()) {
    (*fields)[Aspect::kFirstName] = {names.front()};
    (*fields)[Aspect::kAliases].assign(names.begin() + 1, names.end());
  }
  setText(fields, Aspect::kDesc, definition.descriptionInPlace());
  (*fields)[Aspect::kSup] = definition.superiorsInPlace();
}

void take(const Attribute& type, Content* fields) {
  takeCommon(type, fields);
  setFlag(fields, Aspect::kObsolete, type.getObsolete());
  (*fields)[Aspect::kMatching] = {type.getEquality(), type.getOrdering(), type.getSubstr(),
                                  type.getSyntax()};
  setFlag(fields, Aspect::kSingleValue, type.getSingleValue());
  setFlag(fields, Aspect::kCollective, type.getCollective());
  setFlag(fields, Aspect::kNoUserModification, !type.getUserModification());
  setText(fields, Aspect::kUsage, type.getUsage());
}

void take(const ObjectClass& type, Content* fields) {
  takeCommon(type, fields);
  setFlag(fields, Aspect::kObsolete, type.getObsolete());
  (*fields)[Aspect::kClassKind] = {type.getStructuralTypeName()};
  (*fields)[Aspect::kMust] = type.reqAttrsInPlace();
  (*fields)[Aspect::kMay] = type.optAttrsInPlace();
}

void take(const ORVAttribute& entry, Content* fields) {
  (*fields)[Aspect::kDbName] = entry.getDbNames();
  setText(fields, Aspect::kAccessClass, entry.getAccessClass());
  if (entry.getLength() != "0") {
    setText(fields, Aspect::kLength, entry.getLength());
  }
  setFlag(fields, Aspect::kIndexEquality, entry.hasEquality());
  setFlag(fields, Aspect::kIndexOrdering, entry.hasOrdering());
  setFlag(fields, Aspect::kIndexSubstr, entry.hasSubstr());
  setFlag(fields, Aspect::kIndexApprox, entry.hasApprox());
  setFlag(fields, Aspect::kIndexReverse, entry.hasReverse());
}

bool hasPartners(const Values& mine, const Values& theirs) {
  constexpr std::size_t kShort = 12;
  if (theirs.size() <= kShort) {
    return std::all_of(mine.begin(), mine.end(), [&](const std::string& member) {
      return std::any_of(theirs.begin(), theirs.end(),
                         [&](const std::string& other) { return equalFolded(member, other); });
    });
  }
  Values sorted;
  sorted.reserve(theirs.size());
  for (const std::string& other : theirs) {
    sorted.push_back(folded(other));
  }
  std::sort(sorted.begin(), sorted.end());
  return std::all_of(mine.begin(), mine.end(), [&](const std::string& member) {
    return std::binary_search(sorted.begin(), sorted.end(), folded(member));
  });
}

bool equalInOrder(const Values& left, const Values& right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(), equalFolded);
}

bool haveOneFirstName(const ORVSchema& left, const ORVSchema& right) {
  const Values& mine = left.namesInPlace();
  const Values& theirs = right.namesInPlace();
  return mine.empty() ? theirs.empty()
                      : !theirs.empty() && equalFolded(mine.front(), theirs.front());
}

// The OID follows the attribute type, and is not asked about.
bool areEqual(const ORVAttribute& left, const ORVAttribute& right) {
  return left.getAccessClass() == right.getAccessClass() && left.getLength() == right.getLength() &&
         left.hasEquality() == right.hasEquality() && left.hasOrdering() == right.hasOrdering() &&
         left.hasSubstr() == right.hasSubstr() && left.hasApprox() == right.hasApprox() &&
         left.hasReverse() == right.hasReverse() &&
         equalInOrder(left.getDbNames(), right.getDbNames());
}

std::string joined(const Values& values, std::string_view separator, std::string_view quote) {
  std::string text;
  for (const std::string& value : values) {
    text.append(text.empty() ? std::string_view() : separator);
    text.append(quote).append(value).append(quote);
  }
  return text;
}

void addList(std::string_view keyword, const Values& values, std::string_view separator,
             std::string_view quote, std::string* text) {
  if (!values.empty()) {
    text->append(keyword).append("( ").append(joined(values, separator, quote)).append(" ) ");
  }
}

void addValue(std::string_view keyword, const Values& values, std::string* text) {
  if (!values.empty()) {
    text->append(keyword).append(values.front()).append(" ");
  }
}

void addFlags(const Content& fields, std::initializer_list<Aspect> aspects, std::string* text) {
  for (const Aspect aspect : aspects) {
    if (!fields[aspect].empty()) {
      text->append(nameOf(aspect)).append(" ");
    }
  }
}

void addMatching(const Values& values, std::string* text) {
  for (std::size_t i = 0; i < values.size(); ++i) {
    if (!values[i].empty()) {
      text->append(kMatchingNames[i]).append(" ").append(values[i]).append(" ");
    }
  }
}

}  // namespace

std::string folded(std::string_view text) { return loweredText(text); }

bool equalFolded(std::string_view left, std::string_view right) {
  return equalsFolded(left, right);
}

bool contains(const Values& values, std::string_view member) {
  return std::any_of(values.begin(), values.end(),
                     [&](const std::string& value) { return equalFolded(value, member); });
}

std::string_view nameOf(Aspect aspect) { return kNames[static_cast<std::size_t>(aspect)]; }

const std::vector<Aspect>& aspectsOf(Kind kind) {
  static const std::vector<Aspect> kOfAttributeType = {
      Aspect::kOid,        Aspect::kFirstName,
      Aspect::kAliases,    Aspect::kDesc,
      Aspect::kObsolete,   Aspect::kSup,
      Aspect::kMatching,   Aspect::kSingleValue,
      Aspect::kCollective, Aspect::kNoUserModification,
      Aspect::kUsage};
  static const std::vector<Aspect> kOfObjectClass = {
      Aspect::kOid, Aspect::kFirstName, Aspect::kAliases, Aspect::kDesc, Aspect::kObsolete,
      Aspect::kSup, Aspect::kClassKind, Aspect::kMust,    Aspect::kMay};
  static const std::vector<Aspect> kOfExtension = {
      Aspect::kDbName,        Aspect::kAccessClass, Aspect::kLength,      Aspect::kIndexEquality,
      Aspect::kIndexOrdering, Aspect::kIndexSubstr, Aspect::kIndexApprox, Aspect::kIndexReverse};
  return kind == Kind::kAttributeType ? kOfAttributeType
         : kind == Kind::kObjectClass ? kOfObjectClass
                                      : kOfExtension;
}

Values Content::names() const {
  Values all = (*this)[Aspect::kFirstName];
  const Values& further = (*this)[Aspect::kAliases];
  all.insert(all.end(), further.begin(), further.end());
  return all;
}

Content contentOf(const KeptDefinition& definition) {
  Content fields;
  fields.kind = definition.kind;
  fields[Aspect::kOid] = {definition.object->oidInPlace()};
  switch (definition.kind) {
    case Kind::kAttributeType:
      take(definition.attribute(), &fields);
      break;
    case Kind::kObjectClass:
      take(definition.objectClass(), &fields);
      break;
    case Kind::kVendorExtension:
      take(definition.extension(), &fields);
  }
  return fields;
}

bool areEqual(Aspect aspect, const Values& left, const Values& right) {
  switch (aspect) {
    case Aspect::kFirstName:
    case Aspect::kDbName:
      return equalInOrder(left, right);
    case Aspect::kAliases:
    case Aspect::kSup:
    case Aspect::kMust:
    case Aspect::kMay:
      return left.size() == right.size() && hasPartners(left, right) && hasPartners(right, left);
    default:
      return left == right;
  }
}

bool areEqual(const Content& left, const Content& right) {
  const std::vector<Aspect>& aspects = aspectsOf(left.kind);
  return left.kind == right.kind && std::all_of(aspects.begin(), aspects.end(), [&](Aspect aspect) {
           return areEqual(aspect, left[aspect], right[aspect]);
         });
}

bool haveEqualContent(const KeptDefinition& left, const KeptDefinition& right) {
  if (left.kind == Kind::kVendorExtension && right.kind == Kind::kVendorExtension) {
    return areEqual(left.extension(), right.extension());
  }
  return areEqual(left, right) && haveOneFirstName(*left.object, *right.object);
}

std::string shownValue(Aspect aspect, const Values& values) {
  switch (aspect) {
    case Aspect::kFirstName:
    case Aspect::kDesc:
    case Aspect::kAliases:
    case Aspect::kDbName:
      return joined(values, " ", "'");
    case Aspect::kMatching: {
      std::string text;
      addMatching(values, &text);
      return text.substr(0, text.empty() ? 0 : text.size() - 1);
    }
    default:
      return joined(values, " $ ", "");
  }
}

std::string textOf(const Content& fields) {
  std::string text = "( " + fields.oid() + " ";
  addList("NAME ", fields.names(), " ", "'", &text);
  if (!fields[Aspect::kDesc].empty()) {
    text += "DESC '" + fields[Aspect::kDesc].front() + "' ";
  }
  addFlags(fields, {Aspect::kObsolete}, &text);
  const Values& superiors = fields[Aspect::kSup];
  if (fields.kind == Kind::kObjectClass) {
    addList("SUP ", superiors, " $ ", "", &text);
  } else {
    // An attribute type has one superior; the reader takes one behind each keyword.
    for (const std::string& superior : superiors) {
      text += "SUP " + superior + " ";
    }
  }
  addMatching(fields[Aspect::kMatching], &text);
  addFlags(fields, {Aspect::kSingleValue, Aspect::kCollective, Aspect::kNoUserModification}, &text);
  addValue("USAGE ", fields[Aspect::kUsage], &text);
  addValue("", fields[Aspect::kClassKind], &text);
  addList("MUST ", fields[Aspect::kMust], " $ ", "", &text);
  addList("MAY ", fields[Aspect::kMay], " $ ", "", &text);
  addList("DBNAME ", fields[Aspect::kDbName], " ", "'", &text);
  addValue("ACCESS-CLASS ", fields[Aspect::kAccessClass], &text);
  addValue("LENGTH ", fields[Aspect::kLength], &text);
  addFlags(fields,
           {Aspect::kIndexEquality, Aspect::kIndexOrdering, Aspect::kIndexSubstr,
            Aspect::kIndexApprox, Aspect::kIndexReverse},
           &text);
  return text + ")";
}

}  // namespace migration
