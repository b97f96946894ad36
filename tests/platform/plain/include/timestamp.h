#ifndef PLAIN_TIMESTAMP_H
#define PLAIN_TIMESTAMP_H

#include <string>

std::string getCurrentTimeStamp(int format);

#endif  // PLAIN_TIMESTAMP_H
