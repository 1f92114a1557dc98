#include <algorithm>
#include <array>
#include <cstdint>
#include <memory>
#include <vector>

#include "metadata.h"

namespace {

// What differs between the 525-line and the 625-line form of a picture.
struct Raster {
  std::uint16_t lines;
  MXFRational sampleRate;
  std::uint32_t storedHeight;  // also the sampled height
  std::uint32_t displayHeight;
  std::int32_t displayYOffset;
  std::array<std::int32_t, 2> videoLineMap;
  KLVKey captureGamma;
};

constexpr KLVKey captureGamma625{std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x04,
                                                              0x01, 0x01, 0x01, 0x01, 0x01, 0x00, 0x00}};
constexpr KLVKey captureGamma525{std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x04,
                                                              0x01, 0x01, 0x01, 0x01, 0x02, 0x00, 0x00}};

const Raster dvRaster525{525, {30000, 1001}, 240, 240, 0, {23, 285}, captureGamma525};
const Raster dvRaster625{625, {25, 1}, 288, 288, 0, {23, 335}, captureGamma625};
const Raster d10Raster525{525, {30000, 1001}, 256, 243, 13, {7, 270}, captureGamma525};
const Raster d10Raster625{625, {25, 1}, 304, 288, 16, {7, 320}, captureGamma625};

constexpr std::uint8_t dvColourSiting525 = 0;
constexpr std::uint8_t dvColourSiting625 = 5;
// Files of a Preface version below this one write "unknown" for 625 lines.
constexpr std::uint16_t dvColourSitingVersion = 0x0103;
constexpr std::uint8_t unknownColourSiting = 255;

constexpr std::size_t kindOctet = 14;
constexpr std::size_t wrappingOctet = 15;
constexpr std::size_t versionOctet = 7;

// 06 0E 2B 34 04 01 01 xx 0D 01 03 01 02 02 kind wrapping
constexpr KLVKeyPattern dvContainerPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x00, 0x0D, 0x01, 0x03, 0x01, 0x02, 0x02, 0x00, 0x00});
constexpr std::array<std::uint8_t, 2> dvWrappings{0x01, 0x02};

// The DV kinds that a descriptor can be made for.
struct DVKind {
  std::uint8_t kind;
  const Raster* raster;
  std::array<std::uint8_t, 3> codingTail;  // octets 13 to 15 of the coding label
  std::uint32_t horizontalSubsampling;
  std::uint32_t verticalSubsampling;
};

const std::array<DVKind, 8> dvKinds{{
    {0x01, &dvRaster525, {0x01, 0x01, 0x00}, 4, 1},
    {0x02, &dvRaster625, {0x01, 0x02, 0x00}, 2, 2},
    {0x03, &dvRaster525, {0x01, 0x03, 0x00}, 4, 1},
    {0x04, &dvRaster625, {0x01, 0x04, 0x00}, 2, 2},
    {0x40, &dvRaster525, {0x02, 0x01, 0x00}, 4, 1},
    {0x41, &dvRaster625, {0x02, 0x02, 0x00}, 4, 1},
    {0x50, &dvRaster525, {0x02, 0x03, 0x00}, 2, 1},
    {0x51, &dvRaster625, {0x02, 0x04, 0x00}, 2, 1},
}};

// 06 0E 2B 34 04 01 01 01 04 01 02 02 02, then the kind's tail.
constexpr std::array<std::uint8_t, 13> dvCodingPrefix{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01,
                                                      0x01, 0x04, 0x01, 0x02, 0x02, 0x02};

// 06 0E 2B 34 04 01 01 xx 0D 01 03 01 02 01 kind wrapping
constexpr KLVKeyPattern d10ContainerPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x00, 0x0D, 0x01, 0x03, 0x01, 0x02, 0x01, 0x00, 0x00});
constexpr std::array<std::uint8_t, 3> d10Wrappings{0x01, 0x02, 0x7F};

struct D10Kind {
  std::uint8_t kind;
  const Raster* raster;
  std::uint8_t codingOctet;  // octet 15 of the coding label
};

const std::array<D10Kind, 6> d10Kinds{{
    {0x01, &d10Raster625, 0x01},
    {0x02, &d10Raster525, 0x02},
    {0x03, &d10Raster625, 0x03},
    {0x04, &d10Raster525, 0x04},
    {0x05, &d10Raster625, 0x05},
    {0x06, &d10Raster525, 0x06},
}};

// 06 0E 2B 34 04 01 01 01 04 01 02 02 01 02 01, then the kind's octet.
constexpr std::array<std::uint8_t, 15> d10CodingPrefix{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01,
                                                       0x04, 0x01, 0x02, 0x02, 0x01, 0x02, 0x01};

template <std::size_t N>
bool contains(const std::array<std::uint8_t, N>& values, std::uint8_t value) {
  return std::find(values.begin(), values.end(), value) != values.end();
}

template <typename Kind, std::size_t N>
const Kind* findKind(const std::array<Kind, N>& kinds, std::uint8_t kind) {
  for (const Kind& row : kinds)
    if (row.kind == kind) return &row;
  return nullptr;
}

template <std::size_t N>
KLVKey codingLabel(const std::array<std::uint8_t, N>& prefix, const std::uint8_t* tail) {
  std::array<std::uint8_t, 16> octets{};
  std::copy(prefix.begin(), prefix.end(), octets.begin());
  std::copy(tail, tail + (16 - N), octets.begin() + N);
  return KLVKey(octets);
}

// The values that DV and D-10 pictures share, and those of the raster.
std::shared_ptr<CDCIPictureDescriptor> createInterlacedPicture(const KLVKey& essenceContainer, const Raster& raster) {
  const std::shared_ptr<CDCIPictureDescriptor> d = CDCIPictureDescriptor::create();
  d->setSampleRate(raster.sampleRate);
  d->setEssenceContainer(essenceContainer);
  d->setSignalStandard(1);
  d->setFrameLayout(1);
  d->setStoredWidth(720);
  d->setSampledWidth(720);
  d->setDisplayWidth(720);
  d->setStoredHeight(raster.storedHeight);
  d->setSampledHeight(raster.storedHeight);
  d->setDisplayHeight(raster.displayHeight);
  d->setStoredF2Offset(0);
  d->setSampledXOffset(0);
  d->setSampledYOffset(0);
  d->setDisplayXOffset(0);
  d->setDisplayYOffset(raster.displayYOffset);
  d->setDisplayF2Offset(0);
  d->setAspectRatio(MXFRational{4, 3});
  d->setVideoLineMap(std::vector<std::int32_t>(raster.videoLineMap.begin(), raster.videoLineMap.end()));
  d->setCaptureGamma(raster.captureGamma);
  d->setImageAlignmentOffset(0);
  d->setImageStartOffset(0);
  d->setImageEndOffset(0);
  d->setFieldDominance(1);
  d->setComponentDepth(8);
  d->setReversedByteOrder(false);
  d->setPaddingBits(0);
  d->setBlackReferenceLevel(16);
  d->setWhiteReferenceLevel(235);
  d->setColourRange(225);
  return d;
}

}  // namespace

std::shared_ptr<CDCIPictureDescriptor> createDVPictureDescriptor(const KLVKey& essenceContainer,
                                                                 std::uint16_t prefaceVersion) {
  check(dvContainerPattern.matches(essenceContainer) && essenceContainer[versionOctet] != 0 &&
            contains(dvWrappings, essenceContainer[wrappingOctet]),
        "valid DV essence container");
  const DVKind* kind = findKind(dvKinds, essenceContainer[kindOctet]);
  check(kind != nullptr, "supported DV essence container");
  const std::shared_ptr<CDCIPictureDescriptor> d = createInterlacedPicture(essenceContainer, *kind->raster);
  d->setPictureEssenceCoding(codingLabel(dvCodingPrefix, kind->codingTail.data()));
  d->setHorizontalSubsampling(kind->horizontalSubsampling);
  d->setVerticalSubsampling(kind->verticalSubsampling);
  if (kind->raster->lines == 525)
    d->setColourSiting(dvColourSiting525);
  else
    d->setColourSiting(prefaceVersion < dvColourSitingVersion ? unknownColourSiting : dvColourSiting625);
  return d;
}

std::shared_ptr<CDCIPictureDescriptor> createD10PictureDescriptor(const KLVKey& essenceContainer) {
  const D10Kind* kind = findKind(d10Kinds, essenceContainer[kindOctet]);
  check(d10ContainerPattern.matches(essenceContainer) && essenceContainer[versionOctet] != 0 && kind != nullptr &&
            contains(d10Wrappings, essenceContainer[wrappingOctet]),
        "valid D-10 essence container");
  const std::shared_ptr<CDCIPictureDescriptor> d = createInterlacedPicture(essenceContainer, *kind->raster);
  d->setPictureEssenceCoding(codingLabel(d10CodingPrefix, &kind->codingOctet));
  d->setHorizontalSubsampling(2);
  d->setVerticalSubsampling(1);
  d->setColourSiting(0);
  return d;
}
