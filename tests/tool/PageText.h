// What a page of a report says, for the tests that compare it with the other formats.

#ifndef LIBSCHEMA_TESTS_PAGE_TEXT_H
#define LIBSCHEMA_TESTS_PAGE_TEXT_H

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

inline std::string replacedAll(std::string text, const std::string& from, const std::string& to) {
  for (std::size_t at = 0; (at = text.find(from, at)) != std::string::npos; at += to.size()) {
    text.replace(at, from.size(), to);
  }
  return text;
}

// The text of a part of a page, without its elements.
inline std::string textOf(const std::string& html) {
  std::string text;
  bool isInTag = false;
  for (const char c : html) {
    isInTag = isInTag || c == '<';
    text += isInTag ? "" : std::string(1, c);
    isInTag = isInTag && c != '>';
  }
  for (const auto& [escaped, plain] : std::vector<std::pair<std::string, std::string>>{
           {"&lt;", "<"}, {"&gt;", ">"}, {"&quot;", "\""}, {"&#39;", "'"}, {"&amp;", "&"}}) {
    text = replacedAll(text, escaped, plain);
  }
  return text;
}

// What a part of a page, or of the text, has to have in this order.
inline void expectInOrder(const std::vector<std::string>& parts, const std::string& text) {
  std::size_t at = 0;
  for (const std::string& part : parts) {
    const std::size_t found = text.find(part, at);
    EXPECT_NE(std::string::npos, found) << part << "\nis not in its place in\n" << text;
    at = found == std::string::npos ? at : found + part.size();
  }
}

#endif  // LIBSCHEMA_TESTS_PAGE_TEXT_H
