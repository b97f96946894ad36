#include "Kept.h"

#include <libschema/PlacedLexan.h>
#include <libschema/SchemaTokens.h>

#include <algorithm>
#include <string_view>
#include <utility>

namespace migration {

namespace {

// Where a token that means something may begin: behind white space, of which the analyser takes the
// carriage return for a token of its own, and behind comments.
std::size_t skipToToken(std::string_view bytes, std::size_t place) {
  while (place < bytes.size()) {
    const char c = bytes[place];
    if (c == '#') {
      place = std::min(bytes.find('\n', place), bytes.size());
    } else if (c == ' ' || (c >= '\t' && c <= '\r')) {
      ++place;
    } else {
      break;
    }
  }
  return place;
}

template <typename Definition>
constexpr Kind kKindOf = Kind::kAttributeType;
template <>
constexpr Kind kKindOf<ObjectClass> = Kind::kObjectClass;
template <>
constexpr Kind kKindOf<ORVAttribute> = Kind::kVendorExtension;

}  // namespace

// The loop of SchemaManager::readFile, with a list in place of the tables. KeptEqualsTheManager
// compares the two.
class KeptFile::Reader {
 public:
  explicit Reader(KeptFile* file)
      : m_file(*file), m_bytes(file->m_source->bytes()), m_tokens(m_bytes) {}

  void read() {
    try {
      m_file.m_ending = readAll() ? ReadingEnd::kWhole : ReadingEnd::kFails;
    } catch (const PlacedLexan::NeverCompletes&) {
      m_file.m_ending = ReadingEnd::kNeverEnds;
    }
    m_file.m_endOffset = m_file.m_ending == ReadingEnd::kWhole ? m_bytes.size() : lastToken();
    if (m_current.object != nullptr) {
      m_current.end = m_file.m_endOffset;
      m_file.m_unfinished = std::make_unique<KeptDefinition>(std::move(m_current));
    }
  }

 private:
  // Where the token that was read last begins.
  std::size_t lastToken() const { return skipToToken(m_bytes, m_tokens.endBefore()); }

  bool readAll() {
    int token = m_tokens.lexan();
    while (token != TOKEN_END) {
      bool isRead = true;
      switch (token) {
        case KEY_ATTRIBUTETYPES:
          isRead = readDefinitions<Attribute>(&token);
          break;
        case KEY_ORVATTRIBUTETYPES:
          isRead = readDefinitions<ORVAttribute>(&token);
          break;
        case KEY_OBJECTCLASSES:
          isRead = readDefinitions<ObjectClass>(&token);
          break;
        default:
          token = m_tokens.lexan();
      }
      if (!isRead) {
        return false;
      }
    }
    return true;
  }

  template <typename Definition>
  bool readDefinitions(int* token) {
    const int opening = m_tokens.lexan();
    if (opening == '=') {
      return readOne<Definition>(false, true, token);
    }
    if (opening != '{') {
      return false;
    }
    bool isFirst = true;
    do {
      if (!readOne<Definition>(true, isFirst, token)) {
        return false;
      }
      isFirst = false;
    } while (*token != '}');
    return true;
  }

  // A later definition of a block begins with the token on which the one before it stopped.
  template <typename Definition>
  bool readOne(bool isInBlock, bool isFirst, int* token) {
    auto definition = std::make_unique<Definition>();
    Definition* const parsed = definition.get();
    const std::size_t begin = isFirst ? skipToToken(m_bytes, m_tokens.end()) : lastToken();
    m_current = {kKindOf<Definition>, isInBlock, false, begin, begin, std::move(definition)};
    if (!parsed->parse(&m_tokens)) {
      return false;
    }
    m_current.end = std::max(begin, m_tokens.endBefore());
    m_current.isEntered = !isInBlock || !parsed->oidInPlace().empty();
    m_file.m_definitions.push_back(std::move(m_current));
    *token = m_tokens.getCurrentToken();
    return true;
  }

  KeptFile& m_file;
  std::string_view m_bytes;
  PlacedLexan m_tokens;
  KeptDefinition m_current{};
};

KeptFile::KeptFile(const Source& source) : m_source(&source) { Reader(this).read(); }

std::string describe(const KeptDefinition& definition) {
  std::string text(nameOf(definition.kind));
  const std::string name = definition.object->getFirstName();
  const std::string& oid = definition.object->oidInPlace();
  if (!name.empty()) {
    text += " " + name;
  }
  if (!oid.empty()) {
    text += name.empty() ? " " + oid : " (" + oid + ")";
  }
  return text;
}

}  // namespace migration
