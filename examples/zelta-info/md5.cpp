#include "md5.h"

#include <algorithm>
#include <cstring>

namespace zelta_info {

namespace {

// Per-step left rotations, four per round.
const unsigned shifts[4][4] = {{7, 12, 17, 22}, {5, 9, 14, 20}, {4, 11, 16, 23}, {6, 10, 15, 21}};

// The sine table: floor(abs(sin(i + 1)) * 2^32).
const std::uint32_t sines[64] = {
    0xd76aa478, 0xe8c7b756, 0x242070db, 0xc1bdceee, 0xf57c0faf, 0x4787c62a, 0xa8304613, 0xfd469501,
    0x698098d8, 0x8b44f7af, 0xffff5bb1, 0x895cd7be, 0x6b901122, 0xfd987193, 0xa679438e, 0x49b40821,
    0xf61e2562, 0xc040b340, 0x265e5a51, 0xe9b6c7aa, 0xd62f105d, 0x02441453, 0xd8a1e681, 0xe7d3fbc8,
    0x21e1cde6, 0xc33707d6, 0xf4d50d87, 0x455a14ed, 0xa9e3e905, 0xfcefa3f8, 0x676f02d9, 0x8d2a4c8a,
    0xfffa3942, 0x8771f681, 0x6d9d6122, 0xfde5380c, 0xa4beea44, 0x4bdecfa9, 0xf6bb4b60, 0xbebfbc70,
    0x289b7ec6, 0xeaa127fa, 0xd4ef3085, 0x04881d05, 0xd9d4d039, 0xe6db99e5, 0x1fa27cf8, 0xc4ac5665,
    0xf4292244, 0x432aff97, 0xab9423a7, 0xfc93a039, 0x655b59c3, 0x8f0ccc92, 0xffeff47d, 0x85845dd1,
    0x6fa87e4f, 0xfe2ce6e0, 0xa3014314, 0x4e0811a1, 0xf7537e82, 0xbd3af235, 0x2ad7d2bb, 0xeb86d391};

std::uint32_t rotate(std::uint32_t x, unsigned n) { return (x << n) | (x >> (32 - n)); }

}  // namespace

MD5::MD5() : state_{0x67452301, 0xefcdab89, 0x98badcfe, 0x10325476} {}

void MD5::block(const std::uint8_t* data) {
  std::uint32_t words[16];
  for (int i = 0; i < 16; ++i)
    words[i] = std::uint32_t(data[4 * i]) | std::uint32_t(data[4 * i + 1]) << 8 | std::uint32_t(data[4 * i + 2]) << 16 |
               std::uint32_t(data[4 * i + 3]) << 24;
  std::uint32_t a = state_[0], b = state_[1], c = state_[2], d = state_[3];
  for (unsigned i = 0; i < 64; ++i) {
    std::uint32_t f;
    unsigned g;
    const unsigned round = i / 16;
    if (round == 0) {
      f = (b & c) | (~b & d);
      g = i;
    } else if (round == 1) {
      f = (d & b) | (~d & c);
      g = (5 * i + 1) % 16;
    } else if (round == 2) {
      f = b ^ c ^ d;
      g = (3 * i + 5) % 16;
    } else {
      f = c ^ (b | ~d);
      g = (7 * i) % 16;
    }
    const std::uint32_t next = d;
    d = c;
    c = b;
    b = b + rotate(a + f + sines[i] + words[g], shifts[round][i % 4]);
    a = next;
  }
  state_[0] += a;
  state_[1] += b;
  state_[2] += c;
  state_[3] += d;
}

void MD5::update(const std::uint8_t* data, std::size_t size) {
  total_ += size;
  if (pendingSize_ != 0) {
    const std::size_t take = std::min(size, pending_.size() - pendingSize_);
    std::memcpy(pending_.data() + pendingSize_, data, take);
    pendingSize_ += take;
    data += take;
    size -= take;
    if (pendingSize_ < pending_.size()) return;
    block(pending_.data());
    pendingSize_ = 0;
  }
  for (; size >= 64; data += 64, size -= 64) block(data);
  if (size != 0) std::memcpy(pending_.data(), data, size);
  pendingSize_ = size;
}

std::string MD5::hexDigest() {
  const std::uint64_t bits = total_ * 8;
  std::uint8_t tail[72] = {0x80};
  const std::size_t padding = (pendingSize_ < 56 ? 56 : 120) - pendingSize_;
  for (int i = 0; i < 8; ++i) tail[padding + i] = static_cast<std::uint8_t>(bits >> (8 * i));
  update(tail, padding + 8);
  static const char digits[] = "0123456789abcdef";
  std::string hex;
  for (std::uint32_t word : state_)
    for (int i = 0; i < 4; ++i) {
      const unsigned octet = (word >> (8 * i)) & 0xFF;
      hex += digits[octet >> 4];
      hex += digits[octet & 0xF];
    }
  return hex;
}

}  // namespace zelta_info
