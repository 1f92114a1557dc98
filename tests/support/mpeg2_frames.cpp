#include "support/mpeg2_frames.h"

#include "support/recording.h"

namespace zelta_test {

ByteVector startCode(std::uint8_t code) { return ByteVector{0x00, 0x00, 0x01, code}; }

void append(ByteVector& to, const ByteVector& more) { to.insert(to.end(), more.begin(), more.end()); }

ByteVector sequenceHeader() {
  ByteVector bytes = startCode(0xB3);
  append(bytes, bytesOf("78 04 38 35 FF FF E0 18"));
  return bytes;
}

ByteVector gopHeader(bool closed, bool brokenLink) {
  ByteVector bytes = startCode(0xB8);
  append(bytes, bytesOf("50 08 00"));
  bytes.push_back(static_cast<std::uint8_t>((closed ? 0x40 : 0) | (brokenLink ? 0x20 : 0)));
  return bytes;
}

ByteVector pictureHeader(std::uint16_t temporalReference, std::uint8_t type) {
  ByteVector bytes = startCode(0x00);
  bytes.push_back(static_cast<std::uint8_t>(temporalReference >> 2));
  bytes.push_back(static_cast<std::uint8_t>(((temporalReference & 0x03) << 6) | (type << 3) | 0x07));
  append(bytes, bytesOf("FF F8"));
  return bytes;
}

ByteVector sliceData() {
  ByteVector bytes = startCode(0x01);
  append(bytes, bytesOf("12 34 00 00 01 B8 00 00 00 40 00 00 01 B3 56"));
  return bytes;
}

ByteVector frame(bool withSequenceHeader, Gop gop, std::uint16_t temporalReference, std::uint8_t type) {
  ByteVector bytes;
  if (withSequenceHeader) append(bytes, sequenceHeader());
  if (gop != noGop) append(bytes, gopHeader(gop == closedGop, false));
  append(bytes, pictureHeader(temporalReference, type));
  append(bytes, sliceData());
  return bytes;
}

}  // namespace zelta_test
