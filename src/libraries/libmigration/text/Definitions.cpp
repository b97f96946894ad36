#include "Definitions.h"

#include <array>
#include <cstddef>

namespace migration {

namespace {

constexpr std::array<std::string_view, 3> kNames = {"attribute type", "object class",
                                                    "vendor extension"};
constexpr std::array<std::string_view, 3> kWords = {"attribute-type", "object-class",
                                                    "vendor-extension"};

// In the order of Clause.
constexpr std::array<std::string_view, 25> kKeywords = {
    "OID",      "NAME",         "DESC",      "OBSOLETE",     "SUP",        "EQUALITY",
    "ORDERING", "SUBSTR",       "SYNTAX",    "SINGLE-VALUE", "COLLECTIVE", "NO-USER-MODIFICATION",
    "USAGE",    "STRUCTURAL",   "AUXILIARY", "ABSTRACT",     "MUST",       "MAY",
    "DBNAME",   "ACCESS-CLASS", "LENGTH",    "APPROX",       "REVERSE",    "",
    ""};

}  // namespace

std::string_view nameOf(Kind kind) { return kNames[static_cast<std::size_t>(kind)]; }

std::string_view wordOf(Kind kind) { return kWords[static_cast<std::size_t>(kind)]; }

std::string_view keywordOf(Clause clause) { return kKeywords[static_cast<std::size_t>(clause)]; }

}  // namespace migration
