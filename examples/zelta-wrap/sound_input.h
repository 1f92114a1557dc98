// zelta-wrap: WAV files read through libavformat and handed out as the
// samples of one edit unit per channel.
#ifndef ZELTA_WRAP_SOUND_INPUT_H
#define ZELTA_WRAP_SOUND_INPUT_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "media_input.h"

namespace zelta_wrap {

inline constexpr int soundSamplingRate = 48000;

// One WAV file of little-endian PCM at 48 kHz with the asked sample size;
// InputError for any other.
class SoundInput {
 public:
  SoundInput(const std::string& path, std::uint32_t quantizationBits);

  std::uint32_t getChannelCount() const { return channels_; }
  // The next count samples of each channel, each channel's as octets of
  // little-endian samples; silence once the file has ended.
  void read(std::uint32_t count, std::vector<std::vector<std::uint8_t>>& channels);

 private:
  // Reads packets until the pending octets hold the count or the file ends.
  void fill(std::size_t octets);

  MediaFile media_;
  std::uint32_t channels_;
  std::uint32_t bytesPerSample_;
  bool ended_ = false;
  // Interleaved octets read but not handed out, from pendingStart_ on.
  std::vector<std::uint8_t> pending_;
  std::size_t pendingStart_ = 0;
};

}  // namespace zelta_wrap

#endif
