#include "Calls.h"

#include <cstdio>
#include <map>

namespace support {

namespace {

// By function identifier without its last byte, which is 0.
const std::map<unsigned long, const char*> kFunctions = {
    {0x530101, "Attribute.attrsEqual"},
    {0x530102, "Attribute.parse"},
    {0x530103, "Attribute.dump"},
    {0x530104, "Attribute.print"},
    {0x530201, "ORVAttribute.parse"},
    {0x530202, "ORVAttribute.orvAttrsEqual"},
    {0x530203, "ORVAttribute.dump"},
    {0x530204, "ORVAttribute.print"},
    {0x530301, "ObjectClass.objsEqual"},
    {0x530302, "ObjectClass.parse"},
    {0x530303, "ObjectClass.dump"},
    {0x530304, "ObjectClass.print"},
    {0x530501, "dumpAttrTable"},
    {0x530502, "dumpORVAttrTable"},
    {0x530503, "dumpOcTable"},
    {0x530504, "getAttr"},
    {0x530505, "getORVAttr"},
    {0x530506, "getObjClass"},
    {0x530507, "dumpUserOc"},
    {0x530508, "dumpUserAt"},
    {0x530509, "dumpOrvOc"},
    {0x53050a, "dumpOrvAt"},
    {0x53050b, "dumpSysOc"},
    {0x53050c, "dumpSysAt"},
    {0x53050d, "compObjTables"},
    {0x53050e, "compAttrTables"},
    {0x53050f, "compORVAttrTables"},
    {0x530510, "readFile"},
    {0x530511, "writeFile"},
    {0x530512, "writeSetToFile"},
    {0x530513, "readExcludedOids"},
    {0x530514, "delOidFromFileSet"},
    {0x530515, "mergeSchemas"},
    {0x530516, "mergeAttrs"},
    {0x530517, "mergeORVAttrs"},
    {0x530518, "mergeObjClasses"},
    {0x530519, "findOidInSet"},
    {0x53051a, "dumpEOids"},
    {0x53051b, "compSchemas"},
    {0x53051c, "checkCollisions"},
    {0x53051d, "modifySchema"},
    {0x53051e, "isExcluded"},
    {0x53051f, "delOidFromModSch"},
    {0x530520, "checkObjClasses"},
    {0x530521, "checkAttrs"},
    {0x530522, "checkORVAttrs"},
    {0x530523, "getOcTable"},
    {0x530524, "getORVAttrTable"},
    {0x530525, "getAttrTable"},
    {0x530526, "isModFileEmpty"},
};

bool isAnalyser(unsigned long identifier) { return identifier >> 16 == 0x5304; }

std::string nameOf(unsigned long identifier) {
  const auto function = kFunctions.find(identifier >> 8);
  const bool isKnown = function != kFunctions.end() && (identifier & 0xff) == 0;
  return isKnown ? function->second : "unknown-" + std::to_string(identifier);
}

}  // namespace

std::string callTree(const std::vector<std::string>& records) {
  std::string tree;
  for (const std::string& record : records) {
    unsigned long identifier = 0;
    long code = 0;
    if (std::sscanf(record.c_str(), "entry %lx", &identifier) == 1 && !isAnalyser(identifier)) {
      tree += nameOf(identifier) + "{";
    } else if (std::sscanf(record.c_str(), "exit %lx kind %*u bit %*u code %ld", &identifier,
                           &code) == 2 &&
               !isAnalyser(identifier)) {
      if (!tree.empty() && tree.back() == '{') {
        tree.pop_back();
      } else {
        tree.back() = '}';
      }
      tree += (code == 0 ? "" : "=" + std::to_string(code)) + " ";
    }
  }
  if (!tree.empty()) {
    tree.pop_back();
  }
  return tree;
}

std::string callsOf(const std::function<void()>& action) {
  TraceRecorder trace(kAllEvents);
  action();
  return callTree(trace.records());
}

std::string messagesOf(const std::function<void()>& action) {
  TraceRecorder trace(kDebugEvents);
  action();
  std::string messages;
  for (const std::string& record : trace.records()) {
    const std::string head = "debug 0x5305";
    if (record.compare(0, head.size(), head) == 0) {
      messages += record.substr(record.find(": ") + 2);
    }
  }
  return messages;
}

}  // namespace support
