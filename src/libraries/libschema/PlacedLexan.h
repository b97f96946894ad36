// An analyser over bytes in memory for who reads definitions without a schema manager: it tells
// where tokens end, and a definition that would never complete is left. Everything else is as
// SchemaLexan has it.

#ifndef LIBSCHEMA_PLACED_LEXAN_H
#define LIBSCHEMA_PLACED_LEXAN_H

#include <cstddef>
#include <string_view>

#include "SchemaLexan.h"

class PlacedLexan final : public SchemaLexan {
 public:
  // What the parse() of a definition throws where over any other analyser it would stay for ever:
  // at COLLECTIVE of an attribute type, and at the end of the input in a list of names. The
  // definition's members keep what was read so far.
  struct NeverCompletes {};

  // The bytes are not copied, and must stay as they are as long as the analyser reads.
  explicit PlacedLexan(std::string_view bytes);

  // As SchemaLexan has it; throws NeverCompletes where it says so.
  int lexan() override;

  // How many bytes there are up to the end of the token that lexan() returned last, and up to that
  // of the token before it. All of them for TOKEN_END.
  std::size_t end() const { return m_end; }
  std::size_t endBefore() const { return m_endBefore; }

 private:
  const char* m_bytes;
  std::size_t m_size;
  std::size_t m_end = 0;
  std::size_t m_endBefore = 0;
};

#endif  // LIBSCHEMA_PLACED_LEXAN_H
