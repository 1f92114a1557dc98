// The file forms of the codec descriptors' own value types.
#ifndef ZELTA_METADATA_CODEC_VALUES_H
#define ZELTA_METADATA_CODEC_VALUES_H

#include <cstdint>
#include <istream>
#include <ostream>

#include "metadata.h"

namespace util {
// A batch of channel status records has item size 24.
template <>
struct external_size<AES3ChannelStatusData> {
  static constexpr std::uint32_t value = 24;
};
}  // namespace util

// The 24 octets as they stand.
void internalize(std::istream& in, AES3ChannelStatusData& v);
void externalize(std::ostream& out, const AES3ChannelStatusData& v);

// A uint32 count, then per set a length octet and the octets. Reading
// stops after the counted sets; a set of 256 octets or more can't be
// written ("valid parameter set").
void internalize(std::istream& in, AVCParameterSetArray& v);
void externalize(std::ostream& out, const AVCParameterSetArray& v);

#endif
