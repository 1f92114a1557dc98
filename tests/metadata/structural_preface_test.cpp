#include <ctime>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/metadata_structural.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

std::string what(const util::assertion_failure& failure) { return failure.what(); }

std::time_t secondsOf(const MXFTimestamp& timestamp) {
  std::tm utc{};
  utc.tm_year = timestamp.year - 1900;
  utc.tm_mon = timestamp.month - 1;
  utc.tm_mday = timestamp.day;
  utc.tm_hour = timestamp.hour;
  utc.tm_min = timestamp.minute;
  utc.tm_sec = timestamp.second;
  return timegm(&utc);
}

KLVKey setKey(std::uint8_t classOctet) {
  KLVKey key = keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 00 00");
  ByteVector octets(key.data(), key.data() + 16);
  octets[14] = classOctet;
  return KLVKey(octets.data());
}

const std::string op1a = "06 0E 2B 34 04 01 01 01 0D 01 02 01 01 01 09 00";
const std::string d10Container = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01";

// A Preface with two Identifications and a ContentStorage of a material
// package, a source package with its descriptor, and essence container
// data; the primary package is the material package.
std::shared_ptr<Preface> plainModel() {
  std::shared_ptr<Preface> preface = Preface::create();
  preface->addIdentification(Identification::create());
  preface->addIdentification(Identification::create());
  std::shared_ptr<ContentStorage> storage = ContentStorage::create();
  preface->setContentStorage(storage);
  std::shared_ptr<MaterialPackage> material = MaterialPackage::create();
  std::shared_ptr<SourcePackage> source = SourcePackage::create();
  for (const std::shared_ptr<GenericPackage>& package : {std::shared_ptr<GenericPackage>(material),
                                                          std::shared_ptr<GenericPackage>(source)}) {
    std::shared_ptr<TimelineTrack> track = TimelineTrack::create();
    std::shared_ptr<Sequence> sequence = Sequence::create();
    sequence->addComponent(SourceClip::create());
    track->setSegment(sequence);
    package->addTrack(track);
    storage->addPackage(package);
  }
  source->setDescriptor(GenericDescriptor::create());
  storage->addEssenceContainerData(EssenceContainerData::create());
  preface->setPrimaryPackage(material);
  return preface;
}

}  // namespace

TEST(PrefaceFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  PrefaceFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 2F 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({{"02: 07 02 01 10 02 04 00 00", 0x3B02},
                              {"02: 03 01 02 01 05 00 00 00", 0x3B05},
                              {"02: 03 01 02 01 04 00 00 00", 0x3B07},
                              {"04: 06 01 01 04 01 08 00 00", 0x3B08},
                              {"02: 06 01 01 04 06 04 00 00", 0x3B06},
                              {"02: 06 01 01 04 02 01 00 00", 0x3B03},
                              {"05: 01 02 02 03 00 00 00 00", 0x3B09},
                              {"05: 01 02 02 10 02 01 00 00", 0x3B0A},
                              {"05: 01 02 02 10 02 02 00 00", 0x3B0B}}),
            factory.getSetPrimer());
}

TEST(IdentificationFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  IdentificationFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 30 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({{"02: 05 20 07 01 01 00 00 00", 0x3C09},
                              {"02: 05 20 07 01 02 01 00 00", 0x3C01},
                              {"02: 05 20 07 01 03 01 00 00", 0x3C02},
                              {"02: 05 20 07 01 04 00 00 00", 0x3C03},
                              {"02: 05 20 07 01 05 01 00 00", 0x3C04},
                              {"02: 05 20 07 01 07 00 00 00", 0x3C05},
                              {"02: 07 02 01 10 02 03 00 00", 0x3C06},
                              {"02: 05 20 07 01 0A 00 00 00", 0x3C07},
                              {"02: 05 20 07 01 06 01 00 00", 0x3C08}}),
            factory.getSetPrimer());
}

TEST(Preface, NewPrefaceHasVersion0102AndThePresentTime) {
  const std::time_t before = std::time(nullptr);
  std::shared_ptr<Preface> preface = Preface::create();
  const std::time_t after = std::time(nullptr);
  EXPECT_EQ(0x0102, preface->getVersion());
  EXPECT_LE(before, secondsOf(preface->getLastModifiedDate()));
  EXPECT_GE(after, secondsOf(preface->getLastModifiedDate()));
  EXPECT_EQ(0, preface->getLastModifiedDate().quarterMillisecond);
  EXPECT_FALSE(preface->hasObjectModelVersion());
  EXPECT_FALSE(preface->hasPrimaryPackage());
  EXPECT_EQ(nullptr, preface->getContentStorage());
  EXPECT_TRUE(preface->getDMSchemes().empty());
}

TEST(Identification, NewIdentificationHasAFreshGenerationAndThePresentTime) {
  const std::time_t before = std::time(nullptr);
  std::shared_ptr<Identification> identification = Identification::create();
  const std::time_t after = std::time(nullptr);
  EXPECT_NE(MXFUID(), identification->getThisGenerationUID());
  EXPECT_NE(identification->getThisGenerationUID(), Identification::create()->getThisGenerationUID());
  EXPECT_LE(before, secondsOf(identification->getModificationDate()));
  EXPECT_GE(after, secondsOf(identification->getModificationDate()));
  EXPECT_FALSE(identification->hasProductVersion());
  EXPECT_FALSE(identification->hasToolkitVersion());
  EXPECT_FALSE(identification->hasPlatform());
}

TEST(PrefaceFactory, ParseGivesTheValuesAndTheReferencesWithTheirStrength) {
  PrefaceFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(
      factory.getSetKey(), 1,
      {{propertyKeyOf("02: 07 02 01 10 02 04 00 00"), bytesOf("07 DB 0A 1F 0C 22 38 02")},
       {propertyKeyOf("02: 03 01 02 01 05 00 00 00"), bytesOf("01 03")},
       {propertyKeyOf("02: 03 01 02 01 04 00 00 00"), bytesOf("00 00 00 01")},
       {propertyKeyOf("04: 06 01 01 04 01 08 00 00"), uidBytes(0x05)},
       {propertyKeyOf("02: 06 01 01 04 06 04 00 00"), uidBatch({0x02, 0x03})},
       {propertyKeyOf("02: 06 01 01 04 02 01 00 00"), uidBytes(0x04)},
       {propertyKeyOf("05: 01 02 02 03 00 00 00 00"), bytesOf(op1a)},
       {propertyKeyOf("05: 01 02 02 10 02 01 00 00"), bytesOf("00 00 00 01 00 00 00 10 " + d10Container)},
       {propertyKeyOf("05: 01 02 02 10 02 02 00 00"), bytesOf("00 00 00 00 00 00 00 10")}});
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<Preface> preface = std::dynamic_pointer_cast<Preface>(parsed.object);
  ASSERT_NE(nullptr, preface);
  EXPECT_EQ(2, preface->getLastModifiedDate().quarterMillisecond);
  EXPECT_EQ(0x0103, preface->getVersion());
  EXPECT_EQ(1u, preface->getObjectModelVersion());
  EXPECT_EQ(keyOf(op1a), preface->getOperationalPattern());
  EXPECT_EQ(std::vector<KLVKey>{keyOf(d10Container)}, preface->getEssenceContainers());
  EXPECT_TRUE(preface->getDMSchemes().empty());
  ASSERT_EQ(4u, parsed.references.size());
  EXPECT_FALSE(parsed.references.find(uidOf(0x05))->second->isStrong());
  EXPECT_TRUE(parsed.references.find(uidOf(0x04))->second->isStrong());
  EXPECT_TRUE(parsed.references.find(uidOf(0x02))->second->isStrong());
}

TEST(PrefaceFactory, IdentificationsComeBeforeTheContentStorageAndThePrimaryPackageIsNoneOfThem) {
  std::shared_ptr<Preface> preface = plainModel();
  PrefaceFactory factory;
  MXFReferencedObjects referenced;
  MXFPropertyMap properties = codeWith(factory, preface, referenced);
  EXPECT_EQ((MXFReferencedObjects{preface->getIdentificationAt(0), preface->getIdentificationAt(1),
                                  preface->getContentStorage()}),
            referenced);
  const MXFUID& primary = preface->getPrimaryPackage()->getInstanceUID();
  EXPECT_EQ(ByteVector(primary.data(), primary.data() + 16),
            properties.at(propertyKeyOf("04: 06 01 01 04 01 08 00 00")));
  EXPECT_EQ(0u, properties.count(propertyKeyOf("02: 03 01 02 01 04 00 00 00")));
}

TEST(MXFMetadataModelCoder, PlainModelComesInTreeOrderWithEssenceContainerDataLast) {
  std::vector<KLVKey> expected;
  for (std::uint8_t classOctet : {0x2F, 0x30, 0x30, 0x18, 0x36, 0x3B, 0x0F, 0x11, 0x37, 0x3B, 0x0F, 0x11})
    expected.push_back(setKey(classOctet));
  expected.push_back(GenericDescriptorFactory().getSetKey());
  expected.push_back(setKey(0x23));
  EXPECT_EQ(expected, codedSetKeys(plainModel()));
}

TEST(MXFMetadataModelParser, CodedPlainModelParsesBackIntoOneConnectedTree) {
  std::shared_ptr<Preface> original = plainModel();
  ModelParse run;
  RecordingMetadataHandler coded;
  MXFMetadataModelCoder coder(&coded, std::make_shared<StructuralModelFactory>());
  coder.model(MXFMetadataModel{original});
  MXFMetadataModel model = run.parse(coded.sets);
  EXPECT_TRUE(run.reports().empty());
  ASSERT_EQ(1u, model.size());
  std::shared_ptr<Preface> preface = std::dynamic_pointer_cast<Preface>(model[0]);
  ASSERT_NE(nullptr, preface);
  EXPECT_EQ(2u, preface->getIdentificationCount());
  EXPECT_EQ(original->getIdentificationAt(1)->getThisGenerationUID(),
            preface->getIdentificationAt(1)->getThisGenerationUID());
  std::shared_ptr<ContentStorage> storage = preface->getContentStorage();
  ASSERT_EQ(2u, storage->getPackageCount());
  EXPECT_EQ(storage->getPackageAt(0), preface->getPrimaryPackage());
  std::shared_ptr<SourcePackage> source = std::dynamic_pointer_cast<SourcePackage>(storage->getPackageAt(1));
  ASSERT_NE(nullptr, source);
  EXPECT_NE(nullptr, source->getDescriptor());
  EXPECT_EQ(1u, storage->getEssenceContainerDataCount());
}

TEST(Preface, PrimaryPackageIsWeakAndItsGetterChecksOnlyThatItWasSet) {
  std::shared_ptr<Preface> preface = Preface::create();
  try {
    preface->getPrimaryPackage();
    FAIL() << "an unset primary package was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Preface.primaryPackage is present", what(failure));
  }
  std::shared_ptr<MaterialPackage> package = MaterialPackage::create();
  preface->setPrimaryPackage(package);
  EXPECT_EQ(package, package->getTopOwner());
  EXPECT_EQ(package, preface->getPrimaryPackage());
  package.reset();
  EXPECT_TRUE(preface->hasPrimaryPackage());
  EXPECT_EQ(nullptr, preface->getPrimaryPackage());
  preface->removePrimaryPackage();
  EXPECT_FALSE(preface->hasPrimaryPackage());
}

TEST(PrefaceFactory, CodingAnExpiredPrimaryPackageFails) {
  std::shared_ptr<Preface> preface = plainModel();
  preface->setPrimaryPackage(MaterialPackage::create());
  PrefaceFactory factory;
  try {
    codeWith(factory, preface);
    FAIL() << "an expired primary package was coded";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Preface.primaryPackage is present", what(failure));
  }
}

TEST(PrefaceFactory, CodingWithoutContentStorageFails) {
  PrefaceFactory factory;
  try {
    codeWith(factory, Preface::create());
    FAIL() << "a preface without content storage was coded";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Preface.contentStorage is present", what(failure));
  }
}

TEST(Preface, RemoveIdentificationAtReleasesItAndChecksTheIndex) {
  std::shared_ptr<Preface> preface = plainModel();
  std::shared_ptr<Identification> first = preface->getIdentificationAt(0);
  std::shared_ptr<Identification> second = preface->getIdentificationAt(1);
  preface->removeIdentificationAt(0);
  EXPECT_EQ(first, first->getTopOwner());
  EXPECT_EQ(second, preface->getIdentificationAt(0));
  try {
    preface->removeIdentificationAt(1);
    FAIL() << "an identification past the end was removed";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: valid index", what(failure));
  }
}

TEST(IdentificationFactory, ParseAndCodeOfEveryProperty) {
  IdentificationFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(
      factory.getSetKey(), 1,
      {{propertyKeyOf("02: 05 20 07 01 01 00 00 00"), uidBytes(0x21)},
       {propertyKeyOf("02: 05 20 07 01 02 01 00 00"), bytesOf("00 4F 00 72 00 76")},
       {propertyKeyOf("02: 05 20 07 01 03 01 00 00"), bytesOf("00 5A")},
       {propertyKeyOf("02: 05 20 07 01 04 00 00 00"), bytesOf("00 04 00 00 00 00 00 00 00 4A")},
       {propertyKeyOf("02: 05 20 07 01 05 01 00 00"), bytesOf("00 34 00 2E 00 30")},
       {propertyKeyOf("02: 05 20 07 01 07 00 00 00"), uidBytes(0x22)},
       {propertyKeyOf("02: 07 02 01 10 02 03 00 00"), bytesOf("07 DB 0A 1F 0C 22 38 00")},
       {propertyKeyOf("02: 05 20 07 01 0A 00 00 00"), bytesOf("00 04 00 00 00 00 00 4A 00 01")},
       {propertyKeyOf("02: 05 20 07 01 06 01 00 00"), bytesOf("00 4C 00 78")}});
  std::shared_ptr<Identification> identification =
      std::dynamic_pointer_cast<Identification>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(uidOf(0x21), identification->getThisGenerationUID());
  EXPECT_EQ(L"Orv", identification->getCompanyName());
  EXPECT_EQ(L"Z", identification->getProductName());
  EXPECT_EQ(74, identification->getProductVersion().release);
  EXPECT_EQ(L"4.0", identification->getVersionString());
  EXPECT_EQ(uidOf(0x22), identification->getProductUID());
  EXPECT_EQ(31, identification->getModificationDate().day);
  EXPECT_EQ(74, identification->getToolkitVersion().patch);
  EXPECT_EQ(L"Lx", identification->getPlatform());
  EXPECT_EQ(set.properties, codeWith(factory, identification));
}

TEST(Identification, GettersOfUnsetOptionalValuesCheck) {
  std::shared_ptr<Identification> identification = Identification::create();
  try {
    identification->getPlatform();
    FAIL() << "an unset platform was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Identification.platform is present", what(failure));
  }
  try {
    identification->getToolkitVersion();
    FAIL() << "an unset toolkit version was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Identification.toolkitVersion is present", what(failure));
  }
}
