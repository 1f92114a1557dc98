#include "kit/picture_defaults.h"

#include <algorithm>
#include <array>
#include <cstdint>

#include "kit/essence_formats.h"
#include "kit/labels.h"
#include "kit/picture_labels.h"

namespace zelta {

namespace {

constexpr MXFRational sixteenByNine{16, 9};

struct SizedValue {
  std::uint32_t width;
  std::uint32_t height;
  MXFRational ratio;
};

const std::array<SizedValue, 7> frameRatios{{
    {1440, 1080, sixteenByNine},
    {1440, 540, sixteenByNine},
    {1280, 720, sixteenByNine},
    {1920, 1080, sixteenByNine},
    {1920, 540, sixteenByNine},
    {2048, 1080, {256, 135}},
    {2048, 1556, {512, 389}},
}};
const std::array<SizedValue, 2> fieldRatios{{
    {1440, 540, sixteenByNine},
    {1920, 540, sixteenByNine},
}};

template <std::size_t N>
MXFRational ratioOf(const std::array<SizedValue, N>& table, const ZeltaSize& size) {
  const auto row = std::find_if(table.begin(), table.end(),
                                [&](const SizedValue& r) { return r.width == size.first && r.height == size.second; });
  return row == table.end() ? MXFRational{0, 0} : row->ratio;
}

constexpr ZeltaSize fullChroma{1, 1};
constexpr ZeltaSize halfChroma{2, 1};
constexpr ZeltaSize quarterChroma{2, 2};

// A Simple Studio level and its limits: samples a picture, samples a
// second, bits a second, and the depth that it stays below.
struct StudioLevel {
  std::uint64_t samples;
  std::uint64_t sampleRate;
  std::uint64_t bitRate;
  std::uint32_t depthBelow;
  std::uint16_t level;
};
const std::array<StudioLevel, 5> studioLevels{{
    {0x400000, 0x7800000, 600000000, 11, 226},
    {0x600000, 0xB400000, 900000000, 13, 227},
    {0xC00000, 0x16800000, 1800000000, 13, 228},
    {26542080, 0x2F760000, 1800000000, 13, 235},
    {0x32A0000, 0x5EEC0000, 3600000000, 13, 236},
}};

struct FrameBase {
  MXFRational rate;
  std::uint32_t base;
};
const std::array<FrameBase, 9> frameBases{{
    {{24000, 1001}, 24},
    {{24, 1}, 24},
    {{25, 1}, 25},
    {{30000, 1001}, 30},
    {{30, 1}, 30},
    {{48000, 1001}, 30},
    {{50, 1}, 50},
    {{60000, 1001}, 60},
    {{60, 1}, 60},
}};

constexpr std::uint8_t unknownColourSiting = 255;
constexpr std::uint8_t quarterChromaSiting = 6;
constexpr std::uint16_t sitedVersion = 0x0103;

// Raw codes are families by their hundreds in hexadecimal.
constexpr std::uint16_t rawFamilyMask = 0xF00;
constexpr std::uint16_t rawFamily300 = 0x300;
constexpr std::uint16_t rawFamily400 = 0x400;

struct StoredSize {
  std::uint16_t family;
  std::uint32_t display;
  std::uint32_t stored;
};
const std::array<StoredSize, 4> rawStoredWidths{{
    {rawFamily400, 2048, 2064},
    {rawFamily400, 4096, 4128},
    {rawFamily300, 3840, 4160},
    {rawFamily300, 4096, 4160},
}};
const std::array<StoredSize, 3> rawStoredHeights{{
    {rawFamily400, 1080, 1096},
    {rawFamily400, 2160, 2192},
    {rawFamily300, 2160, 2204},
}};

template <std::size_t N>
std::uint32_t rawStored(const std::array<StoredSize, N>& sizes, std::uint16_t family, std::uint32_t display,
                        const char* text) {
  const auto row = std::find_if(sizes.begin(), sizes.end(),
                                [&](const StoredSize& r) { return r.family == family && r.display == display; });
  check(row != sizes.end(), text);
  return row->stored;
}

bool isUHD(const ZeltaSize& size) { return size == ZeltaSize(3840, 2160); }
bool isDCI4K(const ZeltaSize& size) { return size == defaultRawDisplaySize; }

// Octets 8 to 15 of the proxy's decoder specific info.
struct ProxyInfo {
  MXFRational rate;
  MXFRational aspectRatio;
  std::array<std::uint8_t, 8> octets;
};
const std::array<ProxyInfo, 5> proxyInfos{{
    {{24000, 1001}, {16, 9}, {0x05, 0x14, 0x57, 0x70, 0x28, 0x58, 0x20, 0xF0}},
    {{30000, 1001}, {4, 3}, {0x05, 0x0C, 0x5D, 0x4C, 0x28, 0x58, 0x20, 0xF0}},
    {{30000, 1001}, {16, 9}, {0x05, 0x14, 0x5D, 0x4C, 0x28, 0x58, 0x20, 0xF0}},
    {{25, 1}, {4, 3}, {0x05, 0x08, 0x40, 0x06, 0x68, 0x58, 0x21, 0x20}},
    {{25, 1}, {16, 9}, {0x05, 0x10, 0x40, 0x06, 0x68, 0x58, 0x21, 0x20}},
}};
constexpr std::array<std::uint8_t, 8> proxyInfoHead{0x00, 0x00, 0x01, 0x04, 0x00, 0x00, 0x01, 0x20};
constexpr std::array<std::uint8_t, 2> proxyInfoTail{0xA3, 0x1F};

constexpr MXFRational proxy525Rate{30000, 1001};
constexpr MXFRational proxy625Rate{25, 1};
constexpr MXFRational proxyFilmRate{24000, 1001};

}  // namespace

ZeltaSize getDefaultDisplaySize(std::uint16_t profileAndLevel, bool progressive, bool halfSize) {
  std::uint32_t width = 0;
  if (profileAndLevel == 68 || profileAndLevel == 70) width = 1440;
  if (profileAndLevel == 130) width = 1920;
  check(width != 0, "recognized profileAndLevel");
  const std::uint32_t height = progressive ? 1080 : 540;
  return {width, halfSize ? height / 2 : height};
}

MXFRational getDefaultAspectRatio(const ZeltaSize& displaySize, bool progressive) {
  return progressive ? ratioOf(frameRatios, displaySize) : ratioOf(fieldRatios, displaySize);
}

ZeltaSize getDefaultSubsampling(ZeltaEssenceFormat format, std::uint16_t profileAndLevel, bool simpleStudio, bool rgb) {
  if (format == ZeltaEssenceFormat::AVC) {
    const std::uint8_t profile = static_cast<std::uint8_t>(profileAndLevel >> 8);
    if (profile == 44 || profile == 244) return fullChroma;
    const std::array<std::uint8_t, 6> halfChromaProfiles{66, 77, 88, 100, 110, 122};
    check(std::find(halfChromaProfiles.begin(), halfChromaProfiles.end(), profile) != halfChromaProfiles.end(),
          "recognized profileAndLevel");
    return halfChroma;
  }
  if (simpleStudio) return rgb ? fullChroma : halfChroma;
  if (profileAndLevel == 68 || profileAndLevel == 70) return quarterChroma;
  check(profileAndLevel == 130 || profileAndLevel == 133, "recognized profileAndLevel");
  return halfChroma;
}

std::uint32_t getDefaultComponentDepth(ZeltaEssenceFormat format, bool simpleStudio, bool wideRangeRGB) {
  if (wideRangeRGB) return 12;
  if (simpleStudio || format == ZeltaEssenceFormat::AVC) return 10;
  return 8;
}

std::uint32_t getFrameBase(const MXFRational& editRate) {
  const auto row = std::find_if(frameBases.begin(), frameBases.end(),
                                [&](const FrameBase& r) { return isSameRate(r.rate, editRate); });
  return row == frameBases.end() ? 0 : row->base;
}

std::uint16_t getSimpleStudioLevel(const StudioPicture& picture) {
  std::uint64_t samples = static_cast<std::uint64_t>(picture.displaySize.first) * picture.displaySize.second;
  if (picture.subsampling == fullChroma)
    samples *= 3;
  else if (picture.subsampling == halfChroma)
    samples *= 2;
  else
    samples = 0;
  const std::uint64_t sampleRate = samples * (picture.progressive ? 1 : 2) * getFrameBase(picture.editRate);
  const auto level = std::find_if(studioLevels.begin(), studioLevels.end(), [&](const StudioLevel& l) {
    return samples <= l.samples && sampleRate <= l.sampleRate && picture.bitRate <= l.bitRate &&
           picture.componentDepth < l.depthBelow;
  });
  return level == studioLevels.end() ? 0 : level->level;
}

std::uint8_t getSignalStandard(const ZeltaSize& displaySize, std::uint32_t componentDepth, bool wideRangeRGB) {
  if (wideRangeRGB && componentDepth == 12) return 7;
  if (displaySize.second == 540 || displaySize.second == 1080) return displaySize.first == 2048 ? 0 : 4;
  if (displaySize.second == 720) return 5;
  return 0;
}

std::uint32_t getStoredHeight(std::uint32_t displayHeight) {
  switch (displayHeight) {
    case 540:
      return 544;
    case 1080:
      return 1088;
    case 720:
    case 2160:
      return displayHeight;
    case 1556:
      return 1568;
  }
  check(false, "recognized displayHeight");
  return 0;
}

ZeltaLineMap getDefaultVideoLineMap(std::uint32_t displayHeight, bool progressive) {
  if (displayHeight == 1556) return {32, 0};
  if (displayHeight == 720) return {26, 0};
  return progressive ? ZeltaLineMap(42, 0) : ZeltaLineMap(21, 584);
}

KLVKey getCaptureGamma(bool wideRangeRGB) {
  return wideRangeRGB ? registryLabel(0x08, {0x04, 0x01, 0x01, 0x01, 0x01, 0x07, 0x00, 0x00})
                      : registryLabel(0x01, {0x04, 0x01, 0x01, 0x01, 0x01, 0x02, 0x00, 0x00});
}

std::uint8_t getColourSiting(const ZeltaSize& subsampling, std::uint16_t prefaceVersion) {
  if (subsampling == quarterChroma) return prefaceVersion >= sitedVersion ? quarterChromaSiting : unknownColourSiting;
  if (subsampling == halfChroma || subsampling == fullChroma) return 0;
  return unknownColourSiting;
}

ReferenceLevels getReferenceLevels(std::uint32_t componentDepth) {
  check(componentDepth >= 8, "recognized componentDepth");
  const std::uint32_t shift = componentDepth - 8;
  ReferenceLevels levels;
  levels.black = 16u << shift;
  levels.white = 235u << shift;
  levels.colourRange = (224u << shift) + 1;
  return levels;
}

RawLayout getRawLayout(std::uint16_t code, const ZeltaSize& displaySize) {
  const std::uint16_t family = (code == 0 ? defaultRawCode : code) & rawFamilyMask;
  RawLayout layout;
  layout.storedWidth = rawStored(rawStoredWidths, family, displaySize.first, "recognized displayWidth");
  layout.storedHeight = rawStored(rawStoredHeights, family, displaySize.second, "recognized displayHeight");
  layout.displayXOffset = static_cast<std::int32_t>((layout.storedWidth - displaySize.first) / 2);
  layout.displayYOffset = static_cast<std::int32_t>((layout.storedHeight - displaySize.second) / 2);
  return layout;
}

ZeltaLineMap getRawDefaultVideoLineMap(const ZeltaSize& displaySize) {
  return isDCI4K(displaySize) || isUHD(displaySize) ? ZeltaLineMap(42, 0) : ZeltaLineMap(0, 0);
}

MXFRational getRawDefaultAspectRatio(const ZeltaSize& displaySize) {
  if (isDCI4K(displaySize)) return {256, 135};
  if (isUHD(displaySize)) return sixteenByNine;
  return {0, 0};
}

ByteVector getProxyDecoderSpecificInfo(const MXFRational& editRate, const MXFRational& aspectRatio) {
  const auto row = std::find_if(proxyInfos.begin(), proxyInfos.end(), [&](const ProxyInfo& r) {
    return isSameRate(r.rate, editRate) && isSameRate(r.aspectRatio, aspectRatio);
  });
  check(row != proxyInfos.end(), "valid combination of editRate and aspectRatio");
  ByteVector info(proxyInfoHead.begin(), proxyInfoHead.end());
  info.insert(info.end(), row->octets.begin(), row->octets.end());
  info.insert(info.end(), proxyInfoTail.begin(), proxyInfoTail.end());
  return info;
}

std::uint32_t getProxyStoredHeight(const MXFRational& editRate) {
  if (isSameRate(editRate, proxyFilmRate) || isSameRate(editRate, proxy525Rate)) return 240;
  check(isSameRate(editRate, proxy625Rate), "valid editRate");
  return 288;
}

ZeltaLineMap getProxyDefaultVideoLineMap(const MXFRational& editRate) {
  if (isSameRate(editRate, proxy525Rate)) return {23, 286};
  if (isSameRate(editRate, proxy625Rate)) return {23, 336};
  return {0, 0};
}

}  // namespace zelta
