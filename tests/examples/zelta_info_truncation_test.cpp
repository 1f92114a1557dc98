// A cut file is never reported as clean: zelta-info says how many octets
// the last element misses, or the read ends fatally. The expectations come
// from a walk of the top-level keys and BER lengths of the file, made here.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::ProgramRun;
using zelta_test::readFile;
using zelta_test::runZeltaInfo;

bool has(const std::string& text, const std::string& what) { return text.find(what) != std::string::npos; }

struct Element {
  std::uint64_t start;
  std::uint64_t valueStart;
  std::uint64_t end;
};

// The top-level element that holds an offset, by the file's own keys and
// lengths; its end may lie beyond the octets given.
Element elementAt(const ByteVector& bytes, std::uint64_t offset) {
  std::uint64_t at = 0;
  for (;;) {
    std::uint64_t p = at + 16;
    std::uint64_t length = bytes.at(p++);
    if (length & 0x80) {
      const unsigned octets = length & 0x7F;
      length = 0;
      for (unsigned i = 0; i < octets; ++i) length = (length << 8) | bytes.at(p++);
    }
    const Element element{at, p, p + length};
    if (offset < element.end) return element;
    at = element.end;
  }
}

std::string missingOctets(std::uint64_t octets) {
  return "warning: last element runs past the end of the file - " + std::to_string(octets) + " octets missing\n";
}

class CutFile {
 public:
  CutFile(const ByteVector& bytes, std::uint64_t size)
      : path_((std::filesystem::temp_directory_path() /
               ("zelta-cut-" + std::to_string(::getpid()) + "-" + std::to_string(size) + ".mxf"))
                  .string()) {
    std::ofstream out(path_, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(size));
  }
  ~CutFile() { std::filesystem::remove(path_); }
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

// Cut at half its length from bmx's DV file (the name says so).
TEST(ZeltaInfoTruncation, TruncatedFileOfTheTestDataNamesItsMissingOctets) {
  const ByteVector bytes = readFile(dataPath("damaged_truncated_50pct.mxf"));
  const Element last = elementAt(bytes, bytes.size() - 1);
  ASSERT_GT(last.end, bytes.size());
  for (const char* options : {"", "--essence ", "--json ", "--model "}) {
    const ProgramRun run = runZeltaInfo(std::string(options) + dataPath("damaged_truncated_50pct.mxf"));
    EXPECT_TRUE(has(run.err, missingOctets(last.end - bytes.size()))) << options << run.err;
  }
}

TEST(ZeltaInfoTruncation, CutD10FileAtTwentyPointsIsNeverClean) {
  const ByteVector bytes = readFile(dataPath("bmx_d10_50m_625_8ch24.mxf"));
  for (std::uint64_t k = 1; k <= 20; ++k) {
    const std::uint64_t size = bytes.size() * k / 21;
    SCOPED_TRACE(size);
    const CutFile cut(bytes, size);
    const ProgramRun run = runZeltaInfo(cut.path());
    const Element element = elementAt(bytes, size);
    if (size - element.start >= element.valueStart - element.start && size > element.start) {
      // The key and length were read: the value runs past the end.
      EXPECT_EQ(run.status, 0);
      EXPECT_TRUE(has(run.err, missingOctets(element.end - size))) << run.err;
    } else {
      EXPECT_EQ(run.status, 1) << run.err;
    }
  }
}

// bmx/d10_50m_625_8ch24.mxf cut at 415500 octets: the kit's structure
// validator misses the footer; D-10 is not asked for a random index.
TEST(ZeltaInfoTruncation, ValidationAddsTheMissingFooter) {
  const ByteVector bytes = readFile(dataPath("bmx_d10_50m_625_8ch24.mxf"));
  const CutFile cut(bytes, 415500);
  const ProgramRun run = runZeltaInfo("--validate " + cut.path());
  const Element element = elementAt(bytes, 415500);
  EXPECT_EQ(run.err, missingOctets(element.end - 415500) + "error: missing footer partition\n");
}

}  // namespace
