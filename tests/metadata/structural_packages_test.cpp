#include <ctime>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/metadata_structural.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const PrimerRows packageRows{{"01: 01 01 15 10 00 00 00 00", 0x4401},
                             {"01: 01 03 03 02 01 00 00 00", 0x4402},
                             {"02: 07 02 01 10 01 03 00 00", 0x4405},
                             {"02: 07 02 01 10 02 05 00 00", 0x4404},
                             {"02: 06 01 01 04 06 05 00 00", 0x4403}};

PrimerRows joined(PrimerRows rows, const PrimerRows& more) {
  rows.insert(rows.end(), more.begin(), more.end());
  return rows;
}

const std::string umidLabel = "06 0A 2B 34 01 01 01 05 01 01 0F 23 13 00 00 00";
const std::string basicUMID = umidLabel + " 11 22 33 44 55 66 77 88 99 AA BB CC DD EE FF 00";

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

std::shared_ptr<TimelineTrack> trackOf(std::uint8_t n) {
  std::shared_ptr<TimelineTrack> track = TimelineTrack::create();
  track->setInstanceUID(uidOf(n));
  track->setSegment(Sequence::create());
  return track;
}

}  // namespace

TEST(ContentStorageFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  ContentStorageFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 18 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({{"02: 06 01 01 04 05 01 00 00", 0x1901}, {"02: 06 01 01 04 05 02 00 00", 0x1902}}),
            factory.getSetPrimer());
}

TEST(ContentStorageFactory, ParseEntersPackagesAndEssenceContainerDataAsStrongReferences) {
  ContentStorageFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(
      factory, primedSetOf(factory.getSetKey(), 1,
                           {{propertyKeyOf("02: 06 01 01 04 05 01 00 00"), uidBatch({0x02, 0x03})},
                            {propertyKeyOf("02: 06 01 01 04 05 02 00 00"), uidBatch({0x04})}}));
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(3u, parsed.references.size());
  std::shared_ptr<ContentStorage> storage = std::dynamic_pointer_cast<ContentStorage>(parsed.object);
  std::shared_ptr<EssenceContainerData> data = EssenceContainerData::create();
  parsed.references.find(uidOf(0x04))->second->resolve(data);
  parsed.references.find(uidOf(0x03))->second->resolve(SourcePackage::create());
  EXPECT_TRUE(storage->hasEssenceContainerData());
  EXPECT_EQ(data, storage->getEssenceContainerDataAt(0));
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<const SourcePackage>(storage->getPackageAt(0)));
}

TEST(ContentStorageFactory, SetWithoutPackagesReportsMissingAndUnsetDataIsNotWritten) {
  ContentStorageFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(factory, primedSetOf(factory.getSetKey(), 1, {}));
  EXPECT_EQ(std::vector<std::string>{"error 02 missing ContentStorage.packages"}, run.reports());
  std::shared_ptr<ContentStorage> storage = std::dynamic_pointer_cast<ContentStorage>(parsed.object);
  EXPECT_FALSE(storage->hasEssenceContainerData());
  EXPECT_EQ(0u, storage->getEssenceContainerDataCount());
  EXPECT_EQ((MXFPropertyMap{{MXFInstanceUIDKey, uidBytes(0x01)},
                            {propertyKeyOf("02: 06 01 01 04 05 01 00 00"), uidBatch({})}}),
            codeWith(factory, storage));
}

TEST(ContentStorage, RemoveEssenceContainerDataDropsWithoutReleasing) {
  std::shared_ptr<ContentStorage> storage = ContentStorage::create();
  std::shared_ptr<EssenceContainerData> data = EssenceContainerData::create();
  storage->addEssenceContainerData(data);
  storage->removeEssenceContainerData();
  EXPECT_FALSE(storage->hasEssenceContainerData());
  EXPECT_EQ(0u, storage->getEssenceContainerDataCount());
  EXPECT_EQ(storage, data->getTopOwner());
}

TEST(ContentStorage, RemovePackageAtReleasesThePackage) {
  std::shared_ptr<ContentStorage> storage = ContentStorage::create();
  std::shared_ptr<MaterialPackage> material = MaterialPackage::create();
  std::shared_ptr<SourcePackage> source = SourcePackage::create();
  storage->addPackage(material);
  storage->addPackage(source);
  storage->removePackageAt(0);
  ASSERT_EQ(1u, storage->getPackageCount());
  EXPECT_EQ(source, storage->getPackageAt(0));
  EXPECT_EQ(material, material->getTopOwner());
  try {
    storage->getPackageAt(1);
    FAIL() << "a package past the end was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: valid index", what(failure));
  }
}

TEST(EssenceContainerDataFactory, SetKeyStaticTagsParseAndCode) {
  EssenceContainerDataFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 23 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({{"02: 06 01 01 06 01 00 00 00", 0x2701},
                              {"04: 01 03 04 05 00 00 00 00", 0x3F06},
                              {"04: 01 03 04 04 00 00 00 00", 0x3F07}}),
            factory.getSetPrimer());
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("02: 06 01 01 06 01 00 00 00"), bytesOf(basicUMID + " " + basicUMID)},
                                  {propertyKeyOf("04: 01 03 04 05 00 00 00 00"), bytesOf("00 00 00 02")},
                                  {propertyKeyOf("04: 01 03 04 04 00 00 00 00"), bytesOf("00 00 00 01")}});
  std::shared_ptr<EssenceContainerData> data =
      std::dynamic_pointer_cast<EssenceContainerData>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(UMID::extended, data->getLinkedPackageUID().kind);
  EXPECT_EQ(2u, data->getIndexSID());
  EXPECT_EQ(1u, data->getBodySID());
  EXPECT_EQ(set.properties, codeWith(factory, data));
  data->removeIndexSID();
  try {
    data->getIndexSID();
    FAIL() << "an unset index stream was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: EssenceContainerData.indexSID is present", what(failure));
  }
}

TEST(EssenceContainerDataFactory, UMIDOf33OctetsIsReportedAsInvalidValue) {
  EssenceContainerDataFactory factory;
  FactoryParse run;
  run.parse(factory, primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("02: 06 01 01 06 01 00 00 00"), bytesOf(basicUMID + " 00")},
                                  {propertyKeyOf("04: 01 03 04 04 00 00 00 00"), bytesOf("00 00 00 01")}}));
  EXPECT_EQ(std::vector<std::string>{"error 03 invalid EssenceContainerData.linkedPackageUID value - assertion "
                                     "failure: valid size"},
            run.reports());
}

TEST(GenericPackageFactory, SetKeysAndStaticTagsAreThoseOfTheTable) {
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 34 00"), GenericPackageFactory().getSetKey());
  EXPECT_EQ(structuralPrimer(packageRows), GenericPackageFactory().getSetPrimer());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 36 00"), MaterialPackageFactory().getSetKey());
  EXPECT_EQ(structuralPrimer(packageRows), MaterialPackageFactory().getSetPrimer());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 37 00"), SourcePackageFactory().getSetKey());
  EXPECT_EQ(structuralPrimer(joined(packageRows, {{"02: 06 01 01 04 02 03 00 00", 0x4701}})),
            SourcePackageFactory().getSetPrimer());
}

TEST(GenericPackage, NewPackageHasPresentDatesAndANewUMID) {
  const std::time_t before = std::time(nullptr);
  std::shared_ptr<MaterialPackage> package = MaterialPackage::create();
  const std::time_t after = std::time(nullptr);
  EXPECT_LE(before, secondsOf(package->getPackageCreationDate()));
  EXPECT_GE(after, secondsOf(package->getPackageCreationDate()));
  EXPECT_EQ(0, package->getPackageCreationDate().quarterMillisecond);
  EXPECT_EQ(package->getPackageCreationDate(), package->getPackageModifiedDate());
  const UMID& umid = package->getPackageUID();
  EXPECT_EQ(UMID::basic, umid.kind);
  EXPECT_EQ(bytesOf(umidLabel), ByteVector(umid.octets.begin(), umid.octets.begin() + 16));
  EXPECT_NE(umid, MaterialPackage::create()->getPackageUID());
  EXPECT_FALSE(package->hasName());
}

TEST(MaterialPackageFactory, ParseAndCodeOfThePackageProperties) {
  MaterialPackageFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("01: 01 01 15 10 00 00 00 00"), bytesOf(basicUMID)},
                                  {propertyKeyOf("01: 01 03 03 02 01 00 00 00"), bytesOf("00 43 00 31")},
                                  {propertyKeyOf("02: 07 02 01 10 01 03 00 00"), bytesOf("07 DB 0A 1F 0C 22 38 00")},
                                  {propertyKeyOf("02: 07 02 01 10 02 05 00 00"), bytesOf("07 DC 01 02 03 04 05 06")},
                                  {propertyKeyOf("02: 06 01 01 04 06 05 00 00"), uidBatch({0x07})}});
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<MaterialPackage> package = std::dynamic_pointer_cast<MaterialPackage>(parsed.object);
  ASSERT_NE(nullptr, package);
  EXPECT_EQ(bytesOf(basicUMID), package->getPackageUID().octets);
  EXPECT_EQ(L"C1", package->getName());
  EXPECT_EQ(2011, package->getPackageCreationDate().year);
  EXPECT_EQ(56, package->getPackageCreationDate().second);
  EXPECT_EQ(6, package->getPackageModifiedDate().quarterMillisecond);
  ASSERT_EQ(1u, parsed.references.size());
  parsed.references.begin()->second->resolve(trackOf(0x07));
  EXPECT_EQ(set.properties, codeWith(factory, package));
}

TEST(SourcePackageFactory, CodingWithoutDescriptorFails) {
  std::shared_ptr<SourcePackage> package = SourcePackage::create();
  package->addTrack(trackOf(1));
  SourcePackageFactory factory;
  try {
    codeWith(factory, package);
    FAIL() << "a source package without descriptor was coded";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: SourcePackage.descriptor is present", what(failure));
  }
}

TEST(SourcePackageFactory, TracksComeBeforeTheDescriptorAmongReferencedObjects) {
  std::shared_ptr<SourcePackage> package = SourcePackage::create();
  std::shared_ptr<GenericDescriptor> descriptor = GenericDescriptor::create();
  descriptor->setInstanceUID(uidOf(0x0D));
  package->setDescriptor(descriptor);
  std::shared_ptr<TimelineTrack> track = trackOf(0x07);
  package->addTrack(track);
  SourcePackageFactory factory;
  MXFReferencedObjects referenced;
  MXFPropertyMap properties = codeWith(factory, package, referenced);
  EXPECT_EQ((MXFReferencedObjects{track, descriptor}), referenced);
  EXPECT_EQ(uidBytes(0x0D), properties.at(propertyKeyOf("02: 06 01 01 04 02 03 00 00")));
  EXPECT_EQ((std::vector<KLVKey>{keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 37 00"),
                                 keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 3B 00"),
                                 keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 0F 00"),
                                 GenericDescriptorFactory().getSetKey()}),
            codedSetKeys(package));
}

TEST(SourcePackageFactory, DescriptorIsAStrongReferenceResolvedByTheSetter) {
  SourcePackageFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(
      factory, primedSetOf(factory.getSetKey(), 1, {{propertyKeyOf("02: 06 01 01 04 02 03 00 00"), uidBytes(0x0D)}}));
  EXPECT_EQ((std::vector<std::string>{"error 02 missing GenericPackage.packageUID",
                                      "error 02 missing GenericPackage.packageCreationDate",
                                      "error 02 missing GenericPackage.packageModifiedDate",
                                      "error 02 missing GenericPackage.tracks"}),
            run.reports());
  ASSERT_EQ(1u, parsed.references.count(uidOf(0x0D)));
  EXPECT_TRUE(parsed.references.begin()->second->isStrong());
  std::shared_ptr<GenericDescriptor> descriptor = GenericDescriptor::create();
  parsed.references.begin()->second->resolve(descriptor);
  std::shared_ptr<SourcePackage> package = std::dynamic_pointer_cast<SourcePackage>(parsed.object);
  EXPECT_EQ(descriptor, package->getDescriptor());
  EXPECT_EQ(package, descriptor->getTopOwner());
}
