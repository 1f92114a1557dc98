#include <functional>
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

const PrimerRows componentRows{{"02: 04 07 01 00 00 00 00 00", 0x0201}, {"02: 07 02 02 01 01 03 00 00", 0x0202}};
const PrimerRows sourceReferenceRows{{"02: 06 01 01 03 01 00 00 00", 0x1101}, {"02: 06 01 01 03 02 00 00 00", 0x1102}};

PrimerRows joined(PrimerRows rows, const PrimerRows& more) {
  rows.insert(rows.end(), more.begin(), more.end());
  return rows;
}

const std::string basicUMID =
    "06 0A 2B 34 01 01 01 05 01 01 0F 23 13 00 00 00 11 22 33 44 55 66 77 88 99 AA BB CC DD EE FF 00";
const std::string pictureDefinition = "06 0E 2B 34 04 01 01 01 01 03 02 02 01 00 00 00";

std::string what(const util::assertion_failure& failure) { return failure.what(); }

// A sequence with components whose identifiers have every octet 1, 2, 3.
std::shared_ptr<Sequence> sequenceOfThree(std::vector<std::shared_ptr<Component>>& components) {
  std::shared_ptr<Sequence> sequence = Sequence::create();
  for (std::uint8_t n = 1; n <= 3; ++n) {
    components.push_back(SourceClip::create());
    components.back()->setInstanceUID(uidOf(n));
    sequence->addComponent(components.back());
  }
  return sequence;
}

}  // namespace

TEST(ComponentFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  ComponentFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 02 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(componentRows), factory.getSetPrimer());
  EXPECT_EQ(typeid(Component), factory.getType());
}

TEST(SegmentFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  SegmentFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 03 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(componentRows), factory.getSetPrimer());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<Segment>(factory.create()));
}

TEST(SequenceFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  SequenceFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 0F 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(componentRows, {{"02: 06 01 01 04 06 09 00 00", 0x1001}})),
            factory.getSetPrimer());
}

TEST(SequenceFactory, SetWithoutComponentsReportsMissingAndGivesEmptySequence) {
  SequenceFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(
      factory, primedSetOf(factory.getSetKey(), 0x10, {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"),
                                                        bytesOf(pictureDefinition)}}));
  EXPECT_EQ(std::vector<std::string>{"error 02 missing Sequence.components"}, run.reports());
  ASSERT_EQ(missingPropertyId, run.errors->reports.at(0).identifier);
  std::shared_ptr<Sequence> sequence = std::dynamic_pointer_cast<Sequence>(parsed.object);
  ASSERT_NE(nullptr, sequence);
  EXPECT_EQ(0u, sequence->getComponentCount());
  EXPECT_TRUE(parsed.references.empty());
}

TEST(SequenceFactory, EmptyBatchOfComponentsIsNotMissing) {
  SequenceFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(
      factory, primedSetOf(factory.getSetKey(), 0x10,
                           {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                            {propertyKeyOf("02: 06 01 01 04 06 09 00 00"), bytesOf("00 00 00 00 00 00 00 10")}}));
  EXPECT_TRUE(run.reports().empty());
  EXPECT_TRUE(parsed.references.empty());
}

TEST(SequenceFactory, ParseGivesValuesAndOneStrongReferencePerComponent) {
  SequenceFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 0x10,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                                  {propertyKeyOf("02: 07 02 02 01 01 03 00 00"), bytesOf("00 00 00 00 00 00 01 F4")},
                                  {propertyKeyOf("02: 06 01 01 04 06 09 00 00"), uidBatch({0x02, 0x03})}});
  MXFParsedObject parsed = run.parse(factory, set);
  EXPECT_TRUE(run.reports().empty());
  std::shared_ptr<Sequence> sequence = std::dynamic_pointer_cast<Sequence>(parsed.object);
  ASSERT_NE(nullptr, sequence);
  EXPECT_EQ(uidOf(0x10), sequence->getInstanceUID());
  EXPECT_EQ(keyOf(pictureDefinition), sequence->getDataDefinition());
  EXPECT_EQ(500, sequence->getDuration());
  ASSERT_EQ(2u, parsed.references.size());
  EXPECT_EQ(uidOf(0x02), parsed.references.begin()->first);
  EXPECT_TRUE(parsed.references.begin()->second->isStrong());

  // The targets arrive: the sequence holds them in the order of the batch.
  std::shared_ptr<SourceClip> third = SourceClip::create();
  std::shared_ptr<SourceClip> second = SourceClip::create();
  third->setInstanceUID(uidOf(0x03));
  second->setInstanceUID(uidOf(0x02));
  parsed.references.find(uidOf(0x03))->second->resolve(third);
  parsed.references.find(uidOf(0x02))->second->resolve(second);
  ASSERT_EQ(2u, sequence->getComponentCount());
  EXPECT_EQ(second, sequence->getComponentAt(0));
  EXPECT_EQ(third, sequence->getComponentAt(1));
  EXPECT_EQ(set.properties, codeWith(factory, sequence));
}

TEST(SequenceFactory, CodeListsTheComponentsInOrderAndWritesTheirIdentifiers) {
  std::vector<std::shared_ptr<Component>> components;
  std::shared_ptr<Sequence> sequence = sequenceOfThree(components);
  SequenceFactory factory;
  MXFReferencedObjects referenced;
  MXFPropertyMap properties = codeWith(factory, sequence, referenced);
  EXPECT_EQ(uidBatch({0x01, 0x02, 0x03}), properties.at(propertyKeyOf("02: 06 01 01 04 06 09 00 00")));
  EXPECT_EQ(MXFReferencedObjects(components.begin(), components.end()), referenced);
}

TEST(SequenceFactory, CodingANullComponentFails) {
  std::shared_ptr<Sequence> sequence = Sequence::create();
  sequence->addComponent(nullptr);
  SequenceFactory factory;
  try {
    codeWith(factory, sequence);
    FAIL() << "coded a null component";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Sequence.component is present", what(failure));
  }
}

TEST(SequenceFactory, CodingAnotherClassFailsTheClassCheck) {
  SequenceFactory factory;
  try {
    codeWith(factory, SourceClip::create());
    FAIL() << "coded a source clip as a sequence";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: object is a Sequence", what(failure));
  }
}

TEST(Sequence, RemoveComponentAtLastIndexKeepsTheOthersInOrderAndReleasesTheElement) {
  std::vector<std::shared_ptr<Component>> components;
  std::shared_ptr<Sequence> sequence = sequenceOfThree(components);
  sequence->removeComponentAt(2);
  ASSERT_EQ(2u, sequence->getComponentCount());
  EXPECT_EQ(components[0], sequence->getComponentAt(0));
  EXPECT_EQ(components[1], sequence->getComponentAt(1));
  // Released: another owner may take it now, and the old one no longer can.
  std::shared_ptr<Sequence> other = Sequence::create();
  other->addComponent(components[2]);
  EXPECT_EQ(other, components[2]->getTopOwner());
  EXPECT_EQ(sequence, components[1]->getTopOwner());
}

TEST(Sequence, InsertComponentAtTheFrontMovesTheOthersBack) {
  std::vector<std::shared_ptr<Component>> components;
  std::shared_ptr<Sequence> sequence = sequenceOfThree(components);
  std::shared_ptr<Component> first = TimecodeComponent::create();
  sequence->insertComponentAt(0, first);
  ASSERT_EQ(4u, sequence->getComponentCount());
  EXPECT_EQ(first, sequence->getComponentAt(0));
  EXPECT_EQ(components[0], sequence->getComponentAt(1));
}

TEST(Sequence, IndexOperationsCheckTheIndex) {
  std::vector<std::shared_ptr<Component>> components;
  std::shared_ptr<Sequence> sequence = sequenceOfThree(components);
  const std::shared_ptr<const Sequence> constant = sequence;
  for (auto operation : std::vector<std::function<void()>>{
           [&] { sequence->getComponentAt(3); }, [&] { constant->getComponentAt(3); },
           [&] { sequence->insertComponentAt(4, SourceClip::create()); },
           [&] { sequence->removeComponentAt(3); }}) {
    try {
      operation();
      FAIL() << "index out of range accepted";
    } catch (const util::assertion_failure& failure) {
      EXPECT_EQ("assertion failure: valid index", what(failure));
    }
  }
  EXPECT_EQ(3u, sequence->getComponentCount());
}

TEST(Sequence, AddingAComponentOwnedElsewhereFails) {
  std::vector<std::shared_ptr<Component>> components;
  std::shared_ptr<Sequence> sequence = sequenceOfThree(components);
  std::shared_ptr<Sequence> other = Sequence::create();
  try {
    other->addComponent(components[0]);
    FAIL() << "a component got two owners";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: object is not owned", what(failure));
  }
  EXPECT_EQ(0u, other->getComponentCount());
}

TEST(Component, DurationIsOptionalAndItsGetterChecks) {
  std::shared_ptr<Component> component = Component::create();
  EXPECT_FALSE(component->hasDuration());
  try {
    component->getDuration();
    FAIL() << "an unset duration was read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: Component.duration is present", what(failure));
  }
  component->setDuration(0);
  EXPECT_TRUE(component->hasDuration());
  component->removeDuration();
  EXPECT_FALSE(component->hasDuration());
}

TEST(ComponentFactory, OptionalValueWithTheDefaultsBytesIsPresentAndOmittedIsNot) {
  SourceClipFactory factory;
  FactoryParse run;
  MXFPropertyMap required{{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                          {propertyKeyOf("02: 06 01 01 03 01 00 00 00"), bytesOf(basicUMID)},
                          {propertyKeyOf("02: 06 01 01 03 02 00 00 00"), bytesOf("00 00 00 01")},
                          {propertyKeyOf("02: 07 02 01 03 01 04 00 00"), bytesOf("00 00 00 00 00 00 00 00")}};
  MXFPropertyMap withDuration = required;
  withDuration[propertyKeyOf("02: 07 02 02 01 01 03 00 00")] = bytesOf("00 00 00 00 00 00 00 00");
  std::shared_ptr<Component> present = std::dynamic_pointer_cast<Component>(
      run.parse(factory, primedSetOf(factory.getSetKey(), 1, withDuration)).object);
  std::shared_ptr<Component> absent = std::dynamic_pointer_cast<Component>(
      run.parse(factory, primedSetOf(factory.getSetKey(), 2, required)).object);
  EXPECT_TRUE(run.reports().empty());
  ASSERT_TRUE(present->hasDuration());
  EXPECT_EQ(0, present->getDuration());
  EXPECT_FALSE(absent->hasDuration());
  EXPECT_EQ(1u, codeWith(factory, present).count(propertyKeyOf("02: 07 02 02 01 01 03 00 00")));
  EXPECT_EQ(0u, codeWith(factory, absent).count(propertyKeyOf("02: 07 02 02 01 01 03 00 00")));
}

TEST(SourceReferenceFactory, SetKeyAndStaticTagsAreThoseOfTheTable) {
  SourceReferenceFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 10 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(componentRows, sourceReferenceRows)), factory.getSetPrimer());
}

TEST(SourceReferenceFactory, UMIDOf33OctetsIsReportedAsInvalidValue) {
  SourceReferenceFactory factory;
  FactoryParse run;
  MXFParsedObject parsed = run.parse(
      factory, primedSetOf(factory.getSetKey(), 1,
                           {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                            {propertyKeyOf("02: 06 01 01 03 01 00 00 00"), bytesOf(basicUMID + " 01")},
                            {propertyKeyOf("02: 06 01 01 03 02 00 00 00"), bytesOf("00 00 00 02")}}));
  EXPECT_EQ(std::vector<std::string>{"error 03 invalid SourceReference.sourcePackageID value - assertion failure: "
                                     "valid size"},
            run.reports());
  EXPECT_EQ(invalidPropertyValueId, run.errors->reports.at(0).identifier);
  std::shared_ptr<SourceReference> reference = std::dynamic_pointer_cast<SourceReference>(parsed.object);
  EXPECT_EQ(UMID(), reference->getSourcePackageID());
  EXPECT_EQ(2u, reference->getSourceTrackID());
}

TEST(SourceReferenceFactory, UMIDOf32And64OctetsPass) {
  SourceReferenceFactory factory;
  FactoryParse run;
  for (const std::string& umid : {basicUMID, basicUMID + " " + basicUMID}) {
    MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1,
                                   {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                                    {propertyKeyOf("02: 06 01 01 03 01 00 00 00"), bytesOf(umid)},
                                    {propertyKeyOf("02: 06 01 01 03 02 00 00 00"), bytesOf("00 00 00 02")}});
    std::shared_ptr<SourceReference> reference =
        std::dynamic_pointer_cast<SourceReference>(run.parse(factory, set).object);
    EXPECT_EQ(bytesOf(umid), reference->getSourcePackageID().octets);
    EXPECT_EQ(set.properties, codeWith(factory, reference));
  }
  EXPECT_TRUE(run.reports().empty());
}

TEST(SourceClipFactory, SetKeyStaticTagsParseAndCode) {
  SourceClipFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 11 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(joined(componentRows, sourceReferenceRows),
                                    {{"02: 07 02 01 03 01 04 00 00", 0x1201}})),
            factory.getSetPrimer());
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 7,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                                  {propertyKeyOf("02: 07 02 02 01 01 03 00 00"), bytesOf("00 00 00 00 00 00 00 19")},
                                  {propertyKeyOf("02: 06 01 01 03 01 00 00 00"), bytesOf(basicUMID)},
                                  {propertyKeyOf("02: 06 01 01 03 02 00 00 00"), bytesOf("00 00 00 02")},
                                  {propertyKeyOf("02: 07 02 01 03 01 04 00 00"), bytesOf("FF FF FF FF FF FF FF FE")},
                                  {propertyKeyOf("02: 05 20 07 01 08 00 00 00"), uidBytes(0x44)}});
  std::shared_ptr<SourceClip> clip = std::dynamic_pointer_cast<SourceClip>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(25, clip->getDuration());
  EXPECT_EQ(2u, clip->getSourceTrackID());
  EXPECT_EQ(-2, clip->getStartPosition());
  EXPECT_EQ(uidOf(0x44), clip->getGenerationUID());
  EXPECT_EQ(set.properties, codeWith(factory, clip));
}

TEST(DMSourceClipFactory, SetKeyStaticTagsAndTargetTrackIDs) {
  DMSourceClipFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 45 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(joined(componentRows, sourceReferenceRows),
                                    {{"02: 07 02 01 03 01 04 00 00", 0x1201},
                                     {"05: 01 07 01 06 00 00 00 00", 0x6103}})),
            factory.getSetPrimer());
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 7,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                                  {propertyKeyOf("02: 06 01 01 03 01 00 00 00"), bytesOf(basicUMID)},
                                  {propertyKeyOf("02: 06 01 01 03 02 00 00 00"), bytesOf("00 00 00 02")},
                                  {propertyKeyOf("02: 07 02 01 03 01 04 00 00"), bytesOf("00 00 00 00 00 00 00 00")},
                                  {propertyKeyOf("05: 01 07 01 06 00 00 00 00"),
                                   bytesOf("00 00 00 02 00 00 00 04 00 00 00 01 00 00 00 03")}});
  std::shared_ptr<DMSourceClip> clip = std::dynamic_pointer_cast<DMSourceClip>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ((std::vector<std::uint32_t>{1, 3}), clip->getTargetTrackIDs());
  EXPECT_EQ(set.properties, codeWith(factory, clip));
  clip->removeTargetTrackIDs();
  try {
    clip->getTargetTrackIDs();
    FAIL() << "unset target track identifiers were read";
  } catch (const util::assertion_failure& failure) {
    EXPECT_EQ("assertion failure: DMSourceClip.targetTrackIDs is present", what(failure));
  }
}

TEST(TimecodeComponentFactory, SetKeyStaticTagsParseAndCode) {
  TimecodeComponentFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 14 00"), factory.getSetKey());
  EXPECT_EQ(structuralPrimer(joined(componentRows, {{"02: 07 02 01 03 01 05 00 00", 0x1501},
                                                    {"02: 04 04 01 01 02 06 00 00", 0x1502},
                                                    {"01: 04 04 01 01 05 00 00 00", 0x1503}})),
            factory.getSetPrimer());
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 9,
                                 {{propertyKeyOf("02: 04 07 01 00 00 00 00 00"), bytesOf(pictureDefinition)},
                                  {propertyKeyOf("02: 07 02 01 03 01 05 00 00"), bytesOf("00 00 00 00 00 01 51 80")},
                                  {propertyKeyOf("02: 04 04 01 01 02 06 00 00"), bytesOf("00 1E")},
                                  {propertyKeyOf("01: 04 04 01 01 05 00 00 00"), bytesOf("01")}});
  std::shared_ptr<TimecodeComponent> timecode =
      std::dynamic_pointer_cast<TimecodeComponent>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(86400, timecode->getStartTimecode());
  EXPECT_EQ(30, timecode->getRoundedTimecodeBase());
  EXPECT_TRUE(timecode->getDropFrame());
  EXPECT_EQ(set.properties, codeWith(factory, timecode));
}

TEST(TimecodeComponentFactory, AnyNonZeroDropFrameReadsTrueAndIsWrittenAsOne) {
  TimecodeComponentFactory factory;
  FactoryParse run;
  std::shared_ptr<TimecodeComponent> timecode = std::dynamic_pointer_cast<TimecodeComponent>(
      run.parse(factory, primedSetOf(factory.getSetKey(), 9,
                                     {{propertyKeyOf("01: 04 04 01 01 05 00 00 00"), bytesOf("02")}}))
          .object);
  EXPECT_TRUE(timecode->getDropFrame());
  EXPECT_EQ(bytesOf("01"), codeWith(factory, timecode).at(propertyKeyOf("01: 04 04 01 01 05 00 00 00")));
  EXPECT_EQ((std::vector<std::string>{"error 02 missing TimecodeComponent.startTimecode",
                                      "error 02 missing TimecodeComponent.roundedTimecodeBase",
                                      "error 02 missing Component.dataDefinition"}),
            run.reports());
}
