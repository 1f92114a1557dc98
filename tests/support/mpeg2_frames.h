// MPEG-2 frames built by hand from their headers, as much of them as an
// indexer reads.
#ifndef ZELTA_TESTS_SUPPORT_MPEG2_FRAMES_H
#define ZELTA_TESTS_SUPPORT_MPEG2_FRAMES_H

#include <cstdint>

#include "klv.h"

namespace zelta_test {

ByteVector startCode(std::uint8_t code);
void append(ByteVector& to, const ByteVector& more);

// 1920x1080, aspect 16:9, 25 Hz, no matrices.
ByteVector sequenceHeader();
// Time code 10:00:00:00 in 25 bits, then closed_gop and broken_link.
ByteVector gopHeader(bool closed, bool brokenLink);
// temporal_reference in 10 bits, picture_coding_type in 3, vbv_delay.
ByteVector pictureHeader(std::uint16_t temporalReference, std::uint8_t type);
// A slice of arbitrary octets, with a zero run and start-code-like octets
// behind the picture header that must not be looked at.
ByteVector sliceData();

enum Gop { noGop, openGop, closedGop };

ByteVector frame(bool withSequenceHeader, Gop gop, std::uint16_t temporalReference, std::uint8_t type);

}  // namespace zelta_test

#endif
