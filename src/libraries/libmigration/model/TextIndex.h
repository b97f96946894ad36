// Which values stand under a text. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_TEXT_INDEX_H
#define LIBSCHEMA_MIGRATION_TEXT_INDEX_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace migration {

// Of ASCII letters, as the library folds in the locale of its reading.
constexpr char lowered(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; }
bool equalsFolded(std::string_view left, std::string_view right);
std::string loweredText(std::string_view text);

// Values under texts, several under one in the order in which they were added. The texts are not
// copied and must stay where they are.
class TextIndex {
 public:
  enum class Case { kExact, kFolded };
  static constexpr std::uint32_t kNone = 0xFFFFFFFF;

  explicit TextIndex(Case letterCase) : m_isFolded(letterCase == Case::kFolded) {}

  struct Item {
    std::string_view text;
    std::uint32_t value;
  };

  // Several at a time cost less: what one needs of the memory is fetched while others are looked
  // at.
  void add(std::string_view text, std::uint32_t value) { addAll({{text, value}}); }
  void addAll(const std::vector<Item>& items);

  // The values of a text: nodes from first(text) on, by next(node), to kNone.
  std::uint32_t first(std::string_view text) const { return first(text, hashOf(text)); }
  std::uint32_t first(std::string_view text, std::uint32_t hash) const;
  std::uint32_t next(std::uint32_t node) const { return m_nodes[node].next; }
  std::uint32_t value(std::uint32_t node) const { return m_nodes[node].value; }
  std::string_view text(std::uint32_t node) const { return m_nodes[node].text; }

  // The first node of each text that has more than one value, in the order of their first ones.
  std::vector<std::uint32_t> repeated() const;

  // For who looks up many texts: both before first(), with some other work between them.
  std::uint32_t hashOf(std::string_view text) const;
  void fetchSlot(std::uint32_t hash) const;
  void fetchText(std::uint32_t hash) const;

 private:
  struct Node {
    std::string_view text;
    std::uint32_t value;
    std::uint32_t next;
  };
  struct Slot {
    std::string_view text;
    std::uint32_t hash = 0;
    std::uint32_t first = kNone;
    std::uint32_t last = kNone;
  };

  bool isEqual(std::string_view left, std::string_view right) const {
    return m_isFolded ? equalsFolded(left, right) : left == right;
  }
  // The slot that the text has, or would have.
  std::size_t slotOf(std::string_view text, std::uint32_t hash) const;
  void reserve(std::size_t texts);
  void addOne(const Item& item, std::uint32_t hash);

  bool m_isFolded;
  std::size_t m_used = 0;
  std::vector<Slot> m_slots;  // none, or a power of two
  std::vector<Node> m_nodes;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_TEXT_INDEX_H
