// The primed set parser under a subclass with a fixed primer of its own, as
// a parser of index table segments uses it.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const char* const instanceUIDKey = "06 0E 2B 34 01 01 01 01 01 01 15 02 00 00 00 00";
const char* const segmentKey = "06 0E 2B 34 02 53 01 01 0D 01 02 01 01 10 01 00";

// Ready for sets from the start of each stream; wants segments only.
class FixedPrimerParser : public MXFPrimedSetParser {
 public:
  FixedPrimerParser() : primer_{{0x3C0A, keyOf(instanceUIDKey)}} {}

  void startStream(bool) override { setState(betweenSets); }
  void endStream(bool) override { setState(idle); }
  const MXFTagToKeyMap& getPrimer() override { return primer_; }
  bool acceptSet(const KLVKey& key) override { return key == keyOf(segmentKey); }
  void primedSet(const MXFPrimedSet& set) override { sets.push_back(set); }

  std::vector<MXFPrimedSet> sets;

 private:
  MXFTagToKeyMap primer_;
};

}  // namespace

TEST(MXFPrimedSetParser, SubclassPrimerServesWithoutAPrimerPack) {
  FixedPrimerParser parser;
  RecordingErrorHandler errors;
  parser.setErrorHandler(&errors);
  ByteVector bytes = concat({twoOctetSet(identificationKey(), {{0x3C0A, ByteVector(16, 1)}}),
                             twoOctetSet(keyOf(segmentKey), {{0x3C0A, ByteVector(16, 2)}, {0x3F05, bytesOf("01")}})});
  readThrough(bytes, parser, &errors);
  ASSERT_EQ(1u, parser.sets.size());
  EXPECT_EQ(keyOf(segmentKey), parser.sets[0].key);
  EXPECT_EQ(ByteVector(16, 2), parser.sets[0].properties.at(keyOf(instanceUIDKey)));
  EXPECT_EQ(1u, parser.sets[0].properties.size());
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(tagMissingInPrimerId, errors.reports[0].identifier);
  EXPECT_EQ("tag missing in primer - 3F.05", errors.reports[0].message);
}

TEST(MXFPrimedSetParser, SetKeyOfAnotherVersionIsTheSameSet) {
  FixedPrimerParser parser;
  KLVKey key = keyOf(segmentKey);
  key[7] = 0x02;
  readThrough(twoOctetSet(key, {{0x3C0A, ByteVector(16, 2)}}), parser);
  ASSERT_EQ(1u, parser.sets.size());
  EXPECT_EQ(0x02, parser.sets[0].key[7]);
}

TEST(MXFPrimedSetParser, ItemsAndValuesOutsideASetFail) {
  FixedPrimerParser parser;
  parser.startStream(true);
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ("assertion failure: in primed set", assertionTextOf([&] { parser.startLocalItem(0x3C0A, 16, buffer); }));
  EXPECT_EQ("assertion failure: in primed set", assertionTextOf([&] { parser.value(nullptr, 0); }));
}

TEST(MXFPrimedSetParser, SetBeforeTheParserIsReadyFails) {
  FixedPrimerParser parser;
  EXPECT_EQ("assertion failure: before primed set",
            assertionTextOf([&] { parser.startLocalSet(keyOf(segmentKey), 0, KLVTagType2, KLVLengthType2); }));
}
