#include "support/digest.h"

#include <openssl/evp.h>

#include <stdexcept>

namespace zelta_test {

std::string md5Hex(const ByteVector& bytes) {
  unsigned char digest[EVP_MAX_MD_SIZE];
  unsigned int size = 0;
  if (EVP_Digest(bytes.data(), bytes.size(), digest, &size, EVP_md5(), nullptr) != 1)
    throw std::runtime_error("MD5 failed");
  static const char digits[] = "0123456789abcdef";
  std::string text;
  for (unsigned int i = 0; i < size; ++i) {
    text += digits[digest[i] >> 4];
    text += digits[digest[i] & 0x0F];
  }
  return text;
}

}  // namespace zelta_test
