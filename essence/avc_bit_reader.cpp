#include "essence/avc_bit_reader.h"

#include <cstring>

#include "klv.h"

namespace zelta {

namespace {

constexpr std::uint8_t emulationPrevention = 0x03;
constexpr unsigned longestExpGolombPrefix = 31;

}  // namespace

// A start code's 01 is rare in coded data, so it is searched for; the two
// zeros in front of it must be octets of this search.
bool AVCBitReader::findStartCode() {
  std::size_t from = position_ + 2;
  while (from < size_) {
    const auto* one = static_cast<const std::uint8_t*>(std::memchr(data_ + from, 0x01, size_ - from));
    if (!one) break;
    const std::size_t at = static_cast<std::size_t>(one - data_);
    if (data_[at - 1] == 0 && data_[at - 2] == 0) {
      position_ = at + 1;
      return true;
    }
    from = at + 1;
  }
  position_ = size_;
  return false;
}

std::uint8_t AVCBitReader::peek() const {
  check(position_ < size_, "successful read()");
  return data_[position_];
}

void AVCBitReader::enterNAL() {
  inNAL_ = true;
  zeros_ = 0;
  bitsLeft_ = 0;
}

void AVCBitReader::leaveNAL() {
  inNAL_ = false;
  bitsLeft_ = 0;
}

std::uint8_t AVCBitReader::takeOctetAtEdge() {
  check(position_ < size_, "successful read()");
  std::uint8_t octet = data_[position_++];
  if (!inNAL_) return octet;
  if (zeros_ >= 2 && octet == emulationPrevention) {
    zeros_ = 0;
    check(position_ < size_, "successful read()");
    octet = data_[position_++];
  }
  zeros_ = octet == 0 ? zeros_ + 1 : 0;
  return octet;
}

// Whole runs of the current octet at a time.
std::uint32_t AVCBitReader::bitsAcrossOctets(unsigned count) {
  std::uint64_t value = 0;
  while (count > 0) {
    if (bitsLeft_ == 0) {
      octet_ = takeOctet();
      bitsLeft_ = 8;
    }
    const unsigned take = count < bitsLeft_ ? count : bitsLeft_;
    bitsLeft_ -= take;
    value = (value << take) | ((octet_ >> bitsLeft_) & ((1u << take) - 1));
    count -= take;
  }
  return static_cast<std::uint32_t>(value);
}

// The leading zeros are counted an octet at a time.
std::uint32_t AVCBitReader::codeAcrossOctets() {
  unsigned zeros = 0;
  for (;;) {
    if (bitsLeft_ == 0) {
      octet_ = takeOctet();
      bitsLeft_ = 8;
    }
    const unsigned rest = octet_ & ((1u << bitsLeft_) - 1);
    const unsigned leading = rest == 0 ? bitsLeft_ : static_cast<unsigned>(__builtin_clz(rest)) - (32 - bitsLeft_);
    zeros += leading;
    check(zeros <= longestExpGolombPrefix, "valid Exp-Golomb code");
    bitsLeft_ -= leading;
    if (rest != 0) break;
  }
  --bitsLeft_;  // the one that ends the prefix
  if (zeros == 0) return 0;
  return ((1u << zeros) - 1) + bits(zeros);
}

// 1, 2, 3, 4 ... code +1, -1, +2, -2 ...
std::int32_t AVCBitReader::signedCode() {
  const std::uint32_t code = unsignedCode();
  const std::int64_t magnitude = (static_cast<std::int64_t>(code) + 1) / 2;
  return static_cast<std::int32_t>(code % 2 == 1 ? magnitude : -magnitude);
}

// Within a NAL unit, 00 00 03 is always emulation prevention, so the raw
// octets tell it without the count.
bool AVCBitReader::isEmulationPrevention(std::size_t at) const {
  return data_[at] == emulationPrevention && at >= 2 && data_[at - 1] == 0 && data_[at - 2] == 0;
}

std::size_t AVCBitReader::endOfNAL(std::size_t from) const {
  for (std::size_t at = from; at + 2 < size_; ++at)
    if (data_[at] == 0 && data_[at + 1] == 0 && data_[at + 2] <= 0x02) return at;
  return size_;
}

// The stop bit is the last set bit of the NAL unit, behind which come only
// zero octets, cabac_zero_words among them.
bool AVCBitReader::moreRBSPData() const {
  const std::size_t at = bitsLeft_ > 0 ? position_ - 1 : position_;
  const unsigned bit = bitsLeft_ > 0 ? 8 - bitsLeft_ : 0;
  for (std::size_t last = endOfNAL(at); last > at;) {
    --last;
    if (data_[last] == 0 || isEmulationPrevention(last)) continue;
    const unsigned stopBit = 7 - static_cast<unsigned>(__builtin_ctz(data_[last]));
    return last > at || stopBit > bit;
  }
  return false;
}

}  // namespace zelta
