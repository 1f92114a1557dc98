// Runs a program of the build and keeps its exit status and output.
#ifndef ZELTA_TESTS_SUPPORT_RUN_PROGRAM_H
#define ZELTA_TESTS_SUPPORT_RUN_PROGRAM_H

#include <cstddef>
#include <string>

namespace zelta_test {

struct ProgramRun {
  int status = -1;  // exit status, -1 when it did not exit normally
  std::string out;
  std::string err;
};

// Runs the shell command line, stdout and stderr caught apart.
ProgramRun runProgram(const std::string& commandLine);

// zelta-info of this build with the arguments.
ProgramRun runZeltaInfo(const std::string& arguments);

// How often `what` stands in `text`, overlaps included.
std::size_t occurrences(const std::string& text, const std::string& what);

}  // namespace zelta_test

#endif
