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

const PrimerRows trackRows{{"02: 01 07 01 01 00 00 00 00", 0x4801},
                           {"02: 01 04 01 03 00 00 00 00", 0x4804},
                           {"02: 01 07 01 02 01 00 00 00", 0x4802},
                           {"02: 06 01 01 04 02 04 00 00", 0x4803}};

PrimerRows joined(PrimerRows rows, const PrimerRows& more) {
  rows.insert(rows.end(), more.begin(), more.end());
  return rows;
}

std::string what(const util::assertion_failure& failure) { return failure.what(); }

// The properties of a track whose segment has every identifier octet 5.
MXFPropertyMap trackProperties() {
  return {{propertyKeyOf("02: 01 07 01 01 00 00 00 00"), bytesOf("00 00 00 02")},
          {propertyKeyOf("02: 01 04 01 03 00 00 00 00"), bytesOf("15 01 05 00")},
          {propertyKeyOf("02: 01 07 01 02 01 00 00 00"), bytesOf("00 56 00 31")},
          {propertyKeyOf("02: 06 01 01 04 02 04 00 00"), uidBytes(0x05)}};
}

std::shared_ptr<Sequence> segmentOf(std::uint8_t n) {
  std::shared_ptr<Sequence> sequence = Sequence::create();
  sequence->setInstanceUID(uidOf(n));
  return sequence;
}

}  // namespace

TEST(TrackFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  TrackFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 38 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(trackRows), factory.getSetPrimer());
}

TEST(TimelineTrackFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  TimelineTrackFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 3B 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(trackRows, {{"02: 05 30 04 05 00 00 00 00", 0x4B01},
                                                {"02: 07 02 01 03 01 03 00 00", 0x4B02}})),
            factory.getSetPrimer());
}

TEST(EventTrackFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  EventTrackFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 39 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(trackRows, {{"02: 05 30 04 02 00 00 00 00", 0x4901},
                                                {"05: 07 02 01 03 01 0B 00 00", 0x4902}})),
            factory.getSetPrimer());
}

TEST(StaticTrackFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  StaticTrackFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 3A 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(trackRows), factory.getSetPrimer());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<StaticTrack>(factory.create()));
}

TEST(TimelineTrackFactory, ParseGivesTheValuesAndAStrongSegmentReference) {
  TimelineTrackFactory factory;
  FactoryParse run;
  MXFPropertyMap properties = trackProperties();
  properties[propertyKeyOf("02: 05 30 04 05 00 00 00 00")] = bytesOf("00 00 75 30 00 00 03 E9");
  properties[propertyKeyOf("02: 07 02 01 03 01 03 00 00")] = bytesOf("FF FF FF FF FF FF FF FF");
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 3, properties);
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<TimelineTrack> track = std::dynamic_pointer_cast<TimelineTrack>(parsed.object);
  ASSERT_NE(nullptr, track);
  EXPECT_EQ(2u, track->getTrackID());
  EXPECT_EQ(0x15010500u, track->getTrackNumber());
  EXPECT_EQ(L"V1", track->getTrackName());
  EXPECT_EQ(30000, track->getEditRate().numerator);
  EXPECT_EQ(1001, track->getEditRate().denominator);
  EXPECT_EQ(-1, track->getOrigin());
  EXPECT_EQ(nullptr, track->getSegment());
  ASSERT_EQ(1u, parsed.references.size());
  EXPECT_EQ(uidOf(0x05), parsed.references.begin()->first);
  EXPECT_TRUE(parsed.references.begin()->second->isStrong());
  std::shared_ptr<Sequence> segment = segmentOf(0x05);
  parsed.references.begin()->second->resolve(segment);
  EXPECT_EQ(segment, track->getSegment());
  MXFReferencedObjects referenced;
  EXPECT_EQ(set.properties, codeWith(factory, track, referenced));
  EXPECT_EQ(MXFReferencedObjects{segment}, referenced);
}

TEST(TrackFactory, ResolvingTheSegmentWithAnotherClassFails) {
  TrackFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(factory, primedSetOf(factory.getSetKey(), 3, trackProperties()));
  try {
    parsed.references.begin()->second->resolve(Identification::create());
    FAIL() << "an identification became a segment";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: object is value type", what(failure));
  }
}

TEST(TrackFactory, SetWithoutRequiredPropertiesReportsEachByName) {
  EventTrackFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(factory, primedSetOf(factory.getSetKey(), 3, {}));
  EXPECT_EQ((std::vector<std::string>{"error 02 missing EventTrack.editRate", "error 02 missing Track.trackID",
                                      "error 02 missing Track.segment"}),
            run.reports());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<EventTrack>(parsed.object));
}

TEST(EventTrack, GetOriginWithoutOriginFails) {
  std::shared_ptr<EventTrack> track = EventTrack::create();
  EXPECT_FALSE(track->hasOrigin());
  try {
    track->getOrigin();
    FAIL() << "an unset origin was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: EventTrack.origin is present", what(failure));
  }
}

TEST(TimelineTrack, GetOriginOfANewTrackReturnsTheDefaultZero) {
  EXPECT_EQ(0, TimelineTrack::create()->getOrigin());
}

TEST(EventTrackFactory, OriginWrittenWithTheDefaultsBytesIsPresentAndOmittedIsNot) {
  EventTrackFactory factory;
  FactoryParse run;
  MXFPropertyMap properties = trackProperties();
  properties[propertyKeyOf("02: 05 30 04 02 00 00 00 00")] = bytesOf("00 00 00 19 00 00 00 01");
  std::shared_ptr<EventTrack> absent =
      std::dynamic_pointer_cast<EventTrack>(run.parse(factory, primedSetOf(factory.getSetKey(), 3, properties)).object);
  properties[propertyKeyOf("05: 07 02 01 03 01 0B 00 00")] = bytesOf("00 00 00 00 00 00 00 00");
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 4, properties);
  std::shared_ptr<EventTrack> present = std::dynamic_pointer_cast<EventTrack>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_FALSE(absent->hasOrigin());
  ASSERT_TRUE(present->hasOrigin());
  EXPECT_EQ(0, present->getOrigin());
  present->setSegment(segmentOf(0x05));
  EXPECT_EQ(set.properties, codeWith(factory, present));
}

TEST(Track, OptionalValuesCheckWhenUnset) {
  std::shared_ptr<Track> track = Track::create();
  try {
    track->getTrackNumber();
    FAIL() << "an unset track number was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Track.trackNumber is present", what(failure));
  }
  try {
    track->getTrackName();
    FAIL() << "an unset track name was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Track.trackName is present", what(failure));
  }
}

TEST(TrackFactory, CodingATrackWithoutSegmentFails) {
  TimelineTrackFactory factory;
  try {
    codeWith(factory, TimelineTrack::create());
    FAIL() << "a track without segment was coded";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Track.segment is present", what(failure));
  }
}

TEST(Track, ReplacingTheSegmentReleasesTheOldOne) {
  std::shared_ptr<Track> track = StaticTrack::create();
  std::shared_ptr<Sequence> first = segmentOf(1);
  std::shared_ptr<Sequence> second = segmentOf(2);
  track->setSegment(first);
  track->setSegment(second);
  EXPECT_EQ(second, track->getSegment());
  EXPECT_EQ(track, second->getTopOwner());
  EXPECT_EQ(first, first->getTopOwner());
}

TEST(Track, SettingTheSegmentItAlreadyHoldsFails) {
  std::shared_ptr<Track> track = StaticTrack::create();
  std::shared_ptr<Sequence> segment = segmentOf(1);
  track->setSegment(segment);
  try {
    track->setSegment(segment);
    FAIL() << "the held segment was set again";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: object is not owned", what(failure));
  }
  EXPECT_EQ(segment, track->getSegment());
}
