#include "DecisionsTemplate.h"

#include <algorithm>
#include <string_view>

namespace migration {

namespace {

// A text in TOML's basic quotes.
std::string quoted(std::string_view text) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  std::string result = "\"";
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      result += '\\';
      result += c;
    } else if (byte < ' ' || byte == 127) {
      result.append("\\u00").append(1, kDigits[byte >> 4U]).append(1, kDigits[byte & 15U]);
    } else {
      result += c;
    }
  }
  return result + "\"";
}

// Lines of a comment; a control character in a text must not end them.
std::string comment(const std::string& text) {
  std::string line = "# ";
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    line += byte < ' ' || byte == 127 ? '?' : c;
  }
  return line + "\n";
}

std::string sideOf(const char* name, const Entry* entry) {
  if (entry == nullptr) {
    return comment(std::string(name) + "  does not have it");
  }
  return comment(std::string(name) + "  " + textOf(contentOf(*entry->kept)) + "  (" +
                 entry->file->name + ":" + std::to_string(entry->place().line) + ")");
}

bool isConfigFile(const Verdict& row) {
  return row.match.latest != nullptr && row.match.latest->file->name.rfind("V3.config.", 0) == 0;
}

bool isMergeable(const Verdict& row) {
  const auto isOpenScalar = [](const ClauseChange& change) {
    return !change.isDecided && change.aspect != Aspect::kAliases &&
           change.aspect != Aspect::kSup && change.aspect != Aspect::kMust &&
           change.aspect != Aspect::kMay;
  };
  return row.match.old != nullptr && row.match.latest != nullptr &&
         std::none_of(row.clauses.begin(), row.clauses.end(), isOpenScalar);
}

std::string choicesOf(const Verdict& row) {
  if (isConfigFile(row)) {
    return "\"new\"";
  }
  std::string choices;
  const auto add = [&](bool isPossible, const char* choice) {
    if (isPossible) {
      choices += choices.empty() ? choice : std::string(" or ") + choice;
    }
  };
  add(row.match.old != nullptr, "\"old\"");
  add(true, "\"new\"");
  add(row.match.base != nullptr, "\"base\"");
  add(isMergeable(row), "\"merged\"");
  add(true, "\"drop\"");
  return choices;
}

std::string clausesOf(const Verdict& row) {
  std::string clauses;
  for (const ClauseChange& change : row.clauses) {
    if (!change.isDecided && !isConfigFile(row)) {
      clauses += (clauses.empty() ? "" : ", ") + std::string(nameOf(change.aspect)) + " = \"\"";
    }
  }
  return clauses;
}

std::string dependentsOf(const Entry* entry, const Installation& installation) {
  std::string text;
  if (entry != nullptr && entry->kind() != Kind::kVendorExtension) {
    for (const Reference& reference : installation.referrersOf(*entry)) {
      text += (text.empty() ? "" : ", ") + describe(reference);
    }
  }
  return text;
}

std::string entryOf(const Verdict& row, const MigrationPlan& plan) {
  std::string text = "\n[[definition]]\n" + comment(describe(row) + ": " + row.reason);
  text += (plan.base ? sideOf("BASE", row.match.base) : std::string()) +
          sideOf("OLD ", row.match.old) + sideOf("NEW ", row.match.latest);
  const std::string dependents = dependentsOf(row.match.old, *plan.old);
  if (!dependents.empty()) {
    text += comment("In OLD, these refer to it: " + dependents);
  }
  text += "kind = " + quoted(wordOf(row.kind())) + "\n";
  text += "oid = " + quoted(row.entry().kept->object->oidInPlace()) + "\n";
  text += "fingerprint = " + quoted(fingerprintOf(row)) + "\n";
  text += comment("take: " + choicesOf(row));
  const std::string clauses = clausesOf(row);
  if (!clauses.empty() && row.match.old != nullptr && row.match.latest != nullptr) {
    text += comment("or, clause by clause (old, new, base, of lists union):");
    text += comment("clauses = { " + clauses + " }");
  }
  if (row.isTaken || row.isRenumbered) {
    text += comment("or, beside NEW's: rename = \"\", renumber = \"\"");
  }
  return text + "reason = \"\"\n";
}

bool isAskedWithItsAttribute(const Verdict& row, const MigrationPlan& plan) {
  return row.kind() == Kind::kVendorExtension && row.match.attribute != kNoRow &&
         plan.threeWay.differences[row.match.attribute].isUndecided() &&
         row.reason.rfind("goes with its attribute type", 0) == 0;
}

}  // namespace

std::string decisionsTemplate(const MigrationPlan& plan) {
  std::string text =
      "# What nobody has decided yet. Below each definition write your choice, as in\n"
      "#   take = \"old\"\n"
      "# and give this file to --decisions. A decision about an attribute type covers its vendor\n"
      "# extension where that goes with it.\n";
  for (const Verdict& row : plan.threeWay.differences) {
    if (row.isUndecided() && !isAskedWithItsAttribute(row, plan)) {
      text += entryOf(row, plan);
    }
  }
  return text;
}

}  // namespace migration
