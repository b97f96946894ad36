#include "TextIndex.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <utility>

namespace migration {

bool equalsFolded(std::string_view left, std::string_view right) {
  return left.size() == right.size() &&
         (left == right || std::equal(left.begin(), left.end(), right.begin(),
                                      [](char a, char b) { return lowered(a) == lowered(b); }));
}

std::string loweredText(std::string_view text) {
  std::string result(text);
  for (char& c : result) {
    c = lowered(c);
  }
  return result;
}

// Eight bytes at a time. With the bit that makes a capital letter a small one set in every byte,
// texts that differ in letter case have one hash.
std::uint32_t TextIndex::hashOf(std::string_view text) const {
  constexpr std::uint64_t kSmallLetters = 0x2020202020202020U;
  constexpr std::uint64_t kMultiplier = 0x9E3779B97F4A7C15U;
  const std::uint64_t bits = m_isFolded ? kSmallLetters : 0;
  std::uint64_t hash = text.size();
  const auto mix = [&](std::uint64_t piece) {
    hash = (hash ^ (piece | bits)) * kMultiplier;
    hash ^= hash >> 29;
  };
  while (text.size() >= sizeof(std::uint64_t)) {
    std::uint64_t piece = 0;
    std::memcpy(&piece, text.data(), sizeof piece);
    mix(piece);
    text.remove_prefix(sizeof piece);
  }
  std::uint64_t rest = 0;
  if (!text.empty()) {
    std::memcpy(&rest, text.data(), text.size());
  }
  mix(rest);
  return static_cast<std::uint32_t>(hash >> 32);
}

std::size_t TextIndex::slotOf(std::string_view text, std::uint32_t hash) const {
  const std::size_t mask = m_slots.size() - 1;
  std::size_t place = hash & mask;
  while (m_slots[place].first != kNone &&
         (m_slots[place].hash != hash || !isEqual(m_slots[place].text, text))) {
    place = (place + 1) & mask;
  }
  return place;
}

void TextIndex::fetchSlot(std::uint32_t hash) const {
  if (!m_slots.empty()) {
    __builtin_prefetch(&m_slots[hash & (m_slots.size() - 1)]);
  }
}

void TextIndex::fetchText(std::uint32_t hash) const {
  if (!m_slots.empty()) {
    const Slot& slot = m_slots[hash & (m_slots.size() - 1)];
    if (slot.hash == hash && slot.first != kNone) {
      __builtin_prefetch(slot.text.data());
    }
  }
}

// Makes room for so many: at most two of three slots are in use.
void TextIndex::reserve(std::size_t texts) {
  std::size_t size = std::max<std::size_t>(16, m_slots.size());
  while (texts * 3 > size * 2) {
    size *= 2;
  }
  if (size == m_slots.size()) {
    return;
  }
  std::vector<Slot> old(size);
  std::swap(old, m_slots);
  const std::size_t mask = m_slots.size() - 1;
  for (const Slot& slot : old) {
    if (slot.first != kNone) {
      std::size_t place = slot.hash & mask;
      while (m_slots[place].first != kNone) {
        place = (place + 1) & mask;
      }
      m_slots[place] = slot;
    }
  }
}

void TextIndex::addAll(const std::vector<Item>& items) {
  constexpr std::size_t kAtATime = 16;
  if (items.size() > 1) {
    reserve(m_used + items.size());
    m_nodes.reserve(m_nodes.size() + items.size());
  }
  std::array<std::uint32_t, kAtATime> hashes{};
  for (std::size_t begin = 0; begin < items.size(); begin += kAtATime) {
    const std::size_t count = std::min(kAtATime, items.size() - begin);
    for (std::size_t i = 0; i < count; ++i) {
      hashes[i] = hashOf(items[begin + i].text);
      fetchSlot(hashes[i]);
    }
    for (std::size_t i = 0; i < count; ++i) {
      addOne(items[begin + i], hashes[i]);
    }
  }
}

void TextIndex::addOne(const Item& item, std::uint32_t hash) {
  reserve(m_used + 1);
  const auto node = static_cast<std::uint32_t>(m_nodes.size());
  Slot& slot = m_slots[slotOf(item.text, hash)];
  m_nodes.push_back({item.text, item.value, kNone});
  if (slot.first == kNone) {
    slot = {item.text, hash, node, node};
    ++m_used;
  } else {
    m_nodes[slot.last].next = node;
    slot.last = node;
  }
}

std::uint32_t TextIndex::first(std::string_view text, std::uint32_t hash) const {
  return m_slots.empty() ? kNone : m_slots[slotOf(text, hash)].first;
}

std::vector<std::uint32_t> TextIndex::repeated() const {
  std::vector<std::uint32_t> nodes;
  for (const Slot& slot : m_slots) {
    if (slot.first != slot.last) {
      nodes.push_back(slot.first);
    }
  }
  std::sort(nodes.begin(), nodes.end());
  return nodes;
}

}  // namespace migration
