// early: works with managers before main and behind it, in the constructor and the destructor of a
// static object, in a file that brings no stream into the program by itself. In the current folder.

#include <cstdio>

#include "SchemaManager.h"

namespace {

void writeText(const char* path, const char* text) {
  std::FILE* const out = std::fopen(path, "w");
  std::fputs(text, out);
  std::fclose(out);
}

// Reads, prints and writes the two kinds of definition that have values without a clause for them.
void migrate(const char* when) {
  std::printf("%s\n", when);
  std::fflush(stdout);
  SchemaManager manager(".");
  const int attributes = manager.readFile("V3.user.at");
  const int extensions = manager.readFile("V3.orv.at");
  manager.dumpUserAt();
  manager.getORVAttr("1.1.3").dump();
  const int written =
      manager.writeFile("out", "V3.user.at") + manager.writeFile("out", "V3.orv.at");
  std::printf("read %d %d, written %d\n", attributes, extensions, written);
  for (const char* path : {"out/V3.user.at", "out/V3.orv.at"}) {
    std::FILE* const in = std::fopen(path, "r");
    char line[256];
    std::fgets(line, sizeof line, in);
    while (std::fgets(line, sizeof line, in) != nullptr) {
      std::fputs(line, stdout);
    }
    std::fclose(in);
    std::remove(path);
  }
  std::fflush(stdout);
}

struct Early {
  Early() {
    writeText("V3.user.at", "attributetypes=( 1.1.2 NAME 'sn' DESC 'family name' )\n");
    writeText("V3.orv.at",
              "attributetypes=( 1.1.3 NAME 'l' DESC 'place' )\n"
              "ORVAttributetypes=( 1.1.3 DBNAME ( 'l' 'l' ) )\n");
    migrate("before main");
  }
  ~Early() { migrate("behind main"); }
};

const Early early;

}  // namespace

int main() { std::puts("main"); }
