#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// One parse of a list of sets through the test composite.
struct ParserRun {
  explicit ParserRun(std::shared_ptr<TestModelFactory> f = std::make_shared<TestModelFactory>())
      : factory(std::move(f)), parser(&models, factory) {
    factory->setErrorHandler(errors);
    parser.setErrorHandler(errors.get());
  }
  void feed(const std::vector<MXFPrimedSet>& sets) {
    parser.start();
    for (const MXFPrimedSet& set : sets)
      if (parser.acceptSet(set.key)) parser.primedSet(set);
    parser.end();
  }
  std::vector<std::string> reports() const {
    std::vector<std::string> lines;
    for (const Report& r : errors->reports) {
      ByteVector id(r.identifier.data(), r.identifier.data() + 16);
      lines.push_back(r.severity + " " + std::to_string(id[3]) + " " + r.message);
    }
    return lines;
  }
  std::string root() const { return describe(models.models.at(0).at(0)); }

  std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  RecordingModelHandler models;
  std::shared_ptr<TestModelFactory> factory;
  MXFMetadataModelParser parser;
};

const std::string uid02 = uidText(0x02);
const std::string uid04 = uidText(0x04);
const std::string uid06 = uidText(0x06);

}  // namespace

TEST(MXFMetadataModelParser, ReportIdentifiersCarryTheModelFamily) {
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4F, 0x00, 0x01), unrecognizedMetadataId);
  EXPECT_EQ(MXFUID(std::array<std::uint8_t, 16>{0x4C, 0x4F, 0x00, 0x0A, 0x95, 0xD8, 0x11, 0xE1, 0xBB, 0xB2, 0x10,
                                                0x9A, 0xDD, 0x4A, 0xC6, 0x8C}),
            firstObjectNotRootId);
}

TEST(MXFMetadataModelParser, SampleModelInFileOrderGivesOneRootAndNoReport) {
  ParserRun run;
  run.feed(sampleSets());
  EXPECT_EQ((std::vector<std::string>{"start", "model 1", "end"}), run.models.events);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(sampleDescription(), run.root());
}

TEST(MXFMetadataModelParser, StreamWithNoSetsCallsEndWithoutModel) {
  ParserRun run;
  run.feed({});
  EXPECT_EQ((std::vector<std::string>{"start", "end"}), run.models.events);
  EXPECT_TRUE(run.reports().empty());
}

TEST(MXFMetadataModelParser, FirstSetReferredToLaterReportsFirstObjectIsNotModelRoot) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  std::rotate(sets.begin(), sets.begin() + 3, sets.begin() + 4);  // Credit 04 first
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"warning 7 backward strong reference - " + uid04,
                                      "error 10 first object is not model root"}),
            run.reports());
  EXPECT_EQ((std::vector<std::string>{"start", "model 1", "end"}), run.models.events);
  EXPECT_EQ(sampleDescription(), run.root());
}

TEST(MXFMetadataModelParser, ChildBeforeRootConnectsBackwardLeavesRootsAndFiresFirstRootError) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  std::rotate(sets.begin(), sets.begin() + 5, sets.end());  // Artwork 06 first, as a ContentStorage before its Preface
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"warning 7 backward strong reference - " + uid06,
                                      "error 10 first object is not model root"}),
            run.reports());
  ASSERT_EQ(1u, run.models.models.size());
  ASSERT_EQ(1u, run.models.models[0].size());
  EXPECT_EQ(sampleDescription(), run.root());
}

TEST(MXFMetadataModelParser, DuplicateIdentifierStaysInRootsAndReferencesGoToTheFirst) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  MXFPrimedSet duplicate = sets[1];
  duplicate.properties[testPropertyKey(0x11)] = uint32Bytes(9);
  duplicate.properties.erase(testPropertyKey(0x12));
  sets.insert(sets.begin() + 2, duplicate);
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"error 4 duplicate MetadataRoot.instanceUID - " + uid02,
                                      "warning 8 unreferenced objects - " + uid02}),
            run.reports());
  ASSERT_EQ(2u, run.models.models.at(0).size());
  EXPECT_EQ(sampleDescription(), run.root());
  EXPECT_EQ("Song 02020202020202020202020202020202 number 9\n", describe(run.models.models[0][1]));
}

TEST(MXFMetadataModelParser, DuplicateIdentifierBeforeItsReferrerConnectsBackwardToTheFirst) {
  std::vector<MXFPrimedSet> sets = {
      primedSetOf(testSetKey(0x02), 0x02, {{testPropertyKey(0x11), uint32Bytes(1)}}),
      primedSetOf(testSetKey(0x02), 0x02, {{testPropertyKey(0x11), uint32Bytes(9)}}),
      primedSetOf(testSetKey(0x01), 0x01, {{testPropertyKey(0x01), uint16Bytes(2)}, {testPropertyKey(0x03), uidBatch({0x02})}})};
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"error 4 duplicate MetadataRoot.instanceUID - " + uid02,
                                      "warning 7 backward strong reference - " + uid02,
                                      "error 10 first object is not model root",
                                      "warning 8 unreferenced objects - " + uidText(0x01)}),
            run.reports());
  // The duplicate came before the Album and stays ahead of it.
  ASSERT_EQ(2u, run.models.models.at(0).size());
  EXPECT_EQ("Song 02020202020202020202020202020202 number 9\n", run.root());
  EXPECT_EQ("Album 01010101010101010101010101010101 version 2\n Song 02020202020202020202020202020202 number 1\n",
            describe(run.models.models[0][1]));
}

TEST(MXFMetadataModelParser, SecondStrongReferenceToOneObjectReportsAlreadyOwnedAndDangles) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[2].properties[testPropertyKey(0x12)] = uidBatch({0x04});  // LiveSong 03 claims Credit 04 too
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"error 5 referenced object is already owned - " + uid04,
                                      "warning 9 model has dangling references - " + uid04}),
            run.reports());
  EXPECT_EQ(sampleDescription(), run.root());
}

TEST(MXFMetadataModelParser, WeakReferenceToOwnedObjectConnectsSilentlyInEitherDirection) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[3].properties[testPropertyKey(0x32)] = uidBytes(0x02);  // back to Song 02, owned already
  sets[4].properties[testPropertyKey(0x32)] = uidBytes(0x03);  // after Album: LiveSong 03 comes later
  std::swap(sets[2], sets[4]);
  ParserRun run;
  run.feed(sets);
  EXPECT_TRUE(run.reports().empty());
  std::string expected = sampleDescription();
  const std::string role1 = "role 1";
  expected.insert(expected.find(role1) + role1.size(), " performer 02020202020202020202020202020202");
  const std::string role2 = "role 2";
  expected.insert(expected.find(role2) + role2.size(), " performer 03030303030303030303030303030303");
  EXPECT_EQ(expected, run.root());
}

TEST(MXFMetadataModelParser, EveryOrderOfTheSixSetsGivesTheSameTree) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  std::vector<std::size_t> order{0, 1, 2, 3, 4, 5};
  int permutations = 0;
  do {
    std::vector<MXFPrimedSet> shuffled;
    for (std::size_t i : order) shuffled.push_back(sets[i]);
    ParserRun run;
    run.feed(shuffled);
    ASSERT_EQ(1u, run.models.models.at(0).size()) << permutations;
    ASSERT_EQ(sampleDescription(), run.root()) << permutations;
    ++permutations;
  } while (std::next_permutation(order.begin(), order.end()));
  EXPECT_EQ(720, permutations);
}

TEST(MXFMetadataModelParser, UnreferencedObjectsGiveOneWarningWithTheSecondAndAllReachTheHandler) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets.push_back(primedSetOf(testSetKey(0x04), 0x07, {{testPropertyKey(0x31), ByteVector{0x07}}}));
  sets.push_back(primedSetOf(testSetKey(0x04), 0x08, {{testPropertyKey(0x31), ByteVector{0x08}}}));
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"warning 8 unreferenced objects - " + uidText(0x07)}), run.reports());
  ASSERT_EQ(3u, run.models.models.at(0).size());
  EXPECT_EQ(sampleDescription(), run.root());
  EXPECT_EQ(uidOf(0x07), run.models.models[0][1]->getInstanceUID());
  EXPECT_EQ(uidOf(0x08), run.models.models[0][2]->getInstanceUID());
}

TEST(MXFMetadataModelParser, DanglingReferenceGivesOneWarningAndAShorterVector) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[1].properties[testPropertyKey(0x12)] = uidBatch({0x09, 0x04, 0x0A, 0x05});
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"warning 9 model has dangling references - " + uidText(0x09)}), run.reports());
  EXPECT_EQ(sampleDescription(), run.root());
}

TEST(MXFMetadataModelParser, UnknownSetIsSkippedWithWarningAndItsReferenceDangles) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[5].key = testSetKey(0x7E);
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{
                "warning 1 unrecognized (dark) metadata - 06.0E.2B.34.02.53.01.01.0E.7F.01.01.01.01.7E.00",
                "warning 9 model has dangling references - " + uid06}),
            run.reports());
  EXPECT_FALSE(std::dynamic_pointer_cast<Album>(run.models.models.at(0).at(0))->hasArtwork());
}

TEST(MXFMetadataModelParser, BERKeyIsParsedForAClassThatAllowsItAndUnrecognizedOtherwise) {
  MXFPrimedSet lyrics = primedSetOf(testSetKey(0x06), 0x01, {});
  lyrics.key[5] = 0x13;
  MXFPrimedSet album = sampleSets()[0];
  album.key[5] = 0x13;
  ParserRun run;
  run.feed({lyrics, album});
  EXPECT_EQ((std::vector<std::string>{
                "warning 1 unrecognized (dark) metadata - 06.0E.2B.34.02.13.01.01.0E.7F.01.01.01.01.01.00"}),
            run.reports());
  ASSERT_EQ(1u, run.models.models.at(0).size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<Lyrics>(run.models.models[0][0]));
}

TEST(MXFMetadataModelParser, MissingAndInvalidPropertiesAreReportedAndTheObjectKeepsItsDefaults) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[1].properties.erase(testPropertyKey(0x11));
  sets[3].properties[testPropertyKey(0x31)] = ByteVector{0x01, 0x02};
  sets[4].properties[MXFInstanceUIDKey] = ByteVector(15, 0x05);
  ParserRun run;
  run.feed(sets);
  const std::vector<std::string> reports = run.reports();
  ASSERT_EQ(5u, reports.size());
  EXPECT_EQ("error 2 missing Song.number", reports[0]);
  EXPECT_EQ("error 3 invalid Credit.role value - assertion failure: valid external length", reports[1]);
  EXPECT_EQ("error 3 invalid MetadataRoot.instanceUID value - assertion failure: successful read()", reports[2]);
  EXPECT_EQ("warning 9 model has dangling references - " + uidText(0x05), reports[3]);
  EXPECT_EQ(0u, reports[4].find("warning 8 unreferenced objects - "));
  const auto song = std::dynamic_pointer_cast<const Album>(run.models.models.at(0).at(0))->getSongAt(0);
  EXPECT_EQ(0u, song->getNumber());
  EXPECT_EQ(0u, song->getCreditAt(0)->getRole());
}

// The Album's reference comes first in pending and fails; the Song's then
// connects.
TEST(MXFMetadataModelParser, ReferenceToObjectOfAnotherClassIsInvalidAndStaysPending) {
  std::vector<MXFPrimedSet> sets = sampleSets();
  sets[0].properties[testPropertyKey(0x04)] = uidBytes(0x05);  // an Artwork reference to a Credit
  sets.erase(sets.begin() + 4);
  sets.push_back(primedSetOf(testSetKey(0x04), 0x05, {{testPropertyKey(0x31), ByteVector{0x02}}}));
  ParserRun run;
  run.feed(sets);
  EXPECT_EQ((std::vector<std::string>{"error 6 invalid reference - " + uidText(0x05) +
                                          " - assertion failure: object is value type",
                                      "warning 9 model has dangling references - " + uidText(0x05),
                                      "warning 8 unreferenced objects - " + uid06}),
            run.reports());
}

TEST(MXFMetadataModelParser, StartResetsTheParserForTheNextModel) {
  ParserRun run;
  run.feed(sampleSets());
  run.feed(sampleSets());
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ((std::vector<std::string>{"start", "model 1", "end", "start", "model 1", "end"}), run.models.events);
}
