#include "Digest.h"

#include <openssl/evp.h>

#include <array>
#include <new>

namespace migration {

std::string sha256Of(std::string_view bytes) {
  std::array<unsigned char, EVP_MAX_MD_SIZE> digest{};
  unsigned int size = 0;
  // The one way in which it fails is a lack of memory.
  if (EVP_Digest(bytes.data(), bytes.size(), digest.data(), &size, EVP_sha256(), nullptr) != 1) {
    throw std::bad_alloc();
  }
  constexpr std::string_view kDigits = "0123456789abcdef";
  std::string text;
  text.reserve(std::size_t{2} * size);
  for (unsigned int i = 0; i < size; ++i) {
    text += kDigits[digest[i] >> 4U];
    text += kDigits[digest[i] & 15U];
  }
  return text;
}

}  // namespace migration
