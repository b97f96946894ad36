#include "Printed.h"

#include <algorithm>
#include <array>
#include <tuple>

namespace printed {

namespace {

using migration::Form;

std::string placeOf(const migration::Source& source, std::size_t offset) {
  const migration::Place place = source.placeOf(offset);
  return std::to_string(place.line) + ":" + std::to_string(place.column);
}

std::string valueText(const migration::WrittenValue& value) {
  const std::string quote = value.form == Form::kQuoted         ? "'"
                            : value.form == Form::kDoubleQuoted ? "\""
                                                                : "";
  return quote + value.text() + quote;
}

std::string clauseText(const migration::WrittenFile& file, const migration::WrittenClause& clause) {
  std::string text(keywordOf(clause.clause));
  if (text.empty() || (clause.clause != migration::Clause::kOid && text != clause.keyword)) {
    text += "<" + std::string(clause.keyword) + ">";
  }
  text += clause.isList ? " (" : "";
  for (const migration::WrittenValue& value : file.valuesOf(clause)) {
    text += " " + valueText(value);
  }
  return text + (clause.isList ? " )" : "");
}

constexpr std::array<const char*, 20> kOddities = {"ByteOrderMark",   "Nul",
                                                   "LastWord",        "ByteInQuotes",
                                                   "LineEndInQuotes", "UnclosedQuote",
                                                   "TabBehindWord",   "BadLength",
                                                   "DoubleQuote",     "CarriageReturn",
                                                   "Spelling",        "TextOutside",
                                                   "LoneParenthesis", "StrayParenthesis",
                                                   "NotClosed",       "DefinitionInDefinition",
                                                   "NoOpening",       "NoValue",
                                                   "NoName",          "BlockNotClosed"};

}  // namespace

std::string definitions(const migration::WrittenFile& file) {
  std::string text;
  for (const migration::WrittenDefinition& definition : file.definitions()) {
    const migration::Source& source = file.source();
    text += source.bytes().substr(definition.commentsBegin,
                                  definition.commentsEnd - definition.commentsBegin);
    text += placeOf(source, definition.offset) + "-" + placeOf(source, definition.end) + " " +
            std::string(nameOf(definition.kind)) + (definition.isInBlock ? " {" : " =");
    const char* separator = " ";
    for (const migration::WrittenClause& clause : file.clausesOf(definition)) {
      text += separator + clauseText(file, clause);
      separator = " | ";
    }
    text += definition.isClosed ? "\n" : " …\n";
  }
  return text;
}

std::string oddities(const migration::WrittenFile& file) {
  std::string text;
  for (const migration::WrittenOddity& oddity : file.oddities()) {
    text += placeOf(file.source(), oddity.offset) + " " +
            kOddities[static_cast<std::size_t>(oddity.oddity)] + " [" +
            std::string(file.source().bytes().substr(oddity.offset, oddity.end - oddity.offset)) +
            "]\n";
  }
  return text;
}

std::string findings(const migration::Findings& findings) {
  migration::Findings sorted = findings;
  std::sort(sorted.begin(), sorted.end(),
            [](const migration::Finding& left, const migration::Finding& right) {
              return std::tie(left.line, left.column, left.rule) <
                     std::tie(right.line, right.column, right.rule);
            });
  std::string text;
  for (const migration::Finding& finding : sorted) {
    text += std::to_string(finding.line) + ":" + std::to_string(finding.column) +
            (finding.severity == migration::Severity::kError ? " error " : " warning ") +
            finding.rule + "\n";
  }
  return text;
}

}  // namespace printed
