// zelta-wrap: how many sound samples each edit unit carries, and the AES3
// element in which D-10 carries eight channels.
#ifndef ZELTA_WRAP_SOUND_LAYOUT_H
#define ZELTA_WRAP_SOUND_LAYOUT_H

#include <cstdint>
#include <vector>

#include "kit.h"

namespace zelta_wrap {

// Samples of 48 kHz sound in edit unit n: the running count rounded to the
// nearest sample, so that 30000/1001 gives 1602, 1601, 1602, 1601, 1602.
std::uint32_t getSampleCount(const MXFRational& editRate, std::uint64_t editUnit);

inline constexpr std::uint32_t d10SoundChannels = 8;
inline constexpr std::uint32_t d10SampleOctets = 4;
inline constexpr std::uint32_t d10ElementHeaderOctets = 4;

// The D-10 sound element of one edit unit: a header of the sequence number,
// the sample count (little endian) and a flag per channel in use, then per
// sample the eight channels as 32-bit little-endian words holding the
// channel number in bits 0 to 2 and the sample, as 24 bits, in bits 4 to
// 27. Channels beyond those given are silent; each given channel holds the
// count samples as little-endian octets of its sample size.
void codeD10Sound(const std::vector<std::vector<std::uint8_t>>& channels, std::uint32_t bytesPerSample,
                  std::uint32_t sampleCount, std::uint32_t sequenceNumber, std::uint32_t channelsInUse,
                  std::vector<std::uint8_t>& element);

}  // namespace zelta_wrap

#endif
