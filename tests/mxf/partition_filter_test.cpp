// Stopping a read at a position or at the next partition, behind a KLV
// reader, with the handler behind the filter seeing a clean end.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/klv_output.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const std::string essenceStart = "startIndividualItem " + toString(essenceElementKey()) + " 100";
const std::string essenceEnd = "endIndividualItem " + toString(essenceElementKey());

// Which of the filter's exceptions ended the read.
std::string readUntilStopped(const ByteVector& bytes, MXFPartitionFilter& filter, std::streamoff from = 0) {
  util::vector_istream stream(bytes);
  stream.seekg(from);
  GenericKLVReader reader;
  reader.setHandler(&filter);
  try {
    reader.read(stream);
  } catch (const MXFPartitionFilter::StopPosition&) {
    return "StopPosition";
  } catch (const MXFPartitionFilter::EndPartition&) {
    return "EndPartition";
  }
  return "end of stream";
}

std::vector<std::string> elementEvents(const std::string& start, const std::string& end) {
  return {"setLengthForm 131", start, "value 100", end};
}

}  // namespace

TEST(PartitionFilter, StopAtTheStartThrowsFromStartStreamBeforeTheHandlerSeesAnything) {
  const ByteVector bytes = concat({essenceElement(100), essenceElement(100)});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, 0);
  EXPECT_EQ("StopPosition", readUntilStopped(bytes, filter));
  EXPECT_EQ(std::vector<std::string>{"setLocator"}, next.events);
}

TEST(PartitionFilter, StopBeforeTheStartThrowsFromStartStream) {
  const ByteVector bytes = concat({essenceElement(100), essenceElement(100)});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, 100);
  EXPECT_EQ("StopPosition", readUntilStopped(bytes, filter, 120));
  EXPECT_EQ(std::vector<std::string>{"setLocator"}, next.events);
  EXPECT_EQ(120, filter.getLastPosition());
}

TEST(PartitionFilter, StopInsideAnElementDeliversItWholeAndStopsAtTheNextStart) {
  const ByteVector bytes = concat({essenceElement(100), essenceElement(100), essenceElement(100)});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, 130);
  EXPECT_EQ("StopPosition", readUntilStopped(bytes, filter));
  std::vector<std::string> expected{"setLocator", "startStream 1"};
  for (int i = 0; i < 2; ++i) {
    std::vector<std::string> element = elementEvents(essenceStart, essenceEnd);
    expected.insert(expected.end(), i == 0 ? element.begin() : element.begin() + 1, element.end());
  }
  expected.push_back("endStream 0");
  EXPECT_EQ(expected, next.events);
  EXPECT_EQ(240, filter.getLastPosition());
}

TEST(PartitionFilter, PartitionPackEndsThePartitionWithOneCleanEndOfStream) {
  const ByteVector bytes =
      concat({essenceElement(100), partitionPack(3, 4, packWithCounts(0, 0)), essenceElement(100)});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, -1);
  EXPECT_EQ("EndPartition", readUntilStopped(bytes, filter));
  std::vector<std::string> expected{"setLocator", "startStream 1"};
  std::vector<std::string> element = elementEvents(essenceStart, essenceEnd);
  expected.insert(expected.end(), element.begin(), element.end());
  expected.push_back("endStream 0");
  EXPECT_EQ(expected, next.events);
  EXPECT_EQ(120, filter.getLastPosition());
}

TEST(PartitionFilter, RandomIndexPackPassesToTheHandler) {
  const ByteVector bytes = concat({essenceElement(100), randomIndexPack({{1, 0}})});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, -1);
  EXPECT_EQ("end of stream", readUntilStopped(bytes, filter));
  const std::vector<std::string> tail(next.events.end() - 4, next.events.end());
  EXPECT_EQ((std::vector<std::string>{"startFixedLengthPack " + toString(randomIndexKey()) + " 16", "value 16",
                                      "endFixedLengthPack " + toString(randomIndexKey()), "endStream 0"}),
            tail);
}

TEST(PartitionFilter, KeyOfPartitionShapeThatIsNoPartitionKeyPasses) {
  const ByteVector bytes = concat({essenceElement(100), element(partitionKey(3, 5), ByteVector(8, 0))});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, -1);
  EXPECT_EQ("end of stream", readUntilStopped(bytes, filter));
  EXPECT_EQ("endStream 0", next.events.back());
}

TEST(PartitionFilter, WithoutAStopPositionTheReadGoesToTheEnd) {
  const ByteVector bytes = concat({essenceElement(100), essenceElement(100)});
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, -1);
  EXPECT_EQ("end of stream", readUntilStopped(bytes, filter));
  EXPECT_EQ(10u, next.events.size());
  EXPECT_EQ(240, filter.getLastPosition());
}

TEST(PartitionFilter, BothStopsAreCaughtAsTheCommonBase) {
  const ByteVector bytes = concat({essenceElement(100), partitionPack(3, 4, packWithCounts(0, 0))});
  RecordingKLVHandler next;
  for (std::streamoff stop : {std::streamoff(-1), std::streamoff(0)}) {
    MXFPartitionFilter filter(&next, stop);
    util::vector_istream stream(bytes);
    GenericKLVReader reader;
    reader.setHandler(&filter);
    bool caught = false;
    try {
      reader.read(stream);
    } catch (const MXFPartitionFilter::exception&) {
      caught = true;
    }
    EXPECT_TRUE(caught) << stop;
  }
}

TEST(PartitionFilter, StreamNeedsALocatorAndAccurateLengths) {
  RecordingKLVHandler next;
  MXFPartitionFilter filter(&next, -1);
  EXPECT_EQ("assertion failure: has locator", assertionTextOf([&] { filter.startStream(true); }));
  zelta_test::klv::SettableLocator locator;
  filter.setLocator(&locator);
  EXPECT_EQ("assertion failure: has accurate lengths", assertionTextOf([&] { filter.startStream(false); }));
}
