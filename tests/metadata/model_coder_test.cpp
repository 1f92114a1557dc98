#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

std::shared_ptr<Album> parseSample(const std::shared_ptr<TestModelFactory>& factory,
                                   const std::vector<MXFPrimedSet>& sets) {
  RecordingModelHandler models;
  MXFMetadataModelParser parser(&models, factory);
  parser.start();
  for (const MXFPrimedSet& set : sets)
    if (parser.acceptSet(set.key)) parser.primedSet(set);
  parser.end();
  return std::dynamic_pointer_cast<Album>(models.models.at(0).at(0));
}

void codeModel(const std::shared_ptr<MetadataRoot>& root, RecordingMetadataHandler& sets,
               const std::shared_ptr<MXFMetadataFactory>& factory = std::make_shared<TestModelFactory>()) {
  MXFMetadataModelCoder coder(&sets, factory);
  coder.start();
  coder.model({root});
  coder.end();
}

std::vector<MXFUID> identifiersOf(const RecordingMetadataHandler& sets) {
  std::vector<MXFUID> ids;
  for (const MXFPrimedSet& set : sets.sets) {
    MXFUID id;
    internalize(set.properties.at(MXFInstanceUIDKey), id);
    ids.push_back(id);
  }
  return ids;
}

std::string failureOf(const std::shared_ptr<MetadataRoot>& root, const std::shared_ptr<MXFMetadataFactory>& factory,
                      RecordingMetadataHandler& sets) {
  MXFMetadataModelCoder coder(&sets, factory);
  try {
    coder.model({root});
  } catch (const util::assertion_failure& failure) {
    return failure.what();
  }
  return "no failure";
}

// A composite over a given list.
class ListModelFactory : public MXFMetadataModelFactory {
public:
  explicit ListModelFactory(Factories factories) : factories_(std::move(factories)) {}
  const Factories& getFactories() override { return factories_; }

private:
  Factories factories_;
};

// An Artwork whose size has Credit.role's static tag.
class ClashingArtworkFactory : public ArtworkFactory {
public:
  ClashingArtworkFactory() { getSetPrimer()[testPropertyKey(0x41)] = 0x7F31; }
};

}  // namespace

TEST(MXFMetadataModelCoder, WalksDepthFirstWithTheRootFirst) {
  RecordingMetadataHandler sets;
  codeModel(parseSample(std::make_shared<TestModelFactory>(), sampleSets()), sets);
  EXPECT_EQ((std::vector<MXFUID>{uidOf(1), uidOf(2), uidOf(4), uidOf(5), uidOf(3), uidOf(6)}), identifiersOf(sets));
  EXPECT_EQ("start", sets.events.front());
  EXPECT_EQ("primer 10", sets.events[1]);
  EXPECT_EQ("end", sets.events.back());
  EXPECT_EQ(sampleSets()[1], sets.sets[1]);
}

TEST(MXFMetadataModelCoder, DynamicTagsStartAt0x8000InKeyOrderAndStepOverStaticOnes) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  album->setDarkProperty(testPropertyKey(0x61), ByteVector{0x61});
  album->setDarkProperty(testPropertyKey(0x60), ByteVector{0x60});
  album->setDarkProperty(MXFPropertyOrderHintKey, ByteVector{});
  RecordingMetadataHandler sets;
  codeModel(album, sets);
  const MXFPrimerEntries& primer = sets.primers.at(0);
  ASSERT_EQ(12u, primer.size());
  EXPECT_EQ((MXFPrimerEntry{0x3C0A, MXFInstanceUIDKey}), primer[0]);
  EXPECT_EQ((MXFPrimerEntry{0x7F01, testPropertyKey(0x01)}), primer[1]);
  EXPECT_EQ((MXFPrimerEntry{0x7F41, testPropertyKey(0x41)}), primer[8]);
  EXPECT_EQ((MXFPrimerEntry{0x8000, testPropertyKey(0x60)}), primer[9]);
  EXPECT_EQ((MXFPrimerEntry{0x8001, testPropertyKey(0x21)}), primer[10]);
  EXPECT_EQ((MXFPrimerEntry{0x8002, testPropertyKey(0x61)}), primer[11]);
}

TEST(MXFMetadataModelCoder, DarkKeyOfAnotherClassGetsItsStaticTagBackFromALaterSetOfThatClass) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  album->setDarkProperty(testPropertyKey(0x31), ByteVector{0x09});
  RecordingMetadataHandler sets;
  codeModel(album, sets);
  EXPECT_EQ((MXFPrimerEntry{0x7F31, testPropertyKey(0x31)}), sets.primers.at(0).at(7));
  EXPECT_EQ(ByteVector{0x09}, sets.sets.at(0).properties.at(testPropertyKey(0x31)));
}

TEST(MXFMetadataModelCoder, DarkKeyOfAnotherClassAfterTheLastSetOfThatClassGetsADynamicTag) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  std::const_pointer_cast<Artwork>(album->getArtwork())->setDarkProperty(testPropertyKey(0x31), ByteVector{0x09});
  RecordingMetadataHandler sets;
  codeModel(album, sets);
  EXPECT_EQ(10u, sets.primers.at(0).size());
  EXPECT_EQ((MXFPrimerEntry{0x8000, testPropertyKey(0x31)}), sets.primers.at(0).at(8));
}

TEST(MXFMetadataModelCoder, LargeValueOfBERClassIsCodedWithKeyOctet5Of0x13) {
  for (std::size_t size : {std::size_t{0xFFFF}, std::size_t{0x10000}}) {
    std::shared_ptr<Lyrics> lyrics = Lyrics::create();
    lyrics->setDarkProperty(testPropertyKey(0x62), ByteVector(size, 0x4C));
    RecordingMetadataHandler sets;
    codeModel(lyrics, sets);
    EXPECT_EQ(size == 0x10000 ? 0x13 : 0x53, sets.sets.at(0).key[5]) << size;
  }
}

TEST(MXFMetadataModelCoder, CollidingStaticTagsFailConsistentPrimerEntryAfterTheWalk) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  auto factory = std::make_shared<ListModelFactory>(MXFMetadataModelFactory::Factories{
      std::make_shared<AlbumFactory>(), std::make_shared<SongFactory>(), std::make_shared<LiveSongFactory>(),
      std::make_shared<CreditFactory>(), std::make_shared<ClashingArtworkFactory>()});
  RecordingMetadataHandler sets;
  EXPECT_EQ("assertion failure: consistent primer entry", failureOf(album, factory, sets));
  EXPECT_TRUE(sets.events.empty());
}

TEST(MXFMetadataModelCoder, ModelMustBeOneUnownedObject) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  auto factory = std::make_shared<TestModelFactory>();
  RecordingMetadataHandler sets;
  MXFMetadataModelCoder coder(&sets, factory);
  const std::shared_ptr<MetadataRoot> song = std::const_pointer_cast<Song>(album->getSongAt(0));
  for (const MXFMetadataModel& model : {MXFMetadataModel{}, MXFMetadataModel{album, Credit::create()},
                                        MXFMetadataModel{nullptr}, MXFMetadataModel{song}}) {
    try {
      coder.model(model);
      ADD_FAILURE() << "no failure";
    } catch (const util::assertion_failure& failure) {
      EXPECT_STREQ("assertion failure: valid model", failure.what());
    }
  }
  EXPECT_TRUE(sets.events.empty());
}

TEST(MXFMetadataModelCoder, ObjectOfUnknownClassFailsCanHandleObject) {
  std::shared_ptr<Album> album = Album::create();
  album->setDarkProperty(testPropertyKey(0x63), MetadataObject::create());
  RecordingMetadataHandler sets;
  EXPECT_EQ("assertion failure: can handle object", failureOf(album, std::make_shared<TestModelFactory>(), sets));
}

TEST(MXFMetadataModelCoder, PrimedSetOrderMovesListedSetsToTheEndInListedOrder) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  ByteVector order;
  externalize(order, std::vector<MXFUID>{uidOf(4), uidOf(2)}, true);
  album->setDarkProperty(MXFPrimedSetOrderKey, order);
  RecordingMetadataHandler sets;
  codeModel(album, sets);
  EXPECT_EQ((std::vector<MXFUID>{uidOf(1), uidOf(5), uidOf(3), uidOf(6), uidOf(4), uidOf(2)}), identifiersOf(sets));
  for (const MXFPrimerEntry& entry : sets.primers.at(0)) EXPECT_NE(MXFPrimedSetOrderKey, entry.key);
}

TEST(MXFMetadataModelCoder, SecondPrimedSetOrderFailsSinglePrimedSetOrder) {
  std::shared_ptr<Album> album = parseSample(std::make_shared<TestModelFactory>(), sampleSets());
  ByteVector order;
  externalize(order, std::vector<MXFUID>{uidOf(4)}, true);
  album->setDarkProperty(MXFPrimedSetOrderKey, order);
  std::const_pointer_cast<Artwork>(album->getArtwork())->setDarkProperty(MXFPrimedSetOrderKey, order);
  RecordingMetadataHandler sets;
  EXPECT_EQ("assertion failure: single primed set order",
            failureOf(album, std::make_shared<TestModelFactory>(), sets));
}

TEST(MXFMetadataModelCoder, NullStrongReferenceFailsItsPresenceCheck) {
  std::shared_ptr<Album> album = Album::create();
  album->setDarkProperty(testPropertyKey(0x63), std::shared_ptr<MetadataRoot>());
  RecordingMetadataHandler sets;
  EXPECT_EQ("assertion failure: MetadataRoot.referenceDarkProperty is present",
            failureOf(album, std::make_shared<TestModelFactory>(), sets));
}

TEST(MXFMetadataModelCoder, UnknownPropertiesSurviveParseCodeParseUnderNewDynamicTags) {
  std::vector<MXFPrimedSet> input = sampleSets();
  input[1].properties[testPropertyKey(0x50)] = ByteVector{0xDE, 0xAD};
  input[4].properties[testPropertyKey(0x51)] = ByteVector{};
  RecordingMetadataHandler sets;
  codeModel(parseSample(std::make_shared<TestModelFactory>(), input), sets);
  const MXFPrimerEntries& primer = sets.primers.at(0);
  EXPECT_EQ((MXFPrimerEntry{0x8000, testPropertyKey(0x50)}), primer.at(primer.size() - 3));
  EXPECT_EQ((MXFPrimerEntry{0x8001, testPropertyKey(0x21)}), primer.at(primer.size() - 2));
  EXPECT_EQ((MXFPrimerEntry{0x8002, testPropertyKey(0x51)}), primer.at(primer.size() - 1));
  const std::shared_ptr<Album> again = parseSample(std::make_shared<TestModelFactory>(), sets.sets);
  EXPECT_EQ("Album 01010101010101010101010101010101 version 2\n"
            " favourite 03030303030303030303030303030303\n"
            " Artwork 06060606060606060606060606060606 size 100\n"
            " Song 02020202020202020202020202020202 number 1\n"
            "  Credit 04040404040404040404040404040404 role 1\n"
            "  Credit 05050505050505050505050505050505 role 2\n"
            "   dark 060e2b34010101010e7f025100000000 = \n"
            "  dark 060e2b34010101010e7f025000000000 = dead\n"
            " LiveSong 03030303030303030303030303030303 number 2 venue 7\n",
            describe(again));
}

TEST(MXFMetadataModelCoder, DeclaredDarkReferenceCarriesItsSubtreeThroughParseCodeParse) {
  std::vector<MXFPrimedSet> input = sampleSets();
  input[0].properties[albumDarkReferenceKey()] = uidBytes(0x07);
  input.push_back(primedSetOf(testSetKey(0x02), 0x07,
                              {{testPropertyKey(0x11), uint32Bytes(7)}, {testPropertyKey(0x12), uidBatch({0x08})}}));
  input.push_back(primedSetOf(testSetKey(0x04), 0x08, {{testPropertyKey(0x31), ByteVector{0x08}}}));
  const std::string subtree =
      " dark 060e2b34010101010e7f027000000000 ->\n"
      "  Song 07070707070707070707070707070707 number 7\n"
      "   Credit 08080808080808080808080808080808 role 8\n";
  const std::shared_ptr<Album> album = parseSample(std::make_shared<DarkReferenceModelFactory>(), input);
  EXPECT_EQ(sampleDescription() + subtree, describe(album));
  RecordingMetadataHandler sets;
  codeModel(album, sets);
  EXPECT_EQ((std::vector<MXFUID>{uidOf(1), uidOf(7), uidOf(8), uidOf(2), uidOf(4), uidOf(5), uidOf(3), uidOf(6)}),
            identifiersOf(sets));
  EXPECT_EQ(sampleDescription() + subtree,
            describe(parseSample(std::make_shared<DarkReferenceModelFactory>(), sets.sets)));
}

TEST(MXFMetadataModelFactory, DeclaredDarkReferenceThatIsNoIdentifierIsReportedAndStaysBytes) {
  std::vector<MXFPrimedSet> input = sampleSets();
  input[0].properties[albumDarkReferenceKey()] = ByteVector(15, 0x07);
  auto factory = std::make_shared<DarkReferenceModelFactory>();
  auto errors = std::make_shared<RecordingErrorHandler>();
  factory->setErrorHandler(errors);
  const std::shared_ptr<Album> album = parseSample(factory, input);
  ASSERT_EQ(1u, errors->reports.size());
  EXPECT_EQ(invalidPropertyValueId, errors->reports[0].identifier);
  EXPECT_EQ("invalid reference dark property (06.0E.2B.34.01.01.01.01.0E.7F.02.70.00.00.00.00) value - "
            "assertion failure: successful read()",
            errors->reports[0].message);
  EXPECT_EQ(ByteVector(15, 0x07), album->getDarkProperty(albumDarkReferenceKey()));
}

TEST(MXFMetadataModelFactory, ParseNeedsCanParseFirstAndCachesBothWays) {
  TestModelFactory factory;
  const MXFPrimedSet set = sampleSets()[1];
  try {
    factory.parse(set);
    ADD_FAILURE() << "no failure";
  } catch (const util::assertion_failure& failure) {
    EXPECT_STREQ("assertion failure: can handle set key", failure.what());
  }
  EXPECT_TRUE(factory.canParse(set.key));
  EXPECT_TRUE(typeid(Song) == factory.getType(set.key));
  EXPECT_EQ(set.key, factory.getSetKey(typeid(Song)));
  EXPECT_FALSE(factory.canParse(testSetKey(0x7E)));
  EXPECT_TRUE(factory.canCode(typeid(LiveSong)));
  EXPECT_EQ(0x8001, factory.getSetPrimer(typeid(LiveSong)).at(testPropertyKey(0x21)));
  EXPECT_EQ(0x7F11, factory.getSetPrimer(typeid(LiveSong)).at(testPropertyKey(0x11)));
  EXPECT_FALSE(factory.canCode(typeid(MetadataObject)));
}
