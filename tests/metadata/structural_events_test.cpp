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

const PrimerRows eventRows{{"02: 04 07 01 00 00 00 00 00", 0x0201},
                           {"02: 07 02 02 01 01 03 00 00", 0x0202},
                           {"02: 07 02 01 03 03 03 00 00", 0x0601},
                           {"02: 05 30 04 04 01 00 00 00", 0x0602}};

PrimerRows joined(PrimerRows rows, const PrimerRows& more) {
  rows.insert(rows.end(), more.begin(), more.end());
  return rows;
}

const std::string dataDefinition = "06 0E 2B 34 04 01 01 01 01 03 02 01 10 00 00 00";

std::string what(const util::assertion_failure& failure) { return failure.what(); }

std::shared_ptr<Event> parsedEvent(FactoryParse& run, const ByteVector& comment) {
  EventFactory factory;
  return std::dynamic_pointer_cast<Event>(
      run.parse(factory, primedSetOf(factory.getSetKey(), 1,
                                     {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(dataDefinition)},
                                      {propertyKeyOf("02: 05 30 04 04 01 00 00 00"), comment}}))
          .object);
}

}  // namespace

TEST(EventFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  EventFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 06 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(eventRows), factory.getSetPrimer());
}

TEST(EventFactory, ParseAndCodeOfPositionAndComment) {
  EventFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(dataDefinition)},
                                  {propertyKeyOf("02: 07 02 01 03 03 03 00 00"), bytesOf("00 00 00 00 00 00 00 64")},
                                  {propertyKeyOf("02: 05 30 04 04 01 00 00 00"), bytesOf("00 48 00 69")}});
  std::shared_ptr<Event> event = std::dynamic_pointer_cast<Event>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(100, event->getPosition());
  EXPECT_EQ(L"Hi", event->getComment());
  EXPECT_EQ(set.properties, codeWith(factory, event));
}

TEST(EventFactory, SurrogatePairOfACommentIsOneCodePoint) {
  FactoryParse run;
  std::shared_ptr<Event> event = parsedEvent(run, bytesOf("D8 3D DE 00 00 21"));
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(std::wstring({static_cast<wchar_t>(0x1F600), L'!'}), event->getComment());
}

TEST(EventFactory, WideStringWithAnOddNumberOfOctetsIsReportedAsInvalidValue) {
  FactoryParse run;
  std::shared_ptr<Event> event = parsedEvent(run, bytesOf("00 48 00"));
  EXPECT_EQ(std::vector<std::string>{"error 03 invalid Event.comment value - assertion failure: correct size of "
                                     "UTF-16 string"},
            run.reports());
  EXPECT_EQ(invalidPropertyValueId, run.errors->reports.at(0).identifier);
  EXPECT_FALSE(event->hasComment());
}

TEST(Event, OptionalValuesCheckWhenUnset) {
  std::shared_ptr<Event> event = Event::create();
  try {
    event->getPosition();
    FAIL() << "an unset position was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Event.position is present", what(failure));
  }
  try {
    event->getComment();
    FAIL() << "an unset comment was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Event.comment is present", what(failure));
  }
}

TEST(CommentMarkerFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  CommentMarkerFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 08 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(eventRows, {{"02: 06 01 01 04 02 0A 00 00", 0x0901}})), factory.getSetPrimer());
}

TEST(CommentMarkerFactory, AnnotationIsAnOptionalStrongReference) {
  CommentMarkerFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(dataDefinition)},
                                  {propertyKeyOf("02: 06 01 01 04 02 0A 00 00"), uidBytes(0x0A)}});
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<CommentMarker> marker = std::dynamic_pointer_cast<CommentMarker>(parsed.object);
  EXPECT_FALSE(marker->hasAnnotation());
  ASSERT_EQ(1u, parsed.references.count(uidOf(0x0A)));
  EXPECT_TRUE(parsed.references.begin()->second->isStrong());
  std::shared_ptr<SourceClip> annotation = SourceClip::create();
  annotation->setInstanceUID(uidOf(0x0A));
  parsed.references.begin()->second->resolve(annotation);
  EXPECT_EQ(annotation, marker->getAnnotation());
  EXPECT_EQ(set.properties, codeWith(factory, marker));

  marker->removeAnnotation();
  EXPECT_FALSE(marker->hasAnnotation());
  EXPECT_EQ(0u, codeWith(factory, marker).count(propertyKeyOf("02: 06 01 01 04 02 0A 00 00")));
  try {
    marker->getAnnotation();
    FAIL() << "a removed annotation was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: CommentMarker.annotation is present", what(failure));
  }
}

TEST(DMSegmentFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  DMSegmentFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 41 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(eventRows, {{"02: 06 01 01 04 02 0A 00 00", 0x0901},
                                                {"04: 01 07 01 05 00 00 00 00", 0x6102},
                                                {"05: 06 01 01 04 02 0C 00 00", 0x6101}})),
            factory.getSetPrimer());
}

TEST(DMSegmentFactory, ParseAndCodeOfTargetTracksAndFramework) {
  DMSegmentFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(dataDefinition)},
                                  {propertyKeyOf("04: 01 07 01 05 00 00 00 00"), bytesOf("00 00 00 01 00 00 00 04 "
                                                                                        "00 00 00 02")},
                                  {propertyKeyOf("05: 06 01 01 04 02 0C 00 00"), uidBytes(0x0C)}});
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<DMSegment> segment = std::dynamic_pointer_cast<DMSegment>(parsed.object);
  EXPECT_EQ(std::vector<std::uint32_t>{2}, segment->getTargetTrackIDs());
  ASSERT_EQ(1u, parsed.references.count(uidOf(0x0C)));
  std::shared_ptr<DescriptiveMetadataFramework> framework = DescriptiveMetadataFramework::create();
  framework->setInstanceUID(uidOf(0x0C));
  parsed.references.begin()->second->resolve(framework);
  EXPECT_EQ(framework, segment->getDMFramework());
  EXPECT_EQ(set.properties, codeWith(factory, segment));
}

TEST(DMSegmentFactory, AnnotationComesBeforeTheFrameworkAmongReferencedObjects) {
  std::shared_ptr<DMSegment> segment = DMSegment::create();
  std::shared_ptr<DescriptiveMetadataFramework> framework = DescriptiveMetadataFramework::create();
  std::shared_ptr<SourceClip> annotation = SourceClip::create();
  segment->setDMFramework(framework);
  segment->setAnnotation(annotation);
  DMSegmentFactory factory;
  MXFReferencedObjects referenced;
  codeWith(factory, segment, referenced);
  EXPECT_EQ((MXFReferencedObjects{annotation, framework}), referenced);
  EXPECT_EQ((std::vector<KLVKey>{keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 41 00"),
                                 keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 11 00"),
                                 keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 00 00 00 00")}),
            codedSetKeys(segment));
}

TEST(DMSegment, RemoveDMFrameworkDropsTheFrameworkWithoutReleasingIt) {
  std::shared_ptr<DMSegment> segment = DMSegment::create();
  std::shared_ptr<DescriptiveMetadataFramework> framework = DescriptiveMetadataFramework::create();
  segment->setDMFramework(framework);
  segment->removeDMFramework();
  EXPECT_FALSE(segment->hasDMFramework());
  EXPECT_EQ(segment, framework->getTopOwner());
  std::shared_ptr<DMSegment> other = DMSegment::create();
  try {
    other->setDMFramework(framework);
    FAIL() << "a framework still linked to its owner was taken";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: object is not owned", what(failure));
  }
  segment.reset();
  other->setDMFramework(framework);
  EXPECT_EQ(framework, other->getDMFramework());
}

TEST(DMSegment, GettersOfUnsetOptionalPropertiesCheck) {
  std::shared_ptr<const DMSegment> segment = DMSegment::create();
  try {
    segment->getDMFramework();
    FAIL() << "an unset framework was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: DMSegment.dmFramework is present", what(failure));
  }
  try {
    segment->getTargetTrackIDs();
    FAIL() << "unset target track identifiers were read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: DMSegment.targetTrackIDs is present", what(failure));
  }
}

TEST(DescriptiveMetadataFrameworkFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  DescriptiveMetadataFrameworkFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 00 00 00 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({}), factory.getSetPrimer());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<DescriptiveMetadataFramework>(factory.create()));
}

TEST(DescriptiveMetadataObjectFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  DescriptiveMetadataObjectFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 00 00 00 00 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer({}), factory.getSetPrimer());
  EXPECT_EQ(typeid(DescriptiveMetadataObject), factory.getType());
}
