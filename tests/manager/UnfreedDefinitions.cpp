#include "UnfreedDefinitions.h"

#if defined(__SANITIZE_ADDRESS__)
#define LIBSCHEMA_TESTS_LEAK_CHECKER 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define LIBSCHEMA_TESTS_LEAK_CHECKER 1
#endif
#endif

#ifdef LIBSCHEMA_TESTS_LEAK_CHECKER

#include <sanitizer/lsan_interface.h>

support::UnfreedDefinitions::UnfreedDefinitions() { __lsan_disable(); }
support::UnfreedDefinitions::~UnfreedDefinitions() { __lsan_enable(); }

#else

support::UnfreedDefinitions::UnfreedDefinitions() = default;
support::UnfreedDefinitions::~UnfreedDefinitions() = default;

#endif
