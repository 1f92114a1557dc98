#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/metadata_descriptor_sets.h"
#include "support/metadata_structural.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey locatorsKey = propertyKeyOf(0x02, "06 01 01 04 06 03 00 00");
const KLVKey genericSubDescriptorsKey = propertyKeyOf(0x09, "06 01 01 04 06 10 00 00");
const KLVKey linkedTrackIDKey = propertyKeyOf(0x05, "06 01 01 03 05 00 00 00");
const KLVKey sampleRateKey = propertyKeyOf(0x01, "04 06 01 01 00 00 00 00");
const KLVKey containerDurationKey = propertyKeyOf(0x01, "04 06 01 02 00 00 00 00");
const KLVKey essenceContainerKey = propertyKeyOf(0x02, "06 01 01 04 01 02 00 00");
const KLVKey codecKey = propertyKeyOf(0x02, "06 01 01 04 01 03 00 00");
const KLVKey subDescriptorsKey = propertyKeyOf(0x04, "06 01 01 04 06 0B 00 00");

const std::string multipleEssence = "06 0E 2B 34 04 01 01 03 0D 01 03 01 02 7F 01 00";
const std::string ancillaryData = "06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0E 00 00";
const std::string rate25 = "00000019 00000001";

ByteVector uid(std::uint8_t n) { return ByteVector(16, n); }

// A batch of identifiers, each of sixteen octets n.
ByteVector uids(const std::vector<std::uint8_t>& ns) {
  ByteVector bytes = bytesOf("00000000 00000010");
  bytes[3] = static_cast<std::uint8_t>(ns.size());
  for (std::uint8_t n : ns) bytes.insert(bytes.end(), 16, n);
  return bytes;
}

MXFPrimedSet setOf(const std::string& setKey, std::uint8_t n, MXFPropertyMap properties) {
  MXFPrimedSet set;
  set.key = keyOf(setKey);
  set.properties = std::move(properties);
  set.properties[MXFInstanceUIDKey] = uid(n);
  return set;
}

}  // namespace

TEST(GenericDescriptorFactory, SetKeyAndStaticTags) {
  GenericDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 24 00"), factory.getSetKey());
  EXPECT_EQ(0x2F01, factory.getSetPrimer().at(locatorsKey));
  EXPECT_EQ(4u, factory.getSetPrimer().size());
}

TEST(GenericDescriptorFactory, GenericSubDescriptorsHasADynamicTagAndNoStandardPrimerEntry) {
  GenericDescriptorFactory factory;
  EXPECT_EQ(0, factory.getSetPrimer().at(genericSubDescriptorsKey));
  EXPECT_EQ(0u, getMXFStandardPrimerTags().count(genericSubDescriptorsKey));
}

TEST(FileDescriptorFactory, SetKeyAndStaticTags) {
  FileDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 25 00"), factory.getSetKey());
  const StaticTags tags{{0x3006, linkedTrackIDKey},
                        {0x3001, sampleRateKey},
                        {0x3002, containerDurationKey},
                        {0x3004, essenceContainerKey},
                        {0x3005, codecKey}};
  for (const auto& tag : tags) EXPECT_EQ(tag.first, factory.getSetPrimer().at(tag.second)) << tag.first;
  EXPECT_EQ(9u, factory.getSetPrimer().size());
}

TEST(MultipleDescriptorFactory, SetKeyAndStaticTags) {
  MultipleDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 44 00"), factory.getSetKey());
  EXPECT_EQ(0x3F01, factory.getSetPrimer().at(subDescriptorsKey));
  EXPECT_EQ(10u, factory.getSetPrimer().size());
}

TEST(SubDescriptorFactory, SetKeysOfTheSubDescriptorBases) {
  SubDescriptorFactory base;
  ContainerConstraintsSubDescriptorFactory constraints;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 59 00"), base.getSetKey());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 67 00"), constraints.getSetKey());
  EXPECT_EQ(2u, base.getSetPrimer().size());
  EXPECT_EQ(2u, constraints.getSetPrimer().size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<ContainerConstraintsSubDescriptor>(constraints.create()));
}

TEST(FileDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties{{MXFInstanceUIDKey, uid(0x11)},
                                  {linkedTrackIDKey, bytesOf("00000002")},
                                  {sampleRateKey, bytesOf("00007530 000003E9")},
                                  {containerDurationKey, bytesOf("00000000 00000FA0")},
                                  {essenceContainerKey, bytesOf(ancillaryData)},
                                  {codecKey, uid(0x22)}};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  FileDescriptorFactory factory;
  const std::shared_ptr<FileDescriptor> d =
      std::dynamic_pointer_cast<FileDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(2u, d->getLinkedTrackID());
  EXPECT_EQ((MXFRational{30000, 1001}), d->getSampleRate());
  EXPECT_EQ(4000, d->getContainerDuration());
  EXPECT_EQ(keyOf(ancillaryData), d->getEssenceContainer());
  EXPECT_EQ(MXFUID(uid(0x22).data()), d->getCodec());
  EXPECT_FALSE(d->hasLocators());
  EXPECT_EQ(properties, factory.code(d).set.properties);
}

TEST(FileDescriptorFactory, SetWithoutRequiredPropertiesReportsEachMissingOne) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  FileDescriptorFactory factory;
  const std::shared_ptr<FileDescriptor> d =
      std::dynamic_pointer_cast<FileDescriptor>(parseWith(factory, {{MXFInstanceUIDKey, uid(0x11)}}, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ((std::vector<std::string>{"error 2 missing FileDescriptor.sampleRate",
                                      "error 2 missing FileDescriptor.essenceContainer"}),
            modelReportLines(*errors));
  EXPECT_FALSE(d->hasLinkedTrackID());
  EXPECT_EQ("assertion failure: FileDescriptor.linkedTrackID is present", failureOf([&] { d->getLinkedTrackID(); }));
  EXPECT_EQ("assertion failure: FileDescriptor.containerDuration is present",
            failureOf([&] { d->getContainerDuration(); }));
  EXPECT_EQ("assertion failure: FileDescriptor.codec is present", failureOf([&] { d->getCodec(); }));
}

TEST(MultipleDescriptorFactory, EmptyBatchOfSubDescriptorsPasses) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  MultipleDescriptorFactory factory;
  const MXFParsedObject parsed = parseWith(factory,
                                           {{MXFInstanceUIDKey, uid(0x11)},
                                            {sampleRateKey, bytesOf(rate25)},
                                            {essenceContainerKey, bytesOf(multipleEssence)},
                                            {subDescriptorsKey, bytesOf("00000000 00000010")}},
                                           errors);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_TRUE(parsed.references.empty());
}

TEST(MultipleDescriptorFactory, SetWithoutSubDescriptorsReportsMissing) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  MultipleDescriptorFactory factory;
  parseWith(factory,
            {{MXFInstanceUIDKey, uid(0x11)},
             {sampleRateKey, bytesOf(rate25)},
             {essenceContainerKey, bytesOf(multipleEssence)}},
            errors);
  ASSERT_EQ(1u, errors->reports.size());
  EXPECT_EQ("error", errors->reports[0].severity);
  EXPECT_EQ(missingPropertyId, errors->reports[0].identifier);
  EXPECT_EQ("missing MultipleDescriptor.subDescriptors", errors->reports[0].message);
}

TEST(GenericDescriptor, UnsetOptionalVectorsCountZero) {
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  EXPECT_FALSE(d->hasLocators());
  EXPECT_EQ(0u, d->getLocatorCount());
  EXPECT_FALSE(d->hasGenericSubDescriptors());
  EXPECT_EQ(0u, d->getGenericSubDescriptorCount());
  EXPECT_EQ("assertion failure: valid index", failureOf([&] { d->getLocatorAt(0); }));
  EXPECT_EQ("assertion failure: valid index", failureOf([&] { d->insertLocatorAt(1, NetworkLocator::create()); }));
  EXPECT_FALSE(d->hasLocators());
}

TEST(GenericDescriptorFactory, EmptyBatchesOfOptionalVectorsStayPresentAndAreWrittenAgain) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  GenericDescriptorFactory factory;
  const MXFParsedObject parsed = parseWith(factory,
                                           {{MXFInstanceUIDKey, uid(0x11)},
                                            {locatorsKey, bytesOf("00000000 00000010")},
                                            {genericSubDescriptorsKey, bytesOf("00000000 00000010")}},
                                           errors);
  EXPECT_TRUE(errors->reports.empty());
  const std::shared_ptr<GenericDescriptor> d = std::dynamic_pointer_cast<GenericDescriptor>(parsed.object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(d->hasLocators());
  EXPECT_EQ(0u, d->getLocatorCount());
  EXPECT_TRUE(d->hasGenericSubDescriptors());
  EXPECT_EQ(0u, d->getGenericSubDescriptorCount());
  const MXFPropertyMap coded = codeWith(factory, d);
  ASSERT_EQ(1u, coded.count(locatorsKey));
  EXPECT_EQ(bytesOf("00000000 00000010"), coded.at(locatorsKey));
  ASSERT_EQ(1u, coded.count(genericSubDescriptorsKey));
  EXPECT_EQ(bytesOf("00000000 00000010"), coded.at(genericSubDescriptorsKey));
}

TEST(GenericDescriptorFactory, AbsentOptionalVectorsStayAbsentAndAreNotWritten) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  GenericDescriptorFactory factory;
  const MXFParsedObject parsed = parseWith(factory, {{MXFInstanceUIDKey, uid(0x11)}}, errors);
  EXPECT_TRUE(errors->reports.empty());
  const std::shared_ptr<GenericDescriptor> d = std::dynamic_pointer_cast<GenericDescriptor>(parsed.object);
  ASSERT_NE(nullptr, d);
  EXPECT_FALSE(d->hasLocators());
  EXPECT_FALSE(d->hasGenericSubDescriptors());
  const MXFPropertyMap coded = codeWith(factory, d);
  EXPECT_EQ(0u, coded.count(locatorsKey));
  EXPECT_EQ(0u, coded.count(genericSubDescriptorsKey));
}

TEST(GenericDescriptor, InsertLocatorAtKeepsOrderAndTakesOwnership) {
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  const std::shared_ptr<NetworkLocator> first = NetworkLocator::create();
  const std::shared_ptr<TextLocator> second = TextLocator::create();
  d->addLocator(second);
  d->insertLocatorAt(0, first);
  EXPECT_TRUE(d->hasLocators());
  ASSERT_EQ(2u, d->getLocatorCount());
  EXPECT_EQ(first, d->getLocatorAt(0));
  EXPECT_EQ(second, d->getLocatorAt(1));
  EXPECT_EQ(d, first->getTopOwner());
  EXPECT_EQ("assertion failure: object is not owned",
            failureOf([&] { GenericDescriptor::create()->addLocator(first); }));
}

TEST(GenericDescriptor, RemoveLocatorAtReleasesTheElement) {
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  const std::shared_ptr<NetworkLocator> first = NetworkLocator::create();
  const std::shared_ptr<TextLocator> last = TextLocator::create();
  d->addLocator(first);
  d->addLocator(last);
  d->removeLocatorAt(1);
  ASSERT_EQ(1u, d->getLocatorCount());
  EXPECT_EQ(first, d->getLocatorAt(0));
  EXPECT_EQ(last, last->getTopOwner());
  EXPECT_EQ("assertion failure: valid index", failureOf([&] { d->removeLocatorAt(1); }));
}

TEST(GenericDescriptor, RemoveLocatorsDropsThemWithoutReleasing) {
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  const std::shared_ptr<NetworkLocator> locator = NetworkLocator::create();
  d->addLocator(locator);
  d->removeLocators();
  EXPECT_FALSE(d->hasLocators());
  EXPECT_EQ(0u, d->getLocatorCount());
  EXPECT_EQ(d, locator->getTopOwner());
  EXPECT_EQ("assertion failure: object is not owned",
            failureOf([&] { GenericDescriptor::create()->addLocator(locator); }));
}

TEST(GenericDescriptor, RemoveGenericSubDescriptorsDropsThemWithoutReleasing) {
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  const std::shared_ptr<SubDescriptor> sub = ContainerConstraintsSubDescriptor::create();
  d->addGenericSubDescriptor(sub);
  EXPECT_TRUE(d->hasGenericSubDescriptors());
  d->removeGenericSubDescriptors();
  EXPECT_FALSE(d->hasGenericSubDescriptors());
  EXPECT_EQ(d, sub->getTopOwner());
}

TEST(MultipleDescriptor, RemoveSubDescriptorAtLeavesTheOthersInOrderAndReleases) {
  const std::shared_ptr<MultipleDescriptor> d = MultipleDescriptor::create();
  const std::shared_ptr<FileDescriptor> a = SoundDescriptor::create();
  const std::shared_ptr<FileDescriptor> b = DataDescriptor::create();
  const std::shared_ptr<FileDescriptor> c = CDCIPictureDescriptor::create();
  d->addSubDescriptor(a);
  d->addSubDescriptor(b);
  d->addSubDescriptor(c);
  d->removeSubDescriptorAt(1);
  ASSERT_EQ(2u, d->getSubDescriptorCount());
  EXPECT_EQ(a, d->getSubDescriptorAt(0));
  EXPECT_EQ(c, d->getSubDescriptorAt(1));
  EXPECT_EQ(b, b->getTopOwner());
}

TEST(MultipleDescriptorFactory, ReferencedObjectsAreLocatorsThenGenericSubDescriptorsThenSubDescriptors) {
  const std::shared_ptr<MultipleDescriptor> d = MultipleDescriptor::create();
  const std::shared_ptr<NetworkLocator> locator = NetworkLocator::create();
  const std::shared_ptr<SubDescriptor> constraints = ContainerConstraintsSubDescriptor::create();
  const std::shared_ptr<DataDescriptor> data = DataDescriptor::create();
  locator->setInstanceUID(MXFUID(uid(0x01).data()));
  constraints->setInstanceUID(MXFUID(uid(0x02).data()));
  data->setInstanceUID(MXFUID(uid(0x03).data()));
  d->addSubDescriptor(data);
  d->addGenericSubDescriptor(constraints);
  d->addLocator(locator);
  MultipleDescriptorFactory factory;
  const MXFCodedObject coded = factory.code(d);
  EXPECT_EQ((MXFReferencedObjects{locator, constraints, data}), coded.referenced);
  EXPECT_EQ(uids({0x01}), coded.set.properties.at(locatorsKey));
  EXPECT_EQ(uids({0x02}), coded.set.properties.at(genericSubDescriptorsKey));
  EXPECT_EQ(uids({0x03}), coded.set.properties.at(subDescriptorsKey));
}

TEST(GenericDescriptorFactory, UnsetOptionalVectorsAreLeftOutAndNullElementsFail) {
  GenericDescriptorFactory factory;
  const std::shared_ptr<GenericDescriptor> d = GenericDescriptor::create();
  EXPECT_EQ(1u, factory.code(d).set.properties.size());
  d->addLocator(nullptr);
  EXPECT_EQ("assertion failure: GenericDescriptor.locator is present", failureOf([&] { factory.code(d); }));
  d->removeLocators();
  d->addGenericSubDescriptor(nullptr);
  EXPECT_EQ("assertion failure: GenericDescriptor.genericSubDescriptor is present",
            failureOf([&] { factory.code(d); }));
}

TEST(MultipleDescriptorFactory, ModelConnectsSubDescriptorsLocatorsAndGenericSubDescriptorsInFileOrder) {
  const std::vector<MXFPrimedSet> sets{
      setOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 44 00", 0x01,
            {{sampleRateKey, bytesOf(rate25)},
             {essenceContainerKey, bytesOf(multipleEssence)},
             {locatorsKey, uids({0x02})},
             {genericSubDescriptorsKey, uids({0x03})},
             {subDescriptorsKey, uids({0x04, 0x05})}}),
      setOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 32 00", 0x02,
            {{propertyKeyOf(0x01, "01 02 01 01 01 00 00 00"), bytesOf("0061")}}),
      setOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 67 00", 0x03, {}),
      setOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 43 00", 0x05,
            {{sampleRateKey, bytesOf(rate25)}, {essenceContainerKey, bytesOf(ancillaryData)}}),
      setOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 43 00", 0x04,
            {{sampleRateKey, bytesOf(rate25)}, {essenceContainerKey, bytesOf(ancillaryData)}})};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::vector<MXFMetadataModel> models = parseModels(sets, errors);
  EXPECT_TRUE(errors->reports.empty());
  ASSERT_EQ(1u, models.size());
  ASSERT_EQ(1u, models[0].size());
  const std::shared_ptr<MultipleDescriptor> d = std::dynamic_pointer_cast<MultipleDescriptor>(models[0][0]);
  ASSERT_NE(nullptr, d);
  ASSERT_EQ(1u, d->getLocatorCount());
  EXPECT_EQ(L"a", std::dynamic_pointer_cast<const NetworkLocator>(d->getLocatorAt(0))->getURLString());
  ASSERT_EQ(1u, d->getGenericSubDescriptorCount());
  EXPECT_EQ(MXFUID(uid(0x03).data()), d->getGenericSubDescriptorAt(0)->getInstanceUID());
  ASSERT_EQ(2u, d->getSubDescriptorCount());
  EXPECT_EQ(MXFUID(uid(0x04).data()), d->getSubDescriptorAt(0)->getInstanceUID());
  EXPECT_EQ(MXFUID(uid(0x05).data()), d->getSubDescriptorAt(1)->getInstanceUID());
}
