// Reports and structure events of reads through MXFReader, as lines that a
// test can compare whole.
#ifndef ZELTA_TESTS_SUPPORT_MXF_REPORTS_H
#define ZELTA_TESTS_SUPPORT_MXF_REPORTS_H

#include <istream>
#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"
#include "support/recording.h"

namespace zelta_test {

// "<severity> <16 identifier octets in hex> <message>".
std::string reportLine(const std::string& severity, const MXFUID& identifier, const std::string& message);
std::vector<std::string> reportLines(const RecordingErrorHandler& errors);

// One read through MXFReader with the run-in skipped, a recording structure
// handler and a recording error handler; the other ports are left open.
struct ReaderRun {
  RecordingStructureHandler structure;
  RecordingErrorHandler errors;
  std::string failure = "no failure";  // what() of the exception that ended the read

  std::vector<std::string> reports() const { return reportLines(errors); }
};

void readWithMXFReader(std::istream& stream, ReaderRun& run);
void readWithMXFReader(const ByteVector& bytes, ReaderRun& run);
void readFileWithMXFReader(const std::string& name, ReaderRun& run);  // a file of tests/data

}  // namespace zelta_test

#endif
