// A digest of 128 bits (FNV-1a) and the length of the bytes that it was made of. Two equal ones
// stand for equal bytes: it guards against damage, not against a forger.

#ifndef SCHEMA_MIGRATE_DIGEST_H
#define SCHEMA_MIGRATE_DIGEST_H

#include <cstdint>
#include <string_view>

class Digest {
 public:
  void add(char c) {
    m_state = (m_state ^ static_cast<unsigned char>(c)) * kPrime;
    ++m_length;
  }

  void add(std::string_view bytes) {
    for (const char c : bytes) {
      add(c);
    }
  }

  std::uint64_t length() const { return m_length; }

  bool operator==(const Digest& other) const {
    return m_state == other.m_state && m_length == other.m_length;
  }
  bool operator!=(const Digest& other) const { return !(*this == other); }

 private:
  __extension__ using State = unsigned __int128;

  static constexpr State kPrime = (State{1} << 88) + 0x13b;
  static constexpr State kStart = (State{0x6c62272e07bb0142} << 64) + State{0x62b821756295c58d};

  State m_state = kStart;
  std::uint64_t m_length = 0;
};

#endif  // SCHEMA_MIGRATE_DIGEST_H
