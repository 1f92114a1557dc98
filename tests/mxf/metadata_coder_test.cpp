// The metadata coder writing primers and primed sets, read back as octets.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "mxf.h"
#include "support/klv_output.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const char* const instanceUIDKey = "06 0E 2B 34 01 01 01 01 01 01 15 02 00 00 00 00";
const char* const companyNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 02 01 00 00";
const char* const productNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 03 01 00 00";
const char* const versionKey = "06 0E 2B 34 01 01 01 02 03 01 02 01 05 00 00 00";
const char* const dynamicKey = "06 0E 2B 34 01 01 01 05 04 01 06 02 01 0B 00 00";
const char* const orderHintKey = "9C EF 38 E7 D8 04 25 C1 C3 D2 00 01 9C AD 11 E0";
const char* const setOrderKey = "9C EF 38 E7 D8 04 25 C1 C3 D2 00 02 9C AD 11 E0";
const char* const prefaceKey = "06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 2F 00";
const char* const identificationKey = "06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 30 00";
const char* const primerKey = "06 0E 2B 34 02 05 01 01 0D 01 02 01 01 05 01 00";
const char* const fillItemKey = "06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00";

const MXFPrimerEntries fourEntries{{0x3C0A, keyOf(instanceUIDKey)},
                                   {0x3C01, keyOf(companyNameKey)},
                                   {0x3B05, keyOf(versionKey)},
                                   {0x8000, keyOf(dynamicKey)}};

// Primer pack: key, four-octet length, count, entry size, 18 octets each.
constexpr std::size_t primerPackSize = 16 + 4 + 8 + 18 * 4;

MXFPrimedSet setOf(const char* key, const std::vector<std::pair<const char*, ByteVector>>& properties) {
  MXFPrimedSet set;
  set.key = keyOf(key);
  for (const auto& property : properties) set.properties[keyOf(property.first)] = property.second;
  return set;
}

// A batch of keys: count, item size 16, the keys.
ByteVector hintOf(const std::vector<const char*>& keys) {
  ByteVector value = bytesOf("00 00 00 00 00 00 00 10");
  value[3] = static_cast<std::uint8_t>(keys.size());
  for (const char* key : keys) {
    ByteVector octets = bytesOf(key);
    value.insert(value.end(), octets.begin(), octets.end());
  }
  return value;
}

ByteVector slice(const ByteVector& bytes, std::size_t offset, std::size_t size) {
  if (offset + size > bytes.size()) return ByteVector();
  return ByteVector(bytes.begin() + static_cast<std::ptrdiff_t>(offset),
                    bytes.begin() + static_cast<std::ptrdiff_t>(offset + size));
}

template <typename Coder = MXFMetadataCoder>
struct CoderBench {
  CoderBench() : writer(out), coder(&writer) {}

  // Codes the primer and the sets as one stream; the octets written.
  ByteVector code(const MXFPrimerEntries& entries, const std::vector<MXFPrimedSet>& sets) {
    coder.start();
    coder.primer(entries);
    for (const MXFPrimedSet& set : sets) coder.primedSet(set);
    coder.end();
    return klv::outputOf(out);
  }

  std::ostringstream out;
  GenericKLVWriter writer;
  Coder coder;
};

// The version 1.3 model: Preface, then an Identification.
std::vector<MXFPrimedSet> modelOfVersion(const char* version) {
  return {setOf(prefaceKey, {{instanceUIDKey, ByteVector(16, 1)}, {versionKey, bytesOf(version)}}),
          setOf(identificationKey, {{instanceUIDKey, ByteVector(16, 2)}, {companyNameKey, bytesOf("00 41")}})};
}

}  // namespace

TEST(MXFMetadataCoder, WritesThePrimerPackInFourOctetLengths) {
  CoderBench<> bench;
  ByteVector bytes = bench.code(fourEntries, {});
  ByteVector expected = concat({bytesOf(primerKey), bytesOf("83 00 00 50 00 00 00 04 00 00 00 12"), bytesOf("3C 0A"),
                                bytesOf(instanceUIDKey), bytesOf("3C 01"), bytesOf(companyNameKey), bytesOf("3B 05"),
                                bytesOf(versionKey), bytesOf("80 00"), bytesOf(dynamicKey)});
  EXPECT_EQ(expected, bytes);
}

TEST(MXFMetadataCoder, VersionOneThreeStartsThePrefaceOnFiveHundredTwelve) {
  CoderBench<> bench;
  ByteVector bytes = bench.code(fourEntries, modelOfVersion("01 03"));
  // 100 octets of primer, then a fill item of 20 + 392 octets.
  EXPECT_EQ(concat({bytesOf(fillItemKey), bytesOf("83 00 01 88")}), slice(bytes, primerPackSize, 20));
  EXPECT_EQ(ByteVector(392, 0), slice(bytes, primerPackSize + 20, 392));
  EXPECT_EQ(bytesOf(prefaceKey), slice(bytes, 512, 16));
  // Preface: 16 + 4 + (4 + 16) + (4 + 2); Identification: 16 + 4 + (4 + 16) + (4 + 2); no fill at the end.
  EXPECT_EQ(512u + 46 + 46, bytes.size());
  EXPECT_EQ(bytesOf(identificationKey), slice(bytes, 512 + 46, 16));
}

TEST(MXFMetadataCoder, VersionOneTwoAddsNoFill) {
  CoderBench<> bench;
  ByteVector bytes = bench.code(fourEntries, modelOfVersion("01 02"));
  EXPECT_EQ(bytesOf(prefaceKey), slice(bytes, primerPackSize, 16));
  EXPECT_EQ(primerPackSize + 46 + 46, bytes.size());
}

TEST(MXFMetadataCoder, PrefaceWithoutVersionIsNotAligned) {
  CoderBench<> bench;
  ByteVector bytes = bench.code(fourEntries, {setOf(prefaceKey, {{instanceUIDKey, ByteVector(16, 1)}})});
  EXPECT_EQ(bytesOf(prefaceKey), slice(bytes, primerPackSize, 16));
  EXPECT_EQ(primerPackSize + 40, bytes.size());
}

TEST(MXFMetadataCoder, PrefaceWithAnUnreadableVersionIsNotAligned) {
  CoderBench<> bench;
  ByteVector bytes = bench.code(fourEntries, modelOfVersion("01 03 00"));
  EXPECT_EQ(bytesOf(prefaceKey), slice(bytes, primerPackSize, 16));
}

TEST(MXFMetadataCoder, SetsBeforeThePrefaceAreAlignedWithThePrimer) {
  CoderBench<> bench;
  std::vector<MXFPrimedSet> sets = modelOfVersion("01 04");
  std::swap(sets[0], sets[1]);
  ByteVector bytes = bench.code(fourEntries, sets);
  EXPECT_EQ(bytesOf(identificationKey), slice(bytes, primerPackSize, 16));
  EXPECT_EQ(bytesOf(fillItemKey), slice(bytes, primerPackSize + 46, 16));
  EXPECT_EQ(bytesOf(prefaceKey), slice(bytes, 512, 16));
}

TEST(MXFMetadataCoder, ItemsWithoutHintStandInKeyOrder) {
  CoderBench<> bench;
  MXFPrimedSet set =
      setOf(identificationKey,
            {{companyNameKey, bytesOf("00 41")}, {dynamicKey, ByteVector()}, {instanceUIDKey, ByteVector(16, 7)}});
  ByteVector bytes = bench.code(fourEntries, {set});
  // Octet 7 takes no part in key order: instanceUID (octet 8 01), the dynamic key (04), companyName (05).
  ByteVector expected = concat({bytesOf(identificationKey), bytesOf("83 00 00 1E"), bytesOf("3C 0A 00 10"),
                                ByteVector(16, 7), bytesOf("80 00 00 00"), bytesOf("3C 01 00 02 00 41")});
  EXPECT_EQ(expected, slice(bytes, primerPackSize, expected.size()));
  EXPECT_EQ(primerPackSize + expected.size(), bytes.size());
}

TEST(MXFMetadataCoder, HintNamingAllKeysLeavesNothingForTheSortedRest) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf(identificationKey, {{companyNameKey, bytesOf("00 41")},
                                               {dynamicKey, bytesOf("05")},
                                               {instanceUIDKey, ByteVector(16, 7)},
                                               {orderHintKey, hintOf({dynamicKey, companyNameKey, instanceUIDKey})}});
  ByteVector bytes = bench.code(fourEntries, {set});
  ByteVector expected = concat({bytesOf(identificationKey), bytesOf("83 00 00 1F"), bytesOf("80 00 00 01 05"),
                                bytesOf("3C 01 00 02 00 41"), bytesOf("3C 0A 00 10"), ByteVector(16, 7)});
  EXPECT_EQ(expected, slice(bytes, primerPackSize, expected.size()));
  EXPECT_EQ(primerPackSize + expected.size(), bytes.size());
}

TEST(MXFMetadataCoder, HintKeysComeFirstAndKeysItDoesNotHoldAreSkipped) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf(identificationKey, {{companyNameKey, bytesOf("00 41")},
                                               {dynamicKey, bytesOf("05")},
                                               {instanceUIDKey, ByteVector(16, 7)},
                                               {orderHintKey, hintOf({productNameKey, dynamicKey})}});
  ByteVector bytes = bench.code(fourEntries, {set});
  ByteVector expected = concat({bytesOf(identificationKey), bytesOf("83 00 00 1F"), bytesOf("80 00 00 01 05"),
                                bytesOf("3C 0A 00 10"), ByteVector(16, 7), bytesOf("3C 01 00 02 00 41")});
  EXPECT_EQ(expected, slice(bytes, primerPackSize, expected.size()));
}

TEST(MXFMetadataCoder, HintThatRepeatsAKeyFails) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf(identificationKey, {{companyNameKey, bytesOf("00 41")},
                                               {orderHintKey, hintOf({companyNameKey, companyNameKey})}});
  EXPECT_EQ("assertion failure: no repeated properties in order hint",
            assertionTextOf([&] { bench.code(fourEntries, {set}); }));
}

TEST(MXFMetadataCoder, InMemoryPropertiesAreNeverWritten) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf(identificationKey, {{companyNameKey, bytesOf("00 41")}, {setOrderKey, ByteVector(24, 1)}});
  ByteVector bytes = bench.code(fourEntries, {set});
  ByteVector expected = concat({bytesOf(identificationKey), bytesOf("83 00 00 06"), bytesOf("3C 01 00 02 00 41")});
  EXPECT_EQ(expected, slice(bytes, primerPackSize, bytes.size() - primerPackSize));
}

TEST(MXFMetadataCoder, BERItemLengthsTakeTheShortFormBelowOneHundredTwentyEight) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf("06 0E 2B 34 02 13 01 01 0D 01 01 01 01 01 30 00",
                           {{companyNameKey, ByteVector(127, 1)}, {dynamicKey, ByteVector(128, 2)}});
  ByteVector bytes = bench.code(fourEntries, {set});
  // In key order the dynamic item first: 2 + 4 + 128, then 2 + 1 + 127.
  ByteVector expected =
      concat({bytesOf("06 0E 2B 34 02 13 01 01 0D 01 01 01 01 01 30 00 83 00 01 08 80 00 83 00 00 80"),
              ByteVector(128, 2), bytesOf("3C 01 7F"), ByteVector(127, 1)});
  EXPECT_EQ(expected, slice(bytes, primerPackSize, expected.size()));
  EXPECT_EQ(primerPackSize + expected.size(), bytes.size());
}

TEST(MXFMetadataCoder, PropertyWithoutTagFails) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf(identificationKey, {{productNameKey, bytesOf("00 41")}});
  EXPECT_EQ("assertion failure: valid property key", assertionTextOf([&] { bench.code(fourEntries, {set}); }));
}

TEST(MXFMetadataCoder, SetWithOneOctetTagsFails) {
  CoderBench<> bench;
  MXFPrimedSet set = setOf("06 0E 2B 34 02 43 01 01 0D 01 01 01 01 01 30 00", {{companyNameKey, bytesOf("00 41")}});
  EXPECT_EQ("assertion failure: supported tag type", assertionTextOf([&] { bench.code(fourEntries, {set}); }));
}

TEST(MXFMetadataCoder, EventsOutOfOrderFail) {
  CoderBench<> bench;
  EXPECT_EQ("assertion failure: before primer", assertionTextOf([&] { bench.coder.primer(fourEntries); }));
  EXPECT_EQ("assertion failure: before primed set",
            assertionTextOf([&] { bench.coder.primedSet(modelOfVersion("01 02")[1]); }));
  bench.coder.start();
  EXPECT_EQ("assertion failure: before start", assertionTextOf([&] { bench.coder.start(); }));
  EXPECT_EQ("assertion failure: before primed set",
            assertionTextOf([&] { bench.coder.primedSet(modelOfVersion("01 02")[1]); }));
  bench.coder.primer(fourEntries);
  EXPECT_EQ("assertion failure: before primer", assertionTextOf([&] { bench.coder.primer(fourEntries); }));
}

TEST(MXFMetadataCoder, RepeatedIdenticalEntriesPassAndAChangedPartnerFails) {
  MXFPrimerEntries repeated = fourEntries;
  repeated.push_back(fourEntries[0]);
  CoderBench<> identical;
  EXPECT_EQ("no failure", assertionTextOf([&] { identical.code(repeated, {}); }));
  CoderBench<> newKey;
  EXPECT_EQ("assertion failure: consistent primer tag -> key", assertionTextOf([&] {
              newKey.code({{0x8000, keyOf(dynamicKey)}, {0x8000, keyOf(productNameKey)}}, {});
            }));
  CoderBench<> newTag;
  EXPECT_EQ("assertion failure: consistent primer key -> tag", assertionTextOf([&] {
              newTag.code({{0x8000, keyOf(dynamicKey)}, {0x8001, keyOf(dynamicKey)}}, {});
            }));
}

TEST(MXFMetadataCoder, AcceptsEverySet) {
  CoderBench<> bench;
  EXPECT_TRUE(bench.coder.acceptSet(keyOf(identificationKey)));
}

TEST(MXFFormatMetadataCoder, StandardTagWithAnotherKeyFails) {
  CoderBench<MXFFormatMetadataCoder> bench;
  EXPECT_EQ("assertion failure: consistent primer tag -> key", assertionTextOf([&] {
              bench.code({{0x3C0A, keyOf(companyNameKey)}}, {});
            }));
}

TEST(MXFFormatMetadataCoder, DynamicEntryFollowsTheStandardPrimer) {
  CoderBench<MXFFormatMetadataCoder> bench;
  ByteVector bytes = bench.code({{0x8000, keyOf(dynamicKey)}, {0x3C0A, keyOf(instanceUIDKey)}}, {});
  // 123 standard entries, then the two given, nothing removed.
  EXPECT_EQ(concat({bytesOf(primerKey), bytesOf("83 00 08 D2 00 00 00 7D 00 00 00 12")}), slice(bytes, 0, 28));
  EXPECT_EQ(concat({bytesOf("3C 0A"), bytesOf(instanceUIDKey)}), slice(bytes, 28, 18));
  EXPECT_EQ(concat({bytesOf("80 00"), bytesOf(dynamicKey), bytesOf("3C 0A"), bytesOf(instanceUIDKey)}),
            slice(bytes, 28 + 18 * 123, 36));
  EXPECT_EQ(28u + 18 * 125, bytes.size());
}

TEST(MXFFormatMetadataCoder, NoEntriesGiveTheStandardPrimerAlone) {
  CoderBench<MXFFormatMetadataCoder> bench;
  ByteVector bytes = bench.code({}, {});
  EXPECT_EQ(bytesOf("00 00 00 7B 00 00 00 12"), slice(bytes, 20, 8));
  EXPECT_EQ(concat({bytesOf("01 02"), bytesOf("06 0E 2B 34 01 01 01 02 05 20 07 01 08 00 00 00")}),
            slice(bytes, 28 + 18, 18));
  EXPECT_EQ(28u + 18 * 123, bytes.size());
}

TEST(MXFMetadataPlusIndexPrimerCoder, AddsTheIndexTagsThatAreMissingInOrder) {
  CoderBench<MXFMetadataPlusIndexPrimerCoder> bench;
  ByteVector bytes = bench.code(
      {{0x3F07, keyOf("06 0E 2B 34 01 01 01 04 01 03 04 04 00 00 00 00")}, {0x3C0A, keyOf(instanceUIDKey)}}, {});
  std::vector<std::pair<const char*, const char*>> added{{"3F 05", "06 0E 2B 34 01 01 01 04 04 06 02 01 00 00 00 00"},
                                                         {"3F 06", "06 0E 2B 34 01 01 01 04 01 03 04 05 00 00 00 00"},
                                                         {"3F 08", "06 0E 2B 34 01 01 01 04 04 04 04 01 01 00 00 00"},
                                                         {"3F 09", "06 0E 2B 34 01 01 01 05 04 04 04 01 06 00 00 00"},
                                                         {"3F 0A", "06 0E 2B 34 01 01 01 05 04 04 04 02 05 00 00 00"},
                                                         {"3F 0B", "06 0E 2B 34 01 01 01 05 05 30 04 06 00 00 00 00"},
                                                         {"3F 0C", "06 0E 2B 34 01 01 01 05 07 02 01 03 01 0A 00 00"},
                                                         {"3F 0D", "06 0E 2B 34 01 01 01 05 07 02 02 01 01 02 00 00"}};
  EXPECT_EQ(bytesOf("00 00 00 0A 00 00 00 12"), slice(bytes, 20, 8));
  EXPECT_EQ(concat({bytesOf("3F 07"), bytesOf("06 0E 2B 34 01 01 01 04 01 03 04 04 00 00 00 00"), bytesOf("3C 0A"),
                    bytesOf(instanceUIDKey)}),
            slice(bytes, 28, 36));
  for (std::size_t i = 0; i < added.size(); ++i)
    EXPECT_EQ(concat({bytesOf(added[i].first), bytesOf(added[i].second)}), slice(bytes, 28 + 36 + 18 * i, 18)) << i;
  EXPECT_EQ(28u + 18 * 10, bytes.size());
}

TEST(MXFMetadataPlusIndexPrimerCoder, EmptyEntriesGetAllTen) {
  CoderBench<MXFMetadataPlusIndexPrimerCoder> bench;
  ByteVector bytes = bench.code({}, {});
  EXPECT_EQ(concat({bytesOf("3C 0A"), bytesOf(instanceUIDKey)}), slice(bytes, 28, 18));
  EXPECT_EQ(28u + 18 * 10, bytes.size());
}
