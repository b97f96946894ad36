#include "TraceRecorder.h"

#include <cstdarg>
#include <cstdio>

#include "ldtr.h"

std::uint64_t trcEvents = 0;
ldtr_function_global ldtr_fun;

namespace {

std::vector<std::string>& recorded() {
  static std::vector<std::string> records;
  return records;
}

std::vector<std::string>& recordedMessages() {
  static std::vector<std::string> messages;
  return messages;
}

std::vector<std::string>& recordedFormats() {
  static std::vector<std::string> formats;
  return formats;
}

std::string hex(unsigned long value) {
  char text[32];
  std::snprintf(text, sizeof text, "0x%lx", value);
  return text;
}

std::string formatted(const char* format, std::va_list arguments) {
  std::va_list again;
  va_copy(again, arguments);
  std::string text(static_cast<std::size_t>(std::vsnprintf(nullptr, 0, format, arguments)) + 1,
                   '\0');
  std::vsnprintf(text.data(), text.size(), format, again);
  va_end(again);
  text.pop_back();
  return text;
}

void recordMessage(const std::string& head, const char* format, const std::string& text) {
  recordedFormats().emplace_back(format);
  recorded().push_back(head + ": " + text);
  recordedMessages().push_back(text);
}

const char* mark(void const* pointer) { return pointer == nullptr ? "" : " pointer"; }

}  // namespace

void ldtr_write(unsigned long level, unsigned long identifier, void const* pointer) {
  recorded().push_back("entry " + hex(identifier) + " level " + hex(level) + mark(pointer));
}

void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* pointer) {
  recorded().push_back("exit " + hex(identifier) + " kind " + std::to_string(kind) + " bit " +
                       std::to_string(entryBit) + " code " + std::to_string(errorCode) +
                       mark(pointer));
}

void ldtr_formater_local::debug(unsigned long debugLevel, char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  recordMessage("debug " + hex(m_identifier) + " level " + hex(m_level) + " " + hex(debugLevel),
                format, formatted(format, arguments));
  va_end(arguments);
}

void ldtr_formater_global::debug(unsigned long debugLevel, char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  recordMessage("debug global level " + hex(m_level) + " " + hex(debugLevel), format,
                formatted(format, arguments));
  va_end(arguments);
}

namespace support {

TraceRecorder::TraceRecorder(std::uint64_t events) {
  clear();
  trcEvents = events;
}

TraceRecorder::~TraceRecorder() {
  trcEvents = 0;
  clear();
}

std::vector<std::string> TraceRecorder::records() const { return recorded(); }

std::vector<std::string> TraceRecorder::messages() const { return recordedMessages(); }

std::vector<std::string> TraceRecorder::formats() const { return recordedFormats(); }

void TraceRecorder::clear() {
  recordedFormats().clear();
  recorded().clear();
  recordedMessages().clear();
}

}  // namespace support
