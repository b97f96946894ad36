// Reads a schema's text as it is written into a WrittenFile. Internal.

#ifndef LIBSCHEMA_MIGRATION_WRITTEN_PARSER_H
#define LIBSCHEMA_MIGRATION_WRITTEN_PARSER_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "Keywords.h"
#include "Written.h"
#include "WrittenTokens.h"

namespace migration {

class WrittenParser {
 public:
  explicit WrittenParser(WrittenFile* file);

  void run();

 private:
  // Where a definition stands: the word that begins its section.
  struct Section {
    Kind kind = Kind::kAttributeType;
    bool isBlock = false;
    std::string_view keyword;
    std::size_t offset = 0;
    std::size_t commentsBegin = 0;
    std::size_t commentsEnd = 0;
  };
  // A block whose "}" is not met yet, and the first section that begins directly inside it.
  struct Block {
    Section section;
    std::size_t inner;
    std::size_t innerEnd;
  };
  // A definition in which another one begins before its ")" is met. If that stands behind the
  // inner one, it holds it; otherwise it is not closed.
  struct Interrupted {
    std::size_t offset;  // of its "("
    std::size_t inner;   // of what begins inside
    std::size_t innerEnd;
    std::size_t depth;  // of blocks
  };
  struct GapToken {
    std::size_t offset;
    std::size_t end;
    bool closes;  // is a ")"
    bool isLone;  // a parenthesis without its partner
  };

  static std::uint32_t placeOf(std::size_t offset) { return static_cast<std::uint32_t>(offset); }
  void advance();
  void note(Oddity oddity, std::size_t offset, std::size_t end);
  void note(Oddity oddity, const WrittenToken& token) { note(oddity, token.offset, token.end); }

  Keyword sectionAt(const WrittenToken& token) const;
  bool beginsSection() const;
  bool beginsDefinition() const;
  void section(const Keyword& keyword);
  void opening(const WrittenToken& word, const Section& section);
  void endOfBlock();
  void passTextOfSection();
  void gap();
  void judgeGap();
  void settleInterrupted(std::size_t depth);

  void definition(const Section& section);
  void clauses(WrittenDefinition* definition);
  bool endsDefinition(WrittenDefinition* definition, std::size_t* strayDepth);
  bool endsAtParenthesis(WrittenDefinition* definition, std::size_t* strayDepth);
  void oid(const WrittenDefinition& definition);
  void clause(const WrittenDefinition& definition);
  void keywordClause(const WrittenDefinition& definition, const Keyword& keyword);
  void unknownClause(const WrittenDefinition& definition);
  WrittenClause* beginClause(Clause clause);

  void singleValue(const WrittenDefinition& definition, WrittenClause* clause);
  void list(const WrittenDefinition& definition, WrittenClause* clause);
  bool passOutOfPlace();
  Keyword keywordHere() const;
  void addValue(const WrittenDefinition& definition, WrittenClause* clause);
  void noteCarriage(WrittenClause* clause);

  WrittenFile& m_file;
  WrittenScanner m_scanner;
  WrittenToken m_token;
  std::size_t m_end = 0;  // behind the token before
  bool m_carriageNoted = false;
  std::vector<GapToken> m_gap;
  std::vector<std::size_t> m_open;  // places of "(" in m_gap
  std::vector<Block> m_blocks;
  std::vector<Interrupted> m_interrupted;
  bool m_isInterrupted = false;  // the definition read last
  bool m_isInBlock = false;      // the definition that is read
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_WRITTEN_PARSER_H
