// Zelta: acquisition metadata objects, the camera and lens settings of one
// frame, with the composite factory of their classes. Part of metadata.h,
// which includes it.
#ifndef ZELTA_INCLUDE_METADATA_ACQUISITION_H
#define ZELTA_INCLUDE_METADATA_ACQUISITION_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "metadata_text_based.h"

// Items of an acquisition set that no class knows are kept under keys of
// this family, 9C EF 38 E7 D8 04 25 C1 C3 D1 hi lo 9C AD 11 E0, whose octets
// 10 and 11 are the item's local tag: a set travels without a primer, and
// the tag comes back from the key alone. Octets 7, 10 and 11 are wildcards.
inline constexpr KLVKeyPattern MXFAcquisitionDarkItemPattern = KLVKeyPattern(std::array<std::uint8_t, 16>{
    0x9C, 0xEF, 0x38, 0xE7, 0xD8, 0x04, 0x25, 0x00, 0xC3, 0xD1, 0x00, 0x00, 0x9C, 0xAD, 0x11, 0xE0});

inline KLVKey acquisitionDarkItemKey(std::uint16_t tag) {
  return KLVKey(std::array<std::uint8_t, 16>{0x9C, 0xEF, 0x38, 0xE7, 0xD8, 0x04, 0x25, 0xC1, 0xC3, 0xD1,
                                             static_cast<std::uint8_t>(tag >> 8), static_cast<std::uint8_t>(tag), 0x9C,
                                             0xAD, 0x11, 0xE0});
}

inline std::uint16_t acquisitionDarkItemTag(const KLVKey& key) {
  return static_cast<std::uint16_t>(key[10] << 8 | key[11]);
}

// The base of the frame-wise sets. These objects stand alone: nothing owns
// them or refers to them, and they have no generation identifier.
class ZELTA_EXPORT AcquisitionMetadataObject : public MetadataRoot {
 public:
  AcquisitionMetadataObject();
  ~AcquisitionMetadataObject() override;

  static std::shared_ptr<AcquisitionMetadataObject> create();
};

// How the lens stood. Every property is optional and a set holds only what
// is set.
class ZELTA_EXPORT LensUnitMetadata : public AcquisitionMetadataObject {
 public:
  LensUnitMetadata();
  ~LensUnitMetadata() override;

  static std::shared_ptr<LensUnitMetadata> create();

  const std::uint16_t& getIrisInFNumber() const;
  void setIrisInFNumber(const std::uint16_t& irisInFNumber) { irisInFNumber_ = irisInFNumber; }
  bool hasIrisInFNumber() const { return irisInFNumber_.has_value(); }
  void removeIrisInFNumber() { irisInFNumber_.reset(); }
  const std::uint16_t& getIrisInTNumber() const;
  void setIrisInTNumber(const std::uint16_t& irisInTNumber) { irisInTNumber_ = irisInTNumber; }
  bool hasIrisInTNumber() const { return irisInTNumber_.has_value(); }
  void removeIrisInTNumber() { irisInTNumber_.reset(); }
  const std::uint16_t& getIrisRingPosition() const;
  void setIrisRingPosition(const std::uint16_t& irisRingPosition) { irisRingPosition_ = irisRingPosition; }
  bool hasIrisRingPosition() const { return irisRingPosition_.has_value(); }
  void removeIrisRingPosition() { irisRingPosition_.reset(); }
  const Decimal16& getFocusPositionFromImagePlane() const;
  void setFocusPositionFromImagePlane(const Decimal16& focusPositionFromImagePlane) {
    focusPositionFromImagePlane_ = focusPositionFromImagePlane;
  }
  bool hasFocusPositionFromImagePlane() const { return focusPositionFromImagePlane_.has_value(); }
  void removeFocusPositionFromImagePlane() { focusPositionFromImagePlane_.reset(); }
  const Decimal16& getFocusPositionFromFrontLensVertex() const;
  void setFocusPositionFromFrontLensVertex(const Decimal16& focusPositionFromFrontLensVertex) {
    focusPositionFromFrontLensVertex_ = focusPositionFromFrontLensVertex;
  }
  bool hasFocusPositionFromFrontLensVertex() const { return focusPositionFromFrontLensVertex_.has_value(); }
  void removeFocusPositionFromFrontLensVertex() { focusPositionFromFrontLensVertex_.reset(); }
  const std::uint16_t& getFocusRingPosition() const;
  void setFocusRingPosition(const std::uint16_t& focusRingPosition) { focusRingPosition_ = focusRingPosition; }
  bool hasFocusRingPosition() const { return focusRingPosition_.has_value(); }
  void removeFocusRingPosition() { focusRingPosition_.reset(); }
  const bool& getMacroSetting() const;
  void setMacroSetting(const bool& macroSetting) { macroSetting_ = macroSetting; }
  bool hasMacroSetting() const { return macroSetting_.has_value(); }
  void removeMacroSetting() { macroSetting_.reset(); }
  const Decimal16& getLensZoom35mmStillCameraEquivalent() const;
  void setLensZoom35mmStillCameraEquivalent(const Decimal16& lensZoom35mmStillCameraEquivalent) {
    lensZoom35mmStillCameraEquivalent_ = lensZoom35mmStillCameraEquivalent;
  }
  bool hasLensZoom35mmStillCameraEquivalent() const { return lensZoom35mmStillCameraEquivalent_.has_value(); }
  void removeLensZoom35mmStillCameraEquivalent() { lensZoom35mmStillCameraEquivalent_.reset(); }
  const Decimal16& getLensZoomActualFocalLength() const;
  void setLensZoomActualFocalLength(const Decimal16& lensZoomActualFocalLength) {
    lensZoomActualFocalLength_ = lensZoomActualFocalLength;
  }
  bool hasLensZoomActualFocalLength() const { return lensZoomActualFocalLength_.has_value(); }
  void removeLensZoomActualFocalLength() { lensZoomActualFocalLength_.reset(); }
  const std::uint16_t& getZoomRingPosition() const;
  void setZoomRingPosition(const std::uint16_t& zoomRingPosition) { zoomRingPosition_ = zoomRingPosition; }
  bool hasZoomRingPosition() const { return zoomRingPosition_.has_value(); }
  void removeZoomRingPosition() { zoomRingPosition_.reset(); }
  const std::uint16_t& getOpticalExtenderMagnification() const;
  void setOpticalExtenderMagnification(const std::uint16_t& opticalExtenderMagnification) {
    opticalExtenderMagnification_ = opticalExtenderMagnification;
  }
  bool hasOpticalExtenderMagnification() const { return opticalExtenderMagnification_.has_value(); }
  void removeOpticalExtenderMagnification() { opticalExtenderMagnification_.reset(); }
  const std::string& getLensAttributes() const;
  void setLensAttributes(const std::string& lensAttributes) { lensAttributes_ = lensAttributes; }
  bool hasLensAttributes() const { return lensAttributes_.has_value(); }
  void removeLensAttributes() { lensAttributes_.reset(); }

 private:
  std::optional<std::uint16_t> irisInFNumber_;
  std::optional<std::uint16_t> irisInTNumber_;
  std::optional<std::uint16_t> irisRingPosition_;
  std::optional<Decimal16> focusPositionFromImagePlane_;
  std::optional<Decimal16> focusPositionFromFrontLensVertex_;
  std::optional<std::uint16_t> focusRingPosition_;
  std::optional<bool> macroSetting_;
  std::optional<Decimal16> lensZoom35mmStillCameraEquivalent_;
  std::optional<Decimal16> lensZoomActualFocalLength_;
  std::optional<std::uint16_t> zoomRingPosition_;
  std::optional<std::uint16_t> opticalExtenderMagnification_;
  std::optional<std::string> lensAttributes_;
};

// How the camera stood.
class ZELTA_EXPORT CameraUnitMetadata : public AcquisitionMetadataObject {
 public:
  CameraUnitMetadata();
  ~CameraUnitMetadata() override;

  static std::shared_ptr<CameraUnitMetadata> create();

  const KLVKey& getAutoExposureMode() const;
  void setAutoExposureMode(const KLVKey& autoExposureMode) { autoExposureMode_ = autoExposureMode; }
  bool hasAutoExposureMode() const { return autoExposureMode_.has_value(); }
  void removeAutoExposureMode() { autoExposureMode_.reset(); }
  const std::uint16_t& getExposureIndexOfPhotoMeter() const;
  void setExposureIndexOfPhotoMeter(const std::uint16_t& exposureIndexOfPhotoMeter) {
    exposureIndexOfPhotoMeter_ = exposureIndexOfPhotoMeter;
  }
  bool hasExposureIndexOfPhotoMeter() const { return exposureIndexOfPhotoMeter_.has_value(); }
  void removeExposureIndexOfPhotoMeter() { exposureIndexOfPhotoMeter_.reset(); }
  const std::uint8_t& getAutoFocusSensingAreaSetting() const;
  void setAutoFocusSensingAreaSetting(const std::uint8_t& autoFocusSensingAreaSetting) {
    autoFocusSensingAreaSetting_ = autoFocusSensingAreaSetting;
  }
  bool hasAutoFocusSensingAreaSetting() const { return autoFocusSensingAreaSetting_.has_value(); }
  void removeAutoFocusSensingAreaSetting() { autoFocusSensingAreaSetting_.reset(); }
  const std::uint8_t& getColourCorrectionFilterWheelSetting() const;
  void setColourCorrectionFilterWheelSetting(const std::uint8_t& colourCorrectionFilterWheelSetting) {
    colourCorrectionFilterWheelSetting_ = colourCorrectionFilterWheelSetting;
  }
  bool hasColourCorrectionFilterWheelSetting() const { return colourCorrectionFilterWheelSetting_.has_value(); }
  void removeColourCorrectionFilterWheelSetting() { colourCorrectionFilterWheelSetting_.reset(); }
  const std::uint16_t& getNeutralDensityFilterWheelSetting() const;
  void setNeutralDensityFilterWheelSetting(const std::uint16_t& neutralDensityFilterWheelSetting) {
    neutralDensityFilterWheelSetting_ = neutralDensityFilterWheelSetting;
  }
  bool hasNeutralDensityFilterWheelSetting() const { return neutralDensityFilterWheelSetting_.has_value(); }
  void removeNeutralDensityFilterWheelSetting() { neutralDensityFilterWheelSetting_.reset(); }
  const std::uint16_t& getImageSensorEffectiveWidth() const;
  void setImageSensorEffectiveWidth(const std::uint16_t& imageSensorEffectiveWidth) {
    imageSensorEffectiveWidth_ = imageSensorEffectiveWidth;
  }
  bool hasImageSensorEffectiveWidth() const { return imageSensorEffectiveWidth_.has_value(); }
  void removeImageSensorEffectiveWidth() { imageSensorEffectiveWidth_.reset(); }
  const std::uint16_t& getImageSensorEffectiveHeight() const;
  void setImageSensorEffectiveHeight(const std::uint16_t& imageSensorEffectiveHeight) {
    imageSensorEffectiveHeight_ = imageSensorEffectiveHeight;
  }
  bool hasImageSensorEffectiveHeight() const { return imageSensorEffectiveHeight_.has_value(); }
  void removeImageSensorEffectiveHeight() { imageSensorEffectiveHeight_.reset(); }
  const MXFRational& getCaptureFrameRate() const;
  void setCaptureFrameRate(const MXFRational& captureFrameRate) { captureFrameRate_ = captureFrameRate; }
  bool hasCaptureFrameRate() const { return captureFrameRate_.has_value(); }
  void removeCaptureFrameRate() { captureFrameRate_.reset(); }
  const std::uint8_t& getImageSensorReadoutMode() const;
  void setImageSensorReadoutMode(const std::uint8_t& imageSensorReadoutMode) {
    imageSensorReadoutMode_ = imageSensorReadoutMode;
  }
  bool hasImageSensorReadoutMode() const { return imageSensorReadoutMode_.has_value(); }
  void removeImageSensorReadoutMode() { imageSensorReadoutMode_.reset(); }
  const std::uint32_t& getShutterSpeedAngle() const;
  void setShutterSpeedAngle(const std::uint32_t& shutterSpeedAngle) { shutterSpeedAngle_ = shutterSpeedAngle; }
  bool hasShutterSpeedAngle() const { return shutterSpeedAngle_.has_value(); }
  void removeShutterSpeedAngle() { shutterSpeedAngle_.reset(); }
  const MXFRational& getShutterSpeedTime() const;
  void setShutterSpeedTime(const MXFRational& shutterSpeedTime) { shutterSpeedTime_ = shutterSpeedTime; }
  bool hasShutterSpeedTime() const { return shutterSpeedTime_.has_value(); }
  void removeShutterSpeedTime() { shutterSpeedTime_.reset(); }
  const std::int16_t& getCameraMasterGainAdjustment() const;
  void setCameraMasterGainAdjustment(const std::int16_t& cameraMasterGainAdjustment) {
    cameraMasterGainAdjustment_ = cameraMasterGainAdjustment;
  }
  bool hasCameraMasterGainAdjustment() const { return cameraMasterGainAdjustment_.has_value(); }
  void removeCameraMasterGainAdjustment() { cameraMasterGainAdjustment_.reset(); }
  const std::uint16_t& getISOSensitivity() const;
  void setISOSensitivity(const std::uint16_t& isoSensitivity) { isoSensitivity_ = isoSensitivity; }
  bool hasISOSensitivity() const { return isoSensitivity_.has_value(); }
  void removeISOSensitivity() { isoSensitivity_.reset(); }
  const std::vector<MXFRational>& getColourMatrix() const;
  void setColourMatrix(const std::vector<MXFRational>& colourMatrix) { colourMatrix_ = colourMatrix; }
  bool hasColourMatrix() const { return colourMatrix_.has_value(); }
  void removeColourMatrix() { colourMatrix_.reset(); }
  const std::uint16_t& getElectricalExtenderMagnification() const;
  void setElectricalExtenderMagnification(const std::uint16_t& electricalExtenderMagnification) {
    electricalExtenderMagnification_ = electricalExtenderMagnification;
  }
  bool hasElectricalExtenderMagnification() const { return electricalExtenderMagnification_.has_value(); }
  void removeElectricalExtenderMagnification() { electricalExtenderMagnification_.reset(); }
  const std::uint8_t& getAutoWhiteBalanceMode() const;
  void setAutoWhiteBalanceMode(const std::uint8_t& autoWhiteBalanceMode) {
    autoWhiteBalanceMode_ = autoWhiteBalanceMode;
  }
  bool hasAutoWhiteBalanceMode() const { return autoWhiteBalanceMode_.has_value(); }
  void removeAutoWhiteBalanceMode() { autoWhiteBalanceMode_.reset(); }
  const std::uint16_t& getWhiteBalance() const;
  void setWhiteBalance(const std::uint16_t& whiteBalance) { whiteBalance_ = whiteBalance; }
  bool hasWhiteBalance() const { return whiteBalance_.has_value(); }
  void removeWhiteBalance() { whiteBalance_.reset(); }
  const std::int16_t& getCameraMasterBlackLevel() const;
  void setCameraMasterBlackLevel(const std::int16_t& cameraMasterBlackLevel) {
    cameraMasterBlackLevel_ = cameraMasterBlackLevel;
  }
  bool hasCameraMasterBlackLevel() const { return cameraMasterBlackLevel_.has_value(); }
  void removeCameraMasterBlackLevel() { cameraMasterBlackLevel_.reset(); }
  const std::uint16_t& getCameraKneePoint() const;
  void setCameraKneePoint(const std::uint16_t& cameraKneePoint) { cameraKneePoint_ = cameraKneePoint; }
  bool hasCameraKneePoint() const { return cameraKneePoint_.has_value(); }
  void removeCameraKneePoint() { cameraKneePoint_.reset(); }
  const MXFRational& getCameraKneeSlope() const;
  void setCameraKneeSlope(const MXFRational& cameraKneeSlope) { cameraKneeSlope_ = cameraKneeSlope; }
  bool hasCameraKneeSlope() const { return cameraKneeSlope_.has_value(); }
  void removeCameraKneeSlope() { cameraKneeSlope_.reset(); }
  const std::uint16_t& getCameraLuminanceDynamicRange() const;
  void setCameraLuminanceDynamicRange(const std::uint16_t& cameraLuminanceDynamicRange) {
    cameraLuminanceDynamicRange_ = cameraLuminanceDynamicRange;
  }
  bool hasCameraLuminanceDynamicRange() const { return cameraLuminanceDynamicRange_.has_value(); }
  void removeCameraLuminanceDynamicRange() { cameraLuminanceDynamicRange_.reset(); }
  const KLVKey& getCaptureGammaEquation() const;
  void setCaptureGammaEquation(const KLVKey& captureGammaEquation) { captureGammaEquation_ = captureGammaEquation; }
  bool hasCaptureGammaEquation() const { return captureGammaEquation_.has_value(); }
  void removeCaptureGammaEquation() { captureGammaEquation_.reset(); }
  const std::uint8_t& getGammaForCDL() const;
  void setGammaForCDL(const std::uint8_t& gammaForCDL) { gammaForCDL_ = gammaForCDL; }
  bool hasGammaForCDL() const { return gammaForCDL_.has_value(); }
  void removeGammaForCDL() { gammaForCDL_.reset(); }
  const std::vector<Binary16>& getASCCDL() const;
  void setASCCDL(const std::vector<Binary16>& ascCDL) { ascCDL_ = ascCDL; }
  bool hasASCCDL() const { return ascCDL_.has_value(); }
  void removeASCCDL() { ascCDL_.reset(); }
  const std::string& getCameraSettingFileURI() const;
  void setCameraSettingFileURI(const std::string& cameraSettingFileURI) {
    cameraSettingFileURI_ = cameraSettingFileURI;
  }
  bool hasCameraSettingFileURI() const { return cameraSettingFileURI_.has_value(); }
  void removeCameraSettingFileURI() { cameraSettingFileURI_.reset(); }
  const std::string& getCameraAttributes() const;
  void setCameraAttributes(const std::string& cameraAttributes) { cameraAttributes_ = cameraAttributes; }
  bool hasCameraAttributes() const { return cameraAttributes_.has_value(); }
  void removeCameraAttributes() { cameraAttributes_.reset(); }

 private:
  std::optional<KLVKey> autoExposureMode_;
  std::optional<std::uint16_t> exposureIndexOfPhotoMeter_;
  std::optional<std::uint8_t> autoFocusSensingAreaSetting_;
  std::optional<std::uint8_t> colourCorrectionFilterWheelSetting_;
  std::optional<std::uint16_t> neutralDensityFilterWheelSetting_;
  std::optional<std::uint16_t> imageSensorEffectiveWidth_;
  std::optional<std::uint16_t> imageSensorEffectiveHeight_;
  std::optional<MXFRational> captureFrameRate_;
  std::optional<std::uint8_t> imageSensorReadoutMode_;
  std::optional<std::uint32_t> shutterSpeedAngle_;
  std::optional<MXFRational> shutterSpeedTime_;
  std::optional<std::int16_t> cameraMasterGainAdjustment_;
  std::optional<std::uint16_t> isoSensitivity_;
  std::optional<std::vector<MXFRational>> colourMatrix_;
  std::optional<std::uint16_t> electricalExtenderMagnification_;
  std::optional<std::uint8_t> autoWhiteBalanceMode_;
  std::optional<std::uint16_t> whiteBalance_;
  std::optional<std::int16_t> cameraMasterBlackLevel_;
  std::optional<std::uint16_t> cameraKneePoint_;
  std::optional<MXFRational> cameraKneeSlope_;
  std::optional<std::uint16_t> cameraLuminanceDynamicRange_;
  std::optional<KLVKey> captureGammaEquation_;
  std::optional<std::uint8_t> gammaForCDL_;
  std::optional<std::vector<Binary16>> ascCDL_;
  std::optional<std::string> cameraSettingFileURI_;
  std::optional<std::string> cameraAttributes_;
};

// A set of a manufacturer's own items, all of them dark, named by its set
// identifier.
class ZELTA_EXPORT UserDefinedAcquisitionMetadata : public AcquisitionMetadataObject {
 public:
  UserDefinedAcquisitionMetadata();
  ~UserDefinedAcquisitionMetadata() override;

  static std::shared_ptr<UserDefinedAcquisitionMetadata> create();

  const KLVKey& getUDAMSetIdentifier() const { return udamSetIdentifier_; }
  void setUDAMSetIdentifier(const KLVKey& udamSetIdentifier) { udamSetIdentifier_ = udamSetIdentifier; }

 private:
  KLVKey udamSetIdentifier_;
};

class AcquisitionMetadataObjectFactory : public MetadataClassFactory<AcquisitionMetadataObject, MetadataRootFactory> {};
// Each writes a property order hint behind its properties, so that its sets
// keep the order of the items in the file instead of key order.
class ZELTA_EXPORT LensUnitMetadataFactory
    : public MetadataClassFactory<LensUnitMetadata, AcquisitionMetadataObjectFactory> {
 public:
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};
class ZELTA_EXPORT CameraUnitMetadataFactory
    : public MetadataClassFactory<CameraUnitMetadata, AcquisitionMetadataObjectFactory> {
 public:
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};
class ZELTA_EXPORT UserDefinedAcquisitionMetadataFactory
    : public MetadataClassFactory<UserDefinedAcquisitionMetadata, AcquisitionMetadataObjectFactory> {
 public:
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

// The acquisition classes, in search order.
class ZELTA_EXPORT MXFAcquisitionMetadataModelFactory : public MXFMetadataModelFactory {
 public:
  MXFAcquisitionMetadataModelFactory();
  ~MXFAcquisitionMetadataModelFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

#endif
