#include "md5.h"

#include <stdexcept>

namespace zelta_info {

namespace {

void require(bool done, const char* what) {
  if (!done) throw std::runtime_error(std::string("MD5: ") + what);
}

}  // namespace

MD5::MD5() : context_(EVP_MD_CTX_new()) {
  require(context_ != nullptr, "no digest context");
  require(EVP_DigestInit_ex(context_.get(), EVP_md5(), nullptr) == 1, "digest not available");
}

void MD5::update(const std::uint8_t* data, std::size_t size) {
  require(EVP_DigestUpdate(context_.get(), data, size) == 1, "update failed");
}

std::string MD5::hexDigest() {
  unsigned char digest[EVP_MAX_MD_SIZE];
  unsigned int size = 0;
  require(EVP_DigestFinal_ex(context_.get(), digest, &size) == 1, "final failed");
  static const char digits[] = "0123456789abcdef";
  std::string text;
  for (unsigned int i = 0; i < size; ++i) {
    text += digits[digest[i] >> 4];
    text += digits[digest[i] & 0x0F];
  }
  return text;
}

}  // namespace zelta_info
