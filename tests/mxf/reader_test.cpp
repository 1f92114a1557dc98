// The sequential reader: the order of what a client hears, run-ins, and
// reading again.
#include <gtest/gtest.h>

#include <algorithm>
#include <stdexcept>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// Header with one metadata set and one index set, one essence element, a
// footer and a random index, every offset right.
ByteVector smallFile() {
  MXFPartitionPack header = packWithCounts(40, 32);
  header.footerPartition = 230;
  header.indexSID = 1;
  header.bodySID = 1;
  MXFPartitionPack footer;
  footer.thisPartition = 230;
  footer.footerPartition = 230;
  return concat({partitionPack(2, 4, header), fillItem(20), localSet(metadataSetKey(), {16}),
                 localSet(indexSegmentKey(), {8}), essenceElement(10), partitionPack(4, 4, footer),
                 randomIndexPack({{1, 0}, {0, 230}})});
}

// Error handler events in the same journal as the handlers' events.
class JournalErrorHandler : public RecordingErrorHandler {
public:
  explicit JournalErrorHandler(Journal& journal) : journal_(journal) {}
  void start() override {
    RecordingErrorHandler::start();
    journal_.add("errors start", nullptr);
  }
  void end() override {
    RecordingErrorHandler::end();
    journal_.add("errors end", nullptr);
  }

private:
  Journal& journal_;
};

// The first octets of the data file of an independent writer, before the
// run-in was put in front of it: ffmpeg, D-10 50 Mbit/s, header at 0 and
// footer at 758272.
constexpr const char* d10File = "ffmpeg_d10_50m_625_noaudio.mxf";

// 1,000 octets that hold no partition key, though they hold near misses.
ByteVector runIn1000() {
  ByteVector runIn(1000);
  for (std::size_t i = 0; i < runIn.size(); ++i) runIn[i] = static_cast<std::uint8_t>(i * 7);
  const ByteVector nearMiss = bytesOf("06 0e 2b 34 02 05 01 01 0d 01 03");
  std::copy(nearMiss.begin(), nearMiss.end(), runIn.begin() + 500);
  return runIn;
}

}  // namespace

TEST(MXFReader, ClientHearsAWellFormedFileInOrder) {
  Journal journal;
  JournalStructureHandler structure(journal);
  JournalKLVHandler metadata(journal, "metadata");
  JournalKLVHandler index(journal, "index");
  JournalKLVHandler essence(journal, "essence");
  JournalErrorHandler errors(journal);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&structure);
  reader.setMetadataHandler(&metadata);
  reader.setIndexHandler(&index);
  reader.setEssenceHandler(&essence);
  reader.setErrorHandler(&errors);
  const ByteVector bytes = smallFile();
  util::vector_istream stream(bytes);
  reader.read(stream);
  const std::string header = toString(partitionKey(2, 4));
  const std::string footer = toString(partitionKey(4, 4));
  const std::vector<std::string> expected{
      "errors start", "structure startStream", "structure startPartition " + header + " 128",
      "metadata setLocator", "metadata startStream 1", "metadata setLengthForm 131",
      "metadata startLocalSet " + toString(metadataSetKey()) + " 20", "metadata startLocalItem 15361 16",
      "metadata value 16", "metadata endLocalItem 15361", "metadata endLocalSet " + toString(metadataSetKey()),
      "metadata endStream 0", "index setLocator", "index startStream 1", "index setLengthForm 131",
      "index startLocalSet " + toString(indexSegmentKey()) + " 12", "index startLocalItem 15361 8", "index value 8",
      "index endLocalItem 15361", "index endLocalSet " + toString(indexSegmentKey()), "index endStream 0",
      "essence setLocator", "essence startStream 1", "essence setLengthForm 131",
      "essence startIndividualItem " + toString(essenceElementKey()) + " 10", "essence value 10",
      "essence endIndividualItem " + toString(essenceElementKey()), "essence endStream 0",
      "structure endPartition " + header, "structure startPartition " + footer + " 108",
      "structure endPartition " + footer, "structure randomIndex 2", "structure endStream 0", "errors end"};
  EXPECT_EQ(expected, journal.lines);
  EXPECT_EQ(std::vector<std::string>{}, reportLines(errors));
}

TEST(MXFReader, FileWithoutRunInGivesNoSetRunIn) {
  ReaderRun run;
  readWithMXFReader(smallFile(), run);
  EXPECT_EQ("startStream", run.structure.events.front());
  EXPECT_EQ(std::vector<std::string>{}, run.reports());
}

TEST(MXFReader, MissingStructureHandlerStillValidates) {
  // A header that names no footer, and no random index.
  const ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), essenceElement(10)});
  RecordingErrorHandler errors;
  MXFReader reader;
  reader.setErrorHandler(&errors);
  util::vector_istream stream(bytes);
  reader.read(stream);
  EXPECT_EQ(std::vector<std::string>{reportLine("error", randomIndexMissingId,
                                                "missing random index or non-zero footerPartition in the header "
                                                "partition pack")},
            reportLines(errors));
  EXPECT_EQ(1, errors.starts);
  EXPECT_EQ(1, errors.ends);
}

TEST(MXFReader, ReaderWithNothingInstalledWalksTheFile) {
  MXFReader reader;
  const ByteVector bytes = smallFile();
  util::vector_istream stream(bytes);
  reader.read(stream);
  EXPECT_TRUE(stream.eof());
}

TEST(MXFReader, ReaderCanBeReadWithAgain) {
  RecordingStructureHandler structure;
  RecordingErrorHandler errors;
  MXFReader reader;
  reader.setStructureHandler(&structure);
  reader.setErrorHandler(&errors);
  const ByteVector bytes = smallFile();
  util::vector_istream first(bytes);
  reader.read(first);
  const std::vector<std::string> once = structure.events;
  ASSERT_EQ(7u, once.size());
  util::vector_istream second(bytes);
  reader.read(second);
  EXPECT_EQ(14u, structure.events.size());
  EXPECT_EQ(once, std::vector<std::string>(structure.events.begin() + 7, structure.events.end()));
  EXPECT_EQ(std::vector<std::string>{}, reportLines(errors));
}

TEST(MXFReader, HandlerExceptionLeavesTheRead) {
  class Throwing : public DullMXFStructureHandler {
  public:
    void randomIndex(const std::vector<MXFRandomIndexEntry>&) override { throw std::logic_error("client stop"); }
  };
  Throwing structure;
  RecordingErrorHandler errors;
  MXFReader reader;
  reader.setStructureHandler(&structure);
  reader.setErrorHandler(&errors);
  const ByteVector bytes = smallFile();
  util::vector_istream stream(bytes);
  EXPECT_THROW(reader.read(stream), std::logic_error);
  EXPECT_EQ(1, errors.ends);
}

TEST(MXFReader, RandomIndexAsTheFirstElementIsReportedWithoutStartPartition) {
  ReaderRun run;
  readWithMXFReader(randomIndexPack({{1, 0}}), run);
  EXPECT_EQ((std::vector<std::string>{"startStream", "randomIndex 1", "endStream 0"}), run.structure.events);
  // The random index names a partition that the read never met.
  EXPECT_EQ((std::vector<std::string>{reportLine("error", randomIndexMissingId, "unexpected random index"),
                                      reportLine("warning", randomIndexValueId, "incorrect random index value")}),
            run.reports());
}

// ---------------------------------------------------------------------------
// Run-in

TEST(MXFReader, RunInIsSkippedAndEveryPartitionCarriesThePackItHasWithoutIt) {
  const ByteVector original = readFile(dataPath(d10File));
  ReaderRun plain;
  readWithMXFReader(original, plain);
  ReaderRun prefixed;
  readWithMXFReader(concat({runIn1000(), original}), prefixed);
  EXPECT_EQ("no failure", prefixed.failure);
  ASSERT_FALSE(prefixed.structure.events.empty());
  EXPECT_EQ("setRunIn 1000", prefixed.structure.events.front());
  EXPECT_EQ(std::vector<std::string>(plain.structure.events.begin(), plain.structure.events.end()),
            std::vector<std::string>(prefixed.structure.events.begin() + 1, prefixed.structure.events.end()));
  ASSERT_EQ(2u, prefixed.structure.packs.size());
  EXPECT_EQ(plain.structure.packs, prefixed.structure.packs);
  // The offsets as the file states them, counted without the run-in.
  EXPECT_EQ(0u, prefixed.structure.packs[0].thisPartition);
  EXPECT_EQ(758272u, prefixed.structure.packs[0].footerPartition);
  EXPECT_EQ(758272u, prefixed.structure.packs[1].thisPartition);
  EXPECT_EQ((std::vector<MXFRandomIndexEntry>{{1, 0}, {0, 758272}}), prefixed.structure.entries);
  // Both packs name OP1a (06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00),
  // a generalized pattern; the offsets, counted from the run-in's end, pass.
  const std::string report = reportLine("error", runInErrorId, "generalized operational pattern with run-in");
  EXPECT_EQ((std::vector<std::string>{report, report}), prefixed.reports());
}

TEST(MXFReader, RunInOf65536OctetsIsInvalid) {
  const ByteVector original = readFile(dataPath(d10File));
  ReaderRun run;
  readWithMXFReader(concat({ByteVector(65536, 0), original}), run);
  EXPECT_EQ("invalid run-in", run.failure);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", runInErrorId, "invalid run-in")}, run.reports());
  EXPECT_EQ(0, run.errors.starts);
  EXPECT_TRUE(run.structure.events.empty());
}

TEST(MXFReader, RunInIsNotLookedForUnlessAskedFor) {
  const ByteVector bytes = concat({ByteVector(16, 0x11), smallFile()});
  RecordingErrorHandler errors;
  MXFReader reader;
  reader.setErrorHandler(&errors);
  util::vector_istream stream(bytes);
  EXPECT_THROW(reader.read(stream), std::runtime_error);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", klvCodingErrorId,
                                                "invalid SMPTE key - "
                                                "11.11.11.11.11.11.11.11.11.11.11.11.11.11.11.11")},
            reportLines(errors));
}
