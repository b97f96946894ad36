#include "Tokenizer.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cstring>

namespace minimal {

namespace {

// What a token that starts with a byte is, in the low bits; what a byte may be part of, above them.
enum Start : unsigned char { kSingle, kBlank, kNewline, kComment, kDigit, kLetter, kQuote };
constexpr unsigned char kStartMask = 7;
constexpr unsigned char kNumberPart = 8;
constexpr unsigned char kWordPart = 16;
constexpr unsigned char kQuotedPart = 32;

constexpr std::array<unsigned char, 256> makeClasses() {
  std::array<unsigned char, 256> classes{};
  for (int c = 0; c < 256; ++c) {
    const bool digit = c >= '0' && c <= '9';
    const bool letter = (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
    const bool word = digit || letter || c == '_' || c == '-' || c == '\t';
    const bool quoted = word || (c >= ' ' && c < 127 && c != '\'');
    const Start start = digit                   ? kDigit
                        : letter || c == '-'    ? kLetter
                        : c == '\''             ? kQuote
                        : c == ' ' || c == '\t' ? kBlank
                        : c == '\n'             ? kNewline
                        : c == '#'              ? kComment
                                                : kSingle;
    classes[static_cast<std::size_t>(c)] =
        static_cast<unsigned char>(start | (digit || c == '.' ? kNumberPart : 0) |
                                   (word ? kWordPart : 0) | (quoted ? kQuotedPart : 0));
  }
  return classes;
}

constexpr std::array<unsigned char, 256> kClasses = makeClasses();

constexpr unsigned char classOf(char c) { return kClasses[static_cast<unsigned char>(c)]; }

constexpr std::array<unsigned char, 256> makeSingles() {
  std::array<unsigned char, 256> singles{};
  for (auto& single : singles) {
    single = kOther;
  }
  singles['('] = kOpen;
  singles[')'] = kClose;
  singles['{'] = kOpenBrace;
  singles['}'] = kCloseBrace;
  singles['$'] = kDollar;
  singles['='] = kEquals;
  return singles;
}

constexpr std::array<unsigned char, 256> kSingles = makeSingles();

struct Keyword {
  std::string_view text;
  Token token = kWord;
  std::string_view value = text;  // what the keyword's token has for its text
};

constexpr Keyword kKeywords[] = {
    {"objectclasses", kObjectClasses},
    {"objectClasses", kObjectClasses, "objectclasses"},
    {"NAME", kName},
    {"DESC", kDesc},
    {"SUP", kSup},
    {"AUXILIARY", kAuxiliary},
    {"MUST", kMust},
    {"MAY", kMay},
    {"STRUCTURAL", kStructural},
    {"attributetypes", kAttributeTypes},
    {"attributeTypes", kAttributeTypes, "attributetypes"},
    {"EQUALITY", kEquality},
    {"SYNTAX", kSyntax},
    {"SINGLE-VALUE", kSingleValue},
    {"USAGE", kUsage},
    {"NO-USER-MODIFICATION", kNoUserModification},
    {"ORVAttributetypes", kExtensions},
    {"ORVattributeTypes", kExtensions, "ORVAttributetypes"},
    {"ACCESS-CLASS", kAccessClass},
    {"DBNAME", kDbName},
    {"SUBSTR", kSubstr},
    {"REVERSE", kReverse},
    {"ORDERING", kOrdering},
    {"COLLECTIVE", kCollective},
    {"OBSOLETE", kObsolete},
    {"ABSTRACT", kAbstract},
    {"LENGTH", kLength},
    {"APPROX", kApprox},
};

constexpr std::size_t kSlots = 64;

// A different slot for each keyword.
constexpr std::size_t slotOf(std::string_view text) {
  const auto at = [&](std::size_t place) { return static_cast<unsigned char>(text[place]); };
  const std::size_t size = text.size();
  return (size + at(size * 3 / 4) * 5U + at(size / 2) * 21U + at(size * 2 / 3) * 15U) % kSlots;
}

// One keyword to a slot: two in one would not compile.
constexpr std::array<Keyword, kSlots> makeSlots() {
  std::array<Keyword, kSlots> slots{};
  for (const Keyword& keyword : kKeywords) {
    Keyword& slot = slots[slotOf(keyword.text)];
    if (slot.token != kWord) {
      throw "two keywords in one slot";
    }
    slot.text = keyword.text;
    slot.token = keyword.token;
    slot.value = keyword.value;
  }
  return slots;
}

constexpr std::array<Keyword, kSlots> kSlotTable = makeSlots();

// The token of a word: a keyword, whose text becomes that of the keyword, or kWord.
Token wordToken(std::string_view* text) {
  if (text->empty()) {
    return kWord;
  }
  const Keyword& slot = kSlotTable[slotOf(*text)];
  if (slot.text.size() != text->size() ||
      std::memcmp(slot.text.data(), text->data(), text->size()) != 0) {
    return kWord;
  }
  *text = slot.value;
  return slot.token;
}

}  // namespace

bool FileText::read(const std::string& path) {
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  struct stat status {};
  if (descriptor < 0 || ::fstat(descriptor, &status) != 0) {
    return false;
  }
  size = static_cast<std::size_t>(status.st_size);
  bytes.reset(new char[size + 1]);
  const ssize_t count = ::read(descriptor, bytes.get(), size);
  ::close(descriptor);
  bytes[size] = '\0';
  return count == static_cast<ssize_t>(size);
}

// A zero byte is part of no token, so that the one behind the last byte ends every run; whether it
// is that one is asked only where a token begins or ends.
Token Tokenizer::next() {
  for (;;) {
    const unsigned char byteClass = classOf(*m_next);
    switch (byteClass & kStartMask) {
      case kBlank:
        ++m_next;
        continue;
      case kNewline:
        ++m_line;
        ++m_next;
        continue;
      case kComment: {
        const void* const end = std::memchr(m_next, '\n', static_cast<std::size_t>(m_end - m_next));
        m_next = end == nullptr ? m_end : static_cast<const char*>(end);
        continue;
      }
      case kDigit:
        return m_token = number();
      case kLetter:
      case kQuote:
        return m_token = word();
      default:
        m_text = {};
        if (m_next == m_end) {
          return m_token = kEnd;
        }
        return m_token = static_cast<Token>(kSingles[static_cast<unsigned char>(*m_next++)]);
    }
  }
}

// Digits and dots, and a length in braces with or without blanks before it.
Token Tokenizer::number() {
  const char* const start = m_next;
  while ((classOf(*m_next) & kNumberPart) != 0) {
    ++m_next;
  }
  m_text = {start, static_cast<std::size_t>(m_next - start)};
  const char* brace = m_next;
  while (*brace == ' ') {
    ++brace;
  }
  if (*brace != '{') {
    m_next = brace;
    return brace == m_end ? kEnd : kNumber;
  }
  const char* end = brace + 1;
  while ((classOf(*end) & kStartMask) == kDigit) {
    ++end;
  }
  const bool isComplete = *end == '}' && end > brace + 1;
  end += isComplete ? 1 : 0;
  if (brace == m_next) {
    m_text = {start, static_cast<std::size_t>(end - start)};
  } else {
    m_joined.assign(m_text).append(brace, end);
    m_text = m_joined;
  }
  m_next = end;
  if (m_next == m_end) {
    return kEnd;
  }
  return isComplete ? kNumberLength : kNumberBadLength;
}

// What ends a quoted string is dropped. A word that the file ends with is lost.
Token Tokenizer::word() {
  if (*m_next != '\'') {
    const char* const start = m_next++;
    while ((classOf(*m_next) & kWordPart) != 0) {
      ++m_next;
    }
    m_text = {start, static_cast<std::size_t>(m_next - start)};
  } else {
    const char* const start = ++m_next;
    while ((classOf(*m_next) & kQuotedPart) != 0) {
      ++m_next;
    }
    m_text = {start, static_cast<std::size_t>(m_next - start)};
    m_next += m_next == m_end ? 0 : 1;
  }
  return m_next == m_end ? kEnd : wordToken(&m_text);
}

}  // namespace minimal
