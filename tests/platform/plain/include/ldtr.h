// A trace facility: the mask, the records and their guards.

#ifndef PLAIN_LDTR_H
#define PLAIN_LDTR_H

extern unsigned long trcEvents;

void ldtr_write(unsigned long level, unsigned long identifier, void const* pointer);
void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* pointer);

class ldtr_formater_local {
 public:
  ldtr_formater_local(unsigned long identifier, unsigned long level, void const* pointer)
      : m_identifier(identifier), m_level(level), m_pointer(pointer) {}
  void operator()() { ldtr_write(m_level, m_identifier, m_pointer); }
  void debug(unsigned long debugLevel, char const* format, ...);

 private:
  unsigned long m_identifier;
  unsigned long m_level;
  void const* m_pointer;
};

class ldtr_formater_global {
 public:
  ldtr_formater_global(unsigned long level) : m_level(level) {}
  void debug(unsigned long debugLevel, char const* format, ...);

 private:
  unsigned long m_level;
};

class ldtr_function_global {
 public:
  ldtr_formater_global operator()(unsigned long level) { return ldtr_formater_global(level); }
};

extern ldtr_function_global ldtr_fun;

template <unsigned long kIdentifier, unsigned long kKind, unsigned long kEntryBit>
class ldtr_function_local {
 public:
  ldtr_function_local(void const* pointer) : m_errorCode(0), m_pointer(pointer) {}
  ~ldtr_function_local() {
    if ((trcEvents & (kEntryBit | kEntryBit << 1)) != 0) {
      ldtr_exit_errcode(kIdentifier, kKind, kEntryBit, m_errorCode, m_pointer);
    }
  }
  ldtr_formater_local operator()(unsigned long level) {
    return ldtr_formater_local(kIdentifier, level, m_pointer);
  }
  long SetErrorCode(long errorCode) { return m_errorCode = errorCode; }

 private:
  long m_errorCode;
  void const* m_pointer;
};

#endif  // PLAIN_LDTR_H
