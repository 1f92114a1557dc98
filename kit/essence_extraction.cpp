#include <algorithm>
#include <array>
#include <cstdint>
#include <vector>

#include "kit/essence_formats.h"
#include "kit/master_extraction.h"
#include "kit/model_labels.h"
#include "kit/picture_defaults.h"
#include "kit/picture_labels.h"

namespace zelta {

namespace {

constexpr std::array<std::uint8_t, 3> wideRangeComponents{217, 218, 216};

struct LevelDepth {
  std::uint32_t level;
  std::uint32_t depth;
};
// The highest code value of the narrow and the wide range at 12 and 10 bits.
constexpr std::array<LevelDepth, 4> depthsByLevel{{{3960, 12}, {3760, 12}, {1023, 10}, {940, 10}}};

// Three components of one depth and nothing more, or else the depth that
// the highest code value names.
std::uint32_t rgbaDepth(const RGBAPictureDescriptor& d) {
  const RGBALayout::Component* c = d.getPixelLayout().components.data();
  const bool exact = c[3].code == 0;
  if (c[0].depth != 0 && c[0].depth == c[1].depth && c[1].depth == c[2].depth && exact) return c[0].depth;
  if (!d.hasComponentMaxReferenceLevel()) return 0;
  for (const LevelDepth& row : depthsByLevel)
    if (row.level == d.getComponentMaxReferenceLevel()) return row.depth;
  return 0;
}

void extractComponents(const PictureDescriptor& picture, ZeltaDefaultMetadata& m) {
  if (auto cdci = dynamic_cast<const CDCIPictureDescriptor*>(&picture)) {
    m.componentDepth = cdci->getComponentDepth();
    m.subsampling.first = cdci->getHorizontalSubsampling();
    if (cdci->hasVerticalSubsampling()) m.subsampling.second = cdci->getVerticalSubsampling();
    m.rgb = false;
    m.wideRangeRGB = false;
    return;
  }
  const auto& rgba = dynamic_cast<const RGBAPictureDescriptor&>(picture);
  const RGBALayout::Component* c = rgba.getPixelLayout().components.data();
  const bool wide = std::any_of(c, c + 3, [](const RGBALayout::Component& x) {
    return std::find(wideRangeComponents.begin(), wideRangeComponents.end(), x.code) != wideRangeComponents.end();
  });
  m.wideRangeRGB = wide;
  m.rgb = !wide;
  m.componentDepth = rgbaDepth(rgba);
  m.subsampling = {1, 1};
}

// MPEG-2 values under either name, each only when present.
void extractMPEGValues(const MPEGVideoDescriptor& d, ZeltaDefaultMetadata& m) {
  if (d.hasBitRate()) m.bitRate = d.getBitRate();
  if (d.hasSingleSequence()) m.singleSequence = d.getSingleSequence();
  if (d.hasConstantBFrames()) m.constantBFrames = d.getConstantBFrames();
  if (d.hasLowDelay()) m.lowDelay = d.getLowDelay();
  if (d.hasClosedGOP()) m.closedGOP = d.getClosedGOP();
  if (d.hasIdenticalGOP()) m.identicalGOP = d.getIdenticalGOP();
  if (d.hasMaxGOP()) m.maxGOP = d.getMaxGOP();
  if (d.hasBPictureCount()) m.bPictureCount = d.getBPictureCount();
  if (d.hasProfileAndLevel()) m.profileAndLevel = d.getProfileAndLevel();
}

void extractMPEG4Values(const MPEG4VideoSubDescriptor& d, ZeltaDefaultMetadata& m) {
  if (d.hasBitRate()) m.bitRate = d.getBitRate();
  if (d.hasSingleSequence()) m.singleSequence = d.getSingleSequence();
  if (d.hasConstantBVOPs()) m.constantBFrames = d.getConstantBVOPs();
  if (d.hasLowDelay()) m.lowDelay = d.getLowDelay();
  if (d.hasClosedGOV()) m.closedGOP = d.getClosedGOV();
  if (d.hasIdenticalGOV()) m.identicalGOP = d.getIdenticalGOV();
  if (d.hasMaxGOV()) m.maxGOP = d.getMaxGOV();
  if (d.hasBVOPCount()) m.bPictureCount = d.getBVOPCount();
  if (d.hasProfileAndLevel()) m.profileAndLevel = d.getProfileAndLevel();
}

void extractAVCValues(const AVCVideoSubDescriptor& d, ZeltaDefaultMetadata& m) {
  if (d.hasMaximumBitRate()) m.bitRate = d.getMaximumBitRate();
  if (d.hasConstantBPicture()) m.constantBFrames = d.getConstantBPicture();
  if (d.hasClosedGOP()) m.closedGOP = d.getClosedGOP();
  if (d.hasIdenticalGOP()) m.identicalGOP = d.getIdenticalGOP();
  if (d.hasMaxGOP()) m.maxGOP = d.getMaxGOP();
  if (d.hasBPictureCount()) m.bPictureCount = d.getBPictureCount();
  m.profileAndLevel = static_cast<std::uint16_t>((d.getProfile() << 8) | d.getLevel());
  if (d.hasProfileConstraint()) m.profileConstraint = d.getProfileConstraint();
}

template <typename T>
const T* subDescriptorOf(const PictureDescriptor& picture) {
  for (std::size_t i = 0; i < picture.getGenericSubDescriptorCount(); ++i)
    if (auto found = dynamic_cast<const T*>(picture.getGenericSubDescriptorAt(i).get())) return found;
  return nullptr;
}

const KLVKey& pictureCoding(const PictureDescriptor& picture) {
  check(picture.hasPictureEssenceCoding(), "PictureDescriptor has pictureEssenceCoding");
  return picture.getPictureEssenceCoding();
}

void extractMPEG(const PictureDescriptor& picture, ZeltaDefaultMetadata& m) {
  m.simpleStudioProfile = isSimpleStudioCoding(pictureCoding(picture));
  auto mpeg = dynamic_cast<const MPEGVideoDescriptor*>(&picture);
  auto mpeg4 = subDescriptorOf<MPEG4VideoSubDescriptor>(picture);
  check(mpeg || mpeg4, "model has a MPEGVideoDescriptor or a MPEG4VideoSubDescriptor");
  if (mpeg) extractMPEGValues(*mpeg, m);
  if (mpeg4) extractMPEG4Values(*mpeg4, m);
}

// A plain MPEG descriptor of an AVC picture says the rest by its coding
// label; its level follows from the picture as a Simple Studio level does.
void extractAVC(const PictureDescriptor& picture, const MXFRational& editRate, ZeltaDefaultMetadata& m) {
  auto mpeg = dynamic_cast<const MPEGVideoDescriptor*>(&picture);
  auto avc = subDescriptorOf<AVCVideoSubDescriptor>(picture);
  check(mpeg || avc, "model has a MPEGVideoDescriptor or a AVCVideoSubDescriptor");
  if (mpeg) extractMPEGValues(*mpeg, m);
  if (avc) {
    extractAVCValues(*avc, m);
    return;
  }
  if (!picture.hasPictureEssenceCoding()) return;
  const std::optional<AVCCoding> coding = getAVCCoding(picture.getPictureEssenceCoding());
  if (!coding) return;
  m.profileConstraint = coding->profileConstraint;
  m.bitRate = coding->bitRateClass;
  const std::uint16_t level =
      getSimpleStudioLevel({m.displaySize, m.subsampling, m.progressive, editRate, m.bitRate, m.componentDepth});
  m.profileAndLevel = static_cast<std::uint16_t>((coding->profile << 8) | (level & 0xFF));
}

void extractFormatValues(const PictureDescriptor& picture, ZeltaEssenceFormat format, ZeltaDefaultMetadata& m) {
  switch (format) {
    case ZeltaEssenceFormat::D10:
      m.bitRate = getD10BitRate(picture.getEssenceContainer());
      break;
    case ZeltaEssenceFormat::DV:
      m.bitRate = getDVBitRate(picture.getEssenceContainer());
      break;
    case ZeltaEssenceFormat::Proxy:
      m.bitRate = proxyBitRate;
      check(picture.hasDarkProperty(proxyDecoderSpecificInfoKey), "PictureDescriptor has decoderSpecificInfo");
      break;
    case ZeltaEssenceFormat::Raw:
      m.profileAndLevel = getRawCode(pictureCoding(picture));
      break;
    case ZeltaEssenceFormat::MPEG:
      extractMPEG(picture, m);
      break;
    case ZeltaEssenceFormat::AVC:
      extractAVC(picture, m.editRate, m);
      break;
  }
  m.halfSize = isHalfSizeHeight(m.displaySize.second, m.progressive);
}

// One channel per AES3 descriptor, with its channel status or the default.
void extractAES3Sound(const SoundDescriptor& sound, ZeltaDefaultMetadata& m) {
  auto aes3 = dynamic_cast<const AES3AudioDescriptor*>(&sound);
  check(aes3 && aes3->getChannelCount() == 1, "AES3AudioDescriptor has 1 channel");
  m.audioSamplingRates.push_back(sound.getAudioSamplingRate());
  if (aes3->hasFixedChannelStatusData()) {
    const std::vector<AES3ChannelStatusData>& status = aes3->getFixedChannelStatusData();
    check(status.size() == aes3->getChannelCount(), "AES3AudioDescriptor has consistent fixedChannelStatusData");
    for (const AES3ChannelStatusData& channel : status) m.fixedChannelStatusData.push_back(channel.octets);
  } else {
    m.fixedChannelStatusData.push_back(ZeltaDefaultChannelStatus);
  }
}

void checkQuantizationBits(const SoundDescriptor& sound, bool first, ZeltaDefaultMetadata& m) {
  check(first || sound.getQuantizationBits() == m.quantizationBits, "SoundDescriptor has consistent quantizationBits");
  m.quantizationBits = sound.getQuantizationBits();
}

}  // namespace

void extractPicture(const PictureDescriptor& picture, ZeltaEssenceFormat format, ZeltaDefaultMetadata& m) {
  m.aspectRatio = picture.getAspectRatio();
  m.progressive = picture.getFrameLayout() == 0;
  m.displaySize.first = picture.hasDisplayWidth()   ? picture.getDisplayWidth()
                        : picture.hasSampledWidth() ? picture.getSampledWidth()
                                                    : picture.getStoredWidth();
  m.displaySize.second = picture.hasDisplayHeight()   ? picture.getDisplayHeight()
                         : picture.hasSampledHeight() ? picture.getSampledHeight()
                                                      : picture.getStoredHeight();
  const std::vector<std::int32_t>& lineMap = picture.getVideoLineMap();
  m.videoLineMap = {lineMap.size() > 0 ? lineMap[0] : 0, lineMap.size() > 1 ? lineMap[1] : 0};
  const bool components = dynamic_cast<const CDCIPictureDescriptor*>(&picture) != nullptr ||
                          dynamic_cast<const RGBAPictureDescriptor*>(&picture) != nullptr;
  check(components || format == ZeltaEssenceFormat::Raw, "model has appropriate PictureDescriptor");
  if (components) extractComponents(picture, m);
  extractFormatValues(picture, format, m);
}

void extractSound(const std::vector<const SoundDescriptor*>& sounds, ZeltaEssenceFormat format,
                  ZeltaDefaultMetadata& m) {
  bool first = true;
  for (const SoundDescriptor* sound : sounds) {
    switch (format) {
      case ZeltaEssenceFormat::D10:
        check(first, "SoundDescriptor not already found");
        m.audioChannelCount = sound->getChannelCount();
        m.quantizationBits = sound->getQuantizationBits();
        m.audioSamplingRates.assign(m.audioChannelCount, sound->getAudioSamplingRate());
        break;
      case ZeltaEssenceFormat::Proxy:
        check(sound->getChannelCount() == proxyChannelsPerTrack, "SoundDescriptor has 2 channels");
        m.audioChannelCount += proxyChannelsPerTrack;
        checkQuantizationBits(*sound, first, m);
        m.audioSamplingRates.insert(m.audioSamplingRates.end(), proxyChannelsPerTrack, sound->getAudioSamplingRate());
        break;
      default:
        extractAES3Sound(*sound, m);
        ++m.audioChannelCount;
        checkQuantizationBits(*sound, first, m);
        break;
    }
    first = false;
  }
}

}  // namespace zelta
