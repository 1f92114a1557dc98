// MXFReader on a stream that cannot seek, as on a pipe.

#include <gtest/gtest.h>

#include <streambuf>

#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

namespace {

using namespace zelta_test;

// All octets in the get area, so that put-backs succeed; every seek answers
// -1, as a pipe does.
class PipeBuffer : public std::streambuf {
public:
  explicit PipeBuffer(const ByteVector& bytes) {
    char* begin = const_cast<char*>(reinterpret_cast<const char*>(bytes.data()));
    setg(begin, begin, begin + bytes.size());
  }
};

// Positions on a pipe are counted from the start of the read; behind a
// run-in they must still be file offsets for the structure checks.
TEST(MXFReaderOnPipe, RunInGivesTheSameEventsAndReportsAsOnASeekableStream) {
  const ByteVector original = readFile(dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  const ByteVector prefixed = concat({ByteVector(1000, 0x55), original});
  ReaderRun seekable;
  readWithMXFReader(prefixed, seekable);
  PipeBuffer buffer(prefixed);
  std::istream pipe(&buffer);
  ReaderRun piped;
  readWithMXFReader(pipe, piped);
  EXPECT_EQ("no failure", piped.failure);
  ASSERT_FALSE(piped.structure.events.empty());
  EXPECT_EQ("setRunIn 1000", piped.structure.events.front());
  EXPECT_EQ(seekable.structure.events, piped.structure.events);
  EXPECT_EQ(seekable.structure.packs, piped.structure.packs);
  // OP1a is a generalized pattern, which no run-in may precede; the offsets
  // pass, so nothing else is reported.
  const std::string report = reportLine("error", runInErrorId, "generalized operational pattern with run-in");
  EXPECT_EQ((std::vector<std::string>{report, report}), piped.reports());
}

TEST(MXFReaderOnPipe, FileWithoutRunInReadsAsOnASeekableStream) {
  const ByteVector original = readFile(dataPath("gst_dv25_625_420_2mono.mxf"));
  ReaderRun seekable;
  readWithMXFReader(original, seekable);
  PipeBuffer buffer(original);
  std::istream pipe(&buffer);
  ReaderRun piped;
  readWithMXFReader(pipe, piped);
  EXPECT_EQ("no failure", piped.failure);
  EXPECT_EQ(seekable.structure.events, piped.structure.events);
  EXPECT_EQ(std::vector<std::string>{}, piped.reports());
}

}  // namespace
