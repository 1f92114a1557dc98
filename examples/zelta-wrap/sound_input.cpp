#include "sound_input.h"

#include <algorithm>

#include "options.h"

namespace zelta_wrap {

namespace {

AVCodecID pcmCodec(std::uint32_t bits) { return bits == 16 ? AV_CODEC_ID_PCM_S16LE : AV_CODEC_ID_PCM_S24LE; }

}  // namespace

SoundInput::SoundInput(const std::string& path, std::uint32_t quantizationBits)
    : media_(path, AVMEDIA_TYPE_AUDIO),
      channels_(static_cast<std::uint32_t>(media_.getParameters().ch_layout.nb_channels)),
      bytesPerSample_(quantizationBits / 8) {
  const AVCodecParameters& p = media_.getParameters();
  if (p.codec_id != AV_CODEC_ID_PCM_S16LE && p.codec_id != AV_CODEC_ID_PCM_S24LE)
    throw InputError(path + " is not 16 or 24 bit PCM WAV");
  if (p.sample_rate != soundSamplingRate)
    throw InputError(path + " is sampled at " + std::to_string(p.sample_rate) + " Hz, not 48000 Hz");
  if (p.codec_id != pcmCodec(quantizationBits))
    throw InputError(path + " has " + std::to_string(p.bits_per_coded_sample) + " bit samples, not " +
                     std::to_string(quantizationBits));
  if (channels_ == 0) throw InputError(path + " has no channel");
}

void SoundInput::fill(std::size_t octets) {
  while (!ended_ && pending_.size() - pendingStart_ < octets) {
    if (!media_.readPacket()) {
      ended_ = true;
      break;
    }
    // Octets handed out are dropped before the buffer grows.
    pending_.erase(pending_.begin(), pending_.begin() + static_cast<std::ptrdiff_t>(pendingStart_));
    pendingStart_ = 0;
    const AVPacket& packet = media_.getPacket();
    pending_.insert(pending_.end(), packet.data, packet.data + packet.size);
  }
}

void SoundInput::read(std::uint32_t count, std::vector<std::vector<std::uint8_t>>& channels) {
  const std::size_t frameOctets = std::size_t{channels_} * bytesPerSample_;
  fill(frameOctets * count);
  const std::size_t available = std::min<std::size_t>(count, (pending_.size() - pendingStart_) / frameOctets);
  channels.resize(channels_);
  for (std::uint32_t c = 0; c < channels_; ++c) {
    std::vector<std::uint8_t>& channel = channels[c];
    channel.assign(std::size_t{count} * bytesPerSample_, 0);
    const std::uint8_t* from = pending_.data() + pendingStart_ + std::size_t{c} * bytesPerSample_;
    for (std::size_t s = 0; s < available; ++s, from += frameOctets)
      std::copy(from, from + bytesPerSample_, channel.data() + s * bytesPerSample_);
  }
  pendingStart_ += available * frameOctets;
}

}  // namespace zelta_wrap
