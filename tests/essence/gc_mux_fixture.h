// A generic-container muxer writing into a string, and the keys the tests
// of the writing side use.
#ifndef ZELTA_TESTS_ESSENCE_GC_MUX_FIXTURE_H
#define ZELTA_TESTS_ESSENCE_GC_MUX_FIXTURE_H

#include <sstream>
#include <string>

#include "mxf.h"
#include "support/recording.h"

namespace zelta_test::gcmux {

// A picture, a sound and a data element key, and system keys of the three
// codings: a local set with 2-octet tags and 2-octet lengths, a fixed
// length pack, a variable length pack with 2-octet lengths.
inline const KLVKey pictureKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00");
inline const KLVKey soundKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.16.01.01.00");
inline const KLVKey dataKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.17.01.02.00");
inline const KLVKey compoundKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.18.01.02.00");
inline const KLVKey systemSetKey = keyOf("06.0E.2B.34.02.53.01.01.0D.01.03.01.14.02.01.00");
inline const KLVKey systemPackKey = keyOf("06.0E.2B.34.02.05.01.01.0D.01.03.01.04.01.01.00");
inline const KLVKey systemVariablePackKey = keyOf("06.0E.2B.34.02.44.01.01.0D.01.03.01.04.01.02.00");

// A muxer over a writer on a string.
struct MuxedContainer {
  std::ostringstream out;
  GenericKLVWriter writer{out};
  MXFGCMuxer muxer{&writer};

  MXFGCStructureHandler& structure() { return *muxer.getStructureHandler(); }
  MXFGCSystemHandler& system() { return *muxer.getSystemHandler(); }
  MXFGCEssenceHandler& essence() { return *muxer.getEssenceHandler(); }
  std::streamoff position() { return muxer.getLocator()->getPosition(); }
  ByteVector bytes() const {
    const std::string text = out.str();
    return ByteVector(text.begin(), text.end());
  }
};

// The octets from..to of a byte vector.
inline ByteVector slice(const ByteVector& bytes, std::size_t from, std::size_t to) {
  return ByteVector(bytes.begin() + static_cast<std::ptrdiff_t>(from), bytes.begin() + static_cast<std::ptrdiff_t>(to));
}

// A fill item's key and four-octet length.
inline ByteVector fillHeader(std::uint32_t length) {
  ByteVector header = bytesOf("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00 83");
  for (int shift = 16; shift >= 0; shift -= 8) header.push_back(static_cast<std::uint8_t>(length >> shift));
  return header;
}

}  // namespace zelta_test::gcmux

#endif
