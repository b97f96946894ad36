// The clauses of a definition as they are written.

#include "WrittenParser.h"

namespace migration {

namespace {

bool isExtension(std::string_view word) {
  return word.size() > 2 && (word[0] == 'X' || word[0] == 'x') && word[1] == '-';
}

// A clause whose list or value the reader leaves at a byte that it does not know.
bool stopsAtCarriageReturn(const WrittenClause& clause) {
  return clause.clause != Clause::kName && clause.clause != Clause::kDbName &&
         clause.clause != Clause::kOid && clause.clause < Clause::kExtension;
}

}  // namespace

// The first word or number, unless it is a keyword, or is meant as one and has a value behind it.
void WrittenParser::oid(const WrittenDefinition& definition) {
  if (!m_token.isValue() || beginsSection()) {
    return;
  }
  if (m_token.sort == WrittenToken::kWord) {
    if (exactKeyword(m_token.raw).sort == Keyword::kClause) {
      return;
    }
    const WrittenToken behind = m_scanner.peek();
    const bool hasValue = behind.sort == WrittenToken::kQuoted || behind.is('(');
    if (hasValue && anyCaseKeyword(m_token.raw).sort == Keyword::kClause) {
      return;
    }
  }
  WrittenClause* const clause = beginClause(Clause::kOid);
  clause->keyword = {};
  addValue(definition, clause);
}

WrittenClause* WrittenParser::beginClause(Clause clause) {
  WrittenClause begun{};
  begun.clause = clause;
  begun.keyword = m_token.raw;
  begun.offset = placeOf(m_token.offset);
  begun.end = placeOf(m_token.end);
  begun.firstValue = static_cast<std::uint32_t>(m_file.m_values.size());
  m_file.m_clauses.push_back(begun);
  m_carriageNoted = false;
  return &m_file.m_clauses.back();
}

void WrittenParser::clause(const WrittenDefinition& definition) {
  if (m_token.sort != WrittenToken::kWord) {
    unknownClause(definition);
    return;
  }
  Keyword keyword = exactKeyword(m_token.raw);
  if (keyword.sort != Keyword::kNone) {
    keywordClause(definition, keyword);
    return;
  }
  if (isExtension(m_token.raw)) {
    unknownClause(definition);
    return;
  }
  keyword = anyCaseKeyword(m_token.raw);
  if (keyword.sort == Keyword::kNone) {
    keyword = nearClauseKeyword(m_token.raw, definition.kind);
  }
  if (keyword.sort == Keyword::kClause) {
    note(Oddity::kSpelling, m_token);
    keywordClause(definition, keyword);
  } else {
    unknownClause(definition);
  }
}

void WrittenParser::keywordClause(const WrittenDefinition& definition, const Keyword& keyword) {
  if (keyword.sort != Keyword::kClause || !isKnownTo(definition.kind, keyword.clause)) {
    unknownClause(definition);
    m_file.m_clauses.back().clause =
        keyword.sort == Keyword::kClause ? keyword.clause : Clause::kUnknown;
    return;
  }
  WrittenClause* const clause = beginClause(keyword.clause);
  advance();
  switch (shapeOf(definition.kind, keyword.clause)) {
    case ClauseShape::kFlag:
      break;
    case ClauseShape::kValue:
      singleValue(definition, clause);
      break;
    case ClauseShape::kList:
      list(definition, clause);
      break;
  }
}

// A clause that definitions of this kind do not have: whatever follows and is no keyword belongs to
// it.
void WrittenParser::unknownClause(const WrittenDefinition& definition) {
  const bool isWord = m_token.sort == WrittenToken::kWord;
  WrittenClause* const clause =
      beginClause(isWord && isExtension(m_token.raw) ? Clause::kExtension : Clause::kUnknown);
  const bool isCharacter = m_token.sort == WrittenToken::kCharacter;
  advance();
  if (isCharacter) {
    return;
  }
  if (isWord && m_token.is('(') && !beginsDefinition()) {
    list(definition, clause);
    return;
  }
  while (m_token.isValue() && !beginsSection()) {
    if (m_token.sort == WrittenToken::kWord &&
        (isExtension(m_token.raw) || exactKeyword(m_token.raw).sort == Keyword::kClause ||
         anyCaseKeyword(m_token.raw).sort == Keyword::kClause ||
         nearClauseKeyword(m_token.raw, definition.kind).sort == Keyword::kClause)) {
      return;
    }
    addValue(definition, clause);
  }
}

// The keyword of a clause that stands where a value must; only as the reader knows it, since values
// may be called like one in another letter case.
Keyword WrittenParser::keywordHere() const {
  if (m_token.sort != WrittenToken::kWord) {
    return {};
  }
  const Keyword keyword = exactKeyword(m_token.raw);
  return keyword.sort == Keyword::kClause || (keyword.sort == Keyword::kSection && beginsSection())
             ? keyword
             : Keyword();
}

// Passes over characters that stand where a value must. True when a value comes next.
bool WrittenParser::passOutOfPlace() {
  while (m_token.sort == WrittenToken::kCharacter && !m_token.is('(') && !m_token.is(')') &&
         !(m_isInBlock && m_token.is('}'))) {
    note(Oddity::kNoName, m_token);
    advance();
  }
  return m_token.isValue() && keywordHere().sort == Keyword::kNone && !beginsSection();
}

void WrittenParser::singleValue(const WrittenDefinition& definition, WrittenClause* clause) {
  noteCarriage(clause);
  const std::size_t before = m_token.offset;
  if (passOutOfPlace()) {
    addValue(definition, clause);
  } else if (m_token.is('(') && !beginsDefinition()) {
    note(Oddity::kStrayParenthesis, m_token);
    list(definition, clause);
  } else if (m_token.offset == before &&
             (m_token.is(')') || keywordHere().sort == Keyword::kClause)) {
    note(Oddity::kNoValue, clause->offset, clause->offset + clause->keyword.size());
  }
}

// One value, or values in parentheses, with "$" between them or without. Without parentheses values
// go on where "$" stands between them, and where the clause takes one behind the other.
void WrittenParser::list(const WrittenDefinition& definition, WrittenClause* clause) {
  noteCarriage(clause);
  const std::size_t opening = m_token.offset;
  clause->isList = m_token.is('(') && (clause->clause == Clause::kName || !beginsDefinition());
  if (clause->isList) {
    advance();
  }
  std::size_t depth = 0;
  bool isSeparated = true;  // a value must stand here
  for (;; noteCarriage(clause)) {
    if (m_token.is('$') && !isSeparated && clause->clause != Clause::kName &&
        clause->clause != Clause::kDbName) {
      isSeparated = true;
      advance();
    } else if (m_token.is('(') && clause->isList && !beginsDefinition()) {
      note(Oddity::kStrayParenthesis, m_token);
      ++depth;
      advance();
    } else if (m_token.is(')') && depth > 0) {
      --depth;
      advance();
    } else if ((clause->isList || isSeparated || clause->clause != Clause::kSup) &&
               passOutOfPlace()) {
      if (!clause->isList && !isSeparated && m_token.sort == WrittenToken::kWord &&
          (clause->clause == Clause::kName || isExtension(m_token.raw) ||
           anyCaseKeyword(m_token.raw).sort != Keyword::kNone ||
           nearClauseKeyword(m_token.raw, definition.kind).sort != Keyword::kNone)) {
        break;
      }
      addValue(definition, clause);
      isSeparated = false;
    } else {
      break;
    }
  }
  if (clause->valueCount == 0 || (isSeparated && clause->valueCount > 0)) {
    if (m_token.is(')') || keywordHere().sort == Keyword::kClause) {
      note(Oddity::kNoValue, clause->offset, clause->offset + clause->keyword.size());
    }
  }
  if (clause->isList && m_token.is(')')) {
    advance();
    clause->end = placeOf(m_end);
  } else if (clause->isList && m_token.isValue() && !beginsSection()) {
    note(Oddity::kStrayParenthesis, opening, opening + 1);
  }
}

void WrittenParser::addValue(const WrittenDefinition& definition, WrittenClause* clause) {
  const bool isWord = m_token.sort == WrittenToken::kWord;
  const bool isNumber = m_token.sort == WrittenToken::kNumber;
  const bool hasOddLength =
      (isWord || isNumber) && !m_token.hasLength && m_token.raw.find('{') != std::string_view::npos;
  const bool isKnown = clause->clause != Clause::kOid && isKnownTo(definition.kind, clause->clause);
  if (isKnown && !hasOddLength) {
    const bool isNoName =
        isNumber ? !(m_token.hasLength ? takesLength : takesNumber)(definition.kind, clause->clause)
                 : isWord && clause->clause != Clause::kName && !isReadersWord(m_token.raw) &&
                       m_token.raw.find('\0') == std::string_view::npos;
    if (isNoName) {
      note(Oddity::kNoName, m_token);
    }
  }
  const Form form = isWord                                  ? Form::kWord
                    : isNumber                              ? Form::kNumber
                    : m_token.sort == WrittenToken::kQuoted ? Form::kQuoted
                                                            : Form::kDoubleQuoted;
  m_file.m_values.push_back({m_token.raw, placeOf(m_token.offset), placeOf(m_token.end), form});
  ++clause->valueCount;
  clause->end = placeOf(m_token.end);
  advance();
}

void WrittenParser::noteCarriage(WrittenClause* clause) {
  if (m_token.carriage != WrittenToken::kNone && !m_carriageNoted &&
      stopsAtCarriageReturn(*clause) &&
      (m_token.isValue() || m_token.is('(') || m_token.is('$') || m_token.is(')')) &&
      keywordHere().sort == Keyword::kNone) {
    note(Oddity::kCarriageReturn, m_token.carriage, m_token.carriage + 1);
    m_carriageNoted = true;
  }
}

}  // namespace migration
