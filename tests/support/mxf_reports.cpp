#include "support/mxf_reports.h"

#include <cstdio>
#include <fstream>
#include <stdexcept>

namespace zelta_test {

std::string reportLine(const std::string& severity, const MXFUID& identifier, const std::string& message) {
  std::string octets;
  for (std::uint8_t octet : identifier.octets()) {
    char digits[3];
    std::snprintf(digits, sizeof digits, "%02X", static_cast<unsigned>(octet));
    octets += digits;
  }
  return severity + " " + octets + " " + message;
}

std::vector<std::string> reportLines(const RecordingErrorHandler& errors) {
  std::vector<std::string> lines;
  for (const Report& report : errors.reports)
    lines.push_back(reportLine(report.severity, report.identifier, report.message));
  return lines;
}

void readWithMXFReader(std::istream& stream, ReaderRun& run) {
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&run.structure);
  reader.setErrorHandler(&run.errors);
  try {
    reader.read(stream);
  } catch (const std::exception& failure) {
    run.failure = failure.what();
  }
}

void readWithMXFReader(const ByteVector& bytes, ReaderRun& run) {
  util::vector_istream stream(bytes);
  readWithMXFReader(stream, run);
}

void readFileWithMXFReader(const std::string& name, ReaderRun& run) {
  std::ifstream stream(dataPath(name), std::ios::binary);
  if (!stream.good()) throw std::runtime_error("cannot open " + name);
  readWithMXFReader(stream, run);
}

}  // namespace zelta_test
