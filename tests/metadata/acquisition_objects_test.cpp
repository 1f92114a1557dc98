#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <sstream>
#include <string>
#include <typeinfo>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/klv_output.h"
#include "support/metadata_structural.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const std::string lensSetKey = "06 0E 2B 34 02 53 01 01 0C 02 01 01 01 01 00 00";
const std::string cameraSetKey = "06 0E 2B 34 02 53 01 01 0C 02 01 01 02 01 00 00";
const std::string userDefinedSetKey = "06 0E 2B 34 02 53 01 01 0C 02 01 01 7F 01 00 00";
const std::string instanceUIDKey = "01: 01 01 15 02 00 00 00 00";
const std::string orderHintKey = "9C EF 38 E7 D8 04 25 C1 C3 D2 00 01 9C AD 11 E0";
const std::string udamSetIdentifierKey = "0D: 04 06 08 05 00 00 00 00";
const std::string orderedIdentifier = "96 69 08 00 46 78 03 1C 20 4F 12 34 F0 C0 11 81";

// Key, tag and octets of each property of a full set, in table order.
struct SpelledProperty {
  std::string key;
  std::uint16_t tag;
  std::string octets;
};

const std::vector<SpelledProperty> lensProperties{
    {"0D: 04 20 02 02 01 00 00 00", 0x8000, "00 01"}, {"0D: 04 20 02 02 08 00 00 00", 0x8008, "00 02"},
    {"0D: 04 20 02 02 09 00 00 00", 0x8009, "00 03"}, {"0D: 04 20 02 02 02 00 00 00", 0x8001, "8F FF"},
    {"0D: 04 20 02 02 03 00 00 00", 0x8002, "21 23"}, {"0D: 04 20 02 02 0A 00 00 00", 0x800A, "00 0A"},
    {"0D: 04 20 02 02 04 00 00 00", 0x8003, "01"},    {"0D: 04 20 02 02 05 00 00 00", 0x8004, "10 32"},
    {"0D: 04 20 02 02 06 00 00 00", 0x8005, "F0 01"}, {"0D: 04 20 02 02 0B 00 00 00", 0x800B, "00 0B"},
    {"0D: 04 20 02 02 07 00 00 00", 0x8006, "00 02"}, {"0D: 03 02 03 02 02 10 01 00", 0x8007, "5A 4F 4F 4D"},
};

const std::vector<SpelledProperty> cameraProperties{
    {"0D: 04 20 01 03 01 01 00 00", 0x8100, "06 0E 2B 34 04 01 01 0B 05 10 01 01 01 01 00 00"},
    {"0D: 04 20 01 03 01 0C 00 00", 0x8115, "01 90"},
    {"0D: 04 20 01 03 01 02 00 00", 0x8101, "01"},
    {"0D: 04 20 01 03 01 03 00 00", 0x8102, "02"},
    {"0D: 04 20 01 03 01 04 00 00", 0x8103, "00 04"},
    {"0D: 04 20 01 03 01 05 00 00", 0x8104, "07 80"},
    {"0D: 04 20 01 03 01 06 00 00", 0x8105, "04 38"},
    {"0D: 04 01 03 01 03 01 00 00", 0x8106, "00 00 00 19 00 00 00 01"},
    {"0D: 04 20 01 03 01 07 00 00", 0x8107, "03"},
    {"0D: 04 20 01 03 01 08 00 00", 0x8108, "00 00 46 50"},
    {"0D: 04 20 01 03 01 08 01 00", 0x8109, "00 00 00 01 00 00 00 32"},
    {"0D: 04 20 01 03 01 09 00 00", 0x810A, "FF 9C"},
    {"0D: 04 20 01 03 01 0A 00 00", 0x810B, "03 20"},
    {"0D: 04 20 01 03 01 0D 00 00", 0x8118, "00 00 00 02 00 00 00 08 00 00 00 01 00 00 00 02 FF FF FF FF 00 00 00 03"},
    {"0D: 04 20 01 03 01 0B 00 00", 0x810C, "00 02"},
    {"0D: 04 20 01 03 02 01 00 00", 0x810D, "04"},
    {"0D: 04 20 01 03 02 02 00 00", 0x810E, "14 50"},
    {"0D: 04 20 01 03 02 03 00 00", 0x810F, "00 03"},
    {"0D: 04 20 01 03 02 04 00 00", 0x8110, "27 10"},
    {"0D: 04 20 01 03 02 05 00 00", 0x8111, "00 00 00 01 00 00 00 02"},
    {"0D: 04 20 01 03 02 06 00 00", 0x8112, "01 90"},
    {"02: 04 01 02 01 01 01 02 00", 0x3210, "06 0E 2B 34 04 01 01 01 04 01 01 01 01 01 00 00"},
    {"0D: 04 20 01 03 02 07 00 00", 0x8116, "01"},
    {"0D: 04 20 01 03 02 08 00 00", 0x8117, "00 00 00 02 00 00 00 02 3C 00 BC 00"},
    {"0D: 01 02 01 08 02 00 00 00", 0x8113, "66 69 6C 65 3A 2F 2F 61"},
    {"0D: 03 02 03 02 02 10 02 00", 0x8114, "43 41 4D"},
};

MXFKeyToTagMap primerOf(const std::vector<SpelledProperty>& properties) {
  MXFKeyToTagMap primer{{propertyKeyOf(instanceUIDKey), 0x3C0A}};
  for (const SpelledProperty& property : properties) primer[propertyKeyOf(property.key)] = property.tag;
  return primer;
}

MXFPropertyMap propertiesOf(const std::vector<SpelledProperty>& properties) {
  MXFPropertyMap map;
  for (const SpelledProperty& property : properties) map[propertyKeyOf(property.key)] = bytesOf(property.octets);
  return map;
}

// The hint's value: a batch of keys of item size 16.
ByteVector hintOf(const std::vector<KLVKey>& keys) {
  ByteVector bytes = uint32Bytes(static_cast<std::uint32_t>(keys.size()));
  const ByteVector itemSize = uint32Bytes(16);
  bytes.insert(bytes.end(), itemSize.begin(), itemSize.end());
  for (const KLVKey& key : keys) bytes.insert(bytes.end(), key.data(), key.data() + 16);
  return bytes;
}

// The hint of a full set: the instance identifier, then the table's keys.
ByteVector tableHintOf(const std::vector<SpelledProperty>& properties) {
  std::vector<KLVKey> keys{propertyKeyOf(instanceUIDKey)};
  for (const SpelledProperty& property : properties) keys.push_back(propertyKeyOf(property.key));
  return hintOf(keys);
}

// What the factory of a full set codes: the set as read, with its hint.
MXFPropertyMap fullSetWithHint(MetadataRootFactory& factory, const std::vector<SpelledProperty>& properties) {
  MXFPropertyMap expected = primedSetOf(factory.getSetKey(), 1, propertiesOf(properties)).properties;
  expected[keyOf(orderHintKey)] = tableHintOf(properties);
  return expected;
}

KLVKey darkKey(const std::string& tag) { return keyOf("9C EF 38 E7 D8 04 25 C1 C3 D1 " + tag + " 9C AD 11 E0"); }

template <typename T>
std::shared_ptr<T> parsedWith(MetadataRootFactory& factory, FactoryParse& run, const MXFPropertyMap& properties) {
  return std::dynamic_pointer_cast<T>(run.parse(factory, primedSetOf(factory.getSetKey(), 1, properties)).object);
}

ByteVector hintCodedBy(MetadataRootFactory& factory, const std::shared_ptr<const MetadataRoot>& object) {
  return codeWith(factory, object).at(keyOf(orderHintKey));
}

std::shared_ptr<UserDefinedAcquisitionMetadata> userDefinedWithDarkItems(const std::string& identifier) {
  std::shared_ptr<UserDefinedAcquisitionMetadata> set = UserDefinedAcquisitionMetadata::create();
  set->setUDAMSetIdentifier(keyOf(identifier));
  for (const char* tag : {"E1 00", "E2 01", "E2 02", "E2 03", "80 07"})
    set->setDarkProperty(darkKey(tag), bytesOf("01"));
  return set;
}

}  // namespace

TEST(AcquisitionFactories, SetKeysAreThoseOfTheTables) {
  EXPECT_EQ(keyOf(lensSetKey), LensUnitMetadataFactory().getSetKey());
  EXPECT_EQ(keyOf(cameraSetKey), CameraUnitMetadataFactory().getSetKey());
  EXPECT_EQ(keyOf(userDefinedSetKey), UserDefinedAcquisitionMetadataFactory().getSetKey());
}

TEST(AcquisitionFactories, SetPrimersHoldTheStaticTagsWithoutAGenerationIdentifier) {
  EXPECT_EQ(primerOf(lensProperties), LensUnitMetadataFactory().getSetPrimer());
  EXPECT_EQ(primerOf(cameraProperties), CameraUnitMetadataFactory().getSetPrimer());
  EXPECT_EQ(primerOf({{udamSetIdentifierKey, 0xE000, ""}}), UserDefinedAcquisitionMetadataFactory().getSetPrimer());
}

TEST(AcquisitionFactories, CaptureGammaEquationSharesKeyAndTagWithTheCaptureGamma) {
  EXPECT_EQ(0x3210, CameraUnitMetadataFactory().getSetPrimer().at(propertyKeyOf("02: 04 01 02 01 01 01 02 00")));
  EXPECT_EQ(0x3210, PictureDescriptorFactory().getSetPrimer().at(propertyKeyOf("02: 04 01 02 01 01 01 02 00")));
}

TEST(MXFAcquisitionMetadataModelFactory, SubFactoriesInSearchOrder) {
  MXFAcquisitionMetadataModelFactory composite;
  std::vector<std::string> types;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories())
    types.push_back(dynamic_cast<MetadataRootFactory&>(*factory).getType().name());
  EXPECT_EQ((std::vector<std::string>{typeid(LensUnitMetadata).name(), typeid(CameraUnitMetadata).name(),
                                      typeid(UserDefinedAcquisitionMetadata).name()}),
            types);
  EXPECT_TRUE(composite.canParse(keyOf(cameraSetKey)));
  EXPECT_FALSE(composite.canParse(PrefaceFactory().getSetKey()));
  EXPECT_FALSE(MXFFormatMetadataModelFactory().canParse(keyOf(lensSetKey)));
}

TEST(AcquisitionMetadataObject, HasNoGenerationIdentifier) {
  std::shared_ptr<MetadataRoot> lens = LensUnitMetadata::create();
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<AcquisitionMetadataObject>(lens));
  EXPECT_EQ(nullptr, std::dynamic_pointer_cast<MetadataObject>(lens));
}

TEST(LensUnitMetadata, OptionalValuesCheckWhenUnset) {
  std::shared_ptr<LensUnitMetadata> lens = LensUnitMetadata::create();
  EXPECT_FALSE(lens->hasFocusRingPosition());
  EXPECT_EQ("assertion failure: LensUnitMetadata.focusRingPosition is present",
            failureOf([&] { lens->getFocusRingPosition(); }));
  EXPECT_EQ("assertion failure: LensUnitMetadata.lensAttributes is present",
            failureOf([&] { lens->getLensAttributes(); }));
  lens->setFocusRingPosition(7);
  EXPECT_TRUE(lens->hasFocusRingPosition());
  EXPECT_EQ(7, lens->getFocusRingPosition());
  lens->removeFocusRingPosition();
  EXPECT_FALSE(lens->hasFocusRingPosition());
}

TEST(CameraUnitMetadata, AccessorsKeepTheInitials) {
  std::shared_ptr<CameraUnitMetadata> camera = CameraUnitMetadata::create();
  camera->setISOSensitivity(800);
  camera->setASCCDL({Binary16(1.0f)});
  camera->setCameraSettingFileURI("file://a");
  camera->setGammaForCDL(1);
  EXPECT_EQ(800, camera->getISOSensitivity());
  EXPECT_EQ(std::vector<Binary16>{Binary16(1.0f)}, camera->getASCCDL());
  EXPECT_EQ("file://a", camera->getCameraSettingFileURI());
  EXPECT_EQ(1, camera->getGammaForCDL());
  EXPECT_EQ("assertion failure: CameraUnitMetadata.colourMatrix is present",
            failureOf([&] { camera->getColourMatrix(); }));
  camera->removeASCCDL();
  EXPECT_FALSE(camera->hasASCCDL());
}

TEST(UserDefinedAcquisitionMetadata, SetIdentifierIsRequired) {
  std::shared_ptr<UserDefinedAcquisitionMetadata> set = UserDefinedAcquisitionMetadata::create();
  EXPECT_EQ(KLVKey(), set->getUDAMSetIdentifier());
  set->setUDAMSetIdentifier(keyOf(orderedIdentifier));
  EXPECT_EQ(keyOf(orderedIdentifier), set->getUDAMSetIdentifier());
}

TEST(LensUnitMetadataFactory, RoundTripOfEveryProperty) {
  LensUnitMetadataFactory factory;
  FactoryParse run;
  std::shared_ptr<LensUnitMetadata> lens = parsedWith<LensUnitMetadata>(factory, run, propertiesOf(lensProperties));
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(1, lens->getIrisInFNumber());
  EXPECT_EQ(2, lens->getIrisInTNumber());
  EXPECT_EQ(3, lens->getIrisRingPosition());
  EXPECT_EQ((Decimal16{0xFFF, -8}), lens->getFocusPositionFromImagePlane());
  EXPECT_EQ((Decimal16{0x123, 2}), lens->getFocusPositionFromFrontLensVertex());
  EXPECT_EQ(10, lens->getFocusRingPosition());
  EXPECT_TRUE(lens->getMacroSetting());
  EXPECT_EQ((Decimal16{0x032, 1}), lens->getLensZoom35mmStillCameraEquivalent());
  EXPECT_EQ((Decimal16{0x001, -1}), lens->getLensZoomActualFocalLength());
  EXPECT_EQ(11, lens->getZoomRingPosition());
  EXPECT_EQ(2, lens->getOpticalExtenderMagnification());
  EXPECT_EQ("ZOOM", lens->getLensAttributes());

  EXPECT_EQ(fullSetWithHint(factory, lensProperties), codeWith(factory, lens));
}

TEST(CameraUnitMetadataFactory, RoundTripOfEveryProperty) {
  CameraUnitMetadataFactory factory;
  FactoryParse run;
  std::shared_ptr<CameraUnitMetadata> camera =
      parsedWith<CameraUnitMetadata>(factory, run, propertiesOf(cameraProperties));
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(keyOf("06 0E 2B 34 04 01 01 0B 05 10 01 01 01 01 00 00"), camera->getAutoExposureMode());
  EXPECT_EQ(400, camera->getExposureIndexOfPhotoMeter());
  EXPECT_EQ(1, camera->getAutoFocusSensingAreaSetting());
  EXPECT_EQ(2, camera->getColourCorrectionFilterWheelSetting());
  EXPECT_EQ(4, camera->getNeutralDensityFilterWheelSetting());
  EXPECT_EQ(1920, camera->getImageSensorEffectiveWidth());
  EXPECT_EQ(1080, camera->getImageSensorEffectiveHeight());
  EXPECT_EQ((MXFRational{25, 1}), camera->getCaptureFrameRate());
  EXPECT_EQ(3, camera->getImageSensorReadoutMode());
  EXPECT_EQ(18000u, camera->getShutterSpeedAngle());
  EXPECT_EQ((MXFRational{1, 50}), camera->getShutterSpeedTime());
  EXPECT_EQ(-100, camera->getCameraMasterGainAdjustment());
  EXPECT_EQ(800, camera->getISOSensitivity());
  EXPECT_EQ((std::vector<MXFRational>{{1, 2}, {-1, 3}}), camera->getColourMatrix());
  EXPECT_EQ(2, camera->getElectricalExtenderMagnification());
  EXPECT_EQ(4, camera->getAutoWhiteBalanceMode());
  EXPECT_EQ(5200, camera->getWhiteBalance());
  EXPECT_EQ(3, camera->getCameraMasterBlackLevel());
  EXPECT_EQ(10000, camera->getCameraKneePoint());
  EXPECT_EQ((MXFRational{1, 2}), camera->getCameraKneeSlope());
  EXPECT_EQ(400, camera->getCameraLuminanceDynamicRange());
  EXPECT_EQ(keyOf("06 0E 2B 34 04 01 01 01 04 01 01 01 01 01 00 00"), camera->getCaptureGammaEquation());
  EXPECT_EQ(1, camera->getGammaForCDL());
  EXPECT_EQ((std::vector<Binary16>{Binary16(1.0f), Binary16(-1.0f)}), camera->getASCCDL());
  EXPECT_EQ("file://a", camera->getCameraSettingFileURI());
  EXPECT_EQ("CAM", camera->getCameraAttributes());

  EXPECT_EQ(fullSetWithHint(factory, cameraProperties), codeWith(factory, camera));
}

TEST(UserDefinedAcquisitionMetadataFactory, RoundTripOfTheSetIdentifierAndDarkItems) {
  UserDefinedAcquisitionMetadataFactory factory;
  FactoryParse run;
  MXFPropertyMap properties{{propertyKeyOf(udamSetIdentifierKey), bytesOf(orderedIdentifier)},
                            {darkKey("E2 01"), bytesOf("00 01")},
                            {darkKey("E1 00"), bytesOf("02")}};
  std::shared_ptr<UserDefinedAcquisitionMetadata> set =
      parsedWith<UserDefinedAcquisitionMetadata>(factory, run, properties);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(keyOf(orderedIdentifier), set->getUDAMSetIdentifier());
  EXPECT_EQ(bytesOf("00 01"), set->getDarkProperty(darkKey("E2 01")));
  EXPECT_EQ(bytesOf("02"), set->getDarkProperty(darkKey("E1 00")));

  MXFPropertyMap expected = primedSetOf(factory.getSetKey(), 1, properties).properties;
  expected[keyOf(orderHintKey)] =
      hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf(udamSetIdentifierKey), darkKey("E2 01")});
  EXPECT_EQ(expected, codeWith(factory, set));
}

TEST(UserDefinedAcquisitionMetadataFactory, SetWithoutIdentifierReportsItMissing) {
  UserDefinedAcquisitionMetadataFactory factory;
  FactoryParse run;
  parsedWith<UserDefinedAcquisitionMetadata>(factory, run, {});
  EXPECT_EQ(std::vector<std::string>{"error 02 missing UserDefinedAcquisitionMetadata.udamSetIdentifier"},
            run.reports());
  EXPECT_EQ(missingPropertyId, run.errors->reports.at(0).identifier);
}

TEST(LensUnitMetadataFactory, SetWithOnlyFocusRingPositionHintsTheIdentifierThenIt) {
  LensUnitMetadataFactory factory;
  std::shared_ptr<LensUnitMetadata> lens = LensUnitMetadata::create();
  lens->setFocusRingPosition(10);
  EXPECT_EQ(hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf("0D: 04 20 02 02 0A 00 00 00")}),
            hintCodedBy(factory, lens));
}

TEST(LensUnitMetadataFactory, DarkItemsComeBackUnderTheirKeysBehindTheHint) {
  LensUnitMetadataFactory factory;
  std::shared_ptr<LensUnitMetadata> lens = LensUnitMetadata::create();
  lens->setZoomRingPosition(3);
  lens->setDarkProperty<std::uint16_t>(acquisitionDarkItemKey(0xE123), 0x0102);
  const MXFPropertyMap coded = codeWith(factory, lens);
  EXPECT_EQ(bytesOf("01 02"), coded.at(darkKey("E1 23")));
  EXPECT_EQ(hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf("0D: 04 20 02 02 0B 00 00 00")}),
            coded.at(keyOf(orderHintKey)));
}

TEST(UserDefinedAcquisitionMetadataFactory, MatchingIdentifierHintsTheFourDarkItemsInTheirOrder) {
  UserDefinedAcquisitionMetadataFactory factory;
  EXPECT_EQ(hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf(udamSetIdentifierKey), darkKey("E2 03"),
                    darkKey("E2 01"), darkKey("E2 02"), darkKey("80 07")}),
            hintCodedBy(factory, userDefinedWithDarkItems(orderedIdentifier)));
  // Octets 10 and 11 of the identifier don't count.
  EXPECT_EQ(hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf(udamSetIdentifierKey), darkKey("E2 03"),
                    darkKey("E2 01"), darkKey("E2 02"), darkKey("80 07")}),
            hintCodedBy(factory, userDefinedWithDarkItems("96 69 08 00 46 78 03 1C 20 4F FF 00 F0 C0 11 81")));
}

TEST(UserDefinedAcquisitionMetadataFactory, IdentifierThatDoesNotMatchGetsNoFurtherHintEntries) {
  UserDefinedAcquisitionMetadataFactory factory;
  for (const char* identifier :
       {"96 69 08 01 46 78 03 1C 20 4F 12 34 F0 C0 11 81", "96 69 08 00 46 78 03 1C 20 4F 12 34 F0 C0 11 82"})
    EXPECT_EQ(hintOf({propertyKeyOf(instanceUIDKey), propertyKeyOf(udamSetIdentifierKey)}),
              hintCodedBy(factory, userDefinedWithDarkItems(identifier)))
        << identifier;
}

TEST(LensUnitMetadataFactory, Decimal16WithExponentMinus8ReadsBackAsWritten) {
  LensUnitMetadataFactory factory;
  FactoryParse run;
  const KLVKey key = propertyKeyOf("0D: 04 20 02 02 02 00 00 00");
  std::shared_ptr<LensUnitMetadata> lens = parsedWith<LensUnitMetadata>(factory, run, {{key, bytesOf("8F FF")}});
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(-8, lens->getFocusPositionFromImagePlane().exponent);
  EXPECT_EQ(0x0FFF, lens->getFocusPositionFromImagePlane().mantissa);
  EXPECT_EQ(bytesOf("8F FF"), codeWith(factory, lens).at(key));
}

TEST(LensUnitMetadataFactory, Decimal16OutOfRangeFailsTheCoder) {
  LensUnitMetadataFactory factory;
  std::shared_ptr<LensUnitMetadata> lens = LensUnitMetadata::create();
  lens->setLensZoomActualFocalLength(Decimal16{0x001, 8});
  EXPECT_EQ("assertion failure: valid exponent", failureOf([&] { codeWith(factory, lens); }));
  lens->setLensZoomActualFocalLength(Decimal16{0x1000, 0});
  EXPECT_EQ("assertion failure: valid mantissa", failureOf([&] { codeWith(factory, lens); }));
}

TEST(CameraUnitMetadataFactory, InvalidValueIsReportedByItsName) {
  CameraUnitMetadataFactory factory;
  FactoryParse run;
  std::shared_ptr<CameraUnitMetadata> camera = parsedWith<CameraUnitMetadata>(
      factory, run, {{propertyKeyOf("0D: 04 20 01 03 01 08 00 00"), bytesOf("00 00 46 50 00")}});
  EXPECT_EQ(std::vector<std::string>{"error 03 invalid CameraUnitMetadata.shutterSpeedAngle value - assertion "
                                     "failure: valid external length"},
            run.reports());
  EXPECT_FALSE(camera->hasShutterSpeedAngle());
}

TEST(CameraUnitMetadataFactory, CodingAnotherClassFailsWithTheClassName) {
  CameraUnitMetadataFactory factory;
  EXPECT_EQ("assertion failure: object is a CameraUnitMetadata",
            failureOf([&] { codeWith(factory, LensUnitMetadata::create()); }));
}

TEST(AcquisitionDarkItems, KeyCarriesTheTagAndMatchesWhateverOctets7_10And11) {
  EXPECT_EQ(darkKey("E1 23"), acquisitionDarkItemKey(0xE123));
  EXPECT_EQ(0xE123, acquisitionDarkItemTag(acquisitionDarkItemKey(0xE123)));
  EXPECT_TRUE(MXFAcquisitionDarkItemPattern.matches(keyOf("9C EF 38 E7 D8 04 25 01 C3 D1 00 00 9C AD 11 E0")));
  EXPECT_TRUE(MXFAcquisitionDarkItemPattern.matches(keyOf("9C EF 38 E7 D8 04 25 C1 C3 D1 FF FF 9C AD 11 E0")));
  EXPECT_FALSE(MXFAcquisitionDarkItemPattern.matches(keyOf(orderHintKey)));
  EXPECT_FALSE(MXFAcquisitionDarkItemPattern.matches(keyOf("9C EF 38 E7 D8 04 25 C1 C3 D1 E1 23 9C AD 11 E1")));
}

TEST(AcquisitionDarkItems, NumbersAreKeptAsBigEndianOctets) {
  std::shared_ptr<CameraUnitMetadata> camera = CameraUnitMetadata::create();
  camera->setDarkProperty<std::uint16_t>(acquisitionDarkItemKey(0xE201), 0xABCD);
  EXPECT_EQ(bytesOf("AB CD"), camera->getDarkProperty(darkKey("E2 01")));
}

TEST(AcquisitionDarkItems, UnknownItemOfALensSetStaysDarkAndReturns) {
  LensUnitMetadataFactory factory;
  FactoryParse run;
  std::shared_ptr<LensUnitMetadata> lens =
      parsedWith<LensUnitMetadata>(factory, run, {{darkKey("E1 23"), bytesOf("12 34 56")}});
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(bytesOf("12 34 56"), lens->getDarkProperty(acquisitionDarkItemKey(0xE123)));
  EXPECT_EQ(bytesOf("12 34 56"), codeWith(factory, lens).at(darkKey("E1 23")));
}

TEST(AcquisitionFactories, EveryClassDescribesItsWholeSetPrimer) {
  MXFAcquisitionMetadataModelFactory composite;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories()) {
    const MetadataRootFactory& single = dynamic_cast<const MetadataRootFactory&>(*factory);
    EXPECT_EQ(single.getSetPrimer().size(), single.getPropertyDescriptions().size()) << single.getClassName();
  }
  const LensUnitMetadataFactory lens;
  const MXFPropertyDescription& attributes =
      lens.getPropertyDescriptions().at(propertyKeyOf("0D: 03 02 03 02 02 10 01 00"));
  EXPECT_EQ("LensUnitMetadata.lensAttributes", attributes.name);
  EXPECT_EQ(MXFPropertyKind::narrowString, attributes.kind);
}

// Through the model coder and the set coder, the hint puts the items of a
// camera set in table order, not in key order.
TEST(CameraUnitMetadataFactory, CodedItemsFollowTheTableOrder) {
  std::shared_ptr<CameraUnitMetadata> camera = CameraUnitMetadata::create();
  camera->setCaptureGammaEquation(keyOf("06 0E 2B 34 04 01 01 01 04 01 01 01 01 01 00 00"));
  camera->setISOSensitivity(800);
  camera->setAutoExposureMode(keyOf("06 0E 2B 34 04 01 01 0B 05 10 01 01 01 01 00 00"));
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFMetadataCoder sets(&writer);
  MXFMetadataModelCoder coder(&sets, std::make_shared<MXFAcquisitionMetadataModelFactory>());
  coder.start();
  coder.model({camera});
  coder.end();
  RecordingKLVHandler items;
  readThrough(klv::outputOf(out), items);
  std::vector<std::string> tags;
  for (const std::string& event : items.events)
    if (event.rfind("startLocalItem", 0) == 0) tags.push_back(event.substr(0, event.rfind(' ')));
  EXPECT_EQ((std::vector<std::string>{
                "startLocalItem " + std::to_string(0x3C0A), "startLocalItem " + std::to_string(0x8100),
                "startLocalItem " + std::to_string(0x810B), "startLocalItem " + std::to_string(0x3210)}),
            tags);
}
