#include <gtest/gtest.h>

#include <ios>
#include <istream>
#include <limits>
#include <sstream>
#include <string>

#include "failure.h"
#include "klv.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;

namespace {

// Exposes the stream buffer's seeks, which a stream reaches only through
// tellg and seekg.
std::streamoff seekOff(util::vector_streambuf& buffer, std::streamoff off, std::ios_base::seekdir dir) {
  return static_cast<std::streamoff>(buffer.pubseekoff(off, dir, std::ios_base::in));
}

}  // namespace

TEST(VectorStreambuf, SeekoffOnEmptyBufferAnswersMinusOne) {
  util::vector_streambuf empty;
  EXPECT_EQ(seekOff(empty, 0, std::ios_base::beg), -1);
  EXPECT_EQ(seekOff(empty, 0, std::ios_base::cur), -1);
  EXPECT_EQ(seekOff(empty, 0, std::ios_base::end), -1);
  ByteVector none;
  util::vector_streambuf overEmptyVector(none);
  EXPECT_EQ(seekOff(overEmptyVector, 0, std::ios_base::beg), -1);
  EXPECT_EQ(static_cast<std::streamoff>(overEmptyVector.pubseekpos(0, std::ios_base::in)), -1);
}

TEST(VectorStreambuf, SeekOutsideTheVectorAnswersMinusOne) {
  ByteVector bytes = bytesOf("01 02 03 04");
  util::vector_streambuf buffer(bytes);
  EXPECT_EQ(seekOff(buffer, 5, std::ios_base::beg), -1);
  EXPECT_EQ(seekOff(buffer, -1, std::ios_base::beg), -1);
  EXPECT_EQ(seekOff(buffer, 1, std::ios_base::end), -1);
  EXPECT_EQ(static_cast<std::streamoff>(buffer.pubseekpos(9, std::ios_base::in)), -1);
  EXPECT_EQ(buffer.sgetc(), 0x01);
}

// Found by the fuzzer: a skip of almost 2^63 octets from the middle of a
// value once overflowed the sum of position and offset.
TEST(VectorStreambuf, OffsetsAtTheLimitsOfTheTypeAnswerMinusOne) {
  ByteVector bytes = bytesOf("01 02 03 04");
  util::vector_streambuf buffer(bytes);
  const std::streamoff largest = std::numeric_limits<std::streamoff>::max();
  const std::streamoff smallest = std::numeric_limits<std::streamoff>::min();
  EXPECT_EQ(seekOff(buffer, 2, std::ios_base::beg), 2);
  EXPECT_EQ(seekOff(buffer, largest, std::ios_base::cur), -1);
  EXPECT_EQ(seekOff(buffer, smallest, std::ios_base::cur), -1);
  EXPECT_EQ(seekOff(buffer, largest, std::ios_base::end), -1);
  EXPECT_EQ(seekOff(buffer, smallest, std::ios_base::end), -1);
  EXPECT_EQ(buffer.sgetc(), 0x03);
}

TEST(VectorStreambuf, OffsetFromEndCountsBack) {
  ByteVector bytes = bytesOf("01 02 03 04");
  util::vector_streambuf buffer(bytes);
  EXPECT_EQ(seekOff(buffer, -1, std::ios_base::end), 3);
  EXPECT_EQ(buffer.sgetc(), 0x04);
  EXPECT_EQ(seekOff(buffer, 0, std::ios_base::end), 4);
  EXPECT_EQ(buffer.sgetc(), std::streambuf::traits_type::eof());
}

TEST(VectorStreambuf, SeeksFromStartAndCurrent) {
  ByteVector bytes = bytesOf("01 02 03 04");
  util::vector_streambuf buffer(bytes);
  EXPECT_EQ(static_cast<std::streamoff>(buffer.pubseekpos(2, std::ios_base::in)), 2);
  EXPECT_EQ(buffer.sbumpc(), 0x03);
  EXPECT_EQ(seekOff(buffer, -3, std::ios_base::cur), 0);
  EXPECT_EQ(buffer.sgetc(), 0x01);
}

TEST(VectorStreambuf, WritingIsRefused) {
  ByteVector bytes = bytesOf("01 02");
  util::vector_streambuf buffer(bytes);
  EXPECT_EQ(buffer.sputc('x'), std::streambuf::traits_type::eof());
  EXPECT_EQ(static_cast<std::streamoff>(buffer.pubseekoff(0, std::ios_base::beg, std::ios_base::out)), -1);
  EXPECT_EQ(bytes, bytesOf("01 02"));
}

TEST(VectorIstream, EmptyVectorGivesStreamAtEnd) {
  ByteVector none;
  util::vector_istream in(none);
  EXPECT_EQ(in.peek(), std::istream::traits_type::eof());
  EXPECT_TRUE(in.eof());
}

TEST(VectorIstream, ReadsTheVectorInPlace) {
  ByteVector bytes = bytesOf("01 02 03");
  util::vector_istream in(bytes);
  bytes[1] = 0x7F;  // seen by the stream because nothing was copied
  char octets[3] = {};
  in.read(octets, 3);
  EXPECT_EQ(in.gcount(), 3);
  EXPECT_EQ(octets[1], 0x7F);
}

TEST(VectorIstream, TellsAndSeeksLikeAFile) {
  ByteVector bytes = bytesOf("0A 0B 0C 0D 0E");
  util::vector_istream in(bytes.data() + 1, 3);
  EXPECT_EQ(static_cast<std::streamoff>(in.tellg()), 0);
  in.seekg(0, std::ios_base::end);
  EXPECT_EQ(static_cast<std::streamoff>(in.tellg()), 3);
  in.seekg(1);
  EXPECT_EQ(in.get(), 0x0C);
  in.seekg(5);
  EXPECT_TRUE(in.fail());
}

TEST(ByteVectorDevice, AppendsWhatIsWritten) {
  ByteVector bytes = bytesOf("FF");
  {
    boost::iostreams::stream<util::byte_vector_device> out(bytes);
    out << "AB";
    out.put('\0');
  }
  EXPECT_EQ(bytes, bytesOf("FF 41 42 00"));
}

TEST(RequireExhausted, LeftoverOctetsFailValidExternalLength) {
  ByteVector bytes = bytesOf("01 02");
  util::vector_istream in(bytes);
  in.get();
  EXPECT_EQ(failureOf([&] { util::requireExhausted(in); }), "assertion failure: valid external length");
  in.get();
  EXPECT_EQ(failureOf([&] { util::requireExhausted(in); }), "no failure");
}

TEST(RequireWritten, FailedStreamFailsSuccessfulWrite) {
  std::ostringstream out;
  EXPECT_EQ(failureOf([&] { util::requireWritten(out); }), "no failure");
  out.setstate(std::ios_base::badbit);
  EXPECT_EQ(failureOf([&] { util::requireWritten(out); }), "assertion failure: successful write()");
}
