// What the tests of whole operations' records share.

#ifndef LIBSCHEMA_TESTS_RECORD_ORDER_H
#define LIBSCHEMA_TESTS_RECORD_ORDER_H

#include <gtest/gtest.h>

#include <cstdint>
#include <functional>
#include <string>

#include "Files.h"
#include "SchemaManager.h"
#include "TraceRecorder.h"
#include "TraceTree.h"

namespace tracetree {

constexpr std::uint64_t kCalls = 0x33000;  // entries and exits, no debug texts

inline std::string treeOf(const std::function<void()>& action, std::uint64_t events = kCalls) {
  const support::TraceRecorder recorder(events);
  action();
  return tracetree::treeOf(recorder.records());
}

// A manager over a folder of its own, with what it reads.
struct Installation {
  Installation() : manager(directory.path()) {}
  explicit Installation(const std::string& userAttributes) : Installation() {
    read("V3.user.at", userAttributes);
  }
  void read(const std::string& name, const std::string& text) {
    directory.write(name, text);
    EXPECT_EQ(manager.readFile(name), 0) << text;
  }

  support::TemporaryDirectory directory;
  SchemaManager manager;
};

}  // namespace tracetree

#endif  // LIBSCHEMA_TESTS_RECORD_ORDER_H
