#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "klv.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::CountingStream;
using zelta_test::klv::dataFiles;
using zelta_test::klv::join;
using zelta_test::klv::LocatedKLVHandler;

namespace {

// Right behind the reader's teller: asks the stream itself where it is at
// every event and notes each event where the teller's locator says otherwise.
class TellingFilter : public DullKLVFilter {
public:
  TellingFilter(std::istream& stream, KLVHandler* next) : DullKLVFilter(next), stream_(stream) {}

  void setLocator(Locator* locator) override {
    locator_ = locator;
    DullKLVFilter::setLocator(locator);
  }
  void startStream(bool accurate) override {
    compare("startStream");
    DullKLVFilter::startStream(accurate);
  }
  void endStream(bool aborted) override {
    compare("endStream");
    DullKLVFilter::endStream(aborted);
  }
  void setLengthForm(std::uint8_t form) override {
    compare("setLengthForm");
    DullKLVFilter::setLengthForm(form);
  }
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    compare("startIndividualItem");
    return DullKLVFilter::startIndividualItem(key, length, buffer);
  }
  void endIndividualItem(const KLVKey& key) override {
    compare("endIndividualItem");
    DullKLVFilter::endIndividualItem(key);
  }
  bool startLabel(const KLVKey& key) override {
    compare("startLabel");
    return DullKLVFilter::startLabel(key);
  }
  void endLabel(const KLVKey& key) override {
    compare("endLabel");
    DullKLVFilter::endLabel(key);
  }
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override {
    compare("startUniversalSet");
    return DullKLVFilter::startUniversalSet(key, length);
  }
  void endUniversalSet(const KLVKey& key) override {
    compare("endUniversalSet");
    DullKLVFilter::endUniversalSet(key);
  }
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) override {
    compare("startLocalSet");
    return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
  }
  void endLocalSet(const KLVKey& key) override {
    compare("endLocalSet");
    DullKLVFilter::endLocalSet(key);
  }
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override {
    compare("startLocalItem");
    return DullKLVFilter::startLocalItem(tag, length, buffer);
  }
  void endLocalItem(std::uint32_t tag) override {
    compare("endLocalItem");
    DullKLVFilter::endLocalItem(tag);
  }
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    compare("startFixedLengthPack");
    return DullKLVFilter::startFixedLengthPack(key, length, buffer);
  }
  void endFixedLengthPack(const KLVKey& key) override {
    compare("endFixedLengthPack");
    DullKLVFilter::endFixedLengthPack(key);
  }
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override {
    compare("startVariableLengthPack");
    return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
  }
  void endVariableLengthPack(const KLVKey& key) override {
    compare("endVariableLengthPack");
    DullKLVFilter::endVariableLengthPack(key);
  }
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override {
    compare("startVariableLengthItem");
    return DullKLVFilter::startVariableLengthItem(length, buffer);
  }
  void endVariableLengthItem() override {
    compare("endVariableLengthItem");
    DullKLVFilter::endVariableLengthItem();
  }
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override {
    compare("startWrapper");
    return DullKLVFilter::startWrapper(key, length, isWrapper, buffer);
  }
  void endWrapper(const KLVKey& key) override {
    compare("endWrapper");
    DullKLVFilter::endWrapper(key);
  }
  void value(const std::uint8_t* data, std::streamsize size) override {
    compare("value");
    DullKLVFilter::value(data, size);
  }

  std::vector<std::string> mismatches;
  int compared = 0;

private:
  // A failed stream has no position to tell.
  void compare(const char* event) {
    const std::ios_base::iostate state = stream_.rdstate();
    std::streamoff told = -1;
    if (!(state & (std::ios_base::failbit | std::ios_base::badbit))) {
      stream_.clear();
      told = stream_.tellg();
      stream_.clear(state);
    }
    const std::streamoff located = locator_ ? std::streamoff(locator_->getPosition()) : -2;
    if (told != located)
      mismatches.push_back(std::string(event) + " told " + std::to_string(told) + " located " +
                           std::to_string(located));
    ++compared;
  }

  std::istream& stream_;
  Locator* locator_ = nullptr;
};

struct TellingRead {
  std::vector<std::string> mismatches;
  int compared = 0;
  std::vector<std::string> events;
};

TellingRead readTelling(std::istream& stream, RecordingKLVHandler::Policy policy) {
  LocatedKLVHandler handler(policy);
  TellingFilter telling(stream, &handler);
  GenericKLVReader reader;
  reader.setHandler(&telling);
  try {
    reader.read(stream);
  } catch (const KLVElement::parse_error&) {
  }
  return TellingRead{telling.mismatches, telling.compared, handler.events};
}

const RecordingKLVHandler::Policy everyPolicy[] = {RecordingKLVHandler::take, RecordingKLVHandler::takeIntoBuffer,
                                                   RecordingKLVHandler::skip};

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";

// Every coding of the layer, with length forms that change between elements
// and between the items of sets and packs.
ByteVector everyCoding() {
  return join({
      // Local set of one-octet tags and BER lengths: short, 0x81 and 0x83 forms.
      bytesOf("06 0e 2b 34 02 03 01 01 0d 01 01 01 01 01 01 00 10"),
      bytesOf("01 02 aa bb  02 81 03 cc dd ee  03 83 00 00 01 ff"),
      // Variable length pack of BER items, in a long form of its own.
      bytesOf("06 0e 2b 34 02 04 01 01 0d 01 02 01 01 01 01 00 83 00 00 06"),
      bytesOf("02 aa bb  81 01 cc"),
      // Universal set holding one individual item.
      bytesOf("06 0e 2b 34 02 01 01 01 0d 01 02 01 01 01 01 00 12"),
      bytesOf(itemKey), bytesOf("01 aa"),
      bytesOf("06 0e 2b 34 04 01 01 01 0d 01 02 01 01 01 01 00"),  // label
      bytesOf("06 0e 2b 34 03 01 01 01 0d 01 02 01 01 01 01 00 87 00 00 00 00 00 00 02 aa bb"),
      bytesOf("06 0e 2b 34 02 05 01 01 0d 01 02 01 01 01 01 00 02 aa bb"),  // fixed length pack
      // Local set of two-octet tags and lengths.
      bytesOf("06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 01 00 05 00 01 00 01 aa"),
      // Variable length pack of two-octet lengths.
      bytesOf("06 0e 2b 34 02 44 01 01 0d 01 02 01 01 01 01 00 04 00 02 aa bb"),
      bytesOf(itemKey), bytesOf("00"),
  });
}

}  // namespace

TEST(KLVTellerCount, CountedPositionIsTheToldPositionAtEveryEventOfEveryCoding) {
  for (const auto policy : everyPolicy) {
    SCOPED_TRACE(policy);
    const ByteVector bytes = everyCoding();
    std::istringstream stream(std::string(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
    const TellingRead read = readTelling(stream, policy);
    EXPECT_EQ(read.mismatches, std::vector<std::string>());
    EXPECT_EQ(read.compared + 1, static_cast<int>(read.events.size()));  // all but setLocator
    EXPECT_EQ(read.events.back(), "endStream 0");
  }
}

TEST(KLVTellerCount, CountStartsWhereTheStreamStands) {
  const ByteVector bytes = join({bytesOf("ff ff ff"), everyCoding()});
  std::istringstream stream(std::string(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
  stream.ignore(3);
  const TellingRead read = readTelling(stream, RecordingKLVHandler::skip);
  EXPECT_EQ(read.mismatches, std::vector<std::string>());
  EXPECT_EQ(read.compared + 1, static_cast<int>(read.events.size()));
  EXPECT_EQ(read.events.back(), "endStream 0");
}

TEST(KLVTellerCount, SkipBeyondTheEndIsCountedAsTheStreamTellsIt) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("02 aa bb"), bytesOf(itemKey), bytesOf("83 00 01 00 cc")});
  CountingStream stream(bytes);
  const TellingRead read = readTelling(stream, RecordingKLVHandler::skip);
  EXPECT_EQ(read.mismatches, std::vector<std::string>());
  EXPECT_EQ(read.events.back(), "endStream 0");
}

// Whatever buffer the client gave its file stream: small, the stream's own,
// and large.
TEST(KLVTellerCount, CountedPositionIsTheToldPositionOnEveryDataFile) {
  for (const std::string& path : dataFiles()) {
    for (const auto policy : everyPolicy) {
      for (const std::size_t bufferSize : {std::size_t(256), std::size_t(0), std::size_t(1) << 20}) {
        SCOPED_TRACE(path + " policy " + std::to_string(policy) + " buffer " + std::to_string(bufferSize));
        std::vector<char> buffer(bufferSize);
        std::ifstream stream;
        if (bufferSize != 0) stream.rdbuf()->pubsetbuf(buffer.data(), static_cast<std::streamsize>(bufferSize));
        stream.open(path, std::ios::binary);
        const TellingRead read = readTelling(stream, policy);
        EXPECT_EQ(read.mismatches, std::vector<std::string>());
        EXPECT_GT(read.compared, 2);
      }
    }
  }
}
