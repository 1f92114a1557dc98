#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>

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

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";

// A file of the bytes under the test's temporary directory, removed after.
class TemporaryFile {
public:
  TemporaryFile(const std::string& name, const ByteVector& bytes) : path_(::testing::TempDir() + name) {
    std::ofstream out(path_, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  }
  ~TemporaryFile() { std::remove(path_.c_str()); }
  const std::string& path() const { return path_; }

private:
  std::string path_;
};

}  // namespace

TEST(KLVTeller, PositionAtEndStreamOfTheLastElementIsTheFileSize) {
  const ByteVector bytes =
      join({bytesOf(itemKey), bytesOf("02 aa bb"), bytesOf(itemKey), bytesOf("83 00 00 03 cc dd ee")});
  TemporaryFile file("klv_teller_last_element.bin", bytes);
  std::ifstream stream(file.path(), std::ios::binary);
  LocatedKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  ASSERT_EQ(handler.events.back(), "endStream 0");
  EXPECT_EQ(handler.positions.back(), static_cast<std::streamoff>(bytes.size()));
  // The peek's end-of-file state is left as it was found.
  EXPECT_TRUE(stream.eof());
  EXPECT_FALSE(stream.fail());
}

TEST(KLVTeller, PositionAtAStartEventIsTheFirstOctetOfTheValue) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("02 aa bb"), bytesOf(itemKey), bytesOf("83 00 00 01 cc")});
  CountingStream stream(bytes);
  LocatedKLVHandler handler(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  ASSERT_EQ(handler.events.size(), 9u);
  EXPECT_EQ(handler.positions[0], 0);   // setLocator
  EXPECT_EQ(handler.positions[3], 17);  // first start
  EXPECT_EQ(handler.positions[4], 19);  // its end
  EXPECT_EQ(handler.positions[6], 19 + 20);
  EXPECT_EQ(handler.positions[8], 40);
}

TEST(KLVTeller, ErrorHandlerLocatorGivesThePositionOfTheFailure) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("01 aa"), bytesOf(itemKey), bytesOf("80")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  EXPECT_THROW(reader.read(stream), KLVElement::parse_error);
  ASSERT_EQ(errors.positions.size(), 1u);
  EXPECT_EQ(errors.positions[0], 18);
}

TEST(KLVTeller, BadStreamGivesUnknownPositionAndSetsFail) {
  std::istringstream stream("abc");
  RecordingKLVHandler next;
  KLVTeller teller(stream, &next);
  teller.startStream(true);
  EXPECT_EQ(static_cast<std::streamoff>(teller.getLocator()->getPosition()), 0);
  stream.setstate(std::ios_base::badbit);
  teller.endStream(false);
  EXPECT_EQ(static_cast<std::streamoff>(teller.getLocator()->getPosition()), -1);
  EXPECT_TRUE(stream.fail());
  EXPECT_EQ(next.events, (std::vector<std::string>{"setLocator", "startStream 1", "endStream 0"}));
  EXPECT_EQ(next.locator, teller.getLocator());
}

TEST(KLVTeller, StartsWithUnknownPosition) {
  std::istringstream stream("abc");
  KLVTeller teller(stream);
  EXPECT_EQ(static_cast<std::streamoff>(teller.getLocator()->getPosition()), -1);
}

TEST(InputLocator, HoldsWhatItWasGiven) {
  InputLocator locator;
  EXPECT_EQ(static_cast<std::streamoff>(locator.getPosition()), -1);
  locator.setPosition(1234);
  EXPECT_EQ(static_cast<std::streamoff>(locator.getPosition()), 1234);
}

TEST(NullLocator, StaysAtZero) {
  NullLocator locator;
  EXPECT_EQ(static_cast<std::streamoff>(locator.getPosition()), 0);
}
