// The picture values that the builder derives when the master leaves them
// zero, and the fields that follow from a picture's size, depth and format.
#ifndef ZELTA_KIT_PICTURE_DEFAULTS_H
#define ZELTA_KIT_PICTURE_DEFAULTS_H

#include <cstdint>

#include "kit.h"
#include "klv.h"

namespace zelta {

// Width from the profile and level (68, 70: 1440; 130: 1920; else
// "recognized profileAndLevel"); 1080 lines a frame or 540 a field, halved
// for the half size.
ZeltaSize getDefaultDisplaySize(std::uint16_t profileAndLevel, bool progressive, bool halfSize);
// 0/0 for a size of no known ratio.
MXFRational getDefaultAspectRatio(const ZeltaSize& displaySize, bool progressive);
// By the profile and level, or for AVC by the profile in its high byte
// ("recognized profileAndLevel"); a Simple Studio picture by RGB or not.
ZeltaSize getDefaultSubsampling(ZeltaEssenceFormat format, std::uint16_t profileAndLevel, bool simpleStudio, bool rgb);
std::uint32_t getDefaultComponentDepth(ZeltaEssenceFormat format, bool simpleStudio, bool wideRangeRGB);

// What the Simple Studio level of a picture depends on.
struct StudioPicture {
  ZeltaSize displaySize;
  ZeltaSize subsampling;
  bool progressive = false;
  MXFRational editRate;
  std::uint32_t bitRate = 0;
  std::uint32_t componentDepth = 0;
};
// Whole frames a second by which the sample rate limit counts; 0 for a rate
// that has none.
std::uint32_t getFrameBase(const MXFRational& editRate);
// The lowest level that holds all four limits, 0 when none does.
std::uint16_t getSimpleStudioLevel(const StudioPicture& picture);

std::uint8_t getSignalStandard(const ZeltaSize& displaySize, std::uint32_t componentDepth, bool wideRangeRGB);
// "recognized displayHeight" for a height of no stored form.
std::uint32_t getStoredHeight(std::uint32_t displayHeight);
ZeltaLineMap getDefaultVideoLineMap(std::uint32_t displayHeight, bool progressive);
KLVKey getCaptureGamma(bool wideRangeRGB);
// Sited 4:2:0 chroma is known from version 0x0103 on.
std::uint8_t getColourSiting(const ZeltaSize& subsampling, std::uint16_t prefaceVersion);

struct ReferenceLevels {
  std::uint32_t black = 0;
  std::uint32_t white = 0;
  std::uint32_t colourRange = 0;
};
// Video range at the depth ("recognized componentDepth" below 8 bits).
ReferenceLevels getReferenceLevels(std::uint32_t componentDepth);

// Camera raw pictures.
inline constexpr ZeltaSize defaultRawDisplaySize{4096, 2160};
struct RawLayout {
  std::uint32_t storedWidth = 0;
  std::uint32_t storedHeight = 0;
  std::int32_t displayXOffset = 0;
  std::int32_t displayYOffset = 0;
};
// The stored frame around the displayed one, by the code's family
// ("recognized displayWidth", "recognized displayHeight"); code 0 is 801.
RawLayout getRawLayout(std::uint16_t code, const ZeltaSize& displaySize);
ZeltaLineMap getRawDefaultVideoLineMap(const ZeltaSize& displaySize);
MXFRational getRawDefaultAspectRatio(const ZeltaSize& displaySize);

// Proxy pictures.
inline constexpr std::uint32_t proxyStoredWidth = 352;
// 18 octets by rate and aspect ratio ("valid combination of editRate and
// aspectRatio").
ByteVector getProxyDecoderSpecificInfo(const MXFRational& editRate, const MXFRational& aspectRatio);
// "valid editRate" for a rate of no proxy raster.
std::uint32_t getProxyStoredHeight(const MXFRational& editRate);
// (0, 0) for a rate of no known line map.
ZeltaLineMap getProxyDefaultVideoLineMap(const MXFRational& editRate);

}  // namespace zelta

#endif
