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

  // At most 32 bits, most significant first.
  std::uint32_t bits(unsigned count);
  bool flag() { return bits(1) != 0; }
  // Exp-Golomb codes of at most 31 leading zeros ("valid Exp-Golomb code").
  std::uint32_t unsignedCode();
  std::int32_t signedCode();
  // Whether syntax comes before the stop bit of the NAL unit, which ends at
  // the next 00 00 00, 00 00 01 or 00 00 02, or with the buffer.
  bool moreRBSPData() const;

private:
  std::uint8_t takeOctet();
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
