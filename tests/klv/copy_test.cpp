#include <gtest/gtest.h>

#include <cstdint>
#include <fstream>
#include <sstream>
#include <string>

#include "klv.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::dataPath;
using zelta_test::readFile;
using zelta_test::klv::CountingStream;
using zelta_test::klv::dataFiles;
using zelta_test::klv::outputOf;
using zelta_test::klv::Seeking;

namespace {

// FNV-1a, 64 bits.
std::uint64_t hashOf(const ByteVector& bytes) {
  std::uint64_t hash = 0xcbf29ce484222325ull;
  for (std::uint8_t octet : bytes) {
    hash ^= octet;
    hash *= 0x100000001b3ull;
  }
  return hash;
}

// The octets that a GenericKLVWriter makes of the events of a read.
ByteVector copyOf(std::istream& in, std::uint8_t fillItemKeyVersion = 0) {
  std::ostringstream out;
  setFillItemKeyVersion(out, fillItemKeyVersion);
  GenericKLVWriter writer(out);
  GenericKLVReader reader;
  reader.setHandler(&writer);
  reader.read(in);
  return outputOf(out);
}

// The bytes with octet 7 of every fill item key set to the version; the
// key is found by its other fifteen octets.
ByteVector withFillKeyVersion(ByteVector bytes, std::uint8_t version, int& replaced) {
  const ByteVector fillKey = bytesOf("06 0e 2b 34 01 01 01 01 03 01 02 10 01 00 00 00");
  replaced = 0;
  for (std::size_t at = 0; at + 16 <= bytes.size(); ++at) {
    bool same = true;
    for (std::size_t i = 0; i < 16 && same; ++i) same = i == 7 || bytes[at + i] == fillKey[i];
    if (!same) continue;
    bytes[at + 7] = version;
    ++replaced;
  }
  return bytes;
}

}  // namespace

TEST(KLVCopy, ReaderIntoWriterReproducesEveryReadableFile) {
  int copied = 0;
  for (const std::string& path : dataFiles()) {
    SCOPED_TRACE(path);
    const ByteVector original = readFile(path);
    std::ifstream in(path, std::ios::binary);
    ByteVector copy;
    try {
      copy = copyOf(in);
    } catch (const KLVElement::parse_error&) {
      continue;  // a key the reader refuses, or a file cut short
    }
    EXPECT_EQ(copy.size(), original.size());
    EXPECT_EQ(hashOf(copy), hashOf(original));
    ++copied;
  }
  EXPECT_GE(copied, 10);
}

TEST(KLVCopy, CopyFromAStreamThatCannotSeekIsTheSame) {
  const ByteVector original = readFile(dataPath("ffmpeg_dv25_625_420_2mono.mxf"));
  CountingStream in(original, Seeking::notSeekable);
  const ByteVector copy = copyOf(in);
  EXPECT_EQ(copy.size(), original.size());
  EXPECT_EQ(hashOf(copy), hashOf(original));
}

// The file's fill keys carry version 1 in octet 7: 06 0E 2B 34 01 01 01 01
// 03 01 02 10 01 00 00 00. With the output stream's attribute at 2 they are
// written 06 0E 2B 34 01 01 01 02 03 01 02 10 01 00 00 00; all else stays.
TEST(KLVCopy, FillItemKeyVersionOfTheOutputStreamRewritesFillKeys) {
  const std::string path = dataPath("bmx_d10_50m_625_8ch24.mxf");
  const ByteVector original = readFile(path);
  int replaced = 0;
  const ByteVector expected = withFillKeyVersion(original, 2, replaced);
  ASSERT_GT(replaced, 0);
  ASSERT_NE(hashOf(expected), hashOf(original));
  std::ifstream in(path, std::ios::binary);
  const ByteVector copy = copyOf(in, 2);
  EXPECT_EQ(copy.size(), expected.size());
  EXPECT_EQ(hashOf(copy), hashOf(expected));
}
