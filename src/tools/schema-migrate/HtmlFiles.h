// The files in html/, compiled in.

#ifndef SCHEMA_MIGRATE_HTML_FILES_H
#define SCHEMA_MIGRATE_HTML_FILES_H

namespace html {

extern const char kPlanTemplate[];
extern const char kCheckTemplate[];
extern const char kFleetTemplate[];
extern const char kStyle[];
extern const char kScript[];

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_FILES_H
