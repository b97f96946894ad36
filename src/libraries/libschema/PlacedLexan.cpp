#include "PlacedLexan.h"

#include "SchemaTokens.h"
#include "StreamInput.h"

PlacedLexan::PlacedLexan(std::string_view bytes)
    : SchemaLexan(bytes.data(), bytes.size(), "", ""),
      m_bytes(bytes.data()),
      m_size(bytes.size()) {}

int PlacedLexan::lexan() {
  m_endBefore = m_end;
  const int token = SchemaLexan::lexan();
  m_end = token == TOKEN_END
              ? m_size
              : static_cast<std::size_t>(libschema::Window::begin(*libschema::bufferOf(m_input)) -
                                         m_bytes);
  return token;
}
