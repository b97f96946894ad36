#include "Written.h"

#include "WrittenParser.h"

namespace migration {

namespace {

int hexDigit(char c) {
  return c >= '0' && c <= '9'   ? c - '0'
         : c >= 'a' && c <= 'f' ? c - 'a' + 10
         : c >= 'A' && c <= 'F' ? c - 'A' + 10
                                : -1;
}

// \27 is a quote and \5c a backslash; no other escapes exist.
std::string unescaped(std::string_view raw) {
  std::string text;
  text.reserve(raw.size());
  for (std::size_t i = 0; i < raw.size(); ++i) {
    if (raw[i] == '\\' && i + 2 < raw.size()) {
      const int code = hexDigit(raw[i + 1]) * 16 + hexDigit(raw[i + 2]);
      if (code == '\'' || code == '\\') {
        text += static_cast<char>(code);
        i += 2;
        continue;
      }
    }
    text += raw[i];
  }
  return text;
}

}  // namespace

std::string WrittenValue::text() const {
  if (form == Form::kQuoted) {
    return unescaped(raw);
  }
  const std::size_t blank = form == Form::kNumber ? raw.find(' ') : std::string_view::npos;
  const std::size_t brace = raw.find('{');
  if (blank == std::string_view::npos || brace == std::string_view::npos || blank > brace) {
    return std::string(raw);
  }
  return std::string(raw.substr(0, blank)).append(raw.substr(brace));
}

WrittenFile::WrittenFile(const Source& source) : m_source(&source) { WrittenParser(this).run(); }

const WrittenClause* WrittenFile::find(const WrittenDefinition& definition, Clause clause) const {
  for (const WrittenClause& candidate : clausesOf(definition)) {
    if (candidate.clause == clause) {
      return &candidate;
    }
  }
  return nullptr;
}

std::string WrittenFile::textOf(const WrittenDefinition& definition, Clause clause) const {
  const WrittenClause* const found = find(definition, clause);
  return found == nullptr || found->valueCount == 0 ? std::string()
                                                    : valuesOf(*found).front().text();
}

std::vector<std::string> WrittenFile::textsOf(const WrittenDefinition& definition,
                                              Clause clause) const {
  std::vector<std::string> texts;
  for (const WrittenClause& candidate : clausesOf(definition)) {
    if (candidate.clause == clause) {
      for (const WrittenValue& value : valuesOf(candidate)) {
        texts.push_back(value.text());
      }
    }
  }
  return texts;
}

std::string WrittenFile::describe(const WrittenDefinition& definition) const {
  std::string text(nameOf(definition.kind));
  const std::string oid = textOf(definition, Clause::kOid);
  const std::string name =
      definition.kind == Kind::kVendorExtension ? std::string() : textOf(definition, Clause::kName);
  if (!name.empty()) {
    text += ' ' + name;
  }
  if (!oid.empty()) {
    text += name.empty() ? ' ' + oid : " (" + oid + ")";
  }
  return text;
}

}  // namespace migration
