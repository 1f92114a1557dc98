// Finding the first partition pack behind a run-in, on streams that seek,
// streams that cannot, and streams that fail.
#include <gtest/gtest.h>

#include <stdexcept>
#include <streambuf>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/klv_streams.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// A closed complete header pack with nothing behind it.
ByteVector headerPack() { return partitionPack(2, 4, packWithCounts(0, 0)); }

ByteVector runIn(std::size_t octets) { return ByteVector(octets, 0xAA); }

struct SkipResult {
  std::uint32_t length = 0;
  std::string failure = "no failure";
  std::vector<std::string> reports;
};

SkipResult skip(std::istream& stream, std::uint32_t maximum = 65535) {
  RecordingErrorHandler errors;
  MXFRunInSkipper skipper;
  skipper.setErrorHandler(&errors);
  SkipResult result;
  try {
    result.length = skipper.skip(stream, maximum);
  } catch (const std::runtime_error& failure) {
    result.failure = failure.what();
  }
  result.reports = reportLines(errors);
  EXPECT_EQ(0, errors.starts);
  return result;
}

// The 16 octets at the stream's position.
std::string keyAt(std::istream& stream) {
  std::uint8_t octets[16] = {};
  stream.read(reinterpret_cast<char*>(octets), 16);
  return stream.good() ? toString(KLVKey(octets)) : "short read";
}

// All octets in one get area, no seeking: a pipe that can take octets back.
class PipeWithPutback : public std::streambuf {
public:
  explicit PipeWithPutback(ByteVector& bytes) {
    char* begin = reinterpret_cast<char*>(bytes.data());
    setg(begin, begin, begin + bytes.size());
  }
};

// Hands out one octet at a time and answers where it is, but refuses to
// move.
class UnmovableBuffer : public std::streambuf {
public:
  explicit UnmovableBuffer(const ByteVector& bytes) : bytes_(bytes) {}

protected:
  int_type underflow() override {
    if (next_ == bytes_.size()) return traits_type::eof();
    octet_ = static_cast<char>(bytes_[next_++]);
    setg(&octet_, &octet_, &octet_ + 1);
    return traits_type::to_int_type(octet_);
  }
  pos_type seekoff(off_type off, std::ios_base::seekdir dir, std::ios_base::openmode) override {
    if (off == 0 && dir == std::ios_base::cur) return pos_type(off_type(next_ - (egptr() - gptr())));
    return pos_type(off_type(-1));
  }

private:
  const ByteVector& bytes_;
  std::size_t next_ = 0;
  char octet_ = 0;
};

// Fails the device after some octets.
class FailingBuffer : public std::streambuf {
public:
  explicit FailingBuffer(std::size_t octets) : left_(octets) {}

protected:
  int_type underflow() override {
    if (left_ == 0) throw std::runtime_error("device failure");
    --left_;
    octet_ = 0x55;
    setg(&octet_, &octet_, &octet_ + 1);
    return traits_type::to_int_type(octet_);
  }

private:
  std::size_t left_;
  char octet_ = 0;
};

}  // namespace

TEST(RunInSkipper, StreamWithoutRunInGivesZero) {
  const ByteVector bytes = headerPack();
  util::vector_istream stream(bytes);
  EXPECT_EQ(0u, skip(stream).length);
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, RunInOf65535OctetsIsAccepted) {
  const ByteVector bytes = concat({runIn(65535), headerPack()});
  util::vector_istream stream(bytes);
  const SkipResult result = skip(stream);
  EXPECT_EQ("no failure", result.failure);
  EXPECT_EQ(65535u, result.length);
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, RunInOf65536OctetsIsInvalid) {
  const ByteVector bytes = concat({runIn(65536), headerPack()});
  util::vector_istream stream(bytes);
  const SkipResult result = skip(stream);
  EXPECT_EQ("invalid run-in", result.failure);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", runInErrorId, "invalid run-in")}, result.reports);
}

TEST(RunInSkipper, StreamWithoutThePartitionKeyIsInvalidRunIn) {
  const ByteVector bytes = concat({runIn(100), essenceElement(10)});
  util::vector_istream stream(bytes);
  const SkipResult result = skip(stream);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", runInErrorId, "invalid run-in")}, result.reports);
}

TEST(RunInSkipper, MatchRestartsOnASecond06) {
  const ByteVector bytes = concat({bytesOf("06 0e 2b"), headerPack()});
  util::vector_istream stream(bytes);
  EXPECT_EQ(3u, skip(stream).length);
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, NearMissesInTheRunInAreSkipped) {
  // A fill key and a truncated partition key prefix inside the run-in.
  const ByteVector bytes = concat({bytesOf("06 0e 2b 34 01 01 01 01 03 01 02 10  06 0e 2b 34 02 05 01 01 0d 01 03"),
                                   runIn(10), headerPack()});
  util::vector_istream stream(bytes);
  EXPECT_EQ(33u, skip(stream).length);
}

// Octet 7 counts here, though nowhere else.
TEST(RunInSkipper, PartitionKeyOfAnotherVersionIsNotFound) {
  const ByteVector bytes = concat({runIn(10), element(partitionKey(2, 4, 2), packValue(packWithCounts(0, 0)))});
  util::vector_istream stream(bytes);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", runInErrorId, "invalid run-in")}, skip(stream).reports);
}

TEST(RunInSkipper, MaximumLimitsTheRunIn) {
  const ByteVector bytes = concat({runIn(20), headerPack()});
  util::vector_istream exact(bytes);
  EXPECT_EQ(20u, skip(exact, 20).length);
  util::vector_istream over(bytes);
  EXPECT_EQ("invalid run-in", skip(over, 19).failure);
}

TEST(RunInSkipper, StreamThatIsNotGoodFails) {
  const ByteVector bytes = headerPack();
  util::vector_istream stream(bytes);
  stream.setstate(std::ios_base::failbit);
  const SkipResult result = skip(stream);
  EXPECT_EQ("input stream is not good()", result.failure);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", streamFailureId, "input stream is not good()")},
            result.reports);
}

TEST(RunInSkipper, KeyGoesBackWithinTheStreamBufferWithoutASeek) {
  const ByteVector bytes = concat({runIn(50), headerPack()});
  zelta_test::klv::FileLikeStream stream(bytes, 4096);
  EXPECT_EQ(50u, skip(stream).length);
  EXPECT_EQ(0, stream.file().seeks());
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, KeyThatTheStreamBufferNoLongerHoldsComesBackByASeek) {
  const ByteVector bytes = concat({runIn(50), headerPack()});
  zelta_test::klv::FileLikeStream stream(bytes, 56);
  EXPECT_EQ(50u, skip(stream).length);
  EXPECT_EQ(1, stream.file().seeks());
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, StreamThatCannotSeekGetsTheKeyBack) {
  ByteVector bytes = concat({runIn(50), headerPack()});
  PipeWithPutback buffer(bytes);
  std::istream stream(&buffer);
  EXPECT_EQ(50u, skip(stream).length);
  EXPECT_EQ(toString(partitionKey(2, 4)), keyAt(stream));
}

TEST(RunInSkipper, FailedPutbackIsReported) {
  const ByteVector bytes = concat({runIn(50), headerPack()});
  zelta_test::klv::CountingStream stream(bytes, zelta_test::klv::Seeking::notSeekable);
  const SkipResult result = skip(stream);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", streamFailureId, "unsuccessful putback()")},
            result.reports);
}

TEST(RunInSkipper, FailedSeekIsReported) {
  const ByteVector bytes = concat({runIn(50), headerPack()});
  UnmovableBuffer buffer(bytes);
  std::istream stream(&buffer);
  const SkipResult result = skip(stream);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", streamFailureId, "unsuccessful seekg()")}, result.reports);
}

TEST(RunInSkipper, FailedReadIsReported) {
  FailingBuffer buffer(40);
  std::istream stream(&buffer);
  const SkipResult result = skip(stream);
  EXPECT_EQ("unsuccessful get()", result.failure);
  EXPECT_EQ(std::vector<std::string>{reportLine("fatal", streamFailureId, "unsuccessful get()")}, result.reports);
}

TEST(RunInSkipper, FatalWithoutAnErrorHandlerStillThrows) {
  const ByteVector bytes = runIn(10);
  util::vector_istream stream(bytes);
  MXFRunInSkipper skipper;
  EXPECT_EQ("invalid run-in", runtimeErrorTextOf([&] { skipper.skip(stream, 65535); }));
}
