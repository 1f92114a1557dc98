#include <memory>

#include "metadata/acquisition/acquisition_support.h"

using zelta::acquisitionKey;
using zelta::presentValue;

LensUnitMetadata::LensUnitMetadata() = default;
LensUnitMetadata::~LensUnitMetadata() = default;
std::shared_ptr<LensUnitMetadata> LensUnitMetadata::create() { return std::make_shared<LensUnitMetadata>(); }

const std::uint16_t& LensUnitMetadata::getIrisInFNumber() const {
  return presentValue(irisInFNumber_, "LensUnitMetadata.irisInFNumber is present");
}

const std::uint16_t& LensUnitMetadata::getIrisInTNumber() const {
  return presentValue(irisInTNumber_, "LensUnitMetadata.irisInTNumber is present");
}

const std::uint16_t& LensUnitMetadata::getIrisRingPosition() const {
  return presentValue(irisRingPosition_, "LensUnitMetadata.irisRingPosition is present");
}

const Decimal16& LensUnitMetadata::getFocusPositionFromImagePlane() const {
  return presentValue(focusPositionFromImagePlane_, "LensUnitMetadata.focusPositionFromImagePlane is present");
}

const Decimal16& LensUnitMetadata::getFocusPositionFromFrontLensVertex() const {
  return presentValue(focusPositionFromFrontLensVertex_,
                      "LensUnitMetadata.focusPositionFromFrontLensVertex is present");
}

const std::uint16_t& LensUnitMetadata::getFocusRingPosition() const {
  return presentValue(focusRingPosition_, "LensUnitMetadata.focusRingPosition is present");
}

const bool& LensUnitMetadata::getMacroSetting() const {
  return presentValue(macroSetting_, "LensUnitMetadata.macroSetting is present");
}

const Decimal16& LensUnitMetadata::getLensZoom35mmStillCameraEquivalent() const {
  return presentValue(lensZoom35mmStillCameraEquivalent_,
                      "LensUnitMetadata.lensZoom35mmStillCameraEquivalent is present");
}

const Decimal16& LensUnitMetadata::getLensZoomActualFocalLength() const {
  return presentValue(lensZoomActualFocalLength_, "LensUnitMetadata.lensZoomActualFocalLength is present");
}

const std::uint16_t& LensUnitMetadata::getZoomRingPosition() const {
  return presentValue(zoomRingPosition_, "LensUnitMetadata.zoomRingPosition is present");
}

const std::uint16_t& LensUnitMetadata::getOpticalExtenderMagnification() const {
  return presentValue(opticalExtenderMagnification_, "LensUnitMetadata.opticalExtenderMagnification is present");
}

const std::string& LensUnitMetadata::getLensAttributes() const {
  return presentValue(lensAttributes_, "LensUnitMetadata.lensAttributes is present");
}

namespace zelta {

template <>
const PropertyTable<LensUnitMetadata>& propertyTable<LensUnitMetadata>() {
  typedef LensUnitMetadata C;
  static const PropertyTable<C> table(
      "LensUnitMetadata", acquisitionSetKey(0x01),
      {optionalValue("LensUnitMetadata.irisInFNumber",
                     acquisitionKey(0x8000, {0x04, 0x20, 0x02, 0x02, 0x01, 0x00, 0x00, 0x00}), &C::getIrisInFNumber,
                     &C::setIrisInFNumber, &C::hasIrisInFNumber),
       optionalValue("LensUnitMetadata.irisInTNumber",
                     acquisitionKey(0x8008, {0x04, 0x20, 0x02, 0x02, 0x08, 0x00, 0x00, 0x00}), &C::getIrisInTNumber,
                     &C::setIrisInTNumber, &C::hasIrisInTNumber),
       optionalValue("LensUnitMetadata.irisRingPosition",
                     acquisitionKey(0x8009, {0x04, 0x20, 0x02, 0x02, 0x09, 0x00, 0x00, 0x00}), &C::getIrisRingPosition,
                     &C::setIrisRingPosition, &C::hasIrisRingPosition),
       optionalValue("LensUnitMetadata.focusPositionFromImagePlane",
                     acquisitionKey(0x8001, {0x04, 0x20, 0x02, 0x02, 0x02, 0x00, 0x00, 0x00}),
                     &C::getFocusPositionFromImagePlane, &C::setFocusPositionFromImagePlane,
                     &C::hasFocusPositionFromImagePlane),
       optionalValue("LensUnitMetadata.focusPositionFromFrontLensVertex",
                     acquisitionKey(0x8002, {0x04, 0x20, 0x02, 0x02, 0x03, 0x00, 0x00, 0x00}),
                     &C::getFocusPositionFromFrontLensVertex, &C::setFocusPositionFromFrontLensVertex,
                     &C::hasFocusPositionFromFrontLensVertex),
       optionalValue("LensUnitMetadata.focusRingPosition",
                     acquisitionKey(0x800A, {0x04, 0x20, 0x02, 0x02, 0x0A, 0x00, 0x00, 0x00}), &C::getFocusRingPosition,
                     &C::setFocusRingPosition, &C::hasFocusRingPosition),
       optionalValue("LensUnitMetadata.macroSetting",
                     acquisitionKey(0x8003, {0x04, 0x20, 0x02, 0x02, 0x04, 0x00, 0x00, 0x00}), &C::getMacroSetting,
                     &C::setMacroSetting, &C::hasMacroSetting),
       optionalValue("LensUnitMetadata.lensZoom35mmStillCameraEquivalent",
                     acquisitionKey(0x8004, {0x04, 0x20, 0x02, 0x02, 0x05, 0x00, 0x00, 0x00}),
                     &C::getLensZoom35mmStillCameraEquivalent, &C::setLensZoom35mmStillCameraEquivalent,
                     &C::hasLensZoom35mmStillCameraEquivalent),
       optionalValue("LensUnitMetadata.lensZoomActualFocalLength",
                     acquisitionKey(0x8005, {0x04, 0x20, 0x02, 0x02, 0x06, 0x00, 0x00, 0x00}),
                     &C::getLensZoomActualFocalLength, &C::setLensZoomActualFocalLength,
                     &C::hasLensZoomActualFocalLength),
       optionalValue("LensUnitMetadata.zoomRingPosition",
                     acquisitionKey(0x800B, {0x04, 0x20, 0x02, 0x02, 0x0B, 0x00, 0x00, 0x00}), &C::getZoomRingPosition,
                     &C::setZoomRingPosition, &C::hasZoomRingPosition),
       optionalValue("LensUnitMetadata.opticalExtenderMagnification",
                     acquisitionKey(0x8006, {0x04, 0x20, 0x02, 0x02, 0x07, 0x00, 0x00, 0x00}),
                     &C::getOpticalExtenderMagnification, &C::setOpticalExtenderMagnification,
                     &C::hasOpticalExtenderMagnification),
       optionalValue("LensUnitMetadata.lensAttributes",
                     acquisitionKey(0x8007, {0x03, 0x02, 0x03, 0x02, 0x02, 0x10, 0x01, 0x00}), &C::getLensAttributes,
                     &C::setLensAttributes, &C::hasLensAttributes)});
  return table;
}

}  // namespace zelta

void LensUnitMetadataFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object,
                                             MXFPropertyMap& properties, MXFReferencedObjects& referenced) const {
  MetadataClassFactory<LensUnitMetadata, AcquisitionMetadataObjectFactory>::codeProperties(object, properties,
                                                                                           referenced);
  zelta::writeOrderHint(properties, zelta::propertyTable<LensUnitMetadata>().keys());
}

template class MetadataClassFactory<LensUnitMetadata, AcquisitionMetadataObjectFactory>;
