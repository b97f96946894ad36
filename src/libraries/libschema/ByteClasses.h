// What the bytes of a schema file may be part of, in the "C" locale. Internal: included by .cpp
// files only.

#ifndef LIBSCHEMA_BYTE_CLASSES_H
#define LIBSCHEMA_BYTE_CLASSES_H

#include <array>
#include <cstddef>

namespace libschema {

// Bytes of 128 and more are of no class but the last.
enum ByteClass : unsigned char {
  kDigit = 1,        // 0 to 9
  kNumberPart = 2,   // a digit or "."
  kWordStart = 4,    // a letter, "'" or "-"
  kWordPart = 8,     // a letter, a digit, "_", "-" or a TAB
  kQuotedPart = 16,  // what a word takes, a blank, and any punctuation but "'"
  kBlank = 32,       // a blank or a TAB
  kCommentPart = 64  // anything but a newline
};

constexpr std::array<unsigned char, 256> classifyBytes() {
  std::array<unsigned char, 256> classes{};
  for (int c = 0; c < 256; ++c) {
    const bool digit = c >= '0' && c <= '9';
    const bool letter = (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
    const bool punctuation = c > ' ' && c < 127 && !digit && !letter;
    const bool word = letter || digit || c == '_' || c == '-' || c == '\t';
    classes[static_cast<std::size_t>(c)] = static_cast<unsigned char>(
        (digit ? kDigit : 0) | (digit || c == '.' ? kNumberPart : 0) |
        (letter || c == '\'' || c == '-' ? kWordStart : 0) | (word ? kWordPart : 0) |
        (word || c == ' ' || (punctuation && c != '\'') ? kQuotedPart : 0) |
        (c == ' ' || c == '\t' ? kBlank : 0) | (c != '\n' ? kCommentPart : 0));
  }
  return classes;
}

constexpr std::array<unsigned char, 256> kByteClasses = classifyBytes();

inline bool isOf(char c, ByteClass byteClass) {
  return (kByteClasses[static_cast<unsigned char>(c)] & byteClass) != 0;
}

// What a token that begins with a byte is, where the byte is not passed over.
enum class Start : unsigned char { kCharacter, kBlank, kNewline, kComment, kNumber, kWord, kQuote };

constexpr std::array<Start, 256> classifyStarts() {
  std::array<Start, 256> starts{};
  for (std::size_t c = 0; c < 256; ++c) {
    const unsigned char classes = kByteClasses[c];
    starts[c] = c == '\''                     ? Start::kQuote
                : c == '\n'                   ? Start::kNewline
                : c == '#'                    ? Start::kComment
                : (classes & kBlank) != 0     ? Start::kBlank
                : (classes & kDigit) != 0     ? Start::kNumber
                : (classes & kWordStart) != 0 ? Start::kWord
                                              : Start::kCharacter;
  }
  return starts;
}

constexpr std::array<Start, 256> kStarts = classifyStarts();

// The first place from `place` on, or `end`, that is not of the class.
inline const char* endOfRun(const char* place, const char* end, ByteClass byteClass) {
  // Four at a time: most of the time of a long file is spent here.
  for (; end - place >= 4; place += 4) {
    if (!isOf(place[0], byteClass)) {
      return place;
    }
    if (!isOf(place[1], byteClass)) {
      return place + 1;
    }
    if (!isOf(place[2], byteClass)) {
      return place + 2;
    }
    if (!isOf(place[3], byteClass)) {
      return place + 3;
    }
  }
  while (place != end && isOf(*place, byteClass)) {
    ++place;
  }
  return place;
}

}  // namespace libschema

#endif  // LIBSCHEMA_BYTE_CLASSES_H
