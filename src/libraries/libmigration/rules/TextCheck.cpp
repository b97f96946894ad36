// The L and D rules over one file: the mistakes are found, each difference between the two readings
// is laid to those that can have caused it, and what none explains is told as itself.

#include <algorithm>
#include <string_view>
#include <utility>
#include <vector>

#include "Check.h"
#include "ForeignFormat.h"
#include "Mistakes.h"

namespace migration {

namespace {

bool isRule(const Mistake& mistake, std::string_view rule) { return rule == mistake.rule; }

// Lays each difference to the mistakes that explain it.
class Judge {
 public:
  Judge(const BothReadings& file, Mistakes* mistakes) : m_file(file), m_mistakes(*mistakes) {
    std::stable_sort(
        m_mistakes.begin(), m_mistakes.end(),
        [](const Mistake& left, const Mistake& right) { return left.from < right.from; });
    for (Mistake& mistake : m_mistakes) {
      if (mistake.reach == Mistake::kOnward && !isRule(mistake, "L112")) {
        m_onward.push_back({mistake.from, &mistake});
        if (mistake.resumes != 0) {
          m_onward.push_back({mistake.resumes, &mistake});
        }
      }
    }
    std::stable_sort(m_onward.begin(), m_onward.end(), [](const Onward& left, const Onward& right) {
      return left.from < right.from;
    });
    // Behind a place where the reader begins a definition as it is written, what was before has no
    // effect any more.
    std::size_t last = 0;
    const std::vector<WrittenDefinition>& definitions = file.written.definitions();
    for (std::size_t i = 0; i < definitions.size(); ++i) {
      last = file.differences.beginsAlike(i) ? definitions[i].offset : last;
      m_barriers.push_back(last);
    }
  }

  void judge() {
    std::vector<const Difference*> unexplained;
    for (const Difference& difference : m_file.differences.all()) {
      if (!explain(difference)) {
        unexplained.push_back(&difference);
      }
    }
    for (Mistake& mistake : m_mistakes) {
      // Nothing is kept of a definition that is lost, and of what is not read.
      const bool isLost = mistake.definition != Difference::kNone &&
                          m_file.differences.keptOf(mistake.definition) == nullptr;
      mistake.differs |= mistake.judged == Mistake::kByDifference &&
                         (isLost || m_file.differences.isUnread(mistake.offset));
    }
    for (const Difference* const difference : unexplained) {
      tell(*difference);
    }
  }

 private:
  // A mistake with this reach, and where it begins.
  struct Onward {
    std::size_t from;
    Mistake* mistake;
  };

  std::size_t barrierOf(const Difference& difference) const {
    std::uint32_t definition = difference.definition;
    if (definition == Difference::kNone) {
      const std::vector<WrittenDefinition>& definitions = m_file.written.definitions();
      const auto behind =
          std::upper_bound(definitions.begin(), definitions.end(), difference.begin,
                           [](std::size_t offset, const WrittenDefinition& candidate) {
                             return offset < candidate.offset;
                           });
      if (behind == definitions.begin()) {
        return 0;
      }
      definition = static_cast<std::uint32_t>(behind - definitions.begin() - 1);
    }
    return m_barriers[definition];
  }

  bool explain(const Difference& difference) {
    const bool isExplained = explainByField(difference);
    // From behind: what stands in the text that differs, and the nearest one before it.
    const std::size_t barrier = barrierOf(difference);
    const std::size_t last = std::max(difference.end, difference.begin + 1) - 1;
    auto next = std::upper_bound(
        m_onward.begin(), m_onward.end(), last,
        [](std::size_t offset, const Onward& onward) { return offset < onward.from; });
    bool isInside = false;
    for (; next != m_onward.begin() && (next - 1)->from >= difference.begin; --next) {
      (next - 1)->mistake->differs = true;
      isInside = true;
    }
    if (isExplained || isInside) {
      return true;
    }
    if (next != m_onward.begin() && (next - 1)->from >= barrier) {
      (next - 1)->mistake->differs = true;
      return true;
    }
    return explainFromBehind(difference);
  }

  // What is read otherwise behind a field may hold its keyword, and another value, once more.
  bool explainFromBehind(const Difference& difference) {
    if (difference.sort != Difference::kField) {
      return false;
    }
    const WrittenDefinition& definition = m_file.written.definitions()[difference.definition];
    const auto next = std::lower_bound(
        m_onward.begin(), m_onward.end(), difference.end,
        [](const Onward& onward, std::size_t offset) { return onward.from < offset; });
    if (next == m_onward.end() || next->from >= definition.end) {
      return false;
    }
    next->mistake->differs = true;
    return true;
  }

  // The mistakes of a definition that concern a field are found once.
  bool explainByField(const Difference& difference) {
    const bool hasField =
        difference.sort == Difference::kField ||
        (difference.sort == Difference::kLost && difference.clause == Clause::kOid);
    if (!hasField) {
      return false;
    }
    const std::uint32_t field = fieldOf(difference.clause);
    if (m_fieldsOf != difference.definition) {
      m_fieldsOf = difference.definition;
      m_fieldsLooked = 0;
      m_fieldsExplained = 0;
    }
    if ((m_fieldsLooked & field) == 0) {
      m_fieldsLooked |= field;
      lookForField(m_file.written.definitions()[difference.definition], field);
    }
    return (m_fieldsExplained & field) != 0;
  }

  void lookForField(const WrittenDefinition& definition, std::uint32_t field) {
    auto next = std::lower_bound(
        m_mistakes.begin(), m_mistakes.end(), definition.offset,
        [](const Mistake& mistake, std::size_t offset) { return mistake.from < offset; });
    for (; next != m_mistakes.end() && next->from < definition.end; ++next) {
      if (next->reach == Mistake::kFields && (next->fields & field) != 0) {
        next->differs = true;
        m_fieldsExplained |= field;
      }
    }
  }

  void tell(const Difference& difference) {
    Mistake mistake;
    mistake.rule = "L100";
    mistake.offset = difference.offset;
    mistake.from = difference.begin;
    mistake.definition = difference.definition;
    mistake.judged = Mistake::kError;
    const bool isClause =
        difference.sort == Difference::kField && difference.clause < Clause::kExtension;
    mistake.text = (isClause ? std::string(keywordOf(difference.clause)) + " " : std::string()) +
                   "reads as " + difference.reads + ", is kept as " + difference.kept +
                   "; look at what stands here and before it, and write it in another way";
    m_mistakes.push_back(std::move(mistake));
  }

  const BothReadings& m_file;
  Mistakes& m_mistakes;
  std::vector<Onward> m_onward;
  std::vector<std::size_t> m_barriers;
  std::uint32_t m_fieldsOf = Difference::kNone;  // the definition that the next two are of
  std::uint32_t m_fieldsLooked = 0;
  std::uint32_t m_fieldsExplained = 0;
};

bool belongsToWord(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9');
}

// Where a quote was left out before one that is not closed: the first quoted text of the line
// directly behind which a word stands. The place of the open quote when there is none.
std::size_t beginOfDisorder(std::string_view bytes, std::size_t begin, std::size_t open) {
  const std::size_t lineEnd = open == 0 ? std::string_view::npos : bytes.rfind('\n', open - 1);
  std::size_t at = lineEnd == std::string_view::npos ? begin : std::max(begin, lineEnd + 1);
  while ((at = bytes.find('\'', at)) < open) {
    const std::size_t end = bytes.find('\'', at + 1);
    if (end >= open || belongsToWord(bytes[end + 1])) {
      return std::min(at, open);
    }
    at = end + 1;
  }
  return open;
}

// What is odd behind a quote that was left out is odd for that reason.
void dropDisorder(const WrittenFile& written, Mistakes* mistakes) {
  std::vector<std::pair<std::size_t, std::size_t>> disorders;  // from, up to the open quote
  for (Mistake& mistake : *mistakes) {
    const std::string_view bytes = written.source().bytes();
    if (!mistake.isUnclosedQuote || mistake.definition == Difference::kNone) {
      continue;
    }
    const WrittenDefinition& definition = written.definitions()[mistake.definition];
    mistake.from = beginOfDisorder(bytes, definition.offset, mistake.offset);
    if (mistake.from < mistake.offset) {
      disorders.emplace_back(mistake.from, mistake.offset);
    }
  }
  const auto isDisorder = [&](const Mistake& mistake) {
    const auto behind = std::upper_bound(
        disorders.begin(), disorders.end(), mistake.offset,
        [](std::size_t offset, const auto& disorder) { return offset < disorder.first; });
    return behind != disorders.begin() && mistake.offset < (behind - 1)->second;
  };
  if (!disorders.empty()) {
    std::sort(disorders.begin(), disorders.end());
    mistakes->erase(std::remove_if(mistakes->begin(), mistakes->end(), isDisorder),
                    mistakes->end());
  }
}

// A file with text and no definition says so alone.
void gatherTextWithoutDefinition(const WrittenFile& written, Mistakes* mistakes) {
  const auto isText = [](const Mistake& mistake) {
    return isRule(mistake, "L105") || isRule(mistake, "D209") || isRule(mistake, "L101");
  };
  const auto mayStand = [&](const Mistake& mistake) {
    return isText(mistake) || isRule(mistake, "L107") || isRule(mistake, "L112");
  };
  const auto first = std::find_if(mistakes->begin(), mistakes->end(), isText);
  if (!written.definitions().empty() || first == mistakes->end() ||
      !std::all_of(mistakes->begin(), mistakes->end(), mayStand)) {
    return;
  }
  Mistake mistake;
  mistake.rule = "L109";
  mistake.offset = first->offset;
  mistake.from = mistake.offset;
  mistake.judged = Mistake::kError;
  mistake.text =
      "the file has text and no definition, so that nothing of it is read; see whether it is the "
      "file that is meant";
  mistakes->erase(std::remove_if(mistakes->begin(), mistakes->end(), isText), mistakes->end());
  mistakes->insert(mistakes->begin(), std::move(mistake));
}

Finding findingOf(const Source& source, const char* rule, Severity severity, std::size_t offset,
                  std::string text) {
  const Place place = source.placeOf(offset);
  return {rule, severity, source.path(), place.line, place.column, std::move(text), {}};
}

// True when the file is another format's, which alone is told.
bool checkFormat(const WrittenFile& written, Findings* findings) {
  const Source& source = written.source();
  const ForeignFormat format = foreignFormatOf(source.bytes());
  const bool isText = format != ForeignFormat::kUtf16 && format != ForeignFormat::kCompressed;
  if (format == ForeignFormat::kNone || (isText && written.hasSections())) {
    return false;
  }
  const bool isUtf16 = format == ForeignFormat::kUtf16;
  findings->push_back(findingOf(
      source, isUtf16 ? "L107" : "L108", Severity::kError, 0,
      "this is " + std::string(nameOf(format)) +
          (isUtf16 ? ", of which the reader takes nothing; save it as plain text in ASCII"
                   : " and no schema file, of which the reader takes nothing; convert it to "
                     "definitions as \"attributetypes=( ... )\"")));
  return true;
}

}  // namespace

std::uint32_t BothReadings::definitionAt(std::size_t offset) const {
  const std::vector<WrittenDefinition>& definitions = written.definitions();
  const auto beginOf = [](const WrittenDefinition& definition) {
    return definition.isInBlock ? definition.offset : definition.section;
  };
  const auto behind = std::upper_bound(
      definitions.begin(), definitions.end(), offset,
      [&](std::size_t at, const WrittenDefinition& candidate) { return at < beginOf(candidate); });
  if (behind == definitions.begin() || offset > (behind - 1)->end ||
      (offset == (behind - 1)->end && (behind - 1)->isClosed)) {
    return Difference::kNone;
  }
  return static_cast<std::uint32_t>(behind - 1 - definitions.begin());
}

void checkText(const SchemaFile& file, Findings* findings) {
  const WrittenFile& written = *file.written;
  if (checkFormat(written, findings)) {
    return;
  }
  const Differences differences(written, *file.kept);
  const BothReadings both{written, differences};
  Mistakes mistakes;
  findTextMistakes(both, &mistakes);
  findDefinitionMistakes(both, &mistakes);
  dropDisorder(written, &mistakes);
  Judge(both, &mistakes).judge();
  gatherTextWithoutDefinition(written, &mistakes);
  std::uint32_t described = Difference::kNone;
  std::string description;
  for (Mistake& mistake : mistakes) {
    const bool isError = mistake.judged == Mistake::kError ||
                         (mistake.judged != Mistake::kWarning && mistake.differs);
    if (mistake.judged == Mistake::kOnlyWithDifference && !mistake.differs) {
      continue;
    }
    findings->push_back(findingOf(written.source(), mistake.rule,
                                  isError ? Severity::kError : Severity::kWarning, mistake.offset,
                                  std::move(mistake.text)));
    if (mistake.definition != Difference::kNone) {
      // A definition may have many findings, and many clauses to look for its name in.
      if (described != mistake.definition) {
        described = mistake.definition;
        description = written.describe(written.definitions()[described]);
      }
      findings->back().definition = description;
    }
  }
}

}  // namespace migration
