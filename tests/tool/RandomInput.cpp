#include "RandomInput.h"

#include <vector>

namespace {

using std::string_literals::operator""s;

const std::vector<std::string> kPieces = {
    "NAME",
    "DESC",
    "SUP",
    "MUST",
    "MAY",
    "EQUALITY",
    "ORDERING",
    "SUBSTR",
    "SYNTAX",
    "USAGE",
    "DBNAME",
    "LENGTH",
    "ACCESS-CLASS",
    "OBSOLETE",
    "STRUCTURAL",
    "AUXILIARY",
    "ABSTRACT",
    "SINGLE-VALUE",
    "NO-USER-MODIFICATION",
    "APPROX",
    "REVERSE",
    "COLLECTIVE",
    "attributetypes=",
    "objectclasses=",
    "ORVAttributetypes=",
    "attributeTypes",
    "objectClasses",
    "ORVattributeTypes",
    "attributetypes {",
    "objectclasses {",
    "ORVAttributetypes {",
    "(",
    ")",
    "(",
    ")",
    "{",
    "}",
    "$",
    "=",
    " ",
    " ",
    " ",
    "\n",
    "\n",
    "\t",
    "\r\n",
    "# comment\n",
    "#",
    "'NAME'",
    "'a b'",
    "''",
    "'",
    "cn",
    "sn-1",
    "-",
    "_",
    "1.2.3",
    "1.2.3",
    "'1.2.3'",
    "1.2 {32}",
    "1.2{x",
    "1.2{12)",
    "1.2{",
    "1..2.",
    "7",
    "\xC3\xA4",
    "'a\xFFz'",
    "\0"s,
    "\v",
    "'a\nb'",
    ";",
};

const std::vector<std::string> kDefinitions = {
    "attributetypes=( 1.2.3 NAME ( 'a' 'b' ) DESC 'd e' SUP name EQUALITY m SYNTAX 1.2{32} )\n",
    "attributetypes=( 1.2.4 NAME 'c' SINGLE-VALUE USAGE dSAOperation )\n",
    "attributetypes {\n( 1.2.5 NAME 'e' DESC 'f' )\n( 1.2.6 NAME 'g' OBSOLETE )\n}\n",
    "objectclasses=( 1.3.1 NAME 'p' DESC 'q' SUP top STRUCTURAL MUST ( cn $ sn ) MAY ( l ) )\n",
    "objectclasses=( 1.3.2 NAME ( 'r' 's' ) SUP ( a $ b ) AUXILIARY MAY objectClasses )\n",
    "objectclasses {\n( 1.3.3 NAME 't' ABSTRACT )\n( 1.3.4 NAME 'u' MUST ( v ) )\n}\n",
    "ORVAttributetypes=( 1.2.3 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 32 EQUALITY )\n",
    "ORVAttributetypes {\n( 1.2.4 DBNAME ( 'c' 'c' )\n( 1.2.5 DBNAME ( 'e' ) REVERSE )\n}\n",
    "# comment\n",
};

}  // namespace

std::size_t RandomInput::below(std::size_t limit) { return m_random() % limit; }

std::string RandomInput::piece() { return kPieces[below(kPieces.size())]; }

std::string RandomInput::definition() { return kDefinitions[below(kDefinitions.size())]; }

std::string RandomInput::pieces() {
  std::string text;
  for (std::size_t count = below(40); count > 0; --count) {
    text += piece() + (below(3) == 0 ? "" : " ");
  }
  return text;
}

std::string RandomInput::damagedDefinitions() {
  std::string text;
  for (std::size_t count = 1 + below(4); count > 0; --count) {
    text += definition();
  }
  for (std::size_t damages = below(4); damages > 0; --damages) {
    const std::size_t place = below(text.size() + 1);
    switch (below(4)) {
      case 0:
        text.insert(place, " " + piece() + " ");
        break;
      case 1:
        text.erase(place, 1 + below(12));
        break;
      case 2:
        text.insert(place, text.substr(below(text.size() + 1), below(30)));
        break;
      default:
        text.erase(place);
    }
  }
  return text;
}
