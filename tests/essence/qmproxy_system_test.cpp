// The proxy system element: the parser's item checks, the coder, and the two
// through octets.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey proxyKey = keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00");

// Each event as "<frameCount> <timecode>/<timecode>...".
class RecordingProxyHandler : public MXFQMProxySystemHandler {
public:
  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) override {
    std::string line = std::to_string(frameCount);
    for (std::size_t i = 0; i < timecodes.size(); ++i)
      line += (i == 0 ? " " : "/") + hexOf(ByteVector(timecodes[i].begin(), timecodes[i].end()));
    events.push_back(line);
  }

  std::vector<std::string> events;
};

MXFQMProxyTimecode timecode(std::uint8_t frame) { return MXFQMProxyTimecode{0x10, 0x00, 0x00, frame, 1, 2, 3, 4}; }

ByteVector frameCountBytes(std::uint32_t frameCount) {
  return ByteVector{static_cast<std::uint8_t>(frameCount >> 24), static_cast<std::uint8_t>(frameCount >> 16),
                    static_cast<std::uint8_t>(frameCount >> 8), static_cast<std::uint8_t>(frameCount)};
}

class MXFQMProxySystemParserTest : public ::testing::Test {
protected:
  MXFQMProxySystemParserTest() { parser.setErrorHandler(&errors); }

  void set(const MXFGCLocalItems& items) { parser.systemLocalSet(proxyKey, items); }
  std::vector<std::string> reports() const { return reportLines(errors); }

  RecordingProxyHandler handler;
  RecordingErrorHandler errors;
  MXFQMProxySystemParser parser{&handler};
};

// A batch of two entries of eight octets.
const ByteVector twoTimecodes = bytesOf("00 00 00 02 00 00 00 08 10 00 00 01 01 02 03 04 10 00 00 02 01 02 03 04");
const std::string twoTimecodesText = "10 00 00 01 01 02 03 04/10 00 00 02 01 02 03 04";

}  // namespace

TEST_F(MXFQMProxySystemParserTest, ProxyKeyIsWantedWhateverItsVersion) {
  KLVKey key = proxyKey;
  key[7] = 0x0A;
  EXPECT_TRUE(parser.startSystemElement(key));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFQMProxySystemParserTest, OtherKeyIsReportedAndNotWanted) {
  EXPECT_FALSE(parser.startSystemElement(keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00")));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidQMProxySystemElementId,
                           "invalid QMProxy system element - 06.0E.2B.34.02.05.01.01.0D.01.03.01.04.01.01.00")}));
}

TEST_F(MXFQMProxySystemParserTest, SetOfAnotherKeyFailsTheAssertion) {
  EXPECT_EQ(
      assertionTextOf([&] { parser.systemLocalSet(keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 02 00"), {}); }),
      "assertion failure: valid QMProxy local set");
  EXPECT_TRUE(handler.events.empty());
}

TEST_F(MXFQMProxySystemParserTest, PacksFailTheAssertion) {
  EXPECT_EQ(assertionTextOf([&] { parser.systemFixedPack(proxyKey, {1}); }),
            "assertion failure: valid QMProxy fixed length pack");
  EXPECT_EQ(assertionTextOf([&] { parser.systemVariablePack(proxyKey, {{1}}); }),
            "assertion failure: valid QMProxy variable length pack");
}

TEST_F(MXFQMProxySystemParserTest, FrameCountAndTimecodesAreDelivered) {
  set({{0x0101, frameCountBytes(2)}, {0x0102, twoTimecodes}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText}));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFQMProxySystemParserTest, SetWithNoItemsGivesBothMissingReportsAndAnEmptyEvent) {
  set({});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine("error", missingQMProxyItemId, "missing frameCount"),
                                                 reportLine("error", missingQMProxyItemId, "missing timecodes")}));
}

TEST_F(MXFQMProxySystemParserTest, FrameCountZeroWithNoTimecodesPassesWithoutReport) {
  set({{0x0101, frameCountBytes(0)}, {0x0102, bytesOf("00 00 00 00 00 00 00 08")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFQMProxySystemParserTest, RepeatedFrameCountKeepsTheFirstValue) {
  set({{0x0101, frameCountBytes(2)}, {0x0102, twoTimecodes}, {0x0101, frameCountBytes(7)}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText}));
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", repeatedQMProxyItemId, "unexpected repeated frameCount")}));
}

TEST_F(MXFQMProxySystemParserTest, RepeatedTimecodesKeepTheFirstValue) {
  set({{0x0102, twoTimecodes}, {0x0101, frameCountBytes(2)}, {0x0102, bytesOf("00 00 00 00 00 00 00 08")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText}));
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", repeatedQMProxyItemId, "unexpected repeated timecodes")}));
}

TEST_F(MXFQMProxySystemParserTest, ItemOfTag0103IsReportedAsUnrecognizedAndIgnored) {
  set({{0x0101, frameCountBytes(2)}, {0x0103, bytesOf("FF")}, {0x0102, twoTimecodes}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText}));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine("warning", unrecognizedQMProxyItemId,
                                                            "unrecognized QMProxy metadata item - 01.03")}));
}

TEST_F(MXFQMProxySystemParserTest, TimecodesOfEntryLength12ReadEightOctetsOfEachAndSkipFour) {
  set({{0x0101, frameCountBytes(2)},
       {0x0102, bytesOf("00 00 00 02 00 00 00 0C 10 00 00 01 01 02 03 04 EE EE EE EE "
                        "10 00 00 02 01 02 03 04 DD DD DD DD")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText}));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFQMProxySystemParserTest, EntryLengthBelowEightIsAnInvalidValue) {
  set({{0x0101, frameCountBytes(0)}, {0x0102, bytesOf("00 00 00 01 00 00 00 04 10 00 00 01 01 02 03 04")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(
      reports(),
      (std::vector<std::string>{reportLine("error", invalidQMProxyValueId,
                                           "invalid timecodes value - assertion failure: valid external length")}));
}

TEST_F(MXFQMProxySystemParserTest, OctetsAfterTheLastEntryAreAnInvalidValue) {
  set({{0x0101, frameCountBytes(0)}, {0x0102, bytesOf("00 00 00 01 00 00 00 08 10 00 00 01 01 02 03 04 00")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(
      reports(),
      (std::vector<std::string>{reportLine("error", invalidQMProxyValueId,
                                           "invalid timecodes value - assertion failure: valid external length")}));
}

TEST_F(MXFQMProxySystemParserTest, ShortFrameCountIsAnInvalidValueAndStaysZero) {
  set({{0x0101, bytesOf("00 00 02")}, {0x0102, bytesOf("00 00 00 00 00 00 00 08")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", invalidQMProxyValueId,
                                                 "invalid frameCount value - assertion failure: successful get()")}));
}

TEST_F(MXFQMProxySystemParserTest, LongFrameCountIsAnInvalidValueAndStaysZero) {
  set({{0x0101, bytesOf("00 00 00 00 02")}, {0x0102, bytesOf("00 00 00 00 00 00 00 08")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(
      reports(),
      (std::vector<std::string>{reportLine("error", invalidQMProxyValueId,
                                           "invalid frameCount value - assertion failure: valid external length")}));
}

TEST_F(MXFQMProxySystemParserTest, InvalidValueStillCountsAsSeen) {
  set({{0x0101, bytesOf("00")}, {0x0101, frameCountBytes(2)}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", invalidQMProxyValueId,
                                                 "invalid frameCount value - assertion failure: successful get()"),
                                      reportLine("error", repeatedQMProxyItemId, "unexpected repeated frameCount"),
                                      reportLine("error", missingQMProxyItemId, "missing timecodes")}));
}

TEST_F(MXFQMProxySystemParserTest, FrameCountOtherThanTheNumberOfTimecodesIsInconsistent) {
  set({{0x0101, frameCountBytes(3)}, {0x0102, twoTimecodes}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"3 " + twoTimecodesText}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("warning", invalidQMProxyValueId, "inconsistent frameCount and timecodes")}));
}

TEST(MXFQMProxySystemParser, WithoutAnErrorHandlerNothingIsReportedAndTheEventStillComes) {
  RecordingProxyHandler handler;
  MXFQMProxySystemParser parser(&handler);
  EXPECT_FALSE(parser.startSystemElement(keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00")));
  parser.systemLocalSet(proxyKey, {{0x0103, {}}, {0x0101, bytesOf("01")}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"0"}));
}

TEST(MXFQMProxySystemCoder, FrameCountAndTimecodesAreTwoItemsInThatOrderWithoutStartSystemElement) {
  RecordingGCHandler recorder(RecordingGCHandler::take, false);
  MXFQMProxySystemCoder coder(&recorder);
  coder.proxySystem(2, {timecode(1), timecode(2)});
  EXPECT_EQ(recorder.events, (std::vector<std::string>{"systemLocalSet " + toString(proxyKey) +
                                                       " 0101=00 00 00 02;0102=" + hexOf(twoTimecodes) + ";"}));
}

TEST(MXFQMProxySystemCoder, NoTimecodesAreAnEmptyBatchOfEntryLengthEight) {
  RecordingGCHandler recorder;
  MXFQMProxySystemCoder coder(&recorder);
  coder.proxySystem(0, {});
  EXPECT_EQ(recorder.events, (std::vector<std::string>{"systemLocalSet " + toString(proxyKey) +
                                                       " 0101=00 00 00 00;0102=00 00 00 00 00 00 00 08;"}));
}

TEST(MXFQMProxySystemCoder, ElementIsOneLocalSetOfTwoOctetTagsAndLengths) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  writer.startStream(true);
  MXFGCSystemCoder system(&writer);
  MXFQMProxySystemCoder coder(&system);
  coder.proxySystem(1, {timecode(9)});
  writer.endStream(false);
  EXPECT_EQ(klv::outputOf(out), concat({bytesOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00 83 00 00 1C"),
                                        bytesOf("01 01 00 04 00 00 00 01"),
                                        bytesOf("01 02 00 10 00 00 00 01 00 00 00 08 10 00 00 09 01 02 03 04")}));
}

TEST(MXFQMProxySystemCoder, EditUnitsReadBackAsTheyWereCoded) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  {
    MXFGCMuxer muxer(&writer);
    MXFQMProxySystemCoder coder(muxer.getSystemHandler());
    muxer.getStructureHandler()->start(0);
    coder.proxySystem(2, {timecode(1), timecode(2)});
    coder.proxySystem(1, {MXFQMProxyTimecode{0xFF, 0xFE, 0, 0, 0, 0, 0x80, 0x01}});
    coder.proxySystem(0, {});
    muxer.getStructureHandler()->end();
  }
  RecordingProxyHandler handler;
  RecordingErrorHandler errors;
  MXFQMProxySystemParser parser(&handler);
  parser.setErrorHandler(&errors);
  MXFGCSplitter splitter(nullptr, &parser, nullptr);
  splitter.setErrorHandler(&errors);
  readThrough(klv::outputOf(out), splitter, &errors);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"2 " + twoTimecodesText, "1 FF FE 00 00 00 00 80 01", "0"}));
  EXPECT_TRUE(reportLines(errors).empty());
}
