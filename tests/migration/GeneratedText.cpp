#include "GeneratedText.h"

#include <array>
#include <cstddef>
#include <string_view>
#include <vector>

namespace generated {

namespace {

using namespace std::string_view_literals;

constexpr std::array<std::string_view, 28> kBytes = {
    "'"sv, "'"sv,  "("sv,  ")"sv,  "("sv,  ")"sv,    "{"sv,        "}"sv,  "$"sv, "="sv,
    "#"sv, "\t"sv, "\t"sv, "\r"sv, "\n"sv, "\0"sv,   "\xc3\xa9"sv, "\""sv, ","sv, ";"sv,
    "."sv, "-"sv,  "_"sv,  "7"sv,  "x"sv,  "{64}"sv, "\\27"sv,     " "sv};

constexpr std::array<std::string_view, 42> kClauses = {
    " X-ORIGIN 'RFC 4519' ",
    " X-ORIGIN ( 'a' 'b' ) ",
    " APPROX caseIgnoreMatch ",
    " COLLECTIVE ",
    " DESC 'NAME' ",
    " DESC 'objectClasses' ",
    " NAME 'attributeTypes' ",
    " NAME siteA ",
    " NAME ( 'a' 'A' ) ",
    " MAY cn ",
    " MUST sn ",
    " DBNAME 'a' ",
    " SUP ( a $ b ) ",
    " SUP 2.5.4.3 ",
    " SUP ",
    " DESC ",
    " MUST ( objectClasses $ ORVattributeTypes ) ",
    " MAY ( 2.5.4.3 $ cn ) ",
    " DESC \"a b\" ",
    " SYNTAX 1.3{6x} ",
    " SYNTAX abc{64} ",
    " EQUALTY a ",
    " desc 'b' ",
    " OBSOLETE ",
    " STRUCTURAL ",
    " AUXILIARY ",
    " ( 1.2.3 NAME 'inner' SUP a ) ",
    "\nattributetypes=( 1.2.4 NAME 'other' SUP a )\n",
    " attributetypes ",
    "\nobjectclasses {\n",
    " }\n",
    " ) ",
    " ( ",
    " DESC 'caf\xc3\xa9' ",
    " DESC 'one\ntwo' ",
    " DESC 'it ",
    " foo ",
    " 1.2.3 ",
    " DESC\r\n 'c' ",
    " LENGTH 5 ",
    " ACCESS-CLASS 'NAME' ",
    "\n# comment ( ' \n"};

}  // namespace

std::string TextMaker::oid() {
  std::string text = "1.3.6";
  for (std::size_t i = below(3); i > 0; --i) {
    text += "." + std::to_string(below(30));
  }
  return text;
}

std::string TextMaker::name() {
  static constexpr std::array<const char*, 10> kNames = {"cn",   "sn",  "name", "desc", "siteBadge",
                                                         "c-ou", "a_b", "sup",  "x",    "mail"};
  const std::string base = kNames[below(kNames.size())];
  return oneIn(2) ? base : base + std::to_string(below(50));
}

std::string TextMaker::names() {
  if (oneIn(2)) {
    return "'" + name() + "'";
  }
  std::string text = "(";
  for (std::size_t i = 1 + below(3); i > 0; --i) {
    // Names that differ from each other.
    text += blank() + "'" + name() + "-" + std::to_string(i) + "'";
  }
  return text + " )";
}

std::string TextMaker::list() {
  std::string text = "( " + name();
  for (std::size_t i = below(4); i > 0; --i) {
    text += blank() + "$" + blank() + (oneIn(9) ? "attributetypes" : name());
  }
  return text + " )";
}

std::string TextMaker::blank() {
  return oneIn(8) ? "\n  " : oneIn(12) ? " \t " : oneIn(20) ? " # note\n " : " ";
}

std::string TextMaker::attributeType() {
  std::string text = "(" + blank() + oid() + blank() + "NAME " + names();
  text += oneIn(2) ? blank() + "DESC 'what it\\27s for (" + std::to_string(below(9)) + ")'" : "";
  text += oneIn(6) ? " OBSOLETE" : "";
  text += oneIn(3) ? blank() + "SUP" + blank() + name() : "";
  text += oneIn(3) ? " EQUALITY caseIgnoreMatch" : "";
  text += oneIn(5) ? " ORDERING 2.5.13.3" : "";
  text += oneIn(5) ? " SUBSTR caseIgnoreSubstringsMatch" : "";
  text += blank() + "SYNTAX 1.3.6.1.4.1.1466.115.121.1." + std::to_string(below(60));
  text += oneIn(3) ? "{" + std::to_string(below(900)) + "}" : "";
  text += oneIn(3) ? blank() + "SINGLE-VALUE" : "";
  text += oneIn(6) ? " NO-USER-MODIFICATION" : "";
  text += oneIn(4) ? " USAGE directoryOperation" : "";
  return text + blank() + ")";
}

std::string TextMaker::objectClass() {
  static constexpr std::array<const char*, 3> kKinds = {"STRUCTURAL", "AUXILIARY", "ABSTRACT"};
  std::string text = "(" + blank() + oid() + " NAME " + names();
  text += oneIn(2) ? blank() + "DESC 'a class'" : "";
  text += oneIn(8) ? " OBSOLETE" : "";
  text += oneIn(2) ? blank() + "SUP " + (oneIn(2) ? "top" : list()) : "";
  text += blank() + kKinds[below(kKinds.size())];
  text +=
      oneIn(2) ? " MUST " + (oneIn(3) ? list() + blank() + "MAY" + blank() + list() : list()) : "";
  return text + blank() + ")";
}

std::string TextMaker::vendorExtension() {
  std::string text = "( " + oid();
  text += oneIn(8) ? "" : blank() + "DBNAME ( '" + name() + "'" + blank() + "'" + name() + "' )";
  // Behind such a list a "(" in a later line begins the next extension.
  text += " ACCESS-CLASS normal";
  text += oneIn(2) ? blank() + "LENGTH " + std::to_string(below(2000)) : "";
  for (const char* const flag : {"EQUALITY", "ORDERING", "SUBSTR", "APPROX", "REVERSE"}) {
    text += oneIn(3) ? blank() + flag : "";
  }
  return text + " )";
}

std::string TextMaker::validText() {
  static constexpr std::array<const char*, 5> kWords = {
      "attributetypes", "attributeTypes", "objectclasses", "objectClasses", "ORVAttributetypes"};
  std::string text;
  for (std::size_t section = 1 + below(3); section > 0; --section) {
    const std::size_t word = below(kWords.size());
    const bool isBlock = oneIn(2);
    text += std::string(oneIn(6) ? "# above\n" : "") + kWords[word] + blank() +
            (isBlock ? "{" : "=") + (oneIn(2) ? "\n" : " ");
    for (std::size_t i = isBlock ? 1 + below(3) : 1; i > 0; --i) {
      text += word < 2 ? attributeType() : word < 4 ? objectClass() : vendorExtension();
      text += oneIn(4) ? " " : "\n";
    }
    text += isBlock ? "}\n" : "\n";
  }
  return text;
}

void TextMaker::damageByte(std::string* text) {
  const std::size_t place = below(text->size() + 1);
  const std::size_t removed = oneIn(2) ? 1 : 0;
  text->replace(place, removed, oneIn(3) ? "" : kBytes[below(kBytes.size())]);
}

void TextMaker::damageToken(std::string* text) {
  const std::size_t begin = text->find_first_not_of(" \n", below(text->size()));
  if (begin == std::string::npos) {
    return;
  }
  const std::size_t end = std::min(text->find_first_of(" \n", begin), text->size());
  const std::string token = text->substr(begin, end - begin);
  switch (below(4)) {
    case 0:
      text->erase(begin, end - begin);
      break;
    case 1:
      text->insert(begin, token + " ");
      break;
    case 2:
      text->insert(std::min(end + 1 + below(30), text->size()), " " + token + " ");
      break;
    default:
      for (std::size_t i = begin; i < end; ++i) {
        const char c = (*text)[i];
        (*text)[i] = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
      }
  }
}

void TextMaker::damageClause(std::string* text) {
  const std::size_t place = text->find_first_of(" \n", below(text->size()));
  text->insert(place == std::string::npos ? text->size() : place, kClauses[below(kClauses.size())]);
}

std::string TextMaker::damagedText() {
  std::string text = validText();
  for (std::size_t damages = 1 + below(3); damages > 0; --damages) {
    switch (below(3)) {
      case 0:
        damageByte(&text);
        break;
      case 1:
        damageToken(&text);
        break;
      default:
        damageClause(&text);
    }
  }
  if (oneIn(30)) {
    for (std::size_t at = 0; (at = text.find('\n', at)) != std::string::npos; at += 2) {
      text.insert(at, "\r");
    }
  }
  if (oneIn(10)) {
    text.resize(below(text.size() + 1));
  }
  return text;
}

}  // namespace generated
