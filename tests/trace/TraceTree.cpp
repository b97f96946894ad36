#include "TraceTree.h"

#include <cstdlib>

namespace tracetree {

const std::vector<TracedFunction>& tracedFunctions() {
  static const std::vector<TracedFunction> functions = {
      {"Attribute::attrsEqual", 0x53010100, false},
      {"Attribute::parse", 0x53010200, false},
      {"Attribute::dump(out)", 0x53010300, false},
      {"Attribute::dump()", 0x53010400, false},
      {"ORVAttribute::parse", 0x53020100, false},
      {"ORVAttribute::orvAttrsEqual", 0x53020200, false},
      {"ORVAttribute::dump(out)", 0x53020300, false},
      {"ORVAttribute::dump()", 0x53020400, false},
      {"ObjectClass::objsEqual", 0x53030100, false},
      {"ObjectClass::parse", 0x53030200, false},
      {"ObjectClass::dump(out)", 0x53030300, false},
      {"ObjectClass::dump()", 0x53030400, false},
      {"lookUp", 0x53040100, false},
      {"lexan", 0x53040200, false},
      {"match", 0x53040300, false},
      {"insertString", 0x53040400, false},
      {"insertCharacter", 0x53040500, false},
      {"dumpTable", 0x53040600, false},
      {"SchemaLexan::dump", 0x53040700, false},
      {"getLineNumber", 0x53040800, false},
      {"getFileName", 0x53040900, false},
      {"getWorkingDir", 0x53040a00, false},
      {"fileIsOpen", 0x53040b00, false},
      {"dumpAttrTable", 0x53050100, false},
      {"dumpORVAttrTable", 0x53050200, false},
      {"dumpOcTable", 0x53050300, false},
      {"getAttr", 0x53050400, false},
      {"getORVAttr", 0x53050500, false},
      {"getObjClass", 0x53050600, false},
      {"dumpUserOc", 0x53050700, false},
      {"dumpUserAt", 0x53050800, false},
      {"dumpOrvOc", 0x53050900, false},
      {"dumpOrvAt", 0x53050a00, false},
      {"dumpSysOc", 0x53050b00, false},
      {"dumpSysAt", 0x53050c00, false},
      {"compObjTables", 0x53050d00, true},
      {"compAttrTables", 0x53050e00, true},
      {"compORVAttrTables", 0x53050f00, true},
      {"readFile", 0x53051000, false},
      {"writeFile", 0x53051100, false},
      {"writeSetToFile", 0x53051200, true},
      {"readExcludedOids", 0x53051300, false},
      {"delOidFromFileSet", 0x53051400, true},
      {"mergeSchemas", 0x53051500, false},
      {"mergeAttrs", 0x53051600, true},
      {"mergeORVAttrs", 0x53051700, true},
      {"mergeObjClasses", 0x53051800, true},
      {"findOidInSet", 0x53051900, true},
      {"dumpEOids", 0x53051a00, false},
      {"compSchemas", 0x53051b00, false},
      {"checkCollisions", 0x53051c00, false},
      {"modifySchema", 0x53051d00, false},
      {"isExcluded", 0x53051e00, true},
      {"delOidFromModSch", 0x53051f00, true},
      {"checkObjClasses", 0x53052000, true},
      {"checkAttrs", 0x53052100, true},
      {"checkORVAttrs", 0x53052200, true},
      {"getOcTable", 0x53052300, false},
      {"getORVAttrTable", 0x53052400, false},
      {"getAttrTable", 0x53052500, false},
      {"isModFileEmpty", 0x53052600, false},
  };
  return functions;
}

namespace {

std::string nameOf(const std::string& record) {
  const unsigned long identifier = std::strtoul(record.c_str() + record.find("0x"), nullptr, 16);
  for (const TracedFunction& function : tracedFunctions()) {
    if (function.identifier == identifier) {
      return function.name;
    }
  }
  return "unknown function in " + record;
}

bool startsWith(const std::string& text, const char* head) { return text.rfind(head, 0) == 0; }

std::string debugText(const std::string& record) {
  std::string text = record.substr(record.find(": ") + 2);
  while (!text.empty() && text.back() == '\n') {
    text.pop_back();
  }
  return text;
}

}  // namespace

std::string treeOf(const std::vector<std::string>& records) {
  std::string tree;
  std::vector<std::string> open;
  bool isLeaf = false;
  const auto addLine = [&](const std::string& text) {
    tree += "\n" + std::string(2 * open.size(), ' ') + text;
  };
  for (const std::string& record : records) {
    if (startsWith(record, "entry ")) {
      addLine(nameOf(record));
      open.push_back(nameOf(record));
      isLeaf = true;
      continue;
    }
    if (startsWith(record, "exit ")) {
      const std::string code = record.substr(record.find(" code ") + 6);
      if (open.empty() || open.back() != nameOf(record)) {
        return tree + "\nexit without entry: " + record;
      }
      open.pop_back();
      if (isLeaf) {
        tree += " -> " + code;
      } else {
        addLine(nameOf(record) + " -> " + code);
      }
    } else if (startsWith(record, "debug global ")) {
      addLine("debug outside: " + debugText(record));
    } else {
      addLine("debug: " + debugText(record));
    }
    isLeaf = false;
  }
  return open.empty() ? tree + "\n" : tree + "\nno exit from " + open.back();
}

}  // namespace tracetree
