// The results of the manager's operations, each once. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_SCHEMA_RESULTS_H
#define LIBSCHEMA_SCHEMA_RESULTS_H

constexpr int kDone = 0;
constexpr int kFailed = 1;        // a file could not be opened or parsed
constexpr int kNotInSet = 32;     // the OID was in no set
constexpr int kUnknownFile = 89;  // not one of the accepted V3.* names

#endif  // LIBSCHEMA_SCHEMA_RESULTS_H
