#include "sound_layout.h"

#include <algorithm>

#include "sound_input.h"

namespace zelta_wrap {

namespace {

std::uint64_t samplesBefore(const MXFRational& editRate, std::uint64_t editUnit) {
  const auto numerator = static_cast<std::uint64_t>(editRate.numerator);
  const auto denominator = static_cast<std::uint64_t>(editRate.denominator);
  return (editUnit * soundSamplingRate * denominator + numerator / 2) / numerator;
}

// A little-endian sample of 2 or 3 octets as 24 bits.
std::uint32_t sample24(const std::uint8_t* at, std::uint32_t bytesPerSample) {
  std::uint32_t value = 0;
  for (std::uint32_t i = 0; i < bytesPerSample; ++i) value |= std::uint32_t{at[i]} << (8 * i);
  return value << (8 * (3 - bytesPerSample));
}

}  // namespace

std::uint32_t getSampleCount(const MXFRational& editRate, std::uint64_t editUnit) {
  return static_cast<std::uint32_t>(samplesBefore(editRate, editUnit + 1) - samplesBefore(editRate, editUnit));
}

void codeD10Sound(const std::vector<std::vector<std::uint8_t>>& channels, std::uint32_t bytesPerSample,
                  std::uint32_t sampleCount, std::uint32_t sequenceNumber, std::uint32_t channelsInUse,
                  std::vector<std::uint8_t>& element) {
  element.assign(d10ElementHeaderOctets + std::size_t{sampleCount} * d10SoundChannels * d10SampleOctets, 0);
  element[0] = static_cast<std::uint8_t>(sequenceNumber & 0x07);
  element[1] = static_cast<std::uint8_t>(sampleCount & 0xFF);
  element[2] = static_cast<std::uint8_t>(sampleCount >> 8);
  element[3] = static_cast<std::uint8_t>((1u << std::min(channelsInUse, d10SoundChannels)) - 1);
  std::uint8_t* word = element.data() + d10ElementHeaderOctets;
  for (std::uint32_t s = 0; s < sampleCount; ++s) {
    for (std::uint32_t c = 0; c < d10SoundChannels; ++c, word += d10SampleOctets) {
      const std::uint32_t sample =
          c < channels.size() ? sample24(channels[c].data() + std::size_t{s} * bytesPerSample, bytesPerSample) : 0;
      const std::uint32_t value = c | (sample << 4);
      for (std::uint32_t i = 0; i < d10SampleOctets; ++i) word[i] = static_cast<std::uint8_t>(value >> (8 * i));
    }
  }
}

}  // namespace zelta_wrap
