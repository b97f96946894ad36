#include "Keywords.h"

#include <array>
#include <cstddef>
#include <cstdint>

namespace migration {

namespace {

constexpr char folded(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c == '_' ? '-' : c;
}

constexpr std::array<Keyword, 3> kSections = {
    Keyword{Keyword::kSection, Clause::kUnknown, Kind::kAttributeType, "attributetypes"},
    Keyword{Keyword::kSection, Clause::kUnknown, Kind::kObjectClass, "objectclasses"},
    Keyword{Keyword::kSection, Clause::kUnknown, Kind::kVendorExtension, "ORVAttributetypes"}};
constexpr std::array<std::string_view, 3> kFoldedSpellings = {"attributeTypes", "objectClasses",
                                                              "ORVattributeTypes"};

constexpr auto kFirstClause = static_cast<std::uint8_t>(Clause::kName);
constexpr auto kLastClause = static_cast<std::uint8_t>(Clause::kReverse);

Keyword keywordOfClause(std::uint8_t number) {
  const auto clause = static_cast<Clause>(number);
  return {Keyword::kClause, clause, Kind::kAttributeType, keywordOf(clause)};
}

// The clauses by the first letter and the length of their keywords.
class ClauseTable {
 public:
  ClauseTable() {
    for (std::uint8_t number = kFirstClause; number <= kLastClause; ++number) {
      const std::string_view text = keywordOf(static_cast<Clause>(number));
      std::size_t slot = slotOf(text);
      while (m_slots[slot] != 0) {
        slot = (slot + 1) % m_slots.size();
      }
      m_slots[slot] = number;
    }
  }

  // The number of the clause; 0 when there is none.
  std::uint8_t find(std::string_view word) const {
    for (std::size_t slot = slotOf(word); m_slots[slot] != 0; slot = (slot + 1) % m_slots.size()) {
      if (keywordOf(static_cast<Clause>(m_slots[slot])) == word) {
        return m_slots[slot];
      }
    }
    return 0;
  }

 private:
  static std::size_t slotOf(std::string_view word) {
    return (static_cast<unsigned char>(word[0]) * 7U + static_cast<unsigned char>(word[1]) * 3U +
            word.size()) %
           128;
  }

  std::array<std::uint8_t, 128> m_slots{};
};

bool equalsFolded(std::string_view left, std::string_view right) {
  if (left.size() != right.size()) {
    return false;
  }
  for (std::size_t i = 0; i < left.size(); ++i) {
    if (folded(left[i]) != folded(right[i])) {
      return false;
    }
  }
  return true;
}

// Whether one insertion, deletion, substitution or swap of neighbours makes one of the other.
bool isOneEditAway(std::string_view left, std::string_view right) {
  if (left.size() > right.size()) {
    return isOneEditAway(right, left);
  }
  if (right.size() - left.size() > 1) {
    return false;
  }
  std::size_t same = 0;
  while (same < left.size() && folded(left[same]) == folded(right[same])) {
    ++same;
  }
  if (left.size() < right.size()) {
    return equalsFolded(left.substr(same), right.substr(same + 1));
  }
  if (same == left.size() || equalsFolded(left.substr(same + 1), right.substr(same + 1))) {
    return true;
  }
  return same + 1 < left.size() && folded(left[same]) == folded(right[same + 1]) &&
         folded(left[same + 1]) == folded(right[same]) &&
         equalsFolded(left.substr(same + 2), right.substr(same + 2));
}

constexpr std::uint32_t bit(Clause clause) {
  return std::uint32_t{1} << static_cast<unsigned>(clause);
}

template <typename... Clauses>
constexpr std::uint32_t bits(Clauses... clauses) {
  return (bit(clauses) | ...);
}

constexpr bool isIn(std::uint32_t set, Clause clause) { return (set & bit(clause)) != 0; }

constexpr std::uint32_t kAttributeClauses =
    bits(Clause::kName, Clause::kDesc, Clause::kObsolete, Clause::kSup, Clause::kEquality,
         Clause::kOrdering, Clause::kSubstr, Clause::kSyntax, Clause::kSingleValue,
         Clause::kCollective, Clause::kNoUserModification, Clause::kUsage);
constexpr std::uint32_t kClassClauses =
    bits(Clause::kName, Clause::kDesc, Clause::kObsolete, Clause::kSup, Clause::kStructural,
         Clause::kAuxiliary, Clause::kAbstract, Clause::kMust, Clause::kMay);
constexpr std::uint32_t kExtensionClauses =
    bits(Clause::kDbName, Clause::kAccessClass, Clause::kLength, Clause::kEquality,
         Clause::kOrdering, Clause::kSubstr, Clause::kApprox, Clause::kReverse);
constexpr std::uint32_t kFlags =
    bits(Clause::kObsolete, Clause::kSingleValue, Clause::kCollective, Clause::kNoUserModification,
         Clause::kStructural, Clause::kAuxiliary, Clause::kAbstract, Clause::kReverse);
constexpr std::uint32_t kExtensionFlags =
    bits(Clause::kEquality, Clause::kOrdering, Clause::kSubstr, Clause::kApprox, Clause::kReverse);
constexpr std::uint32_t kLists = bits(Clause::kName, Clause::kMust, Clause::kMay, Clause::kDbName);

}  // namespace

Keyword exactKeyword(std::string_view word) {
  static const ClauseTable clauses;
  if (word.size() < 3 || word.size() > 20) {
    return {};
  }
  if (const std::uint8_t number = clauses.find(word); number != 0) {
    return keywordOfClause(number);
  }
  for (std::size_t i = 0; i < kSections.size(); ++i) {
    if (word == kSections[i].text || word == kFoldedSpellings[i]) {
      return kSections[i];
    }
  }
  return {};
}

Keyword anyCaseKeyword(std::string_view word) {
  for (std::uint8_t number = kFirstClause; number <= kLastClause; ++number) {
    if (equalsFolded(word, keywordOf(static_cast<Clause>(number)))) {
      return keywordOfClause(number);
    }
  }
  for (const Keyword& section : kSections) {
    if (equalsFolded(word, section.text)) {
      return section;
    }
  }
  return {};
}

Keyword nearClauseKeyword(std::string_view word, Kind kind) {
  Keyword found;
  for (std::uint8_t number = kFirstClause; number <= kLastClause; ++number) {
    const auto clause = static_cast<Clause>(number);
    if (isOneEditAway(word, keywordOf(clause))) {
      if (isKnownTo(kind, clause)) {
        return keywordOfClause(number);
      }
      found = found.sort == Keyword::kNone ? keywordOfClause(number) : found;
    }
  }
  return found;
}

Keyword nearSectionKeyword(std::string_view word) {
  for (const Keyword& section : kSections) {
    if (isOneEditAway(word, section.text)) {
      return section;
    }
  }
  return {};
}

bool isKnownTo(Kind kind, Clause clause) {
  return isIn(kind == Kind::kAttributeType ? kAttributeClauses
              : kind == Kind::kObjectClass ? kClassClauses
                                           : kExtensionClauses,
              clause);
}

ClauseShape shapeOf(Kind kind, Clause clause) {
  if (isIn(kFlags, clause) || (kind == Kind::kVendorExtension && isIn(kExtensionFlags, clause))) {
    return ClauseShape::kFlag;
  }
  const bool isList = isIn(kLists, clause) || clause == Clause::kExtension ||
                      clause == Clause::kUnknown ||
                      (clause == Clause::kSup && kind != Kind::kAttributeType);
  return isList ? ClauseShape::kList : ClauseShape::kValue;
}

bool takesNumber(Kind kind, Clause clause) {
  constexpr std::uint32_t kRules =
      bits(Clause::kSup, Clause::kEquality, Clause::kOrdering, Clause::kSubstr);
  return takesLength(kind, clause) || (kind == Kind::kAttributeType && isIn(kRules, clause));
}

bool takesLength(Kind kind, Clause clause) {
  return (kind == Kind::kAttributeType && clause == Clause::kSyntax) ||
         (kind == Kind::kVendorExtension && clause == Clause::kLength);
}

bool endsNames(Kind kind, Clause clause) {
  return clause != Clause::kName && kind != Kind::kVendorExtension && isKnownTo(kind, clause);
}

bool isReadersWord(std::string_view word) {
  const auto isLetter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
  for (const char c : word) {
    if (!isLetter(c) && !(c >= '0' && c <= '9') && c != '_' && c != '-') {
      return false;
    }
  }
  return !word.empty() && (isLetter(word[0]) || word[0] == '-');
}

}  // namespace migration
