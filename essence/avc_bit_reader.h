// Bits of an AVC byte stream, with and without emulation prevention.
#ifndef ZELTA_ESSENCE_AVC_BIT_READER_H
#define ZELTA_ESSENCE_AVC_BIT_READER_H

#include <cstddef>
#include <cstdint>

namespace zelta {

// Over a buffer that it does not own. Outside a NAL unit it takes octets as
// they are; inside one it drops each 03 that follows two zero octets, the
// count of zeros starting again behind it. Reading past the end fails
// "successful read()".
class AVCBitReader {
public:
  AVCBitReader(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

  // Moves behind the next 00 00 01, in byte mode; false when there is none.
  bool findStartCode();
  // Octets not yet taken.
  std::size_t remaining() const { return size_ - position_; }
  // The next octet, not taken ("successful read()").
  std::uint8_t peek() const;

  void enterNAL();
  // Drops the bits left of the current octet.
  void leaveNAL();

  // At most 32 bits, most significant first. Headers are read for every
  // picture, so what the current octet holds is taken inline.
  std::uint32_t bits(unsigned count) {
    if (count > bitsLeft_) return bitsAcrossOctets(count);
    bitsLeft_ -= count;
    return (octet_ >> bitsLeft_) & ((1u << count) - 1);
  }
  bool flag() { return bits(1) != 0; }
  // Exp-Golomb codes of at most 31 leading zeros ("valid Exp-Golomb code").
  std::uint32_t unsignedCode() {
    const unsigned rest = octet_ & ((1u << bitsLeft_) - 1);
    if (rest != 0) {
      const unsigned leading = static_cast<unsigned>(__builtin_clz(rest)) - (32 - bitsLeft_);
      const unsigned codeBits = 2 * leading + 1;
      if (codeBits <= bitsLeft_) {
        bitsLeft_ -= codeBits;
        return ((octet_ >> bitsLeft_) & ((1u << (leading + 1)) - 1)) - 1;
      }
    }
    return codeAcrossOctets();
  }
  std::int32_t signedCode();
  // Whether syntax comes before the stop bit of the NAL unit, which ends at
  // the next 00 00 00, 00 00 01 or 00 00 02, or with the buffer.
  bool moreRBSPData() const;

private:
  std::uint32_t bitsAcrossOctets(unsigned count);
  std::uint32_t codeAcrossOctets();
  // Inline for the common octet: inside the buffer and no 03 to drop.
  std::uint8_t takeOctet() {
    if (position_ < size_ && (zeros_ < 2 || data_[position_] != 0x03)) {
      const std::uint8_t octet = data_[position_++];
      zeros_ = octet == 0 ? zeros_ + 1 : 0;
      return octet;
    }
    return takeOctetAtEdge();
  }
  std::uint8_t takeOctetAtEdge();
  std::size_t endOfNAL(std::size_t from) const;
  bool isEmulationPrevention(std::size_t at) const;

  const std::uint8_t* data_;
  std::size_t size_;
  std::size_t position_ = 0;
  std::uint8_t octet_ = 0;
  unsigned bitsLeft_ = 0;
  bool inNAL_ = false;
  unsigned zeros_ = 0;
};

}  // namespace zelta

#endif
