// Whatever stream buffer a client sets, a read of a whole file that takes
// every value reads each octet of the file from the file once.
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/process_reads.h"
#include "support/recording.h"

using zelta_test::ProcessReads;
using zelta_test::klv::dataFiles;
using zelta_test::klv::FileLikeStream;

namespace {

// Small, the C++ library's own (8 KiB), and the large ones of media programs.
const std::size_t clientBufferSizes[] = {256, 8192, 65536, 1048576};

// Takes every system item and essence element, the essence into buffers of
// its own, and counts the values larger than a stream buffer of the given
// size, each of which may cost a call of its own.
class TakingEverything : public DullMXFGCSystemHandler,
                         public DullMXFGCEssenceHandler,
                         public MXFMetadataHandler,
                         public MXFIndexHandler {
public:
  explicit TakingEverything(std::size_t bufferSize) : bufferSize_(bufferSize) {}

  bool startSystemElement(const KLVKey&) override { return true; }
  bool startEssenceElement(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    if (length >= bufferSize_) ++largeValues;
    buffers_[next_ % 4].resize(length);
    buffer = buffers_[next_++ % 4].data();
    return true;
  }
  void pictureElement(const KLVKey&, const std::uint8_t*, std::uint64_t length) override { taken += length; }
  void soundElement(const KLVKey&, const std::uint8_t*, std::uint64_t length) override { taken += length; }
  void dataElement(const KLVKey&, const std::uint8_t*, std::uint64_t length) override { taken += length; }
  void compoundElement(const KLVKey&, const std::uint8_t*, std::uint64_t length) override { taken += length; }

  void start() override {}
  void end() override {}
  void primer(const MXFPrimerEntries&) override {}
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet&) override {}

  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment&) override {}

  std::uint64_t taken = 0;
  std::uint64_t largeValues = 0;

private:
  std::size_t bufferSize_;
  std::vector<ByteVector> buffers_ = std::vector<ByteVector>(4);
  std::size_t next_ = 0;
};

// The whole file through MXFReader with every parser; false when a damaged
// file ended the read in a failure, which is the file's.
bool readEverything(std::istream& in, TakingEverything& handler) {
  MXFMetadataParser metadata(&handler);
  MXFIndexParser index(&handler);
  MXFGCSplitter essence(nullptr, &handler, &handler);
  MXFReader reader;
  reader.setMetadataHandler(&metadata);
  reader.setIndexHandler(&index);
  reader.setEssenceHandler(&essence);
  try {
    reader.read(in);
    return true;
  } catch (const std::exception&) {
    return false;
  }
}

}  // namespace

TEST(ReadOnce, StreamBufferOfAnySizeGivesEachOctetOfEveryFileOnceInAboutOneCallPerBuffer) {
  for (const std::string& path : dataFiles()) {
    const ByteVector bytes = zelta_test::readFile(path);
    for (const std::size_t size : clientBufferSizes) {
      SCOPED_TRACE(path + " buffer " + std::to_string(size));
      FileLikeStream in(bytes, size);
      TakingEverything handler(size);
      if (readEverything(in, handler)) {
        EXPECT_GT(handler.taken, bytes.size() / 2);
      }
      EXPECT_LE(in.file().octetsPulled(), bytes.size() + bytes.size() / 100);
      EXPECT_LE(static_cast<std::uint64_t>(in.file().pulls()),
                bytes.size() / size + 2 * handler.largeValues + 8);
    }
  }
}

TEST(ReadOnce, FileStreamWithAnyBufferGivesEachOctetOfEveryFileOnce) {
  for (const std::string& path : dataFiles()) {
    const std::uint64_t size = zelta_test::readFile(path).size();
    for (const std::size_t bufferSize : {std::size_t(256), std::size_t(0), std::size_t(65536), std::size_t(1) << 20}) {
      SCOPED_TRACE(path + " buffer " + std::to_string(bufferSize));
      std::vector<char> buffer(bufferSize);
      std::ifstream in;
      if (bufferSize != 0) in.rdbuf()->pubsetbuf(buffer.data(), static_cast<std::streamsize>(bufferSize));
      in.open(path, std::ios::binary);
      TakingEverything handler(bufferSize);
      ProcessReads reads;
      bool whole = false;
      if (!zelta_test::readsOf([&] { whole = readEverything(in, handler); }, reads)) GTEST_SKIP() << "no /proc/self/io";
      if (whole) {
        EXPECT_GT(handler.taken, size / 2);
      }
      EXPECT_LE(reads.octets, size + size / 100);
    }
  }
}
