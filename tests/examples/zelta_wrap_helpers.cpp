#include "zelta_wrap_helpers.h"

#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "support/digest.h"

namespace zelta_wrap_test {

using zelta_test::ProgramRun;
using zelta_test::runProgram;

namespace {

std::string trimmed(std::string text) {
  while (!text.empty() && (text.back() == '\n' || text.back() == ' ')) text.pop_back();
  return text;
}

}  // namespace

ProgramRun runWrap(const std::string& arguments) { return runProgram(std::string(ZELTA_WRAP) + " " + arguments); }

bool haveFFmpeg() {
  static const bool present = runProgram("ffmpeg -version >/dev/null && ffprobe -version >/dev/null").status == 0;
  return present;
}

void WrapTest::SetUp() {
  if (!haveFFmpeg()) GTEST_SKIP() << "ffmpeg is not installed";
  const ::testing::TestInfo* test = ::testing::UnitTest::GetInstance()->current_test_info();
  folder_ = ::testing::TempDir() + "zelta-wrap-" + std::to_string(getpid()) + "-" + test->name();
  std::filesystem::remove_all(folder_);
  std::filesystem::create_directories(folder_);
}

void WrapTest::TearDown() {
  if (!folder_.empty()) std::filesystem::remove_all(folder_);
}

std::string WrapTest::path(const std::string& name) const { return folder_ + "/" + name; }

void WrapTest::ffmpeg(const std::string& arguments) const {
  const ProgramRun run = runProgram("cd " + folder_ + " && ffmpeg -nostdin -y -v error " + arguments);
  ASSERT_EQ(run.status, 0) << arguments << "\n" << run.err;
}

std::vector<std::string> WrapTest::files() const {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(folder_)) names.push_back(entry.path().filename());
  std::sort(names.begin(), names.end());
  return names;
}

std::string md5Of(const std::string& command) {
  const std::string output = ::testing::TempDir() + "zelta-wrap-" + std::to_string(getpid()) + ".md5-input";
  const ProgramRun run = runProgram(command + " >" + output);
  EXPECT_EQ(run.status, 0) << command << "\n" << run.err;
  std::ifstream in(output, std::ios::binary);
  const ByteVector octets{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  std::filesystem::remove(output);
  return zelta_test::md5Hex(octets);
}

std::string probe(const std::string& file, const std::string& streams, const std::string& entries) {
  const std::string selection = streams.empty() ? "" : " -select_streams " + streams;
  const ProgramRun run = runProgram("ffprobe -v error" + selection + " -count_packets -show_entries " + entries +
                                    " -of default=nw=1:nk=1 " + file);
  EXPECT_EQ(run.status, 0) << file << "\n" << run.err;
  return trimmed(run.out);
}

}  // namespace zelta_wrap_test
