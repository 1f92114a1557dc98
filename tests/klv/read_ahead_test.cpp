#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/process_reads.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::ProcessReads;
using zelta_test::RecordingErrorHandler;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::FileLikeStream;
using zelta_test::klv::join;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";

// The stream buffer sizes that clients pick: small, the C++ library's own,
// and the large ones of media programs.
const std::size_t clientBufferSizes[] = {256, 0, 65536, 1048576};

ByteVector counting(std::size_t count, unsigned step = 7) {
  ByteVector bytes(count);
  for (std::size_t i = 0; i < count; ++i) bytes[i] = static_cast<std::uint8_t>(i * step);
  return bytes;
}

// One individual item with a four-octet BER length.
ByteVector item(const ByteVector& value) {
  const auto size = static_cast<std::uint32_t>(value.size());
  ByteVector bytes = bytesOf(itemKey);
  bytes.insert(bytes.end(), {0x83, static_cast<std::uint8_t>(size >> 16), static_cast<std::uint8_t>(size >> 8),
                             static_cast<std::uint8_t>(size)});
  bytes.insert(bytes.end(), value.begin(), value.end());
  return bytes;
}

// Edit-unit-like runs: a large value, then many small ones, again and again.
ByteVector editUnits(int count) {
  ByteVector bytes;
  for (int unit = 0; unit < count; ++unit) {
    const ByteVector picture = item(counting(100000 + 1000 * unit, 3));
    bytes.insert(bytes.end(), picture.begin(), picture.end());
    for (int sound = 0; sound < 8; ++sound) {
      const ByteVector small = item(counting(1920 + sound, 5));
      bytes.insert(bytes.end(), small.begin(), small.end());
    }
  }
  return bytes;
}

// A file of the given octets under the temporary directory, removed with the
// object.
class TemporaryFile {
public:
  explicit TemporaryFile(const ByteVector& bytes)
      : path_((std::filesystem::temp_directory_path() /
               ("zelta_read_ahead_" + std::to_string(::getpid()) + "_" + std::to_string(next_++) + ".klv"))
                  .string()) {
    std::ofstream out(path_, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  }
  ~TemporaryFile() { std::remove(path_.c_str()); }
  const std::string& path() const { return path_; }

private:
  static inline int next_ = 0;
  std::string path_;
};

// Runs test once for every client buffer size, on a file stream over path
// whose buffer is set before it opens.
template <typename Test>
void forEachClientBuffer(const std::string& path, Test test) {
  for (const std::size_t size : clientBufferSizes) {
    SCOPED_TRACE("client buffer " + std::to_string(size));
    std::vector<char> buffer(size);
    std::ifstream in;
    if (size != 0) in.rdbuf()->pubsetbuf(buffer.data(), static_cast<std::streamsize>(size));
    in.open(path, std::ios::binary);
    test(in);
  }
}

bool readCounted(std::istream& in, KLVHandler& handler, ProcessReads& reads) {
  GenericKLVReader reader;
  reader.setHandler(&handler);
  return zelta_test::readsOf([&] { reader.read(in); }, reads);
}

// Takes every value into a buffer of its own and writes nothing down.
class TakingHandler : public DullKLVHandler {
public:
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    buffers_[next_ % 4].resize(length);
    buffer = buffers_[next_++ % 4].data();
    return true;
  }
  void value(const std::uint8_t* data, std::streamsize size) override { taken.insert(taken.end(), data, data + size); }

  ByteVector taken;

private:
  std::vector<ByteVector> buffers_ = std::vector<ByteVector>(4);
  std::size_t next_ = 0;
};

ByteVector valuesOf(int units) {
  ByteVector values;
  for (int unit = 0; unit < units; ++unit) {
    const ByteVector picture = counting(100000 + 1000 * unit, 3);
    values.insert(values.end(), picture.begin(), picture.end());
    for (int sound = 0; sound < 8; ++sound) {
      const ByteVector small = counting(1920 + sound, 5);
      values.insert(values.end(), small.begin(), small.end());
    }
  }
  return values;
}

}  // namespace

TEST(GenericKLVReaderStreamBuffer, SkipThatEndsInsideTheStreamBufferNeitherSeeksNorReadsAgain) {
  const ByteVector bytes = join({item(counting(300)), item(counting(20))});
  FileLikeStream stream(bytes, 4096);
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(stream.file().seeks(), 0);
  EXPECT_EQ(stream.file().octetsPulled(), bytes.size());
  EXPECT_EQ(handler.events.back(), "endStream 0");
}

TEST(GenericKLVReaderStreamBuffer, SkipBeyondTheStreamBufferSeeksPastWhatItDoesNotHold) {
  const ByteVector bytes = join({item(counting(100000)), item(counting(20))});
  FileLikeStream stream(bytes, 256);
  RecordingKLVHandler skipping(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&skipping);
  reader.read(stream);
  EXPECT_EQ(stream.file().seeks(), 1);
  // The skipped octets are not read, and the buffer is read once before the
  // seek and once behind it.
  EXPECT_LE(stream.file().octetsPulled(), 2u * 256u);
}

TEST(GenericKLVReaderStreamBuffer, SmallValuesComeOutOfTheStreamBufferInOneCallPerBuffer) {
  ByteVector bytes;
  for (int i = 0; i < 2000; ++i) {
    const ByteVector small = item(counting(100 + i % 7));
    bytes.insert(bytes.end(), small.begin(), small.end());
  }
  FileLikeStream stream(bytes, 65536);
  TakingHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(stream.file().octetsPulled(), bytes.size());
  // Each call fills the buffer; the last one finds the end.
  EXPECT_EQ(static_cast<std::size_t>(stream.file().pulls()), bytes.size() / 65536 + 2);
}

TEST(GenericKLVReaderStreamBuffer, ValueWithoutBufferComesFromWhereTheStreamBufferHoldsIt) {
  const ByteVector value = counting(70000);
  const ByteVector bytes = item(value);
  FileLikeStream stream(bytes, 1048576);
  RecordingKLVHandler handler(RecordingKLVHandler::take);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(std::vector<std::string>(handler.events.begin() + 4, handler.events.end() - 2),
            (std::vector<std::string>{"value 65536", "value 4464"}));
  EXPECT_EQ(handler.values, value);
}

TEST(GenericKLVReaderFileStream, EveryOctetIsReadOnceAndSmallValuesShareCallsWhateverTheClientBuffer) {
  const int units = 40;
  const ByteVector bytes = editUnits(units);
  const TemporaryFile file(bytes);
  forEachClientBuffer(file.path(), [&](std::ifstream& in) {
    TakingHandler handler;
    ProcessReads reads;
    if (!readCounted(in, handler, reads)) GTEST_SKIP() << "no /proc/self/io";
    EXPECT_EQ(handler.taken, valuesOf(units));
    EXPECT_LE(reads.octets, bytes.size() + bytes.size() / 100);
    // A large value costs one call, which also brings the small ones that
    // follow it once the reader has seen such a run; the first run and the
    // end take a few more.
    EXPECT_LE(reads.calls, static_cast<std::uint64_t>(units) + 16);
  });
}

TEST(GenericKLVReaderFileStream, SkippedValuesAreNotRead) {
  const ByteVector bytes = editUnits(20);
  const TemporaryFile file(bytes);
  forEachClientBuffer(file.path(), [&](std::ifstream& in) {
    RecordingKLVHandler handler(RecordingKLVHandler::skip);
    ProcessReads reads;
    if (!readCounted(in, handler, reads)) GTEST_SKIP() << "no /proc/self/io";
    EXPECT_EQ(handler.events.back(), "endStream 0");
    EXPECT_LT(reads.octets, bytes.size() / 4);
  });
}

TEST(GenericKLVReaderFileStream, HandlersThatAskTheClientStreamLearnTheReadPosition) {
  const ByteVector bytes = join({item(counting(50000)), item(counting(10)), item(counting(300))});
  const TemporaryFile file(bytes);
  forEachClientBuffer(file.path(), [&](std::ifstream& in) {
    struct Asking : public DullKLVHandler {
      explicit Asking(std::istream& stream) : stream(stream) {}
      bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*&) override {
        told.push_back(stream.tellg());
        return length > 100;
      }
      void endIndividualItem(const KLVKey&) override { told.push_back(stream.tellg()); }
      std::istream& stream;
      std::vector<std::streamoff> told;
    } asking(in);
    GenericKLVReader reader;
    reader.setHandler(&asking);
    reader.read(in);
    EXPECT_EQ(asking.told, (std::vector<std::streamoff>{20, 50020, 50040, 50050, 50070, 50370}));
  });
}

TEST(GenericKLVReaderFileStream, ClientStreamStandsWhereAStoppedReadStopped) {
  const ByteVector first = counting(200000);
  const ByteVector second = counting(30);
  const ByteVector bytes = join({item(first), item(second)});
  const TemporaryFile file(bytes);
  forEachClientBuffer(file.path(), [&](std::ifstream& in) {
    RecordingKLVHandler head(RecordingKLVHandler::take);
    GenericKLVReader reader;
    reader.setHandler(&head);
    reader.read(in, 1);
    EXPECT_EQ(head.values, first);
    EXPECT_EQ(std::streamoff(in.tellg()), 200020);
    RecordingKLVHandler rest(RecordingKLVHandler::take);
    reader.setHandler(&rest);
    reader.read(in);
    EXPECT_EQ(rest.values, second);
    EXPECT_TRUE(in.eof());
    EXPECT_FALSE(in.fail());
    in.clear();
    EXPECT_EQ(std::streamoff(in.tellg()), static_cast<std::streamoff>(bytes.size()));
  });
}

TEST(GenericKLVReaderFileStream, CutInsideATakenValueFailsUnsuccessfulReadAndLeavesTheStreamFailed) {
  ByteVector bytes = item(counting(100000));
  bytes.resize(60000);
  const TemporaryFile file(bytes);
  std::ifstream in(file.path(), std::ios::binary);
  TakingHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  const zelta_test::klv::Failure failure = zelta_test::klv::parseErrorOf([&] { reader.read(in); });
  EXPECT_EQ(failure.message, "unsuccessful read()");
  EXPECT_EQ(failure.identifier, streamFailureId);
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_TRUE(in.fail());
}

TEST(GenericKLVReaderFileStream, OutputStillInTheStreamBufferIsRead) {
  const ByteVector value = counting(40);
  const ByteVector bytes = item(value);
  const TemporaryFile file({});
  std::fstream stream(file.path(), std::ios::in | std::ios::out | std::ios::binary | std::ios::trunc);
  stream.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  stream.seekg(0);
  RecordingKLVHandler handler(RecordingKLVHandler::take);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.values, value);
}

TEST(GenericKLVReaderFileStream, FileStreamOnAPipeReadsThroughItsOwnBuffer) {
  const ByteVector bytes = join({item(counting(70000)), item(counting(5))});
  const std::string path = (std::filesystem::temp_directory_path() /
                            ("zelta_read_ahead_pipe_" + std::to_string(::getpid())))
                               .string();
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  std::thread writer([&] {
    std::ofstream out(path, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  });
  std::ifstream in(path, std::ios::binary);
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  reader.read(in);
  writer.join();
  std::remove(path.c_str());
  const std::string key = zelta_test::toString(keyOf(itemKey));
  EXPECT_EQ(handler.events, (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 131",
                                                      "startIndividualItem " + key + " 70000",
                                                      "endIndividualItem " + key, "startIndividualItem " + key + " 5",
                                                      "endIndividualItem " + key, "endStream 0"}));
  EXPECT_TRUE(errors.reports.empty());
}
