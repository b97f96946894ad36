#include "WrittenParser.h"

#include <algorithm>
#include <cstdint>
#include <initializer_list>
#include <limits>
#include <string_view>

namespace migration {

namespace {

// A definition written by hand has a value in as many bytes, and few more clauses than values.
constexpr std::size_t kBytesOfAValue = 24;

constexpr std::size_t kMostBytes = std::numeric_limits<std::uint32_t>::max();

// Whether a word can be one that begins a section: at either end it must look like one, since it
// has at most one mistake.
bool mayBeginSection(std::string_view word) {
  constexpr std::size_t kShortest = 12;
  constexpr std::size_t kLongest = 18;
  if (word.size() < kShortest || word.size() > kLongest) {
    return false;
  }
  const auto isOneOf = [](std::string_view part, std::initializer_list<std::string_view> parts) {
    return std::any_of(parts.begin(), parts.end(), [&](std::string_view candidate) {
      return std::equal(part.begin(), part.end(), candidate.begin(),
                        [](char c, char expected) { return (c | ' ') == expected; });
    });
  };
  return isOneOf(word.substr(0, 4), {"attr", "obje", "orva"}) ||
         isOneOf(word.substr(word.size() - 4), {"ypes", "sses"});
}

}  // namespace

WrittenParser::WrittenParser(WrittenFile* file)
    : m_file(*file), m_scanner(file->m_source->bytes().substr(0, kMostBytes), &file->m_oddities) {
  const std::size_t bytes = file->m_source->bytes().size();
  file->m_values.reserve(bytes / kBytesOfAValue);
  file->m_clauses.reserve(bytes / kBytesOfAValue);
}

void WrittenParser::advance() {
  m_end = m_token.end;
  m_token = m_scanner.next();
}

void WrittenParser::note(Oddity oddity, std::size_t offset, std::size_t end) {
  m_file.m_oddities.push_back({oddity, offset, end});
}

void WrittenParser::run() {
  m_token = m_scanner.next();
  m_file.m_hasText = m_token.sort != WrittenToken::kEnd;
  while (m_token.sort != WrittenToken::kEnd) {
    if (const Keyword keyword = sectionAt(m_token); keyword.sort != Keyword::kNone) {
      section(keyword);
    } else if (!m_blocks.empty() && m_token.is('(')) {
      Section inside = m_blocks.back().section;
      m_scanner.commentsAbove(m_token.offset, &inside.commentsBegin, &inside.commentsEnd);
      definition(inside);
    } else if (!m_blocks.empty() && m_token.is('}')) {
      endOfBlock();
    } else {
      gap();
    }
  }
  settleInterrupted(0);
  for (const Block& block : m_blocks) {
    note(Oddity::kBlockNotClosed, block.section.offset,
         block.innerEnd != 0 ? block.inner : m_file.m_source->bytes().size());
  }
  m_file.m_commentLines = m_scanner.commentLines();
  m_file.m_firstComment = m_scanner.firstComment();
  std::stable_sort(m_file.m_oddities.begin(), m_file.m_oddities.end(),
                   [](const WrittenOddity& left, const WrittenOddity& right) {
                     return left.offset < right.offset;
                   });
}

// ---- Sections ----

// The word that begins a section: one that the reader knows, whatever follows, and one that is
// meant so where what follows shows it.
Keyword WrittenParser::sectionAt(const WrittenToken& token) const {
  if (token.sort != WrittenToken::kWord || !mayBeginSection(token.raw)) {
    return {};
  }
  Keyword keyword = exactKeyword(token.raw);
  if (keyword.sort != Keyword::kNone) {
    return keyword.sort == Keyword::kSection ? keyword : Keyword();
  }
  keyword = anyCaseKeyword(token.raw);
  if (keyword.sort != Keyword::kSection) {
    keyword = nearSectionKeyword(token.raw);
  }
  if (keyword.sort == Keyword::kSection) {
    const WrittenToken behind = m_scanner.peek();
    if (behind.is('=') || behind.is('{') || behind.is('(')) {
      return keyword;
    }
  }
  return {};
}

// Within a definition, a section begins at such a word with "=" or "{" behind it.
bool WrittenParser::beginsSection() const {
  if (sectionAt(m_token).sort == Keyword::kNone) {
    return false;
  }
  const WrittenToken behind = m_scanner.peek();
  return behind.is('=') || behind.is('{');
}

void WrittenParser::section(const Keyword& keyword) {
  const WrittenToken word = m_token;
  if (!m_isInterrupted) {
    settleInterrupted(m_blocks.size());
    if (!m_blocks.empty() && m_blocks.back().innerEnd == 0) {
      m_blocks.back().inner = word.offset;
      m_blocks.back().innerEnd = word.end;
    }
  }
  Section begun;
  begun.kind = keyword.kind;
  begun.keyword = word.raw;
  begun.offset = word.offset;
  m_scanner.commentsAbove(word.offset, &begun.commentsBegin, &begun.commentsEnd);
  if (exactKeyword(word.raw).sort != Keyword::kSection) {
    note(Oddity::kSpelling, word);
  }
  advance();
  if (m_token.carriage != WrittenToken::kNone) {
    note(Oddity::kCarriageReturn, m_token.carriage, m_token.carriage + 1);
  }
  opening(word, begun);
}

// What stands behind the word that begins a section.
void WrittenParser::opening(const WrittenToken& word, const Section& begun) {
  m_file.m_hasSections = m_file.m_hasSections || m_token.is('{') || m_token.is('=');
  if (m_token.is('{')) {
    m_isInterrupted = false;
    m_blocks.push_back({begun, 0, 0});
    m_blocks.back().section.isBlock = true;
    advance();
  } else if (m_token.is('=')) {
    advance();
    // The reader takes the "(" of an object class behind it for another one.
    if (m_token.carriage != WrittenToken::kNone && begun.kind == Kind::kObjectClass) {
      note(Oddity::kCarriageReturn, m_token.carriage, m_token.carriage + 1);
    }
    if (m_token.sort == WrittenToken::kEnd || beginsSection() || m_token.is('}')) {
      m_isInterrupted = false;
      note(Oddity::kNotClosed, word);
    } else {
      definition(begun);
    }
  } else {
    // At the very end of the file the reader does not see the word.
    const bool isLast = word.end == m_file.m_source->bytes().size();
    if (exactKeyword(word.raw).sort == Keyword::kSection && !isLast) {
      note(Oddity::kNoOpening, word);
    }
    if (m_token.is('(')) {
      definition(begun);
    } else {
      passTextOfSection();
    }
  }
}

// A block holds the section that begins directly inside it when its own "}" stands behind.
void WrittenParser::endOfBlock() {
  settleInterrupted(m_blocks.size());
  m_isInterrupted = false;
  const Block& block = m_blocks.back();
  if (block.innerEnd != 0) {
    note(Oddity::kDefinitionInDefinition, block.inner, block.innerEnd);
  }
  m_blocks.pop_back();
  advance();
}

// What stands behind a word that begins a section, and nothing that opens it.
void WrittenParser::passTextOfSection() {
  m_isInterrupted = false;
  while (m_token.sort != WrittenToken::kEnd && sectionAt(m_token).sort == Keyword::kNone) {
    advance();
  }
}

// ---- Between definitions ----

// What stands between two definitions: text, which is told once, and parentheses that belong to
// nothing.
void WrittenParser::gap() {
  m_gap.clear();
  m_open.clear();
  while (m_token.sort != WrittenToken::kEnd && sectionAt(m_token).sort == Keyword::kNone &&
         (m_blocks.empty() || (!m_token.is('(') && !m_token.is('}')))) {
    const bool opens = m_token.is('(');
    const bool closes = m_token.is(')');
    bool isLone = opens;
    if (opens) {
      m_open.push_back(m_gap.size());
    } else if (closes) {
      isLone = m_open.empty();
      if (!isLone) {
        m_gap[m_open.back()].isLone = false;
        m_open.pop_back();
      }
    }
    m_gap.push_back({m_token.offset, m_token.end, closes, isLone});
    advance();
  }
  judgeGap();
}

void WrittenParser::judgeGap() {
  std::size_t from = 0;
  for (std::size_t i = 0; i < m_gap.size() && !m_interrupted.empty(); ++i) {
    // The end of a definition that holds the one before; what stands between belongs to it.
    if (m_gap[i].closes && m_gap[i].isLone && m_interrupted.back().depth == m_blocks.size()) {
      note(Oddity::kDefinitionInDefinition, m_interrupted.back().inner,
           m_interrupted.back().innerEnd);
      m_interrupted.pop_back();
      from = i + 1;
    }
  }
  std::size_t run = m_gap.size();  // the first token of the run of text
  for (std::size_t i = from; i <= m_gap.size(); ++i) {
    const bool isText = i < m_gap.size() && !m_gap[i].isLone;
    if (isText && run == m_gap.size()) {
      run = i;
    } else if (!isText && run != m_gap.size()) {
      note(Oddity::kTextOutside, m_gap[run].offset, m_gap[i - 1].end);
      run = m_gap.size();
    }
    if (!isText && i < m_gap.size()) {
      note(Oddity::kLoneParenthesis, m_gap[i].offset, m_gap[i].end);
    }
  }
}

// Those that are interrupted in blocks as deep are not closed.
void WrittenParser::settleInterrupted(std::size_t depth) {
  while (!m_interrupted.empty() && m_interrupted.back().depth >= depth) {
    note(Oddity::kNotClosed, m_interrupted.back().offset, m_interrupted.back().offset + 1);
    m_interrupted.pop_back();
  }
}

// ---- Definitions ----

void WrittenParser::definition(const Section& section) {
  if (!m_isInterrupted) {
    settleInterrupted(m_blocks.size());
  }
  // One that begins inside another is read behind it.
  do {
    m_isInterrupted = false;
    WrittenDefinition made{};
    made.kind = section.kind;
    made.isInBlock = m_isInBlock = section.isBlock;
    made.keyword = section.keyword;
    made.section = placeOf(section.offset);
    made.offset = placeOf(m_token.offset);
    made.commentsBegin = placeOf(section.commentsBegin);
    made.commentsEnd = placeOf(section.commentsEnd);
    made.firstClause = static_cast<std::uint32_t>(m_file.m_clauses.size());
    clauses(&made);
    made.clauseCount = static_cast<std::uint32_t>(m_file.m_clauses.size()) - made.firstClause;
    m_file.m_definitions.push_back(made);
  } while (m_isInterrupted && m_token.is('('));
}

void WrittenParser::clauses(WrittenDefinition* definition) {
  if (m_token.is('(')) {
    advance();
  } else {
    note(Oddity::kStrayParenthesis, m_token.offset, m_token.offset);
  }
  oid(*definition);
  for (std::size_t strayDepth = 0; !endsDefinition(definition, &strayDepth);) {
    clause(*definition);
  }
}

// Whether the definition ends here, and how. Stray parentheses are passed over.
bool WrittenParser::endsDefinition(WrittenDefinition* definition, std::size_t* strayDepth) {
  for (;;) {
    definition->end = placeOf(m_end);
    if (m_token.is(')')) {
      if (endsAtParenthesis(definition, strayDepth)) {
        return true;
      }
    } else if (m_token.sort == WrittenToken::kEnd || (definition->isInBlock && m_token.is('}'))) {
      note(Oddity::kNotClosed, definition->offset, definition->offset + 1);
      return true;
    } else if (beginsSection() || (m_token.is('(') && beginsDefinition())) {
      m_interrupted.push_back({definition->offset, m_token.offset, m_token.end, m_blocks.size()});
      m_isInterrupted = true;
      return true;
    } else if (m_token.is('(')) {
      note(Oddity::kStrayParenthesis, m_token);
      ++*strayDepth;
      advance();
    } else {
      return false;
    }
  }
}

// A ")" is the partner of a stray "(" only where the definition goes on behind it.
bool WrittenParser::endsAtParenthesis(WrittenDefinition* definition, std::size_t* strayDepth) {
  const std::size_t end = m_token.end;
  advance();
  const bool goesOn = m_token.is(')') || (m_token.isValue() && !beginsSection());
  if (*strayDepth > 0 && goesOn) {
    --*strayDepth;
    return false;
  }
  definition->isClosed = true;
  definition->end = placeOf(end);
  return true;
}

// Whether a definition begins at this "(": an OID and a word stand behind it.
bool WrittenParser::beginsDefinition() const {
  WrittenScanner ahead(m_scanner);
  ahead.beSilent();
  const WrittenToken first = ahead.next();
  return first.sort == WrittenToken::kNumber && !first.hasLength &&
         ahead.next().sort == WrittenToken::kWord;
}

}  // namespace migration
