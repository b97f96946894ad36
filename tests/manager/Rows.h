// Tables of test cases, one row per case.

#ifndef LIBSCHEMA_TESTS_ROWS_H
#define LIBSCHEMA_TESTS_ROWS_H

#include <gtest/gtest.h>

#include <string>

namespace support {

// The `name` of a row is the name of its test.
template <typename Row>
std::string nameOfRow(const testing::TestParamInfo<Row>& row) {
  return row.param.name;
}

}  // namespace support

#endif  // LIBSCHEMA_TESTS_ROWS_H
