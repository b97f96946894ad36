// The server's trace facility, as far as the library uses it.
//
// The facility gives the event mask, the two record writers, the two `debug` entry points and the
// object `ldtr_fun`. The guard template and the small classes around a record are complete in this
// header.
//
// libschema-platform holds a stand-in for each of these symbols, by itself, behind libschema: the
// server's own is found first, wherever it stands.
// - In the program, also one that is built with -fvisibility=hidden, or in a shared library that
// the
//   program is linked with: nothing is to be done, in whichever order they are linked. A program
//   that names -lschema-platform itself names it behind the server's library.
// - In a static archive: the archive stands behind libschema.
// - libschema.a with the server's shared library: the latter stands before libschema-platform.a,
//   which can be left out where the server gives every symbol.
// - libschema in a plug-in: the program exports its symbols (-rdynamic), or they are in a shared
//   library of the program's or among what the plug-in is linked with.

#ifndef LIBSCHEMA_LDTR_H
#define LIBSCHEMA_LDTR_H

#include <cstdint>

// Visible to libschema also where a server compiles its definitions with -fvisibility=hidden.
#pragma GCC visibility push(default)

// The mask of enabled events. It is only read, afresh at every trace point.
extern std::uint64_t trcEvents;

// Writes the entry record of a function.
void ldtr_write(unsigned long level, unsigned long identifier, void const* pointer);

// Writes the exit record of a function, with the status that its caller sees.
void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* pointer);

// A record under construction, of a function that has an identifier.
class ldtr_formater_local {
 public:
  // Keeps what the record will have: the function, the level, and the object or null.
  ldtr_formater_local(unsigned long identifier, unsigned long level, void const* pointer)
      : m_identifier(identifier), m_level(level), m_pointer(pointer) {}

  // Writes the entry record.
  void operator()() { ldtr_write(m_level, m_identifier, m_pointer); }

  // Writes a printf-style debug record. Given by the facility.
  void debug(unsigned long debugLevel, char const* format, ...)
      __attribute__((format(printf, 3, 4)));

  // As it was made with.
  unsigned long identifier() const { return m_identifier; }
  unsigned long level() const { return m_level; }

 private:
  unsigned long m_identifier;
  unsigned long m_level;
  void const* m_pointer;
};

// A record under construction, of code outside any numbered function.
class ldtr_formater_global {
 public:
  // Keeps the level that the record will have.
  ldtr_formater_global(unsigned long level) : m_level(level) {}

  // Writes a printf-style debug record. Given by the facility.
  void debug(unsigned long debugLevel, char const* format, ...)
      __attribute__((format(printf, 3, 4)));

  // As it was made with.
  unsigned long level() const { return m_level; }

 private:
  unsigned long m_level;
};

// The guard of code outside any numbered function, used through the object `ldtr_fun`.
class ldtr_function_global {
 public:
  // Begins a record of this level.
  ldtr_formater_global operator()(unsigned long level) { return ldtr_formater_global(level); }
};

// The one object of its class, given by the facility.
extern ldtr_function_global ldtr_fun;

// The guard of a numbered function: created on entry, it writes the exit record when it is
// destroyed, also when an exception passes. kKind is 33 with the entry bit 4096, or 43 with 65536;
// the exit record is written when that bit or the next higher one is set.
template <unsigned long kIdentifier, unsigned long kKind, unsigned long kEntryBit>
class ldtr_function_local {
 public:
  // On entry; `pointer` is the object that the function is of, or null.
  ldtr_function_local(void const* pointer) : m_errorCode(0), m_pointer(pointer) {}
  ldtr_function_local(const ldtr_function_local&) = delete;
  ldtr_function_local& operator=(const ldtr_function_local&) = delete;

  ~ldtr_function_local() {
    if ((trcEvents & kExitBits) != 0) {
      ldtr_exit_errcode(kIdentifier, kKind, kEntryBit, m_errorCode, m_pointer);
    }
  }

  // Begins a record of this level.
  ldtr_formater_local operator()(unsigned long level) {
    return ldtr_formater_local(kIdentifier, level, m_pointer);
  }

  // Stores the code for the exit record and returns it.
  long SetErrorCode(long errorCode) {
    m_errorCode = errorCode;
    return errorCode;
  }

 private:
  static constexpr std::uint64_t kExitBits = kEntryBit | (kEntryBit << 1);

  long m_errorCode;
  void const* m_pointer;
};

#pragma GCC visibility pop

#endif  // LIBSCHEMA_LDTR_H
