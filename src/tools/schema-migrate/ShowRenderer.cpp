#include <algorithm>
#include <set>

#include "DisplayText.h"
#include "Messages.h"
#include "ShowReport.h"
#include "Terminal.h"

namespace {

std::string placeOf(const ShownPlace& place) {
  return wholePrintable(place.file) + ":" + std::to_string(place.line);
}

std::string lineOf(const ShownPlace& place) {
  return placeOf(place) + ": " + wholePrintable(place.title) + "\n";
}

// "    MAY sn  from object class person (2.5.6.6), FILE:LINE" a line each, the second part below
// one another.
std::string columns(const std::vector<ShownClause>& clauses, const char* word) {
  std::size_t width = 0;
  for (const ShownClause& clause : clauses) {
    width = std::max(width, displayWidth(wholePrintable(clause.text)));
  }
  std::string text;
  for (const ShownClause& clause : clauses) {
    text += "    " + padded(wholePrintable(clause.text), width) + "  " + word + " " +
            wholePrintable(clause.from.title) + ", " + placeOf(clause.from) + "\n";
  }
  return text.empty() ? "    nothing\n" : text;
}

std::string textOf(const ShownDefinition& definition, const ShowReport& report) {
  std::string text = lineOf(definition.place) + "( " + wholePrintable(definition.oid) + "\n";
  for (const std::string& clause : definition.clauses) {
    text += "  " + wholePrintable(clause) + "\n";
  }
  text += ")\n";
  for (const ShownPlace& place : definition.insteadOfIt) {
    text += "  not in use; the server uses " + placeOf(place) + "\n";
  }
  if (report.isWithInherited) {
    text += fitted("  inherits:\n" + columns(definition.inherited, "from"), longestLine());
  }
  if (report.isWithReferrers) {
    text += fitted("  is referred to by:\n" + columns(definition.referrers, "of"), longestLine());
  }
  return text;
}

std::string textOf(const ShownTreeLine& line) {
  std::string text(2 * line.depth, ' ');
  text += wholePrintable(line.name);
  for (const std::string& superior : line.notDefined) {
    text += " (its superior " + wholePrintable(superior) + " is not defined)";
  }
  return text + (line.isShownAbove ? " (see above)\n" : "\n");
}

std::string quoted(const std::string& name) {
  std::string text = "\"";
  for (const char c : wholePrintable(name)) {
    text += c == '"' || c == '\\' ? "\\" : "";
    text += c;
  }
  return text + "\"";
}

}  // namespace

std::string renderText(const ShowReport& report) {
  std::string text;
  for (const ShownPlace& place : report.list) {
    text += fitted(lineOf(place), longestLine());
  }
  for (const ShownDefinition& definition : report.definitions) {
    text += text.empty() ? "" : "\n";
    text += textOf(definition, report);
  }
  for (const ShownTreeLine& line : report.tree) {
    text += textOf(line);
  }
  return text;
}

std::string renderDot(const ShowReport& report) {
  std::string text = "digraph schema {\n  rankdir=BT;\n  node [shape=box];\n";
  std::set<std::string> told;
  for (const ShownTreeLine& line : report.tree) {
    if (!told.insert(line.place.title).second) {
      continue;
    }
    text += "  " + quoted(line.name) + ";\n";
    for (const std::string& superior : line.superiors) {
      text += "  " + quoted(line.name) + " -> " + quoted(superior) + ";\n";
    }
    for (const std::string& superior : line.notDefined) {
      text += "  " + quoted(superior) + " [style=dashed];\n";
      text += "  " + quoted(line.name) + " -> " + quoted(superior) + " [style=dashed];\n";
    }
  }
  return text + "}\n";
}

std::string renderComplaints(const ShowReport& report) {
  std::string text;
  for (const migration::Failure& failure : report.failures) {
    const std::string file = wholePrintable(failure.file);
    text += errorLine(failure.line == 0 ? file : placeOf(file, {failure.line, failure.column}),
                      wholePrintable(failure.text));
  }
  for (const ShownNothing& unknown : report.unknown) {
    for (const ShownPlace& place : unknown.written) {
      text += errorLine(
          placeOf(place),
          place.title +
              " is written here, and the library does not keep it; --as written shows it, and schema-migrate check tells why");
    }
    if (!unknown.written.empty()) {
      continue;
    }
    std::string near;
    for (const std::string& name : unknown.near) {
      near += (near.empty() ? "; near it: " : ", ") + wholePrintable(name);
    }
    text += errorLine("nothing here is called " + wholePrintable(unknown.name) + near);
  }
  return text;
}
