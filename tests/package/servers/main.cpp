// A server's program. With PLUGIN it loads that, for itself alone; with SETS_MASK it sets the event
// mask of the facility.

#include <dlfcn.h>

#include <cstdio>

#include "ldtr.h"

extern "C" int migrate();

int main() {
#ifdef SETS_MASK
  trcEvents = SETS_MASK;
#endif
#ifdef PLUGIN
  void* const plugin = ::dlopen(PLUGIN, RTLD_NOW | RTLD_LOCAL);
  void* const function = plugin == nullptr ? nullptr : ::dlsym(plugin, "migrate");
  if (function == nullptr) {
    std::printf("%s\n", ::dlerror());
    return 1;
  }
  return reinterpret_cast<int (*)()>(function)();
#else
  return migrate();
#endif
}
