// The L rules: what is found in the text itself.

#include <algorithm>
#include <array>
#include <utility>

#include "KeptFields.h"
#include "Keywords.h"
#include "Mistakes.h"

namespace migration {

namespace {

std::string byteText(char c) {
  constexpr char kDigits[] = "0123456789abcdef";
  const auto byte = static_cast<unsigned char>(c);
  return std::string("\\x") + kDigits[byte / 16] + kDigits[byte % 16];
}

class TextMistakes {
 public:
  TextMistakes(const BothReadings& file, Mistakes* mistakes)
      : m_file(file),
        m_written(file.written),
        m_bytes(file.written.source().bytes()),
        m_mistakes(*mistakes) {}

  void find() {
    for (const WrittenOddity& oddity : m_written.oddities()) {
      m_lastWord = oddity.oddity == Oddity::kLastWord ? oddity.offset : m_lastWord;
    }
    for (const WrittenOddity& oddity : m_written.oddities()) {
      lookAt(oddity);
    }
    const std::vector<WrittenDefinition>& definitions = m_written.definitions();
    for (std::uint32_t i = 0; i < definitions.size(); ++i) {
      for (const WrittenClause& clause : m_written.clausesOf(definitions[i])) {
        for (const WrittenValue& value : m_written.valuesOf(clause)) {
          if (mayBeKeyword(value)) {
            lookAtValue(i, clause, value);
          }
        }
      }
    }
    if (m_written.commentLines() > 0) {
      const std::string count = std::to_string(m_written.commentLines());
      add("L112", m_written.firstComment(),
          (m_written.commentLines() == 1
               ? "a comment begins here, and the library does not write it"
               : "the first of " + count + " comment lines, none of which the library writes") +
              std::string("; keep it elsewhere if it matters"))
          .judged = Mistake::kWarning;
    }
  }

 private:
  // How a value that looks like a keyword is kept.
  struct Looked {
    Clause clause;
    std::string_view raw;
    bool isKept;
    bool isFolded;
  };

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

  std::string textOf(const WrittenOddity& oddity) const {
    return quotedForMessage(m_bytes.substr(oddity.offset, oddity.end - oddity.offset));
  }

  // Whatever is wrong with text outside definitions, it is text outside definitions.
  bool isOutside(const WrittenOddity& oddity) const { return oddity.offset < m_outsideEnd; }

  void lookAt(const WrittenOddity& oddity) {
    switch (oddity.oddity) {
      case Oddity::kByteOrderMark:
        add("L107", oddity.offset,
            "the file begins with a byte-order mark, which is no part of a schema; save it as "
            "plain text without the mark");
        break;
      case Oddity::kNul:
        add("L107", oddity.offset,
            "a byte of zero stands in the text, where the reader ends a word or a quoted text; "
            "take it out");
        break;
      case Oddity::kLastWord:
        add("L101", oddity.offset,
            textOf(oddity) +
                " is the last word of the file and has no line end behind it, so "
                "that the reader does not see it; end the line")
            .judged = Mistake::kError;
        break;
      case Oddity::kTextOutside:
        lookAtTextOutside(oddity);
        break;
      case Oddity::kSpelling:
        lookAtSpelling(oddity);
        break;
      case Oddity::kCarriageReturn:
        add("L113", oddity.offset,
            "a carriage return stands where the reader takes every byte for a token, and what "
            "belongs behind it is not taken; end lines with a line feed alone")
            .judged = Mistake::kOnlyWithDifference;
        break;
      default:
        if (!isOutside(oddity)) {
          lookAtToken(oddity);
        }
    }
  }

  void lookAtToken(const WrittenOddity& oddity) {
    switch (oddity.oddity) {
      case Oddity::kByteInQuotes:
        add("L102", oddity.offset,
            "the byte " + byteText(m_bytes[oddity.offset]) +
                " ends the quoted text for the reader, which takes printable ASCII only, and what "
                "stands behind is read as if it stood outside; write the text in ASCII");
        break;
      case Oddity::kLineEndInQuotes:
        add("L103", oddity.offset,
            "a line end stands in the quoted text that begins here, and ends it for the reader; "
            "write the text on one line");
        break;
      case Oddity::kUnclosedQuote:
        add("L103", oddity.offset,
            "the quote that begins a text here is not closed, and what stands behind is taken for "
            "a part of it; write the closing quote")
            .isUnclosedQuote = true;
        break;
      case Oddity::kTabBehindWord:
        add("L103", oddity.offset,
            "a TAB stands directly behind " + textOf(oddity) +
                ", and the reader takes it for a part of the word; write a blank in its place");
        break;
      case Oddity::kBadLength:
        add("L104", oddity.offset,
            "the length of " + textOf(oddity) +
                " is none: only a number takes one, as digits in braces directly behind; write it "
                "so, or take it away");
        break;
      case Oddity::kDoubleQuote:
        add("L111", oddity.offset,
            "double quotes stand round " + textOf(oddity) +
                ", and the reader takes each for a character by itself; write single quotes");
        break;
      default:
        break;
    }
  }

  // A single word that the end of the file cuts off is told as that.
  void lookAtTextOutside(const WrittenOddity& oddity) {
    m_outsideEnd = oddity.end;
    const bool isLastWord = oddity.offset == m_lastWord;
    if (!isLastWord) {
      add("L105", oddity.offset,
          "this text stands outside definitions and is passed over; make a comment of it with "
          "\"#\", or take it out")
          .judged = Mistake::kError;
    }
  }

  void lookAtSpelling(const WrittenOddity& oddity) {
    const std::string_view word = m_bytes.substr(oddity.offset, oddity.end - oddity.offset);
    const std::uint32_t number = m_file.definitionAt(oddity.offset);
    Keyword keyword = anyCaseKeyword(word);
    const bool isCase = keyword.sort != Keyword::kNone;
    if (!isCase) {
      const Kind kind =
          number == Difference::kNone ? Kind::kAttributeType : m_written.definitions()[number].kind;
      keyword = nearClauseKeyword(word, kind);
      keyword = keyword.sort == Keyword::kNone ? nearSectionKeyword(word) : keyword;
    }
    add("L110", oddity.offset,
        textOf(oddity) +
            (isCase ? " is a keyword in the wrong letter case"
                    : " is no keyword, and looks like one") +
            ", so that the reader takes it for a plain word; write " + std::string(keyword.text));
  }

  // Quotes make no difference to the reader, and the words that begin a section are folded.
  static bool mayBeKeyword(const WrittenValue& value) {
    return value.form <= Form::kQuoted && value.form != Form::kNumber && value.raw.size() >= 3 &&
           exactKeyword(value.raw).sort != Keyword::kNone;
  }

  void lookAtValue(std::uint32_t number, const WrittenClause& clause, const WrittenValue& value) {
    const Keyword keyword = exactKeyword(value.raw);
    const WrittenDefinition& definition = m_written.definitions()[number];
    if (clause.clause != Clause::kOid && !isKnownTo(definition.kind, clause.clause)) {
      return;
    }
    const KeptDefinition* const kept = m_file.differences.keptOf(number);
    if (kept == nullptr) {
      if (keyword.sort == Keyword::kClause) {
        addKeyword(number, value, keyword);
      }
      return;
    }
    const Looked* const looked = lookFor(number, *kept, clause.clause, value.raw, keyword.text);
    if (looked == nullptr || looked->isKept) {
      return;
    }
    Mistake& mistake = addKeyword(number, value, keyword);
    if (looked->isFolded) {
      mistake.reach = Mistake::kFields;
      mistake.judged = Mistake::kWarning;
      mistake.text = quotedForMessage(value.raw) + " is kept as " + quotedForMessage(keyword.text) +
                     ", the word that begins a definition; nothing is lost but the letter case";
    }
  }

  // Each keyword once in a clause of a definition; null from the second time on.
  const Looked* lookFor(std::uint32_t number, const KeptDefinition& kept, Clause clause,
                        std::string_view raw, std::string_view keyword) {
    if (m_lookedIn != number) {
      m_looked.clear();
      m_lookedIn = number;
    }
    for (const Looked& looked : m_looked) {
      if (looked.clause == clause && looked.raw == raw) {
        return nullptr;
      }
    }
    const KeptFields fields(kept);
    m_looked.push_back(
        {clause, raw, isAmong(fields, clause, raw), isAmong(fields, clause, keyword)});
    return &m_looked.back();
  }

  Mistake& addKeyword(std::uint32_t number, const WrittenValue& value, const Keyword& keyword) {
    Mistake& mistake =
        add("L106", value.offset,
            quotedForMessage(value.raw) + " is read as the keyword " + std::string(keyword.text) +
                ", in quotes or not, and is no value; write another text");
    mistake.definition = number;
    return mistake;
  }

  static bool isAmong(const KeptFields& fields, Clause clause, std::string_view text) {
    if (const std::vector<std::string>* const list = fields.list(clause)) {
      return std::find(list->begin(), list->end(), text) != list->end();
    }
    return fields.text(clause) != nullptr && *fields.text(clause) == text;
  }

  const BothReadings& m_file;
  const WrittenFile& m_written;
  std::string_view m_bytes;
  Mistakes& m_mistakes;
  std::size_t m_outsideEnd = 0;
  std::size_t m_lastWord = ~std::size_t{0};
  std::vector<Looked> m_looked;  // in one definition
  std::uint32_t m_lookedIn = Difference::kNone;
};

}  // namespace

void findTextMistakes(const BothReadings& file, Mistakes* mistakes) {
  TextMistakes(file, mistakes).find();
}

}  // namespace migration
