// A server that has its own clock and trace facility. The library takes them in place of its
// stand-ins, whichever way it is linked.

#include <cstdarg>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>

#include "SchemaManager.h"
#include "ldtr.h"
#include "timestamp.h"

std::uint64_t trcEvents = 0;
ldtr_function_global ldtr_fun;

namespace {

constexpr std::uint64_t kEntryAndDebug = 0x04001000;
constexpr unsigned long kReadFile = 0x53051000;
constexpr unsigned long kCompSchemas = 0x53051b00;
constexpr unsigned long kWriteFile = 0x53051100;

bool isShown(unsigned long identifier) {
  return identifier == kReadFile || identifier == kCompSchemas || identifier == kWriteFile;
}

void writeText(const char* path, const char* text) {
  std::ofstream out(path);
  out << text;
}

}  // namespace

std::string getCurrentTimeStamp(int format) { return "host clock " + std::to_string(format); }

void ldtr_write(unsigned long level, unsigned long identifier, void const* /*pointer*/) {
  if (isShown(identifier)) {
    std::printf("entry %lx level %lx\n", identifier, level);
  }
}

void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* /*pointer*/) {
  if (isShown(identifier)) {
    std::printf("exit %lx kind %lu bit %lu code %ld\n", identifier, kind, entryBit, errorCode);
  }
}

void ldtr_formater_local::debug(unsigned long debugLevel, char const* format, ...) {
  if (isShown(identifier())) {
    std::printf("debug %lx level %lx %lx: ", identifier(), level(), debugLevel);
    std::va_list arguments;
    va_start(arguments, format);
    std::vprintf(format, arguments);
    va_end(arguments);
  }
}

void ldtr_formater_global::debug(unsigned long /*debugLevel*/, char const* /*format*/, ...) {}

// Works in the current folder: writes two schemas of one file each, compares them, writes what the
// first has of its own.
int main() {
  for (const char* folder : {"old", "new", "out"}) {
    std::filesystem::create_directory(folder);
  }
  writeText("new/V3.user.at", "attributetypes=( 1.1.2 NAME 'sn' DESC 'family name' )\n");
  writeText("old/V3.user.at",
            "attributetypes=( 1.1.2 NAME 'sn' DESC 'family name' )\n"
            "attributetypes=( 1.1.1 NAME 'badgeNumber' DESC 'on the badge' SYNTAX 1.2.3{8} )\n");

  trcEvents = kEntryAndDebug;
  SchemaManager site("old");
  SchemaManager release("new");
  if (site.readFile("V3.user.at") != 0 || release.readFile("V3.user.at") != 0 ||
      !site.compSchemas(&release) || site.writeFile("out", "V3.user.at") != 0) {
    return 1;
  }
  trcEvents = 0;
  std::cout << "written:\n" << std::ifstream("out/V3.user.at").rdbuf();
}
