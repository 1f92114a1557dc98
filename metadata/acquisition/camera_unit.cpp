#include <memory>

#include "metadata/acquisition/acquisition_support.h"

using zelta::acquisitionKey;
using zelta::presentValue;

CameraUnitMetadata::CameraUnitMetadata() = default;
CameraUnitMetadata::~CameraUnitMetadata() = default;
std::shared_ptr<CameraUnitMetadata> CameraUnitMetadata::create() { return std::make_shared<CameraUnitMetadata>(); }

const KLVKey& CameraUnitMetadata::getAutoExposureMode() const {
  return presentValue(autoExposureMode_, "CameraUnitMetadata.autoExposureMode is present");
}

const std::uint16_t& CameraUnitMetadata::getExposureIndexOfPhotoMeter() const {
  return presentValue(exposureIndexOfPhotoMeter_, "CameraUnitMetadata.exposureIndexOfPhotoMeter is present");
}

const std::uint8_t& CameraUnitMetadata::getAutoFocusSensingAreaSetting() const {
  return presentValue(autoFocusSensingAreaSetting_, "CameraUnitMetadata.autoFocusSensingAreaSetting is present");
}

const std::uint8_t& CameraUnitMetadata::getColourCorrectionFilterWheelSetting() const {
  return presentValue(colourCorrectionFilterWheelSetting_,
                      "CameraUnitMetadata.colourCorrectionFilterWheelSetting is present");
}

const std::uint16_t& CameraUnitMetadata::getNeutralDensityFilterWheelSetting() const {
  return presentValue(neutralDensityFilterWheelSetting_,
                      "CameraUnitMetadata.neutralDensityFilterWheelSetting is present");
}

const std::uint16_t& CameraUnitMetadata::getImageSensorEffectiveWidth() const {
  return presentValue(imageSensorEffectiveWidth_, "CameraUnitMetadata.imageSensorEffectiveWidth is present");
}

const std::uint16_t& CameraUnitMetadata::getImageSensorEffectiveHeight() const {
  return presentValue(imageSensorEffectiveHeight_, "CameraUnitMetadata.imageSensorEffectiveHeight is present");
}

const MXFRational& CameraUnitMetadata::getCaptureFrameRate() const {
  return presentValue(captureFrameRate_, "CameraUnitMetadata.captureFrameRate is present");
}

const std::uint8_t& CameraUnitMetadata::getImageSensorReadoutMode() const {
  return presentValue(imageSensorReadoutMode_, "CameraUnitMetadata.imageSensorReadoutMode is present");
}

const std::uint32_t& CameraUnitMetadata::getShutterSpeedAngle() const {
  return presentValue(shutterSpeedAngle_, "CameraUnitMetadata.shutterSpeedAngle is present");
}

const MXFRational& CameraUnitMetadata::getShutterSpeedTime() const {
  return presentValue(shutterSpeedTime_, "CameraUnitMetadata.shutterSpeedTime is present");
}

const std::int16_t& CameraUnitMetadata::getCameraMasterGainAdjustment() const {
  return presentValue(cameraMasterGainAdjustment_, "CameraUnitMetadata.cameraMasterGainAdjustment is present");
}

const std::uint16_t& CameraUnitMetadata::getISOSensitivity() const {
  return presentValue(isoSensitivity_, "CameraUnitMetadata.isoSensitivity is present");
}

const std::vector<MXFRational>& CameraUnitMetadata::getColourMatrix() const {
  return presentValue(colourMatrix_, "CameraUnitMetadata.colourMatrix is present");
}

const std::uint16_t& CameraUnitMetadata::getElectricalExtenderMagnification() const {
  return presentValue(electricalExtenderMagnification_,
                      "CameraUnitMetadata.electricalExtenderMagnification is present");
}

const std::uint8_t& CameraUnitMetadata::getAutoWhiteBalanceMode() const {
  return presentValue(autoWhiteBalanceMode_, "CameraUnitMetadata.autoWhiteBalanceMode is present");
}

const std::uint16_t& CameraUnitMetadata::getWhiteBalance() const {
  return presentValue(whiteBalance_, "CameraUnitMetadata.whiteBalance is present");
}

const std::int16_t& CameraUnitMetadata::getCameraMasterBlackLevel() const {
  return presentValue(cameraMasterBlackLevel_, "CameraUnitMetadata.cameraMasterBlackLevel is present");
}

const std::uint16_t& CameraUnitMetadata::getCameraKneePoint() const {
  return presentValue(cameraKneePoint_, "CameraUnitMetadata.cameraKneePoint is present");
}

const MXFRational& CameraUnitMetadata::getCameraKneeSlope() const {
  return presentValue(cameraKneeSlope_, "CameraUnitMetadata.cameraKneeSlope is present");
}

const std::uint16_t& CameraUnitMetadata::getCameraLuminanceDynamicRange() const {
  return presentValue(cameraLuminanceDynamicRange_, "CameraUnitMetadata.cameraLuminanceDynamicRange is present");
}

const KLVKey& CameraUnitMetadata::getCaptureGammaEquation() const {
  return presentValue(captureGammaEquation_, "CameraUnitMetadata.captureGammaEquation is present");
}

const std::uint8_t& CameraUnitMetadata::getGammaForCDL() const {
  return presentValue(gammaForCDL_, "CameraUnitMetadata.gammaForCDL is present");
}

const std::vector<Binary16>& CameraUnitMetadata::getASCCDL() const {
  return presentValue(ascCDL_, "CameraUnitMetadata.ascCDL is present");
}

const std::string& CameraUnitMetadata::getCameraSettingFileURI() const {
  return presentValue(cameraSettingFileURI_, "CameraUnitMetadata.cameraSettingFileURI is present");
}

const std::string& CameraUnitMetadata::getCameraAttributes() const {
  return presentValue(cameraAttributes_, "CameraUnitMetadata.cameraAttributes is present");
}

namespace zelta {

template <>
const PropertyTable<CameraUnitMetadata>& propertyTable<CameraUnitMetadata>() {
  typedef CameraUnitMetadata C;
  static const PropertyTable<C> table(
      "CameraUnitMetadata", acquisitionSetKey(0x02),
      {optionalValue("CameraUnitMetadata.autoExposureMode",
                     acquisitionKey(0x8100, {0x04, 0x20, 0x01, 0x03, 0x01, 0x01, 0x00, 0x00}), &C::getAutoExposureMode,
                     &C::setAutoExposureMode, &C::hasAutoExposureMode),
       optionalValue("CameraUnitMetadata.exposureIndexOfPhotoMeter",
                     acquisitionKey(0x8115, {0x04, 0x20, 0x01, 0x03, 0x01, 0x0C, 0x00, 0x00}),
                     &C::getExposureIndexOfPhotoMeter, &C::setExposureIndexOfPhotoMeter,
                     &C::hasExposureIndexOfPhotoMeter),
       optionalValue("CameraUnitMetadata.autoFocusSensingAreaSetting",
                     acquisitionKey(0x8101, {0x04, 0x20, 0x01, 0x03, 0x01, 0x02, 0x00, 0x00}),
                     &C::getAutoFocusSensingAreaSetting, &C::setAutoFocusSensingAreaSetting,
                     &C::hasAutoFocusSensingAreaSetting),
       optionalValue("CameraUnitMetadata.colourCorrectionFilterWheelSetting",
                     acquisitionKey(0x8102, {0x04, 0x20, 0x01, 0x03, 0x01, 0x03, 0x00, 0x00}),
                     &C::getColourCorrectionFilterWheelSetting, &C::setColourCorrectionFilterWheelSetting,
                     &C::hasColourCorrectionFilterWheelSetting),
       optionalValue("CameraUnitMetadata.neutralDensityFilterWheelSetting",
                     acquisitionKey(0x8103, {0x04, 0x20, 0x01, 0x03, 0x01, 0x04, 0x00, 0x00}),
                     &C::getNeutralDensityFilterWheelSetting, &C::setNeutralDensityFilterWheelSetting,
                     &C::hasNeutralDensityFilterWheelSetting),
       optionalValue("CameraUnitMetadata.imageSensorEffectiveWidth",
                     acquisitionKey(0x8104, {0x04, 0x20, 0x01, 0x03, 0x01, 0x05, 0x00, 0x00}),
                     &C::getImageSensorEffectiveWidth, &C::setImageSensorEffectiveWidth,
                     &C::hasImageSensorEffectiveWidth),
       optionalValue("CameraUnitMetadata.imageSensorEffectiveHeight",
                     acquisitionKey(0x8105, {0x04, 0x20, 0x01, 0x03, 0x01, 0x06, 0x00, 0x00}),
                     &C::getImageSensorEffectiveHeight, &C::setImageSensorEffectiveHeight,
                     &C::hasImageSensorEffectiveHeight),
       optionalValue("CameraUnitMetadata.captureFrameRate",
                     acquisitionKey(0x8106, {0x04, 0x01, 0x03, 0x01, 0x03, 0x01, 0x00, 0x00}), &C::getCaptureFrameRate,
                     &C::setCaptureFrameRate, &C::hasCaptureFrameRate),
       optionalValue("CameraUnitMetadata.imageSensorReadoutMode",
                     acquisitionKey(0x8107, {0x04, 0x20, 0x01, 0x03, 0x01, 0x07, 0x00, 0x00}),
                     &C::getImageSensorReadoutMode, &C::setImageSensorReadoutMode, &C::hasImageSensorReadoutMode),
       optionalValue("CameraUnitMetadata.shutterSpeedAngle",
                     acquisitionKey(0x8108, {0x04, 0x20, 0x01, 0x03, 0x01, 0x08, 0x00, 0x00}), &C::getShutterSpeedAngle,
                     &C::setShutterSpeedAngle, &C::hasShutterSpeedAngle),
       optionalValue("CameraUnitMetadata.shutterSpeedTime",
                     acquisitionKey(0x8109, {0x04, 0x20, 0x01, 0x03, 0x01, 0x08, 0x01, 0x00}), &C::getShutterSpeedTime,
                     &C::setShutterSpeedTime, &C::hasShutterSpeedTime),
       optionalValue("CameraUnitMetadata.cameraMasterGainAdjustment",
                     acquisitionKey(0x810A, {0x04, 0x20, 0x01, 0x03, 0x01, 0x09, 0x00, 0x00}),
                     &C::getCameraMasterGainAdjustment, &C::setCameraMasterGainAdjustment,
                     &C::hasCameraMasterGainAdjustment),
       optionalValue("CameraUnitMetadata.isoSensitivity",
                     acquisitionKey(0x810B, {0x04, 0x20, 0x01, 0x03, 0x01, 0x0A, 0x00, 0x00}), &C::getISOSensitivity,
                     &C::setISOSensitivity, &C::hasISOSensitivity),
       optionalValue("CameraUnitMetadata.colourMatrix",
                     acquisitionKey(0x8118, {0x04, 0x20, 0x01, 0x03, 0x01, 0x0D, 0x00, 0x00}), &C::getColourMatrix,
                     &C::setColourMatrix, &C::hasColourMatrix),
       optionalValue("CameraUnitMetadata.electricalExtenderMagnification",
                     acquisitionKey(0x810C, {0x04, 0x20, 0x01, 0x03, 0x01, 0x0B, 0x00, 0x00}),
                     &C::getElectricalExtenderMagnification, &C::setElectricalExtenderMagnification,
                     &C::hasElectricalExtenderMagnification),
       optionalValue("CameraUnitMetadata.autoWhiteBalanceMode",
                     acquisitionKey(0x810D, {0x04, 0x20, 0x01, 0x03, 0x02, 0x01, 0x00, 0x00}),
                     &C::getAutoWhiteBalanceMode, &C::setAutoWhiteBalanceMode, &C::hasAutoWhiteBalanceMode),
       optionalValue("CameraUnitMetadata.whiteBalance",
                     acquisitionKey(0x810E, {0x04, 0x20, 0x01, 0x03, 0x02, 0x02, 0x00, 0x00}), &C::getWhiteBalance,
                     &C::setWhiteBalance, &C::hasWhiteBalance),
       optionalValue("CameraUnitMetadata.cameraMasterBlackLevel",
                     acquisitionKey(0x810F, {0x04, 0x20, 0x01, 0x03, 0x02, 0x03, 0x00, 0x00}),
                     &C::getCameraMasterBlackLevel, &C::setCameraMasterBlackLevel, &C::hasCameraMasterBlackLevel),
       optionalValue("CameraUnitMetadata.cameraKneePoint",
                     acquisitionKey(0x8110, {0x04, 0x20, 0x01, 0x03, 0x02, 0x04, 0x00, 0x00}), &C::getCameraKneePoint,
                     &C::setCameraKneePoint, &C::hasCameraKneePoint),
       optionalValue("CameraUnitMetadata.cameraKneeSlope",
                     acquisitionKey(0x8111, {0x04, 0x20, 0x01, 0x03, 0x02, 0x05, 0x00, 0x00}), &C::getCameraKneeSlope,
                     &C::setCameraKneeSlope, &C::hasCameraKneeSlope),
       optionalValue("CameraUnitMetadata.cameraLuminanceDynamicRange",
                     acquisitionKey(0x8112, {0x04, 0x20, 0x01, 0x03, 0x02, 0x06, 0x00, 0x00}),
                     &C::getCameraLuminanceDynamicRange, &C::setCameraLuminanceDynamicRange,
                     &C::hasCameraLuminanceDynamicRange),
       optionalValue("CameraUnitMetadata.captureGammaEquation", 0x3210, &C::getCaptureGammaEquation,
                     &C::setCaptureGammaEquation, &C::hasCaptureGammaEquation),
       optionalValue("CameraUnitMetadata.gammaForCDL",
                     acquisitionKey(0x8116, {0x04, 0x20, 0x01, 0x03, 0x02, 0x07, 0x00, 0x00}), &C::getGammaForCDL,
                     &C::setGammaForCDL, &C::hasGammaForCDL),
       optionalValue("CameraUnitMetadata.ascCDL",
                     acquisitionKey(0x8117, {0x04, 0x20, 0x01, 0x03, 0x02, 0x08, 0x00, 0x00}), &C::getASCCDL,
                     &C::setASCCDL, &C::hasASCCDL),
       optionalValue("CameraUnitMetadata.cameraSettingFileURI",
                     acquisitionKey(0x8113, {0x01, 0x02, 0x01, 0x08, 0x02, 0x00, 0x00, 0x00}),
                     &C::getCameraSettingFileURI, &C::setCameraSettingFileURI, &C::hasCameraSettingFileURI),
       optionalValue("CameraUnitMetadata.cameraAttributes",
                     acquisitionKey(0x8114, {0x03, 0x02, 0x03, 0x02, 0x02, 0x10, 0x02, 0x00}), &C::getCameraAttributes,
                     &C::setCameraAttributes, &C::hasCameraAttributes)});
  return table;
}

}  // namespace zelta

void CameraUnitMetadataFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object,
                                               MXFPropertyMap& properties, MXFReferencedObjects& referenced) const {
  MetadataClassFactory<CameraUnitMetadata, AcquisitionMetadataObjectFactory>::codeProperties(object, properties,
                                                                                             referenced);
  zelta::writeOrderHint(properties, zelta::propertyTable<CameraUnitMetadata>().keys());
}

template class MetadataClassFactory<CameraUnitMetadata, AcquisitionMetadataObjectFactory>;
