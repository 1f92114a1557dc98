#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "klv.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::dataPath;
using zelta_test::keyOf;
using zelta_test::readFile;
using zelta_test::RecordingKLVHandler;
using zelta_test::toString;
using zelta_test::klv::assertionOf;
using zelta_test::klv::CountingStream;
using zelta_test::klv::dataFiles;
using zelta_test::klv::join;
using zelta_test::klv::parseErrorOf;
using zelta_test::klv::Seeking;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const itemKeyVersion2 = "06 0e 2b 34 01 02 01 02 0d 01 03 01 15 01 05 00";
const char* const otherItemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 16 01 01 00";
const char* const universalSetKey = "06 0e 2b 34 02 01 01 01 0d 01 01 01 01 01 01 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";
const char* const labelKey = "06 0e 2b 34 04 01 01 01 0d 01 02 01 01 01 01 00";

const char* const singlePassFile = "bmx_op1a_dv25_625_singlepass.mxf";

// The text of the verification failure that a call raised.
template <typename Call>
std::string verificationOf(Call call) {
  try {
    call();
  } catch (const VerifyingKLVHandler::exception& e) {
    return e.what();
  }
  return "no verification failure";
}

// Offsets of the top-level elements of a KLV file, taken apart here by hand.
std::vector<std::size_t> elementOffsets(const ByteVector& bytes) {
  std::vector<std::size_t> offsets;
  std::size_t at = 0;
  while (at < bytes.size()) {
    offsets.push_back(at);
    const std::uint8_t first = bytes.at(at + 16);
    std::uint64_t length = first;
    std::size_t lengthOctets = 1;
    if (first & 0x80) {
      lengthOctets += first & 0x7f;
      length = 0;
      for (std::size_t i = 1; i < lengthOctets; ++i) length = (length << 8) | bytes.at(at + 16 + i);
    }
    at += 16 + lengthOctets + length;
  }
  return offsets;
}

// Reads the original with a GenericKLVReader into a verifier of the other
// bytes.
void verify(const std::string& original, const ByteVector& other) {
  CountingStream held(other);
  VerifyingKLVHandler verifier(held);
  std::ifstream in(original, std::ios::binary);
  GenericKLVReader reader;
  reader.setHandler(&verifier);
  reader.read(in);
}

// Gives the whole stream at once and cannot seek, as a pipe.
class PipeBuffer : public std::streambuf {
public:
  explicit PipeBuffer(ByteVector& bytes) {
    char* begin = reinterpret_cast<char*>(bytes.data());
    setg(begin, begin, begin + bytes.size());
  }
};

}  // namespace

TEST(VerifyingKLVHandler, KeyThatDiffersOnlyInOctet7Passes) {
  const ByteVector held = join({bytesOf(itemKeyVersion2), bytesOf("83 00 00 02 aa bb")});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  verifier.setLengthForm(0x83);
  EXPECT_FALSE(verifier.startIndividualItem(keyOf(itemKey), 2, buffer));
  EXPECT_EQ(stream.tellg(), std::streampos(22));
}

TEST(VerifyingKLVHandler, LengthForm0x84AgainstTheProducers0x83FailsAlthoughTheLengthsAgree) {
  const ByteVector held = join({bytesOf(itemKey), bytesOf("84 00 00 00 02 aa bb")});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  verifier.setLengthForm(0x83);
  EXPECT_EQ(verificationOf([&] { verifier.startIndividualItem(keyOf(itemKey), 2, buffer); }),
            "Unexpected BER length form");
}

TEST(VerifyingKLVHandler, LengthBeforeAnyProducerFormFailsUnexpectedBERLengthForm) {
  const ByteVector held = join({bytesOf(itemKey), bytesOf("02 aa bb")});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ(verificationOf([&] { verifier.startIndividualItem(keyOf(itemKey), 2, buffer); }),
            "Unexpected BER length form");
}

TEST(VerifyingKLVHandler, DifferentKeyFailsWithBothKeys) {
  const ByteVector held = join({bytesOf(otherItemKey), bytesOf("83 00 00 00")});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  verifier.setLengthForm(0x83);
  EXPECT_EQ(verificationOf([&] { verifier.startIndividualItem(keyOf(itemKey), 0, buffer); }),
            "Unexpected KLV Key, expected 06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00, "
            "actual 06.0E.2B.34.01.02.01.01.0D.01.03.01.16.01.01.00");
}

TEST(VerifyingKLVHandler, DifferentLengthFailsWithBothLengths) {
  const ByteVector held = join({bytesOf(itemKey), bytesOf("83 00 01 03"), ByteVector(259, 0)});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  verifier.setLengthForm(0x83);
  EXPECT_EQ(verificationOf([&] { verifier.startIndividualItem(keyOf(itemKey), 258, buffer); }),
            "Unexpected KLV length, expected 258, actual 259");
}

TEST(VerifyingKLVHandler, ShortStreamFailsUnsuccessfulRead) {
  const ByteVector held = bytesOf("06 0e 2b 34 01 02");
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  const auto failure = parseErrorOf([&] { verifier.startLabel(keyOf(labelKey)); });
  EXPECT_EQ(failure.identifier, streamFailureId);
  EXPECT_EQ(failure.message, "unsuccessful read()");
}

TEST(VerifyingKLVHandler, DeclinesEveryElementAndSkipsItsValue) {
  const ByteVector held = join({bytesOf(universalSetKey), bytesOf("83 00 00 03 01 02 03"), bytesOf(labelKey),
                                bytesOf(localSetKey), bytesOf("83 00 00 01 ff"), bytesOf(itemKey),
                                bytesOf("83 00 00 00")});
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  verifier.setLengthForm(0x83);
  EXPECT_FALSE(verifier.startUniversalSet(keyOf(universalSetKey), 3));
  verifier.endUniversalSet(keyOf(universalSetKey));
  EXPECT_FALSE(verifier.startLabel(keyOf(labelKey)));
  verifier.endLabel(keyOf(labelKey));
  EXPECT_FALSE(verifier.startLocalSet(keyOf(localSetKey), 1, KLVTagType2, KLVLengthType2));
  verifier.endLocalSet(keyOf(localSetKey));
  EXPECT_FALSE(verifier.startIndividualItem(keyOf(itemKey), 0, buffer));
  EXPECT_EQ(stream.tellg(), std::streampos(static_cast<std::streamoff>(held.size())));
}

TEST(VerifyingKLVHandler, ItemsInsideSetsAndPacksMustNotArrive) {
  const ByteVector held;
  CountingStream stream(held);
  VerifyingKLVHandler verifier(stream);
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ(assertionOf([&] { verifier.startLocalItem(1, 0, buffer); }), "assertion failure: expected local item");
  EXPECT_EQ(assertionOf([&] { verifier.startVariableLengthItem(0, buffer); }),
            "assertion failure: expected variable length item");
}

TEST(VerifyingKLVHandler, PassesOnlyStreamStartAndEndToItsNextHandler) {
  const ByteVector held = join({bytesOf(itemKey), bytesOf("01 aa")});
  CountingStream stream(held);
  RecordingKLVHandler next;
  VerifyingKLVHandler verifier(stream, &next);
  NullLocator locator;
  verifier.setLocator(&locator);
  verifier.startStream(true);
  verifier.setLengthForm(1);
  writeIndividualItem(verifier, keyOf(itemKey), bytesOf("aa").data(), 1);
  verifier.endStream(false);
  EXPECT_EQ(next.events, (std::vector<std::string>{"startStream 1", "endStream 0"}));
}

TEST(VerifyingKLVHandler, ReaderOfAFilePassesOnTheSameFile) {
  int verified = 0;
  for (const std::string& path : dataFiles()) {
    SCOPED_TRACE(path);
    try {
      std::ifstream probe(path, std::ios::binary);
      RecordingKLVHandler taking(RecordingKLVHandler::take);
      GenericKLVReader probeReader;
      probeReader.setHandler(&taking);
      probeReader.read(probe);
    } catch (const KLVElement::parse_error&) {
      continue;  // refused by the reader, nothing to verify
    }
    std::ifstream held(path, std::ios::binary);
    VerifyingKLVHandler verifier(held);
    std::ifstream in(path, std::ios::binary);
    GenericKLVReader reader;
    reader.setHandler(&verifier);
    reader.read(in);
    EXPECT_EQ(held.tellg(), std::streampos(static_cast<std::streamoff>(readFile(path).size())));
    ++verified;
  }
  EXPECT_GE(verified, 10);
}

TEST(VerifyingKLVHandler, ReaderOfAFileFailsOnACopyWithOneKeyOctetChanged) {
  const std::string path = dataPath(singlePassFile);
  ByteVector copy = readFile(path);
  const std::size_t second = elementOffsets(copy).at(1);
  const KLVKey expected(copy.data() + second);
  copy[second + 12] ^= 0x01;
  const KLVKey actual(copy.data() + second);
  EXPECT_EQ(verificationOf([&] { verify(path, copy); }),
            "Unexpected KLV Key, expected " + toString(expected) + ", actual " + toString(actual));
}

TEST(VerifyingKLVHandler, ReaderOfAFileFailsOnACopyWithALengthInALongerForm) {
  const std::string path = dataPath(singlePassFile);
  ByteVector copy = readFile(path);
  const std::vector<std::size_t> offsets = elementOffsets(copy);
  const std::size_t third = offsets.at(2);
  ASSERT_EQ(copy[third + 16], 0x83);
  copy[third + 16] = 0x84;
  copy.insert(copy.begin() + static_cast<std::ptrdiff_t>(third + 17), 0x00);
  EXPECT_EQ(verificationOf([&] { verify(path, copy); }), "Unexpected BER length form");
}

TEST(FindKey, MovesToTheNextKeyOnASeekableStream) {
  const ByteVector bytes = join({bytesOf("00 01 02"), bytesOf(itemKey)});
  CountingStream stream(bytes);
  EXPECT_TRUE(findKey(stream, -1));
  EXPECT_EQ(stream.tellg(), std::streampos(3));
  EXPECT_TRUE(stream.good());
}

TEST(FindKey, BacksUpWithinTheStreamBufferWithoutASeek) {
  const ByteVector bytes = join({bytesOf("00 01 02"), bytesOf(itemKey)});
  zelta_test::klv::FileLikeStream stream(bytes, 4096);
  EXPECT_TRUE(findKey(stream, -1));
  EXPECT_EQ(stream.tellg(), std::streampos(3));
  EXPECT_EQ(stream.file().seeks(), 0);
}

TEST(FindKey, RestartsTheMatchOnA06) {
  const ByteVector bytes = bytesOf("06 0e 06 06 0e 2b 34 01");
  CountingStream stream(bytes);
  EXPECT_TRUE(findKey(stream, -1));
  EXPECT_EQ(stream.tellg(), std::streampos(3));
}

TEST(FindKey, BacksUpByPutBacksOnAStreamThatCannotSeek) {
  ByteVector bytes = bytesOf("ff 06 0e 2b 34 01 02");
  PipeBuffer buffer(bytes);
  std::istream stream(&buffer);
  EXPECT_TRUE(findKey(stream, -1));
  EXPECT_EQ(stream.get(), 0x06);
  EXPECT_EQ(stream.get(), 0x0e);
}

TEST(FindKey, FailsSuccessfulPutbackWhenTheBufferCannotGiveBack) {
  const ByteVector bytes = bytesOf("ff 06 0e 2b 34 01 02");
  CountingStream stream(bytes, Seeking::notSeekable);
  EXPECT_EQ(assertionOf([&] { findKey(stream, -1); }), "assertion failure: successful putback()");
}

TEST(FindKey, AnswersFalseWhenTheKeyBeginsBeyondTheLimit) {
  const ByteVector bytes = join({bytesOf("00 00 00 00 00"), bytesOf(itemKey)});
  CountingStream beyond(bytes);
  EXPECT_FALSE(findKey(beyond, 4));
  CountingStream within(bytes);
  EXPECT_TRUE(findKey(within, 5));
  EXPECT_EQ(within.tellg(), std::streampos(5));
}

TEST(FindKey, AnswersFalseAtTheEndWithFailAndEndOfFileSet) {
  const ByteVector bytes = bytesOf("00 06 0e 2b");
  CountingStream stream(bytes);
  EXPECT_FALSE(findKey(stream, -1));
  EXPECT_TRUE(stream.fail());
  EXPECT_TRUE(stream.eof());
}

TEST(FindKey, RequiresAGoodStream) {
  const ByteVector bytes = bytesOf(itemKey);
  CountingStream stream(bytes);
  stream.setstate(std::ios_base::failbit);
  EXPECT_EQ(assertionOf([&] { findKey(stream, -1); }), "assertion failure: input stream is good()");
}
