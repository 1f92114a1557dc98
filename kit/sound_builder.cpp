#include <cstdint>
#include <memory>
#include <vector>

#include "kit/essence_formats.h"
#include "kit/model_builder.h"
#include "kit/model_labels.h"

namespace zelta {

namespace {

constexpr std::uint32_t d10ChannelCounts[] = {4, 8};

// The older model gives sound the edit rate, the newer its sampling rate.
template <typename Descriptor>
std::shared_ptr<Descriptor> soundDescriptor(const ModelBuild& build, std::uint32_t trackID, const MXFRational& rate) {
  std::shared_ptr<Descriptor> sound = build.make<Descriptor>();
  sound->setLinkedTrackID(trackID);
  sound->setSampleRate(build.isNewerModel() ? rate : build.editRate);
  sound->setEssenceContainer(getSoundContainer(build.format));
  sound->setAudioSamplingRate(rate);
  sound->setLocked(true);
  return sound;
}

std::shared_ptr<FileDescriptor> d10Sound(const ModelBuild& build, std::uint32_t trackID) {
  const std::uint32_t channels = build.master.getAudioChannelCount();
  check(channels == d10ChannelCounts[0] || channels == d10ChannelCounts[1], "valid audioChannels count");
  std::shared_ptr<SoundDescriptor> sound = soundDescriptor<SoundDescriptor>(
      build, trackID, getSoundRate(build.format, build.master.getAudioSamplingRate(0)));
  sound->setAudioReferenceLevel(0);
  sound->setChannelCount(channels);
  sound->setQuantizationBits(build.master.getQuantizationBits());
  return sound;
}

// A stereo pair of the proxy's eight channels.
std::shared_ptr<FileDescriptor> proxySound(const ModelBuild& build, std::uint32_t index, std::uint32_t trackID) {
  std::shared_ptr<SoundDescriptor> sound = soundDescriptor<SoundDescriptor>(
      build, trackID, getSoundRate(build.format, build.master.getAudioSamplingRate(index * proxyChannelsPerTrack)));
  sound->setChannelCount(proxyChannelsPerTrack);
  sound->setQuantizationBits(proxyQuantizationBits);
  sound->setSoundEssenceCompression(proxySoundCompression);
  return sound;
}

// One channel of AES3 sound.
std::shared_ptr<FileDescriptor> aes3Sound(const ModelBuild& build, std::uint32_t channel, std::uint32_t trackID) {
  const MXFRational rate = getSoundRate(build.format, build.master.getAudioSamplingRate(channel));
  std::shared_ptr<AES3AudioDescriptor> sound = soundDescriptor<AES3AudioDescriptor>(build, trackID, rate);
  sound->setAudioReferenceLevel(0);
  sound->setChannelCount(1);
  const std::uint32_t bits = build.master.getQuantizationBits();
  sound->setQuantizationBits(bits);
  if (build.format == ZeltaEssenceFormat::AVC) sound->setSoundEssenceCompression(avcSoundCompression);
  const auto blockAlign = static_cast<std::uint16_t>((bits + 7) / 8);
  sound->setBlockAlign(blockAlign);
  sound->setAverageBytesPerSecond(
      static_cast<std::uint32_t>(std::int64_t{blockAlign} * rate.numerator / rate.denominator));
  sound->setChannelStatusDataMode(ByteVector{1});
  AES3ChannelStatusData status;
  status.octets = build.master.getFixedChannelStatusData(channel);
  sound->setFixedChannelStatusData({status});
  return sound;
}

}  // namespace

std::vector<std::shared_ptr<FileDescriptor>> buildSoundDescriptors(const ModelBuild& build, std::uint32_t trackCount,
                                                                   std::uint32_t firstTrackID) {
  std::vector<std::shared_ptr<FileDescriptor>> sounds;
  for (std::uint32_t i = 0; i < trackCount; ++i) {
    const std::uint32_t trackID = firstTrackID + i;
    switch (build.format) {
      case ZeltaEssenceFormat::D10:
        sounds.push_back(d10Sound(build, trackID));
        break;
      case ZeltaEssenceFormat::Proxy:
        sounds.push_back(proxySound(build, i, trackID));
        break;
      default:
        sounds.push_back(aes3Sound(build, i, trackID));
        break;
    }
  }
  return sounds;
}

std::shared_ptr<FileDescriptor> buildDataDescriptor(const ModelBuild& build, std::uint32_t trackID) {
  std::shared_ptr<ANCDataDescriptor> data = build.make<ANCDataDescriptor>();
  data->setLinkedTrackID(trackID);
  data->setSampleRate(build.editRate);
  data->setEssenceContainer(ancillaryDataContainer);
  return data;
}

}  // namespace zelta
