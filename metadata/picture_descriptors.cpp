#include <memory>

#include "metadata.h"
#include "metadata/descriptor_tables.h"
#include "metadata/rgba_layout.h"

using zelta::presentValue;

PictureDescriptor::PictureDescriptor() = default;
PictureDescriptor::~PictureDescriptor() = default;
std::shared_ptr<PictureDescriptor> PictureDescriptor::create() { return std::make_shared<PictureDescriptor>(); }

const std::uint8_t& PictureDescriptor::getSignalStandard() const {
  return presentValue(signalStandard_, "PictureDescriptor.signalStandard is present");
}

const std::int32_t& PictureDescriptor::getStoredF2Offset() const {
  return presentValue(storedF2Offset_, "PictureDescriptor.storedF2Offset is present");
}

const std::uint32_t& PictureDescriptor::getSampledWidth() const {
  return presentValue(sampledWidth_, "PictureDescriptor.sampledWidth is present");
}

const std::uint32_t& PictureDescriptor::getSampledHeight() const {
  return presentValue(sampledHeight_, "PictureDescriptor.sampledHeight is present");
}

const std::int32_t& PictureDescriptor::getSampledXOffset() const {
  return presentValue(sampledXOffset_, "PictureDescriptor.sampledXOffset is present");
}

const std::int32_t& PictureDescriptor::getSampledYOffset() const {
  return presentValue(sampledYOffset_, "PictureDescriptor.sampledYOffset is present");
}

const std::uint32_t& PictureDescriptor::getDisplayHeight() const {
  return presentValue(displayHeight_, "PictureDescriptor.displayHeight is present");
}

const std::uint32_t& PictureDescriptor::getDisplayWidth() const {
  return presentValue(displayWidth_, "PictureDescriptor.displayWidth is present");
}

const std::int32_t& PictureDescriptor::getDisplayXOffset() const {
  return presentValue(displayXOffset_, "PictureDescriptor.displayXOffset is present");
}

const std::int32_t& PictureDescriptor::getDisplayYOffset() const {
  return presentValue(displayYOffset_, "PictureDescriptor.displayYOffset is present");
}

const std::int32_t& PictureDescriptor::getDisplayF2Offset() const {
  return presentValue(displayF2Offset_, "PictureDescriptor.displayF2Offset is present");
}

const std::uint8_t& PictureDescriptor::getActiveFormatDescriptor() const {
  return presentValue(activeFormatDescriptor_, "PictureDescriptor.activeFormatDescriptor is present");
}

const std::uint8_t& PictureDescriptor::getAlphaTransparency() const {
  return presentValue(alphaTransparency_, "PictureDescriptor.alphaTransparency is present");
}

const KLVKey& PictureDescriptor::getCaptureGamma() const {
  return presentValue(captureGamma_, "PictureDescriptor.captureGamma is present");
}

const std::uint32_t& PictureDescriptor::getImageAlignmentOffset() const {
  return presentValue(imageAlignmentOffset_, "PictureDescriptor.imageAlignmentOffset is present");
}

const std::uint32_t& PictureDescriptor::getImageStartOffset() const {
  return presentValue(imageStartOffset_, "PictureDescriptor.imageStartOffset is present");
}

const std::uint32_t& PictureDescriptor::getImageEndOffset() const {
  return presentValue(imageEndOffset_, "PictureDescriptor.imageEndOffset is present");
}

const std::uint8_t& PictureDescriptor::getFieldDominance() const {
  return presentValue(fieldDominance_, "PictureDescriptor.fieldDominance is present");
}

const KLVKey& PictureDescriptor::getPictureEssenceCoding() const {
  return presentValue(pictureEssenceCoding_, "PictureDescriptor.pictureEssenceCoding is present");
}

const KLVKey& PictureDescriptor::getCodingEquations() const {
  return presentValue(codingEquations_, "PictureDescriptor.codingEquations is present");
}

const KLVKey& PictureDescriptor::getColourPrimaries() const {
  return presentValue(colourPrimaries_, "PictureDescriptor.colourPrimaries is present");
}

CDCIPictureDescriptor::CDCIPictureDescriptor() = default;
CDCIPictureDescriptor::~CDCIPictureDescriptor() = default;
std::shared_ptr<CDCIPictureDescriptor> CDCIPictureDescriptor::create() {
  return std::make_shared<CDCIPictureDescriptor>();
}

const std::uint32_t& CDCIPictureDescriptor::getVerticalSubsampling() const {
  return presentValue(verticalSubsampling_, "CDCIPictureDescriptor.verticalSubsampling is present");
}

const std::uint8_t& CDCIPictureDescriptor::getColourSiting() const {
  return presentValue(colourSiting_, "CDCIPictureDescriptor.colourSiting is present");
}

const bool& CDCIPictureDescriptor::getReversedByteOrder() const {
  return presentValue(reversedByteOrder_, "CDCIPictureDescriptor.reversedByteOrder is present");
}

const std::int16_t& CDCIPictureDescriptor::getPaddingBits() const {
  return presentValue(paddingBits_, "CDCIPictureDescriptor.paddingBits is present");
}

const std::uint32_t& CDCIPictureDescriptor::getAlphaSamplingDepth() const {
  return presentValue(alphaSamplingDepth_, "CDCIPictureDescriptor.alphaSamplingDepth is present");
}

const std::uint32_t& CDCIPictureDescriptor::getBlackReferenceLevel() const {
  return presentValue(blackReferenceLevel_, "CDCIPictureDescriptor.blackReferenceLevel is present");
}

const std::uint32_t& CDCIPictureDescriptor::getWhiteReferenceLevel() const {
  return presentValue(whiteReferenceLevel_, "CDCIPictureDescriptor.whiteReferenceLevel is present");
}

const std::uint32_t& CDCIPictureDescriptor::getColourRange() const {
  return presentValue(colourRange_, "CDCIPictureDescriptor.colourRange is present");
}

RGBAPictureDescriptor::RGBAPictureDescriptor() = default;
RGBAPictureDescriptor::~RGBAPictureDescriptor() = default;
std::shared_ptr<RGBAPictureDescriptor> RGBAPictureDescriptor::create() {
  return std::make_shared<RGBAPictureDescriptor>();
}

const std::uint32_t& RGBAPictureDescriptor::getComponentMaxReferenceLevel() const {
  return presentValue(componentMaxReferenceLevel_, "RGBAPictureDescriptor.componentMaxReferenceLevel is present");
}

const std::uint32_t& RGBAPictureDescriptor::getComponentMinReferenceLevel() const {
  return presentValue(componentMinReferenceLevel_, "RGBAPictureDescriptor.componentMinReferenceLevel is present");
}

const std::uint32_t& RGBAPictureDescriptor::getAlphaMaxReferenceLevel() const {
  return presentValue(alphaMaxReferenceLevel_, "RGBAPictureDescriptor.alphaMaxReferenceLevel is present");
}

const std::uint32_t& RGBAPictureDescriptor::getAlphaMinReferenceLevel() const {
  return presentValue(alphaMinReferenceLevel_, "RGBAPictureDescriptor.alphaMinReferenceLevel is present");
}

const std::uint8_t& RGBAPictureDescriptor::getScanningDirection() const {
  return presentValue(scanningDirection_, "RGBAPictureDescriptor.scanningDirection is present");
}

const ByteVector& RGBAPictureDescriptor::getPalette() const {
  return presentValue(palette_, "RGBAPictureDescriptor.palette is present");
}

const RGBALayout& RGBAPictureDescriptor::getPaletteLayout() const {
  return presentValue(paletteLayout_, "RGBAPictureDescriptor.paletteLayout is present");
}

namespace zelta {

template <>
const PropertyTable<PictureDescriptor>& propertyTable<PictureDescriptor>() {
  typedef PictureDescriptor C;
  static const PropertyTable<C> table(
      "PictureDescriptor", formatSetKey(0x27),
      {optionalValue("PictureDescriptor.signalStandard", 0x3215, &C::getSignalStandard, &C::setSignalStandard,
                     &C::hasSignalStandard),
       requiredValue("PictureDescriptor.frameLayout", 0x320C, &C::getFrameLayout, &C::setFrameLayout),
       requiredValue("PictureDescriptor.storedWidth", 0x3203, &C::getStoredWidth, &C::setStoredWidth),
       requiredValue("PictureDescriptor.storedHeight", 0x3202, &C::getStoredHeight, &C::setStoredHeight),
       optionalValue("PictureDescriptor.storedF2Offset", 0x3216, &C::getStoredF2Offset, &C::setStoredF2Offset,
                     &C::hasStoredF2Offset),
       optionalValue("PictureDescriptor.sampledWidth", 0x3205, &C::getSampledWidth, &C::setSampledWidth,
                     &C::hasSampledWidth),
       optionalValue("PictureDescriptor.sampledHeight", 0x3204, &C::getSampledHeight, &C::setSampledHeight,
                     &C::hasSampledHeight),
       optionalValue("PictureDescriptor.sampledXOffset", 0x3206, &C::getSampledXOffset, &C::setSampledXOffset,
                     &C::hasSampledXOffset),
       optionalValue("PictureDescriptor.sampledYOffset", 0x3207, &C::getSampledYOffset, &C::setSampledYOffset,
                     &C::hasSampledYOffset),
       optionalValue("PictureDescriptor.displayHeight", 0x3208, &C::getDisplayHeight, &C::setDisplayHeight,
                     &C::hasDisplayHeight),
       optionalValue("PictureDescriptor.displayWidth", 0x3209, &C::getDisplayWidth, &C::setDisplayWidth,
                     &C::hasDisplayWidth),
       optionalValue("PictureDescriptor.displayXOffset", 0x320A, &C::getDisplayXOffset, &C::setDisplayXOffset,
                     &C::hasDisplayXOffset),
       optionalValue("PictureDescriptor.displayYOffset", 0x320B, &C::getDisplayYOffset, &C::setDisplayYOffset,
                     &C::hasDisplayYOffset),
       optionalValue("PictureDescriptor.displayF2Offset", 0x3217, &C::getDisplayF2Offset, &C::setDisplayF2Offset,
                     &C::hasDisplayF2Offset),
       requiredValue("PictureDescriptor.aspectRatio", 0x320E, &C::getAspectRatio, &C::setAspectRatio),
       optionalValue("PictureDescriptor.activeFormatDescriptor", 0x3218, &C::getActiveFormatDescriptor,
                     &C::setActiveFormatDescriptor, &C::hasActiveFormatDescriptor),
       requiredValue("PictureDescriptor.videoLineMap", 0x320D, &C::getVideoLineMap, &C::setVideoLineMap),
       optionalValue("PictureDescriptor.alphaTransparency", 0x320F, &C::getAlphaTransparency, &C::setAlphaTransparency,
                     &C::hasAlphaTransparency),
       optionalValue("PictureDescriptor.captureGamma", 0x3210, &C::getCaptureGamma, &C::setCaptureGamma,
                     &C::hasCaptureGamma),
       optionalValue("PictureDescriptor.imageAlignmentOffset", 0x3211, &C::getImageAlignmentOffset,
                     &C::setImageAlignmentOffset, &C::hasImageAlignmentOffset),
       optionalValue("PictureDescriptor.imageStartOffset", 0x3213, &C::getImageStartOffset, &C::setImageStartOffset,
                     &C::hasImageStartOffset),
       optionalValue("PictureDescriptor.imageEndOffset", 0x3214, &C::getImageEndOffset, &C::setImageEndOffset,
                     &C::hasImageEndOffset),
       optionalValue("PictureDescriptor.fieldDominance", 0x3212, &C::getFieldDominance, &C::setFieldDominance,
                     &C::hasFieldDominance),
       optionalValue("PictureDescriptor.pictureEssenceCoding", 0x3201, &C::getPictureEssenceCoding,
                     &C::setPictureEssenceCoding, &C::hasPictureEssenceCoding),
       optionalValue("PictureDescriptor.codingEquations", 0x321A, &C::getCodingEquations, &C::setCodingEquations,
                     &C::hasCodingEquations),
       optionalValue("PictureDescriptor.colourPrimaries", 0x3219, &C::getColourPrimaries, &C::setColourPrimaries,
                     &C::hasColourPrimaries)});
  return table;
}

template <>
const PropertyTable<CDCIPictureDescriptor>& propertyTable<CDCIPictureDescriptor>() {
  typedef CDCIPictureDescriptor C;
  static const PropertyTable<C> table(
      "CDCIPictureDescriptor", formatSetKey(0x28),
      {requiredValue("CDCIPictureDescriptor.componentDepth", 0x3301, &C::getComponentDepth, &C::setComponentDepth),
       requiredValue("CDCIPictureDescriptor.horizontalSubsampling", 0x3302, &C::getHorizontalSubsampling,
                     &C::setHorizontalSubsampling),
       optionalValue("CDCIPictureDescriptor.verticalSubsampling", 0x3308, &C::getVerticalSubsampling,
                     &C::setVerticalSubsampling, &C::hasVerticalSubsampling),
       optionalValue("CDCIPictureDescriptor.colourSiting", 0x3303, &C::getColourSiting, &C::setColourSiting,
                     &C::hasColourSiting),
       optionalValue("CDCIPictureDescriptor.reversedByteOrder", 0x330B, &C::getReversedByteOrder,
                     &C::setReversedByteOrder, &C::hasReversedByteOrder),
       optionalValue("CDCIPictureDescriptor.paddingBits", 0x3307, &C::getPaddingBits, &C::setPaddingBits,
                     &C::hasPaddingBits),
       optionalValue("CDCIPictureDescriptor.alphaSamplingDepth", 0x3309, &C::getAlphaSamplingDepth,
                     &C::setAlphaSamplingDepth, &C::hasAlphaSamplingDepth),
       optionalValue("CDCIPictureDescriptor.blackReferenceLevel", 0x3304, &C::getBlackReferenceLevel,
                     &C::setBlackReferenceLevel, &C::hasBlackReferenceLevel),
       optionalValue("CDCIPictureDescriptor.whiteReferenceLevel", 0x3305, &C::getWhiteReferenceLevel,
                     &C::setWhiteReferenceLevel, &C::hasWhiteReferenceLevel),
       optionalValue("CDCIPictureDescriptor.colourRange", 0x3306, &C::getColourRange, &C::setColourRange,
                     &C::hasColourRange)});
  return table;
}

template <>
const PropertyTable<RGBAPictureDescriptor>& propertyTable<RGBAPictureDescriptor>() {
  typedef RGBAPictureDescriptor C;
  static const PropertyTable<C> table(
      "RGBAPictureDescriptor", formatSetKey(0x29),
      {optionalValue("RGBAPictureDescriptor.componentMaxReferenceLevel", 0x3406, &C::getComponentMaxReferenceLevel,
                     &C::setComponentMaxReferenceLevel, &C::hasComponentMaxReferenceLevel),
       optionalValue("RGBAPictureDescriptor.componentMinReferenceLevel", 0x3407, &C::getComponentMinReferenceLevel,
                     &C::setComponentMinReferenceLevel, &C::hasComponentMinReferenceLevel),
       optionalValue("RGBAPictureDescriptor.alphaMaxReferenceLevel", 0x3408, &C::getAlphaMaxReferenceLevel,
                     &C::setAlphaMaxReferenceLevel, &C::hasAlphaMaxReferenceLevel),
       optionalValue("RGBAPictureDescriptor.alphaMinReferenceLevel", 0x3409, &C::getAlphaMinReferenceLevel,
                     &C::setAlphaMinReferenceLevel, &C::hasAlphaMinReferenceLevel),
       optionalValue("RGBAPictureDescriptor.scanningDirection", 0x3405, &C::getScanningDirection,
                     &C::setScanningDirection, &C::hasScanningDirection),
       requiredValue("RGBAPictureDescriptor.pixelLayout", 0x3401, &C::getPixelLayout, &C::setPixelLayout),
       optionalValue("RGBAPictureDescriptor.palette", 0x3403, &C::getPalette, &C::setPalette, &C::hasPalette),
       optionalValue("RGBAPictureDescriptor.paletteLayout", 0x3404, &C::getPaletteLayout, &C::setPaletteLayout,
                     &C::hasPaletteLayout)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<PictureDescriptor, FileDescriptorFactory>;
template class MetadataClassFactory<CDCIPictureDescriptor, PictureDescriptorFactory>;
template class MetadataClassFactory<RGBAPictureDescriptor, PictureDescriptorFactory>;
