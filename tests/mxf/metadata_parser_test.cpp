// The metadata parser on header metadata spelled by hand: the primer, its
// checks, and local sets turned into primed sets.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// Identifiers of the reports, spelled: family and code, then the fixed tail.
MXFUID idOf(const std::string& head) { return MXFUID(bytesOf(head + " 95 D8 11 E1 BB B2 10 9A DD 4A C6 8C").data()); }

const char* const instanceUIDKey = "06 0E 2B 34 01 01 01 01 01 01 15 02 00 00 00 00";
const char* const companyNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 02 01 00 00";
const char* const productNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 03 01 00 00";
const char* const dynamicKey = "06 0E 2B 34 01 01 01 05 04 01 06 02 01 0B 00 00";
const char* const otherDynamicKey = "06 0E 2B 34 01 01 01 05 04 01 06 02 01 05 00 00";

const std::vector<SpelledEntry> threeEntries{
    {"3C 0A", instanceUIDKey}, {"3C 01", companyNameKey}, {"80 00", dynamicKey}};

struct ParserRead {
  explicit ParserRead(bool accept = true) : handler(accept), parser(&handler) { parser.setErrorHandler(&errors); }

  // Reads to the end; the text of the assertion failure that stopped the
  // read, or "no failure".
  std::string read(const ByteVector& bytes) {
    return assertionTextOf([&] { readThrough(bytes, parser, &errors); });
  }

  RecordingMetadataHandler handler;
  RecordingErrorHandler errors;
  MXFMetadataParser parser;
};

ByteVector octets(std::size_t size, std::uint8_t octet) { return ByteVector(size, octet); }

void expectReport(const Report& report, const char* severity, const std::string& id, const std::string& message) {
  EXPECT_EQ(severity, report.severity);
  EXPECT_EQ(idOf(id), report.identifier) << message;
  EXPECT_EQ(message, report.message);
}

}  // namespace

TEST(MXFMetadataParser, StreamWithoutPrimerFailsAtTheFirstLocalSet) {
  ParserRead read;
  EXPECT_EQ("assertion failure: before primed set",
            read.read(twoOctetSet(identificationKey(), {{0x3C0A, octets(16, 1)}})));
  std::vector<std::string> expected{"start", "end"};
  EXPECT_EQ(expected, read.handler.events);
}

TEST(MXFMetadataParser, StreamWithNeitherSetsNorPrimerEndsCleanly) {
  ParserRead read;
  EXPECT_EQ("no failure", read.read(fillItem(40)));
  std::vector<std::string> expected{"start", "end"};
  EXPECT_EQ(expected, read.handler.events);
  EXPECT_TRUE(read.errors.reports.empty());
}

TEST(MXFMetadataParser, SetsBecomePrimedSetsByTheirPrimer) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries)),
              twoOctetSet(identificationKey(), {{0x3C01, octets(4, 0x41)}, {0x3C0A, octets(16, 7)}, {0x8000, {}}})});
  EXPECT_EQ("no failure", read.read(bytes));
  std::vector<std::string> expected{"start", "primer 3", "acceptSet " + toString(identificationKey()),
                                    "primedSet " + toString(identificationKey()) + " 3", "end"};
  EXPECT_EQ(expected, read.handler.events);
  EXPECT_TRUE(read.errors.reports.empty());
  ASSERT_EQ(1u, read.handler.primers.size());
  MXFPrimerEntries entries{
      {0x3C0A, keyOf(instanceUIDKey)}, {0x3C01, keyOf(companyNameKey)}, {0x8000, keyOf(dynamicKey)}};
  EXPECT_EQ(entries, read.handler.primers[0]);
  ASSERT_EQ(1u, read.handler.sets.size());
  const MXFPrimedSet& set = read.handler.sets[0];
  EXPECT_EQ(identificationKey(), set.key);
  EXPECT_EQ(octets(4, 0x41), set.properties.at(keyOf(companyNameKey)));
  EXPECT_EQ(octets(16, 7), set.properties.at(keyOf(instanceUIDKey)));
  EXPECT_EQ(ByteVector(), set.properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, EmptyPrimerIsValidAndEveryItemIsMissingFromIt) {
  ParserRead read;
  ByteVector bytes = concat({primerPack(primerValue({})),
                             twoOctetSet(identificationKey(), {{0x3C0A, octets(16, 1)}, {0x3C01, octets(2, 0)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(2u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 04 02", "tag missing in primer - 3C.0A");
  expectReport(read.errors.reports[1], "error", "4C 4C 04 02", "tag missing in primer - 3C.01");
  ASSERT_EQ(1u, read.handler.primers.size());
  EXPECT_TRUE(read.handler.primers[0].empty());
  ASSERT_EQ(1u, read.handler.sets.size());
  EXPECT_TRUE(read.handler.sets[0].properties.empty());
}

TEST(MXFMetadataParser, EntrySizeTwentyReadsEighteenAndSkipsTwo) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries, 20)), twoOctetSet(identificationKey(), {{0x8000, octets(3, 9)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_TRUE(read.errors.reports.empty());
  MXFPrimerEntries entries{
      {0x3C0A, keyOf(instanceUIDKey)}, {0x3C01, keyOf(companyNameKey)}, {0x8000, keyOf(dynamicKey)}};
  ASSERT_EQ(1u, read.handler.primers.size());
  EXPECT_EQ(entries, read.handler.primers[0]);
  EXPECT_EQ(octets(3, 9), read.handler.sets.at(0).properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, TruncatedEntryFallsBackToTheStandardPrimerAfterTheError) {
  ParserRead read;
  ByteVector value = primerValue(threeEntries);
  value.resize(value.size() - 5);
  ByteVector bytes = concat({primerPack(value), twoOctetSet(identificationKey(), {{0x3C02, octets(2, 0x42)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 03 01",
               "invalid primer value - assertion failure: successful read()");
  ASSERT_EQ(1u, read.handler.primers.size());
  EXPECT_EQ(getMXFStandardPrimer(), read.handler.primers[0]);
  // 3C 02 is not in the file's primer but is in the standard one.
  EXPECT_EQ(octets(2, 0x42), read.handler.sets.at(0).properties.at(keyOf(productNameKey)));
}

TEST(MXFMetadataParser, EntrySizeBelowEighteenIsAnInvalidPrimerValue) {
  ParserRead read;
  ByteVector value = primerValue({});
  value[7] = 17;
  EXPECT_EQ("no failure", read.read(primerPack(value)));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 03 01",
               "invalid primer value - assertion failure: valid external length");
}

TEST(MXFMetadataParser, OctetsAfterTheLastEntryAreAnInvalidPrimerValue) {
  ParserRead read;
  ByteVector value = primerValue(threeEntries);
  value.push_back(0);
  EXPECT_EQ("no failure", read.read(primerPack(value)));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 03 01",
               "invalid primer value - assertion failure: valid external length");
  EXPECT_EQ(getMXFStandardPrimer(), read.handler.primers.at(0));
}

TEST(MXFMetadataParser, BERItemOfSixtyFourKibibytesJustifiesBERLengths) {
  ParserRead read;
  ByteVector bytes = concat({primerPack(primerValue(threeEntries)),
                             berItemSet(berIdentificationKey(), {{0x8000, octets(0x10000, 3)}}, 0x83)});
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_TRUE(read.errors.reports.empty());
  EXPECT_EQ(octets(0x10000, 3), read.handler.sets.at(0).properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, BERItemsBelowSixtyFourKibibytesAreReportedOnce) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries)),
              berItemSet(berIdentificationKey(), {{0x3C0A, octets(16, 1)}, {0x8000, octets(0xFFFF, 3)}}, 0x83)});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 00 07", "non-standard local item length type - BER");
  EXPECT_EQ(2u, read.handler.sets.at(0).properties.size());
}

TEST(MXFMetadataParser, UnwantedSetWithBERItemLengthsIsReportedWhateverItsItems) {
  ParserRead read(false);
  ByteVector bytes = concat({primerPack(primerValue(threeEntries)),
                             berItemSet(berIdentificationKey(), {{0x8000, octets(0x10000, 3)}}, 0x83)});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 00 07", "non-standard local item length type - BER");
  std::vector<std::string> expected{"start", "primer 3", "acceptSet " + toString(berIdentificationKey()), "end"};
  EXPECT_EQ(expected, read.handler.events);
}

TEST(MXFMetadataParser, FixedLengthTypeOtherThanTwoOctetsIsReportedWithItsLabel) {
  ParserRead read;
  // Octet 5 0x73: two-octet tags, four-octet lengths.
  KLVKey key = keyOf("06 0E 2B 34 02 73 01 01 0D 01 01 01 01 01 30 00");
  ByteVector set = element(key, bytesOf("80 00 00 00 00 02 AA BB"));
  EXPECT_EQ("no failure", read.read(concat({primerPack(primerValue(threeEntries)), set})));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 00 07", "non-standard local item length type - Fixed 4 byte");
  EXPECT_EQ(bytesOf("AA BB"), read.handler.sets.at(0).properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, SetWithoutTwoOctetTagsIsSkippedWithoutBeingOffered) {
  ParserRead read;
  // Octet 5 0x43: one-octet tags, two-octet lengths.
  KLVKey key = keyOf("06 0E 2B 34 02 43 01 01 0D 01 01 01 01 01 30 00");
  ByteVector set = element(key, bytesOf("01 00 02 AA BB"));
  EXPECT_EQ("no failure", read.read(concat({primerPack(primerValue(threeEntries)), set})));
  std::vector<std::string> expected{"start", "primer 3", "end"};
  EXPECT_EQ(expected, read.handler.events);
  EXPECT_TRUE(read.errors.reports.empty());
}

TEST(MXFMetadataParser, NonStandardBERFormIsReportedOnceAtTheNextSet) {
  ParserRead read;
  ByteVector set = element(identificationKey(), bytesOf("80 00 00 01 AA"), 0x84);
  ByteVector bytes = concat({primerPack(primerValue(threeEntries)), set, set,
                             twoOctetSet(identificationKey(), {{0x8000, octets(1, 0xBB)}}), set});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(2u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 00 07", "non-standard BER length form - 0x84");
  expectReport(read.errors.reports[1], "warning", "4C 4C 00 07", "non-standard BER length form - 0x84");
  EXPECT_EQ(4u, read.handler.sets.size());
}

TEST(MXFMetadataParser, StandardTagWithAnotherKeyIsReportedBothWays) {
  ParserRead read;
  // 3C 0A names companyName's key, which is standard under 3C 01.
  EXPECT_EQ("no failure", read.read(primerPack(primerValue({{"3C 0A", companyNameKey}}))));
  ASSERT_EQ(2u, read.errors.reports.size());
  const std::string entry = "{ 3C.0A, 06.0E.2B.34.01.01.01.02.05.20.07.01.02.01.00.00 }";
  expectReport(read.errors.reports[0], "error", "4C 4C 03 02", "non-standard primer key - " + entry);
  expectReport(read.errors.reports[1], "warning", "4C 4C 03 03", "non-standard primer tag - " + entry);
}

TEST(MXFMetadataParser, StandardKeyUnderADynamicTagIsANonStandardTag) {
  ParserRead read;
  EXPECT_EQ("no failure", read.read(primerPack(primerValue({{"80 01", productNameKey}}))));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 03 03",
               "non-standard primer tag - { 80.01, 06.0E.2B.34.01.01.01.02.05.20.07.01.03.01.00.00 }");
}

TEST(MXFMetadataParser, StandardKeyOfAnotherVersionIsStandard) {
  ParserRead read;
  EXPECT_EQ("no failure", read.read(primerPack(primerValue({{"3C 0A",
                                                             "06 0E 2B 34 01 01 01 05 01 01 15 02 00 00 "
                                                             "00 00"}}))));
  EXPECT_TRUE(read.errors.reports.empty());
}

TEST(MXFMetadataParser, TagRepeatedWithAnotherKeyKeepsTheFirstKey) {
  ParserRead read;
  ByteVector bytes = concat({primerPack(primerValue({{"80 00", dynamicKey}, {"80 00", otherDynamicKey}})),
                             twoOctetSet(identificationKey(), {{0x8000, octets(1, 5)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 03 04",
               "inconsistent primer key - { 80.00, 06.0E.2B.34.01.01.01.05.04.01.06.02.01.05.00.00 }");
  EXPECT_EQ(octets(1, 5), read.handler.sets.at(0).properties.at(keyOf(dynamicKey)));
  EXPECT_EQ(2u, read.handler.primers.at(0).size());
}

TEST(MXFMetadataParser, KeyRepeatedWithAnotherTagIsReachedByBothTags) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue({{"80 00", dynamicKey}, {"80 01", dynamicKey}, {"80 00", dynamicKey}})),
              twoOctetSet(identificationKey(), {{0x8001, octets(1, 5)}}),
              twoOctetSet(identificationKey(), {{0x8000, octets(1, 6)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "warning", "4C 4C 03 05",
               "inconsistent primer tag - { 80.01, 06.0E.2B.34.01.01.01.05.04.01.06.02.01.0B.00.00 }");
  ASSERT_EQ(2u, read.handler.sets.size());
  EXPECT_EQ(octets(1, 5), read.handler.sets[0].properties.at(keyOf(dynamicKey)));
  EXPECT_EQ(octets(1, 6), read.handler.sets[1].properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, RepeatedPropertyKeepsTheFirstItem) {
  ParserRead read;
  ByteVector bytes = concat({primerPack(primerValue(threeEntries)),
                             twoOctetSet(identificationKey(), {{0x3C01, octets(2, 1)}, {0x3C01, octets(4, 2)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  ASSERT_EQ(1u, read.errors.reports.size());
  expectReport(read.errors.reports[0], "error", "4C 4C 04 01", "unexpected repeated property - 3C.01");
  EXPECT_EQ(octets(2, 1), read.handler.sets.at(0).properties.at(keyOf(companyNameKey)));
}

TEST(MXFMetadataParser, SecondPrimerIsIgnoredWithoutAWord) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries)), primerPack(primerValue({{"80 00", otherDynamicKey}})),
              twoOctetSet(identificationKey(), {{0x8000, octets(1, 5)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_TRUE(read.errors.reports.empty());
  EXPECT_EQ(1u, read.handler.primers.size());
  EXPECT_EQ(octets(1, 5), read.handler.sets.at(0).properties.at(keyOf(dynamicKey)));
}

TEST(MXFMetadataParser, DeclinedSetIsNotDelivered) {
  ParserRead read(false);
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries)), twoOctetSet(identificationKey(), {{0x9999, octets(1, 5)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_TRUE(read.handler.sets.empty());
  EXPECT_TRUE(read.errors.reports.empty());
}

TEST(MXFMetadataParser, ReportsVanishWithoutAnErrorHandler) {
  RecordingMetadataHandler handler;
  MXFMetadataParser parser(&handler);
  ByteVector bytes = concat({primerPack(primerValue({{"3C 0A", companyNameKey}})),
                             twoOctetSet(identificationKey(), {{0x9999, octets(1, 5)}})});
  EXPECT_EQ("no failure", assertionTextOf([&] { readThrough(bytes, parser); }));
  EXPECT_EQ(1u, handler.sets.size());
}

TEST(MXFMetadataParser, SecondStartWithoutEndFails) {
  RecordingMetadataHandler handler;
  MXFMetadataParser parser(&handler);
  parser.startStream(true);
  EXPECT_EQ("assertion failure: before start", assertionTextOf([&] { parser.startStream(true); }));
}

TEST(MXFMetadataParser, ParsesOneStreamAfterAnother) {
  ParserRead read;
  ByteVector bytes =
      concat({primerPack(primerValue(threeEntries)), twoOctetSet(identificationKey(), {{0x8000, octets(1, 5)}})});
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_EQ("no failure", read.read(bytes));
  EXPECT_EQ(2u, read.handler.primers.size());
  EXPECT_EQ(2u, read.handler.sets.size());
}
