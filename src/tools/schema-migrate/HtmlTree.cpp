#include "HtmlTree.h"

#include <libschema-migration/Content.h>

#include <algorithm>
#include <string>
#include <unordered_map>
#include <vector>

#include "HtmlWords.h"
#include "Messages.h"

namespace html {

namespace {

constexpr std::size_t kLineHeight = 22;
constexpr std::size_t kBaseline = 15;  // of the text in it
constexpr std::size_t kIndent = 22;
constexpr std::size_t kCharacterWidth = 8;
constexpr std::size_t kLinesInSlice = 25;
// What is deeper stands below the deepest level that is drawn, and says how deep it is.
constexpr std::size_t kDeepest = 24;
// Of more subordinates than these that do not change, only the first ones are drawn.
constexpr std::size_t kMostUnchanged = 8;

struct Node {
  std::string text;                          // "cn (2.5.4.3)"
  std::size_t definition = Names::kNowhere;  // where the page has it
  const Word* word = nullptr;                // its class; null where nothing is known of it
  std::vector<std::size_t> below;
  bool isBelowAnother = false;

  bool isUnchanged() const { return word == nullptr || std::string(word->word) == "same"; }
};

struct Line {
  std::size_t node = Names::kNowhere;
  std::size_t level = 0;
  std::vector<bool> hasNext;  // for each level above whether the line of that one goes on
  bool isRepeated = false;    // it is drawn in full under another superior
  std::size_t leftOut = 0;    // stands for that many that are not drawn
};

class Forest {
 public:
  Forest(const Json& document, const char* kind, const Names& names) : m_kind(kind) {
    const Json& definitions = document.at("definitions");
    for (const Json& entry : document.at("superiors")) {
      if (entry.at("kind") == kind) {
        addNode(entry, definitions, names);
      }
    }
    for (const Json& entry : document.at("superiors")) {
      if (entry.at("kind") == kind) {
        addEdges(entry);
      }
    }
  }

  // Those that have neither a superior nor a subordinate.
  std::size_t lonelyCount() const {
    return static_cast<std::size_t>(
        std::count_if(m_nodes.begin(), m_nodes.end(),
                      [](const Node& node) { return node.below.empty() && !node.isBelowAnother; }));
  }

  const Node& node(std::size_t at) const { return m_nodes[at]; }

  std::vector<Line> lines() {
    std::vector<Line> lines;
    std::vector<bool> isDrawn(m_nodes.size(), false);
    for (std::size_t at = 0; at < m_nodes.size(); ++at) {
      if (!m_nodes[at].isBelowAnother && !m_nodes[at].below.empty()) {
        draw(at, &isDrawn, &lines);
      }
    }
    // Loops have no uppermost one.
    for (std::size_t at = 0; at < m_nodes.size(); ++at) {
      if (!isDrawn[at] && m_nodes[at].isBelowAnother && !m_isLeftOut[at]) {
        draw(at, &isDrawn, &lines);
      }
    }
    return lines;
  }

 private:
  void addNode(const Json& entry, const Json& definitions, const Names& names) {
    Node node;
    const std::string name = entry.at("name");
    const std::string oid = entry.at("oid");
    node.text = name.empty() ? oid : name + " (" + oid + ")";
    node.definition = names.find(m_kind, oid);
    node.word =
        &wordIn(classWords(), node.definition == Names::kNowhere
                                  ? "same"
                                  : definitions[node.definition].at("class").get<std::string>());
    m_byName.try_emplace(migration::folded(oid), m_nodes.size());
    m_byName.try_emplace(migration::folded(name), m_nodes.size());
    m_nodes.push_back(std::move(node));
  }

  void addEdges(const Json& entry) {
    const std::size_t own = m_byName.at(migration::folded(entry.at("oid").get<std::string>()));
    for (const Json& superior : entry.at("superiors")) {
      const std::string name = superior;
      const auto [found, isNew] = m_byName.try_emplace(migration::folded(name), m_nodes.size());
      if (isNew) {
        Node node;
        node.text = name;
        m_nodes.push_back(std::move(node));
      }
      if (found->second != own) {
        m_nodes[found->second].below.push_back(own);
        m_nodes[own].isBelowAnother = true;
      }
    }
    m_isLeftOut.resize(m_nodes.size(), false);
  }

  // What is drawn below a node: what changes or has something below it, and the first of the rest.
  std::vector<std::size_t> drawnBelow(const Node& node, std::size_t* leftOut) {
    std::vector<std::size_t> drawn;
    std::size_t unchanged = 0;
    *leftOut = 0;
    for (const std::size_t below : node.below) {
      const bool isQuiet = m_nodes[below].isUnchanged() && m_nodes[below].below.empty();
      if (isQuiet && ++unchanged > kMostUnchanged) {
        ++*leftOut;
        m_isLeftOut[below] = true;
      } else {
        drawn.push_back(below);
      }
    }
    return drawn;
  }

  void draw(std::size_t root, std::vector<bool>* isDrawn, std::vector<Line>* lines) {
    std::vector<Line> open(1);
    open.front().node = root;
    while (!open.empty()) {
      Line line = std::move(open.back());
      open.pop_back();
      if (line.node == Names::kNowhere) {
        lines->push_back(std::move(line));
        continue;
      }
      line.isRepeated = (*isDrawn)[line.node];
      (*isDrawn)[line.node] = true;
      lines->push_back(line);
      if (line.isRepeated) {
        continue;
      }
      std::size_t leftOut = 0;
      const std::vector<std::size_t> below = drawnBelow(m_nodes[line.node], &leftOut);
      if (leftOut != 0) {
        Line rest = lineBelow(line, false);
        rest.leftOut = leftOut;
        open.push_back(std::move(rest));
      }
      for (std::size_t i = below.size(); i > 0; --i) {
        Line next = lineBelow(line, i < below.size() || leftOut != 0);
        next.node = below[i - 1];
        open.push_back(std::move(next));
      }
    }
  }

  static Line lineBelow(const Line& above, bool hasNext) {
    Line line;
    line.level = above.level + 1;
    line.hasNext = above.hasNext;
    if (line.hasNext.size() < kDeepest) {
      line.hasNext.push_back(hasNext);
    }
    return line;
  }

  const char* m_kind;
  std::vector<Node> m_nodes;
  std::unordered_map<std::string, std::size_t> m_byName;
  std::vector<bool> m_isLeftOut;
};

// The strokes left of a line: down where a line above goes on, and the elbow to its own.
std::string pathOf(const Line& line, std::size_t top) {
  const std::string middle = std::to_string(top + kLineHeight / 2);
  std::string path;
  for (std::size_t i = 0; i < line.hasNext.size(); ++i) {
    const std::string x = std::to_string(i * kIndent + 12);
    const bool isOwn = i + 1 == line.hasNext.size();
    if (line.hasNext[i] || isOwn) {
      path += "M" + x + " " + std::to_string(top) + "V" +
              (line.hasNext[i] ? std::to_string(top + kLineHeight) : middle);
    }
    if (isOwn) {
      path += "M" + x + " " + middle + "h" + std::to_string(kIndent / 2);
    }
  }
  return path;
}

std::string saidOf(const Line& line, const Node& node) {
  std::string said = node.word == nullptr ? "not defined" : node.word->said;
  said += line.isRepeated ? ", drawn elsewhere too" : "";
  return said + (line.level > kDeepest ? ", level " + std::to_string(line.level + 1) : "");
}

class TreePicture {
 public:
  TreePicture(const Forest& forest, const std::vector<Line>& lines, const char* heading)
      : m_forest(forest), m_lines(lines), m_heading(heading) {}

  void addTo(Dictionary* ofKind) {
    ofKind->SetValue("HEADING", m_heading);
    for (std::size_t first = 0; first < m_lines.size(); first += kLinesInSlice) {
      addSlice(first, std::min(first + kLinesInSlice, m_lines.size()), ofKind);
    }
  }

 private:
  void addSlice(std::size_t first, std::size_t last, Dictionary* ofKind) {
    Dictionary* const slice = ofKind->AddSectionDictionary("SLICE");
    setNumber(slice, "HEIGHT", (last - first) * kLineHeight);
    setNumber(slice, "FIRST", first + 1);
    m_width = 0;
    std::string path;
    for (std::size_t i = first; i < last; ++i) {
      const std::size_t top = (i - first) * kLineHeight;
      path += pathOf(m_lines[i], top);
      Dictionary* const row = slice->AddSectionDictionary("ROW");
      setNumber(row, "Y", top + kBaseline);
      addLine(m_lines[i], row);
    }
    setText(slice, "PATH", path);
    setNumber(slice, "WIDTH", m_width);
  }

  void addLine(const Line& line, Dictionary* row) {
    const std::size_t x = line.hasNext.size() * kIndent + 4;
    setNumber(row, "X", x);
    std::string text = "\u2026 and " + std::to_string(line.leftOut) + " more that stay the same";
    std::string said;
    if (line.node != Names::kNowhere) {
      const Node& node = m_forest.node(line.node);
      text = node.text;
      said = saidOf(line, node);
      row->SetValue("STYLE_CLASS", node.word == nullptr ? "plain" : node.word->style);
      row->SetValue("SIGN", node.word == nullptr ? "?" : node.word->sign);
      linkTo(node.definition, row);
      addText(row, "SAID", "WORD", said);
    }
    setText(row, "TEXT", text);
    m_width = std::max(m_width, x + (visible(text).size() + said.size() + 6) * kCharacterWidth);
  }

  const Forest& m_forest;
  const std::vector<Line>& m_lines;
  const char* m_heading;
  std::size_t m_width = 0;
};

}  // namespace

void addTree(const Json& document, const Names& names, Dictionary* page) {
  if (document.at("superiors").empty()) {
    return;
  }
  page->ShowSection("TREE_LINK");
  Dictionary* const tree = page->AddSectionDictionary("TREE");
  std::size_t lonely = 0;
  for (const Word& kind : kindWords()) {
    Forest forest(document, kind.word, names);
    lonely += forest.lonelyCount();
    const std::vector<Line> lines = forest.lines();
    if (!lines.empty()) {
      const std::string heading =
          std::string(kind.word) == "object-class" ? "Object classes" : "Attribute types";
      TreePicture(forest, lines, heading.c_str()).addTo(tree->AddSectionDictionary("OF_KIND"));
    }
  }
  if (lonely != 0) {
    addText(tree, "NOTHING", "TEXT",
            "Not drawn, with neither a superior nor a subordinate: " +
                counted(lonely, "definition") + ".");
  }
}

}  // namespace html
