#include "support/run_program.h"

#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <iterator>

#include <gtest/gtest.h>

namespace zelta_test {

ProgramRun runProgram(const std::string& commandLine) {
  const std::string errFile = ::testing::TempDir() + "zelta-test-" + std::to_string(getpid()) + ".stderr";
  const std::string command = commandLine + " 2>" + errFile;
  ProgramRun run;
  FILE* pipe = popen(command.c_str(), "r");
  if (pipe == nullptr) return run;
  char buffer[4096];
  std::size_t n;
  while ((n = fread(buffer, 1, sizeof buffer, pipe)) > 0) run.out.append(buffer, n);
  int status = pclose(pipe);
  run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  std::ifstream err(errFile);
  run.err.assign(std::istreambuf_iterator<char>(err), std::istreambuf_iterator<char>());
  std::remove(errFile.c_str());
  return run;
}

ProgramRun runZeltaInfo(const std::string& arguments) { return runProgram(std::string(ZELTA_INFO) + " " + arguments); }

std::size_t occurrences(const std::string& text, const std::string& what) {
  std::size_t n = 0;
  for (std::string::size_type at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) ++n;
  return n;
}

}  // namespace zelta_test
