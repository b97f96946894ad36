// The trace points: one type for each traced function, with its identifier and its kind. Whether a
// function is frequent is settled here, not at the call. Internal: included by .cpp files only.
//
// A traced function begins with its trace point: `tracepoint::ReadFile trace;` writes the entry
// record then and the exit record at every way out. TRACE_DEBUG(trace, "text, %s\n", text.c_str())
// writes a debug record, and a function with a status leaves by `return trace.status(1);`, which
// puts it into the exit record.

#ifndef LIBSCHEMA_TRACE_POINTS_H
#define LIBSCHEMA_TRACE_POINTS_H

#include <cstdint>

#include "ldtr.h"

namespace tracepoint {

constexpr std::uint64_t kDebugEvents = 0x04000000;
constexpr unsigned long kDebugLevel = 0x3400000;
constexpr unsigned long kDebugCallLevel = 0xc8010000;

// While nothing is traced, no record tells in which order things are done.
inline bool isAnythingTraced() { return trcEvents != 0; }

// The classes of the library, as numbered in the identifiers.
enum Class : unsigned long {
  kAttribute = 0x01,
  kORVAttribute = 0x02,
  kObjectClass = 0x03,
  kSchemaLexan = 0x04,
  kSchemaManager = 0x05,
};

constexpr unsigned long identifier(Class owner, unsigned long number) {
  return 0x53000000UL | (owner << 16) | (number << 8);
}

template <unsigned long kIdentifier, unsigned long kKind, unsigned long kEntryBit,
          unsigned long kEntryLevel>
class Function : public ldtr_function_local<kIdentifier, kKind, kEntryBit> {
 public:
  Function() : ldtr_function_local<kIdentifier, kKind, kEntryBit>(nullptr) {
    if ((trcEvents & kEntryBit) != 0) {
      (*this)(kEntryLevel)();
    }
  }

  // Hands the status to the exit record and returns it.
  int status(int code) { return static_cast<int>(this->SetErrorCode(code)); }
};

template <Class kOwner, unsigned long kNumber>
using Ordinary = Function<identifier(kOwner, kNumber), 33, 4096, 0x3200000>;

template <Class kOwner, unsigned long kNumber>
using Frequent = Function<identifier(kOwner, kNumber), 43, 65536, 0x32a0000>;

using AttributeAttrsEqual = Ordinary<kAttribute, 0x01>;
using AttributeParse = Ordinary<kAttribute, 0x02>;
using AttributeWrite = Ordinary<kAttribute, 0x03>;
using AttributePrint = Ordinary<kAttribute, 0x04>;

using ORVAttributeParse = Ordinary<kORVAttribute, 0x01>;
using ORVAttributeOrvAttrsEqual = Ordinary<kORVAttribute, 0x02>;
using ORVAttributeWrite = Ordinary<kORVAttribute, 0x03>;
using ORVAttributePrint = Ordinary<kORVAttribute, 0x04>;

using ObjectClassObjsEqual = Ordinary<kObjectClass, 0x01>;
using ObjectClassParse = Ordinary<kObjectClass, 0x02>;
using ObjectClassWrite = Ordinary<kObjectClass, 0x03>;
using ObjectClassPrint = Ordinary<kObjectClass, 0x04>;

using LexanLookUp = Ordinary<kSchemaLexan, 0x01>;
using LexanLexan = Ordinary<kSchemaLexan, 0x02>;
using LexanMatch = Ordinary<kSchemaLexan, 0x03>;
using LexanInsertString = Ordinary<kSchemaLexan, 0x04>;
using LexanInsertCharacter = Ordinary<kSchemaLexan, 0x05>;
using LexanDumpTable = Ordinary<kSchemaLexan, 0x06>;
using LexanDump = Ordinary<kSchemaLexan, 0x07>;
using LexanGetLineNumber = Ordinary<kSchemaLexan, 0x08>;
using LexanGetFileName = Ordinary<kSchemaLexan, 0x09>;
using LexanGetWorkingDir = Ordinary<kSchemaLexan, 0x0a>;
using LexanFileIsOpen = Ordinary<kSchemaLexan, 0x0b>;

using DumpAttrTable = Ordinary<kSchemaManager, 0x01>;
using DumpORVAttrTable = Ordinary<kSchemaManager, 0x02>;
using DumpOcTable = Ordinary<kSchemaManager, 0x03>;
using GetAttr = Ordinary<kSchemaManager, 0x04>;
using GetORVAttr = Ordinary<kSchemaManager, 0x05>;
using GetObjClass = Ordinary<kSchemaManager, 0x06>;
using DumpUserOc = Ordinary<kSchemaManager, 0x07>;
using DumpUserAt = Ordinary<kSchemaManager, 0x08>;
using DumpOrvOc = Ordinary<kSchemaManager, 0x09>;
using DumpOrvAt = Ordinary<kSchemaManager, 0x0a>;
using DumpSysOc = Ordinary<kSchemaManager, 0x0b>;
using DumpSysAt = Ordinary<kSchemaManager, 0x0c>;
using CompObjTables = Frequent<kSchemaManager, 0x0d>;
using CompAttrTables = Frequent<kSchemaManager, 0x0e>;
using CompORVAttrTables = Frequent<kSchemaManager, 0x0f>;
using ReadFile = Ordinary<kSchemaManager, 0x10>;
using WriteFile = Ordinary<kSchemaManager, 0x11>;
using WriteSetToFile = Frequent<kSchemaManager, 0x12>;
using ReadExcludedOids = Ordinary<kSchemaManager, 0x13>;
using DelOidFromFileSet = Frequent<kSchemaManager, 0x14>;
using MergeSchemas = Ordinary<kSchemaManager, 0x15>;
using MergeAttrs = Frequent<kSchemaManager, 0x16>;
using MergeORVAttrs = Frequent<kSchemaManager, 0x17>;
using MergeObjClasses = Frequent<kSchemaManager, 0x18>;
using FindOidInSet = Frequent<kSchemaManager, 0x19>;
using DumpEOids = Ordinary<kSchemaManager, 0x1a>;
using CompSchemas = Ordinary<kSchemaManager, 0x1b>;
using CheckCollisions = Ordinary<kSchemaManager, 0x1c>;
using ModifySchema = Ordinary<kSchemaManager, 0x1d>;
using IsExcluded = Frequent<kSchemaManager, 0x1e>;
using DelOidFromModSch = Frequent<kSchemaManager, 0x1f>;
using CheckObjClasses = Frequent<kSchemaManager, 0x20>;
using CheckAttrs = Frequent<kSchemaManager, 0x21>;
using CheckORVAttrs = Frequent<kSchemaManager, 0x22>;
using GetOcTable = Ordinary<kSchemaManager, 0x23>;
using GetORVAttrTable = Ordinary<kSchemaManager, 0x24>;
using GetAttrTable = Ordinary<kSchemaManager, 0x25>;
using IsModFileEmpty = Ordinary<kSchemaManager, 0x26>;

}  // namespace tracepoint

// Writes a debug record through `guard`: a trace point, or ldtr_fun outside any numbered function.
// The format and its arguments are evaluated only when debug events are on.
#define TRACE_DEBUG(guard, ...)                                                         \
  do {                                                                                  \
    if ((trcEvents & tracepoint::kDebugEvents) != 0) {                                  \
      (guard)(tracepoint::kDebugLevel).debug(tracepoint::kDebugCallLevel, __VA_ARGS__); \
    }                                                                                   \
  } while (false)

#endif  // LIBSCHEMA_TRACE_POINTS_H
