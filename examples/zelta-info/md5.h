// MD5 of a stream of octets, by OpenSSL's libcrypto, for comparing essence
// with other tools' checksums.
#ifndef ZELTA_INFO_MD5_H
#define ZELTA_INFO_MD5_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

#include <openssl/evp.h>

namespace zelta_info {

class MD5 {
public:
  MD5();
  void update(const std::uint8_t* data, std::size_t size);
  // 32 lower-case hexadecimal digits; the digest is final after this.
  std::string hexDigest();

private:
  struct Free {
    void operator()(EVP_MD_CTX* context) const { EVP_MD_CTX_free(context); }
  };
  std::unique_ptr<EVP_MD_CTX, Free> context_;
};

}  // namespace zelta_info

#endif
