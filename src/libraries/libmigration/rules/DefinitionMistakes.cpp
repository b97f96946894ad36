// The D rules: what is found in definitions and in how they stand.

#include <algorithm>
#include <string_view>
#include <unordered_set>
#include <utility>

#include "KeptFields.h"
#include "Keywords.h"
#include "Mistakes.h"
#include "NameIndex.h"

namespace migration {

namespace {

constexpr std::uint32_t kKinds =
    fieldOf(Clause::kStructural) | fieldOf(Clause::kAuxiliary) | fieldOf(Clause::kAbstract);

// As RFC 4512 has it: numbers without leading zeros, at least two, with dots between them.
bool isNumericOid(std::string_view text) {
  std::size_t parts = 0;
  while (!text.empty()) {
    const std::size_t size = std::min(text.find('.'), text.size());
    const std::string_view part = text.substr(0, size);
    if (part.empty() || part.find_first_not_of("0123456789") != std::string_view::npos ||
        (part.size() > 1 && part[0] == '0')) {
      return false;
    }
    ++parts;
    const bool isLast = size == text.size();
    text.remove_prefix(isLast ? size : size + 1);
    if (!isLast && text.empty()) {
      return false;
    }
  }
  return parts > 1;
}

class DefinitionMistakes {
 public:
  DefinitionMistakes(const BothReadings& file, Mistakes* mistakes)
      : m_file(file), m_written(file.written), m_mistakes(*mistakes) {}

  void find() {
    std::size_t next = 0;
    const std::vector<WrittenOddity>& oddities = m_written.oddities();
    for (m_number = 0; m_number < m_written.definitions().size(); ++m_number) {
      m_definition = &m_written.definitions()[m_number];
      m_hasUnclosedQuote = false;
      m_unclosedQuotes.clear();
      for (; next < oddities.size() && oddities[next].offset < m_definition->end; ++next) {
        m_hasUnclosedQuote |= oddities[next].oddity == Oddity::kUnclosedQuote &&
                              oddities[next].offset > m_definition->offset;
        if (oddities[next].oddity == Oddity::kUnclosedQuote) {
          m_unclosedQuotes.push_back(oddities[next].offset);
        }
        m_pending.push_back(&oddities[next]);
      }
      lookAtPending();
      lookAtDefinition();
    }
    m_hasUnclosedQuote = false;
    for (; next < oddities.size(); ++next) {
      m_pending.push_back(&oddities[next]);
    }
    lookAtPending();
  }

 private:
  Mistake& add(const char* rule, std::size_t offset, std::string text) {
    Mistake mistake;
    mistake.rule = rule;
    mistake.offset = offset;
    mistake.from = offset;
    mistake.definition = m_file.definitionAt(offset);
    mistake.text = std::move(text);
    m_mistakes.push_back(std::move(mistake));
    return m_mistakes.back();
  }

  void lookAtPending() {
    for (const WrittenOddity* const oddity : m_pending) {
      lookAt(*oddity);
    }
    m_pending.clear();
  }

  std::string textOf(const WrittenOddity& oddity) const {
    return quotedForMessage(
        m_written.source().bytes().substr(oddity.offset, oddity.end - oddity.offset));
  }

  void lookAt(const WrittenOddity& oddity) {
    switch (oddity.oddity) {
      case Oddity::kLoneParenthesis:
        add("D209", oddity.offset,
            "this parenthesis stands outside definitions and belongs to none; take it away, or "
            "write its partner")
            .judged = Mistake::kError;
        break;
      case Oddity::kStrayParenthesis:
        add("D209", oddity.offset,
            "a parenthesis is missing or too many here, and the reader takes the next one for "
            "another; write as many \")\" as \"(\", and none round what takes one value");
        break;
      case Oddity::kNotClosed:
        // What stands behind an open quote, the ")" included, is a part of that text.
        if (!m_hasUnclosedQuote) {
          Mistake& mistake = add("D204", oddity.offset,
                                 "the definition that begins here is not closed, so that it gets "
                                 "lost, or what stands behind it is taken for a part of it; write "
                                 "its \")\"");
          // Of nothing behind "=" nothing can be kept.
          const bool isNothing = mistake.definition == Difference::kNone;
          mistake.judged = isNothing ? Mistake::kError : Mistake::kByDifference;
        }
        break;
      case Oddity::kDefinitionInDefinition:
        lookAtInner(oddity);
        break;
      case Oddity::kNoOpening:
        add("D211", oddity.offset,
            textOf(oddity) +
                " begins a definition, and neither \"=\" nor \"{\" stands behind it, so that the "
                "rest of the file is not read; write \"=\" before one definition or \"{\" before "
                "several, or take the word away");
        break;
      case Oddity::kNoValue:
        add("D212", oddity.offset,
            textOf(oddity) +
                " has no value, and the reader takes what stands there in its place; write the "
                "value, or take the keyword away");
        break;
      case Oddity::kBlockNotClosed:
        add("D213", oddity.offset,
            "the block that begins here has no \"}\", so that what stands behind it is read as a "
            "part of it; write \"}\" behind its last definition")
            .from = oddity.end;
        break;
      case Oddity::kNoName:
        add("D214", oddity.offset,
            textOf(oddity) +
                " stands where a name must, and is no name that the reader takes there; write the "
                "name");
        break;
      default:
        break;
    }
  }

  void lookAtInner(const WrittenOddity& oddity) {
    Mistake& mistake = add("D210", oddity.offset,
                           "a definition begins here inside another one, and the reader takes "
                           "both for one; write one behind the other");
    const std::vector<WrittenDefinition>& definitions = m_written.definitions();
    const auto inner = std::lower_bound(definitions.begin(), definitions.end(), oddity.offset,
                                        [](const WrittenDefinition& candidate, std::size_t offset) {
                                          return candidate.offset < offset;
                                        });
    if (inner != definitions.begin() && !(inner - 1)->isClosed) {
      mistake.from = (inner - 1)->offset;
    }
    mistake.resumes = inner == definitions.end() ? 0 : inner->end;
  }

  void lookAtDefinition() {
    m_hasOid = false;
    m_seen = 0;
    m_names.clear();
    const Slice<WrittenClause> clauses = m_written.clausesOf(*m_definition);
    m_lastEnd = 0;
    for (std::size_t i = 1; i < clauses.size(); ++i) {
      m_lastEnd = endsNames(m_definition->kind, clauses[i].clause) ? i : m_lastEnd;
    }
    bool isInNames = false;  // no clause that ends a NAME clause since
    for (std::size_t i = 0; i < clauses.size(); ++i) {
      const WrittenClause& clause = clauses[i];
      if (clause.clause == Clause::kOid) {
        lookAtOid(clause);
      } else if (isKnownTo(m_definition->kind, clause.clause)) {
        lookAtRepetition(clause);
        if (clause.clause == Clause::kName) {
          isInNames = true;
          lookAtNames(clauses, i);
        } else if (clause.clause == Clause::kCollective &&
                   clause.keyword == keywordOf(Clause::kCollective)) {
          add("D202", clause.offset,
              "the reader does not get past COLLECTIVE, so that reading never ends; take the word "
              "away")
              .judged = Mistake::kError;
        }
        isInNames = isInNames && !endsNames(m_definition->kind, clause.clause);
      } else {
        lookAtUnknown(clauses, i, isInNames);
      }
    }
    if (!m_hasOid) {
      Mistake& mistake = add("D205", m_definition->offset,
                             "this definition has no OID, by which everything finds it; write a "
                             "numeric OID behind its \"(\"");
      mistake.judged = Mistake::kError;
      mistake.reach = Mistake::kFields;
      mistake.fields = fieldOf(Clause::kOid);
    }
    lookAtLast(clauses);
  }

  void lookAtOid(const WrittenClause& clause) {
    m_hasOid = true;
    const WrittenValue& value = m_written.valuesOf(clause).front();
    if (!isNumericOid(value.raw)) {
      Mistake& mistake = add("D205", clause.offset,
                             quotedForMessage(value.raw) +
                                 " stands for the OID and is no numeric OID, as other servers and "
                                 "tools need it; write numbers with dots between them");
      mistake.reach = Mistake::kFields;
      mistake.fields = fieldOf(Clause::kOid) | fieldOf(Clause::kUnknown);
    }
  }

  void lookAtRepetition(const WrittenClause& clause) {
    const std::uint32_t field = fieldOf(clause.clause);
    const std::uint32_t fields = (field & kKinds) != 0 ? kKinds : field;
    if ((m_seen & fields) != 0) {
      Mistake& mistake =
          add("D206", clause.offset,
              std::string(keywordOf(clause.clause)) +
                  " stands here a second time, or says otherwise than the one before; what one "
                  "place says must not depend on the reader: write it once");
      mistake.reach = Mistake::kFields;
      mistake.fields = fields;
    }
    m_seen |= field;
  }

  void lookAtNames(const Slice<WrittenClause>& clauses, std::size_t place) {
    const WrittenClause& names = clauses[place];
    for (const WrittenValue& value : m_written.valuesOf(names)) {
      if (value.form == Form::kWord) {
        lookAtBareName(value);
      }
      if (!m_names.add(value.raw)) {
        Mistake& mistake = add("D206", value.offset,
                               "the name " + quotedForMessage(value.raw) +
                                   " stands here a second time, and a repeated name may be "
                                   "dropped; write it once");
        mistake.reach = Mistake::kFields;
        mistake.fields = fieldOf(Clause::kName);
      }
    }
    const bool isEnded = m_lastEnd > place;
    if (!isEnded && !m_hasUnclosedQuote && m_definition->kind != Kind::kVendorExtension &&
        names.keyword == keywordOf(Clause::kName)) {
      const char* const ends = m_definition->kind == Kind::kAttributeType
                                   ? "no clause that ends NAME stands behind it, and \")\" does "
                                     "not, so that the reader takes what follows for names; put a "
                                     "clause behind the names, such as USAGE userApplications"
                                   : "no clause that ends NAME stands behind it, and \")\" does "
                                     "not, so that the reader takes what follows for names; put "
                                     "the kind of the class behind the names, such as STRUCTURAL";
      add("D203", names.offset, ends).judged = Mistake::kError;
    }
  }

  void lookAtBareName(const WrittenValue& value) {
    Mistake& mistake =
        add("D207", value.offset,
            quotedForMessage(value.raw) +
                " stands among the names without quotes, where the reader takes any word for a "
                "name; write it in single quotes");
    mistake.reach = Mistake::kFields;
    mistake.fields = fieldOf(Clause::kName);
    const KeptDefinition* const kept = m_file.differences.keptOf(m_number);
    if (kept != nullptr) {
      if (m_keptNamesOf != m_number) {
        const std::vector<std::string>& names = kept->object->namesInPlace();
        m_keptNames.clear();
        m_keptNames.insert(names.begin(), names.end());
        m_keptNamesOf = m_number;
      }
      const bool isKept = m_keptNames.count(value.raw) != 0;
      mistake.judged = isKept ? Mistake::kWarning : Mistake::kError;
      mistake.fields = isKept ? 0 : mistake.fields;
    }
  }

  // Behind a list without parentheses the reader takes such words for members of it.
  void lookAtUnknown(const Slice<WrittenClause>& clauses, std::size_t place, bool isInNames) {
    const WrittenClause& clause = clauses[place];
    // A quote too many is told as that.
    if (std::binary_search(m_unclosedQuotes.begin(), m_unclosedQuotes.end(), clause.offset)) {
      return;
    }
    const std::string word = quotedForMessage(clause.keyword);
    if (isInNames) {
      Mistake& mistake = add("D207", clause.offset,
                             word +
                                 " stands directly behind the names, and the reader takes it and "
                                 "its values for names; take it away, or make a comment of it");
      mistake.reach = Mistake::kFields;
      mistake.fields = fieldOf(Clause::kName) | fieldOf(clause.clause);
      return;
    }
    // A keyword of another kind of definition is passed over; only its values are not.
    const bool isKeyword = clause.clause < Clause::kExtension;
    const bool isWord = clause.keyword.size() > 1 || isReadersWord(clause.keyword) ||
                        isNumericOid(clause.keyword) || clause.valueCount > 0 ||
                        m_written.source().bytes()[clause.offset] == '\'' ||
                        (clause.keyword[0] >= '0' && clause.keyword[0] <= '9');
    if ((isKeyword && clause.valueCount == 0) || !isWord) {
      Mistake& mistake = add("L100", clause.offset,
                             word +
                                 " reads as a part of the definition, is kept as nothing: the "
                                 "reader does not know it here; take it away");
      mistake.judged = Mistake::kOnlyWithDifference;
      return;
    }
    Mistake& mistake = add("D201", clause.offset,
                           word +
                               " is no clause that the reader knows here, and it or its value "
                               "takes the place of the OID; take it away, or make a comment of it");
    if (place > 0 && !clauses[place - 1].isList &&
        shapeOf(m_definition->kind, clauses[place - 1].clause) == ClauseShape::kList) {
      mistake.from = clauses[place - 1].offset;
    }
  }

  // The reader takes the ")" of the definition for the end of the list.
  void lookAtLast(const Slice<WrittenClause>& clauses) {
    if (clauses.empty() || !m_definition->isClosed) {
      return;
    }
    const WrittenClause& last = clauses.back();
    const bool isList = last.clause == Clause::kMust || last.clause == Clause::kMay ||
                        last.clause == Clause::kDbName;
    if (isList && !last.isList && last.valueCount > 0 &&
        isKnownTo(m_definition->kind, last.clause) && last.keyword == keywordOf(last.clause)) {
      add("D208", last.offset,
          std::string(last.keyword) +
              " has no parentheses round its value and stands last, so that the reader takes the "
              "\")\" of the definition for the end of the list; write " +
              std::string(last.keyword) + " ( " +
              std::string(m_written.valuesOf(last).front().raw) + " ) )");
    }
  }

  const BothReadings& m_file;
  const WrittenFile& m_written;
  Mistakes& m_mistakes;
  std::uint32_t m_number = 0;
  const WrittenDefinition* m_definition = nullptr;
  std::vector<const WrittenOddity*> m_pending;
  bool m_hasUnclosedQuote = false;
  std::vector<std::size_t> m_unclosedQuotes;  // their places in the definition
  bool m_hasOid = false;
  std::uint32_t m_seen = 0;
  std::size_t m_lastEnd = 0;  // the last clause that ends a NAME clause
  std::unordered_set<std::string_view> m_keptNames;
  std::uint32_t m_keptNamesOf = Difference::kNone;
  NameIndex m_names;
};

}  // namespace

void findDefinitionMistakes(const BothReadings& file, Mistakes* mistakes) {
  DefinitionMistakes(file, mistakes).find();
}

}  // namespace migration
