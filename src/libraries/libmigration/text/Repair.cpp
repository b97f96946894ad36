#include "Repair.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <utility>

#include "Keywords.h"

namespace migration {

namespace {

struct Edit {
  std::size_t begin;
  std::size_t end;
  std::string text;
};

bool makesUncertain(Oddity oddity) {
  switch (oddity) {
    case Oddity::kNul:
    case Oddity::kLastWord:
    case Oddity::kLineEndInQuotes:
    case Oddity::kUnclosedQuote:
    case Oddity::kBadLength:
    case Oddity::kDoubleQuote:
    case Oddity::kStrayParenthesis:
    case Oddity::kNotClosed:
    case Oddity::kDefinitionInDefinition:
    case Oddity::kNoValue:
    case Oddity::kNoName:
      return true;
    default:
      return false;
  }
}

class Repairer {
 public:
  explicit Repairer(const WrittenFile& written)
      : m_written(written), m_bytes(written.source().bytes()) {}

  Repair run() {
    std::size_t next = 0;
    const std::vector<WrittenOddity>& oddities = m_written.oddities();
    for (const WrittenDefinition& definition : m_written.definitions()) {
      while (next < oddities.size() && oddities[next].offset < definition.offset) {
        ++next;
      }
      bool isCertain = definition.isClosed;
      for (; next < oddities.size() && oddities[next].offset < definition.end; ++next) {
        isCertain = isCertain && !makesUncertain(oddities[next].oddity);
      }
      if (isCertain) {
        mendClauses(definition);
      }
    }
    for (const WrittenOddity& oddity : oddities) {
      mend(oddity);
    }
    return made();
  }

 private:
  void change(const char* rule, std::size_t offset, std::string text) {
    m_repair.changes.push_back({rule, m_written.source().placeOf(offset), std::move(text)});
  }

  void mendClauses(const WrittenDefinition& definition) {
    const Slice<WrittenClause> clauses = m_written.clausesOf(definition);
    bool isInNames = false;
    const WrittenClause* last = nullptr;
    for (const WrittenClause& clause : clauses) {
      if (clause.clause == Clause::kExtension) {
        makeComment(clause, isInNames ? "D207" : "D201");
        continue;
      }
      last = &clause;
      isInNames = (isInNames || clause.clause == Clause::kName) &&
                  !endsNames(definition.kind, clause.clause);
    }
    const bool isList = last != nullptr && isKnownTo(definition.kind, last->clause) &&
                        (last->clause == Clause::kMust || last->clause == Clause::kMay ||
                         last->clause == Clause::kDbName);
    if (isList && !last->isList && last->valueCount > 0) {
      const Slice<WrittenValue> values = m_written.valuesOf(*last);
      m_edits.push_back({values.front().offset, values.front().offset, "( "});
      m_edits.push_back({values.back().end, values.back().end, " )"});
      change("D208", last->offset,
             "parentheses round the value of " + std::string(keywordOf(last->clause)));
    }
  }

  // The clause stands in one line then, and what is behind it in the next.
  void makeComment(const WrittenClause& clause, const char* rule) {
    std::string text = "# ";
    for (const char c : m_bytes.substr(clause.offset, clause.end - clause.offset)) {
      text += c == '\n' || c == '\r' ? ' ' : c;
    }
    m_comments.push_back({clause.offset, clause.end, text + "\n"});
    change(rule, clause.offset, "a comment of " + std::string(clause.keyword));
  }

  void mend(const WrittenOddity& oddity) {
    switch (oddity.oddity) {
      case Oddity::kLastWord:
        m_edits.push_back({oddity.end, oddity.end, "\n"});
        change("L101", oddity.offset, "a line end behind the last word");
        break;
      case Oddity::kSpelling:
        mendLetterCase(oddity);
        break;
      case Oddity::kCarriageReturn:
        if (isBeforeLineEnd(oddity.offset)) {
          mendLineEnds(oddity.offset);
        } else {
          m_edits.push_back({oddity.offset, oddity.end, " "});
          change("L113", oddity.offset, "a blank in place of a carriage return");
        }
        break;
      default:
        break;
    }
  }

  void mendLetterCase(const WrittenOddity& oddity) {
    const std::string_view word = m_bytes.substr(oddity.offset, oddity.end - oddity.offset);
    const Keyword keyword = anyCaseKeyword(word);
    if (keyword.sort != Keyword::kNone && word.find('_') == std::string_view::npos) {
      m_edits.push_back({oddity.offset, oddity.end, std::string(keyword.text)});
      change("L110", oddity.offset, std::string(keyword.text) + " in its letter case");
    }
  }

  bool isBeforeLineEnd(std::size_t offset) const {
    return offset + 1 < m_bytes.size() && m_bytes[offset + 1] == '\n';
  }

  // Once for the file. Texts in quotes keep theirs.
  void mendLineEnds(std::size_t offset) {
    if (m_hasLineEnds) {
      return;
    }
    m_hasLineEnds = true;
    const std::vector<std::pair<std::size_t, std::size_t>> quoted = quotedLines();
    auto next = quoted.begin();
    std::size_t count = 0;
    for (std::size_t at = m_bytes.find("\r\n"); at != std::string_view::npos;
         at = m_bytes.find("\r\n", at + 2)) {
      while (next != quoted.end() && next->second <= at) {
        ++next;
      }
      if (next == quoted.end() || at < next->first) {
        m_edits.push_back({at, at + 1, {}});
        ++count;
      }
    }
    change("L113", offset, std::to_string(count) + " carriage returns before line ends away");
  }

  // Where texts in quotes hold line ends.
  std::vector<std::pair<std::size_t, std::size_t>> quotedLines() const {
    std::vector<std::pair<std::size_t, std::size_t>> places;
    for (const WrittenOddity& oddity : m_written.oddities()) {
      if (oddity.oddity == Oddity::kLineEndInQuotes) {
        const std::size_t end = m_bytes.find('\'', oddity.offset + 1);
        places.emplace_back(oddity.offset, std::min(end, m_bytes.size()));
      }
    }
    return places;
  }

  Repair made() {
    const auto isBefore = [](const Edit& left, const Edit& right) {
      return left.begin < right.begin;
    };
    std::stable_sort(m_edits.begin(), m_edits.end(), isBefore);
    // What becomes a comment is written anew as a whole.
    std::vector<Edit> edits;
    auto comment = m_comments.begin();
    for (Edit& edit : m_edits) {
      while (comment != m_comments.end() && comment->end <= edit.begin) {
        edits.push_back(std::move(*comment++));
      }
      if (comment == m_comments.end() || edit.begin < comment->begin) {
        edits.push_back(std::move(edit));
      }
    }
    edits.insert(edits.end(), std::make_move_iterator(comment),
                 std::make_move_iterator(m_comments.end()));
    std::size_t done = 0;
    for (const Edit& edit : edits) {
      m_repair.bytes.append(m_bytes.substr(done, edit.begin - done)).append(edit.text);
      done = edit.end;
    }
    m_repair.bytes.append(m_bytes.substr(done));
    std::stable_sort(m_repair.changes.begin(), m_repair.changes.end(),
                     [](const RepairedPlace& left, const RepairedPlace& right) {
                       return std::pair(left.place.line, left.place.column) <
                              std::pair(right.place.line, right.place.column);
                     });
    return std::move(m_repair);
  }

  const WrittenFile& m_written;
  std::string_view m_bytes;
  std::vector<Edit> m_edits;
  std::vector<Edit> m_comments;  // in the order of their places
  bool m_hasLineEnds = false;
  Repair m_repair;
};

}  // namespace

Repair repair(const WrittenFile& written) { return Repairer(written).run(); }

}  // namespace migration
