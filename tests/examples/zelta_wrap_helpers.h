// What the zelta-wrap tests share: running the program, making inputs with
// ffmpeg in a folder of the test's own, and asking ffprobe and ffmpeg about
// the files written.
#ifndef ZELTA_TESTS_EXAMPLES_ZELTA_WRAP_HELPERS_H
#define ZELTA_TESTS_EXAMPLES_ZELTA_WRAP_HELPERS_H

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/run_program.h"

namespace zelta_wrap_test {

// zelta-wrap of this build with the arguments.
zelta_test::ProgramRun runWrap(const std::string& arguments);

// Whether ffmpeg and ffprobe can be run.
bool haveFFmpeg();

// A fresh folder per test, removed with the test.
class WrapTest : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;

  // The path of a file in the test's folder.
  std::string path(const std::string& name) const;
  // Runs ffmpeg with the arguments (-y and -v error added) in the folder;
  // the test fails when it fails.
  void ffmpeg(const std::string& arguments) const;
  // The names in the test's folder, sorted.
  std::vector<std::string> files() const;

  std::string folder_;
};

// The MD5 of what the shell command prints, in lower-case hexadecimal.
std::string md5Of(const std::string& command);
// ffprobe's values of the entries ("stream=codec_name,width", "format_tags=timecode") of the selected streams
// (empty: all), one a line; packets are counted, as nb_read_packets.
std::string probe(const std::string& file, const std::string& streams, const std::string& entries);

}  // namespace zelta_wrap_test

#endif
