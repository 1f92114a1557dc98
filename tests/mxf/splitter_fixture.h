// A splitter with journaling delegates, read from bytes spelled by the test.
#ifndef ZELTA_TESTS_MXF_SPLITTER_FIXTURE_H
#define ZELTA_TESTS_MXF_SPLITTER_FIXTURE_H

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

namespace zelta_test {

class SplitterRead : public ::testing::Test {
protected:
  SplitterRead()
      : structure(journal),
        metadata(journal, "metadata"),
        index(journal, "index"),
        essence(journal, "essence"),
        splitter(&structure, &metadata, &index, &essence, false) {
    splitter.setErrorHandler(&errors);
  }

  // Reads to the end; the text of the run-time error that stopped the read,
  // or "no failure".
  std::string read(const ByteVector& bytes) {
    return runtimeErrorTextOf([&] { readThrough(bytes, splitter, &errors); });
  }

  // The lines of one handler, without its name.
  std::vector<std::string> linesOf(const std::string& name) const {
    std::vector<std::string> out;
    for (const std::string& line : journal.lines)
      if (line.compare(0, name.size() + 1, name + " ") == 0) out.push_back(line.substr(name.size() + 1));
    return out;
  }

  // The position at each line of one handler.
  std::vector<std::streamoff> positionsOf(const std::string& name) const {
    std::vector<std::streamoff> out;
    for (std::size_t i = 0; i < journal.lines.size(); ++i)
      if (journal.lines[i].compare(0, name.size() + 1, name + " ") == 0) out.push_back(journal.positions[i]);
    return out;
  }

  Journal journal;
  JournalStructureHandler structure;
  JournalKLVHandler metadata;
  JournalKLVHandler index;
  JournalKLVHandler essence;
  RecordingErrorHandler errors;
  MXFSplitter splitter;
};

// Sizes of the elements that the tests build.
inline constexpr std::uint64_t packSize = 16 + 4 + 88;  // a pack without essence container labels
inline constexpr std::uint64_t smallFillSize = 20;      // a fill item with an empty value

inline std::string header(std::uint8_t status = 4) { return toString(partitionKey(2, status)); }
inline std::string body(std::uint8_t status = 4) { return toString(partitionKey(3, status)); }
inline std::string footer(std::uint8_t status = 4) { return toString(partitionKey(4, status)); }

}  // namespace zelta_test

#endif
