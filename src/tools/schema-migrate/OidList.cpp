#include "OidList.h"

#include <array>
#include <cstddef>

#include "InputFile.h"
#include "Messages.h"

namespace {

constexpr bool isSpace(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

class WordReader {
 public:
  explicit WordReader(std::set<std::string>* oids) : m_oids(oids) {}

  void take(char c) {
    if (m_isInComment) {
      m_isInComment = c != '\n';
    } else if (!isSpace(c)) {
      m_word += c;
    } else if (m_word.find('#') != std::string::npos) {
      m_isInComment = c != '\n';
      m_word.clear();
    } else if (!m_word.empty()) {
      m_oids->insert(m_word);
      m_word.clear();
    }
    m_line += c == '\n' ? 1 : 0;
  }

  // The word that the file ends in, if the library would lose one.
  std::string lastWord() const {
    return m_word.find('#') == std::string::npos ? m_word : std::string();
  }

  std::uint64_t line() const { return m_line; }

 private:
  std::set<std::string>* m_oids;
  std::string m_word;
  bool m_isInComment = false;
  std::uint64_t m_line = 1;
};

}  // namespace

void readOidList(const ListFile& list, std::set<std::string>* oids) {
  InputFile file(list.copy);
  WordReader words(oids);
  std::array<char, 4096> buffer{};
  while (const std::size_t count = file.read(buffer.data(), buffer.size())) {
    for (std::size_t i = 0; i < count; ++i) {
      words.take(buffer[i]);
    }
  }
  if (!file.problem().empty()) {
    throw Failure(kBadInput,
                  errorLine(list.path, "the list of OIDs cannot be read: " + file.problem()));
  }
  if (!words.lastWord().empty()) {
    throw Failure(
        kBadInput,
        errorLine(
            placeOf(list.path, words.line()),
            "no line break behind the last OID, " + printable(words.lastWord()) +
                ", which would therefore not count; add a line break at the end of the file"));
  }
}
