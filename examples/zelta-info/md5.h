// MD5 (RFC 1321) of a stream of octets, for comparing essence with other
// tools' checksums.
#ifndef ZELTA_INFO_MD5_H
#define ZELTA_INFO_MD5_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>

namespace zelta_info {

class MD5 {
public:
  MD5();
  void update(const std::uint8_t* data, std::size_t size);
  // 32 lower-case hexadecimal digits; the digest is final after this.
  std::string hexDigest();

private:
  void block(const std::uint8_t* data);

  std::array<std::uint32_t, 4> state_;
  std::array<std::uint8_t, 64> pending_{};
  std::size_t pendingSize_ = 0;
  std::uint64_t total_ = 0;
};

}  // namespace zelta_info

#endif
