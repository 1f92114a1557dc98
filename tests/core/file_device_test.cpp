#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <boost/iostreams/stream.hpp>

#include <cstdint>
#include <cstdio>
#include <fstream>
#include <ios>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

#include "core/file_device_impl.h"
#include "klv.h"

namespace {

using boost::iostreams::stream_offset;
using zelta::file_device;

const std::ios_base::openmode readOnly = std::ios_base::in;
const std::ios_base::openmode writeOnly = std::ios_base::out;
const std::ios_base::openmode readWrite = std::ios_base::in | std::ios_base::out;

// A file in the test's temporary directory, removed at the end. The process
// number keeps test programs of several build trees apart.
class TempFile {
public:
  explicit TempFile(const std::string& name)
      : path_(::testing::TempDir() + "zelta_file_device_" + std::to_string(::getpid()) + "_" + name) {
    std::remove(path_.c_str());
  }
  ~TempFile() { std::remove(path_.c_str()); }
  const std::string& path() const { return path_; }

  // Fills the file with n octets counting up from 0, modulo 251.
  void fill(std::size_t n) const {
    std::ofstream out(path_, std::ios_base::binary);
    for (std::size_t i = 0; i < n; ++i) out.put(static_cast<char>(i % 251));
  }
  std::string contents() const {
    std::ifstream in(path_, std::ios_base::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
  }
  stream_offset size() const {
    struct stat64 status;
    return ::stat64(path_.c_str(), &status) == 0 ? status.st_size : -1;
  }

private:
  std::string path_;
};

mode_t currentUmask() {
  const mode_t current = ::umask(0);
  ::umask(current);
  return current;
}

char octetAt(std::size_t i) { return static_cast<char>(i % 251); }

// The what() of the std::ios_base::failure that the call raises.
template <typename Call>
std::string failureOf(Call call) {
  try {
    call();
  } catch (const std::ios_base::failure& failure) {
    return failure.what();
  }
  return "no failure";
}

// Every posix_fadvise that a device makes while it lives.
class AdviceRecorder {
public:
  struct Advice {
    stream_offset offset;
    stream_offset length;
    int advice;
  };
  AdviceRecorder() {
    calls().clear();
    zelta::file_advice_observer = &record;
  }
  ~AdviceRecorder() { zelta::file_advice_observer = nullptr; }
  std::vector<int> advice() const {
    std::vector<int> result;
    for (const Advice& call : calls()) result.push_back(call.advice);
    return result;
  }
  static std::vector<Advice>& calls() {
    static std::vector<Advice> recorded;
    return recorded;
  }

private:
  static void record(stream_offset offset, stream_offset length, int advice) {
    calls().push_back(Advice{offset, length, advice});
  }
};

std::vector<char> readFrom(file_device& device, std::streamsize n) {
  std::vector<char> buffer(static_cast<std::size_t>(n));
  std::streamsize got = device.read(buffer.data(), n);
  buffer.resize(got < 0 ? 0 : static_cast<std::size_t>(got));
  return buffer;
}

}  // namespace

TEST(FileDevice, SequentialHintAloneGivesNoAdvice) {
  TempFile file("sequential_alone");
  file.fill(10);
  AdviceRecorder recorder;
  file_device device(file.path(), readOnly, file_device::hint_sequential);
  EXPECT_TRUE(recorder.advice().empty());
}

TEST(FileDevice, RandomHintAloneGivesNoAdvice) {
  TempFile file("random_alone");
  file.fill(10);
  AdviceRecorder recorder;
  file_device device(file.path(), readOnly, file_device::hint_random);
  EXPECT_TRUE(recorder.advice().empty());
}

TEST(FileDevice, SequentialAndRandomHintsGiveRandomThenSequentialAdvice) {
  TempFile file("sequential_and_random");
  file.fill(10);
  AdviceRecorder recorder;
  file_device device(file.path(), readOnly, file_device::hint_sequential | file_device::hint_random);
  EXPECT_EQ(recorder.advice(), (std::vector<int>{POSIX_FADV_RANDOM, POSIX_FADV_SEQUENTIAL}));
}

TEST(FileDevice, UnbufferedHintAdvisesNoReuseOnTheWholeFile) {
  TempFile file("unbuffered_advice");
  file.fill(10);
  AdviceRecorder recorder;
  file_device device(file.path(), readOnly, file_device::hint_unbuffered);
  ASSERT_EQ(recorder.advice(), (std::vector<int>{POSIX_FADV_NOREUSE}));
  EXPECT_EQ(AdviceRecorder::calls()[0].offset, 0);
  EXPECT_EQ(AdviceRecorder::calls()[0].length, 0);
}

TEST(FileDevice, ReadOfTwoMebibytesGivesOneMebibyteWithoutHints) {
  TempFile file("read_limit");
  file.fill(3 * 1048576);
  file_device device(file.path(), readOnly);
  std::vector<char> buffer(2 * 1048576);
  ASSERT_EQ(device.read(buffer.data(), 2 * 1048576), 1048576);
  EXPECT_EQ(buffer[1048575], octetAt(1048575));
  EXPECT_EQ(device.read(buffer.data(), 2 * 1048576), 1048576);
  EXPECT_EQ(buffer[0], octetAt(1048576));
}

TEST(FileDevice, ReadOfTwoMebibytesGivesOneBlockWithLimitedReadHint) {
  TempFile file("read_limit_hint");
  file.fill(3 * 1048576);
  file_device device(file.path(), readOnly, file_device::hint_limited_read);
  std::vector<char> buffer(2 * 1048576);
  EXPECT_EQ(device.read(buffer.data(), 2 * 1048576), 512);
  EXPECT_EQ(buffer[511], octetAt(511));
}

TEST(FileDevice, LimitedReadHintCanChangeAfterOpen) {
  TempFile file("read_limit_change");
  file.fill(3 * 1048576);
  file_device device(file.path(), readOnly);
  std::vector<char> buffer(2 * 1048576);
  device.hints(file_device::hint_limited_read);
  EXPECT_EQ(device.read(buffer.data(), 2 * 1048576), 512);
  device.hints(0, file_device::hint_limited_read);
  EXPECT_EQ(device.read(buffer.data(), 2 * 1048576), 1048576);
  EXPECT_EQ(buffer[0], octetAt(512));
}

TEST(FileDevice, HintsFixedAtOpenDoNotChange) {
  TempFile file("hints");
  file.fill(10);
  file_device device(file.path(), readOnly, file_device::hint_unbuffered | file_device::hint_sequential);
  EXPECT_EQ(device.hints(), 6);
  device.hints(0x101 | 0x08);
  EXPECT_EQ(device.hints(), 0x107);
  device.hints(0, 0xFF);
  EXPECT_EQ(device.hints(), 0x106);
  device.hints(0, ~0);
  EXPECT_EQ(device.hints(), 6);
}

TEST(FileDevice, SeekBeforeTheStartFails) {
  TempFile file("seek_before_start");
  file.fill(10);
  file_device device(file.path(), readOnly);
  EXPECT_EQ(failureOf([&] { device.seek(-1, std::ios_base::beg); }), "bad seek");
  device.seek(4, std::ios_base::beg);
  EXPECT_EQ(failureOf([&] { device.seek(-5, std::ios_base::cur); }), "bad seek");
  EXPECT_EQ(failureOf([&] { device.seek(-11, std::ios_base::end); }), "bad seek");
  EXPECT_EQ(readFrom(device, 1), (std::vector<char>{octetAt(4)}));
}

TEST(FileDevice, ReadAtEndOfFileGivesMinusOne) {
  TempFile file("read_at_end");
  file.fill(10);
  file_device device(file.path(), readOnly);
  device.seek(0, std::ios_base::end);
  char c = 0;
  EXPECT_EQ(device.read(&c, 1), -1);
  device.seek(20, std::ios_base::beg);
  EXPECT_EQ(device.read(&c, 1), -1);
}

TEST(FileDevice, AlignedReadAtEndOfFileGivesMinusOne) {
  TempFile file("aligned_read_at_end");
  file.fill(700);
  file_device device(file.path(), readOnly, file_device::hint_unbuffered);
  device.seek(700, std::ios_base::beg);
  char c = 0;
  EXPECT_EQ(device.read(&c, 1), -1);
  device.seek(1000, std::ios_base::beg);
  EXPECT_EQ(device.read(&c, 1), -1);
}

TEST(FileDevice, PartialModeIsNotImplemented) {
  TempFile file("partial");
  file.fill(10);
  file_device device;
  EXPECT_EQ(failureOf([&] { device.open(2, 4, file.path(), readOnly); }), "partial mode not implemented");
  EXPECT_FALSE(device.is_open());
  EXPECT_EQ(failureOf([&] { device.open(2, 4, util::utf8::decode(file.path()), readOnly); }),
            "partial mode not implemented");
  EXPECT_FALSE(device.is_open());
}

TEST(FileDevice, PartialModeFailsAfterTheFileHasOpened) {
  TempFile file("partial_creates");
  file_device device;
  EXPECT_EQ(failureOf([&] { device.open(0, 4, file.path(), writeOnly); }), "partial mode not implemented");
  EXPECT_EQ(file.size(), 0);
}

TEST(FileDevice, EveryOperationOnAClosedDeviceFailsNotOpen) {
  file_device device;
  char c = 0;
  EXPECT_FALSE(device.is_open());
  EXPECT_EQ(failureOf([&] { device.read(&c, 1); }), "not open");
  EXPECT_EQ(failureOf([&] { device.write(&c, 1); }), "not open");
  EXPECT_EQ(failureOf([&] { device.seek(0, std::ios_base::beg); }), "not open");
  EXPECT_EQ(failureOf([&] { device.size(); }), "not open");
  EXPECT_EQ(failureOf([&] { device.truncate(); }), "not open");
  EXPECT_EQ(failureOf([&] { device.close(); }), "not open");
  EXPECT_EQ(failureOf([&] { device.optimal_buffer_size(); }), "not open");
  EXPECT_EQ(failureOf([&] { device.hints(); }), "not open");
  EXPECT_EQ(failureOf([&] { device.hints(1); }), "not open");
  EXPECT_EQ(failureOf([&] { device.hints(1, 1); }), "not open");
}

TEST(FileDevice, CloseLeavesTheDeviceNotOpen) {
  TempFile file("close");
  file.fill(10);
  file_device device(file.path(), readOnly);
  EXPECT_TRUE(device.is_open());
  EXPECT_EQ(device.optimal_buffer_size(), 65536);
  device.close();
  EXPECT_FALSE(device.is_open());
  char c = 0;
  EXPECT_EQ(failureOf([&] { device.read(&c, 1); }), "not open");
  EXPECT_EQ(failureOf([&] { device.close(); }), "not open");
}

TEST(FileDevice, OpenModeWithoutInOrOutFails) {
  TempFile file("bad_mode");
  file.fill(10);
  file_device device;
  EXPECT_EQ(failureOf([&] { device.open(file.path(), std::ios_base::binary); }), "bad openmode");
  EXPECT_FALSE(device.is_open());
}

TEST(FileDevice, FailedOpenKeepsTheFileOpenBefore) {
  TempFile file("failed_open");
  file.fill(10);
  file_device device(file.path(), readOnly);
  EXPECT_EQ(failureOf([&] { device.open(::testing::TempDir() + "no/such/directory/file", readOnly); }), "bad open");
  EXPECT_TRUE(device.is_open());
  EXPECT_EQ(readFrom(device, 2), (std::vector<char>{octetAt(0), octetAt(1)}));
}

TEST(FileDevice, FailuresAreIosFailures) {
  file_device device;
  EXPECT_THROW(device.size(), std::ios_base::failure);
}

TEST(FileDevice, WriteOnlyOpenCreatesAndTruncates) {
  TempFile file("write_only");
  file.fill(100);
  file_device device(file.path(), writeOnly);
  EXPECT_EQ(device.size(), 0);
  EXPECT_EQ(device.write("abc", 3), 3);
  device.close();
  EXPECT_EQ(file.contents(), "abc");
  struct stat64 status;
  ASSERT_EQ(::stat64(file.path().c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777, 0666 & ~currentUmask());
}

TEST(FileDevice, ReadWriteOpenKeepsTheContents) {
  TempFile file("read_write");
  file.fill(10);
  file_device device(file.path(), readWrite);
  EXPECT_EQ(device.size(), 10);
  device.seek(2, std::ios_base::beg);
  EXPECT_EQ(device.write("xy", 2), 2);
  EXPECT_EQ(readFrom(device, 2), (std::vector<char>{octetAt(4), octetAt(5)}));
  device.seek(0, std::ios_base::beg);
  EXPECT_EQ(readFrom(device, 4), (std::vector<char>{octetAt(0), octetAt(1), 'x', 'y'}));
}

TEST(FileDevice, SeekByEndOfAWriteOnlyFileUsesTheSizeWritten) {
  TempFile file("write_only_end");
  file_device device(file.path(), writeOnly);
  device.write("0123456789", 10);
  device.seek(4, std::ios_base::beg);
  device.write("ab", 2);
  EXPECT_EQ(device.size(), 10);
  EXPECT_EQ(device.seek(0, std::ios_base::end), std::streampos(10));
  EXPECT_EQ(device.seek(-3, std::ios_base::end), std::streampos(7));
  device.write("Z", 1);
  device.close();
  EXPECT_EQ(file.contents(), "0123ab6Z89");
}

TEST(FileDevice, SeekMovesOnlyTheLogicalPosition) {
  TempFile file("seek_logical");
  file.fill(10);
  file_device device(file.path(), readOnly);
  EXPECT_EQ(device.seek(3, std::ios_base::beg), std::streampos(3));
  EXPECT_EQ(device.seek(2, std::ios_base::cur), std::streampos(5));
  EXPECT_EQ(device.seek(100, std::ios_base::beg), std::streampos(100));
  EXPECT_EQ(device.seek(-2, std::ios_base::end), std::streampos(8));
  EXPECT_EQ(readFrom(device, 5), (std::vector<char>{octetAt(8), octetAt(9)}));
}

TEST(FileDevice, TruncateCutsAtTheLogicalPosition) {
  TempFile file("truncate");
  file.fill(100);
  file_device device(file.path(), readWrite);
  device.seek(40, std::ios_base::beg);
  device.truncate();
  EXPECT_EQ(device.size(), 40);
  EXPECT_EQ(file.size(), 40);
}

TEST(FileDevice, TruncateOfAWriteOnlyFileSetsTheSizeWritten) {
  TempFile file("truncate_write_only");
  file_device device(file.path(), writeOnly);
  device.write("0123456789", 10);
  device.seek(6, std::ios_base::beg);
  device.truncate();
  EXPECT_EQ(device.seek(0, std::ios_base::end), std::streampos(6));
  EXPECT_EQ(file.size(), 6);
}

TEST(FileDevice, AlignedReadsGiveTheOctetsAtTheLogicalPosition) {
  TempFile file("aligned");
  file.fill(5000);
  file_device device(file.path(), readOnly, file_device::hint_unbuffered);
  device.seek(700, std::ios_base::beg);
  std::vector<char> got = readFrom(device, 1000);
  ASSERT_EQ(got.size(), 1000u);
  for (std::size_t i = 0; i < got.size(); ++i) ASSERT_EQ(got[i], octetAt(700 + i)) << i;
  got = readFrom(device, 10);
  ASSERT_EQ(got.size(), 10u);
  EXPECT_EQ(got[0], octetAt(1700));
  device.seek(4990, std::ios_base::beg);
  got = readFrom(device, 100);
  ASSERT_EQ(got.size(), 10u);
  EXPECT_EQ(got[9], octetAt(4999));
}

// The limit bounds what is asked of the file, rounded up to whole blocks
// from the block that holds the position; the caller gets all of that.
TEST(FileDevice, AlignedReadWithLimitedReadHintGivesTheBlocksThatTheLimitSpans) {
  TempFile file("aligned_limited");
  file.fill(5000);
  file_device device(file.path(), readOnly, file_device::hint_unbuffered | file_device::hint_limited_read);
  device.seek(100, std::ios_base::beg);
  std::vector<char> got = readFrom(device, 4000);
  EXPECT_EQ(got.size(), 1024u - 100);
  EXPECT_EQ(got.front(), octetAt(100));
  EXPECT_EQ(got.back(), octetAt(1023));
}

TEST(FileDevice, ReadOfNothingGivesZero) {
  TempFile file("read_nothing");
  file.fill(10);
  for (int hints : {0, file_device::hint_unbuffered}) {
    file_device device(file.path(), readOnly, hints);
    device.seek(10, std::ios_base::beg);
    char c = 0;
    EXPECT_EQ(device.read(&c, 0), 0);
  }
}

TEST(FileDevice, CopiesShareOneOpenFile) {
  TempFile file("copies");
  file.fill(10);
  file_device device(file.path(), readOnly);
  file_device copy = device;
  EXPECT_EQ(readFrom(device, 3).size(), 3u);
  EXPECT_EQ(readFrom(copy, 1), (std::vector<char>{octetAt(3)}));
  copy.close();
  EXPECT_FALSE(device.is_open());
}

TEST(FileDevice, WidePathsOpen) {
  TempFile file("wide_\xC3\xA9t\xC3\xA9");
  file.fill(10);
  const std::wstring widePath = util::utf8::decode(file.path());
  ASSERT_EQ(widePath.substr(widePath.size() - 3), L"\u00e9t\u00e9");
  file_device device(widePath, readOnly);
  EXPECT_EQ(readFrom(device, 2), (std::vector<char>{octetAt(0), octetAt(1)}));
}

// Positions beyond 32 bits through a standard stream, in a sparse file.
TEST(FileDevice, StreamReadsAndWritesBeyondFourGibibytes) {
  TempFile file("large");
  const stream_offset far = (stream_offset(1) << 32) + 12345;
  const stream_offset farther = (stream_offset(5) << 30) + 7;
  {
    boost::iostreams::stream<file_device> out(file_device(file.path(), writeOnly));
    out << "head";
    out.seekp(far);
    out << "far away";
    out.seekp(farther);
    out << "end";
    out.seekp(0, std::ios_base::end);
    EXPECT_EQ(static_cast<stream_offset>(out.tellp()), farther + 3);
    out.seekp(-3, std::ios_base::end);
    out << "END";
    ASSERT_TRUE(out.good());
  }
  EXPECT_EQ(file.size(), farther + 3);
  {
    boost::iostreams::stream<file_device> io(file_device(file.path(), readWrite));
    io.seekg(far);
    std::string word;
    io >> word;
    EXPECT_EQ(word, "far");
    io.seekg(farther);
    io >> word;
    EXPECT_EQ(word, "END");
    io.clear();
    io.seekp(far + 4);
    io << "AWAY";
    io.seekg(far - 2);
    char around[14] = {};
    io.read(around, sizeof(around));
    EXPECT_EQ(std::string(around, sizeof(around)), std::string("\0\0far AWAY\0\0\0\0", 14));
    io.seekg(0, std::ios_base::end);
    EXPECT_EQ(static_cast<stream_offset>(io.tellg()), farther + 3);
  }
}

TEST(FileDevice, WriteToAReadOnlyFileFails) {
  TempFile file("bad_write");
  file.fill(10);
  file_device device(file.path(), readOnly);
  EXPECT_EQ(failureOf([&] { device.write("x", 1); }), "bad write");
}

TEST(FileDevice, ReadFromAWriteOnlyFileFails) {
  TempFile file("bad_read");
  for (int hints : {0, file_device::hint_unbuffered}) {
    file_device device(file.path(), writeOnly, hints);
    device.write("0123456789", 10);
    device.seek(0, std::ios_base::beg);
    char c = 0;
    EXPECT_EQ(failureOf([&] { device.read(&c, 1); }), "bad read");
  }
}

TEST(FileDevice, TruncateOfAReadOnlyFileFails) {
  TempFile file("bad_truncate");
  file.fill(10);
  file_device device(file.path(), readOnly);
  device.seek(5, std::ios_base::beg);
  EXPECT_EQ(failureOf([&] { device.truncate(); }), "bad truncate");
  EXPECT_EQ(file.size(), 10);
}

// A pipe has no positions: the descriptor can't follow a logical seek.
TEST(FileDevice, TransferAfterASeekThatTheDescriptorCanNotFollowFails) {
  TempFile file("fifo");
  ASSERT_EQ(::mkfifo(file.path().c_str(), 0600), 0);
  file_device device(file.path(), readWrite);
  EXPECT_EQ(device.seek(5, std::ios_base::beg), std::streampos(5));
  char c = 0;
  EXPECT_EQ(failureOf([&] { device.read(&c, 1); }), "bad seek");
  EXPECT_EQ(failureOf([&] { device.write("x", 1); }), "bad seek");
}

TEST(FileDeviceImpl, CloseOfADescriptorThatIsGoneFails) {
  TempFile file("bad_close");
  file.fill(10);
  file_device::impl device(readOnly, 0);
  device.open(file.path());
  ASSERT_EQ(::close(device.fd), 0);
  EXPECT_EQ(failureOf([&] { device.close(); }), "bad close");
  EXPECT_EQ(device.fd, -1);
}

TEST(FileDeviceImpl, AlignmentMustBeAPowerOfTwo) {
  TempFile file("bad_alignment");
  file.fill(1000);
  file_device::impl device(readOnly, file_device::hint_unbuffered);
  device.open(file.path());
  device.alignment = 500;
  char buffer[10];
  EXPECT_EQ(failureOf([&] { device.read(buffer, 10); }), "bad alignment (not a power of 2)");
}

TEST(FileDeviceImpl, AlignedBufferOnlyGrows) {
  TempFile file("buffer_grows");
  file.fill(5000);
  file_device::impl device(readOnly, file_device::hint_unbuffered);
  device.open(file.path());
  std::vector<char> buffer(4000);
  device.read(buffer.data(), 4000);
  char* const grown = device.aligned_start;
  EXPECT_EQ(reinterpret_cast<std::uintptr_t>(grown) % 512, 0u);
  EXPECT_GE(device.buffer_end - grown, 4096);
  device.seek(0, std::ios_base::beg);
  device.read(buffer.data(), 10);
  EXPECT_EQ(device.aligned_start, grown);
  EXPECT_EQ(device.physical, 512);
  EXPECT_EQ(device.logical, 10);
}
