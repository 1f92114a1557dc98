#include <gtest/gtest.h>

#include <vector>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::RecordingErrorHandler;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::CountingStream;
using zelta_test::klv::join;
using zelta_test::klv::LocatedKLVHandler;
using zelta_test::klv::Seeking;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";

// Notes how many device reads each value cost, from its start event to its
// value event, or to its end event when declined.
class ReadCountingHandler : public DullKLVHandler {
public:
  ReadCountingHandler(CountingStream& stream, bool take, bool intoBuffer)
      : stream_(stream), take_(take), intoBuffer_(intoBuffer) {}

  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    return start(length, buffer);
  }
  void endIndividualItem(const KLVKey&) override { end(); }
  bool startLocalSet(const KLVKey&, std::uint64_t, KLVTagType, KLVLengthType) override { return true; }
  bool startLocalItem(std::uint32_t, std::uint64_t length, std::uint8_t*& buffer) override {
    return start(length, buffer);
  }
  void endLocalItem(std::uint32_t) override { end(); }
  void value(const std::uint8_t* data, std::streamsize size) override {
    readsPerValue.push_back(stream_.reads() - readsAtStart_);
    readsAtStart_ = stream_.reads();
    values.insert(values.end(), data, data + size);
  }

  std::vector<int> readsPerValue;
  std::vector<int> readsPerSkip;
  ByteVector values;

private:
  bool start(std::uint64_t length, std::uint8_t*& buffer) {
    readsAtStart_ = stream_.reads();
    if (take_ && intoBuffer_) {
      buffer_.resize(length);
      buffer = buffer_.data();
    }
    return take_;
  }
  void end() {
    if (!take_) readsPerSkip.push_back(stream_.reads() - readsAtStart_);
  }

  CountingStream& stream_;
  bool take_;
  bool intoBuffer_;
  int readsAtStart_ = 0;
  ByteVector buffer_;
};

ByteVector counting(std::size_t count) {
  ByteVector bytes(count);
  for (std::size_t i = 0; i < count; ++i) bytes[i] = static_cast<std::uint8_t>(i * 7);
  return bytes;
}

}  // namespace

// A value that the stream's buffer holds costs no read at all; here the
// buffer holds one octet at a time, so only the empty value comes without.
TEST(GenericKLVReaderStreamAccess, HandlerBufferGetsAtMostOneStreamReadPerValue) {
  const ByteVector big = counting(300000);
  const ByteVector bytes =
      join({bytesOf(itemKey), bytesOf("83 04 93 e0"), big, bytesOf(localSetKey),
            bytesOf("0d 3c 0a 00 02 aa bb 01 02 00 03 cc dd ee"), bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  ReadCountingHandler handler(stream, true, true);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.readsPerValue, (std::vector<int>{1, 1, 1, 0}));
  EXPECT_EQ(handler.values, join({big, bytesOf("aa bb cc dd ee")}));
}

TEST(GenericKLVReaderStreamAccess, WithoutBufferValueComesInChunksOf64KiB) {
  const ByteVector big = counting(200000);
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("83 03 0d 40"), big});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(std::vector<std::string>(handler.events.begin() + 4, handler.events.end() - 2),
            (std::vector<std::string>{"value 65536", "value 65536", "value 65536", "value 3392"}));
  EXPECT_EQ(handler.values, big);
}

TEST(GenericKLVReaderStreamAccess, SkippedValueOfASeekableStreamCostsNoRead) {
  const ByteVector bytes = join(
      {bytesOf(itemKey), bytesOf("83 10 00 00"), ByteVector(0x100000, 0xAB), bytesOf(itemKey), bytesOf("02 01 02")});
  CountingStream stream(bytes);
  ReadCountingHandler handler(stream, false, false);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.readsPerSkip, (std::vector<int>{0, 0}));
}

TEST(GenericKLVReaderStreamAccess, CutInsideASkippedValueOfASeekableStreamEndsNormally) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("01 aa"), bytesOf(itemKey), bytesOf("10 01 02 03")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  reader.read(stream);
  const std::string key = zelta_test::toString(keyOf(itemKey));
  EXPECT_EQ(
      std::vector<std::string>(handler.events.end() - 3, handler.events.end()),
      (std::vector<std::string>{"startIndividualItem " + key + " 16", "endIndividualItem " + key, "endStream 0"}));
  EXPECT_TRUE(errors.reports.empty());
}

TEST(GenericKLVReaderStreamAccess, PipeSkipsByIgnoreAndCountsPositionsFromEvents) {
  const ByteVector bytes =
      join({bytesOf(itemKey), bytesOf("83 00 00 05 01 02 03 04 05"), bytesOf(itemKey), bytesOf("02 aa bb")});
  CountingStream stream(bytes, Seeking::notSeekable);
  LocatedKLVHandler handler(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  const std::string key = zelta_test::toString(keyOf(itemKey));
  EXPECT_EQ(handler.events, (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 131",
                                                      "startIndividualItem " + key + " 5", "endIndividualItem " + key,
                                                      "setLengthForm 1", "startIndividualItem " + key + " 2",
                                                      "endIndividualItem " + key, "endStream 0"}));
  EXPECT_EQ(handler.positions, (std::vector<std::streamoff>{0, 0, 0, 20, 25, 25, 42, 44, 44}));
  EXPECT_TRUE(stream.eof());
}

TEST(GenericKLVReaderStreamAccess, PipeSkipReadsWhatItPassesOver) {
  const ByteVector bytes =
      join({bytesOf(itemKey), bytesOf("83 00 10 00"), ByteVector(0x1000, 0xAB), bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes, Seeking::notSeekable);
  ReadCountingHandler handler(stream, false, false);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  ASSERT_EQ(handler.readsPerSkip.size(), 2u);
  EXPECT_GT(handler.readsPerSkip[0], 0);
}

TEST(GenericKLVReaderStreamAccess, PipeCutInsideASkippedValueFailsUnsuccessfulIgnore) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("10 01 02 03")});
  CountingStream stream(bytes, Seeking::notSeekable);
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  const zelta_test::klv::Failure failure = zelta_test::klv::parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "unsuccessful ignore()");
  EXPECT_EQ(failure.identifier, streamFailureId);
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, "unsuccessful ignore()");
  EXPECT_EQ(handler.events.back(), "endStream 1");
}

TEST(GenericKLVReaderStreamAccess, PipeValueThatEndsTheStreamEndsNormally) {
  // ignore() meets the end just after the count; that is no failure.
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("03 01 02 03")});
  CountingStream stream(bytes, Seeking::notSeekable);
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.events.back(), "endStream 0");
}

TEST(GenericKLVReaderStreamAccess, ErrorHandlerLocatorOfAPipeIsTheMonitor) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("01 aa"), bytesOf(itemKey), bytesOf("80")});
  CountingStream stream(bytes, Seeking::notSeekable);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  EXPECT_THROW(reader.read(stream), KLVElement::parse_error);
  ASSERT_EQ(errors.positions.size(), 1u);
  EXPECT_EQ(errors.positions[0], 18);
}
