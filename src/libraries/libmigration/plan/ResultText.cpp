#include "ResultText.h"

#include <algorithm>
#include <array>
#include <optional>
#include <utility>
#include <vector>

#include "TextEdits.h"
#include "ThreeWay.h"

namespace migration {

namespace {

constexpr std::array<const char*, 3> kKeywords = {"attributetypes", "objectclasses",
                                                  "ORVAttributetypes"};

// What the library reads; nothing where the text is not one whole definition.
std::optional<Content> readingOf(Kind kind, std::string_view text) {
  const Source source("result", lineOf(kind, text));
  const KeptFile kept(source);
  const bool isOne = kept.ending() == ReadingEnd::kWhole && kept.definitions().size() == 1 &&
                     kept.definitions().front().kind == kind;
  return isOne ? std::optional<Content>(contentOf(kept.definitions().front())) : std::nullopt;
}

bool isReadAs(const Content& content, std::string_view text) {
  const std::optional<Content> reading = readingOf(content.kind, text);
  return reading && reading->values == content.values;
}

bool isWhole(const Entry* entry) {
  return entry != nullptr && entry->written != nullptr && entry->written->isClosed;
}

std::string_view writtenText(const Entry& entry) {
  const WrittenDefinition& written = *entry.written;
  return entry.file->source->bytes().substr(written.offset, written.end - written.offset);
}

// What is written in one clause, or in some that belong together.
struct Group {
  std::vector<Aspect> aspects;
  std::vector<Clause> clauses;
};

const std::vector<Group>& groups() {
  static const std::vector<Group> kGroups = {
      {{Aspect::kOid}, {Clause::kOid}},
      {{Aspect::kFirstName, Aspect::kAliases}, {Clause::kName}},
      {{Aspect::kDesc}, {Clause::kDesc}},
      {{Aspect::kObsolete}, {Clause::kObsolete}},
      {{Aspect::kSup}, {Clause::kSup}},
      {{Aspect::kMatching},
       {Clause::kEquality, Clause::kOrdering, Clause::kSubstr, Clause::kSyntax}},
      {{Aspect::kSingleValue}, {Clause::kSingleValue}},
      {{Aspect::kCollective}, {Clause::kCollective}},
      {{Aspect::kNoUserModification}, {Clause::kNoUserModification}},
      {{Aspect::kUsage}, {Clause::kUsage}},
      {{Aspect::kClassKind}, {Clause::kStructural, Clause::kAuxiliary, Clause::kAbstract}},
      {{Aspect::kMust}, {Clause::kMust}},
      {{Aspect::kMay}, {Clause::kMay}},
      {{Aspect::kDbName}, {Clause::kDbName}},
      {{Aspect::kAccessClass}, {Clause::kAccessClass}},
      {{Aspect::kLength}, {Clause::kLength}},
      {{Aspect::kIndexEquality}, {Clause::kEquality}},
      {{Aspect::kIndexOrdering}, {Clause::kOrdering}},
      {{Aspect::kIndexSubstr}, {Clause::kSubstr}},
      {{Aspect::kIndexApprox}, {Clause::kApprox}},
      {{Aspect::kIndexReverse}, {Clause::kReverse}}};
  return kGroups;
}

// A group as it is composed, without blanks around it; empty when nothing of it is there.
std::string composed(const Group& group, const Content& content) {
  if (group.aspects.front() == Aspect::kOid) {
    return content.oid();
  }
  Content alone;
  alone.kind = content.kind;
  alone[Aspect::kOid] = {"0"};
  for (const Aspect aspect : group.aspects) {
    alone[aspect] = content[aspect];
  }
  constexpr std::string_view kBegin = "( 0 ";
  const std::string text = textOf(alone);
  const std::string inner = text.substr(kBegin.size(), text.size() - kBegin.size() - 1);
  return inner.empty() ? inner : inner.substr(0, inner.size() - 1);
}

// The text of `entry` with those clauses changed that differ in `wanted`, and everything else as it
// is: comments, clauses that the library does not keep, and the order.
std::string edited(const Entry& entry, const Content& wanted) {
  const WrittenFile& file = *entry.file->written;
  const WrittenDefinition& written = *entry.written;
  const Content there = contentOf(*entry.kept);
  TextEdits edits;
  std::string added;
  for (const Group& group : groups()) {
    const bool isEqual =
        std::all_of(group.aspects.begin(), group.aspects.end(),
                    [&](Aspect aspect) { return there[aspect] == wanted[aspect]; });
    if (isEqual) {
      continue;
    }
    std::string text = composed(group, wanted);
    for (const WrittenClause& clause : file.clausesOf(written)) {
      if (std::find(group.clauses.begin(), group.clauses.end(), clause.clause) !=
          group.clauses.end()) {
        edits.replace(clause.offset - written.offset, clause.end - written.offset,
                      std::exchange(text, ""));
      }
    }
    if (!text.empty()) {
      added.append(text).append(" ");
    }
  }
  const std::size_t end = written.end - written.offset - 1;
  const std::string_view bytes = writtenText(entry);
  const bool needsBlank = !added.empty() && end > 0 && bytes[end - 1] != ' ' &&
                          bytes[end - 1] != '\n' && bytes[end - 1] != '\t';
  edits.replace(end, end, (needsBlank ? " " : "") + added);
  return edits.applyTo(bytes);
}

// Whether the library's comparison takes the result for what NEW has, and would leave it out. It
// looks from one side only, and not at the order of names.
bool isEqualToTheLibrary(const Verdict& row) {
  const Source source("result", lineOf(row.kind(), row.text));
  const KeptFile kept(source);
  if (kept.definitions().size() != 1) {
    return false;
  }
  const KeptDefinition& mine = kept.definitions().front();
  const KeptDefinition& theirs = *row.match.latest->kept;
  switch (row.kind()) {
    case Kind::kAttributeType:
      return mine.attribute().isEqualTo(theirs.attribute());
    case Kind::kObjectClass:
      return mine.objectClass().isEqualTo(theirs.objectClass());
    case Kind::kVendorExtension:
      return mine.extension().isEqualTo(theirs.extension());
  }
  return false;
}

// Whether NEW's definition has to go before the result's can come: the merge replaces only what has
// the same OID and first name.
bool isNewsInTheWay(const Verdict& row) {
  if (!row.isCarried() || row.match.latest == nullptr) {
    return row.isTakenOut;
  }
  return hasOtherIdentity(*row.result, *row.match.latest);
}

// What a definition says beside what the library keeps: "X-ORIGIN 'here'".
std::vector<std::string> unkeptClauses(const Entry* entry) {
  std::vector<std::string> texts;
  if (isWhole(entry)) {
    for (const WrittenClause& clause : entry->file->written->clausesOf(*entry->written)) {
      if (clause.clause == Clause::kExtension) {
        texts.emplace_back(
            entry->file->source->bytes().substr(clause.offset, clause.end - clause.offset));
      }
    }
  }
  return texts;
}

void tellWhatIsLost(const char* side, const Entry* entry, Verdict* row) {
  for (const std::string& clause : unkeptClauses(entry)) {
    if (row->text.find(clause) == std::string::npos) {
      row->notes.push_back(std::string(side) + " " + clause +
                           ", which the library does not keep, is not carried over");
    }
  }
}

// One side's as it is where the result is just that; or else the text of the side that it mostly
// is, with what differs changed; or else composed.
std::string textInResult(const Verdict& row) {
  const MatchRow& match = row.match;
  for (const Entry* const entry : {match.old, match.latest, match.base}) {
    if (isWhole(entry) && contentOf(*entry->kept).values == row.result->values) {
      return std::string(writtenText(*entry));
    }
  }
  const bool isNewsFirst = row.outcome == Outcome::kMerged || row.outcome == Outcome::kText ||
                           row.outcome == Outcome::kNew;
  const Entry* const first = isNewsFirst && match.latest != nullptr ? match.latest : match.old;
  for (const Entry* const entry : {first, match.old, match.latest}) {
    if (isWhole(entry)) {
      std::string text = edited(*entry, *row.result);
      if (isReadAs(*row.result, text)) {
        return text;
      }
    }
  }
  return textOf(*row.result);
}

}  // namespace

std::string lineOf(Kind kind, std::string_view text) {
  std::string line = kKeywords[static_cast<std::size_t>(kind)];
  return line.append("=").append(text).append("\n");
}

bool endsLinesWithReturns(std::string_view text) {
  const std::size_t end = text.find('\n');
  return end != std::string_view::npos && end > 0 && text[end - 1] == '\r';
}

std::string withLineEnds(const std::string& text, bool areReturns) {
  std::string result;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool isReturn = text[i] == '\r' && i + 1 < text.size() && text[i + 1] == '\n';
    if (!isReturn) {
      result.append(areReturns && text[i] == '\n' ? "\r" : "").append(1, text[i]);
    }
  }
  return result;
}

std::string withLineEnds(Kind kind, const std::string& definition, bool areReturns) {
  if (definition.find('\n') == std::string::npos) {
    return definition;
  }
  std::string changed = withLineEnds(definition, areReturns);
  if (changed == definition) {
    return definition;
  }
  const std::optional<Content> before = readingOf(kind, definition);
  return before && isReadAs(*before, changed) ? changed : definition;
}

void writeTexts(std::vector<Verdict>* differences) {
  for (Verdict& row : *differences) {
    if (row.isCarried()) {
      row.text = textInResult(row);
      tellWhatIsLost("OLD's", row.match.old, &row);
      tellWhatIsLost("NEW's", row.match.latest, &row);
    }
    row.isNewsInTheWay = isNewsInTheWay(row);
    row.isEqualToNews = row.isCarried() && row.match.latest != nullptr && !row.isNewsInTheWay &&
                        isEqualToTheLibrary(row);
  }
}

}  // namespace migration
