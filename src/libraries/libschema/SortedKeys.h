// Keys that come in any order, each with a value, brought into the order of the tables: a batch of
// entries is made or erased much faster in that order than one by one at places all over a tree.
// Internal: included by .cpp files only.

#ifndef LIBSCHEMA_SORTED_KEYS_H
#define LIBSCHEMA_SORTED_KEYS_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <utility>
#include <vector>

namespace libschema {

// The keys are not copied: each must stay where it is as long as it is in here.
template <typename Value>
class SortedKeys {
 public:
  struct Entry {
    std::string_view key;
    Value value;
    std::uint64_t piece;  // eight characters of the key, as a number, while it is sorted
  };

  void add(std::string_view key, Value value) {
    m_entries.push_back({key, value, 0});
    m_isSorted = false;
  }
  void clear() { m_entries.clear(); }

  // The entries by ascending key; those of one key in the order in which they were added.
  const std::vector<Entry>& inOrder() {
    sort();
    return m_entries;
  }

  // Removes the entries for which `isDone` returns true, asked in order.
  template <typename IsDone>
  void removeInOrder(IsDone isDone) {
    sort();
    m_entries.erase(std::remove_if(m_entries.begin(), m_entries.end(), isDone), m_entries.end());
  }

 private:
  static constexpr std::size_t kPiece = 8;

  // Entries whose keys are equal up to `depth`.
  struct Run {
    Entry* first;
    Entry* last;
    std::size_t depth;
  };

  // Keys have long beginnings in common: they are sorted by one piece after another, as numbers.
  void sort() {
    if (m_isSorted) {
      return;
    }
    m_isSorted = true;
    std::vector<Run> runs = {{m_entries.data(), m_entries.data() + m_entries.size(), 0}};
    while (!runs.empty()) {
      const Run run = runs.back();
      runs.pop_back();
      if (run.last - run.first <= kFew) {
        sortFew(run);
      } else {
        sortByPiece(run);
        addRunsOfOnePiece(run, &runs);
      }
    }
  }

  static constexpr std::ptrdiff_t kFew = 12;

  static void sortFew(const Run& run) {
    const auto isBefore = [&](const Entry& left, const Entry& right) {
      return left.key.substr(run.depth) < right.key.substr(run.depth);
    };
    for (Entry* next = run.first; next != run.last; ++next) {
      std::rotate(std::upper_bound(run.first, next, *next, isBefore), next, next + 1);
    }
  }

  static void sortByPiece(const Run& run) {
    for (Entry* entry = run.first; entry != run.last; ++entry) {
      entry->piece = pieceAt(entry->key, run.depth);
    }
    const auto isBefore = [&](const Entry& left, const Entry& right) {
      return left.piece != right.piece
                 ? left.piece < right.piece
                 : leftOver(left.key, run.depth) < leftOver(right.key, run.depth);
    };
    if (!std::is_sorted(run.first, run.last, isBefore)) {
      std::stable_sort(run.first, run.last, isBefore);
    }
  }

  static void addRunsOfOnePiece(const Run& run, std::vector<Run>* runs) {
    for (Entry* first = run.first; first != run.last;) {
      Entry* last = first + 1;
      while (last != run.last && last->piece == first->piece) {
        ++last;
      }
      // Keys that end with the piece stand before those that go on, and are equal.
      while (first != last && leftOver(first->key, run.depth) <= kPiece) {
        ++first;
      }
      if (last - first > 1) {
        runs->push_back({first, last, run.depth + kPiece});
      }
      first = last;
    }
  }

  static std::uint64_t pieceAt(std::string_view key, std::size_t depth) {
    std::uint64_t piece = 0;
    const std::size_t count = std::min(key.size() - depth, kPiece);
    for (std::size_t i = 0; i < count; ++i) {
      piece |= std::uint64_t{static_cast<unsigned char>(key[depth + i])} << (8 * (kPiece - 1 - i));
    }
    return piece;
  }

  // How many characters there are from `depth` on, those behind the piece counted as one.
  static std::size_t leftOver(std::string_view key, std::size_t depth) {
    return std::min(key.size() - depth, kPiece + 1);
  }

  std::vector<Entry> m_entries;
  bool m_isSorted = true;
};

}  // namespace libschema

#endif  // LIBSCHEMA_SORTED_KEYS_H
