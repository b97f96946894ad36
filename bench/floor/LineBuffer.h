// Text for a file to be written at once. Room is made once for a whole definition, and the pieces
// are then only copied.

#ifndef LIBSCHEMA_BENCH_FLOOR_LINE_BUFFER_H
#define LIBSCHEMA_BENCH_FLOOR_LINE_BUFFER_H

#include <cstddef>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace minimal {

class LineBuffer {
 public:
  // Makes room for `count` bytes more.
  void reserve(std::size_t count) {
    if (m_capacity - m_size < count) {
      grow(count);
    }
  }

  // Each of these wants the room reserved.
  void add(std::string_view text) {
    std::memcpy(m_bytes.get() + m_size, text.data(), text.size());
    m_size += text.size();
  }
  void addIf(bool condition, std::string_view text) {
    if (condition) {
      add(text);
    }
  }
  void addValue(std::string_view keyword, const std::string& value) {
    if (!value.empty()) {
      add(keyword);
      add(value);
      add(" ");
    }
  }
  void addQuoted(const std::vector<std::string>& values) {
    for (const std::string& value : values) {
      add("'");
      add(value);
      add("' ");
    }
  }

  // Room that a list of values takes in a line, whatever stands between them.
  static std::size_t room(const std::vector<std::string>& values) {
    std::size_t sum = 16;
    for (const std::string& value : values) {
      sum += value.size() + 3;
    }
    return sum;
  }

  const char* data() const { return m_bytes.get(); }
  std::size_t size() const { return m_size; }

 private:
  void grow(std::size_t count) {
    m_capacity = (m_capacity + count) * 2;
    std::unique_ptr<char[]> bytes(new char[m_capacity]);
    if (m_size != 0) {
      std::memcpy(bytes.get(), m_bytes.get(), m_size);
    }
    m_bytes = std::move(bytes);
  }

  std::unique_ptr<char[]> m_bytes;
  std::size_t m_size = 0;
  std::size_t m_capacity = 0;
};

}  // namespace minimal

#endif  // LIBSCHEMA_BENCH_FLOOR_LINE_BUFFER_H
